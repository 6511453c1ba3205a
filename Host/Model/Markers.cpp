#include "Host/Model/Markers.h"

#include <algorithm>

std::optional<std::size_t> Markers::Add(const Marker& marker) {
  if (!IsStorableTime(marker.time) || marker.duration < 0 ||
      !IsStorableTime(AddTimes(marker.time, marker.duration))) {
    return std::nullopt;
  }
  auto it = std::upper_bound(mMarkers.begin(), mMarkers.end(), marker.time,
                             [](TickTime t, const Marker& m) { return t < m.time; });
  it = mMarkers.insert(it, marker);
  return static_cast<std::size_t>(it - mMarkers.begin());
}

bool Markers::Remove(std::size_t index) {
  if (index >= mMarkers.size()) {
    return false;
  }
  mMarkers.erase(mMarkers.begin() + static_cast<std::ptrdiff_t>(index));
  return true;
}

std::size_t Markers::RemoveAt(TickTime time) {
  return std::erase_if(mMarkers, [time](const Marker& m) { return m.time == time; });
}

std::optional<std::size_t> Markers::FindAt(TickTime time) const {
  for (std::size_t i = 0; i < mMarkers.size(); ++i) {
    if (mMarkers[i].time == time) {
      return i;
    }
  }
  return std::nullopt;
}

std::optional<TickTime> Markers::NextMarkerTime(TickTime time) const {
  for (const Marker& m : mMarkers) {
    if (m.time > time) {
      return m.time;
    }
  }
  return std::nullopt;
}

std::optional<TickTime> Markers::PreviousMarkerTime(TickTime time) const {
  for (auto it = mMarkers.rbegin(); it != mMarkers.rend(); ++it) {
    if (it->time < time) {
      return it->time;
    }
  }
  return std::nullopt;
}
