#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "Host/Model/Marker.h"

// The markers of one owner, ordered by time (markers at the same time keep the order they were
// added in). A plain value: the owner replaces it as a whole, which keeps marker edits undoable
// as before/after pairs.
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
