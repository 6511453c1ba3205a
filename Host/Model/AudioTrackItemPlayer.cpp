#include "Host/Model/AudioTrackItemPlayer.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

std::shared_ptr<AudioTrackItemPlayer> AudioTrackItemPlayer::Create(
    TrackItemRef part, std::shared_ptr<PlayerClock> clock) {
  if (!HOST_VERIFY(part != nullptr, "Invalid TrackItem") || !CanPlay(*part)) {
    return nullptr;
  }
  return std::shared_ptr<AudioTrackItemPlayer>(
      new AudioTrackItemPlayer(std::move(part), std::move(clock)));
}

AudioTrackItemPlayer::AudioTrackItemPlayer(TrackItemRef part, std::shared_ptr<PlayerClock> clock)
    : Player(SequenceRef(part->GetSequence()), RegisterUniqueStation("AudioTrackItemPlayer"),
             std::move(clock)),
      mPart(std::move(part)) {}

AudioTrackItemPlayer::~AudioTrackItemPlayer() {
  DisposeStation(GetStation());
}

bool AudioTrackItemPlayer::CanPlay(const TrackItem& part) {
  const MasterClip* clip = part.GetMasterClip().get();
  const Media* media = clip ? clip->GetMedia().get() : nullptr;
  return part.IsClip() && part.GetMediaType() == MediaType::Audio && part.GetSequence() && media &&
         media->HasAudio() && part.GetSpeed() == 1.0 && !IsPlaybackRestricted(part);
}

bool AudioTrackItemPlayer::IsPlaybackRestricted(const TrackItem& part) {
  const MasterClip* clip = part.GetMasterClip().get();
  return part.GetDuration() <= 0 ||
         (clip && clip->GetProperties().GetBool(kPropertyKey_FromInactiveProject, false));
}

TickTime AudioTrackItemPlayer::GetDuration() const {
  return mPart->GetDuration();
}

TickTime AudioTrackItemPlayer::GetAdjustedTrackItemStart() const {
  return mPart->GetStart();
}

std::pair<TickTime, TickTime> AudioTrackItemPlayer::GetPlayRange(bool loop) const {
  const TickTime duration = GetDuration();
  TickTime from = 0;
  TickTime to = duration;
  const Sequence* sequence = mPart->GetSequence();
  if (loop && sequence) {
    const TickTime start = GetAdjustedTrackItemStart();
    if (auto in = sequence->GetInPoint(); in && *in - start >= 0 && *in - start <= duration) {
      from = *in - start;
    }
    if (auto out = sequence->GetOutPoint(); out && *out - start >= 0 && *out - start <= duration) {
      to = *out - start;
    }
    if (from >= to) {
      from = 0;
      to = duration;
    }
  }
  return {from, to};
}

bool AudioTrackItemPlayer::PlayPart(TickTime editTime, bool loop) {
  const auto [from, to] = GetPlayRange(loop);
  SetLooping(loop);
  SetPosition(SubtractTimes(editTime, GetAdjustedTrackItemStart()));
  return Play(from, to, 1.0);
}
