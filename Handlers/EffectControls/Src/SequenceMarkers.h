#pragma once

#include <cstdint>
#include <optional>
#include <set>
#include <vector>

#include "Host/Model/Marker.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/TimeBarControl.h"

class Markers;

// The panel's view of the markers its ruler shows: the sequence's, or in master-clip mode the
// master clip's (media times, shown where the targeted clip plays them); which markers the
// user selected; and the undoable marker edits the ruler and the marker commands ask for, made
// on the markers shown.
//
// A marker's id on the ruler is its index in the owner's markers plus one; ids are only valid
// until the markers change (the owner reloads the ruler on MarkersChangedMessage). The selection
// is kept by time, so it survives a reload that leaves the selected markers where they were.
// Times given and returned are sequence ticks. UI thread only.
class SequenceMarkers {
 public:
  SequenceMarkers() = default;

  // Null: no sequence; every query is empty and every edit fails.
  void SetSequence(const SequenceRef& sequence);
  const SequenceRef& GetSequence() const { return mSequence; }
  // Shows the master clip's markers through `item`, a clip of it in the sequence; null (either)
  // goes back to the sequence's markers.
  void SetMasterClip(const MasterClipRef& masterClip, const TrackItemRef& item);
  bool ShowsMasterClip() const { return mMasterClip != nullptr; }

  // The markers as the ruler shows them.
  std::vector<TimeBarMarker> GetTimeBarMarkers() const;
  bool IsSelected(std::int64_t id) const;
  // Makes the marker the only selected one (an unknown id empties the selection).
  void Select(std::int64_t id);
  void SelectAt(TickTime time);
  void ClearSelection() { mSelectedTimes.clear(); }
  std::size_t GetSelectedCount() const { return mSelectedTimes.size(); }

  // The first marker strictly after / before `time`.
  std::optional<TickTime> Next(TickTime time) const;
  std::optional<TickTime> Previous(TickTime time) const;
  // The ruler id of the first marker at exactly `time`.
  std::optional<std::int64_t> FindAt(TickTime time) const;
  // The marker with ruler id `id`, its time in sequence ticks.
  std::optional<Marker> GetMarker(std::int64_t id) const;

  // Undoable edits; false when nothing changed (no sequence, read-only, nothing there).
  // Where a marker already sits at `time` none is added: that one is selected instead.
  bool AddAt(TickTime time, int colorIndex);
  // Removes the selected markers lying exactly at `time`.
  bool RemoveSelectedAt(TickTime time);
  bool ClearAll();
  // Moves the marker with ruler id `id` to `time`; the selection follows it.
  bool Move(std::int64_t id, TickTime time);
  // Gives the marker with ruler id `id` the name, comment, colour and duration of `marker` (its
  // time stays); one undo step.
  EditStatus Change(std::int64_t id, const Marker& marker);

 private:
  const Markers* Source() const;
  std::optional<std::size_t> IndexOf(std::int64_t id) const;
  TickTime ToSequence(TickTime ownerTime) const;
  TickTime ToOwner(TickTime sequenceTime) const;

  SequenceRef mSequence;
  MasterClipRef mMasterClip;
  TrackItemRef mClipItem;  // plays mMasterClip in mSequence
  std::set<TickTime> mSelectedTimes;
};
