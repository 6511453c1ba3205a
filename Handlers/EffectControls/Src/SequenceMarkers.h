#pragma once

#include <cstdint>
#include <optional>
#include <set>
#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/TimeBarControl.h"

// The panel's view of its sequence's markers: what the time ruler shows, which markers the user
// selected, and the undoable marker edits the ruler and the marker commands ask for.
//
// A marker's id on the ruler is its index in the sequence's markers plus one; ids are only valid
// until the markers change (the owner reloads the ruler on MarkersChangedMessage). The selection
// is kept by time, so it survives a reload that leaves the selected markers where they were.
// Times are sequence ticks. UI thread only.
class SequenceMarkers {
 public:
  SequenceMarkers() = default;

  // Null: no sequence; every query is empty and every edit fails.
  void SetSequence(const SequenceRef& sequence);
  const SequenceRef& GetSequence() const { return mSequence; }

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

  // Undoable edits; false when nothing changed (no sequence, read-only, nothing there).
  bool AddAt(TickTime time, int colorIndex);
  // Removes the selected markers lying exactly at `time`.
  bool RemoveSelectedAt(TickTime time);
  bool ClearAll();
  // Moves the marker with ruler id `id` to `time`; the selection follows it.
  bool Move(std::int64_t id, TickTime time);

 private:
  std::optional<std::size_t> IndexOf(std::int64_t id) const;

  SequenceRef mSequence;
  std::set<TickTime> mSelectedTimes;
};
