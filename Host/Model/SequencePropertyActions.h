#pragma once

#include <optional>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Undoable in and out points of a sequence (sequence time) or a master clip (media time). nullopt
// clears a point. Points are not negative, and in never lies after out (TimeOutOfRange); a master
// clip's points lie within its media. PropertiesChangedMessage ("MZ.InPoint", "MZ.OutPoint") on
// do and undo alike, for the points that change; NoChange and no step when nothing would change;
// ReadOnly for a read-only owner.
class SequencePropertyActions {
 public:
  static constexpr const char* kSetInPoint = "MZ.SequencePropertyActions.SetInPoint";
  static constexpr const char* kSetOutPoint = "MZ.SequencePropertyActions.SetOutPoint";
  static constexpr const char* kSetInOutPoints = "MZ.SequencePropertyActions.SetInOutPoints";

  static EditStatus SetInPoint(const SequenceRef& sequence, std::optional<TickTime> in);
  static EditStatus SetOutPoint(const SequenceRef& sequence, std::optional<TickTime> out);
  // Both as one step (also how both are cleared).
  static EditStatus SetInOutPoints(const SequenceRef& sequence, std::optional<TickTime> in,
                                   std::optional<TickTime> out);

  static EditStatus SetInPoint(const MasterClipRef& clip, std::optional<TickTime> in);
  static EditStatus SetOutPoint(const MasterClipRef& clip, std::optional<TickTime> out);
  static EditStatus SetInOutPoints(const MasterClipRef& clip, std::optional<TickTime> in,
                                   std::optional<TickTime> out);
};
