#pragma once

#include <memory>

#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/PlayerClock.h"
#include "Host/Time/TickTime.h"

// A simulated player: a position that advances with a clock while playing, over a range, at a
// speed, optionally looping. There is no audio or video device; what plays is the position and
// the messages about it. The UI thread's message loop drives it: while playing, each
// MessageLoop::RunPending runs one step (an idle task) that advances the position by the clock
// time elapsed since the previous step times the speed, so under test a ManualPlayerClock and
// RunPending make playback exact.
//
// Messages (see the subclasses for the station): PlayerPositionChangedMessage with the position
// and kPlayModePlaying at each step that moved it (kPlayModeSet when set while stopped,
// kPlayModeScrubbing while scrubbing); PlayerIsPlayingMessage when playback starts;
// PlayerIsStoppedMessage when it stops, by Stop or by reaching the end of the range without
// looping (the position is then the range's end).
//
// Held by shared ownership; a pending step keeps only a weak reference. UI thread only.
class Player : public std::enable_shared_from_this<Player> {
 public:
  Player(const Player&) = delete;
  Player& operator=(const Player&) = delete;
  virtual ~Player();

  PlayerState GetState() const { return mState; }
  bool IsPlaying() const { return mState == PlayerState::Playing; }
  // kPlayModeStopped, kPlayModePlaying or kPlayModeScrubbing.
  int GetStateCode() const;

  virtual TickTime GetPosition() const { return mPosition; }
  // Moves the position; while playing it is limited to the range and playback goes on from there.
  void SetPosition(TickTime position);

  // Plays [from, to] at `speed` (negative plays backwards), from the position when it lies in
  // the range, else from the range's start (its end when playing backwards). False, changing
  // nothing, for an empty or unstorable range or a speed that is zero or not finite. Playing
  // again while playing changes range and speed without a new PlayerIsPlayingMessage.
  bool Play(TickTime from, TickTime to, double speed = 1.0);
  void Stop();
  TickTime GetRangeStart() const { return mFrom; }
  TickTime GetRangeEnd() const { return mTo; }
  double GetSpeed() const { return mSpeed; }

  // Looping wraps the position to the other end of the range instead of stopping there.
  void SetLooping(bool looping) { mLooping = looping; }
  bool IsLooping() const { return mLooping; }

  // Shows one time without playing (dragging a handle): stops playback first, then the position
  // goes there with kPlayModeScrubbing; EndScrub returns to stopped.
  void Scrub(TickTime position);
  void EndScrub();

  // Advances by the clock time since the last step. The message loop calls it; callers that
  // drive playback themselves may too.
  void Step();

  const StationName& GetStation() const { return mStation; }
  const SequenceRef& GetSequence() const { return mSequence; }

 protected:
  // `station` carries the messages (the subclass may route them elsewhere through the hooks).
  // A null clock means the steady clock.
  Player(SequenceRef sequence, StationName station, std::shared_ptr<PlayerClock> clock);

  // The position moved (sends PlayerPositionChangedMessage on the station by default).
  virtual void PositionChangedSelf(TickTime position, int playMode);
  // Playing, stopped or scrubbing (sends PlayerIsPlayingMessage / PlayerIsStoppedMessage).
  virtual void StateChangedSelf(PlayerState previous, PlayerState state);

 private:
  void SetState(PlayerState state);
  void MoveTo(TickTime position, int playMode);
  void ScheduleStep();

  SequenceRef mSequence;
  StationName mStation;
  std::shared_ptr<PlayerClock> mClock;
  PlayerState mState = PlayerState::Stopped;
  TickTime mPosition = 0;
  TickTime mFrom = 0;
  TickTime mTo = 0;
  double mSpeed = 1.0;
  bool mLooping = false;
  bool mStepScheduled = false;
  TickTime mLastStep = 0;  // clock time of the last step
  double mCarry = 0.0;     // fraction of a tick not yet applied (slow and fractional speeds)
};
