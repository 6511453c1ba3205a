#pragma once

#include <compare>

#include "Host/Time/TickTime.h"

// A time on one time line, named by `Line`, so that times of two lines cannot be mixed: it is
// made from ticks only explicitly, and neither converts to nor compares with a time of another
// line or a bare TickTime. Moving it by a duration keeps its line; two times of one line differ
// by a plain duration. What relates two lines is known by whoever holds both (TrackItem).
// The arithmetic is TickTime's: exact, with no saturation at the sentinels.
template <typename Line>
class TimePoint {
 public:
  constexpr TimePoint() = default;
  constexpr explicit TimePoint(TickTime ticks) : mTicks(ticks) {}

  constexpr TickTime Ticks() const { return mTicks; }

  friend constexpr auto operator<=>(const TimePoint&, const TimePoint&) = default;
  friend constexpr TimePoint operator+(TimePoint time, TickTime duration) {
    return TimePoint(time.mTicks + duration);
  }
  friend constexpr TimePoint operator-(TimePoint time, TickTime duration) {
    return TimePoint(time.mTicks - duration);
  }
  friend constexpr TickTime operator-(TimePoint later, TimePoint earlier) {
    return later.mTicks - earlier.mTicks;
  }

 private:
  TickTime mTicks = kTime_Zero;
};

// The time of a clip's media (0 = its first frame); its effects' keyframes are stored in it.
using ClipTime = TimePoint<struct ClipTimeLine>;
// The sequence's time line: where clips are placed and the edit line moves.
using SequenceTime = TimePoint<struct SequenceTimeLine>;

// Which of the two lines a bare TickTime answer is given on.
enum class TimeLine { kClip, kSequence };
