#include "Handlers/EffectControls/Src/SequenceMarkers.h"

#include "Host/Model/MarkerActions.h"
#include "Host/Model/Markers.h"
#include "Host/Model/Sequence.h"

void SequenceMarkers::SetSequence(const SequenceRef& sequence) {
  if (sequence != mSequence) {
    mSelectedTimes.clear();
  }
  mSequence = sequence;
}

std::vector<TimeBarMarker> SequenceMarkers::GetTimeBarMarkers() const {
  std::vector<TimeBarMarker> result;
  if (!mSequence) {
    return result;
  }
  const auto& all = mSequence->GetMarkers().All();
  result.reserve(all.size());
  for (std::size_t i = 0; i < all.size(); ++i) {
    const Marker& marker = all[i];
    result.push_back(TimeBarMarker{static_cast<std::int64_t>(i) + 1, marker.time, marker.duration,
                                   marker.colorIndex, marker.name});
  }
  return result;
}

std::optional<std::size_t> SequenceMarkers::IndexOf(std::int64_t id) const {
  if (!mSequence || id < 1 || static_cast<std::size_t>(id) > mSequence->GetMarkers().Size()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(id - 1);
}

bool SequenceMarkers::IsSelected(std::int64_t id) const {
  const auto index = IndexOf(id);
  return index && mSelectedTimes.contains(mSequence->GetMarkers().At(*index).time);
}

void SequenceMarkers::Select(std::int64_t id) {
  mSelectedTimes.clear();
  if (const auto index = IndexOf(id)) {
    mSelectedTimes.insert(mSequence->GetMarkers().At(*index).time);
  }
}

void SequenceMarkers::SelectAt(TickTime time) {
  mSelectedTimes.clear();
  if (mSequence && mSequence->GetMarkers().FindAt(time)) {
    mSelectedTimes.insert(time);
  }
}

std::optional<TickTime> SequenceMarkers::Next(TickTime time) const {
  return mSequence ? mSequence->GetMarkers().NextMarkerTime(time) : std::nullopt;
}

std::optional<TickTime> SequenceMarkers::Previous(TickTime time) const {
  return mSequence ? mSequence->GetMarkers().PreviousMarkerTime(time) : std::nullopt;
}

bool SequenceMarkers::AddAt(TickTime time, int colorIndex) {
  if (!mSequence) {
    return false;
  }
  Marker marker;
  marker.time = time;
  marker.colorIndex = colorIndex;
  return MarkerActions::AddMarker(mSequence, marker) == EditStatus::Done;
}

bool SequenceMarkers::RemoveSelectedAt(TickTime time) {
  if (!mSequence || !mSelectedTimes.contains(time)) {
    return false;
  }
  bool removed = false;
  // One step per marker: each removal shifts the indices after it.
  while (const auto index = mSequence->GetMarkers().FindAt(time)) {
    if (MarkerActions::RemoveMarker(mSequence, *index) != EditStatus::Done) {
      break;
    }
    removed = true;
  }
  mSelectedTimes.erase(time);
  return removed;
}

bool SequenceMarkers::ClearAll() {
  if (!mSequence) {
    return false;
  }
  mSelectedTimes.clear();
  return MarkerActions::ClearAllMarkers(mSequence) == EditStatus::Done;
}

bool SequenceMarkers::Move(std::int64_t id, TickTime time) {
  const auto index = IndexOf(id);
  if (!index) {
    return false;
  }
  const TickTime from = mSequence->GetMarkers().At(*index).time;
  const bool wasSelected = mSelectedTimes.contains(from);
  if (MarkerActions::MoveMarker(mSequence, *index, time) != EditStatus::Done) {
    return false;
  }
  if (wasSelected) {
    mSelectedTimes.erase(from);
    mSelectedTimes.insert(time);
  }
  return true;
}
