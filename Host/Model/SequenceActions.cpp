#include "Host/Model/SequenceActions.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/CompoundAction.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/SequenceEditAction.h"
#include "Host/Model/TrackItem.h"

namespace {

using Edge = SequenceEditing::Edge;

SequenceRef SequenceOf(const TrackItemRef& item) {
  return item ? SequenceRef(item->GetSequence()) : nullptr;
}

TickTime Rounded(const TrackItem& item, TickTime delta) {
  return item.GetFrameRate().AlignToNearestFrame(delta);
}

bool IsEditable(const TrackItemRef& item) {
  return item && item->GetSequence() && !EditPermissions::IsReadOnly(*item);
}

EditStatus InsertEffects(const TrackItemRef& item, const std::vector<ComponentRef>& effects,
                         int index, const char* name) {
  if (!HOST_VERIFY(item != nullptr, "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (!item->IsClip()) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*item)) {
    return EditStatus::ReadOnly;
  }
  const std::vector<ComponentRef> applicable =
      item->GetComponentChain()->ApplicableEffects(effects);
  if (applicable.empty()) {
    return EditStatus::InvalidArgument;
  }
  const ComponentChainRef& chain = item->GetComponentChain();
  std::vector<ComponentRef> after = chain->WithCopiesInserted(applicable, index);
  return ExecuteModelAction(item->GetProject(), ComponentChainActions::CreateSetComponentsAction(
                                                    chain, name, std::move(after)));
}

}  // namespace

TickTime SequenceActions::QueryTrimTransition(const TrackItemRef& transition, Edge edge,
                                              TickTime delta) {
  if (!IsEditable(transition) || !transition->IsTransition()) {
    return 0;
  }
  return SequenceEditing::GetTrimTransitionLimits(*transition, edge)
      .Clamp(Rounded(*transition, delta));
}

EditStatus SequenceActions::TrimTransitions(const TrackItemRef& transition, Edge edge,
                                            TickTime delta) {
  if (!HOST_VERIFY(transition && transition->GetSequence(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SequenceEditAction::Execute(kTrimTransitions, SequenceOf(transition), [=] {
    return SequenceEditing::TrimTransition(*transition, edge, delta);
  });
}

TickTime SequenceActions::QuerySlideTransition(const TrackItemRef& transition, TickTime delta) {
  if (!IsEditable(transition) || !transition->IsTransition()) {
    return 0;
  }
  return SequenceEditing::GetSlideTransitionLimits(*transition).Clamp(Rounded(*transition, delta));
}

EditStatus SequenceActions::SlideTransition(const TrackItemRef& transition, TickTime delta) {
  if (!HOST_VERIFY(transition && transition->GetSequence(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SequenceEditAction::Execute(kSlideTransition, SequenceOf(transition), [=] {
    return SequenceEditing::SlideTransition(*transition, delta);
  });
}

TickTime SequenceActions::QueryRollItems(const TrackItemRef& clipA, const TrackItemRef& clipB,
                                         TickTime delta) {
  if (!IsEditable(clipA) || !clipB) {
    return 0;
  }
  return SequenceEditing::GetRollLimits(*clipA, *clipB).Clamp(Rounded(*clipA, delta));
}

EditStatus SequenceActions::RollItems(const TrackItemRef& clipA, const TrackItemRef& clipB,
                                      TickTime delta) {
  if (!HOST_VERIFY(clipA && clipB && clipA->GetSequence(), "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SequenceEditAction::Execute(kRollItems, SequenceOf(clipA),
                                     [=] { return SequenceEditing::Roll(*clipA, *clipB, delta); });
}

TickTime SequenceActions::QueryTrimItems(const std::vector<TrackItemRef>& items, Edge edge,
                                         TickTime delta, bool ripple) {
  if (items.empty() || !std::all_of(items.begin(), items.end(), IsEditable)) {
    return 0;
  }
  delta = Rounded(*items.front(), delta);
  if (ripple) {
    return SequenceEditing::GetRippleTrimLimits(items, edge).Clamp(delta);
  }
  for (const TrackItemRef& item : items) {
    delta = SequenceEditing::GetTrimLimits(*item, edge).Clamp(delta);
  }
  return delta;
}

EditStatus SequenceActions::TrimItems(const std::vector<TrackItemRef>& items, Edge edge,
                                      TickTime delta, bool ripple) {
  if (!HOST_VERIFY(!items.empty() && items.front() && items.front()->GetSequence(),
                   "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  if (ripple) {
    return SequenceEditAction::Execute(kRippleTrimItems, SequenceOf(items.front()), [=] {
      return SequenceEditing::RippleTrim(items, edge, delta);
    });
  }
  return SequenceEditAction::Execute(kTrimItems, SequenceOf(items.front()), [=] {
    // All or nothing: every item must take the whole delta before any moves.
    for (const TrackItemRef& item : items) {
      const TickTime rounded = Rounded(*item, delta);
      if (SequenceEditing::GetTrimLimits(*item, edge).Clamp(rounded) != rounded) {
        return EditStatus::TimeOutOfRange;
      }
    }
    EditStatus status = EditStatus::NoChange;
    for (const TrackItemRef& item : items) {
      if (SequenceEditing::Trim(*item, edge, delta) == EditStatus::Done) {
        status = EditStatus::Done;
      }
    }
    return status;
  });
}

EditStatus SequenceActions::RemoveItems(const std::vector<TrackItemRef>& items) {
  const auto first = std::find_if(items.begin(), items.end(),
                                  [](const TrackItemRef& i) { return i && i->GetSequence(); });
  if (first == items.end()) {
    return EditStatus::NoChange;
  }
  return SequenceEditAction::Execute(kRemoveItems, SequenceOf(*first),
                                     [=] { return SequenceEditing::RemoveItems(items); });
}

bool SequenceActions::QueryApplyTrackItemEffects(const TrackItemRef& item,
                                                 const std::vector<ComponentRef>& effects) {
  return item && item->IsClip() && !EditPermissions::IsReadOnly(*item) &&
         !item->GetComponentChain()->ApplicableEffects(effects).empty();
}

EditStatus SequenceActions::ApplyTrackItemEffects(const TrackItemRef& item,
                                                  const std::vector<ComponentRef>& effects) {
  return InsertEffects(item, effects, item ? item->GetComponentChain()->GetCount() : 0,
                       kApplyTrackItemEffects);
}

EditStatus SequenceActions::InsertTrackItemEffects(const TrackItemRef& item,
                                                   const std::vector<ComponentRef>& effects,
                                                   int index) {
  return InsertEffects(item, effects, index, kInsertTrackItemEffects);
}

EditStatus SequenceActions::RemoveAttributes(const std::vector<TrackItemRef>& items) {
  auto step = std::make_unique<CompoundAction>(kRemoveAttributes);
  auto values = std::make_unique<ParamStatesAction>(kRemoveAttributes);
  Project* project = nullptr;
  for (const TrackItemRef& item : items) {
    if (!item) {
      continue;
    }
    if (EditPermissions::IsReadOnly(*item)) {
      return EditStatus::ReadOnly;
    }
    project = project ? project : item->GetProject();
    const ComponentChainRef& chain = item->GetComponentChain();
    std::vector<ComponentRef> kept;
    for (const ComponentRef& component : chain->GetComponents()) {
      if (!component->IsIntrinsic()) {
        continue;
      }
      kept.push_back(component);
      for (const ComponentParamRef& param : component->GetParams()) {
        ComponentParam::State reset = param->MakeConstantState(param->GetDefaultValue());
        if (reset != param->GetState() && !param->IsReadOnly()) {
          values->Add(param, param->GetState(), std::move(reset));
        }
      }
    }
    if (kept != chain->GetComponents()) {
      step->Add(ComponentChainActions::CreateSetComponentsAction(chain, kRemoveAttributes,
                                                                 std::move(kept)));
    }
  }
  if (!values->IsEmpty()) {
    step->Add(std::move(values));
  }
  if (step->IsEmpty()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(project, std::move(step));
}
