#include <gtest/gtest.h>

#include <cmath>

#include "Host/Model/KeyframeCurve.h"
#include "Tests/Host/Model/KeyframeCurveTestSupport.h"

namespace {

using namespace curvetest;

ParamPoint PointAt(const KeyframeCurve& curve, TickTime time) {
  return std::get<ParamPoint>(*curve.ValueAt(time));
}

double Distance(ParamPoint a, ParamPoint b) {
  return std::hypot(b.x - a.x, b.y - a.y);
}

TEST(KeyframeCurvePath, StraightPathMovesAtConstantSpeed) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  curve.Add(Key(2 * kSecond, ParamPoint{30, 40}));
  EXPECT_EQ(PointAt(curve, kSecond).x, 15.0);
  EXPECT_EQ(PointAt(curve, kSecond).y, 20.0);
  EXPECT_DOUBLE_EQ(curve.VelocityAt(kSecond / 3), 25.0);  // 50 units in 2 seconds
  EXPECT_DOUBLE_EQ(curve.At(0).outSpeed, 25.0);
  EXPECT_FALSE(curve.ScalarAt(kSecond));
}

TEST(KeyframeCurvePath, CurvedPathPassesThroughItsKeyframesAlongItsTangents) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  curve.Add(Key(kSecond, ParamPoint{100, 0}));
  ASSERT_EQ(curve.SetSpatialTangent(0, KeyframeSide::Out, ParamPoint{0, 60}), CurveStatus::Ok);
  ASSERT_EQ(curve.SetSpatialTangent(1, KeyframeSide::In, ParamPoint{0, 60}), CurveStatus::Ok);
  EXPECT_EQ(curve.At(0).spatial, SpatialInterpolation::Bezier);
  EXPECT_EQ(PointAt(curve, 0).x, 0.0);
  EXPECT_EQ(PointAt(curve, kSecond).x, 100.0);
  // An arch: the middle of the journey is above the chord, at the middle in x by symmetry.
  const ParamPoint middle = PointAt(curve, kSecond / 2);
  EXPECT_NEAR(middle.x, 50.0, 1e-6);
  EXPECT_NEAR(middle.y, 45.0, 0.5);  // 3/4 of the tangent height at u = 1/2
  // Linear in time: equal times cover equal distances along the arch.
  double previous = -1.0;
  for (int i = 1; i <= 10; ++i) {
    const double step =
        Distance(PointAt(curve, (i - 1) * kSecond / 10), PointAt(curve, i * kSecond / 10));
    if (previous > 0.0) {
      EXPECT_NEAR(step, previous, 0.01 * previous) << i;
    }
    previous = step;
  }
  EXPECT_GT(curve.VelocityAt(kSecond / 2), 100.0);  // the arch is longer than the chord
}

TEST(KeyframeCurvePath, TemporalEaseSlowsTheJourneyAtItsEnds) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  curve.Add(Key(kSecond, ParamPoint{100, 0}));
  ASSERT_EQ(curve.ApplyAutomaticEase(0, KeyframeSide::Out), CurveStatus::Ok);
  ASSERT_EQ(curve.ApplyAutomaticEase(1, KeyframeSide::In), CurveStatus::Ok);
  EXPECT_LT(PointAt(curve, kSecond / 10).x, 10.0);
  EXPECT_NEAR(PointAt(curve, kSecond / 2).x, 50.0, 1e-9);
  EXPECT_NEAR(curve.VelocityAt(0), 0.0, 1e-9);
  EXPECT_GT(curve.VelocityAt(kSecond / 2), 100.0);
}

TEST(KeyframeCurvePath, FastSpeedsNeverCarryAPointPastItsKeyframe) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Eased(0, 0.0, 0.0, 0.0)), CurveStatus::Ok);
  curve.Clear();
  Keyframe a = Key(0, ParamPoint{0, 0}, TemporalInterpolation::Bezier);
  a.outSpeed = 10000.0;
  Keyframe b = Key(kSecond, ParamPoint{10, 0}, TemporalInterpolation::Bezier);
  b.inSpeed = 10000.0;
  ASSERT_EQ(curve.Add(a), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(b), CurveStatus::Ok);
  double previous = 0.0;
  for (int i = 0; i <= 100; ++i) {
    const double x = PointAt(curve, i * kSecond / 100).x;
    EXPECT_GE(x, previous - 1e-9) << i;
    EXPECT_LE(x, 10.0 + 1e-9) << i;
    previous = x;
  }
  EXPECT_GE(curve.GetMinimumVelocity(0, kSecond), 0.0);
}

TEST(KeyframeCurvePath, SpeedAlongAPathCannotBeNegative) {
  KeyframeCurve curve;
  Keyframe key = Key(0, ParamPoint{0, 0}, TemporalInterpolation::Bezier);
  key.outSpeed = -1.0;
  EXPECT_EQ(curve.Add(key), CurveStatus::NegativeSpeed);
  curve.Add(Key(0, ParamColor{}));
  EXPECT_EQ(curve.SetEase(0, KeyframeSide::Out, -5.0, 0.5), CurveStatus::NegativeSpeed);
}

TEST(KeyframeCurvePath, ContinuousTangentsStayOpposite) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  curve.Add(Key(kSecond, ParamPoint{50, 50}));
  curve.Add(Key(2 * kSecond, ParamPoint{100, 0}));
  ASSERT_EQ(curve.SetSpatialTangent(1, KeyframeSide::In, ParamPoint{-20, 0}), CurveStatus::Ok);
  ASSERT_EQ(curve.SetSpatialTangent(1, KeyframeSide::Out, ParamPoint{10, 10}), CurveStatus::Ok);
  ASSERT_EQ(curve.SetSpatialInterpolation(1, SpatialInterpolation::ContinuousBezier),
            CurveStatus::Ok);
  ParamPoint in = curve.At(1).inTangent;
  EXPECT_NEAR(in.x, -20.0 / std::sqrt(2.0), 1e-9);  // turned against the outgoing tangent,
  EXPECT_NEAR(in.y, -20.0 / std::sqrt(2.0), 1e-9);  // its length kept
  ASSERT_EQ(curve.SetSpatialTangent(1, KeyframeSide::In, ParamPoint{0, -5}), CurveStatus::Ok);
  const ParamPoint out = curve.At(1).outTangent;
  EXPECT_NEAR(out.x, 0.0, 1e-9);
  EXPECT_NEAR(out.y, std::hypot(10.0, 10.0), 1e-9);
  EXPECT_EQ(curve.At(1).spatial, SpatialInterpolation::ContinuousBezier);
}

TEST(KeyframeCurvePath, AutoTangentsRunAlongTheNeighboursChord) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  Keyframe middle = Key(kSecond, ParamPoint{50, 50});
  middle.spatial = SpatialInterpolation::AutoBezier;
  curve.Add(middle);
  curve.Add(Key(2 * kSecond, ParamPoint{120, 0}));
  EXPECT_NEAR(curve.At(1).outTangent.x, 20.0, 1e-12);
  EXPECT_NEAR(curve.At(1).outTangent.y, 0.0, 1e-12);
  EXPECT_NEAR(curve.At(1).inTangent.x, -20.0, 1e-12);
  curve.SetValue(2, ParamPoint{60, 60});
  EXPECT_NEAR(curve.At(1).outTangent.y, 10.0, 1e-12);  // follows the edit
  // Linear keyframes have no tangents whatever they are given.
  Keyframe straight = Key(3 * kSecond, ParamPoint{0, 0});
  straight.inTangent = {5, 5};
  curve.Add(straight);
  EXPECT_EQ(curve.At(3).inTangent, (ParamPoint{0, 0}));
}

TEST(KeyframeCurvePath, ColoursBlendPerComponentAtConstantSpeed) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamColor{1, 0, 0, 1}));
  curve.Add(Key(kSecond, ParamColor{0, 0, 1, 0}));
  const ParamColor middle = std::get<ParamColor>(*curve.ValueAt(kSecond / 2));
  EXPECT_FLOAT_EQ(middle.r, 0.5f);
  EXPECT_FLOAT_EQ(middle.g, 0.0f);
  EXPECT_FLOAT_EQ(middle.b, 0.5f);
  EXPECT_FLOAT_EQ(middle.a, 0.5f);
  EXPECT_NEAR(curve.VelocityAt(kSecond / 4), std::sqrt(3.0), 1e-6);
  EXPECT_EQ(curve.SetSpatialTangent(0, KeyframeSide::Out, ParamPoint{1, 1}),
            CurveStatus::KindMismatch);
}

TEST(KeyframeCurvePath, HandlesOfPathsCarryTheSpeed) {
  KeyframeCurve curve;
  curve.Add(Key(0, ParamPoint{0, 0}));
  curve.Add(Key(kSecond, ParamPoint{3, 4}));
  const std::optional<KeyframeHandle> handle = curve.ComputeHandle(0, KeyframeSide::Out);
  ASSERT_TRUE(handle);
  EXPECT_DOUBLE_EQ(handle->value, 5.0);
  EXPECT_NEAR(static_cast<double>(handle->time), kSecond / 3.0, 1e-6 * kSecond);  // a third
}

TEST(KeyframeCurvePath, IncrementalRefreshEqualsAFreshBuild) {
  Random random(77);
  KeyframeCurve curve;
  for (int step = 0; step < 300; ++step) {
    const int action = curve.Size() < 3 ? 0 : random.Below(5);
    const std::size_t index = static_cast<std::size_t>(
        random.Below(static_cast<int>(std::max<std::size_t>(curve.Size(), 1))));
    const TickTime time = static_cast<TickTime>(random.Uniform(0, 30)) * (kSecond / 3);
    const ParamPoint where{random.Uniform(-100, 100), random.Uniform(-100, 100)};
    switch (action) {
      case 0: {
        Keyframe key = Key(time, where, *TemporalInterpolationFromCode(random.Below(5)));
        key.spatial = *SpatialInterpolationFromCode(1 + random.Below(4));
        key.outTangent = {random.Uniform(-20, 20), random.Uniform(-20, 20)};
        key.inTangent = {random.Uniform(-20, 20), random.Uniform(-20, 20)};
        key.inSpeed = random.Uniform(0, 50);
        key.outSpeed = random.Uniform(0, 50);
        curve.Add(key);
        break;
      }
      case 1:
        curve.Remove(index);
        break;
      case 2:
        curve.SetValue(index, where);
        break;
      case 3:
        curve.SetSpatialInterpolation(index, *SpatialInterpolationFromCode(1 + random.Below(4)));
        break;
      default:
        curve.Move(index, time);
        break;
    }
    KeyframeCurve fresh;
    for (const Keyframe& key : curve.Keyframes()) {
      ASSERT_EQ(fresh.Add(key), CurveStatus::Ok);
    }
    ASSERT_EQ(fresh, curve) << "step " << step;
    for (TickTime t = 0; t <= 10 * kSecond; t += kSecond / 4) {
      ASSERT_EQ(fresh.ValueAt(t), curve.ValueAt(t)) << "step " << step;
    }
  }
}

}  // namespace
