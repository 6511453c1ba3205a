#include "Handlers/EffectControls/Src/SequenceMarkers.h"

#include "Host/Model/MarkerActions.h"
#include "Host/Model/Markers.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

void SequenceMarkers::SetSequence(const SequenceRef& sequence) {
  if (sequence != mSequence) {
    mSelectedTimes.clear();
  }
  mSequence = sequence;
}

void SequenceMarkers::SetMasterClip(const MasterClipRef& masterClip, const TrackItemRef& item) {
  const bool both = masterClip && item;
  const MasterClipRef shown = both ? masterClip : nullptr;
  if (shown != mMasterClip || (both && item != mClipItem)) {
    mSelectedTimes.clear();
  }
  mMasterClip = shown;
  mClipItem = both ? item : nullptr;
}

const Markers* SequenceMarkers::Source() const {
  if (mMasterClip) {
    return &mMasterClip->GetMarkers();
  }
  return mSequence ? &mSequence->GetMarkers() : nullptr;
}

TickTime SequenceMarkers::ToSequence(TickTime ownerTime) const {
  return mMasterClip ? mClipItem->ClipTimeToSequenceTime(ClipTime(ownerTime)).Ticks() : ownerTime;
}

TickTime SequenceMarkers::ToOwner(TickTime sequenceTime) const {
  return mMasterClip ? mClipItem->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks()
                     : sequenceTime;
}

std::vector<TimeBarMarker> SequenceMarkers::GetTimeBarMarkers() const {
  std::vector<TimeBarMarker> result;
  const Markers* source = Source();
  if (source == nullptr) {
    return result;
  }
  const auto& all = source->All();
  result.reserve(all.size());
  for (std::size_t i = 0; i < all.size(); ++i) {
    const Marker& marker = all[i];
    result.push_back(TimeBarMarker{static_cast<std::int64_t>(i) + 1, ToSequence(marker.time),
                                   marker.duration, marker.colorIndex, marker.name});
  }
  return result;
}

std::optional<std::size_t> SequenceMarkers::IndexOf(std::int64_t id) const {
  const Markers* source = Source();
  if (source == nullptr || id < 1 || static_cast<std::size_t>(id) > source->Size()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(id - 1);
}

std::optional<Marker> SequenceMarkers::GetMarker(std::int64_t id) const {
  const auto index = IndexOf(id);
  if (!index) {
    return std::nullopt;
  }
  Marker marker = Source()->At(*index);
  marker.time = ToSequence(marker.time);
  return marker;
}

std::optional<std::int64_t> SequenceMarkers::FindAt(TickTime time) const {
  const Markers* source = Source();
  if (source == nullptr) {
    return std::nullopt;
  }
  if (const auto index = source->FindAt(ToOwner(time))) {
    return static_cast<std::int64_t>(*index) + 1;
  }
  return std::nullopt;
}

bool SequenceMarkers::IsSelected(std::int64_t id) const {
  const auto marker = GetMarker(id);
  return marker && mSelectedTimes.contains(marker->time);
}

void SequenceMarkers::Select(std::int64_t id) {
  mSelectedTimes.clear();
  if (const auto marker = GetMarker(id)) {
    mSelectedTimes.insert(marker->time);
  }
}

void SequenceMarkers::SelectAt(TickTime time) {
  mSelectedTimes.clear();
  if (FindAt(time)) {
    mSelectedTimes.insert(time);
  }
}

std::optional<TickTime> SequenceMarkers::Next(TickTime time) const {
  const Markers* source = Source();
  if (source == nullptr) {
    return std::nullopt;
  }
  const auto next = source->NextMarkerTime(ToOwner(time));
  return next ? std::optional<TickTime>(ToSequence(*next)) : std::nullopt;
}

std::optional<TickTime> SequenceMarkers::Previous(TickTime time) const {
  const Markers* source = Source();
  if (source == nullptr) {
    return std::nullopt;
  }
  const auto previous = source->PreviousMarkerTime(ToOwner(time));
  return previous ? std::optional<TickTime>(ToSequence(*previous)) : std::nullopt;
}

bool SequenceMarkers::AddAt(TickTime time, int colorIndex) {
  if (Source() == nullptr) {
    return false;
  }
  if (FindAt(time)) {
    // A second marker on the same frame could not be seen, picked or stepped to on its own.
    SelectAt(time);
    return false;
  }
  Marker marker;
  marker.time = ToOwner(time);
  marker.colorIndex = colorIndex;
  const EditStatus status = mMasterClip ? MarkerActions::AddMarker(mMasterClip, marker)
                                        : MarkerActions::AddMarker(mSequence, marker);
  return status == EditStatus::Done;
}

bool SequenceMarkers::RemoveSelectedAt(TickTime time) {
  if (Source() == nullptr || !mSelectedTimes.contains(time)) {
    return false;
  }
  bool removed = false;
  // One step per marker: each removal shifts the indices after it.
  while (const auto index = Source()->FindAt(ToOwner(time))) {
    const EditStatus status = mMasterClip ? MarkerActions::RemoveMarker(mMasterClip, *index)
                                          : MarkerActions::RemoveMarker(mSequence, *index);
    if (status != EditStatus::Done) {
      break;
    }
    removed = true;
  }
  mSelectedTimes.erase(time);
  return removed;
}

bool SequenceMarkers::ClearAll() {
  if (Source() == nullptr) {
    return false;
  }
  mSelectedTimes.clear();
  const EditStatus status = mMasterClip ? MarkerActions::ClearAllMarkers(mMasterClip)
                                        : MarkerActions::ClearAllMarkers(mSequence);
  return status == EditStatus::Done;
}

bool SequenceMarkers::Move(std::int64_t id, TickTime time) {
  const auto index = IndexOf(id);
  if (!index) {
    return false;
  }
  const TickTime from = ToSequence(Source()->At(*index).time);
  const bool wasSelected = mSelectedTimes.contains(from);
  const EditStatus status = mMasterClip
                                ? MarkerActions::MoveMarker(mMasterClip, *index, ToOwner(time))
                                : MarkerActions::MoveMarker(mSequence, *index, time);
  if (status != EditStatus::Done) {
    return false;
  }
  if (wasSelected) {
    mSelectedTimes.erase(from);
    mSelectedTimes.insert(time);
  }
  return true;
}

EditStatus SequenceMarkers::Change(std::int64_t id, const Marker& marker) {
  const auto index = IndexOf(id);
  if (!index) {
    return EditStatus::NotFound;
  }
  Marker changed = marker;
  changed.time = Source()->At(*index).time;
  return mMasterClip ? MarkerActions::ChangeMarker(mMasterClip, *index, changed)
                     : MarkerActions::ChangeMarker(mSequence, *index, changed);
}
