#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <vector>

#include "Host/Model/KeyframeCurve.h"
#include "Tests/Host/Model/KeyframeCurveTestSupport.h"

namespace {

using namespace curvetest;

std::vector<TickTime> Times(TickTime from, TickTime to, int count) {
  std::vector<TickTime> times;
  for (int i = 0; i < count; ++i) {
    times.push_back(from + (to - from) / (count - 1) * i);
  }
  return times;
}

void ExpectSamplerAgrees(const KeyframeCurve& curve, const std::vector<TickTime>& times) {
  KeyframeCurve::Sampler sampler(curve);
  for (const TickTime t : times) {
    ASSERT_EQ(sampler.ValueAt(t), curve.ValueAt(t)) << t;
    ASSERT_EQ(sampler.ScalarAt(t), curve.ScalarAt(t)) << t;
    ASSERT_EQ(sampler.VelocityAt(t, Approach::FromLeft), curve.VelocityAt(t, Approach::FromLeft))
        << t;
    ASSERT_EQ(sampler.VelocityAt(t), curve.VelocityAt(t)) << t;
  }
}

TEST(KeyframeCurveSampler, AgreesWithTheCurveForwardBackwardAndAtRandom) {
  Random random(5);
  for (const int count : {0, 1, 2, 9, 300}) {
    const KeyframeCurve curve = RandomCurve(random, count);
    std::vector<TickTime> times = Times(-kSecond, (count + 1) * kSecond, 2000);
    // Exactly on the keyframes, too.
    for (const Keyframe& key : curve.Keyframes()) {
      times.push_back(key.time);
    }
    std::sort(times.begin(), times.end());
    ExpectSamplerAgrees(curve, times);
    std::reverse(times.begin(), times.end());
    ExpectSamplerAgrees(curve, times);
    for (std::size_t i = 0; i < times.size(); ++i) {
      std::swap(times[i],
                times[static_cast<std::size_t>(random.Below(static_cast<int>(times.size())))]);
    }
    ExpectSamplerAgrees(curve, times);
  }
}

// A row of readings at once gives exactly what one reading at a time gives, whatever the order
// of the times and however many keyframes lie between them.
void ExpectRowAgrees(const KeyframeCurve& curve, const std::vector<TickTime>& times) {
  KeyframeCurve::Sampler sampler(curve);
  std::vector<double> values(times.size(), -12345.0);
  ASSERT_TRUE(sampler.ScalarsAt(times, values));
  for (std::size_t i = 0; i < times.size(); ++i) {
    ASSERT_EQ(values[i], curve.ScalarAt(times[i])) << i << " at " << times[i];
  }
}

TEST(KeyframeCurveSampler, ARowOfReadingsMatchesReadingsOneByOne) {
  Random random(11);
  for (const int count : {1, 2, 9, 300, 2000}) {
    const KeyframeCurve curve = RandomCurve(random, count);
    // From before the first keyframe to after the last, sparse and dense, on the keyframes too.
    for (const int samples : {7, 150, 4000}) {
      std::vector<TickTime> times = Times(-kSecond, (count + 1) * kSecond, samples);
      for (const Keyframe& key : curve.Keyframes()) {
        times.push_back(key.time);
      }
      std::sort(times.begin(), times.end());
      ExpectRowAgrees(curve, times);
      std::reverse(times.begin(), times.end());
      ExpectRowAgrees(curve, times);
      for (std::size_t i = 0; i < times.size(); ++i) {
        std::swap(times[i],
                  times[static_cast<std::size_t>(random.Below(static_cast<int>(times.size())))]);
      }
      ExpectRowAgrees(curve, times);
    }
  }
}

TEST(KeyframeCurveSampler, ARowIsRefusedWithoutScalarsOrRoomForThem) {
  KeyframeCurve empty;
  std::vector<double> values(2, 7.0);
  const std::vector<TickTime> times{0, kSecond};
  EXPECT_FALSE(KeyframeCurve::Sampler(empty).ScalarsAt(times, values));
  KeyframeCurve points;
  points.Add(Key(0, ParamPoint{1, 2}));
  points.Add(Key(kSecond, ParamPoint{3, 4}));
  EXPECT_FALSE(KeyframeCurve::Sampler(points).ScalarsAt(times, values));
  KeyframeCurve scalars;
  scalars.Add(Key(0, 1.0));
  std::vector<double> tooFew(1, 7.0);
  EXPECT_FALSE(KeyframeCurve::Sampler(scalars).ScalarsAt(times, tooFew));
  EXPECT_EQ(tooFew[0], 7.0);
  EXPECT_EQ(values, (std::vector<double>{7.0, 7.0}));
  EXPECT_TRUE(KeyframeCurve::Sampler(scalars).ScalarsAt(times, values));
  EXPECT_EQ(values, (std::vector<double>{1.0, 1.0}));
}

TEST(KeyframeCurveSampler, CoarseStepsAcrossManyKeyframes) {
  Random random(8);
  const KeyframeCurve curve = RandomCurve(random, 2000);
  // Strides of 1 to 40 keyframes per sample, forward and back.
  for (const int count : {1500, 400, 50}) {
    std::vector<TickTime> times = Times(0, 2001 * kSecond, count);
    ExpectSamplerAgrees(curve, times);
    std::reverse(times.begin(), times.end());
    ExpectSamplerAgrees(curve, times);
  }
}

TEST(KeyframeCurveSampler, NoticesEditsOfItsCurve) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 10.0));
  KeyframeCurve::Sampler sampler(curve);
  EXPECT_DOUBLE_EQ(*sampler.ScalarAt(kSecond / 2), 5.0);
  curve.SetValue(1, 20.0);
  EXPECT_DOUBLE_EQ(*sampler.ScalarAt(kSecond / 2), 10.0);
  curve.Remove(1);
  EXPECT_EQ(*sampler.ScalarAt(kSecond / 2), 0.0);
  curve.Clear();
  EXPECT_FALSE(sampler.ScalarAt(kSecond / 2));
  EXPECT_FALSE(sampler.ValueAt(kSecond / 2));
  EXPECT_EQ(sampler.VelocityAt(kSecond / 2), 0.0);
  // The only keyframe changes kind: no scalar any more.
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 1.0));
  EXPECT_TRUE(sampler.ScalarAt(kSecond / 2));
  curve.Remove(1);
  curve.SetValue(0, ParamPoint{1, 2});
  curve.Add(Key(kSecond, ParamPoint{3, 2}));
  EXPECT_FALSE(sampler.ScalarAt(kSecond / 2));
  EXPECT_EQ(sampler.ValueAt(kSecond / 2), ParamValue(ParamPoint{2, 2}));
}

TEST(KeyframeCurveSampler, FollowsACurveReplacedByAssignment) {
  Random random(9);
  KeyframeCurve curve = RandomCurve(random, 50);
  KeyframeCurve::Sampler sampler(curve);
  for (const TickTime t : Times(0, 50 * kSecond, 100)) {
    sampler.ScalarAt(t);  // leaves the cursor near the end
  }
  curve = RandomCurve(random, 3);
  for (const TickTime t : Times(0, 50 * kSecond, 100)) {
    ASSERT_EQ(sampler.ScalarAt(t), curve.ScalarAt(t)) << t;
  }
  KeyframeCurve moved = std::move(curve);
  curve = KeyframeCurve();
  EXPECT_FALSE(sampler.ScalarAt(kSecond));
}

}  // namespace
