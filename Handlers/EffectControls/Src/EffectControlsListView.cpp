// Construction, listening, command dispatch, the shared time state and the state dump of the
// effect list. Building, layout, painting, selection and the effect commands live in the files
// named after them.
#include "Handlers/EffectControls/Public/EffectControlsListView.h"

#include <cxxabi.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <string>
#include <typeinfo>
#include <utility>

#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

// Stations the list listens on besides the model's: effect filters announce UI updates on the
// first, text rows their size changes on the second.
constexpr const char* kVideoFilterNotifierStation = "ML.VideoFilterNotifierStation";
constexpr const char* kTextControlResizeStation = "HSL.textcontrol.resize";

// The view mode a selection logic asks for before it targets a transition.
constexpr int kTransitionViewMode = 3;

// One video and one audio item of the same linked clip, each in a group of its own.
bool IsValidLinkedTrackItems(const std::vector<TrackItemGroup>& groups) {
  if (groups.size() != 2) {
    return false;
  }
  TrackItemRef video;
  TrackItemRef audio;
  for (const TrackItemGroup& group : groups) {
    if (group.videoItems.size() == 1 && group.audioItems.empty()) {
      video = group.videoItems.front();
    } else if (group.audioItems.size() == 1 && group.videoItems.empty()) {
      audio = group.audioItems.front();
    }
  }
  return video && audio && video->IsClip() && audio->IsClip() && video->GetLinkGroup() != 0 &&
         video->GetLinkGroup() == audio->GetLinkGroup();
}

// "PictureButton" for a PictureButton; the mangled name when it cannot be read.
std::string ClassNameOf(const ViewBase& view) {
  const char* mangled = typeid(view).name();
  int status = 0;
  std::unique_ptr<char, void (*)(void*)> readable(
      abi::__cxa_demangle(mangled, nullptr, nullptr, &status), std::free);
  return status == 0 && readable ? std::string(readable.get()) : std::string(mangled);
}

StateDumpRect Offset(const Rect& rect, Point origin) {
  return {rect.left + origin.x, rect.top + origin.y, rect.Width(), rect.Height()};
}

void AppendDumpRows(const std::shared_ptr<EffectItem>& row, std::vector<std::string> path,
                    Point origin, std::vector<StateDumpRow>& rows) {
  path.push_back(row->GetName());
  StateDumpRow dump;
  dump.path = path;
  dump.className = ParameterRowFactory::GetRowClassName(*row);
  dump.top = row->GetTop();
  dump.height = row->IsSetAside() ? 0 : row->Height();
  dump.groupLevel = row->GetGroupLevel();
  dump.expanded = row->IsExpanded();
  dump.selected = row->IsSelected();
  dump.setAside = row->IsSetAside();
  dump.shown = row->IsShown();
  if (row->IsShown() && !row->IsSetAside()) {
    dump.rect = Offset(Rect::FromSize(0, row->GetTop(), row->GetWidth(), row->OwnHeight()), origin);
  }
  for (const auto& control : row->GetControls()) {
    dump.controls.push_back({.className = ClassNameOf(*control),
                             .rect = Offset(control->GetBounds(), origin),
                             .visible = control->IsVisible(),
                             .enabled = control->IsEnabled()});
  }
  rows.push_back(std::move(dump));
  for (const auto& child : row->GetItems()) {
    AppendDumpRows(child, path, origin, rows);
  }
}

}  // namespace

EffectControlsListView::EffectControlsListView(Commander* parent, StationName ownStation,
                                               std::shared_ptr<PanelTimeline> timeline)
    : SubView(parent),
      mOwnStation(std::move(ownStation)),
      mTimeline(timeline ? std::move(timeline) : std::make_shared<PanelTimeline>()),
      mNormalFont(kFont_Normal),
      mLabelFont(kFont_Normal) {
  mKeyframeStation = RegisterUniqueStation(mOwnStation + ".Keyframes");
  RegisterStation(mOwnStation);
  for (const StationName& station :
       {mOwnStation, StationName(kSequenceActivationStation),
        StationName(kVideoFilterNotifierStation), StationName(kTextControlResizeStation),
        StationName(kDirectManipulationStation), mTimeline->GetStation()}) {
    AddListener(station, *this);
  }
}

EffectControlsListView::~EffectControlsListView() {
  // Rows broadcast while they are torn down (their controls leave this view); stop listening
  // first so nothing reaches a half-destroyed list.
  RemoveListenerFromAllStations(*this);
  mVideoItems.Clear();
  mGraphicsItems.Clear();
  for (const auto& part : mAudioParts) {
    part->Clear();
  }
  mAudioParts.clear();
  DisposeStation(mKeyframeStation);
}

void EffectControlsListView::FinishCreateSelf() {
  if (!HasECPStyle(kStyleNoVideoExpander)) {
    CreateVideoExpanderButton();
  }
  if (!HasECPStyle(kStyleNoXOTextExpander)) {
    CreateXOEditableTextExpanderButton();
  }
  CreateGraphicsExpanderButton();
  mImageList.Add(kDirectManipulationDecal);
  SetAcceptsDrops(true);
}

void EffectControlsListView::DestroySelf() {
  RemoveListenerFromAllStations(*this);
  ClearList();
}

// --- Target ---

void EffectControlsListView::SetSequence(const SequenceRef& sequence) {
  if (mTarget.sequence == sequence) {
    return;
  }
  if (mTarget.sequence) {
    StopListeningTo(mTarget.sequence->GetStation());
  }
  mTarget.sequence = sequence;
  if (mTarget.sequence) {
    ListenTo(mTarget.sequence->GetStation());
    mTimeline->SetEditTime(mTarget.sequence->GetCurrentTime());
  }
}

void EffectControlsListView::DoSequenceClipSelectionChanged(const SequenceRef& sequence) {
  SetSequence(sequence);
  mTarget = ChooseTarget(mTarget.sequence ? mTarget.sequence->GetSelection()
                                          : std::vector<TrackItemGroup>());
  if (mBuiltTarget == mTarget) {
    UpdateParamsUI(GetEditTime(), true);
    Invalidate();
    return;
  }
  ClearAndRebuildList();
}

PanelTarget EffectControlsListView::ChooseTarget(std::vector<TrackItemGroup> groups) const {
  PanelTarget target;
  target.sequence = mTarget.sequence;
  target.masterClip = mTarget.masterClip;
  target.kind = kTargetClip;
  if (groups.size() == 1) {
    const TrackItemGroup& group = groups.front();
    if (group.videoItems.size() == 1) {
      const TrackItemRef& item = group.videoItems.front();
      if (item->IsClip()) {
        target.showVideo = true;
        target.showAudio = !group.audioItems.empty();
      } else if (item->IsTransition() && AllowsViewMode(kTransitionViewMode)) {
        target.kind = kTargetTransition;
        target.showVideo = true;
        if (item->HasOwnComponentChain()) {
          target.transitionChain = item->GetComponentChain();
          target.kind = kTargetTransitionComponent;
        }
      }
    } else if (group.videoItems.empty() && !group.audioItems.empty()) {
      const TrackItemRef& item = group.audioItems.front();
      if (item->IsClip()) {
        target.showAudio = true;
      } else if (group.audioItems.size() == 1 && item->IsTransition() &&
                 AllowsViewMode(kTransitionViewMode)) {
        target.kind = kTargetTransition;
        target.showAudio = true;
      }
    }
  } else if (IsValidLinkedTrackItems(groups)) {
    target.showVideo = true;
    target.showAudio = true;
  }
  target.selection = std::move(groups);
  return target;
}

bool EffectControlsListView::IsReadOnlyEffectContainer() const {
  if (mTarget.masterClip) {
    if (EditPermissions::IsReadOnly(*mTarget.masterClip)) {
      return true;
    }
    return mTarget.masterClip->GetProperties().GetBool(kPropertyKey_FromInactiveProject, false);
  }
  if (mTarget.sequence) {
    return EditPermissions::IsReadOnly(*mTarget.sequence);
  }
  return false;
}

bool EffectControlsListView::ShouldAllowParameter(const ComponentRef& /*component*/,
                                                  const ComponentParamRef& /*param*/) {
  return true;
}

bool EffectControlsListView::AllowsViewMode(int /*viewMode*/) const {
  return true;
}

// --- Messages and commands ---

void EffectControlsListView::ListenToMessage(const Message& message) {
  if (const auto* time = message.As<PanelTimelineChangedMessage>()) {
    OnTimelineChanged(*time);
  } else if (message.Is<EffectControlsDisclosureStateChanged>()) {
    OnDisclosureStateChanged();
  } else if (const auto* all = message.As<DisclosureStateAllChanged>()) {
    OnDisclosureStateAllChanged(all->expanded);
  } else if (message.Is<FilterItemNameChanged>()) {
    Invalidate();
  } else if (const auto* onOff = message.As<FilterOnOffAllChanged>()) {
    OnFilterOnOffAllChanged(onOff->enabled);
  } else if (const auto* added = message.As<EmbeddedEffectAdded>()) {
    // The rebuild the insertion causes may come before or after this message: select the
    // effect now if it has a row, and again after the next build (that one only).
    if (FindFilterRow(added->component.get(), nullptr)) {
      SelectComponents({added->component});
    }
    mPendingSelection = {added->component};
  } else if (const auto* picked = message.As<DirectManipulationFilterPickedMessage>()) {
    SelectDMFilterItem(picked->component);
  } else if (message.Is<ParameterControlChangedMessage>()) {
    BroadcastRefreshKeyframes();
    if (mVideoLimiterPresent) {
      bool changed = false;
      for (const EffectItemList* list : {&mVideoItems, &mGraphicsItems}) {
        for (const auto& row : *list) {
          changed = row->RecursiveUpdateSetAside() || changed;
        }
      }
      if (changed) {
        PositionItems();
        UpdateVScrollBar();
      }
    }
    BroadcastListChanged();
  } else if (message.Is<ParameterControlMinMaxChangedMessage>()) {
    Invalidate();
  } else if (const auto* scroll = message.As<ScrollVerticalMessage>()) {
    OnVScroll(scroll->code, scroll->position, scroll->flags);
  } else if (message.Is<ComponentChainChangedMessage>()) {
    PostMessageToUIThread(mKeyframeStation,
                          std::make_shared<EffectControlsRefreshKeyframesMessage>());
  } else if (message.Is<ComponentChainStructureChangedMessage>()) {
    ClearAndRebuildList();
  } else if (message.Is<TrackItemChangedMessage>()) {
    ResetTimes();
    PostMessageToUIThread(mKeyframeStation,
                          std::make_shared<EffectControlsRefreshKeyframesMessage>());
  } else if (const auto* position = message.As<PlayerPositionChangedMessage>()) {
    if (position->playMode == kPlayModePlaying || position->playMode == kPlayModeScrubbing) {
      UpdateParamsUI(position->time, false);
    }
  } else if (message.Is<ReadOnlyStateChangedMessage>()) {
    ClearAndRebuildList();
  }
}

void EffectControlsListView::OnFilterOnOffAllChanged(bool enabled) {
  if (IsReadOnlyEffectContainer()) {
    return;
  }
  std::vector<ComponentChainRef> chains;
  for (const ComponentChainRef& chain : {mVideoChain, mMasterGraphicChain}) {
    if (chain) {
      chains.push_back(chain);
    }
  }
  for (const auto& part : mAudioParts) {
    if (part->IsClipPart() && part->GetTrackItem()->GetComponentChain()) {
      chains.push_back(part->GetTrackItem()->GetComponentChain());
    }
  }
  // One step for all of them; the rows follow through the components' change messages.
  ComponentChainActions::SetBypass(chains, !enabled);
}

bool EffectControlsListView::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command == kVideoExpanderCommand || command == kGraphicsExpanderCommand ||
      command == kTextExpanderCommand ||
      (command >= kAudioExpanderCommand && command < kAudioExpanderCommand + kMaxAudioParts)) {
    status.enabled = true;
    return true;
  }
  if (command >= kPlayAudioPartCommand && command < kPlayAudioPartCommand + kMaxAudioParts) {
    status.enabled = CanPlayAudioPart(command - kPlayAudioPartCommand);
    return true;
  }
  switch (command) {
    case kCommandClear:
    case kCommandPaste:
      // With nothing of the list's to act on, the answer is left to the keyframe area.
      if (command == kCommandClear) {
        OnDeleteStatus(command, status);
      } else {
        OnPasteStatus(status);
      }
      return status.enabled;
    case kCommandCut:
      OnDeleteStatus(command, status);
      return true;
    case kCommandCopy:
      OnCopyStatus(status);
      return true;
    case kCommandSelectAll:
      OnSelectAllStatus(status);
      return true;
    case kCommandDeselectAll:
      OnDeselectAllStatus(status);
      return true;
    case kDeleteEffectCommand:
    case kDeleteAllEffectsCommand:
    case kEffectsEnabledCommand:
    case kResetEffectCommand:
    case kSavePresetCommand:
      OnCommandStatus(command, status);
      return true;
    default:
      break;
  }
  return SubView::FindCommandStatus(command, status);
}

bool EffectControlsListView::ObeyCommand(CommandID command) {
  if (command == kVideoExpanderCommand) {
    OnVideoExpander();
    return true;
  }
  if (command == kGraphicsExpanderCommand) {
    OnGraphicsExpander();
    return true;
  }
  if (command == kTextExpanderCommand) {
    OnXOEditableTextExpander();
    return true;
  }
  if (command >= kAudioExpanderCommand && command < kAudioExpanderCommand + kMaxAudioParts) {
    OnAudioExpander(command);
    return true;
  }
  switch (command) {
    // Delete and paste answer "not handled" when there was nothing to act on, so that the
    // panel offers them to the keyframe area.
    case kCommandClear:
    case kDeleteEffectCommand:
      return OnDelete();
    case kCommandPaste:
      return OnPaste();
    case kCommandCut:
      return OnCut();
    case kCommandCopy:
      return OnCopy();
    case kCommandSelectAll:
      OnSelectAll();
      return true;
    case kCommandDeselectAll:
      OnDeselectAll();
      return true;
    case kDeleteAllEffectsCommand:
      OnDeleteAllEffects();
      return true;
    case kEffectsEnabledCommand:
      OnEffectEnabled();
      return true;
    case kResetEffectCommand:
      OnResetEffect();
      return true;
    default:
      break;
  }
  return SubView::ObeyCommand(command);
}

void EffectControlsListView::BroadcastListChanged() {
  BroadcastMessage(mOwnStation, EffectControlsListChangedMessage());
}

void EffectControlsListView::BroadcastRefreshKeyframes() {
  BroadcastMessage(mKeyframeStation, EffectControlsRefreshKeyframesMessage());
}

void EffectControlsListView::ListenTo(const StationName& station) {
  if (!station.empty()) {
    AddListener(station, *this);
  }
}

void EffectControlsListView::StopListeningTo(const StationName& station) {
  if (!station.empty()) {
    RemoveListener(station, *this);
  }
}

// --- Time ---

TickTime EffectControlsListView::GetEditTime() const {
  return mTimeline->GetEditTime();
}

bool EffectControlsListView::SetTimePerPixel(double secondsPerPixel) {
  return mTimeline->SetSecondsPerPixel(secondsPerPixel);
}

bool EffectControlsListView::SetVisibleKeyframeTime(TickTime time) {
  return mTimeline->SetVisibleStart(time);
}

double EffectControlsListView::GetTimePerPixel() const {
  return mTimeline->GetSecondsPerPixel();
}

TickTime EffectControlsListView::GetVisibleKeyframeTime() const {
  return mTimeline->GetVisibleStart();
}

const FrameRate& EffectControlsListView::GetPixelFrameRate() const {
  return mTimeline->GetPixelFrameRate();
}

void EffectControlsListView::OnTimelineChanged(const PanelTimelineChangedMessage& change) {
  if (change.Has(PanelTimeline::kEditTimeChanged)) {
    SyncRowsToTime(false);
  }
  if (change.Has(PanelTimeline::kZoomChanged) || change.Has(PanelTimeline::kVisibleStartChanged)) {
    Invalidate();
  }
}

// --- State dump ---

std::vector<StateDumpRow> EffectControlsListView::GetDumpRows(Point origin) const {
  std::vector<StateDumpRow> rows;
  auto dumpList = [&rows, origin](const EffectItemList& list) {
    for (const auto& row : list) {
      AppendDumpRows(row, {}, origin, rows);
    }
  };
  dumpList(mGraphicsItems);
  dumpList(mVideoItems);
  for (const auto& part : mAudioParts) {
    dumpList(part->GetItems());
  }
  return rows;
}

void EffectControlsListView::ForEachTopRow(
    const std::function<void(const std::shared_ptr<EffectItem>&)>& visit) const {
  for (const EffectItemList* list : {&mGraphicsItems, &mVideoItems}) {
    for (const auto& row : *list) {
      visit(row);
    }
  }
  for (const auto& part : mAudioParts) {
    for (const auto& row : part->GetItems()) {
      visit(row);
    }
  }
}
