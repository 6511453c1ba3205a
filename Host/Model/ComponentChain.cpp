#include "Host/Model/ComponentChain.h"

#include <algorithm>
#include <set>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/TrackItem.h"

ComponentChainRef ComponentChain::Create(MediaType mediaType) {
  return ComponentChainRef(new ComponentChain(mediaType));
}

ComponentChain::ComponentChain(MediaType mediaType)
    : ModelObject("ComponentChain"), mMediaType(mediaType) {}

ComponentChain::~ComponentChain() {
  for (const ComponentRef& component : mComponents) {
    if (component->GetChain() == this) {
      component->SetChain(nullptr);
    }
  }
}

ComponentRef ComponentChain::GetAt(int index) const {
  if (index < 0 || index >= GetCount()) {
    return nullptr;
  }
  return mComponents[static_cast<std::size_t>(index)];
}

int ComponentChain::GetIndexOf(const Component* component) const {
  for (std::size_t i = 0; i < mComponents.size(); ++i) {
    if (mComponents[i].get() == component) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

ComponentRef ComponentChain::FindByMatchName(std::string_view matchName) const {
  for (const ComponentRef& component : mComponents) {
    if (component->GetMatchName() == matchName) {
      return component;
    }
  }
  return nullptr;
}

std::vector<ComponentRef> ComponentChain::ApplicableEffects(
    const std::vector<ComponentRef>& effects) const {
  std::vector<ComponentRef> applicable;
  for (const ComponentRef& effect : effects) {
    if (effect && !effect->IsIntrinsic() && !effect->IsMask() &&
        effect->GetMediaType() == mMediaType) {
      applicable.push_back(effect);
    }
  }
  return applicable;
}

std::vector<ComponentRef> ComponentChain::WithCopiesInserted(
    const std::vector<ComponentRef>& effects, int index) const {
  std::vector<ComponentRef> after = mComponents;
  auto at = after.begin() + std::clamp(index, 0, GetCount());
  for (const ComponentRef& effect : effects) {
    at = after.insert(at, effect->Clone()) + 1;
  }
  return after;
}

void ComponentChain::SetComponents(std::vector<ComponentRef> components) {
  std::set<const Component*> seen;
  for (const ComponentRef& component : components) {
    if (!HOST_VERIFY(component && !component->IsMask() && seen.insert(component.get()).second,
                     "Invalid component list")) {
      return;
    }
  }

  std::vector<ComponentChainChange> changes;
  for (std::size_t i = 0; i < mComponents.size(); ++i) {
    if (!seen.contains(mComponents[i].get())) {
      changes.push_back({ComponentChainChange::Kind::Removed, mComponents[i], static_cast<int>(i)});
    }
  }
  for (std::size_t i = 0; i < components.size(); ++i) {
    const int before = GetIndexOf(components[i].get());
    if (before < 0) {
      changes.push_back({ComponentChainChange::Kind::Added, components[i], static_cast<int>(i)});
    } else if (before != static_cast<int>(i)) {
      changes.push_back({ComponentChainChange::Kind::Moved, components[i], static_cast<int>(i)});
    }
  }
  if (changes.empty()) {
    return;
  }

  for (const ComponentRef& component : mComponents) {
    if (!seen.contains(component.get()) && component->GetChain() == this) {
      component->SetChain(nullptr);
    }
  }
  for (const ComponentRef& component : components) {
    ComponentChain* previous = component->GetChain();
    if (previous && previous != this) {
      std::erase(previous->mComponents, component);
    }
    component->SetChain(this);
  }
  mComponents = std::move(components);
  BroadcastMessage(GetStation(), ComponentChainStructureChangedMessage(ComponentChainRef(this),
                                                                       std::move(changes)));
}

void ComponentChain::Append(const ComponentRef& component) {
  Insert(GetCount(), component);
}

void ComponentChain::Insert(int index, const ComponentRef& component) {
  std::vector<ComponentRef> components = mComponents;
  index = std::clamp(index, 0, GetCount());
  components.insert(components.begin() + index, component);
  SetComponents(std::move(components));
}

Sequence* ComponentChain::GetSequence() const {
  return mTrackItem ? mTrackItem->GetSequence() : nullptr;
}

Project* ComponentChain::GetProject() const {
  if (mTrackItem) {
    return mTrackItem->GetProject();
  }
  return mMasterClip ? mMasterClip->GetProject() : nullptr;
}

StationName ComponentChain::GetOwnerStation() const {
  if (mTrackItem) {
    return mTrackItem->GetStation();
  }
  return mMasterClip ? mMasterClip->GetStation() : StationName();
}

void ComponentChain::ClearOwner() {
  mTrackItem = nullptr;
  mMasterClip = nullptr;
}

void ComponentChain::NotifyValuesChanged() {
  BroadcastMessage(GetStation(), ComponentChainChangedMessage(ComponentChainRef(this)));
}

void ComponentChain::NotifyMasksChanged(const ComponentRef& component) {
  std::vector<ComponentChainChange> changes{
      {ComponentChainChange::Kind::MasksChanged, component, GetIndexOf(component.get())}};
  BroadcastMessage(GetStation(), ComponentChainStructureChangedMessage(ComponentChainRef(this),
                                                                       std::move(changes)));
}
