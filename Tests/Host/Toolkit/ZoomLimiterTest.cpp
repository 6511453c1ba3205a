#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "Host/Toolkit/ZoomLimiter.h"

namespace {

// What a panel's limiter looks like: a time range and a frame duration.
class RangeLimiter : public ZoomLimiter {
 public:
  TickTime GetDuration() const override { return mMax - mMin; }
  TickTime GetFrameDuration() const override { return mFrame; }
  TickTime ClampTime(TickTime time) const override { return std::clamp(time, mMin, mMax); }

  TickTime mMin = 0;
  TickTime mMax = 0;
  TickTime mFrame = kUnsetFrameDuration;
};

TEST(ZoomLimiter, WithoutAFrameRateTheFinestZoomIsOneSecondPerPixel) {
  RangeLimiter limiter;
  limiter.mMax = 1000 * kTicksPerSecond;
  limiter.SetScrollWidth(100);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(0.001), 1.0);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(5.0), 5.0);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(50.0), 10.0) << "the whole range across the width";
}

TEST(ZoomLimiter, TheFinestZoomGivesAFrameItsMostPixels) {
  RangeLimiter limiter;
  limiter.mMax = 60 * kTicksPerSecond;
  limiter.mFrame = kTicksPerSecond / 25;
  limiter.SetScrollWidth(600);
  const double finest = 1.0 / (ZoomLimiter::kMaxPixelsPerFrame * 25.0);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(1e-9), finest);
  limiter.SetAudioTimeUnits(true);
  limiter.mFrame = kTicksPerSecond / 48000;
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(1e-12),
                   1.0 / (ZoomLimiter::kMaxPixelsPerAudioSample * 48000.0));
}

TEST(ZoomLimiter, TheWidestZoomWinsWhenTheBoundsCross) {
  RangeLimiter limiter;
  limiter.mMax = kTicksPerSecond / 2;  // half a second over 100 px is finer than 1 s/px
  limiter.SetScrollWidth(100);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(3.0), 0.005);
}

TEST(ZoomLimiter, EmptyRangesNarrowWidthsAndNaNAreSafe) {
  RangeLimiter limiter;
  limiter.SetScrollWidth(-20);
  EXPECT_EQ(limiter.GetScrollWidth(), 0);
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(7.0), 1.0) << "empty duration: 1 s/px";
  limiter.mMax = 10 * kTicksPerSecond;
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(100.0), 10.0) << "a zero width counts as one pixel";
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(std::nan("")), 1.0);
}

TEST(ZoomLimiter, ZoomPositionsFollowThePowerCurveBothWays) {
  RangeLimiter limiter;
  limiter.mMax = 100 * kTicksPerSecond;
  limiter.mFrame = kTicksPerSecond / 25;
  limiter.SetScrollWidth(100);
  const double finest = limiter.GetFinestTimePerPixel();
  EXPECT_DOUBLE_EQ(limiter.TimePerPixelFromZoomPosition(0.0), finest);
  EXPECT_DOUBLE_EQ(limiter.TimePerPixelFromZoomPosition(1.0), 1.0);
  EXPECT_DOUBLE_EQ(limiter.TimePerPixelFromZoomPosition(0.5), finest + (1.0 - finest) * 0.125);
  for (const double p : {0.0, 0.1, 0.37, 0.9, 1.0}) {
    EXPECT_NEAR(limiter.ZoomPositionFromTimePerPixel(limiter.TimePerPixelFromZoomPosition(p)), p,
                1e-9);
  }
  EXPECT_DOUBLE_EQ(limiter.TimePerPixelFromZoomPosition(7.0), 1.0) << "positions are clamped";
}

}  // namespace
