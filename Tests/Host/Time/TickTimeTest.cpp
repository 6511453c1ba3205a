#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

namespace {

constexpr TickTime kInt64Max = std::numeric_limits<TickTime>::max();
constexpr TickTime kInt64Min = std::numeric_limits<TickTime>::min();

TEST(TickTime, SentinelsLeaveRoomForOneMoreAdditionOrSubtraction) {
  // Any two times between the sentinels can be added or subtracted in 64 bits.
  static_assert(kTime_Max <= kInt64Max - kTime_Max);
  static_assert(kTime_Min >= kInt64Min - kTime_Min);
  static_assert(kTime_Max - kTime_Min > 0);
  EXPECT_FALSE(IsStorableTime(kTime_Max));
  EXPECT_FALSE(IsStorableTime(kTime_Min));
  EXPECT_TRUE(IsStorableTime(kTime_Max - 1));
  EXPECT_TRUE(IsStorableTime(kTime_Min + 1));
  EXPECT_TRUE(IsStorableTime(kTime_Zero));
}

TEST(TickTime, SaturatingArithmeticStopsAtTheSentinels) {
  EXPECT_EQ(AddTimes(kTime_Max, kTime_Max), kTime_Max);
  EXPECT_EQ(AddTimes(kInt64Max, 1), kTime_Max);
  EXPECT_EQ(AddTimes(kInt64Min, -1), kTime_Min);
  EXPECT_EQ(SubtractTimes(kTime_Min, kTime_Max), kTime_Min);
  EXPECT_EQ(SubtractTimes(0, kInt64Min), kTime_Max);
  EXPECT_EQ(AddTimes(5, -7), -2);
  EXPECT_EQ(SubtractTimes(5, 7), -2);
}

TEST(TickTime, SecondsConvertBothWaysAndRound) {
  EXPECT_EQ(SecondsToTicks(1.0), kTicksPerSecond);
  EXPECT_EQ(SecondsToTicks(-2.5), -kTicksPerSecond * 5 / 2);
  EXPECT_DOUBLE_EQ(TicksToSeconds(kTicksPerSecond / 4), 0.25);
  // Half a tick rounds away from zero; less than half rounds to the nearest tick.
  const double tick = 1.0 / static_cast<double>(kTicksPerSecond);
  EXPECT_EQ(SecondsToTicks(0.4 * tick), 0);
  EXPECT_EQ(SecondsToTicks(0.6 * tick), 1);
  EXPECT_EQ(SecondsToTicks(-0.6 * tick), -1);
}

TEST(TickTime, SecondsOutOfRangeSaturateAndNaNIsZero) {
  EXPECT_EQ(SecondsToTicks(std::numeric_limits<double>::infinity()), kTime_Max);
  EXPECT_EQ(SecondsToTicks(-std::numeric_limits<double>::infinity()), kTime_Min);
  EXPECT_EQ(SecondsToTicks(1e30), kTime_Max);
  EXPECT_EQ(SecondsToTicks(-1e30), kTime_Min);
  EXPECT_EQ(SecondsToTicks(std::nan("")), kTime_Zero);
}

TEST(TickTime, ToFrameRoundsTowardMinusInfinity) {
  const TickTime frame = kFrameRate_24.GetTicksPerFrame();
  EXPECT_EQ(ToFrame(0, kFrameRate_24), 0);
  EXPECT_EQ(ToFrame(frame - 1, kFrameRate_24), 0);
  EXPECT_EQ(ToFrame(frame, kFrameRate_24), 1);
  EXPECT_EQ(ToFrame(-1, kFrameRate_24), -1);
  EXPECT_EQ(ToFrame(-frame, kFrameRate_24), -1);
  EXPECT_EQ(ToFrame(-frame - 1, kFrameRate_24), -2);
  EXPECT_EQ(ToFrame(kInt64Min, *FrameRate::FromTicksPerFrame(1)), kInt64Min);
}

TEST(TickTime, FrameToTimeIsExactAndSaturates) {
  EXPECT_EQ(FrameToTime(24, kFrameRate_24), kTicksPerSecond);
  EXPECT_EQ(FrameToTime(30000, kFrameRate_2997_NDF), 1001 * kTicksPerSecond);
  EXPECT_EQ(FrameToTime(-3, kFrameRate_25), -3 * kFrameRate_25.GetTicksPerFrame());
  EXPECT_EQ(FrameToTime(kInt64Max, kFrameRate_25), kTime_Max);
  EXPECT_EQ(FrameToTime(kInt64Min, kFrameRate_25), kTime_Min);
  for (const std::int64_t frame : {-100001, -1, 0, 1, 7, 123456789}) {
    EXPECT_EQ(ToFrame(FrameToTime(frame, kFrameRate_23976), kFrameRate_23976), frame);
  }
}

TEST(TickTime, ToFrame32Clamps) {
  const FrameRate tick = *FrameRate::FromTicksPerFrame(1);
  EXPECT_EQ(ToFrame32(kTime_Max, tick), std::numeric_limits<std::int32_t>::max());
  EXPECT_EQ(ToFrame32(kTime_Min, tick), std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(ToFrame32(kTicksPerSecond, kFrameRate_25), 25);
}

TEST(TickTime, InvalidRateGivesZeroInsteadOfDividingByZero) {
  const FrameRate invalid;
  EXPECT_EQ(ToFrame(kTicksPerSecond, invalid), 0);
  EXPECT_EQ(FrameToTime(10, invalid), 0);
}

}  // namespace
