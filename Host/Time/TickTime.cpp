#include "Host/Time/TickTime.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "Host/Time/FrameRate.h"

namespace {

TickTime Clamp(TickTime time) {
  return std::clamp(time, kTime_Min, kTime_Max);
}

}  // namespace

TickTime AddTimes(TickTime a, TickTime b) {
  TickTime sum = 0;
  if (__builtin_add_overflow(a, b, &sum)) {
    return b > 0 ? kTime_Max : kTime_Min;
  }
  return Clamp(sum);
}

TickTime SubtractTimes(TickTime a, TickTime b) {
  TickTime difference = 0;
  if (__builtin_sub_overflow(a, b, &difference)) {
    return b < 0 ? kTime_Max : kTime_Min;
  }
  return Clamp(difference);
}

double TicksToSeconds(TickTime time) {
  return static_cast<double>(time) / static_cast<double>(kTicksPerSecond);
}

TickTime SecondsToTicks(double seconds) {
  if (std::isnan(seconds)) {
    return kTime_Zero;
  }
  const double ticks = seconds * static_cast<double>(kTicksPerSecond);
  // kTime_Max converts to exactly 2^62, so the comparisons are exact.
  if (ticks >= static_cast<double>(kTime_Max)) {
    return kTime_Max;
  }
  if (ticks <= static_cast<double>(kTime_Min)) {
    return kTime_Min;
  }
  return static_cast<TickTime>(std::llround(ticks));
}

std::int64_t ToFrame(TickTime time, const FrameRate& rate) {
  const TickTime perFrame = rate.GetTicksPerFrame();
  if (perFrame <= 0) {
    return 0;
  }
  std::int64_t frame = time / perFrame;
  if (time % perFrame != 0 && time < 0) {
    --frame;
  }
  return frame;
}

std::int32_t ToFrame32(TickTime time, const FrameRate& rate) {
  const std::int64_t frame = ToFrame(time, rate);
  return static_cast<std::int32_t>(std::clamp<std::int64_t>(
      frame, std::numeric_limits<std::int32_t>::min(), std::numeric_limits<std::int32_t>::max()));
}

TickTime FrameToTime(std::int64_t frame, const FrameRate& rate) {
  const TickTime perFrame = rate.GetTicksPerFrame();
  if (perFrame <= 0) {
    return kTime_Zero;
  }
  TickTime time = 0;
  if (__builtin_mul_overflow(frame, perFrame, &time)) {
    return frame > 0 ? kTime_Max : kTime_Min;
  }
  return Clamp(time);
}
