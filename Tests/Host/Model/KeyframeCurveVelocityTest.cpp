#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "Host/Model/KeyframeCurve.h"
#include "Tests/Host/Model/KeyframeCurveTestSupport.h"

namespace {

using namespace curvetest;

TEST(KeyframeCurveVelocity, SignFollowsTheDirectionOfTheValue) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(kSecond, 10.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(2 * kSecond, -5.0, TemporalInterpolation::AutoBezier));
  EXPECT_GT(curve.VelocityAt(kSecond / 2), 0.0);
  EXPECT_LT(curve.VelocityAt(3 * kSecond / 2), 0.0);
  EXPECT_NEAR(curve.VelocityAt(kSecond), 0.0, 1e-9);  // a peak is flat
}

TEST(KeyframeCurveVelocity, BezierEndsMoveAtTheKeyframesSpeeds) {
  KeyframeCurve curve;
  curve.Add(Eased(0, 0.0, 0.0, 12.0, 1.0, 0.4));
  curve.Add(Eased(kSecond, 3.0, -7.0, 0.0, 0.8, 1.0));
  EXPECT_NEAR(curve.VelocityAt(0, Approach::FromRight), 12.0, 1e-6);
  EXPECT_NEAR(curve.VelocityAt(kSecond, Approach::FromLeft), -7.0, 1e-6);
}

TEST(KeyframeCurveVelocity, AgreesWithTheSlopeOfTheValue) {
  Random random(11);
  const KeyframeCurve curve = RandomCurve(random, 8);
  const TickTime h = kSecond / 100000;
  for (int i = 0; i < 300; ++i) {
    const TickTime t = static_cast<TickTime>(random.Uniform(0, 8) * kSecond);
    const std::optional<std::size_t> next = curve.FindAfter(t - h);
    if (next && curve.At(*next).time <= t + h) {
      continue;  // a keyframe lies inside the difference quotient
    }
    const double quotient = (Scalar(curve, t + h) - Scalar(curve, t - h)) / TicksToSeconds(2 * h);
    const double velocity = curve.VelocityAt(t);
    EXPECT_NEAR(velocity, quotient, 1e-3 * std::max(1.0, std::fabs(velocity))) << t;
  }
}

TEST(KeyframeCurveVelocity, ExtremesOverASpanMatchDenseSampling) {
  Random random(3);
  for (int round = 0; round < 30; ++round) {
    const KeyframeCurve curve = RandomCurve(random, 5);
    const double first = TicksToSeconds(curve.At(0).time);
    const TickTime from = SecondsToTicks(random.Uniform(first - 1.0, first + 4.0));
    const TickTime to = from + SecondsToTicks(random.Uniform(0.1, 4.0));
    const double minimum = curve.GetMinimumVelocity(from, to);
    const double maximum = curve.GetMaximumVelocity(from, to);
    double sampledMin = 0.0;
    double sampledMax = 0.0;
    bool any = false;
    KeyframeCurve::Sampler sampler(curve);
    auto sample = [&](TickTime t, Approach side) {
      const double v = sampler.VelocityAt(t, side);
      sampledMin = any ? std::min(sampledMin, v) : v;
      sampledMax = any ? std::max(sampledMax, v) : v;
      any = true;
    };
    constexpr int kSamples = 20000;
    for (int i = 0; i <= kSamples; ++i) {
      const TickTime t = from + (to - from) / kSamples * i;
      sample(t, i == kSamples ? Approach::FromLeft : Approach::FromRight);
    }
    // Both sides of every keyframe inside: a short handle can put the extreme right there, in a
    // sliver of time that even dense sampling misses.
    for (const std::size_t k : curve.FindInRange(from, to)) {
      const TickTime t = curve.At(k).time;
      if (t > from) {
        sample(t, Approach::FromLeft);
      }
      if (t < to) {
        sample(t, Approach::FromRight);
      }
    }
    const double scale = std::max({1.0, std::fabs(sampledMin), std::fabs(sampledMax)});
    // Never inside the sampled range, and no further out than dense sampling can miss.
    EXPECT_LE(minimum, sampledMin + 1e-9 * scale) << round;
    EXPECT_GE(maximum, sampledMax - 1e-9 * scale) << round;
    EXPECT_NEAR(minimum, sampledMin, 2e-3 * scale) << round;
    EXPECT_NEAR(maximum, sampledMax, 2e-3 * scale) << round;
  }
}

TEST(KeyframeCurveVelocity, SpansOutsideTheKeyframesAndHoldsCountAsStill) {
  KeyframeCurve curve;
  curve.Add(Key(kSecond, 0.0));
  curve.Add(Key(2 * kSecond, 10.0, TemporalInterpolation::Hold));
  curve.Add(Key(3 * kSecond, 20.0));
  EXPECT_DOUBLE_EQ(curve.GetMinimumVelocity(kSecond, 2 * kSecond), 10.0);
  EXPECT_DOUBLE_EQ(curve.GetMaximumVelocity(kSecond, 2 * kSecond), 10.0);
  EXPECT_EQ(curve.GetMinimumVelocity(0, 2 * kSecond), 0.0);  // still before the first keyframe
  EXPECT_EQ(curve.GetMinimumVelocity(kSecond, 3 * kSecond), 0.0);  // the hold
  EXPECT_EQ(curve.GetMaximumVelocity(5 * kSecond, 6 * kSecond), 0.0);
  EXPECT_EQ(curve.GetMaximumVelocity(2 * kSecond, kSecond), 0.0);  // no span
  EXPECT_EQ(KeyframeCurve().GetMaximumVelocity(0, kSecond), 0.0);
  EXPECT_DOUBLE_EQ(curve.GetMaximumVelocity(kSecond + 5, kSecond + 5), 10.0);
}

TEST(KeyframeCurveVelocity, SegmentSamplesSeeTheSpanFromInside) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 10.0));
  curve.Add(Key(2 * kSecond, 0.0));
  const std::vector<VelocitySample> samples = curve.CreateVelocitySegment(0, kSecond, 11);
  ASSERT_EQ(samples.size(), 11u);
  EXPECT_EQ(samples.front().time, 0);
  EXPECT_EQ(samples.back().time, kSecond);
  for (const VelocitySample& sample : samples) {
    // The last sample belongs to this segment, not to the falling one after it.
    EXPECT_DOUBLE_EQ(sample.velocity, 10.0) << sample.time;
  }
  for (std::size_t i = 1; i < samples.size(); ++i) {
    EXPECT_GT(samples[i].time, samples[i - 1].time);
  }
  EXPECT_TRUE(curve.CreateVelocitySegment(0, kSecond, 1).empty());
  EXPECT_TRUE(curve.CreateVelocitySegment(kSecond, 0, 10).empty());
  EXPECT_EQ(curve.CreateVelocitySegment(kTime_Min, kTime_Max, 3).size(), 3u);
}

}  // namespace
