#include <gtest/gtest.h>

#include <limits>

#include "Host/Model/Keyframe.h"

namespace {

TEST(Keyframe, InterpolationCodesAreTheHosts) {
  EXPECT_EQ(TemporalInterpolationFromCode(0), TemporalInterpolation::Hold);
  EXPECT_EQ(TemporalInterpolationFromCode(4), TemporalInterpolation::AutoBezier);
  EXPECT_FALSE(TemporalInterpolationFromCode(5));
  EXPECT_FALSE(TemporalInterpolationFromCode(-1));
  EXPECT_EQ(SpatialInterpolationFromCode(1), SpatialInterpolation::Linear);
  EXPECT_FALSE(SpatialInterpolationFromCode(0));
  EXPECT_TRUE(IsCurved(TemporalInterpolation::ContinuousBezier));
  EXPECT_FALSE(IsCurved(TemporalInterpolation::Hold));
  EXPECT_FALSE(IsCurved(TemporalInterpolation::Linear));
}

TEST(Keyframe, EaseTimesReachInfluenceTimesHalfTheSegment) {
  Keyframe key;
  key.time = 1000;
  key.inInfluence = 0.5;
  key.outInfluence = 1.0;
  // p - (p - q) * influence / 2 and p + (r - p) * influence / 2.
  EXPECT_EQ(key.GetEaseInTime(200), 800);
  EXPECT_EQ(key.GetEaseOutTime(3000), 2000);
  // The neighbour must lie strictly before (after).
  EXPECT_FALSE(key.GetEaseInTime(1000));
  EXPECT_FALSE(key.GetEaseInTime(2000));
  EXPECT_FALSE(key.GetEaseOutTime(1000));
  EXPECT_FALSE(key.GetEaseOutTime(0));
}

TEST(Keyframe, EaseTimesStayInsideAHugeSegment) {
  Keyframe key;
  key.time = kTime_Max - 1;
  key.inInfluence = 1.0;
  const std::optional<TickTime> handle = key.GetEaseInTime(kTime_Min + 1);
  ASSERT_TRUE(handle);
  EXPECT_GT(*handle, kTime_Min + 1);
  EXPECT_LT(*handle, kTime_Max - 1);
  EXPECT_NEAR(static_cast<double>(*handle), 0.0, 1e4);
  key.outInfluence = std::numeric_limits<double>::quiet_NaN();  // treated as the default
  EXPECT_FALSE(key.GetEaseOutTime(kTime_Max - 1));
  key.time = 0;
  EXPECT_TRUE(key.GetEaseOutTime(kTime_Max - 1));
}

TEST(Keyframe, EaseValuesFollowTheSpeedInUnitsPerSecond) {
  Keyframe key;
  key.time = 2 * kTicksPerSecond;
  key.value = 10.0;
  key.inSpeed = 4.0;
  key.outSpeed = -2.0;
  EXPECT_DOUBLE_EQ(*key.GetEaseInValue(kTicksPerSecond + kTicksPerSecond / 2), 8.0);
  EXPECT_DOUBLE_EQ(*key.GetEaseOutValue(3 * kTicksPerSecond), 8.0);
  key.value = ParamPoint{1, 1};
  EXPECT_FALSE(key.GetEaseInValue(0));
}

}  // namespace
