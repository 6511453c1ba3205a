#include "Host/Model/Player.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Model/ModelMessages.h"

Player::Player(SequenceRef sequence, StationName station, std::shared_ptr<PlayerClock> clock)
    : mSequence(std::move(sequence)),
      mStation(std::move(station)),
      mClock(clock ? std::move(clock) : PlayerClock::CreateSteadyClock()) {}

Player::~Player() = default;

int Player::GetStateCode() const {
  switch (mState) {
    case PlayerState::Playing:
      return kPlayModePlaying;
    case PlayerState::Scrubbing:
      return kPlayModeScrubbing;
    default:
      return kPlayModeStopped;
  }
}

void Player::SetPosition(TickTime position) {
  if (!IsStorableTime(position)) {
    return;
  }
  mCarry = 0.0;
  if (IsPlaying()) {
    MoveTo(std::clamp(position, mFrom, mTo), kPlayModePlaying);
  } else {
    MoveTo(position, kPlayModeSet);
  }
}

bool Player::Play(TickTime from, TickTime to, double speed) {
  if (!IsStorableTime(from) || !IsStorableTime(to) || from >= to || !std::isfinite(speed) ||
      speed == 0.0) {
    return false;
  }
  mFrom = from;
  mTo = to;
  mSpeed = speed;
  mCarry = 0.0;
  mLastStep = mClock->Now();
  TickTime start = GetPosition();
  if (speed > 0 && (start < from || start >= to)) {
    start = from;
  } else if (speed < 0 && (start <= from || start > to)) {
    start = to;
  }
  SetState(PlayerState::Playing);
  if (start != GetPosition()) {
    MoveTo(start, kPlayModePlaying);
  }
  ScheduleStep();
  return true;
}

void Player::Stop() {
  if (mState != PlayerState::Stopped) {
    SetState(PlayerState::Stopped);
  }
}

void Player::Scrub(TickTime position) {
  if (!IsStorableTime(position)) {
    return;
  }
  Stop();
  SetState(PlayerState::Scrubbing);
  MoveTo(position, kPlayModeScrubbing);
}

void Player::EndScrub() {
  if (mState == PlayerState::Scrubbing) {
    SetState(PlayerState::Stopped);
  }
}

void Player::Step() {
  if (!IsPlaying()) {
    return;
  }
  const TickTime now = mClock->Now();
  const TickTime elapsed = now - mLastStep;
  mLastStep = now;
  if (elapsed <= 0) {
    return;
  }
  const double advance = static_cast<double>(elapsed) * mSpeed + mCarry;
  const double whole = std::trunc(advance);
  mCarry = advance - whole;
  if (whole == 0.0) {
    return;
  }
  const TickTime length = mTo - mFrom;
  // Where the position was moved to by someone else during playback counts from the range.
  const TickTime current = std::clamp(GetPosition(), mFrom, mTo);
  const double target = static_cast<double>(current) + whole;
  if (mSpeed > 0 && target >= static_cast<double>(mTo)) {
    if (!mLooping) {
      MoveTo(mTo, kPlayModePlaying);
      Stop();
      return;
    }
    const double past = std::fmod(target - static_cast<double>(mFrom), static_cast<double>(length));
    MoveTo(mFrom + static_cast<TickTime>(past), kPlayModePlaying);
    return;
  }
  if (mSpeed < 0 && target <= static_cast<double>(mFrom)) {
    if (!mLooping) {
      MoveTo(mFrom, kPlayModePlaying);
      Stop();
      return;
    }
    const double before = std::fmod(static_cast<double>(mTo) - target, static_cast<double>(length));
    MoveTo(mTo - static_cast<TickTime>(before), kPlayModePlaying);
    return;
  }
  MoveTo(static_cast<TickTime>(target), kPlayModePlaying);
}

void Player::PositionChangedSelf(TickTime position, int playMode) {
  BroadcastMessage(mStation, PlayerPositionChangedMessage(mSequence, position, playMode));
}

void Player::StateChangedSelf(PlayerState previous, PlayerState state) {
  if (state == PlayerState::Playing) {
    BroadcastMessage(mStation, PlayerIsPlayingMessage(mSequence));
  } else if (previous == PlayerState::Playing) {
    BroadcastMessage(mStation, PlayerIsStoppedMessage(mSequence));
  }
}

void Player::SetState(PlayerState state) {
  if (state == mState) {
    return;
  }
  const PlayerState previous = std::exchange(mState, state);
  StateChangedSelf(previous, state);
}

void Player::MoveTo(TickTime position, int playMode) {
  mPosition = position;
  PositionChangedSelf(position, playMode);
}

void Player::ScheduleStep() {
  if (mStepScheduled) {
    return;
  }
  std::weak_ptr<Player> weak = weak_from_this();
  if (!HOST_VERIFY(!weak.expired(), "A player must be held by a shared_ptr")) {
    return;
  }
  mStepScheduled = true;
  MessageLoop::Instance().AddIdleTask([weak] {
    std::shared_ptr<Player> player = weak.lock();
    if (!player) {
      return;
    }
    player->mStepScheduled = false;
    player->Step();
    if (player->IsPlaying()) {
      player->ScheduleStep();
    }
  });
}
