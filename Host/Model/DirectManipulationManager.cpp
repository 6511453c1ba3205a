#include "Host/Model/DirectManipulationManager.h"

#include <algorithm>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/TrackItem.h"

DirectManipulationManager::DirectManipulationManager(StationName station)
    : mStation(std::move(station)) {}

bool DirectManipulationManager::HasOnScreenControls(const Component& component) {
  if (component.GetMediaType() != MediaType::Video || component.IsArchived() ||
      component.IsOffline()) {
    return false;
  }
  if (component.IsMask() || component.IsGraphicsComponent()) {
    return true;
  }
  const auto& params = component.GetParams();
  return std::any_of(params.begin(), params.end(), [](const ComponentParamRef& param) {
    return param->GetType() == ParamType::Point;
  });
}

bool DirectManipulationManager::SetDirectManipulationFilter(const ComponentRef& component,
                                                            const TrackItemRef& trackItem) {
  if (component && !HasOnScreenControls(*component)) {
    return false;
  }
  const bool shown = component != nullptr;
  if (mComponent == component && mTrackItem == trackItem && mShown == shown) {
    return true;
  }
  mComponent = component;
  mTrackItem = component ? trackItem : nullptr;
  mShown = shown;
  Announce();
  return true;
}

bool DirectManipulationManager::ToggleDirectManipulationFilter(const ComponentRef& component,
                                                               const TrackItemRef& trackItem) {
  if (!component || !IsActive(component.get(), trackItem.get())) {
    return SetDirectManipulationFilter(component, trackItem);
  }
  mShown = !mShown;
  Announce();
  return true;
}

bool DirectManipulationManager::IsActive(const Component* component,
                                         const TrackItem* trackItem) const {
  return component != nullptr && mComponent.get() == component && mTrackItem.get() == trackItem;
}

void DirectManipulationManager::PickFilter(const ComponentRef& component,
                                           const TrackItemRef& trackItem) {
  if (!component || !SetDirectManipulationFilter(component, trackItem)) {
    return;
  }
  BroadcastMessage(mStation, DirectManipulationFilterPickedMessage(component, trackItem));
}

void DirectManipulationManager::Announce() const {
  BroadcastMessage(mStation, DirectManipulationChangedMessage(mComponent, mTrackItem, mShown));
}
