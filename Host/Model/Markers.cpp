#include "Host/Model/Markers.h"

#include <algorithm>

namespace {

bool IsStorable(const Marker& marker) {
  return IsStorableTime(marker.time) && marker.duration >= 0 &&
         IsStorableTime(AddTimes(marker.time, marker.duration));
}

}  // namespace

std::optional<std::size_t> Markers::Add(const Marker& marker) {
  if (!IsStorable(marker)) {
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

bool Markers::InsertAt(std::size_t index, const Marker& marker) {
  if (index > mMarkers.size() || !IsStorable(marker) ||
      (index > 0 && mMarkers[index - 1].time > marker.time) ||
      (index < mMarkers.size() && mMarkers[index].time < marker.time)) {
    return false;
  }
  mMarkers.insert(mMarkers.begin() + static_cast<std::ptrdiff_t>(index), marker);
  return true;
}

std::optional<std::size_t> Markers::Replace(std::size_t index, const Marker& marker) {
  if (index >= mMarkers.size() || !IsStorable(marker)) {
    return std::nullopt;
  }
  Remove(index);
  return Add(marker);
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
