// Building the rows of the effect list from its target, and tearing them down.
#include <cstddef>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/EffectRowPlan.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/FilterItemOptions.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
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
  mTimeReferenceItem = mVideoTrackItem ? mVideoTrackItem : mAudioTransitionItem;
}

SequenceTime EffectControlsListView::ClipTimeToSequenceTime(ClipTime clipTime) const {
  return mTimeReferenceItem ? mTimeReferenceItem->ClipTimeToSequenceTime(clipTime)
                            : SequenceTime(clipTime.Ticks());
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
  EffectRowSource source;
  source.mode = masterClipMode ? EffectRowMode::MasterClip : EffectRowMode::Clip;
  source.videoChain = mVideoChain;
  source.masterGraphicChain = mMasterGraphicChain;
  source.showCapsules = masterClip && masterClip->IsTemplate();
  const EffectRowPlan plan = PlanEffectRows(source, MakeRowRules());
  AddEffectRows(mGraphicsItems, plan.graphics, trackItem);
  AddEffectRows(mVideoItems, plan.video, trackItem);
  mVideoLimiterPresent = mVideoLimiterPresent || plan.videoLimiterPresent;
  if (plan.graphicsLayers && !mGraphicsItems.IsEmpty()) {
    mGraphicsExpanded = true;
    if (mGraphicsExpander) {
      mGraphicsExpander->SetValue(0);
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
  EffectRowSource source;
  source.mode = IsViewingMasterClip() ? EffectRowMode::MasterClip : EffectRowMode::Clip;
  source.audioItems = audioItems;
  const EffectRowPlan plan = PlanEffectRows(source, MakeRowRules());

  for (std::size_t index = 0; index < plan.audioParts.size(); ++index) {
    const TrackItemRef& item = plan.audioParts[index].item;
    auto part = std::make_shared<AudioPartInfo>(item);
    mAudioParts.push_back(part);
    part->SetExpanded(true);
    const int partIndex = static_cast<int>(index);
    if (auto expander = CreateAudioExpanderButton(partIndex)) {
      expander->SetValue(part->IsExpanded() ? 0 : 1);
      expander->Show();
      part->SetExpanderButton(std::move(expander));
    }
    if (plan.audioParts.size() >= 2) {
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
  for (std::size_t index = 0; index < plan.audioParts.size(); ++index) {
    const PlannedAudioPart& planned = plan.audioParts[index];
    EffectItemList& rows = mAudioParts[index]->GetItems();
    AddEffectRows(rows, planned.rows, planned.item);
    FinishAndShowRows(rows);
  }
  return plan.audioParts.empty() ? nullptr : plan.audioParts.front().item;
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
  EffectRowSource source;
  source.mode = EffectRowMode::TransitionEffects;
  source.videoChain = mTarget.transitionChain;
  const EffectRowPlan plan = PlanEffectRows(source, MakeRowRules());
  const std::size_t transitionRows = mVideoItems.Size();
  AddEffectRows(mVideoItems, plan.video, item);
  for (std::size_t index = transitionRows; index < mVideoItems.Size(); ++index) {
    mVideoItems[index]->FinishCreateSelf();
    mVideoItems[index]->Show();
  }
  mVideoLimiterPresent = mVideoLimiterPresent || plan.videoLimiterPresent;
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

EffectRowRules EffectControlsListView::MakeRowRules() const {
  EffectRowRules rules;
  rules.hideTimeRemapping = HasECPStyle(kStyleHideTimeRemapping);
  rules.noMaskControls = HasECPStyle(kStyleNoMaskControls);
  rules.noAudio = HasECPStyle(kStyleNoAudio);
  rules.maxAudioParts = static_cast<std::size_t>(kMaxAudioParts);
  return rules;
}

void EffectControlsListView::AddEffectRows(EffectItemList& section,
                                           const std::vector<PlannedRow>& effects,
                                           const TrackItemRef& trackItem) {
  for (const PlannedRow& effect : effects) {
    section.AddItem(MakeEffectRow(effect, trackItem));
  }
}

std::shared_ptr<FilterItem> EffectControlsListView::MakeEffectRow(const PlannedRow& effect,
                                                                  const TrackItemRef& trackItem) {
  FilterItemOptions options;
  options.topLevel = effect.groupLevel == 0;
  options.checkboxSwitch = HasECPStyle(kStyleCheckboxSwitch);
  options.noVideoSetupButton = HasECPStyle(kStyleNoVideoSetupButton);
  options.indent = HasECPStyle(kStyleIndentFilters) ? 40 : 0;
  options.startCollapsed = HasECPStyle(kStyleStartCollapsed);
  options.noIndent = HasECPStyle(kStyleNoFilterIndent);

  auto row = std::make_shared<FilterItem>(
      effect.mediaType, effect.component, trackItem, mTarget.sequence,
      effect.masterClipEffect ? mTarget.masterClip : nullptr, options, mOwnStation, this);
  row->SetIsMask(effect.isMask);
  row->SetGroupLevel(effect.groupLevel);
  AddPlannedRows(row, effect.children, trackItem, effect.masterClipEffect);
  return row;
}

void EffectControlsListView::AddPlannedRows(const std::shared_ptr<EffectItem>& parent,
                                            const std::vector<PlannedRow>& rows,
                                            const TrackItemRef& trackItem, bool masterClipEffect) {
  for (const PlannedRow& planned : rows) {
    switch (planned.kind) {
      case PlannedRowKind::Effect:
        parent->AddItem(MakeEffectRow(planned, trackItem));
        break;
      case PlannedRowKind::MaskShape:
        if (auto shape =
                ParameterRowFactory::CreateMaskShapeRow(this, mOwnStation, planned.component)) {
          shape->SetGroupLevel(planned.groupLevel);
          parent->AddItem(std::move(shape));
        }
        break;
      case PlannedRowKind::CustomAudio:
        parent->AddItem(ParameterRowFactory::CreateCustomAudioFilterRow(
            this, mOwnStation, planned.component, planned.customAudioIndex == 1));
        break;
      case PlannedRowKind::Group:
        AddGroupRow(parent, planned, trackItem, masterClipEffect);
        break;
      case PlannedRowKind::Parameter:
        LoadFilterParameterControls(trackItem, parent, static_cast<int>(planned.paramIndex),
                                    planned.component, planned.param, false, planned.groupLevel);
        break;
    }
  }
}

void EffectControlsListView::AddGroupRow(const std::shared_ptr<EffectItem>& parent,
                                         const PlannedRow& planned, const TrackItemRef& trackItem,
                                         bool masterClipEffect) {
  ParameterRowRequest request;
  request.info = MakeParameterInfo(trackItem, planned.component, planned.param, masterClipEffect);
  request.listStyle = mStyle;
  request.componentIsMask = planned.component->IsMask();
  std::shared_ptr<GroupBeginParameter> group = ParameterRowFactory::CreateGroupRow(request);
  if (!group) {
    return;
  }
  group->SetGroupLevel(planned.groupLevel);
  group->SetAside(!group->IsParamVisible());
  parent->AddItem(group);
  AddPlannedRows(group, planned.children, trackItem, masterClipEffect);
  // Closed: its children follow its expansion from now on.
  group->SetIsExpanded(group->IsExpanded());
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
  // An audio effect's plan leaves out what it hides; other effects ask the hook.
  if (component->GetMediaType() != MediaType::Audio && !ShouldAllowParameter(component, param)) {
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
