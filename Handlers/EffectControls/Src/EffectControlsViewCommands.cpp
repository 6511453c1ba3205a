#include <algorithm>
#include <optional>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequencePropertyActions.h"
#include "Host/Model/SequenceSettingsActions.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/TimeBarControl.h"

namespace {

// The snapping option a snapping command toggles.
std::optional<EffectControlsKeyframeView::SnapFlag> SnapFlagFor(CommandID command) {
  switch (command) {
    case EffectControlsView::kToggleSnappingCommand:
      return EffectControlsKeyframeView::kSnapKeyframes;
    case EffectControlsView::kSnapToVideoCommand:
      return EffectControlsKeyframeView::kSnapVideo;
    case EffectControlsView::kSnapToAudioCommand:
      return EffectControlsKeyframeView::kSnapAudio;
    case EffectControlsView::kSnapToMarkersCommand:
      return EffectControlsKeyframeView::kSnapMarkers;
    case EffectControlsView::kSnapToCurrentTimeCommand:
      return EffectControlsKeyframeView::kSnapCurrentTime;
    case EffectControlsView::kSnapToClipCommand:
      return EffectControlsKeyframeView::kSnapClip;
    default:
      return std::nullopt;
  }
}

// A host navigation or marker command as the panel takes it.
struct NavigationCommand {
  CommandID command;
  // Changes the sequence (or master clip): refused while the effects are read only.
  bool edits;
  // What it does to a targeted master clip instead; none: it acts on the sequence in either
  // mode (markers added or edited from here are sequence markers).
  std::optional<EffectControlsView::MasterClipNavigation> onMasterClip;
};

using View = EffectControlsView;
constexpr NavigationCommand kNavigationCommands[] = {
    {View::kMarkInCommand, true, View::kNavMarkIn},
    {View::kMarkOutCommand, true, View::kNavMarkOut},
    {View::kGoToInCommand, false, View::kNavGoToIn},
    {View::kGoToOutCommand, false, View::kNavGoToOut},
    {View::kClearInCommand, true, View::kNavClearIn},
    {View::kClearOutCommand, true, View::kNavClearOut},
    {View::kClearInOutCommand, true, View::kNavClearInOut},
    {View::kAddMarkerCommand, true, std::nullopt},
    {View::kClearMarkerCommand, true, std::nullopt},
    {View::kClearAllMarkersCommand, true, View::kNavClearAllMarkers},
    {View::kNextMarkerCommand, false, View::kNavNextMarker},
    {View::kPreviousMarkerCommand, false, View::kNavPreviousMarker},
    {View::kEditMarkerCommand, true, std::nullopt},
};
// Each command of the range adds a marker of one colour.
constexpr NavigationCommand kColoredMarkerCommand{View::kFirstColoredMarkerCommand, true,
                                                  std::nullopt};

// Null when `command` is no navigation command.
const NavigationCommand* FindNavigationCommand(CommandID command) {
  for (const NavigationCommand& entry : kNavigationCommands) {
    if (entry.command == command) {
      return &entry;
    }
  }
  if (command >= View::kFirstColoredMarkerCommand && command <= View::kLastColoredMarkerCommand) {
    return &kColoredMarkerCommand;
  }
  return nullptr;
}

}  // namespace

bool EffectControlsView::IsNavigationCommand(CommandID command) const {
  return FindNavigationCommand(command) != nullptr;
}

bool EffectControlsView::OnNavigationCommand(CommandID command) {
  const NavigationCommand* navigation = FindNavigationCommand(command);
  if (GetMasterClip() && navigation != nullptr && navigation->onMasterClip) {
    return NavigateMasterClip(*navigation->onMasterClip);
  }
  if (!mSequence) {
    return false;
  }
  // Marker edits go to the markers the ruler shows.
  mMarkers.SetMasterClip(GetMasterClip(), GetMasterClipItem());
  const TickTime editLine = mTimeline->GetEditTime();
  switch (command) {
    case kMarkInCommand:
      SequencePropertyActions::SetInPoint(mSequence, SnapToFrame(editLine));
      return true;
    case kMarkOutCommand: {
      const TickTime out = std::min(SnapToFrame(editLine), mRuler->GetEndTime());
      SequencePropertyActions::SetOutPoint(mSequence, out);
      return true;
    }
    case kGoToInCommand:
      SetEditTime(mSequence->GetInPoint().value_or(0));
      return true;
    case kGoToOutCommand:
      if (const auto out = mSequence->GetOutPoint()) {
        SetEditTime(*out);
      }
      return true;
    case kClearInCommand:
      SequencePropertyActions::SetInPoint(mSequence, std::nullopt);
      return true;
    case kClearOutCommand:
      SequencePropertyActions::SetOutPoint(mSequence, std::nullopt);
      return true;
    case kClearInOutCommand:
      SequencePropertyActions::SetInOutPoints(mSequence, std::nullopt, std::nullopt);
      return true;
    case kAddMarkerCommand:
      mMarkers.AddAt(editLine, 0);
      return true;
    case kClearMarkerCommand:
      mMarkers.RemoveSelectedAt(editLine);
      return true;
    case kClearAllMarkersCommand:
      mMarkers.ClearAll();
      ReloadMarkers();
      return true;
    case kNextMarkerCommand:
    case kPreviousMarkerCommand: {
      const auto time =
          command == kNextMarkerCommand ? mMarkers.Next(editLine) : mMarkers.Previous(editLine);
      if (time) {
        SetEditTime(*time);
        mMarkers.SelectAt(*time);
        mRuler->Invalidate();
      }
      return true;
    }
    case kEditMarkerCommand:
      if (const auto id = mMarkers.FindAt(editLine)) {
        EditMarker(*id);
      }
      return true;
    default:
      if (command >= kFirstColoredMarkerCommand && command <= kLastColoredMarkerCommand) {
        mMarkers.AddAt(editLine, command - kFirstColoredMarkerCommand);
        return true;
      }
      return false;
  }
}

// --- Commands ---

bool EffectControlsView::CanEdit() const {
  return !mListView->IsReadOnlyEffectContainer() && !(mSequence && mSequence->IsReadOnly());
}

bool EffectControlsView::IsEditingCommand(CommandID command) const {
  switch (command) {
    case kRenameCommand:
    case kSavePresetCommand:
    case kEffectsEnabledCommand:
    case kDeleteEffectCommand:
    case kResetEffectCommand:
    case kDeleteAllEffectsCommand:
    case kCommandPaste:
    case kCommandClear:
    case kSequenceEditCommand:
    case kBlendModePreviousCommand:
    case kBlendModeNextCommand:
    case kCapsuleResetAllCommand:
      return true;
    default:
      if (const NavigationCommand* navigation = FindNavigationCommand(command)) {
        return navigation->edits;
      }
      return command >= kFirstCapsuleResetCommand && command <= kLastCapsuleResetCommand;
  }
}

bool EffectControlsView::FindCommandStatus(CommandID command, CommandStatus& status) {
  status = CommandStatus{};
  const bool editable = CanEdit();
  if (const auto flag = SnapFlagFor(command)) {
    status.enabled = true;
    status.checked = mKeyframeView->IsSnapFlagSet(*flag);
    return true;
  }
  switch (command) {
    case kToggleKeyframesCommand:
      status.enabled = true;
      status.checked = mKeyframesVisible;
      return true;
    case kPinToClipCommand:
      status.enabled = mTargetMode == kTargetClip;
      status.checked = mPinned;
      return true;
    case kAudioTimeUnitsCommand:
      status.enabled = mSequence != nullptr;
      status.checked = mAudioTimeUnits;
      return true;
    case kRulerNumbersCommand:
      status.enabled = true;
      status.checked = mRuler->AreNumbersShown();
      return true;
    case kOwnSliderRowsCommand:
      status.enabled = true;
      status.checked = HasOwnSliderRows();
      return true;
    case kLoopAudioCommand:
      status.enabled = mLoopButton && mLoopButton->IsEnabled();
      status.checked = mAudioLoop;
      return true;
    case kPlayAudioCommand:
      status.enabled = mListView->GetNumberOfAudioParts() == 1 && mListView->CanPlayAudioPart(0);
      return true;
    case kZoomInCommand:
    case kZoomOutCommand:
      status.enabled = mTargetMode != kTargetNone && mKeyframesVisible;
      return true;
    case kSnapToAllCommand:
    case kSnapToNoneCommand:
      status.enabled = true;
      return true;
    case kRenameCommand: {
      const auto& entries = mListView->GetSelectedItems().GetEntries();
      status.enabled = editable && entries.size() == 1 && entries.front().component &&
                       !entries.front().component->IsGraphicsComponent();
      return true;
    }
    default:
      break;
  }
  if (IsNavigationCommand(command)) {
    const bool target = mSequence != nullptr || GetMasterClip() != nullptr;
    status.enabled = target && (editable || !IsEditingCommand(command));
    if (command == kEditMarkerCommand && status.enabled) {
      mMarkers.SetMasterClip(GetMasterClip(), GetMasterClipItem());
      status.enabled = mMarkers.FindAt(mTimeline->GetEditTime()).has_value();
    }
    return true;
  }
  switch (command) {
    case kSavePresetCommand:
    case kEffectsEnabledCommand:
    case kDeleteEffectCommand:
    case kResetEffectCommand:
    case kDeleteAllEffectsCommand:
      // The list answers for its effect commands.
      if (!mListView->FindCommandStatus(command, status)) {
        status = CommandStatus{};
      }
      status.enabled = status.enabled && editable;
      return true;
    case kCommandClear:
    case kCommandPaste:
      if (!mListView->FindCommandStatus(command, status) || !status.enabled) {
        status = CommandStatus{};
        mKeyframeView->FindCommandStatus(command, status);
      }
      status.enabled = status.enabled && editable;
      return true;
    case kCommandCut:
    case kCommandCopy:
      if (!mListView->FindCommandStatus(command, status) || !status.enabled) {
        status = CommandStatus{};
        mKeyframeView->FindCommandStatus(command, status);
      }
      if (command == kCommandCut) {
        status.enabled = status.enabled && editable;
      }
      return true;
    case kKeyframeAreaCommand:
      if (!mKeyframeView->FindCommandStatus(command, status)) {
        status = CommandStatus{};
      }
      return true;
    case kSequenceEditCommand:
      status.enabled = false;
      return true;
    case kBlendModePreviousCommand:
    case kBlendModeNextCommand:
      status.enabled = editable && StepBlendMode(command == kBlendModeNextCommand ? 1 : -1, false);
      return true;
    case kCapsuleResetAllCommand:
      status.enabled = editable && ResetCapsuleParameters(std::nullopt, false);
      return true;
    default:
      if (command >= kFirstCapsuleResetCommand && command <= kLastCapsuleResetCommand) {
        status.enabled =
            editable && ResetCapsuleParameters(
                            static_cast<std::size_t>(command - kFirstCapsuleResetCommand), false);
        return true;
      }
      if (EffectControlsKeyframeView::IsKeyframeCommand(command)) {
        return mKeyframeView->FindCommandStatus(command, status);
      }
      break;
  }
  if (command > kPlayAudioCommand && command < kPlayAudioCommand + 50) {
    return mListView->FindCommandStatus(command, status);
  }
  return TabView::FindCommandStatus(command, status);
}

bool EffectControlsView::ObeyCommand(CommandID command) {
  if (IsEditingCommand(command) && !CanEdit()) {
    // A read-only container takes editing commands and does nothing.
    return true;
  }
  if (const auto flag = SnapFlagFor(command)) {
    mKeyframeView->ToggleSnapFlag(*flag);
    return true;
  }
  switch (command) {
    case kToggleKeyframesCommand:
      ToggleKeyframesVisible();
      return true;
    case kZoomInCommand:
      ZoomToTimePerPixel(mTimeline->GetSecondsPerPixel() * 0.5, true);
      return true;
    case kZoomOutCommand:
      ZoomToTimePerPixel(mTimeline->GetSecondsPerPixel() * 2.0, true);
      return true;
    case kPinToClipCommand:
      if (mTargetMode == kTargetClip) {
        mPinned = !mPinned;
        mKeyframeView->SetPinToClip(mPinned);
        SetupTimeBarZoomMinMax(mListView->GetTarget().selection);
        const int width = std::max(1, mZoomLimiter.GetScrollWidth());
        const TickTime span = mRuler->GetZoomOutTime() - mRuler->GetZoomInTime();
        // The new limits place the range around the edit line even at the same zoom.
        ApplyZoom(
            mZoomLimiter.ClampTimePerPixel(static_cast<double>(span) / kTicksPerSecond / width),
            true);
      }
      return true;
    case kAudioTimeUnitsCommand:
      SetAudioTimeUnits(!mAudioTimeUnits);
      if (mSequence) {
        SequenceSettingsActions::SetAudioFrameAligned(mSequence, mAudioTimeUnits);
      }
      return true;
    case kRulerNumbersCommand:
      mRuler->SetShowNumbers(!mRuler->AreNumbersShown());
      return true;
    case kOwnSliderRowsCommand:
      SetOwnSliderRows(!HasOwnSliderRows());
      return true;
    case kLoopAudioCommand:
      mAudioLoop = !mAudioLoop;
      if (mLoopButton) {
        mLoopButton->SetSelected(mAudioLoop);
      }
      // The list's loop mode arrives with audio part playback.
      return true;
    case kPlayAudioCommand:
      if (mListView->GetNumberOfAudioParts() == 1 && mListView->CanPlayAudioPart(0)) {
        // Playing a part belongs to the list (audio part playback is not built yet).
        mListView->ObeyCommand(EffectControlsListView::kPlayAudioPartCommand);
      }
      return true;
    case kSnapToAllCommand:
      mKeyframeView->SetSnapFlags(mKeyframeView->GetSnapFlags() |
                                  EffectControlsKeyframeView::kSnapTargets);
      return true;
    case kSnapToNoneCommand:
      mKeyframeView->SetSnapFlags(mKeyframeView->GetSnapFlags() &
                                  ~EffectControlsKeyframeView::kSnapTargets);
      return true;
    case kRenameCommand:
      RenameSelectedEffect();
      return true;
    case kSavePresetCommand:
      SavePreset();
      return true;
    case kEffectsEnabledCommand:
    case kDeleteEffectCommand:
    case kResetEffectCommand:
    case kDeleteAllEffectsCommand:
      mListView->ObeyCommand(command);
      return true;
    case kCommandClear:
      // Selected effects first, else selected keyframes.
      if (!mListView->ObeyCommand(command)) {
        mKeyframeView->ObeyCommand(command);
      }
      return true;
    case kCommandPaste:
      // Effects first; keyframes when the clipboard holds no effects.
      if (!mListView->ObeyCommand(command)) {
        mKeyframeView->ObeyCommand(command);
      }
      return true;
    case kCommandCut:
    case kCommandCopy:
      // Effects first, else keyframes.
      if (!mListView->ObeyCommand(command)) {
        mKeyframeView->ObeyCommand(command);
      }
      return true;
    case kKeyframeAreaCommand:
      mKeyframeView->ObeyCommand(command);
      return true;
    case kBlendModePreviousCommand:
    case kBlendModeNextCommand:
      StepBlendMode(command == kBlendModeNextCommand ? 1 : -1, true);
      return true;
    case kCapsuleResetAllCommand:
      ResetCapsuleParameters(std::nullopt, true);
      return true;
    default:
      if (command >= kFirstCapsuleResetCommand && command <= kLastCapsuleResetCommand) {
        ResetCapsuleParameters(static_cast<std::size_t>(command - kFirstCapsuleResetCommand), true);
        return true;
      }
      break;
  }
  if (EffectControlsKeyframeView::IsKeyframeCommand(command)) {
    return mKeyframeView->ObeyCommand(command);
  }
  if (IsNavigationCommand(command)) {
    OnNavigationCommand(command);
    return true;
  }
  if (command > kPlayAudioCommand && command < kPlayAudioCommand + 50) {
    return mListView->ObeyCommand(command);
  }
  return TabView::ObeyCommand(command);
}

void EffectControlsView::SetAudioTimeUnits(bool audioUnits) {
  mAudioTimeUnits = audioUnits;
  ReloadTimeDisplays();
  mRuler->SetAudioTimeUnits(audioUnits);
  // The list's audio frame alignment arrives with the keyframe area's audio-unit snapping.
  if (mKeyframesVisible && mTimeline->GetSecondsPerPixel() > 0.0) {
    ZoomToTimePerPixel(mTimeline->GetSecondsPerPixel(), false);
  }
}

void EffectControlsView::RenameSelectedEffect() {
  const auto& entries = mListView->GetSelectedItems().GetEntries();
  if (entries.size() != 1 || !CanEdit()) {
    return;
  }
  const ComponentRef component = entries.front().component;
  if (!component || component->IsGraphicsComponent()) {
    return;
  }
  const auto name =
      InputBox::Ask(LocalizeString("$$$/Vantile/Handlers/EffectControls/RenameItem=Rename Item"),
                    LocalizeString("$$$/Vantile/Handlers/EffectControls/NewName=New Name"),
                    component->GetInstanceName());
  if (name && !name->empty() && *name != component->GetInstanceName()) {
    ComponentActions::SetInstanceName(component, *name);
  }
}

void EffectControlsView::NowOnDuty() {
  ShortcutManager::Instance().SetActiveContext(mContextName);
  if (mSequenceChangedOffDuty && mSequence) {
    mSequenceChangedOffDuty = false;
    OnSequenceChanged(mSequence);
  }
  ReloadMarkers();
  if (IsTarget()) {
    // Keys go to the list first; it passes what it does not take up to the panel.
    mListView->BecomeTarget();
  }
}
