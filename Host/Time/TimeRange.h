#pragma once

#include "Host/Time/TickTime.h"

// A half-open span [start, end) of ticks. Which time line it lies on is for its owner to say.
struct TimeRange {
  TickTime start = kTime_Zero;
  TickTime end = kTime_Zero;

  // Negative when end lies before start.
  constexpr TickTime Duration() const { return end - start; }
  // The end itself lies outside: ranges that meet share no time.
  constexpr bool Contains(TickTime time) const { return start <= time && time < end; }
};
