#pragma once

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Undoable intro and outro durations of a graphics clip (the regions at its start and end that
// play its in and out animations). Only a graphics clip that is not a master graphic and whose
// durations are not locked takes them (InvalidArgument otherwise). A duration is not negative and
// leaves at least GetMinimumGap between intro and outro (TimeOutOfRange otherwise).
// TrackItemChangedMessage on do and undo; NoChange and no step when nothing would change.
class IntroOutroActions {
 public:
  static constexpr const char* kSetIntroDuration = "MZ.TrackItemActions.SetIntroDuration";
  static constexpr const char* kSetOutroDuration = "MZ.TrackItemActions.SetOutroDuration";

  static bool CanResize(const TrackItem& clip);
  // One frame of the clip: what must remain between the end of the intro and the outro's start.
  static TickTime GetMinimumGap(const TrackItem& clip);
  // The longest intro (outro) the clip allows with its current outro (intro).
  static TickTime GetMaximumIntroDuration(const TrackItem& clip);
  static TickTime GetMaximumOutroDuration(const TrackItem& clip);

  static EditStatus SetIntroDuration(const TrackItemRef& clip, TickTime duration);
  static EditStatus SetOutroDuration(const TrackItemRef& clip, TickTime duration);
};
