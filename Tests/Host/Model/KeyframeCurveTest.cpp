#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "Host/Model/KeyframeCurve.h"
#include "Tests/Host/Model/KeyframeCurveTestSupport.h"

namespace {

using namespace curvetest;

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr double kInf = std::numeric_limits<double>::infinity();

TEST(KeyframeCurve, EmptyCurveHasNoValueAndNoMotion) {
  const KeyframeCurve curve;
  EXPECT_FALSE(curve.ValueAt(0));
  EXPECT_FALSE(curve.ScalarAt(0));
  EXPECT_FALSE(curve.Kind());
  EXPECT_EQ(curve.VelocityAt(0), 0.0);
  EXPECT_FALSE(curve.NextKeyframeTime(kTime_Min));
  EXPECT_FALSE(curve.ComputeHandle(0, KeyframeSide::Out));
}

TEST(KeyframeCurve, OneKeyframeHoldsItsValueAtEveryTime) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(kSecond, 7.0)), CurveStatus::Ok);
  for (const TickTime t : {kTime_Min, TickTime{0}, kSecond, 5 * kSecond, kTime_Max}) {
    EXPECT_EQ(Scalar(curve, t), 7.0);
    EXPECT_EQ(curve.VelocityAt(t), 0.0);
  }
  EXPECT_FALSE(curve.ComputeHandle(0, KeyframeSide::In));
  EXPECT_FALSE(curve.ComputeHandle(0, KeyframeSide::Out));
}

TEST(KeyframeCurve, BeforeTheFirstAndAfterTheLastTheEndValuesHold) {
  KeyframeCurve curve;
  curve.Add(Eased(kSecond, 1.0, 50.0, 50.0));
  curve.Add(Eased(2 * kSecond, 3.0, 50.0, 50.0));
  EXPECT_EQ(Scalar(curve, kTime_Min), 1.0);
  EXPECT_EQ(Scalar(curve, kSecond - 1), 1.0);
  EXPECT_EQ(Scalar(curve, 2 * kSecond + 1), 3.0);
  EXPECT_EQ(curve.VelocityAt(kSecond - 1), 0.0);
  EXPECT_EQ(curve.VelocityAt(2 * kSecond), 0.0);  // from the right of the last keyframe
}

TEST(KeyframeCurve, HoldKeepsTheValueUntilTheNextKey) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 1.0, TemporalInterpolation::Hold)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(kSecond, 5.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(2 * kSecond, 9.0)), CurveStatus::Ok);
  EXPECT_EQ(Scalar(curve, kSecond / 2), 1.0);
  EXPECT_EQ(Scalar(curve, kSecond - 1), 1.0);
  EXPECT_EQ(Scalar(curve, kSecond), 5.0);
  EXPECT_DOUBLE_EQ(Scalar(curve, 3 * kSecond / 2), 7.0);
  EXPECT_EQ(curve.VelocityAt(kSecond / 2), 0.0);
}

TEST(KeyframeCurve, LinearInterpolatesBetweenKeys) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 0.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(2 * kSecond, 10.0)), CurveStatus::Ok);
  EXPECT_DOUBLE_EQ(Scalar(curve, kSecond / 2), 2.5);
  EXPECT_DOUBLE_EQ(curve.VelocityAt(kSecond), 5.0);
  // A linear keyframe's speeds are derived: the slopes of its segments.
  EXPECT_DOUBLE_EQ(curve.At(0).outSpeed, 5.0);
  EXPECT_DOUBLE_EQ(curve.At(1).inSpeed, 5.0);
}

TEST(KeyframeCurve, BezierPassesThroughItsKeyframes) {
  KeyframeCurve curve;
  curve.Add(Eased(0, 2.0, 0.0, 40.0, 1.0, 0.3));
  curve.Add(Eased(kSecond, -3.0, -70.0, 5.0, 0.1, 0.9));
  curve.Add(Eased(3 * kSecond, 8.0, 0.0, 0.0));
  EXPECT_EQ(Scalar(curve, 0), 2.0);
  EXPECT_EQ(Scalar(curve, kSecond), -3.0);
  EXPECT_EQ(Scalar(curve, 3 * kSecond), 8.0);
  // Continuous at the keyframes: one tick away the value has barely moved.
  EXPECT_NEAR(Scalar(curve, kSecond - 1), -3.0, 1e-6);
  EXPECT_NEAR(Scalar(curve, 3 * kSecond - 1), 8.0, 1e-6);
}

TEST(KeyframeCurve, ZeroSpeedsGiveFlatTangentsAtBothEnds) {
  KeyframeCurve curve;
  curve.Add(Eased(0, 0.0, 0.0, 0.0));
  curve.Add(Eased(kSecond, 10.0, 0.0, 0.0));
  EXPECT_NEAR(curve.VelocityAt(0, Approach::FromRight), 0.0, 1e-9);
  EXPECT_NEAR(curve.VelocityAt(kSecond, Approach::FromLeft), 0.0, 1e-9);
  EXPECT_GT(curve.VelocityAt(kSecond / 2), 10.0);  // faster than the straight line in between
}

TEST(KeyframeCurve, SymmetricEaseCrossesTheMiddleValueAtTheMiddleTime) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 0.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(kSecond, 10.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.ApplyAutomaticEase(0, KeyframeSide::Out), CurveStatus::Ok);
  ASSERT_EQ(curve.ApplyAutomaticEase(1, KeyframeSide::In), CurveStatus::Ok);
  EXPECT_NEAR(Scalar(curve, kSecond / 2), 5.0, 1e-9);
  // Symmetric about the middle.
  EXPECT_NEAR(Scalar(curve, kSecond / 5) + Scalar(curve, kSecond - kSecond / 5), 10.0, 1e-9);
  EXPECT_LT(Scalar(curve, kSecond / 10), 1.0);  // eases out of the first keyframe
}

TEST(KeyframeCurve, HandlesOnTheStraightLineGiveAStraightLine) {
  KeyframeCurve curve;
  curve.Add(Eased(0, 0.0, 0.0, 5.0));
  curve.Add(Eased(2 * kSecond, 10.0, 5.0, 0.0));
  for (int i = 0; i <= 20; ++i) {
    const TickTime t = i * (2 * kSecond) / 20;
    EXPECT_NEAR(Scalar(curve, t), 5.0 * TicksToSeconds(t), 1e-9) << i;
    EXPECT_NEAR(curve.VelocityAt(t, Approach::FromLeft), i == 0 ? 0.0 : 5.0, 1e-9) << i;
  }
}

TEST(KeyframeCurve, FasterOutgoingHandleRaisesTheStartOfTheSegment) {
  KeyframeCurve slow;
  slow.Add(Eased(0, 0.0, 0.0, 0.0));
  slow.Add(Eased(kSecond, 10.0, 0.0, 0.0));
  KeyframeCurve fast = slow;
  ASSERT_EQ(fast.SetEase(0, KeyframeSide::Out, 60.0, kDefaultInfluence), CurveStatus::Ok);
  EXPECT_GT(Scalar(fast, kSecond / 10), Scalar(slow, kSecond / 10));
  EXPECT_NEAR(fast.VelocityAt(0), 60.0, 1e-6);
  // A longer reach of a flat handle keeps the value near the start for longer.
  KeyframeCurve reach = slow;
  ASSERT_EQ(reach.SetEase(0, KeyframeSide::Out, 0.0, 1.0), CurveStatus::Ok);
  EXPECT_LT(Scalar(reach, kSecond / 4), Scalar(slow, kSecond / 4));
}

TEST(KeyframeCurve, MatchesAnIndependentEvaluationOfItsSegments) {
  Random random(7);
  for (int round = 0; round < 20; ++round) {
    const KeyframeCurve curve = RandomCurve(random, 6);
    const TickTime first = curve.At(0).time;
    const TickTime last = curve.At(curve.Size() - 1).time;
    for (int i = 0; i < 200; ++i) {
      const TickTime t = first + static_cast<TickTime>(random.Uniform(-0.1, 1.1) *
                                                       static_cast<double>(last - first));
      // Within half a tick of time, the slopes here being below 1e4 units per second.
      EXPECT_NEAR(Scalar(curve, t), ReferenceValue(curve, t), 1e-7) << round << " " << t;
    }
  }
}

TEST(KeyframeCurve, ExtremeInfluencesStillSolveExactly) {
  for (const double in : {kMinimumInfluence, 0.5, 1.0}) {
    for (const double out : {kMinimumInfluence, 0.5, 1.0}) {
      KeyframeCurve curve;
      curve.Add(Eased(0, 0.0, 0.0, 300.0, 1.0, out));
      curve.Add(Eased(kSecond / 24, 1.0, -300.0, 0.0, in, 1.0));
      for (int i = 0; i <= 50; ++i) {
        const TickTime t = i * (kSecond / 24) / 50;
        EXPECT_NEAR(Scalar(curve, t), ReferenceValue(curve, t), 1e-9) << in << " " << out;
      }
    }
  }
}

TEST(KeyframeCurve, AutoBezierIsSmoothThroughInteriorKeyframes) {
  KeyframeCurve curve;
  const double values[] = {0.0, 4.0, 5.0, 12.0, 20.0};
  const TickTime times[] = {0, kSecond, 3 * kSecond, 4 * kSecond, 7 * kSecond};
  for (int i = 0; i < 5; ++i) {
    curve.Add(Key(times[i], values[i], TemporalInterpolation::AutoBezier));
  }
  for (int i = 1; i < 4; ++i) {
    const double left = curve.VelocityAt(times[i], Approach::FromLeft);
    const double right = curve.VelocityAt(times[i], Approach::FromRight);
    EXPECT_NEAR(left, right, 1e-6 * std::max(1.0, std::fabs(left))) << i;
    EXPECT_GT(right, 0.0) << i;
    // And the curve itself agrees: the difference quotients on both sides approach the same.
    const TickTime h = kSecond / 10000;
    const double before =
        (Scalar(curve, times[i]) - Scalar(curve, times[i] - h)) / TicksToSeconds(h);
    const double after =
        (Scalar(curve, times[i] + h) - Scalar(curve, times[i])) / TicksToSeconds(h);
    EXPECT_NEAR(before, after, 1e-2 * std::max(1.0, std::fabs(after))) << i;
  }
}

TEST(KeyframeCurve, AutoBezierFlattensAtATurnAndDoesNotOvershoot) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(kSecond, 10.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(2 * kSecond, 0.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(2 * kSecond + kSecond / 10, 0.5, TemporalInterpolation::AutoBezier));
  curve.Add(Key(5 * kSecond, 30.0, TemporalInterpolation::AutoBezier));
  EXPECT_EQ(curve.At(1).inSpeed, 0.0);
  EXPECT_EQ(curve.At(1).outSpeed, 0.0);
  for (TickTime t = 0; t <= 5 * kSecond; t += kSecond / 100) {
    const double v = Scalar(curve, t);
    EXPECT_GE(v, 0.0 - 1e-9) << t;
    EXPECT_LE(v, 30.0 + 1e-9) << t;
    if (t > 2 * kSecond) {
      // Rising data rise monotonically even where the spacing is very uneven.
      EXPECT_GE(v, Scalar(curve, t - kSecond / 100) - 1e-9) << t;
    }
  }
}

TEST(KeyframeCurve, AutoBezierSpeedIsCappedBesideAGentleSegment) {
  // A gentle rise (1 a second) into a steep one (1000 a second): the chord through the middle
  // key is far steeper than three times the gentle slope, so the cap decides its speed.
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(kSecond, 1.0, TemporalInterpolation::AutoBezier));
  curve.Add(Key(kSecond + kSecond / 10, 101.0, TemporalInterpolation::AutoBezier));
  EXPECT_NEAR(curve.At(1).inSpeed, 3.0, 1e-9);
  EXPECT_NEAR(curve.At(1).outSpeed, 3.0, 1e-9);
  // Uncapped, the curve would dip far below its first key before climbing to the second.
  double previous = Scalar(curve, 0);
  for (TickTime t = kSecond / 100; t <= kSecond + kSecond / 10; t += kSecond / 100) {
    const double v = Scalar(curve, t);
    EXPECT_GE(v, previous - 1e-9) << t;
    EXPECT_GE(v, 0.0 - 1e-9) << t;
    previous = v;
  }
}

TEST(KeyframeCurve, AutoBezierSpeedsFollowEveryEdit) {
  KeyframeCurve curve;
  for (int i = 0; i < 5; ++i) {
    curve.Add(Key(i * kSecond, static_cast<double>(i), TemporalInterpolation::AutoBezier));
  }
  EXPECT_NEAR(curve.At(2).outSpeed, 1.0, 1e-12);
  ASSERT_EQ(curve.SetValue(3, 10.0), CurveStatus::Ok);
  EXPECT_GT(curve.At(2).outSpeed, 1.0);
  ASSERT_EQ(curve.Remove(3), CurveStatus::Ok);
  EXPECT_NEAR(curve.At(2).inSpeed, 1.0, 1e-12);  // neighbours 1 and 4 now, a straight chord
  ASSERT_EQ(curve.Move(1, kSecond / 2), CurveStatus::Ok);
  EXPECT_NEAR(curve.At(2).inSpeed, (4.0 - 1.0) / 3.5, 1e-12);
}

TEST(KeyframeCurve, ContinuousBezierKeepsOneSpeedOnBothSides) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Eased(kSecond, 5.0, 2.0, 8.0));
  curve.Add(Key(2 * kSecond, 0.0));
  ASSERT_EQ(curve.SetTemporalInterpolation(1, TemporalInterpolation::ContinuousBezier),
            CurveStatus::Ok);
  EXPECT_EQ(curve.At(1).inSpeed, 5.0);  // the mean of 2 and 8
  EXPECT_EQ(curve.At(1).outSpeed, 5.0);
  ASSERT_EQ(curve.SetEase(1, KeyframeSide::In, -3.0, 0.4), CurveStatus::Ok);
  EXPECT_EQ(curve.At(1).interpolation, TemporalInterpolation::ContinuousBezier);
  EXPECT_EQ(curve.At(1).outSpeed, -3.0);
  EXPECT_EQ(curve.At(1).outInfluence, kDefaultInfluence);  // influence is per side
  EXPECT_NEAR(curve.VelocityAt(kSecond, Approach::FromLeft),
              curve.VelocityAt(kSecond, Approach::FromRight), 1e-9);
  // A replacement whose speeds differ keeps the side that changed.
  Keyframe changed = curve.At(1);
  changed.outSpeed = 7.0;
  ASSERT_EQ(curve.Replace(1, changed), CurveStatus::Ok);
  EXPECT_EQ(curve.At(1).inSpeed, 7.0);
}

TEST(KeyframeCurve, EaseInAndOutFlattenOneSideAndKeepTheOther) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 10.0));
  curve.Add(Key(2 * kSecond, 30.0));
  const double before = Scalar(curve, kSecond + kSecond / 3);
  ASSERT_EQ(curve.ApplyAutomaticEase(1, KeyframeSide::In), CurveStatus::Ok);
  const Keyframe& key = curve.At(1);
  EXPECT_EQ(key.interpolation, TemporalInterpolation::Bezier);
  EXPECT_EQ(key.inSpeed, 0.0);
  EXPECT_EQ(key.inInfluence, kDefaultInfluence);
  EXPECT_DOUBLE_EQ(key.outSpeed, 20.0);  // the slope it had
  EXPECT_NEAR(curve.VelocityAt(kSecond, Approach::FromLeft), 0.0, 1e-9);
  // The outgoing segment keeps its straight course.
  EXPECT_NEAR(Scalar(curve, kSecond + kSecond / 3), before, 1e-9);
  ASSERT_EQ(curve.ApplyAutomaticEase(1, KeyframeSide::Out), CurveStatus::Ok);
  EXPECT_EQ(curve.At(1).outSpeed, 0.0);
  EXPECT_EQ(curve.At(1).inSpeed, 0.0);
  EXPECT_EQ(curve.ApplyAutomaticEase(3, KeyframeSide::Out), CurveStatus::NoSuchKeyframe);
}

TEST(KeyframeCurve, TurningLinearIntoBezierDoesNotMoveTheCurve) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 10.0));
  curve.Add(Key(3 * kSecond, -10.0));
  const KeyframeCurve original = curve;
  ASSERT_EQ(curve.SetTemporalInterpolation(1, TemporalInterpolation::Bezier), CurveStatus::Ok);
  for (TickTime t = 0; t <= 3 * kSecond; t += kSecond / 7) {
    EXPECT_NEAR(Scalar(curve, t), Scalar(original, t), 1e-9) << t;
  }
}

TEST(KeyframeCurve, EqualTimesAreRejectedAndNothingChanges) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 1.0));
  const KeyframeCurve before = curve;
  const std::uint64_t revision = curve.Revision();
  EXPECT_EQ(curve.Add(Key(kSecond, 5.0)), CurveStatus::DuplicateTime);
  EXPECT_EQ(curve.Move(0, kSecond), CurveStatus::DuplicateTime);
  Keyframe moved = curve.At(1);
  moved.time = 0;
  EXPECT_EQ(curve.Replace(1, moved), CurveStatus::DuplicateTime);
  EXPECT_EQ(curve, before);
  EXPECT_EQ(curve.Revision(), revision);
  // Replacing at the same time is not a duplicate.
  EXPECT_EQ(curve.AddOrReplace(Key(kSecond, 5.0)), CurveStatus::Ok);
  EXPECT_EQ(Scalar(curve, kSecond), 5.0);
  EXPECT_EQ(curve.Size(), 2u);
}

TEST(KeyframeCurve, NonFiniteNumbersAreRejected) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  const KeyframeCurve before = curve;
  EXPECT_EQ(curve.Add(Key(kSecond, kNaN)), CurveStatus::NonFiniteValue);
  EXPECT_EQ(curve.Add(Key(kSecond, kInf)), CurveStatus::NonFiniteValue);
  EXPECT_EQ(curve.SetValue(0, -kInf), CurveStatus::NonFiniteValue);
  EXPECT_EQ(curve.SetEase(0, KeyframeSide::Out, kNaN, 0.5), CurveStatus::NonFiniteValue);
  EXPECT_EQ(curve.SetEase(0, KeyframeSide::Out, 1.0, kInf), CurveStatus::NonFiniteValue);
  Keyframe bad = Eased(kSecond, 1.0, 0.0, 0.0);
  bad.inInfluence = kNaN;
  EXPECT_EQ(curve.Add(bad), CurveStatus::NonFiniteValue);
  EXPECT_EQ(curve.Add(Key(kSecond, 1e101)), CurveStatus::ValueOutOfRange);
  EXPECT_EQ(curve.SetEase(0, KeyframeSide::In, 1e201, 0.5), CurveStatus::ValueOutOfRange);
  EXPECT_EQ(curve, before);

  KeyframeCurve points;
  EXPECT_EQ(points.Add(Key(0, ParamPoint{kNaN, 0})), CurveStatus::NonFiniteValue);
  KeyframeCurve colours;
  EXPECT_EQ(colours.Add(Key(0, ParamColor{0, std::numeric_limits<float>::infinity(), 0, 1})),
            CurveStatus::NonFiniteValue);
  EXPECT_TRUE(points.IsEmpty());
  EXPECT_TRUE(colours.IsEmpty());
}

TEST(KeyframeCurve, InfluencesAreLimitedToTheirRange) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Eased(0, 0.0, 0.0, 0.0, -3.0, 0.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Eased(kSecond, 1.0, 0.0, 0.0, 7.0, 1.0)), CurveStatus::Ok);
  EXPECT_EQ(curve.At(0).outInfluence, kMinimumInfluence);
  EXPECT_EQ(curve.At(1).inInfluence, kMaximumInfluence);
  EXPECT_NEAR(Scalar(curve, kSecond / 2), ReferenceValue(curve, kSecond / 2), 1e-9);
}

TEST(KeyframeCurve, TimesOutsideTheStorableRangeAreRejected) {
  KeyframeCurve curve;
  EXPECT_EQ(curve.Add(Key(kTime_Max, 0.0)), CurveStatus::TimeOutOfRange);
  EXPECT_EQ(curve.Add(Key(kTime_Min, 0.0)), CurveStatus::TimeOutOfRange);
  EXPECT_EQ(curve.Add(Key(std::numeric_limits<TickTime>::max(), 0.0)), CurveStatus::TimeOutOfRange);
  ASSERT_EQ(curve.Add(Key(kTime_Max - 1, 0.0)), CurveStatus::Ok);
  EXPECT_EQ(curve.Move(0, kTime_Max), CurveStatus::TimeOutOfRange);
  EXPECT_EQ(curve.MoveKeyframes({0}, 1), CurveStatus::TimeOutOfRange);
  EXPECT_EQ(curve.MoveKeyframes({0}, std::numeric_limits<TickTime>::max()),
            CurveStatus::TimeOutOfRange);
  EXPECT_EQ(curve.At(0).time, kTime_Max - 1);
}

TEST(KeyframeCurve, HugeTickValuesEvaluateWithoutOverflow) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Eased(kTime_Min + 1, -1.0, 0.0, 0.0, 1.0, 0.3)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Eased(kTime_Max - 1, 1.0, 0.0, 0.0, 0.3, 1.0)), CurveStatus::Ok);
  double previous = -1.0;
  const TickTime step = ((kTime_Max - 1) - (kTime_Min + 1)) / 1000;
  for (int i = 0; i <= 1000; ++i) {
    const TickTime t = kTime_Min + 1 + step * i;
    const double v = Scalar(curve, t);
    ASSERT_TRUE(std::isfinite(v)) << i;
    EXPECT_GE(v, previous - 1e-12) << i;
    EXPECT_NEAR(v, ReferenceValue(curve, t), 1e-9) << i;
    previous = v;
  }
  EXPECT_TRUE(std::isfinite(curve.VelocityAt(0)));
  EXPECT_TRUE(std::isfinite(curve.GetMaximumVelocity(kTime_Min, kTime_Max)));
  const std::optional<KeyframeHandle> handle = curve.ComputeHandle(0, KeyframeSide::Out);
  ASSERT_TRUE(handle);
  EXPECT_GT(handle->time, kTime_Min + 1);
}

TEST(KeyframeCurve, AllKeyframesShareOneKind) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 1.0));
  EXPECT_EQ(curve.Add(Key(2 * kSecond, ParamPoint{1, 1})), CurveStatus::KindMismatch);
  EXPECT_EQ(curve.SetValue(0, true), CurveStatus::KindMismatch);
  EXPECT_EQ(curve.Kind(), ParamValueKind::Double);
  // The only keyframe may change kind: the curve takes the new one.
  KeyframeCurve single;
  single.Add(Key(0, 0.0));
  ASSERT_EQ(single.SetValue(0, ParamPoint{2, 3}), CurveStatus::Ok);
  EXPECT_EQ(single.Kind(), ParamValueKind::Point);
  ASSERT_EQ(single.Add(Key(kSecond, ParamPoint{4, 3})), CurveStatus::Ok);
  EXPECT_EQ(single.ValueAt(kSecond / 2), ParamValue(ParamPoint{3, 3}));
}

TEST(KeyframeCurve, KindsThatDoNotInterpolateHoldWhateverTheMode) {
  KeyframeCurve flags;
  flags.Add(Key(0, false, TemporalInterpolation::Linear));
  flags.Add(Key(kSecond, true, TemporalInterpolation::AutoBezier));
  EXPECT_EQ(flags.ValueAt(kSecond - 1), ParamValue(false));
  EXPECT_EQ(flags.ValueAt(kSecond), ParamValue(true));
  EXPECT_EQ(flags.ScalarAt(kSecond / 2), 0.0);
  EXPECT_EQ(flags.VelocityAt(kSecond / 2), 0.0);

  KeyframeCurve text;
  text.Add(Key(0, std::string("one")));
  text.Add(Key(kSecond, std::string("two")));
  EXPECT_EQ(text.ValueAt(kSecond / 2), ParamValue(std::string("one")));
  EXPECT_FALSE(text.ScalarAt(kSecond / 2));

  KeyframeCurve menu;
  menu.Add(Key(0, ParamChoice{1}));
  menu.Add(Key(kSecond, ParamChoice{4}));
  EXPECT_EQ(menu.ScalarAt(kSecond - 1), 1.0);
  EXPECT_EQ(menu.ScalarAt(kSecond), 4.0);

  KeyframeCurve blob;
  blob.Add(Key(0, ParamBlob{{1}}));
  blob.Add(Key(kSecond, ParamBlob{{2}}));
  EXPECT_EQ(blob.ValueAt(kSecond / 2), ParamValue(ParamBlob{{1}}));
}

TEST(KeyframeCurve, FindsKeyframesAroundATime) {
  KeyframeCurve curve;
  for (const TickTime t : {3 * kSecond, kSecond, 2 * kSecond}) {
    curve.Add(Key(t, 0.0));
  }
  EXPECT_EQ(curve.At(0).time, kSecond);  // kept in time order
  EXPECT_EQ(curve.FindAt(2 * kSecond), 1u);
  EXPECT_FALSE(curve.FindAt(2 * kSecond + 1));
  EXPECT_EQ(curve.FindBefore(2 * kSecond), 0u);
  EXPECT_EQ(curve.FindAfter(2 * kSecond), 2u);
  EXPECT_EQ(curve.FindAtOrBefore(2 * kSecond), 1u);
  EXPECT_EQ(curve.FindAtOrAfter(2 * kSecond + 1), 2u);
  EXPECT_FALSE(curve.FindBefore(kSecond));
  EXPECT_FALSE(curve.FindAfter(3 * kSecond));
  EXPECT_EQ(curve.NextKeyframeTime(kTime_Min), kSecond);
  EXPECT_EQ(curve.PreviousKeyframeTime(kTime_Max), 3 * kSecond);
  EXPECT_FALSE(curve.NextKeyframeTime(3 * kSecond));
  EXPECT_EQ(curve.FindInRange(kSecond, 2 * kSecond), (std::vector<std::size_t>{0, 1}));
  EXPECT_EQ(curve.FindInRange(kTime_Min, kTime_Max), (std::vector<std::size_t>{0, 1, 2}));
  EXPECT_TRUE(curve.FindInRange(2 * kSecond, kSecond).empty());
}

TEST(KeyframeCurve, MovingAKeyframeReordersAndReshapes) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Key(kSecond, 10.0));
  curve.Add(Key(2 * kSecond, 20.0));
  ASSERT_EQ(curve.Move(0, 3 * kSecond), CurveStatus::Ok);
  EXPECT_EQ(curve.At(2).time, 3 * kSecond);
  EXPECT_EQ(curve.At(2).value, ParamValue(0.0));
  EXPECT_DOUBLE_EQ(Scalar(curve, 5 * kSecond / 2), 10.0);
  EXPECT_EQ(Scalar(curve, 0), 10.0);
  EXPECT_EQ(curve.Move(5, 0), CurveStatus::NoSuchKeyframe);
}

TEST(KeyframeCurve, MovingASelectionShiftsItAsOne) {
  KeyframeCurve curve;
  for (int i = 0; i < 4; ++i) {
    curve.Add(Key(i * kSecond, static_cast<double>(i)));
  }
  const KeyframeCurve before = curve;
  // Keys 0 and 1 by two seconds: key 1 would land on key 3, which stays.
  EXPECT_EQ(curve.MoveKeyframes({0, 1}, 2 * kSecond), CurveStatus::DuplicateTime);
  EXPECT_EQ(curve, before);
  // Keys 1 to 3 by one second: each lands where the next was, which moves too.
  ASSERT_EQ(curve.MoveKeyframes({3, 1, 2, 1}, kSecond), CurveStatus::Ok);
  EXPECT_EQ(curve.At(1).time, 2 * kSecond);
  EXPECT_EQ(curve.At(1).value, ParamValue(1.0));
  EXPECT_EQ(curve.At(2).time, 3 * kSecond);
  EXPECT_EQ(curve.At(2).value, ParamValue(2.0));
  EXPECT_EQ(curve.FindAt(4 * kSecond), 3u);
  EXPECT_DOUBLE_EQ(Scalar(curve, kSecond), 0.5);
  // Key 0 past everything.
  ASSERT_EQ(curve.MoveKeyframes({0}, 10 * kSecond), CurveStatus::Ok);
  EXPECT_EQ(curve.At(3).value, ParamValue(0.0));
  EXPECT_EQ(curve.MoveKeyframes({9}, kSecond), CurveStatus::NoSuchKeyframe);
  EXPECT_EQ(curve.MoveKeyframes({}, kSecond), CurveStatus::Ok);
}

TEST(KeyframeCurve, ComputesHandlesAsInfluenceAndSpeedGiveThem) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  curve.Add(Eased(2 * kSecond, 10.0, 4.0, -6.0, 0.5, 1.0));
  curve.Add(Key(6 * kSecond, 0.0));
  const std::optional<KeyframeHandle> in = curve.ComputeHandle(1, KeyframeSide::In);
  ASSERT_TRUE(in);
  EXPECT_EQ(in->time, 2 * kSecond - kSecond / 2);  // p - (p - q) * 0.5 / 2
  EXPECT_DOUBLE_EQ(in->value, 10.0 - 0.5 * 4.0);
  const std::optional<KeyframeHandle> out = curve.ComputeHandle(1, KeyframeSide::Out);
  ASSERT_TRUE(out);
  EXPECT_EQ(out->time, 4 * kSecond);  // p + (r - p) * 1.0 / 2
  EXPECT_DOUBLE_EQ(out->value, 10.0 - 2.0 * 6.0);
  // A linear keyframe's handle lies on its straight segment.
  const std::optional<KeyframeHandle> straight = curve.ComputeHandle(0, KeyframeSide::Out);
  ASSERT_TRUE(straight);
  EXPECT_NEAR(straight->value, 5.0 * TicksToSeconds(straight->time), 1e-9);
  EXPECT_FALSE(curve.ComputeHandle(0, KeyframeSide::In));
  EXPECT_FALSE(curve.ComputeHandle(2, KeyframeSide::Out));
  EXPECT_FALSE(curve.ComputeHandle(3, KeyframeSide::In));
}

TEST(KeyframeCurve, BadInterpolationCodesAreRejected) {
  KeyframeCurve curve;
  curve.Add(Key(0, 0.0));
  EXPECT_EQ(curve.SetTemporalInterpolation(0, static_cast<TemporalInterpolation>(9)),
            CurveStatus::InvalidMode);
  Keyframe bad = Key(kSecond, 1.0);
  bad.spatial = static_cast<SpatialInterpolation>(0);
  EXPECT_EQ(curve.Add(bad), CurveStatus::InvalidMode);
  EXPECT_EQ(curve.SetSpatialInterpolation(0, SpatialInterpolation::Bezier),
            CurveStatus::KindMismatch);  // a number has no path
  EXPECT_EQ(curve.Size(), 1u);
}

TEST(KeyframeCurve, RevisionChangesWithEverySuccessfulEdit) {
  KeyframeCurve a;
  KeyframeCurve b;
  a.Add(Key(0, 0.0));
  b.Add(Key(0, 0.0));
  EXPECT_NE(a.Revision(), b.Revision());  // unique across curves
  const std::uint64_t revision = a.Revision();
  EXPECT_EQ(a.Remove(4), CurveStatus::NoSuchKeyframe);
  EXPECT_EQ(a.Revision(), revision);
  a.Clear();
  EXPECT_NE(a.Revision(), revision);
  EXPECT_TRUE(a.IsEmpty());
}

// Edits refresh only the neighbourhood of the keyframe they touch; whatever the order of edits,
// the result must equal a curve built afresh from the same keyframes.
TEST(KeyframeCurve, IncrementalRefreshEqualsAFreshBuild) {
  Random random(42);
  KeyframeCurve curve;
  for (int step = 0; step < 600; ++step) {
    const int action = curve.Size() < 3 ? 0 : random.Below(7);
    const auto index = static_cast<std::size_t>(random.Below(static_cast<int>(curve.Size()) + 1)) %
                       std::max<std::size_t>(curve.Size(), 1);
    const TickTime time = static_cast<TickTime>(random.Uniform(0, 40)) * (kSecond / 4);
    switch (action) {
      case 0: {
        Keyframe key = Eased(time, random.Uniform(-50, 50), random.Uniform(-9, 9),
                             random.Uniform(-9, 9), random.Uniform(0, 1), random.Uniform(0, 1));
        key.interpolation = *TemporalInterpolationFromCode(random.Below(5));
        curve.Add(key);
        break;
      }
      case 1:
        curve.Remove(index);
        break;
      case 2:
        curve.Move(index, time);
        break;
      case 3:
        curve.SetValue(index, random.Uniform(-50, 50));
        break;
      case 4:
        curve.SetTemporalInterpolation(index, *TemporalInterpolationFromCode(random.Below(5)));
        break;
      case 5:
        curve.SetEase(index, random.Below(2) ? KeyframeSide::In : KeyframeSide::Out,
                      random.Uniform(-9, 9), random.Uniform(0, 1));
        break;
      default:
        curve.MoveKeyframes({index, (index + 2) % curve.Size()}, kSecond / 4);
        break;
    }
    KeyframeCurve fresh;
    std::vector<Keyframe> keys = curve.Keyframes();
    std::reverse(keys.begin(), keys.end());
    for (const Keyframe& key : keys) {
      ASSERT_EQ(fresh.Add(key), CurveStatus::Ok);
    }
    ASSERT_EQ(fresh, curve) << "step " << step;
    for (TickTime t = -kSecond; t <= 11 * kSecond; t += kSecond / 3) {
      ASSERT_EQ(Scalar(fresh, t), Scalar(curve, t)) << "step " << step << " t " << t;
    }
  }
}

}  // namespace
