#include <functional>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionEditor.h"
#include "Host/Model/Markers.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

// Every parameter row of a section, shown or not.
void ForEachParameterRow(const EffectItemList& rows,
                         const std::function<void(const ParameterControl&)>& visit) {
  std::function<void(const std::shared_ptr<EffectItem>&)> walk =
      [&](const std::shared_ptr<EffectItem>& row) {
        if (const auto* param = dynamic_cast<const ParameterControl*>(row.get());
            param != nullptr && param->GetParam()) {
          visit(*param);
        }
        for (const auto& child : row->GetItems()) {
          walk(child);
        }
      };
  for (const auto& row : rows) {
    walk(row);
  }
}

struct InterpolationCode {
  enum class Kind { kTemporal, kSpatial, kEase } kind;
  int code;
};

InterpolationCode CodeFor(CommandID command) {
  using Kind = InterpolationCode::Kind;
  switch (command) {
    case EffectControlsKeyframeView::kInterpolationLinearCommand:
      return {Kind::kTemporal, 1};
    case EffectControlsKeyframeView::kInterpolationBezierCommand:
      return {Kind::kTemporal, 2};
    case EffectControlsKeyframeView::kInterpolationAutoBezierCommand:
      return {Kind::kTemporal, 4};
    case EffectControlsKeyframeView::kInterpolationContinuousBezierCommand:
      return {Kind::kTemporal, 3};
    case EffectControlsKeyframeView::kInterpolationHoldCommand:
      return {Kind::kTemporal, 0};
    case EffectControlsKeyframeView::kEaseInCommand:
      return {Kind::kEase, 0};
    case EffectControlsKeyframeView::kEaseOutCommand:
      return {Kind::kEase, 1};
    case EffectControlsKeyframeView::kSpatialLinearCommand:
      return {Kind::kSpatial, 1};
    case EffectControlsKeyframeView::kSpatialBezierCommand:
      return {Kind::kSpatial, 2};
    case EffectControlsKeyframeView::kSpatialAutoBezierCommand:
      return {Kind::kSpatial, 4};
    default:
      return {Kind::kSpatial, 3};
  }
}

}  // namespace

bool EffectControlsKeyframeView::IsKeyframeCommand(CommandID command) {
  return IsInterpolationCommand(command) || command == kClearAllKeyframesCommand;
}

bool EffectControlsKeyframeView::FindCommandStatus(CommandID command, CommandStatus& status) {
  std::string text;
  bool answered = false;
  switch (command) {
    case kCommandClear:
    case kCommandCut:
    case kCommandCopy:
      answered = ClearCutCopyStatus(command, status.enabled, status.checked, text);
      // Nothing to act on here: the list may have effects selected.
      return answered && status.enabled;
    case kCommandPaste:
      answered = PasteStatus(command, status.enabled, status.checked, text);
      return answered && (status.enabled || IsReadOnly());
    case kCommandSelectAll:
      return SelectAllStatus(command, status.enabled, status.checked, text);
    case kClearAllKeyframesCommand:
      return ClearAllKeyframesStatus(command, status.enabled, status.checked, text);
    default:
      if (IsInterpolationCommand(command)) {
        return InterpolationStatus(command, status.enabled, status.checked, text);
      }
      break;
  }
  return SubView::FindCommandStatus(command, status);
}

bool EffectControlsKeyframeView::ObeyCommand(CommandID command) {
  const bool readOnly = IsReadOnly();
  const bool empty = GetSelectedKeyframeCount() == 0;
  switch (command) {
    case kCommandClear:
    case kCommandCut:
    case kCommandCopy:
      if (empty) {
        return readOnly;  // swallowed on a read-only list, else offered to the others
      }
      if (!readOnly) {
        if (command == kCommandClear) {
          DeleteSelectedKeyframes();
        } else if (command == kCommandCut) {
          CutSelectedKeyframes();
        } else {
          CopySelectedKeyframes();
        }
      }
      return true;
    case kCommandPaste:
      if (readOnly) {
        return true;
      }
      if (!CanPasteKeyframes()) {
        return false;
      }
      PasteKeyframes();
      return true;
    case kCommandSelectAll:
      SelectAllKeyframes();
      return true;
    case kClearAllKeyframesCommand:
      ClearAllKeyframes();
      return true;
    default:
      break;
  }
  if (IsInterpolationCommand(command)) {
    const auto selection = GetSelection();
    if (readOnly || !selection || selection->IsEmpty()) {
      return true;
    }
    const InterpolationCode code = CodeFor(command);
    switch (code.kind) {
      case InterpolationCode::Kind::kTemporal:
        selection->SetKeyframeTemporalInterpolation(code.code);
        break;
      case InterpolationCode::Kind::kSpatial:
        selection->SetKeyframeSpatialInterpolation(code.code);
        break;
      case InterpolationCode::Kind::kEase:
        selection->ApplyAutomaticEase(code.code);
        break;
    }
    Invalidate();
    return true;
  }
  return SubView::ObeyCommand(command);
}

// --- Status slots ---

bool EffectControlsKeyframeView::ClearCutCopyStatus(CommandID /*command*/, bool& enabled,
                                                    bool& checked, std::string& text) {
  enabled = !IsReadOnly() && GetSelectedKeyframeCount() > 0;
  checked = false;
  text.clear();
  return true;
}

bool EffectControlsKeyframeView::PasteStatus(CommandID /*command*/, bool& enabled, bool& checked,
                                             std::string& text) {
  enabled = !IsReadOnly() && CanPasteKeyframes();
  checked = false;
  text.clear();
  return true;
}

bool EffectControlsKeyframeView::SelectAllStatus(CommandID /*command*/, bool& enabled,
                                                 bool& checked, std::string& text) {
  const auto list = mList.lock();
  enabled = list && GetSelection() &&
            (list->GetTargetKind() == EffectControlsListView::kTargetClip ||
             list->GetTargetKind() == EffectControlsListView::kTargetTransitionComponent);
  checked = false;
  text.clear();
  return true;
}

bool EffectControlsKeyframeView::ClearAllKeyframesStatus(CommandID command, bool& enabled,
                                                         bool& checked, std::string& text) {
  SelectAllStatus(command, enabled, checked, text);
  enabled = enabled && !IsReadOnly();
  return true;
}

bool EffectControlsKeyframeView::InterpolationStatus(CommandID command, bool& enabled,
                                                     bool& checked, std::string& text) {
  text.clear();
  enabled = false;
  checked = false;
  const auto selection = GetSelection();
  if (IsReadOnly() || !selection || selection->IsEmpty()) {
    return true;
  }
  const InterpolationCode code = CodeFor(command);
  switch (code.kind) {
    case InterpolationCode::Kind::kTemporal: {
      const int capability = code.code == 1   ? kInterpolationCapabilityLinear
                             : code.code == 0 ? kInterpolationCapabilityHold
                                              : kInterpolationCapabilityBezier;
      enabled = selection->SupportsInterpolationMode(capability);
      checked = selection->TemporalInterpolationModeMatches(code.code);
      break;
    }
    case InterpolationCode::Kind::kEase:
      enabled = selection->SupportsInterpolationMode(kInterpolationCapabilityBezier);
      break;
    case InterpolationCode::Kind::kSpatial:
      enabled = !selection->HasNonSpatialKeyframe();
      checked = selection->SpatialInterpolationModeMatches(code.code);
      break;
  }
  return true;
}

// --- Edits ---

void EffectControlsKeyframeView::DeleteSelectedKeyframes() {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !selection || selection->IsEmpty() || IsReadOnly()) {
    return;
  }
  // The rebuild an edit causes may give the list a new selection: keep this one alive.
  if (selection->RemoveSelectionFromComponentParams(GetClip()) == EditStatus::Done) {
    selection->Clear();
  }
  Invalidate();
}

void EffectControlsKeyframeView::CutSelectedKeyframes() {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !selection || selection->IsEmpty() || IsReadOnly()) {
    return;
  }
  KeyframeMultiSelectionEditor::Cut(*selection, list->GetSequence());
  Invalidate();
}

void EffectControlsKeyframeView::CopySelectedKeyframes() {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !selection || selection->IsEmpty()) {
    return;
  }
  KeyframeMultiSelectionEditor::Copy(*selection, list->GetSequence());
}

ComponentChainRef EffectControlsKeyframeView::GetPasteChain() const {
  const auto list = mList.lock();
  if (!list) {
    return nullptr;
  }
  if (list->GetVideoChain()) {
    return list->GetVideoChain();
  }
  for (const auto& part : list->GetAudioParts()) {
    if (part->IsClipPart()) {
      return part->GetTrackItem()->GetComponentChain();
    }
  }
  return nullptr;
}

bool EffectControlsKeyframeView::CanPasteKeyframes() const {
  const auto list = mList.lock();
  const ComponentChainRef chain = GetPasteChain();
  return list && chain && KeyframeMultiSelectionEditor::PasteValid(list->GetSequence(), chain);
}

void EffectControlsKeyframeView::PasteKeyframes() {
  const auto list = mList.lock();
  if (!list || IsReadOnly() || !CanPasteKeyframes()) {
    return;
  }
  KeyframeMultiSelectionEditor::Paste(list->GetSequence(), GetPasteChain(), GetSelection().get());
  Invalidate();
}

void EffectControlsKeyframeView::SelectAllKeyframes() {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !selection) {
    return;
  }
  selection->Clear();
  const auto add = [&](const ParameterControl& row) {
    // Speed keyframes are not selected with the others: a clear-all must not remove them.
    if (row.GetComponent() && row.GetComponent()->IsTimeRemapping()) {
      return;
    }
    selection->AddAllItems(row.GetTrackItem(), row.GetComponent(), row.GetParam());
  };
  ForEachParameterRow(list->GetGraphicsItems(), add);
  ForEachParameterRow(list->GetVideoItems(), add);
  for (const auto& part : list->GetAudioParts()) {
    ForEachParameterRow(part->GetItems(), add);
  }
  Invalidate();
}

void EffectControlsKeyframeView::ClearAllKeyframes() {
  if (IsReadOnly() || !GetSelection()) {
    return;
  }
  SelectAllKeyframes();
  DeleteSelectedKeyframes();
}

// --- Snapping ---

void EffectControlsKeyframeView::RebuildSnapSet() {
  mSnapSet.Clear();
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list) {
    return;
  }
  if (IsSnapFlagSet(kSnapCurrentTime)) {
    mSnapSet.Add(GetEditTime());
  }
  if (const TrackItemRef clip = GetClip(); clip && IsSnapFlagSet(kSnapClip)) {
    mSnapSet.Add(clip->GetStart());
    mSnapSet.Add(clip->GetEnd());
  }
  // The keyframes being dragged are no targets of their own move.
  const auto addKeyframes = [&](const ParameterControl& row) {
    if (!row.IsTimeVarying()) {
      return;
    }
    const KeyframeSelection* selected = selection ? selection->Find(row.GetParam().get()) : nullptr;
    for (const TickTime time : row.GetParam()->GetKeyframeTimes()) {
      if (selected == nullptr || !selected->Contains(time)) {
        mSnapSet.Add(row.ClipTimeToSequenceTime(ClipTime(time)).Ticks());
      }
    }
  };
  if (IsSnapFlagSet(kSnapVideo)) {
    ForEachParameterRow(list->GetVideoItems(), addKeyframes);
    ForEachParameterRow(list->GetGraphicsItems(), addKeyframes);
  }
  if (IsSnapFlagSet(kSnapAudio)) {
    for (const auto& part : list->GetAudioParts()) {
      if (part->IsClipPart()) {
        ForEachParameterRow(part->GetItems(), addKeyframes);
      }
    }
  }
  if (IsSnapFlagSet(kSnapMarkers)) {
    if (const MasterClipRef& master = list->GetMasterClip()) {
      for (const Marker& marker : master->GetMarkers().All()) {
        mSnapSet.Add(list->ClipTimeToSequenceTime(ClipTime(marker.time)).Ticks());
      }
    } else if (list->GetSequence()) {
      for (const Marker& marker : list->GetSequence()->GetMarkers().All()) {
        mSnapSet.Add(marker.time);
      }
    }
  }
}
