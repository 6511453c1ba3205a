#include "Host/Model/Track.h"

#include <algorithm>
#include <utility>

#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

TrackRef Track::Create(MediaType mediaType, std::string name) {
  return TrackRef(new Track(mediaType, std::move(name)));
}

Track::Track(MediaType mediaType, std::string name)
    : ModelObject("Track"), mMediaType(mediaType), mName(std::move(name)) {}

Track::~Track() {
  for (const TrackItemRef& item : mItems) {
    item->SetTrack(nullptr);
  }
}

bool Track::AddItem(const TrackItemRef& item) {
  if (!item || item->GetMediaType() != mMediaType || item->GetTrack() != nullptr) {
    return false;
  }
  auto it = std::upper_bound(
      mItems.begin(), mItems.end(), item->GetStart(),
      [](TickTime start, const TrackItemRef& other) { return start < other->GetStart(); });
  mItems.insert(it, item);
  item->SetTrack(this);
  if (mSequence) {
    mSequence->NotifyStructureChanged();
  }
  return true;
}

bool Track::RemoveItem(const TrackItem* item) {
  auto it = std::find_if(mItems.begin(), mItems.end(),
                         [item](const TrackItemRef& other) { return other.get() == item; });
  if (it == mItems.end()) {
    return false;
  }
  TrackItemRef keep = *it;
  mItems.erase(it);
  keep->SetTrack(nullptr);
  if (mSequence) {
    mSequence->NotifyStructureChanged();
  }
  return true;
}

std::vector<TrackItemRef> Track::FindItemsAt(TickTime time) const {
  std::vector<TrackItemRef> found;
  for (const TrackItemRef& item : mItems) {
    if (item->GetSpan().Contains(time)) {
      found.push_back(item);
    }
  }
  return found;
}

void Track::Reorder() {
  std::stable_sort(mItems.begin(), mItems.end(), [](const TrackItemRef& a, const TrackItemRef& b) {
    return a->GetStart() < b->GetStart();
  });
}

int Track::GetIndex() const {
  if (!mSequence) {
    return -1;
  }
  const auto& tracks =
      mMediaType == MediaType::Video ? mSequence->GetVideoTracks() : mSequence->GetAudioTracks();
  for (std::size_t i = 0; i < tracks.size(); ++i) {
    if (tracks[i].get() == this) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

Project* Track::GetProject() const {
  return mSequence ? mSequence->GetProject() : nullptr;
}
