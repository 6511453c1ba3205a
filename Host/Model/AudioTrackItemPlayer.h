#pragma once

#include <memory>
#include <utility>

#include "Host/Model/Player.h"

// Plays one audio part (one audio track item of a clip) on its own, so its effects can be heard
// alone. Its time is part time: 0 at the part's start in the sequence, the part's duration at its
// end; it does not move the sequence's edit line. Messages go to the player's own station
// (GetStation, unique per player, disposed with it), with part times.
class AudioTrackItemPlayer : public Player {
 public:
  // Null unless CanPlay(part).
  static std::shared_ptr<AudioTrackItemPlayer> Create(TrackItemRef part,
                                                      std::shared_ptr<PlayerClock> clock = nullptr);
  ~AudioTrackItemPlayer() override;

  // An audio clip in a sequence whose media has audio, playing at exactly normal speed, and not
  // held back by IsPlaybackRestricted.
  static bool CanPlay(const TrackItem& part);
  // The host's further test: a part of no duration, or one whose master clip is read only
  // because its project is not the active one, cannot be played alone.
  static bool IsPlaybackRestricted(const TrackItem& part);

  const TrackItemRef& GetTrackItem() const { return mPart; }
  TickTime GetDuration() const;
  // The sequence time of part time 0.
  TickTime GetAdjustedTrackItemStart() const;

  // The range to play: the whole part; in loop mode the sequence's in to out point in part time,
  // each end falling back to the part's start or end when it lies outside the part (or is unset).
  std::pair<TickTime, TickTime> GetPlayRange(bool loop) const;
  // Plays the part from the sequence time `editTime` (limited into the range) over
  // GetPlayRange(loop) at normal speed, looping in loop mode.
  bool PlayPart(TickTime editTime, bool loop);

 private:
  AudioTrackItemPlayer(TrackItemRef part, std::shared_ptr<PlayerClock> clock);

  TrackItemRef mPart;
};
