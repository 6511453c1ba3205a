#pragma once

#include <cstddef>

#include "Host/Model/Marker.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Undoable edits of the markers of a sequence (sequence time) or a master clip (media time).
// Each records the owner's markers before and after (MarkersChangedMessage both ways); NoChange
// and no step when nothing would change; ReadOnly for a read-only owner.
class MarkerActions {
 public:
  static constexpr const char* kAddMarker = "MZ.MarkerActions.AddMarker";
  static constexpr const char* kRemoveMarker = "MZ.MarkerActions.RemoveMarker";
  static constexpr const char* kMoveMarker = "MZ.MarkerActions.MoveMarker";
  static constexpr const char* kClearAllMarkers = "MZ.MarkerActions.ClearAllMarkers";

  // A marker whose time (or end) cannot be stored, or with a negative duration or a colour index
  // outside 0 to 7, is refused (InvalidArgument).
  static EditStatus AddMarker(const SequenceRef& sequence, const Marker& marker);
  static EditStatus AddMarker(const MasterClipRef& clip, const Marker& marker);
  // NotFound for an index out of range.
  static EditStatus RemoveMarker(const SequenceRef& sequence, std::size_t index);
  static EditStatus RemoveMarker(const MasterClipRef& clip, std::size_t index);
  // The marker keeps its duration, name and colour; markers stay ordered by time.
  static EditStatus MoveMarker(const SequenceRef& sequence, std::size_t index, TickTime time);
  static EditStatus MoveMarker(const MasterClipRef& clip, std::size_t index, TickTime time);
  static EditStatus ClearAllMarkers(const SequenceRef& sequence);
  static EditStatus ClearAllMarkers(const MasterClipRef& clip);
};
