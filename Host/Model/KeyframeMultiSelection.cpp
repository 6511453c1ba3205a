#include "Host/Model/KeyframeMultiSelection.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ParamStatesAction.h"

KeyframeMultiSelection::KeyframeMultiSelection(SequenceRef sequence)
    : mSequence(std::move(sequence)) {}

std::shared_ptr<KeyframeMultiSelection> KeyframeMultiSelection::Clone() const {
  return std::make_shared<KeyframeMultiSelection>(*this);
}

std::vector<const KeyframeSelection*> KeyframeMultiSelection::GetSelections() const {
  std::vector<const KeyframeSelection*> selections;
  for (const KeyframeSelection& selection : mSelections) {
    if (!selection.IsEmpty()) {
      selections.push_back(&selection);
    }
  }
  return selections;
}

std::size_t KeyframeMultiSelection::GetKeyframeCount() const {
  std::size_t count = 0;
  for (const KeyframeSelection& selection : mSelections) {
    count += selection.Size();
  }
  return count;
}

const KeyframeSelection* KeyframeMultiSelection::Find(const ComponentParam* param) const {
  for (const KeyframeSelection& selection : mSelections) {
    if (selection.GetParam().get() == param) {
      return &selection;
    }
  }
  return nullptr;
}

KeyframeSelection* KeyframeMultiSelection::FindMutable(const ComponentParam* param) {
  return const_cast<KeyframeSelection*>(Find(param));
}

KeyframeSelection& KeyframeMultiSelection::Obtain(const TrackItemRef& trackItem,
                                                  const ComponentRef& component,
                                                  const ComponentParamRef& param) {
  if (KeyframeSelection* found = FindMutable(param.get())) {
    return *found;
  }
  mSelections.emplace_back(trackItem, component, param);
  return mSelections.back();
}

bool KeyframeMultiSelection::Contains(const ComponentParam* param, TickTime clipTime) const {
  const KeyframeSelection* selection = Find(param);
  return selection && selection->Contains(clipTime) &&
         param->GetKeyframes().FindAt(clipTime).has_value();
}

bool KeyframeMultiSelection::AddItem(const TrackItemRef& trackItem, const ComponentRef& component,
                                     const ComponentParamRef& param, TickTime clipTime) {
  if (!HOST_VERIFY(param != nullptr, "Invalid ComponentParam")) {
    return false;
  }
  if (!param->GetKeyframes().FindAt(clipTime)) {
    return false;
  }
  return Obtain(trackItem, component, param).Add(clipTime);
}

bool KeyframeMultiSelection::RemoveItem(const ComponentParam* param, TickTime clipTime) {
  KeyframeSelection* selection = FindMutable(param);
  return selection && selection->Remove(clipTime);
}

void KeyframeMultiSelection::AddAllItems(const TrackItemRef& trackItem,
                                         const ComponentRef& component,
                                         const ComponentParamRef& param) {
  if (!HOST_VERIFY(param != nullptr, "Invalid ComponentParam") || !param->HasKeyframes()) {
    return;
  }
  Obtain(trackItem, component, param).AddAll();
}

void KeyframeMultiSelection::AddItems(const KeyframeMultiSelection& other) {
  for (const KeyframeSelection& theirs : other.mSelections) {
    for (TickTime time : theirs.GetKeyframeTimes()) {
      AddItem(theirs.GetTrackItem(), theirs.GetComponent(), theirs.GetParam(), time);
    }
  }
}

void KeyframeMultiSelection::InvertItems(const KeyframeMultiSelection& other) {
  for (const KeyframeSelection& theirs : other.mSelections) {
    for (TickTime time : theirs.GetKeyframeTimes()) {
      if (!RemoveItem(theirs.GetParam().get(), time)) {
        AddItem(theirs.GetTrackItem(), theirs.GetComponent(), theirs.GetParam(), time);
      }
    }
  }
}

void KeyframeMultiSelection::RemoveParam(const ComponentParam* param) {
  std::erase_if(mSelections,
                [param](const KeyframeSelection& s) { return s.GetParam().get() == param; });
}

void KeyframeMultiSelection::Prune() {
  for (KeyframeSelection& selection : mSelections) {
    selection.Prune();
  }
  std::erase_if(mSelections, [](const KeyframeSelection& s) { return s.GetTimes().empty(); });
}

void KeyframeMultiSelection::SetTimes(const ComponentParam* param, std::set<TickTime> times) {
  if (KeyframeSelection* selection = FindMutable(param)) {
    selection->SetTimes(std::move(times));
  }
}

bool KeyframeMultiSelection::HasSpatialKeyframe() const {
  return std::any_of(mSelections.begin(), mSelections.end(),
                     [](const KeyframeSelection& s) { return s.IsSpatial(); });
}

bool KeyframeMultiSelection::HasNonSpatialKeyframe() const {
  return std::any_of(mSelections.begin(), mSelections.end(),
                     [](const KeyframeSelection& s) { return !s.IsEmpty() && !s.IsSpatial(); });
}

bool KeyframeMultiSelection::HasTimeRemappingKeyframe() const {
  return std::any_of(mSelections.begin(), mSelections.end(),
                     [](const KeyframeSelection& s) { return s.IsTimeRemapping(); });
}

bool KeyframeMultiSelection::SupportsInterpolationMode(int capability) const {
  return std::any_of(mSelections.begin(), mSelections.end(), [capability](const auto& s) {
    return s.SupportsInterpolationMode(capability);
  });
}

bool KeyframeMultiSelection::TemporalInterpolationModeMatches(int code) const {
  const auto selections = GetSelections();
  return !selections.empty() &&
         std::all_of(selections.begin(), selections.end(), [code](const KeyframeSelection* s) {
           return s->TemporalInterpolationModeMatches(code);
         });
}

bool KeyframeMultiSelection::SpatialInterpolationModeMatches(int code) const {
  bool any = false;
  for (const KeyframeSelection* selection : GetSelections()) {
    if (!selection->IsSpatial()) {
      continue;
    }
    if (!selection->SpatialInterpolationModeMatches(code)) {
      return false;
    }
    any = true;
  }
  return any;
}

EditStatus KeyframeMultiSelection::RunEdit(
    const char* name, std::string undoText,
    const std::optional<KeyframeSelection::KeyframeEdit>& edit) const {
  if (!edit) {
    return EditStatus::InvalidArgument;
  }
  std::vector<ParamStatesAction::Change> changes;
  bool readOnly = false;
  for (const KeyframeSelection* selection : GetSelections()) {
    if (selection->GetParam()->IsReadOnly()) {
      readOnly = true;
      continue;
    }
    if (auto after = selection->StateAfter(*edit)) {
      changes.push_back({selection->GetParam(), std::move(*after)});
    }
  }
  if (changes.empty()) {
    return readOnly ? EditStatus::ReadOnly : EditStatus::NoChange;
  }
  return ParamStatesAction::Execute(name, std::move(undoText), std::move(changes));
}

EditStatus KeyframeMultiSelection::SetKeyframeTemporalInterpolation(int code,
                                                                    std::string undoText) const {
  return RunEdit(kKeyframeActionSetTemporalInterpolation,
                 undoText.empty() ? KeyframeSelection::TemporalUndoText(code) : std::move(undoText),
                 KeyframeSelection::MakeTemporalEdit(code));
}

EditStatus KeyframeMultiSelection::SetKeyframeSpatialInterpolation(int code,
                                                                   std::string undoText) const {
  return RunEdit(kKeyframeActionSetSpatialInterpolation,
                 undoText.empty() ? KeyframeSelection::SpatialUndoText(code) : std::move(undoText),
                 KeyframeSelection::MakeSpatialEdit(code));
}

EditStatus KeyframeMultiSelection::ApplyAutomaticEase(int side, std::string undoText) const {
  return RunEdit(kKeyframeActionApplyAutomaticEase,
                 undoText.empty() ? KeyframeSelection::EaseUndoText(side) : std::move(undoText),
                 KeyframeSelection::MakeEaseEdit(side));
}

EditStatus KeyframeMultiSelection::RemoveSelectionFromComponentParams(const TrackItemRef& trackItem,
                                                                      std::string name,
                                                                      std::string undoText) const {
  std::vector<ParamStatesAction::Change> changes;
  bool readOnly = false;
  for (const KeyframeSelection* selection : GetSelections()) {
    if (trackItem && selection->GetTrackItem() != trackItem) {
      continue;
    }
    if (selection->GetParam()->IsReadOnly()) {
      readOnly = true;
      continue;
    }
    if (auto after = selection->StateAfterRemoval()) {
      changes.push_back({selection->GetParam(), std::move(*after)});
    }
  }
  if (changes.empty()) {
    return readOnly ? EditStatus::ReadOnly : EditStatus::NoChange;
  }
  return ParamStatesAction::Execute(std::move(name), std::move(undoText), std::move(changes));
}
