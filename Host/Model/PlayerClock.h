#pragma once

#include <memory>

#include "Host/Time/TickTime.h"

// The time source of a player: a monotonic time in ticks. Players measure how much time passed
// between two steps; the origin does not matter. The steady clock is the machine's; tests use
// ManualPlayerClock to make playback deterministic.
class PlayerClock {
 public:
  PlayerClock() = default;
  PlayerClock(const PlayerClock&) = delete;
  PlayerClock& operator=(const PlayerClock&) = delete;
  virtual ~PlayerClock() = default;

  virtual TickTime Now() const = 0;

  // std::chrono::steady_clock in ticks. Thread-safe.
  static std::shared_ptr<PlayerClock> CreateSteadyClock();
};
