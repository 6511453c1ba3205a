// Building the rows of the effect list from its target, and tearing them down.
#include <algorithm>
#include <cstdint>
#include <string_view>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/FilterItemOptions.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/AudioFilterParamInfo.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/MultiPictureButton.h"

namespace {

// Effects the build treats by their match name.
constexpr std::string_view kMatchNameVideoLimiter = "XO.KRVN VideoLimiter";
constexpr std::string_view kMatchNameDigitalVideoLimiter = "XO.KRVN DigitalVideoLimiter";
constexpr std::string_view kMatchNameWarpStabilizer = "XO.KRVN WarpStabilizer";
constexpr std::string_view kMatchNameAutoReframe = "XO.KRVN AutoReframe";
constexpr std::string_view kMatchNameGraphicGroup = "XO.KRVN GraphicGroup";

// Audio part order keys at or above this are not parts.
constexpr std::uint32_t kMaxPartOrderKey = 10000;

// An audio effect whose plug-in brings its own window (the host's audio effects with a setup
// dialog) gets the custom-setup and channel-map rows.
bool HasCustomAudioUI(const Component& component) {
  return component.GetMediaType() == MediaType::Audio && component.HasSetupDialog();
}

// The first item of a group's video or audio items; a group that lists a missing item is a
// broken model, reported as a missing interface (the rebuild then ends).
const TrackItemRef* FirstItem(const std::vector<TrackItemRef>& items) {
  if (items.empty()) {
    return nullptr;
  }
  if (!items.front()) {
    throw NullInterfaceException("ITrackItem");
  }
  return &items.front();
}

// One group row open while a component's parameters are walked.
struct OpenGroup {
  std::shared_ptr<EffectItem> row;
  // Parameters still to come for a counted group; -1 for a group closed by a group end.
  long long remaining = -1;
};

// Closes the innermost open group: its children follow its expansion from now on.
void CloseGroup(std::vector<OpenGroup>& stack) {
  const std::shared_ptr<EffectItem> row = stack.back().row;
  stack.pop_back();
  row->SetIsExpanded(row->IsExpanded());
}

}  // namespace

// --- Whole list ---

void EffectControlsListView::ClearAndRebuildList() {
  ClearList();
  if (mTarget.kind == kTargetClip || mTarget.kind == kTargetTransition ||
      mTarget.kind == kTargetTransitionComponent) {
    try {
      RebuildClipOrTransitionView();
    } catch (...) {
      // A model object the build needs was missing (the dispatch reports it). Half a list,
      // unfinished and unplaced, must not stay on screen: show none and say so.
      ClearList();
      PositionItems();
      UpdateVScrollBar();
      BroadcastListChanged();
      Invalidate();
      BroadcastRefreshKeyframes();
      throw;
    }
  }
  mBuiltTarget = mTarget;
  UpdateVScrollBar();
  BroadcastListChanged();
  Invalidate();
  BroadcastRefreshKeyframes();
  AutoSelectNthEmbeddedEffect();
}

void EffectControlsListView::ClearList() {
  ClearSelection();
  mVideoItems.Clear();
  mGraphicsItems.Clear();
  for (const auto& part : mAudioParts) {
    part->GetItems().Clear();
  }
  ClearAudioPartsList();
  mVideoExpanded = false;
  if (mVideoExpander) {
    mVideoExpander->SetValue(1);
    mVideoExpander->Hide();
  }
  mGraphicsExpanded = false;
  if (mGraphicsExpander) {
    mGraphicsExpander->SetValue(1);
    mGraphicsExpander->Hide();
  }
  StopListeningTo(mVideoTrackItemStation);
  mVideoTrackItemStation.clear();
  // The chains are let go: their changes are no longer the list's business.
  StopListeningTo(mChainStation);
  StopListeningTo(mMasterGraphicChainStation);
  mChainStation.clear();
  mMasterGraphicChainStation.clear();
  mVideoTrackItem.reset();
  mVideoChain.reset();
  mMasterGraphicChain.reset();
  mAudioTransitionItem.reset();
  // The transition chain is what the selection chose to show; the rebuild that follows needs it.
  mKeyframeSelection.reset();
  mTextExpanded = false;
  if (mTextExpander) {
    mTextExpander->SetValue(1);
    mTextExpander->Hide();
  }
  mVideoHeaderTop = -1;
  mGraphicsHeaderTop = -1;
  mBuiltTarget.reset();
}

void EffectControlsListView::RebuildClipOrTransitionView() {
  if (!mTarget.sequence) {
    return;
  }
  mVideoLimiterPresent = false;
  const std::vector<TrackItemGroup>& selection = mTarget.sequence->GetSelection();
  if (!selection.empty()) {
    // Linked video and audio items selected as two groups are one clip.
    TrackItemGroup group = selection.front();
    if (selection.size() == 2 && mTarget.showVideo && mTarget.showAudio &&
        group.audioItems.empty()) {
      group.audioItems = selection[1].audioItems;
    }
    if (mTarget.kind == kTargetTransition) {
      RebuildTransitionView(&group);
    } else if (mTarget.transitionChain) {
      RebuildTransitionComponentView(&group);
    } else {
      if (mTarget.showVideo) {
        RebuildVideoClipView(&group);
      }
      if (mTarget.showAudio) {
        RebuildAudioClipView(&group);
      }
    }
  }
  ResetTimes();
  if (!mVideoTrackItem) {
    LoadFilterPlaceholder();
  }
  PositionItems();
}

void EffectControlsListView::ResetTimes() {
  const TrackItemRef& item = mVideoTrackItem ? mVideoTrackItem : mAudioTransitionItem;
  mTrackItemStart = item ? item->GetStart() : 0;
  mTrackItemMediaIn = item ? item->GetMediaIn() : 0;
}

void EffectControlsListView::NewKeyframeSelection() {
  mKeyframeSelection = std::make_shared<KeyframeMultiSelection>(mTarget.sequence);
}

void EffectControlsListView::FinishAndShowRows(const EffectItemList& list) {
  for (const auto& row : list) {
    row->FinishCreateSelf();
    row->Show();
  }
}

void EffectControlsListView::UpdateParamsUI(TickTime editTime, bool force) {
  mTimeline->SetEditTime(editTime);
  SyncRowsToTime(force);
}

void EffectControlsListView::SyncRowsToTime(bool force) {
  ForEachTopRow(
      [force](const std::shared_ptr<EffectItem>& row) { row->RecursiveSynchToTime(force); });
}

// --- Video clip ---

void EffectControlsListView::RebuildVideoClipView(const TrackItemGroup* inTrackItemGroup) {
  HOST_ASSERT(inTrackItemGroup != NULL, "Invalid inTrackItemGroup");
  if (inTrackItemGroup == nullptr) {
    return;
  }
  const TrackItemRef* first = FirstItem(inTrackItemGroup->videoItems);
  if (first == nullptr || !(*first)->IsClip()) {
    return;
  }
  const TrackItemRef item = *first;
  mVideoTrackItemStation = item->GetStation();
  ListenTo(mVideoTrackItemStation);
  if (mTarget.masterClip) {
    LoadVideoFilters(item, mTarget.masterClip->GetVideoChain(), true);
  } else {
    LoadVideoFilters(item, item->GetComponentChain(), false);
  }
  mVideoTrackItem = item;
}

void EffectControlsListView::LoadVideoFilters(const TrackItemRef& trackItem,
                                              const ComponentChainRef& chain, bool masterClipMode) {
  mTarget.kind = kTargetClip;
  mVideoExpanded = true;
  if (mVideoExpander) {
    mVideoExpander->SetValue(0);
  }

  mVideoChain = chain;
  const MasterClipRef masterClip = trackItem ? trackItem->GetMasterClip() : nullptr;
  mMasterGraphicChain.reset();
  if (masterClip && masterClip->IsMasterGraphic() && masterClip->GetVideoChain() != chain) {
    mMasterGraphicChain = masterClip->GetVideoChain();
  }

  StopListeningTo(mChainStation);
  StopListeningTo(mMasterGraphicChainStation);
  mChainStation = mVideoChain ? mVideoChain->GetStation() : StationName();
  mMasterGraphicChainStation =
      mMasterGraphicChain ? mMasterGraphicChain->GetStation() : StationName();
  ListenTo(mChainStation);
  ListenTo(mMasterGraphicChainStation);

  NewKeyframeSelection();
  if (!mVideoChain) {
    return;
  }
  const bool isTemplate = masterClip && masterClip->IsTemplate();

  // Intrinsics, last in the chain first.
  for (int position = mVideoChain->GetCount() - 1; position >= 0; --position) {
    const ComponentRef component = mVideoChain->GetAt(position);
    if (!component->IsIntrinsic()) {
      continue;
    }
    if (HasECPStyle(kStyleHideTimeRemapping) && component->IsTimeRemapping()) {
      continue;
    }
    if (component->IsCapsule() && !isTemplate) {
      continue;
    }
    auto row =
        LoadFilter(MediaType::Video, trackItem, component, {.masterClipMode = masterClipMode});
    if (component->GetMatchName() == kMatchNameGraphicGroup) {
      mGraphicsItems.AddItem(row);
    } else {
      mVideoItems.AddItem(row);
    }
  }

  int lastGraphics = -1;
  for (int position = 0; position < mVideoChain->GetCount(); ++position) {
    if (mVideoChain->GetAt(position)->IsGraphicsComponent()) {
      lastGraphics = position;
    }
  }

  if (lastGraphics >= 0) {
    // A graphics clip: its layers in chain order, then the master graphic's.
    for (const ComponentChainRef& layers : {mVideoChain, mMasterGraphicChain}) {
      if (!layers) {
        continue;
      }
      for (const ComponentRef& component : layers->GetComponents()) {
        if (!component->IsIntrinsic()) {
          mGraphicsItems.AddItem(LoadFilter(MediaType::Video, trackItem, component,
                                            {.masterClipMode = masterClipMode}));
        }
      }
    }
    if (!mGraphicsItems.IsEmpty()) {
      mGraphicsExpanded = true;
      if (mGraphicsExpander) {
        mGraphicsExpander->SetValue(0);
      }
    }
  } else {
    // Applied effects, the last applied at the top.
    for (int position = mVideoChain->GetCount() - 1; position >= 0; --position) {
      const ComponentRef component = mVideoChain->GetAt(position);
      if (!component->IsIntrinsic()) {
        mVideoItems.AddItem(
            LoadFilter(MediaType::Video, trackItem, component, {.masterClipMode = masterClipMode}));
      }
    }
  }

  FinishAndShowRows(mVideoItems);
  FinishAndShowRows(mGraphicsItems);
  if (mVideoExpander && !mVideoItems.IsEmpty()) {
    mVideoExpander->Show();
  }
  if (mGraphicsExpander && !mGraphicsItems.IsEmpty()) {
    mGraphicsExpander->Show();
  }
  UpdateParamsUI(GetEditTime(), true);
}

// --- Audio clip ---

void EffectControlsListView::RebuildAudioClipView(const TrackItemGroup* inTrackItemGroup) {
  HOST_ASSERT(inTrackItemGroup != NULL, "Invalid inTrackItemGroup");
  if (inTrackItemGroup == nullptr) {
    return;
  }
  if (HasECPStyle(kStyleNoAudio)) {
    return;
  }
  const std::vector<TrackItemRef>& items = inTrackItemGroup->audioItems;
  const TrackItemRef* first = FirstItem(items);
  if (first == nullptr || !(*first)->IsClip() || mTarget.masterClip) {
    return;
  }
  LoadAudioFilters(items);
}

TrackItemRef EffectControlsListView::LoadAudioFilters(const std::vector<TrackItemRef>& audioItems) {
  mTarget.kind = kTargetClip;
  // Parts in the order of their keys. Items that share a key keep the order they came in: each
  // is a part of the clip and must not disappear from the list.
  std::vector<TrackItemRef> ordered;
  for (const TrackItemRef& item : audioItems) {
    if (item && item->IsClip() && item->GetPartOrderKey() < kMaxPartOrderKey) {
      ordered.push_back(item);
    }
  }
  std::stable_sort(ordered.begin(), ordered.end(),
                   [](const TrackItemRef& a, const TrackItemRef& b) {
                     return a->GetPartOrderKey() < b->GetPartOrderKey();
                   });
  if (ordered.size() > static_cast<std::size_t>(kMaxAudioParts)) {
    // The parts' buttons have a command each, kMaxAudioParts of them.
    ordered.resize(static_cast<std::size_t>(kMaxAudioParts));
  }

  for (std::size_t index = 0; index < ordered.size(); ++index) {
    const TrackItemRef& item = ordered[index];
    auto part = std::make_shared<AudioPartInfo>(item);
    mAudioParts.push_back(part);
    part->SetExpanded(true);
    const int partIndex = static_cast<int>(index);
    if (auto expander = CreateAudioExpanderButton(partIndex)) {
      expander->SetValue(part->IsExpanded() ? 0 : 1);
      expander->Show();
      part->SetExpanderButton(std::move(expander));
    }
    if (ordered.size() >= 2) {
      if (auto play = CreatePlayButton(partIndex)) {
        play->Show();
        play->SetEnabled(CanPlayAudioPart(partIndex));
        part->SetPlayButton(std::move(play));
      }
    }
    const ComponentChainRef& chain = item->GetComponentChain();
    part->SetStations(item->GetStation(), chain ? chain->GetStation() : StationName());
    ListenTo(part->GetItemStation());
    ListenTo(part->GetChainStation());
  }

  NewKeyframeSelection();
  for (const auto& part : mAudioParts) {
    const TrackItemRef& item = part->GetTrackItem();
    if (const ComponentChainRef& chain = item->GetComponentChain()) {
      for (const ComponentRef& component : chain->GetComponents()) {
        part->GetItems().AddItem(LoadFilter(MediaType::Audio, item, component, {}));
      }
    }
    FinishAndShowRows(part->GetItems());
  }
  return ordered.empty() ? nullptr : ordered.front();
}

bool EffectControlsListView::CanPlayAudioPart(int index) const {
  const AudioPartInfo* part = FindAudioPartInfoByIndex(index);
  if (part == nullptr || !part->IsClipPart()) {
    return false;
  }
  const TrackItemRef& item = part->GetTrackItem();
  const MasterClipRef& masterClip = item->GetMasterClip();
  return masterClip && masterClip->GetMedia() && masterClip->GetMedia()->HasAudio() &&
         item->GetSpeed() == 1.0;
}

void EffectControlsListView::ClearAudioPartsList() {
  for (const auto& part : mAudioParts) {
    for (const StationName& station : {part->GetItemStation(), part->GetChainStation()}) {
      if (!station.empty() && StationExists(station)) {
        RemoveListener(station, *this);
      }
    }
    part->Clear();
  }
  mAudioParts.clear();
}

AudioPartInfo* EffectControlsListView::FindAudioPartInfoByIndex(int index) const {
  if (index < 0 || index >= static_cast<int>(mAudioParts.size())) {
    return nullptr;
  }
  return mAudioParts[static_cast<std::size_t>(index)].get();
}

AudioPartInfo* EffectControlsListView::FindAudioPartInfo(const EffectItem& row) const {
  for (const auto& part : mAudioParts) {
    const bool found = !part->GetItems().ForEachRow(
        [&row](const EffectItemList::Row& candidate) { return candidate.get() != &row; });
    if (found) {
      return part.get();
    }
  }
  return nullptr;
}

// --- Transitions ---

void EffectControlsListView::RebuildTransitionView(const TrackItemGroup* inTrackItemGroup) {
  HOST_ASSERT(inTrackItemGroup != NULL, "Invalid inTrackItemGroup");
  if (inTrackItemGroup == nullptr) {
    return;
  }
  if (mTarget.showVideo) {
    const TrackItemRef* first = FirstItem(inTrackItemGroup->videoItems);
    if (first != nullptr && (*first)->IsTransition()) {
      const TrackItemRef item = *first;
      LoadVideoTransition(item);
      mVideoTrackItem = item;
    }
  } else if (mTarget.showAudio) {
    const TrackItemRef* first = FirstItem(inTrackItemGroup->audioItems);
    if (first != nullptr && (*first)->IsTransition()) {
      const TrackItemRef item = *first;
      LoadAudioTransition(item);
      mAudioTransitionItem = item;
    }
  }
}

void EffectControlsListView::RebuildTransitionComponentView(
    const TrackItemGroup* inTrackItemGroup) {
  HOST_ASSERT(inTrackItemGroup != NULL, "Invalid inTrackItemGroup");
  if (inTrackItemGroup == nullptr) {
    return;
  }
  mVideoExpanded = true;
  if (mVideoExpander) {
    mVideoExpander->SetValue(0);
  }
  const TrackItemRef* first = FirstItem(inTrackItemGroup->videoItems);
  if (first == nullptr || !(*first)->IsTransition()) {
    return;
  }
  const TrackItemRef item = *first;
  LoadVideoTransition(item);
  mVideoTrackItem = item;
  NewKeyframeSelection();
  // The first component of the chain is the transition itself, which its row presents; the
  // next one carries the settings the transition exposes as an effect.
  if (mTarget.transitionChain && mTarget.transitionChain->GetCount() > 1) {
    auto row = LoadFilter(MediaType::Video, item, mTarget.transitionChain->GetAt(1),
                          {.allowMasks = false});
    mVideoItems.AddItem(row);
    row->FinishCreateSelf();
    row->Show();
  }
  UpdateParamsUI(GetEditTime(), true);
}

void EffectControlsListView::LoadVideoTransition(const TrackItemRef& trackItem) {
  auto row = ParameterRowFactory::CreateVideoTransitionRow(this, mOwnStation, trackItem);
  if (!row) {
    return;
  }
  StopListeningTo(mVideoTrackItemStation);
  mVideoTrackItemStation = trackItem->GetStation();
  ListenTo(mVideoTrackItemStation);
  mVideoItems.AddItem(row);
  row->FinishCreateSelf();
  row->Show();
}

void EffectControlsListView::LoadAudioTransition(const TrackItemRef& trackItem) {
  auto row = ParameterRowFactory::CreateAudioTransitionRow(this, mOwnStation, trackItem);
  if (!row) {
    return;
  }
  auto part = std::make_shared<AudioPartInfo>(trackItem);
  part->SetExpanded(true);
  part->SetStations(trackItem->GetStation(), StationName());
  ListenTo(part->GetItemStation());
  part->GetItems().AddItem(row);
  mAudioParts.push_back(part);
  row->FinishCreateSelf();
  row->Show();
}

// --- One effect ---

std::shared_ptr<FilterItem> EffectControlsListView::LoadFilter(MediaType mediaType,
                                                               const TrackItemRef& trackItem,
                                                               const ComponentRef& component,
                                                               const FilterRowOptions& rowOptions) {
  if (!component) {
    throw NullInterfaceException("IComponent");
  }
  const bool maskRow = rowOptions.isMask && component->GetMatchName() == kMatchName_Mask;

  FilterItemOptions options;
  options.topLevel = rowOptions.subgroupLevel == 0;
  options.checkboxSwitch = HasECPStyle(kStyleCheckboxSwitch);
  options.noVideoSetupButton = HasECPStyle(kStyleNoVideoSetupButton);
  options.indent = HasECPStyle(kStyleIndentFilters) ? 40 : 0;
  options.startCollapsed = HasECPStyle(kStyleStartCollapsed);
  options.noIndent = HasECPStyle(kStyleNoFilterIndent);

  auto row = std::make_shared<FilterItem>(mediaType, component, trackItem, mTarget.sequence,
                                          rowOptions.masterClipMode ? mTarget.masterClip : nullptr,
                                          options, mOwnStation, this);
  row->SetIsMask(maskRow);
  row->SetGroupLevel(rowOptions.subgroupLevel);
  if (component->IsOffline()) {
    return row;
  }
  // Layers of a master graphic's chain nest no deeper here: the row's own subgroup level says
  // how deep a layer sits.
  const int baseLevel = rowOptions.subgroupLevel;

  if (mediaType == MediaType::Audio && HasCustomAudioUI(*component)) {
    for (const bool second : {false, true}) {
      row->AddItem(
          ParameterRowFactory::CreateCustomAudioFilterRow(this, mOwnStation, component, second));
    }
  }

  if (mediaType == MediaType::Video &&
      (component->GetMatchName() == kMatchNameVideoLimiter ||
       component->GetMatchName() == kMatchNameDigitalVideoLimiter)) {
    mVideoLimiterPresent = true;
  }

  if (mediaType == MediaType::Video && !HasECPStyle(kStyleNoMaskControls)) {
    const std::string& matchName = component->GetMatchName();
    const bool takesMaskShape = component->CanTakeMasks() &&
                                (!component->IsIntrinsic() || matchName == kMatchName_Opacity) &&
                                rowOptions.allowMasks && !rowOptions.masterClipMode &&
                                matchName != kMatchNameWarpStabilizer &&
                                matchName != kMatchNameAutoReframe;
    if (takesMaskShape) {
      if (auto shape = ParameterRowFactory::CreateMaskShapeRow(this, mOwnStation, component)) {
        shape->SetGroupLevel(baseLevel);
        row->AddItem(std::move(shape));
      }
    }
    for (const ComponentRef& mask : component->GetMasks()) {
      row->AddItem(
          LoadFilter(MediaType::Video, trackItem, mask,
                     {.allowMasks = false, .subgroupLevel = baseLevel + 1, .isMask = true}));
    }
  }

  // Parameters, with the open groups on a stack above the effect row.
  std::vector<OpenGroup> stack;
  auto container = [&]() -> std::shared_ptr<EffectItem> {
    return stack.empty() ? std::shared_ptr<EffectItem>(row) : stack.back().row;
  };
  auto level = [&] { return baseLevel + static_cast<int>(stack.size()); };
  const std::vector<ComponentParamRef>& params = component->GetParams();
  for (std::size_t position = 0; position < params.size(); ++position) {
    const ComponentParamRef& param = params[position];
    // A counted group spans the parameters that follow it, whatever they are.
    for (OpenGroup& open : stack) {
      if (open.remaining > 0) {
        --open.remaining;
      }
    }
    if (param->GetType() == ParamType::GroupBegin) {
      ParameterRowRequest request;
      request.info = MakeParameterInfo(trackItem, component, param, rowOptions.masterClipMode);
      request.listStyle = mStyle;
      request.componentIsMask = component->IsMask();
      std::shared_ptr<GroupBeginParameter> group = ParameterRowFactory::CreateGroupRow(request);
      if (group) {
        group->SetGroupLevel(level());
        group->SetAside(!group->IsParamVisible());
        container()->AddItem(group);
        OpenGroup open{group, -1};
        if (param->GetGroupKind() == GroupKind::Counted) {
          open.remaining = static_cast<long long>(GroupBeginParameter::CountGroupEntries(*param));
        }
        stack.push_back(std::move(open));
      }
    } else if (param->GetType() == ParamType::GroupEnd) {
      // Closes the innermost group that waits for an end, and the counted groups inside it.
      const auto waiting = std::find_if(stack.rbegin(), stack.rend(),
                                        [](const OpenGroup& open) { return open.remaining < 0; });
      if (waiting != stack.rend()) {
        const std::size_t keep = static_cast<std::size_t>(stack.rend() - waiting) - 1;
        while (stack.size() > keep) {
          CloseGroup(stack);
        }
      }
    } else {
      LoadFilterParameterControls(trackItem, container(), static_cast<int>(position), component,
                                  param, false, level());
    }
    while (!stack.empty() && stack.back().remaining == 0) {
      CloseGroup(stack);
    }
  }
  while (!stack.empty()) {
    CloseGroup(stack);
  }
  return row;
}

ParameterControlInfo EffectControlsListView::MakeParameterInfo(const TrackItemRef& trackItem,
                                                               const ComponentRef& component,
                                                               const ComponentParamRef& param,
                                                               bool masterClipMode) const {
  ParameterControlInfo info;
  info.parentView = const_cast<EffectControlsListView*>(this);
  info.station = mOwnStation;
  info.sequence = mTarget.sequence;
  info.component = component;
  info.param = param;
  // Master-clip effects keep their keyframes in the clip's own time.
  info.trackItem = masterClipMode ? nullptr : trackItem;
  info.editTime = PanelTimeline::ShareEditTime(mTimeline);
  info.readOnly = IsReadOnlyEffectContainer();
  return info;
}

void EffectControlsListView::LoadFilterParameterControls(
    const TrackItemRef& trackItem, const std::shared_ptr<EffectItem>& parentRow,
    int /*controlIndex*/, const ComponentRef& component, const ComponentParamRef& param,
    bool suppressReset, int subgroupLevel) {
  if (!parentRow || !component || !param) {
    return;
  }
  // An audio effect says itself which of its parameters it shows; other effects ask the hook.
  if (component->GetMediaType() == MediaType::Audio) {
    const auto audioInfo = AudioFilterParamInfo::ForComponent(*component);
    const std::size_t index = component->GetParamIndex(param.get());
    if (!audioInfo || index == 0 ||
        !audioInfo->IsParamShown(static_cast<std::uint32_t>(index - 1))) {
      return;
    }
  } else if (!ShouldAllowParameter(component, param)) {
    return;
  }
  ParameterRowRequest request;
  request.info = MakeParameterInfo(trackItem, component, param, IsViewingMasterClip());
  request.listStyle = mStyle;
  request.suppressReset = suppressReset;
  request.componentIsMask = component->IsMask();
  for (const std::shared_ptr<ParameterControl>& row :
       ParameterRowFactory::CreateParameterRows(request)) {
    row->SetGroupLevel(subgroupLevel);
    row->SetAside(!row->IsParamVisible());
    parentRow->AddItem(row);
  }
}
