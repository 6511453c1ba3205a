#pragma once

#include <cstdint>

class FrameRate;

// Every clip, keyframe and ruler time: a signed count of ticks. 254016000000 ticks make one
// second, a number divisible by every common video frame rate (including the 1001-based ones) and
// by the common audio sample rates, so frame and sample boundaries are exact.
using TickTime = std::int64_t;

inline constexpr TickTime kTicksPerSecond = 254016000000;

inline constexpr TickTime kTime_Zero = 0;
// The sentinels are +-(2^62 - 1), about 210 days. Any two times in [kTime_Min, kTime_Max] can be
// added or subtracted without overflowing 64 bits, so "t + span" and "end - start" are safe even
// when one side is a sentinel. Stored keyframe and clip times lie strictly between them.
inline constexpr TickTime kTime_Max = (TickTime{1} << 62) - 1;
inline constexpr TickTime kTime_Min = -kTime_Max;

// True when min < time < max: a time that can be stored (not a sentinel, not beyond one).
constexpr bool IsStorableTime(TickTime time) {
  return time > kTime_Min && time < kTime_Max;
}

// Saturating arithmetic: the result is limited to [kTime_Min, kTime_Max]. Arguments may be any
// 64-bit values.
TickTime AddTimes(TickTime a, TickTime b);
TickTime SubtractTimes(TickTime a, TickTime b);

double TicksToSeconds(TickTime time);
// Rounded to the nearest tick and limited to [kTime_Min, kTime_Max]; NaN gives kTime_Zero.
TickTime SecondsToTicks(double seconds);

// Frame arithmetic. An invalid (default-constructed) rate gives frame 0 and time 0.
// Index of the frame that contains `time` (rounded toward minus infinity).
std::int64_t ToFrame(TickTime time, const FrameRate& rate);
// As ToFrame, limited to the 32-bit range.
std::int32_t ToFrame32(TickTime time, const FrameRate& rate);
// Start time of a frame, limited to [kTime_Min, kTime_Max].
TickTime FrameToTime(std::int64_t frame, const FrameRate& rate);
