#include "Host/Model/Sequence.h"

#include <algorithm>
#include <utility>

#include "Host/Model/ModelMessages.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

// Video items by track, then time; the same for audio.
void SortGroup(TrackItemGroup& group) {
  auto order = [](const TrackItemRef& a, const TrackItemRef& b) {
    const int ta = a->GetTrack() ? a->GetTrack()->GetIndex() : -1;
    const int tb = b->GetTrack() ? b->GetTrack()->GetIndex() : -1;
    if (ta != tb) {
      return ta < tb;
    }
    return a->GetStart() < b->GetStart();
  };
  std::stable_sort(group.videoItems.begin(), group.videoItems.end(), order);
  std::stable_sort(group.audioItems.begin(), group.audioItems.end(), order);
}

bool GroupHolds(const TrackItemGroup& group, const TrackItem* item) {
  auto same = [item](const TrackItemRef& other) { return other.get() == item; };
  return std::any_of(group.videoItems.begin(), group.videoItems.end(), same) ||
         std::any_of(group.audioItems.begin(), group.audioItems.end(), same);
}

}  // namespace

SequenceRef Sequence::Create(std::string name, FrameRate videoRate, FrameRate audioRate) {
  return SequenceRef(new Sequence(std::move(name), videoRate, audioRate));
}

Sequence::Sequence(std::string name, FrameRate videoRate, FrameRate audioRate)
    : ModelObject("Sequence"),
      mName(std::move(name)),
      mVideoRate(videoRate.IsValid() ? videoRate : kFrameRate_25),
      mAudioRate(audioRate.IsValid() ? audioRate : kFrameRate_Audio48000),
      mVideoDisplay(mVideoRate),
      mAudioDisplay(mAudioRate),
      mPlayerStation(GetStation() + ".Player") {}

Sequence::~Sequence() {
  for (const TrackRef& track : mVideoTracks) {
    track->SetSequence(nullptr);
  }
  for (const TrackRef& track : mAudioTracks) {
    track->SetSequence(nullptr);
  }
  DisposeStation(mPlayerStation);
}

void Sequence::SetName(std::string name) {
  if (name == mName) {
    return;
  }
  mName = std::move(name);
  BroadcastMessage(GetStation(), SequenceNameChangedMessage(SequenceRef(this)));
}

bool Sequence::SetFrameRates(FrameRate videoRate, FrameRate audioRate) {
  if (!videoRate.IsValid() || !audioRate.IsValid()) {
    return false;
  }
  mVideoRate = videoRate;
  mAudioRate = audioRate;
  NotifySettingsChanged();
  return true;
}

bool Sequence::SetTimeDisplays(FrameRate videoDisplay, FrameRate audioDisplay) {
  if (!videoDisplay.IsValid() || !audioDisplay.IsValid()) {
    return false;
  }
  mVideoDisplay = videoDisplay;
  mAudioDisplay = audioDisplay;
  NotifySettingsChanged();
  return true;
}

bool Sequence::SetFrameSize(FrameSize size) {
  const auto valid = [](int side) { return side >= 1 && side <= kMaxFrameSide; };
  if (!valid(size.width) || !valid(size.height)) {
    return false;
  }
  if (size != mFrameSize) {
    mFrameSize = size;
    NotifySettingsChanged();
  }
  return true;
}

void Sequence::SetAudioFrameAligned(bool aligned) {
  if (aligned == mAudioFrameAligned) {
    return;
  }
  mAudioFrameAligned = aligned;
  BroadcastMessage(GetStation(), PropertiesChangedMessage(GetID(), {kPropertyKey_FrameAlignment}));
}

void Sequence::SetZeroPoint(TickTime time) {
  if (time == mZeroPoint || !IsStorableTime(time)) {
    return;
  }
  mZeroPoint = time;
  BroadcastMessage(GetStation(), SequenceZeroPointChangedMessage(SequenceRef(this), time));
}

void Sequence::SetInPoint(std::optional<TickTime> time) {
  if (time == mInPoint || (time && !IsStorableTime(*time))) {
    return;
  }
  mInPoint = time;
  BroadcastMessage(GetStation(), PropertiesChangedMessage(GetID(), {kPropertyKey_InPoint}));
}

void Sequence::SetOutPoint(std::optional<TickTime> time) {
  if (time == mOutPoint || (time && !IsStorableTime(*time))) {
    return;
  }
  mOutPoint = time;
  BroadcastMessage(GetStation(), PropertiesChangedMessage(GetID(), {kPropertyKey_OutPoint}));
}

void Sequence::ChangeMarkers(const std::function<bool(Markers&)>& change) {
  if (change(mMarkers)) {
    BroadcastMessage(GetStation(), MarkersChangedMessage(GetID()));
  }
}

void Sequence::SetMarkers(Markers markers) {
  if (markers == mMarkers) {
    return;
  }
  mMarkers = std::move(markers);
  BroadcastMessage(GetStation(), MarkersChangedMessage(GetID()));
}

void Sequence::SetCurrentTime(TickTime time, int playMode) {
  if (!IsStorableTime(time)) {
    return;
  }
  mCurrentTime = time;
  BroadcastMessage(mPlayerStation, PlayerPositionChangedMessage(SequenceRef(this), time, playMode));
}

void Sequence::SetPlayerState(PlayerState state) {
  if (state == mPlayerState) {
    return;
  }
  const bool wasPlaying = mPlayerState == PlayerState::Playing;
  mPlayerState = state;
  if (state == PlayerState::Playing) {
    BroadcastMessage(mPlayerStation, PlayerIsPlayingMessage(SequenceRef(this)));
  } else if (wasPlaying) {
    BroadcastMessage(mPlayerStation, PlayerIsStoppedMessage(SequenceRef(this)));
  }
}

void Sequence::SetReadOnly(bool readOnly) {
  if (readOnly == mReadOnly) {
    return;
  }
  mReadOnly = readOnly;
  BroadcastMessage(GetStation(), ReadOnlyStateChangedMessage(GetID(), readOnly));
}

void Sequence::AddTrack(const TrackRef& track) {
  if (!track || track->GetSequence() != nullptr) {
    return;
  }
  (track->GetMediaType() == MediaType::Video ? mVideoTracks : mAudioTracks).push_back(track);
  track->SetSequence(this);
  NotifyStructureChanged();
}

TickTime Sequence::GetEnd() const {
  TickTime end = 0;
  ForEachTrackItem([&end](const TrackItemRef& item) { end = std::max(end, item->GetEnd()); });
  return end;
}

bool Sequence::Contains(const TrackItem* item) const {
  return item != nullptr && item->GetSequence() == this;
}

TrackItemRef Sequence::FindTrackItem(ObjectID id) const {
  TrackItemRef found;
  ForEachTrackItem([&](const TrackItemRef& item) {
    if (!found && item->GetID() == id) {
      found = item;
    }
  });
  return found;
}

void Sequence::ForEachTrackItem(const std::function<void(const TrackItemRef&)>& visit) const {
  for (const auto* tracks : {&mVideoTracks, &mAudioTracks}) {
    for (const TrackRef& track : *tracks) {
      // A copy: the visitor may not change the track, but it may drop the last other reference.
      const std::vector<TrackItemRef> items = track->GetItems();
      for (const TrackItemRef& item : items) {
        visit(item);
      }
    }
  }
}

void Sequence::SetSelection(const std::vector<TrackItemRef>& items, bool byUser) {
  std::vector<TrackItemGroup> groups;
  for (const TrackItemRef& item : items) {
    if (!Contains(item.get()) ||
        std::any_of(groups.begin(), groups.end(),
                    [&](const TrackItemGroup& g) { return GroupHolds(g, item.get()); })) {
      continue;
    }
    TrackItemGroup group;
    std::vector<TrackItemRef> members{item};
    const std::vector<TrackItemRef> linked = item->GetLinkedItems();
    members.insert(members.end(), linked.begin(), linked.end());
    for (const TrackItemRef& member : members) {
      (member->GetMediaType() == MediaType::Video ? group.videoItems : group.audioItems)
          .push_back(member);
    }
    SortGroup(group);
    groups.push_back(std::move(group));
  }
  SetSelectedGroups(std::move(groups), byUser);
}

void Sequence::SetSelectedGroups(std::vector<TrackItemGroup> groups, bool byUser) {
  for (TrackItemGroup& group : groups) {
    std::erase_if(group.videoItems, [this](const TrackItemRef& i) { return !Contains(i.get()); });
    std::erase_if(group.audioItems, [this](const TrackItemRef& i) { return !Contains(i.get()); });
  }
  std::erase_if(groups, [](const TrackItemGroup& g) { return g.IsEmpty(); });
  if (groups == mSelection) {
    return;
  }
  mSelection = std::move(groups);
  BroadcastMessage(GetStation(), SequenceClipSelectionChangedMessage(SequenceRef(this), byUser));
}

void Sequence::ClearSelection(bool byUser) {
  SetSelectedGroups({}, byUser);
}

bool Sequence::IsSelected(const TrackItem* item) const {
  return std::any_of(mSelection.begin(), mSelection.end(),
                     [item](const TrackItemGroup& g) { return GroupHolds(g, item); });
}

void Sequence::NotifyStructureChanged() {
  mPendingStructure = true;
  if (mBatchDepth == 0) {
    FlushChanges();
  }
}

void Sequence::NotifySettingsChanged() {
  mPendingSettings = true;
  if (mBatchDepth == 0) {
    FlushChanges();
  }
}

void Sequence::NotifyLinkStatusChanged() {
  BroadcastMessage(GetStation(), TrackItemLinkStatusChangedMessage(SequenceRef(this)));
}

void Sequence::FlushChanges() {
  if (!mPendingStructure && !mPendingSettings) {
    return;
  }
  const bool structure = std::exchange(mPendingStructure, false);
  const bool settings = std::exchange(mPendingSettings, false);
  if (structure) {
    PruneSelection();
  }
  SequenceRef self(this);
  if (settings) {
    BroadcastMessage(GetStation(), SequenceSettingsChangedMessage(self));
  }
  BroadcastMessage(GetStation(), SequenceChangedMessage(self, structure, settings));
}

void Sequence::PruneSelection() {
  std::vector<TrackItemGroup> pruned = mSelection;
  SetSelectedGroups(std::move(pruned), false);
}

Sequence::ScopedChangeBatch::ScopedChangeBatch(Sequence& sequence) : mSequence(&sequence) {
  ++mSequence->mBatchDepth;
}

Sequence::ScopedChangeBatch::~ScopedChangeBatch() {
  if (--mSequence->mBatchDepth == 0) {
    mSequence->FlushChanges();
  }
}

std::vector<std::string> Sequence::GetTrackComboParamStrings() const {
  std::vector<std::string> strings{"None", "(-"};
  for (const TrackRef& track : mVideoTracks) {
    strings.push_back(track->GetName().empty() ? "~" : track->GetName());
  }
  return strings;
}
