#include <gtest/gtest.h>

#include "Host/Model/KeyframeCurve.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

Keyframe Key(TickTime time, double value,
             TemporalInterpolation mode = TemporalInterpolation::Linear) {
  Keyframe k;
  k.time = time;
  k.value = value;
  k.interpolation = mode;
  return k;
}

TEST(KeyframeCurve, HoldKeepsTheValueUntilTheNextKey) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 1.0, TemporalInterpolation::Hold)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(kSecond, 5.0)), CurveStatus::Ok);
  EXPECT_EQ(curve.ScalarAt(kSecond - 1), 1.0);
  EXPECT_EQ(curve.ScalarAt(kSecond), 5.0);
}

TEST(KeyframeCurve, LinearInterpolatesBetweenKeys) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 0.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(2 * kSecond, 10.0)), CurveStatus::Ok);
  EXPECT_DOUBLE_EQ(*curve.ScalarAt(kSecond / 2), 2.5);
  EXPECT_DOUBLE_EQ(curve.VelocityAt(kSecond), 5.0);
}

TEST(KeyframeCurve, SymmetricEaseCrossesTheMiddleValueAtTheMiddleTime) {
  KeyframeCurve curve;
  ASSERT_EQ(curve.Add(Key(0, 0.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.Add(Key(kSecond, 10.0)), CurveStatus::Ok);
  ASSERT_EQ(curve.ApplyAutomaticEase(0, KeyframeSide::Out), CurveStatus::Ok);
  ASSERT_EQ(curve.ApplyAutomaticEase(1, KeyframeSide::In), CurveStatus::Ok);
  EXPECT_NEAR(*curve.ScalarAt(kSecond / 2), 5.0, 1e-9);
  EXPECT_LT(*curve.ScalarAt(kSecond / 10), 1.0);
}

}  // namespace
