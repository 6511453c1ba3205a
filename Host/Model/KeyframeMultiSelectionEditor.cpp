#include "Host/Model/KeyframeMultiSelectionEditor.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/TimePoint.h"

namespace {

// The chain's effects and their masks, each effect followed by its masks: the order in which
// clipboard ordinals count.
std::vector<ComponentRef> FlattenChain(const ComponentChain& chain) {
  std::vector<ComponentRef> all;
  for (const ComponentRef& component : chain.GetComponents()) {
    all.push_back(component);
    all.insert(all.end(), component->GetMasks().begin(), component->GetMasks().end());
  }
  return all;
}

int OrdinalOf(const Component& component) {
  const ComponentChain* chain = component.GetChain();
  if (!chain) {
    return 0;
  }
  int ordinal = 0;
  for (const ComponentRef& other : FlattenChain(*chain)) {
    if (other.get() == &component) {
      return ordinal;
    }
    if (other->GetMatchName() == component.GetMatchName()) {
      ++ordinal;
    }
  }
  return 0;
}

bool InChain(const KeyframeSelection& selection, const ComponentChain* chain) {
  if (!chain) {
    return true;
  }
  const Component* component = selection.GetParam()->GetComponent();
  return component && component->GetChain() == chain;
}

// The selection restricted to the parameters of `chain` (all when null).
KeyframeMultiSelection Restrict(const KeyframeMultiSelection& selection,
                                const ComponentChain* chain) {
  KeyframeMultiSelection restricted(selection.GetSequence());
  for (const KeyframeSelection* param : selection.GetSelections()) {
    if (InChain(*param, chain)) {
      for (TickTime time : param->GetKeyframeTimes()) {
        restricted.AddItem(param->GetTrackItem(), param->GetComponent(), param->GetParam(), time);
      }
    }
  }
  return restricted;
}

Project* ProjectFor(const SequenceRef& sequence, const KeyframeMultiSelection* selection,
                    const ComponentChainRef& chain) {
  if (sequence && sequence->GetProject()) {
    return sequence->GetProject();
  }
  if (chain && chain->GetProject()) {
    return chain->GetProject();
  }
  if (selection) {
    for (const KeyframeSelection* param : selection->GetSelections()) {
      if (Project* project = param->GetParam()->GetProject()) {
        return project;
      }
    }
  }
  return nullptr;
}

const KeyframeClipboardItem* ClipboardKeyframes(const Project* project) {
  if (!project) {
    return nullptr;
  }
  const auto& item = const_cast<Project*>(project)->GetClipboard().GetItem();
  if (!item || item->GetKind() != KeyframeClipboardItem::kKind) {
    return nullptr;
  }
  return dynamic_cast<const KeyframeClipboardItem*>(item.get());
}

bool CanPasteInto(const ComponentParam& param) {
  return param.CanVaryOverTime() && !param.IsReadOnly();
}

}  // namespace

std::shared_ptr<const KeyframeClipboardItem> KeyframeMultiSelectionEditor::CreateClipboardItem(
    const KeyframeMultiSelection& selection) {
  const auto selections = selection.GetSelections();
  if (selections.empty()) {
    return nullptr;
  }
  TickTime earliest = kTime_Max;
  for (const KeyframeSelection* param : selections) {
    earliest = std::min(earliest, param->GetKeyframeTimes().front());
  }
  std::vector<KeyframeClipboardItem::ParamKeyframes> copied;
  for (const KeyframeSelection* param : selections) {
    const ComponentParam& source = *param->GetParam();
    const Component* component = source.GetComponent();
    KeyframeClipboardItem::ParamKeyframes entry;
    if (component) {
      entry.componentMatchName = component->GetMatchName();
      entry.componentOrdinal = OrdinalOf(*component);
      entry.paramIndex = component->GetParamIndex(&source) - 1;
    }
    entry.paramName = source.GetName();
    entry.valueKind = source.GetValueKind();
    const KeyframeCurve& curve = source.GetKeyframes();
    for (TickTime time : param->GetKeyframeTimes()) {
      Keyframe keyframe = curve.At(*curve.FindAt(time));
      keyframe.time = time - earliest;
      entry.keyframes.push_back(std::move(keyframe));
    }
    copied.push_back(std::move(entry));
  }
  return std::make_shared<KeyframeClipboardItem>(std::move(copied));
}

bool KeyframeMultiSelectionEditor::Copy(const KeyframeMultiSelection& selection,
                                        const SequenceRef& sequence,
                                        const ComponentChainRef& chain) {
  const KeyframeMultiSelection restricted = Restrict(selection, chain.get());
  auto item = CreateClipboardItem(restricted);
  Project* project = ProjectFor(sequence, &restricted, chain);
  if (!item || !project) {
    return false;
  }
  project->GetClipboard().AddItem(std::move(item));
  return true;
}

EditStatus KeyframeMultiSelectionEditor::Cut(KeyframeMultiSelection& selection,
                                             const SequenceRef& sequence,
                                             const ComponentChainRef& chain) {
  const KeyframeMultiSelection restricted = Restrict(selection, chain.get());
  if (restricted.IsEmpty()) {
    return EditStatus::NoChange;
  }
  Project* project = ProjectFor(sequence, &restricted, chain);
  if (project && project->IsReadOnly()) {
    return EditStatus::ReadOnly;
  }
  if (!Copy(restricted, sequence, nullptr)) {
    return EditStatus::InvalidArgument;
  }
  std::vector<const ComponentParam*> params;
  for (const KeyframeSelection* param : restricted.GetSelections()) {
    params.push_back(param->GetParam().get());
  }
  const EditStatus status =
      restricted.RemoveSelectionFromComponentParams(nullptr, kKeyframeActionCut);
  if (status == EditStatus::Done) {
    for (const ComponentParam* param : params) {
      selection.RemoveParam(param);
    }
  }
  return status;
}

ComponentParamRef KeyframeMultiSelectionEditor::FindTarget(
    const KeyframeClipboardItem::ParamKeyframes& copied, const ComponentChain& chain) {
  std::vector<ComponentRef> candidates;
  for (const ComponentRef& component : FlattenChain(chain)) {
    if (component->GetMatchName() == copied.componentMatchName) {
      candidates.push_back(component);
    }
  }
  if (candidates.empty()) {
    return nullptr;
  }
  const std::size_t ordinal = static_cast<std::size_t>(std::max(0, copied.componentOrdinal));
  const ComponentRef& component = candidates[ordinal < candidates.size() ? ordinal : 0];
  ComponentParamRef param = component->GetParam(copied.paramIndex);
  if (!param || param->GetName() != copied.paramName || param->GetValueKind() != copied.valueKind) {
    return nullptr;
  }
  return param;
}

bool KeyframeMultiSelectionEditor::PasteValid(const SequenceRef& sequence,
                                              const ComponentChainRef& chain) {
  const KeyframeClipboardItem* item = ClipboardKeyframes(ProjectFor(sequence, nullptr, chain));
  if (!item || !chain) {
    return false;
  }
  return std::any_of(item->GetParams().begin(), item->GetParams().end(), [&](const auto& copied) {
    ComponentParamRef target = FindTarget(copied, *chain);
    return target && CanPasteInto(*target);
  });
}

EditStatus KeyframeMultiSelectionEditor::Paste(const SequenceRef& sequence,
                                               const ComponentChainRef& chain,
                                               KeyframeMultiSelection* selection) {
  if (!HOST_VERIFY(chain != nullptr, "Invalid ComponentChain")) {
    return EditStatus::InvalidArgument;
  }
  const KeyframeClipboardItem* item = ClipboardKeyframes(ProjectFor(sequence, nullptr, chain));
  if (!item) {
    return EditStatus::NoChange;
  }
  const SequenceTime editTime(sequence ? sequence->GetCurrentTime() : kTime_Zero);
  const TrackItem* trackItem = chain->GetTrackItem();
  // A master clip's chain has no track item: its clip time is read off the edit line as it is.
  const ClipTime clipTime =
      trackItem ? trackItem->SequenceTimeToClipTime(editTime) : ClipTime(editTime.Ticks());
  return PasteAt(*item, chain, clipTime, selection);
}

EditStatus KeyframeMultiSelectionEditor::PasteAt(const KeyframeClipboardItem& item,
                                                 const ComponentChainRef& chain, ClipTime clipTime,
                                                 KeyframeMultiSelection* selection) {
  if (!HOST_VERIFY(chain != nullptr, "Invalid ComponentChain")) {
    return EditStatus::InvalidArgument;
  }
  std::vector<ParamStatesAction::Change> changes;
  struct Pasted {
    ComponentParamRef param;
    std::vector<TickTime> times;
  };
  std::vector<Pasted> pasted;
  for (const auto& copied : item.GetParams()) {
    ComponentParamRef target = FindTarget(copied, *chain);
    if (!target || !CanPasteInto(*target)) {
      continue;
    }
    ComponentParam::State state = target->GetState();
    if (!state.timeVarying) {
      state.timeVarying = true;
      state.keyframes.Clear();
    }
    Pasted record{target, {}};
    for (Keyframe keyframe : copied.keyframes) {
      keyframe.time = AddTimes(clipTime.Ticks(), keyframe.time);
      const std::optional<ParamValue> value = target->Coerce(keyframe.value);
      if (!value || !IsStorableTime(keyframe.time)) {
        return value ? EditStatus::TimeOutOfRange : EditStatus::InvalidArgument;
      }
      keyframe.value = *value;
      if (state.keyframes.AddOrReplace(keyframe) != CurveStatus::Ok) {
        return EditStatus::InvalidArgument;
      }
      record.times.push_back(keyframe.time);
    }
    changes.push_back({target, std::move(state)});
    pasted.push_back(std::move(record));
  }
  if (changes.empty()) {
    return EditStatus::NoChange;
  }
  const EditStatus status =
      ParamStatesAction::Execute(kKeyframeActionPaste, {}, std::move(changes));
  if (status == EditStatus::Done && selection) {
    selection->Clear();
    for (const Pasted& record : pasted) {
      Component* component = record.param->GetComponent();
      for (TickTime time : record.times) {
        selection->AddItem(TrackItemRef(chain->GetTrackItem()), ComponentRef(component),
                           record.param, time);
      }
    }
  }
  return status;
}
