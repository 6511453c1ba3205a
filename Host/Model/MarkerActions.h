#pragma once

#include <cstddef>

#include "Host/Model/Marker.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Undoable edits of the markers of a sequence (sequence time) or a master clip (media time).
// Each step keeps only the marker it changes and its index, so a long history of marker edits
// grows by one marker a step (clearing keeps all it removes). MarkersChangedMessage both ways;
// NoChange and no step when nothing would change; ReadOnly for a read-only owner.
class MarkerActions {
 public:
  static constexpr const char* kAddMarker = "MZ.MarkerActions.AddMarker";
  static constexpr const char* kRemoveMarker = "MZ.MarkerActions.RemoveMarker";
  static constexpr const char* kMoveMarker = "MZ.MarkerActions.MoveMarker";
  static constexpr const char* kChangeMarker = "MZ.MarkerActions.ChangeMarker";
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
  // Replaces the marker at `index` (its name, comment, colour, duration and time) with
  // `marker`; it moves to where its time belongs. NotFound for an index out of range;
  // InvalidArgument for a marker AddMarker would refuse.
  static EditStatus ChangeMarker(const SequenceRef& sequence, std::size_t index,
                                 const Marker& marker);
  static EditStatus ChangeMarker(const MasterClipRef& clip, std::size_t index,
                                 const Marker& marker);
  static EditStatus ClearAllMarkers(const SequenceRef& sequence);
  static EditStatus ClearAllMarkers(const MasterClipRef& clip);
};
