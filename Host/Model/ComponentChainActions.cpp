#include "Host/Model/ComponentChainActions.h"

#include <algorithm>
#include <set>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/CompoundAction.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"

namespace {

EditStatus Execute(Project* project, std::unique_ptr<Action> action) {
  if (!action) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(project, std::move(action));
}

// The chain's list without the applied components of `remove`.
std::vector<ComponentRef> WithoutApplied(const ComponentChain& chain,
                                         const std::vector<ComponentRef>& remove) {
  std::vector<ComponentRef> after = chain.GetComponents();
  std::erase_if(after, [&](const ComponentRef& c) {
    return !c->IsIntrinsic() && std::find(remove.begin(), remove.end(), c) != remove.end();
  });
  return after;
}

EditStatus RemoveFrom(const ComponentChainRef& chain, const std::vector<ComponentRef>& remove,
                      const char* name) {
  if (!HOST_VERIFY(chain != nullptr, "Invalid ComponentChain")) {
    return EditStatus::InvalidArgument;
  }
  std::vector<ComponentRef> after = WithoutApplied(*chain, remove);
  if (after.size() == chain->GetComponents().size()) {
    return EditStatus::NoChange;
  }
  return Execute(chain->GetProject(),
                 ComponentChainActions::CreateSetComponentsAction(chain, name, std::move(after)));
}

}  // namespace

std::unique_ptr<Action> ComponentChainActions::CreateSetComponentsAction(
    const ComponentChainRef& chain, std::string name, std::vector<ComponentRef> after) {
  return FunctionAction::MakeSetter(
      std::move(name), chain->GetComponents(), std::move(after),
      [chain](const std::vector<ComponentRef>& list) { chain->SetComponents(list); });
}

EditStatus ComponentChainActions::RemoveFilter(const ComponentChainRef& chain,
                                               const ComponentRef& component) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (chain && chain->GetIndexOf(component.get()) < 0) {
    return EditStatus::NotFound;
  }
  return RemoveFrom(chain, {component}, kRemoveFilter);
}

EditStatus ComponentChainActions::RemoveMultipleFilters(
    const ComponentChainRef& chain, const std::vector<ComponentRef>& components) {
  return RemoveFrom(chain, components, kRemoveMultipleFilters);
}

EditStatus ComponentChainActions::RemoveAllFilters(const ComponentChainRef& chain) {
  return RemoveFrom(chain, chain ? chain->GetComponents() : std::vector<ComponentRef>{},
                    kRemoveAllFilters);
}

std::unique_ptr<Action> ComponentChainActions::CreateMoveFiltersAction(
    const ComponentChainRef& target, const std::vector<ComponentRef>& components,
    const ComponentRef& insertAfter) {
  if (!HOST_VERIFY(target != nullptr, "Invalid ComponentChain")) {
    return nullptr;
  }
  if (!HOST_VERIFY(!insertAfter || target->GetIndexOf(insertAfter.get()) >= 0,
                   "Invalid insertionComponent")) {
    return nullptr;
  }
  std::vector<ComponentRef> moved;
  std::set<const Component*> movedSet;
  for (const ComponentRef& component : components) {
    ComponentChain* source = component ? component->GetChain() : nullptr;
    if (!source || component->IsMask() || movedSet.contains(component.get()) ||
        component->GetMediaType() != target->GetMediaType() ||
        (component->IsIntrinsic() && source != target.get())) {
      continue;
    }
    moved.push_back(component);
    movedSet.insert(component.get());
  }
  if (moved.empty()) {
    return nullptr;
  }

  // Where the moved components go: after the anchor, the nearest component at or before
  // `insertAfter` that stays.
  std::vector<ComponentRef> targetAfter;
  std::size_t insertAt = 0;
  bool anchorPassed = insertAfter == nullptr;
  for (const ComponentRef& component : target->GetComponents()) {
    if (!movedSet.contains(component.get())) {
      targetAfter.push_back(component);
      if (!anchorPassed) {
        insertAt = targetAfter.size();
      }
    }
    if (component == insertAfter) {
      anchorPassed = true;
    }
  }
  targetAfter.insert(targetAfter.begin() + static_cast<std::ptrdiff_t>(insertAt), moved.begin(),
                     moved.end());

  auto compound = std::make_unique<CompoundAction>(kMoveFilters);
  std::set<ComponentChain*> sources;
  for (const ComponentRef& component : moved) {
    ComponentChain* source = component->GetChain();
    if (source != target.get() && sources.insert(source).second) {
      std::vector<ComponentRef> sourceAfter = source->GetComponents();
      std::erase_if(sourceAfter, [&](const ComponentRef& c) { return movedSet.contains(c.get()); });
      compound->Add(CreateSetComponentsAction(ComponentChainRef(source), kMoveFilters,
                                              std::move(sourceAfter)));
    }
  }
  if (sources.empty() && targetAfter == target->GetComponents()) {
    return nullptr;
  }
  compound->Add(CreateSetComponentsAction(target, kMoveFilters, std::move(targetAfter)));
  return compound;
}

EditStatus ComponentChainActions::MoveFilters(const ComponentChainRef& target,
                                              const std::vector<ComponentRef>& components,
                                              const ComponentRef& insertAfter) {
  if (!HOST_VERIFY(target != nullptr, "Invalid ComponentChain")) {
    return EditStatus::InvalidArgument;
  }
  if (insertAfter && target->GetIndexOf(insertAfter.get()) < 0) {
    CreateMoveFiltersAction(target, components, insertAfter);  // records the assertion
    return EditStatus::InvalidArgument;
  }
  return Execute(target->GetProject(), CreateMoveFiltersAction(target, components, insertAfter));
}

EditStatus ComponentChainActions::SetBypass(const std::vector<ComponentChainRef>& chains,
                                            bool bypass) {
  std::vector<ComponentRef> components;
  for (const ComponentChainRef& chain : chains) {
    if (chain) {
      components.insert(components.end(), chain->GetComponents().begin(),
                        chain->GetComponents().end());
    }
  }
  return SetBypassOfComponents(components, bypass);
}

EditStatus ComponentChainActions::SetBypassOfComponents(const std::vector<ComponentRef>& components,
                                                        bool bypass) {
  auto compound = std::make_unique<CompoundAction>(kSetBypass);
  Project* project = nullptr;
  std::set<const Component*> seen;
  for (const ComponentRef& component : components) {
    if (!component || !seen.insert(component.get()).second) {
      continue;
    }
    if (auto action = ComponentActions::CreateSetBypassAction(component, bypass)) {
      project = project ? project : component->GetProject();
      compound->Add(std::move(action));
    }
  }
  if (compound->IsEmpty()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(project, std::move(compound));
}

ComponentChainActions::InsertResult ComponentChainActions::InsertFilter(
    const ComponentChainRef& chain, const Component& effect, int index) {
  InsertResult result;
  if (!HOST_VERIFY(chain != nullptr, "Invalid ComponentChain")) {
    return result;
  }
  if (effect.GetMediaType() != chain->GetMediaType() || effect.IsMask()) {
    return result;
  }
  ComponentRef copy = effect.Clone();
  std::vector<ComponentRef> after = chain->GetComponents();
  index = std::clamp(index, 0, chain->GetCount());
  after.insert(after.begin() + index, copy);
  const bool appends = index == chain->GetCount();
  result.status = ExecuteModelAction(
      chain->GetProject(),
      CreateSetComponentsAction(chain, appends ? kAddFilter : kInsertFilter, std::move(after)));
  if (result.status == EditStatus::Done) {
    result.component = std::move(copy);
  }
  return result;
}

ComponentChainActions::InsertResult ComponentChainActions::AddFilter(const ComponentChainRef& chain,
                                                                     const Component& effect) {
  return InsertFilter(chain, effect, chain ? chain->GetCount() : 0);
}

EditStatus ComponentChainActions::ResetComponent(const ComponentRef& component) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  auto compound = std::make_unique<CompoundAction>(kResetComponent);
  compound->Add(ComponentActions::CreateResetParameterValuesAction(component, 0));
  compound->Add(ComponentActions::CreateSetInstanceNameAction(component, {}));
  const int defaultPreset = component->GetPresetCount() > 0 ? 0 : -1;
  if (component->GetCurrentPreset() != defaultPreset) {
    compound->Add(FunctionAction::MakeSetter(
        ComponentActions::kSetCurrentPreset, component->GetCurrentPreset(), defaultPreset,
        [component](int index) { component->SetCurrentPreset(index); }));
  }
  if (compound->IsEmpty()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(component->GetProject(), std::move(compound));
}
