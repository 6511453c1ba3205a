#pragma once

#include <string_view>
#include <utility>

#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"

// Where the direct-manipulation manager announces itself (and the program monitor reports the
// user's picks).
inline constexpr const char* kDirectManipulationStation = "Host.DirectManipulation";

// The effect whose on-screen controls the program monitor shows changed (or they were switched
// on or off). Null component: none.
struct DirectManipulationChangedMessage : MessageOf<DirectManipulationChangedMessage> {
  static constexpr std::string_view kTypeName = "DirectManipulationChangedMessage";
  DirectManipulationChangedMessage(ComponentRef c, TrackItemRef t, bool shown)
      : component(std::move(c)), trackItem(std::move(t)), controlsShown(shown) {}
  ComponentRef component;
  TrackItemRef trackItem;
  bool controlsShown;
};

// The user picked an effect's on-screen controls in the monitor: panels select that effect.
struct DirectManipulationFilterPickedMessage : MessageOf<DirectManipulationFilterPickedMessage> {
  static constexpr std::string_view kTypeName = "DirectManipulationFilterPickedMessage";
  DirectManipulationFilterPickedMessage(ComponentRef c, TrackItemRef t)
      : component(std::move(c)), trackItem(std::move(t)) {}
  ComponentRef component;
  TrackItemRef trackItem;
};

// Which effect's on-screen controls (handles in the program monitor) are active. One per
// project; it is view state, not an edit: nothing here is undoable. Messages go out on the
// station given at construction, only when something changed. UI thread only.
class DirectManipulationManager {
 public:
  explicit DirectManipulationManager(StationName station = kDirectManipulationStation);

  // Whether the effect has controls of its own on screen: a video effect with a point
  // parameter, a mask, or a graphics layer; never an archived or offline one.
  static bool HasOnScreenControls(const Component& component);

  // Makes the effect active with its controls shown; a null component clears. A component
  // without on-screen controls is refused (false, nothing changes).
  bool SetDirectManipulationFilter(const ComponentRef& component, const TrackItemRef& trackItem);
  // The active effect's controls are switched off or on again; another effect becomes active
  // with its controls shown.
  bool ToggleDirectManipulationFilter(const ComponentRef& component, const TrackItemRef& trackItem);
  void Clear() { SetDirectManipulationFilter(nullptr, nullptr); }

  const ComponentRef& GetFilter() const { return mComponent; }
  const TrackItemRef& GetTrackItem() const { return mTrackItem; }
  bool AreControlsShown() const { return mComponent != nullptr && mShown; }
  bool IsActive(const Component* component, const TrackItem* trackItem) const;

  // What the monitor calls when the user grabs an effect's handles: it becomes active and
  // DirectManipulationFilterPickedMessage goes out.
  void PickFilter(const ComponentRef& component, const TrackItemRef& trackItem);

 private:
  void Announce() const;

  StationName mStation;
  ComponentRef mComponent;
  TrackItemRef mTrackItem;
  bool mShown = false;
};
