#include "Host/Model/FilterMultiSelection.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ClipboardItem.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/CompoundAction.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/TrackItem.h"

namespace {

const EffectClipboardItem* AsEffects(const ClipboardItem* item) {
  if (!item || item->GetKind() != EffectClipboardItem::kKind) {
    return nullptr;
  }
  return dynamic_cast<const EffectClipboardItem*>(item);
}

// The first editable target chain of the media type.
ComponentChainRef ChainFor(MediaType mediaType, const std::vector<ComponentChainRef>& targets) {
  for (const ComponentChainRef& chain : targets) {
    if (chain && chain->GetMediaType() == mediaType && !EditPermissions::IsReadOnly(*chain)) {
      return chain;
    }
  }
  return nullptr;
}

// The intrinsic's parameter states taken over from `source`, by position, where name and value
// kind agree.
std::vector<ParamStatesAction::Change> IntrinsicValues(const Component& source,
                                                       const Component& target) {
  std::vector<ParamStatesAction::Change> changes;
  const std::size_t count = std::min(source.GetParamCount(), target.GetParamCount());
  for (std::size_t i = 0; i < count; ++i) {
    const ComponentParamRef& from = source.GetParams()[i];
    const ComponentParamRef& to = target.GetParams()[i];
    if (from->GetName() == to->GetName() && from->GetValueKind() == to->GetValueKind() &&
        !to->IsReadOnly() && from->GetState() != to->GetState()) {
      changes.push_back({to, from->GetState()});
    }
  }
  return changes;
}

struct PastePlan {
  std::vector<std::pair<ComponentChainRef, std::vector<ComponentRef>>> chains;  // lists after
  std::vector<ParamStatesAction::Change> values;
  Project* project = nullptr;

  bool IsEmpty() const { return chains.empty() && values.empty(); }
};

PastePlan PlanPaste(const FilterMultiSelection::Selection& selection,
                    const EffectClipboardItem& item,
                    const std::vector<ComponentChainRef>& targets) {
  PastePlan plan;
  auto listFor = [&plan](const ComponentChainRef& chain) -> std::vector<ComponentRef>& {
    for (auto& [planned, list] : plan.chains) {
      if (planned == chain) {
        return list;
      }
    }
    plan.chains.emplace_back(chain, chain->GetComponents());
    return plan.chains.back().second;
  };
  // Where each chain's pastes go: after its last selected effect, else at the end; later pastes
  // follow the earlier ones.
  std::vector<std::pair<const ComponentChain*, std::size_t>> insertAt;
  for (const ComponentRef& effect : item.GetEffects()) {
    ComponentChainRef chain = ChainFor(effect->GetMediaType(), targets);
    if (!chain) {
      continue;
    }
    if (!plan.project) {
      plan.project = chain->GetProject();
    }
    if (effect->IsIntrinsic()) {
      if (ComponentRef own = chain->FindByMatchName(effect->GetMatchName());
          own && own->IsIntrinsic()) {
        auto values = IntrinsicValues(*effect, *own);
        plan.values.insert(plan.values.end(), values.begin(), values.end());
      }
      continue;
    }
    std::vector<ComponentRef>& list = listFor(chain);
    auto slot = std::find_if(insertAt.begin(), insertAt.end(),
                             [&](const auto& s) { return s.first == chain.get(); });
    if (slot == insertAt.end()) {
      std::optional<std::size_t> afterSelected;
      for (const FilterMultiSelection::Entry& entry : selection.GetEntries()) {
        const Component* selected =
            entry.IsSubsidiary() ? entry.parent.get() : entry.component.get();
        if (const int index = chain->GetIndexOf(selected); index >= 0) {
          afterSelected = std::max(afterSelected.value_or(0), static_cast<std::size_t>(index) + 1);
        }
      }
      slot = insertAt.insert(insertAt.end(), {chain.get(), afterSelected.value_or(list.size())});
    }
    list.insert(list.begin() + static_cast<std::ptrdiff_t>(slot->second), effect->Clone());
    ++slot->second;
  }
  return plan;
}

}  // namespace

bool FilterMultiSelection::IsSameComponent(const Component* a, const Component* b) {
  return a != nullptr && a == b;
}

int FilterMultiSelection::Selection::Find(const Component* component,
                                          const TrackItem* trackItem) const {
  for (std::size_t i = 0; i < mEntries.size(); ++i) {
    if (IsSameComponent(mEntries[i].component.get(), component) &&
        mEntries[i].trackItem.get() == trackItem) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

bool FilterMultiSelection::Selection::Add(const ComponentRef& component,
                                          const TrackItemRef& trackItem) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component") ||
      Contains(component.get(), trackItem.get())) {
    return false;
  }
  mEntries.push_back({component, trackItem, ComponentRef(component->GetMaskOwner())});
  return true;
}

bool FilterMultiSelection::Selection::Remove(const Component* component,
                                             const TrackItem* trackItem) {
  const int index = Find(component, trackItem);
  if (index < 0) {
    return false;
  }
  mEntries.erase(mEntries.begin() + index);
  return true;
}

bool FilterMultiSelection::Selection::ContainsSubsidiaryItems() const {
  return std::any_of(mEntries.begin(), mEntries.end(),
                     [](const Entry& e) { return e.IsSubsidiary(); });
}

std::vector<ComponentRef> FilterMultiSelection::Selection::GetComponents() const {
  std::vector<ComponentRef> components;
  for (const Entry& entry : mEntries) {
    components.push_back(entry.component);
  }
  return components;
}

bool operator==(const FilterMultiSelection::Selection& a,
                const FilterMultiSelection::Selection& b) {
  return std::equal(a.mEntries.begin(), a.mEntries.end(), b.mEntries.begin(), b.mEntries.end(),
                    [](const auto& x, const auto& y) {
                      return x.component == y.component && x.trackItem == y.trackItem &&
                             x.parent == y.parent;
                    });
}

std::shared_ptr<const EffectClipboardItem> FilterMultiSelection::Selection::CreateClipboardItem()
    const {
  if (mEntries.empty()) {
    return nullptr;
  }
  std::vector<ComponentRef> effects;
  std::vector<ComponentRef> masks;
  for (const Entry& entry : mEntries) {
    (entry.IsSubsidiary() ? masks : effects).push_back(entry.component->Clone());
  }
  return std::make_shared<EffectClipboardItem>(std::move(effects), std::move(masks),
                                               mEntries.front().trackItem);
}

bool FilterMultiSelection::Selection::Copy(Project& project) const {
  auto item = CreateClipboardItem();
  if (!item) {
    return false;
  }
  project.GetClipboard().AddItem(std::move(item));
  return true;
}

bool FilterMultiSelection::Selection::QueryPaste(
    const ClipboardItem* item, const std::vector<ComponentChainRef>& targets) const {
  const EffectClipboardItem* effects = AsEffects(item);
  return effects && !PlanPaste(*this, *effects, targets).IsEmpty();
}

EditStatus FilterMultiSelection::Selection::Paste(
    const ClipboardItem& item, const std::vector<ComponentChainRef>& targets) const {
  const EffectClipboardItem* effects = AsEffects(&item);
  if (!effects) {
    return EditStatus::InvalidArgument;
  }
  PastePlan plan = PlanPaste(*this, *effects, targets);
  if (plan.IsEmpty()) {
    return EditStatus::NoChange;
  }
  auto step = std::make_unique<CompoundAction>(kPasteFiltersActionName);
  for (auto& [chain, list] : plan.chains) {
    step->Add(
        ComponentChainActions::CreateSetComponentsAction(chain, kPasteFiltersActionName, list));
  }
  if (!plan.values.empty()) {
    auto values = std::make_unique<ParamStatesAction>(kPasteFiltersActionName);
    for (auto& change : plan.values) {
      values->Add(change.param, change.param->GetState(), std::move(change.after));
    }
    step->Add(std::move(values));
  }
  return ExecuteModelAction(plan.project, std::move(step));
}

EditStatus FilterMultiSelection::PasteMasks(const ComponentRef& effect,
                                            const EffectClipboardItem& item, std::string undoText,
                                            std::string actionName) {
  if (!HOST_VERIFY(effect != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (!effect->CanTakeMasks()) {
    return EditStatus::InvalidArgument;
  }
  if (!item.HasMasks()) {
    return EditStatus::NoChange;
  }
  if (const ComponentChain* chain = effect->GetChain();
      chain && EditPermissions::IsReadOnly(*chain)) {
    return EditStatus::ReadOnly;
  }
  std::vector<ComponentRef> after = effect->GetMasks();
  for (const ComponentRef& mask : item.GetMasks()) {
    after.push_back(mask->Clone());
  }
  auto action = FunctionAction::MakeSetter(
      std::move(actionName), effect->GetMasks(), std::move(after),
      [effect](const std::vector<ComponentRef>& masks) { effect->SetMasks(masks); });
  action->SetUndoText(std::move(undoText));
  return ExecuteModelAction(effect->GetProject(), std::move(action));
}
