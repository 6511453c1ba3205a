#include "Host/Model/TrackItem.h"

#include <cmath>
#include <utility>

#include "Host/Model/ComponentChain.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"

namespace {

constexpr std::uint32_t kDefaultVideoLabel = 0x8A83C9;
constexpr std::uint32_t kDefaultAudioLabel = 0x58B36D;
constexpr std::uint32_t kDefaultTransitionLabel = 0x7D7DCC;

// `span * factor` in whole ticks, limited to the storable range.
TickTime ScaleSpan(TickTime span, double factor) {
  if (factor == 1.0) {
    return span;
  }
  const double scaled = std::round(static_cast<double>(span) * factor);
  if (scaled >= static_cast<double>(kTime_Max)) {
    return kTime_Max;
  }
  if (scaled <= static_cast<double>(kTime_Min)) {
    return kTime_Min;
  }
  return static_cast<TickTime>(scaled);
}

// A span that can be stored: an unstorable start becomes 0, an unstorable or earlier end the start.
TimeRange ClampedSpan(TickTime start, TickTime end) {
  const TickTime first = IsStorableTime(start) ? start : 0;
  return {first, IsStorableTime(end) && end >= first ? end : first};
}

}  // namespace

TrackItemRef TrackItem::CreateClip(MediaType mediaType, TickTime start, TickTime end,
                                   MasterClipRef masterClip, TickTime mediaIn) {
  TrackItemRef item(new TrackItem(TrackItemKind::Clip, mediaType, start, end));
  item->mMasterClip = std::move(masterClip);
  item->mMediaIn = IsStorableTime(mediaIn) ? mediaIn : 0;
  return item;
}

TrackItemRef TrackItem::CreateTransition(MediaType mediaType, TickTime start, TickTime end,
                                         TransitionData transition) {
  TrackItemRef item(new TrackItem(TrackItemKind::Transition, mediaType, start, end));
  item->mTransition = std::move(transition);
  item->mLabelColor = kDefaultTransitionLabel;
  return item;
}

TrackItem::TrackItem(TrackItemKind kind, MediaType mediaType, TickTime start, TickTime end)
    : ModelObject("TrackItem"),
      mKind(kind),
      mMediaType(mediaType),
      mSpan(ClampedSpan(start, end)),
      mChain(ComponentChain::Create(mediaType)),
      mLabelColor(mediaType == MediaType::Video ? kDefaultVideoLabel : kDefaultAudioLabel) {
  mChain->SetOwner(this);
}

TrackItem::~TrackItem() {
  mChain->ClearOwner();
}

bool TrackItem::SetTimes(TickTime start, TickTime end, TickTime mediaIn) {
  if (!IsStorableTime(start) || !IsStorableTime(end) || !IsStorableTime(mediaIn) || end < start) {
    return false;
  }
  if (start == mSpan.start && end == mSpan.end && mediaIn == mMediaIn) {
    return true;
  }
  mSpan = {start, end};
  mMediaIn = mediaIn;
  NotifyTimingChanged();
  return true;
}

bool TrackItem::SetSpeed(double speed) {
  if (!std::isfinite(speed) || speed <= 0.0) {
    return false;
  }
  if (speed != mSpeed) {
    mSpeed = speed;
    NotifyTimingChanged();
  }
  return true;
}

ClipTime TrackItem::SequenceTimeToClipTime(SequenceTime sequenceTime) const {
  return ClipTime(
      AddTimes(mMediaIn, ScaleSpan(SubtractTimes(sequenceTime.Ticks(), mSpan.start), mSpeed)));
}

SequenceTime TrackItem::ClipTimeToSequenceTime(ClipTime clipTime) const {
  return SequenceTime(
      AddTimes(mSpan.start, ScaleSpan(SubtractTimes(clipTime.Ticks(), mMediaIn), 1.0 / mSpeed)));
}

TickTime TrackItem::GetMediaStartInSequence() const {
  const Media* media = mMasterClip ? mMasterClip->GetMedia().get() : nullptr;
  if (!media || media->IsGenerated()) {
    return kTime_Min;
  }
  return ClipTimeToSequenceTime(ClipTime(0)).Ticks();
}

TickTime TrackItem::GetMediaEndInSequence() const {
  const Media* media = mMasterClip ? mMasterClip->GetMedia().get() : nullptr;
  if (!media || media->IsGenerated()) {
    return kTime_Max;
  }
  return ClipTimeToSequenceTime(ClipTime(media->GetDuration())).Ticks();
}

std::string TrackItem::GetName() const {
  if (!mName.empty()) {
    return mName;
  }
  if (mMasterClip) {
    return mMasterClip->GetName();
  }
  return mTransition.displayName;
}

void TrackItem::SetName(std::string name) {
  if (name != mName) {
    mName = std::move(name);
    NotifyChanged();
  }
}

FrameRate TrackItem::GetFrameRate() const {
  if (const Sequence* sequence = GetSequence()) {
    return mMediaType == MediaType::Video ? sequence->GetVideoFrameRate()
                                          : sequence->GetAudioFrameRate();
  }
  if (mMasterClip && mMasterClip->GetMedia()) {
    return mMasterClip->GetMedia()->GetFrameRate();
  }
  return kFrameRate_25;
}

bool TrackItem::HasOwnComponentChain() const {
  return IsTransition() && mChain->GetCount() > 0;
}

void TrackItem::SetLabelColor(std::uint32_t rgb) {
  rgb &= 0xFFFFFF;
  if (rgb != mLabelColor) {
    mLabelColor = rgb;
    NotifyChanged();
  }
}

void TrackItem::SetPartOrderKey(std::uint32_t key) {
  if (key != mPartOrderKey) {
    mPartOrderKey = key;
    NotifyChanged();
  }
}

void TrackItem::SetLinkGroup(int group) {
  if (group == mLinkGroup) {
    return;
  }
  mLinkGroup = group;
  NotifyChanged();
  if (Sequence* sequence = GetSequence()) {
    sequence->NotifyLinkStatusChanged();
  }
}

bool TrackItem::IsGraphicsClip() const {
  return IsClip() && mMasterClip && mMasterClip->IsGraphic();
}

TickTime TrackItem::GetEffectiveIntroDuration() const {
  return std::min(mIntro, GetDuration());
}

TickTime TrackItem::GetEffectiveOutroDuration() const {
  return std::min(mOutro, GetDuration() - GetEffectiveIntroDuration());
}

bool TrackItem::SetIntroDuration(TickTime duration) {
  if (duration < 0 || !IsStorableTime(duration)) {
    return false;
  }
  if (duration != mIntro) {
    mIntro = duration;
    NotifyChanged();
  }
  return true;
}

bool TrackItem::SetOutroDuration(TickTime duration) {
  if (duration < 0 || !IsStorableTime(duration)) {
    return false;
  }
  if (duration != mOutro) {
    mOutro = duration;
    NotifyChanged();
  }
  return true;
}

void TrackItem::SetIntroOutroLocked(bool locked) {
  if (locked != mIntroOutroLocked) {
    mIntroOutroLocked = locked;
    NotifyChanged();
  }
}

void TrackItem::SetTransitionData(TransitionData data) {
  if (data == mTransition) {
    return;
  }
  mTransition = std::move(data);
  NotifyChanged();
}

Sequence* TrackItem::GetSequence() const {
  return mTrack ? mTrack->GetSequence() : nullptr;
}

Project* TrackItem::GetProject() const {
  return mTrack ? mTrack->GetProject() : nullptr;
}

std::vector<TrackItemRef> TrackItem::GetLinkedItems() const {
  std::vector<TrackItemRef> linked;
  const Sequence* sequence = GetSequence();
  if (mLinkGroup == 0 || !sequence) {
    return linked;
  }
  sequence->ForEachTrackItem([&](const TrackItemRef& item) {
    if (item.get() != this && item->GetLinkGroup() == mLinkGroup) {
      linked.push_back(item);
    }
  });
  return linked;
}

void TrackItem::NotifyChanged() {
  BroadcastMessage(GetStation(), TrackItemChangedMessage(TrackItemRef(this)));
}

void TrackItem::NotifyTimingChanged() {
  if (mTrack) {
    mTrack->Reorder();
  }
  NotifyChanged();
  if (Sequence* sequence = GetSequence()) {
    sequence->NotifyStructureChanged();
  }
}
