#pragma once

#include "Host/Model/PlayerClock.h"

// A clock that moves only when told (tests, automation): playback becomes a function of the
// Advance calls and the message loop runs, not of the machine's speed.
class ManualPlayerClock : public PlayerClock {
 public:
  TickTime Now() const override { return mNow; }
  void Advance(TickTime elapsed) { mNow += elapsed; }

 private:
  TickTime mNow = 0;
};
