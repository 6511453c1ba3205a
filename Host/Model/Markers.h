#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "Host/Model/Marker.h"

// The markers of one owner, ordered by time (markers at the same time keep the order they were
// added in). Edits change one marker in place, so an undo step need only keep that marker and
// its index (see MarkerActions).
class Markers {
 public:
  bool IsEmpty() const { return mMarkers.empty(); }
  std::size_t Size() const { return mMarkers.size(); }
  const Marker& At(std::size_t index) const { return mMarkers.at(index); }
  const std::vector<Marker>& All() const { return mMarkers; }

  // Returns the index the marker got. A marker with a time outside the storable range is refused
  // (nullopt).
  std::optional<std::size_t> Add(const Marker& marker);
  bool Remove(std::size_t index);
  // Puts `marker` back at exactly `index`, as the undo of Remove(index) does; refused (false)
  // when the index is past the end or the marker would break the order by time.
  bool InsertAt(std::size_t index, const Marker& marker);
  // Replaces the marker at `index`; it moves to where its time belongs (after the markers
  // already at that time). Returns its new index; nullopt, with nothing changed, for an index
  // out of range or a marker Add would refuse.
  std::optional<std::size_t> Replace(std::size_t index, const Marker& marker);
  // Removes every marker at exactly `time`; returns how many.
  std::size_t RemoveAt(TickTime time);
  void Clear() { mMarkers.clear(); }

  std::optional<std::size_t> FindAt(TickTime time) const;
  std::optional<TickTime> NextMarkerTime(TickTime time) const;      // first marker time > t
  std::optional<TickTime> PreviousMarkerTime(TickTime time) const;  // last marker time < t

  friend bool operator==(const Markers&, const Markers&) = default;

 private:
  std::vector<Marker> mMarkers;
};
