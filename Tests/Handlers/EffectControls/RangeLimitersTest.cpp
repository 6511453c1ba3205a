#include <gtest/gtest.h>

#include <optional>

#include "Handlers/EffectControls/Src/HueRangeLimiter.h"
#include "Handlers/EffectControls/Src/LumaRangeLimiter.h"
#include "Handlers/EffectControls/Src/SaturationRangeLimiter.h"
#include "Handlers/EffectControls/Src/TonalRangeLimiter.h"
#include "Host/Rows/HSLRangeValues.h"
#include "Host/Rows/TonalRangeValues.h"

namespace {

// Range 0..100 with the start threshold at 30 (softness 20) and the end threshold at 60
// (softness 10).
class FixedHSLRange : public HSLRangeValues {
 public:
  float GetMinValue() const override { return 0.0f; }
  float GetMaxValue() const override { return 100.0f; }
  float GetStartThreshold() const override { return 30.0f; }
  float GetStartSoftness() const override { return 20.0f; }
  float GetEndThreshold() const override { return 60.0f; }
  float GetEndSoftness() const override { return 10.0f; }
};

class FixedTonalRange : public TonalRangeValues {
 public:
  float GetMinValue() const override { return 0.0f; }
  float GetMaxValue() const override { return 255.0f; }
  float GetShadowThreshold() const override { return 50.0f; }
  float GetHighlightThreshold() const override { return 200.0f; }
};

struct Result {
  float value;
  bool clamped;
  friend bool operator==(const Result&, const Result&) = default;
};

Result Limit(const DoubleSliderLimiter& limiter, int handle, float value) {
  bool clamped = false;
  const float limited = limiter.Limit(handle, value, clamped);
  return {limited, clamped};
}

TEST(HueRangeLimiter, LeavesAValueBetweenTheBoundsAndClampsOneOutside) {
  const FixedHSLRange range;
  const HueRangeLimiter hue(&range);
  EXPECT_EQ(Limit(hue, 5, 10.0f), (Result{10.0f, false}));
  EXPECT_EQ(Limit(hue, 5, 31.0f), (Result{30.0f, true}));
  EXPECT_EQ(Limit(hue, 5, -1.0f), (Result{0.0f, true}));
  EXPECT_EQ(Limit(hue, 6, 19.0f), (Result{20.0f, true}));  // the start softness
  EXPECT_EQ(Limit(hue, 6, 61.0f), (Result{60.0f, true}));
  EXPECT_EQ(Limit(hue, 7, 41.0f), (Result{40.0f, true}));  // 100 - end threshold
  EXPECT_EQ(Limit(hue, 8, 29.0f), (Result{30.0f, true}));
  EXPECT_EQ(Limit(hue, 8, 95.0f), (Result{90.0f, true}));  // 100 - end softness
  EXPECT_EQ(Limit(hue, 8, 90.0f), (Result{90.0f, false}));
}

TEST(HSLRangeLimiters, AnswerOnlyToTheirOwnHandles) {
  const FixedHSLRange range;
  const HueRangeLimiter hue(&range);
  const SaturationRangeLimiter saturation(&range);
  const LumaRangeLimiter luma(&range);
  EXPECT_EQ(Limit(saturation, 9, 31.0f), (Result{30.0f, true}));
  EXPECT_EQ(Limit(saturation, 12, 95.0f), (Result{90.0f, true}));
  EXPECT_EQ(Limit(luma, 13, 31.0f), (Result{30.0f, true}));
  EXPECT_EQ(Limit(luma, 16, 95.0f), (Result{90.0f, true}));
  // Handles of the others, and the first handle's neighbours, pass unchanged.
  EXPECT_EQ(Limit(hue, 9, 500.0f), (Result{500.0f, false}));
  EXPECT_EQ(Limit(hue, 4, 500.0f), (Result{500.0f, false}));
  EXPECT_EQ(Limit(saturation, 5, 500.0f), (Result{500.0f, false}));
  EXPECT_EQ(Limit(luma, 12, 500.0f), (Result{500.0f, false}));
  EXPECT_EQ(Limit(luma, 17, 500.0f), (Result{500.0f, false}));
}

TEST(TonalRangeLimiter, KeepsShadowsBelowHighlights) {
  const FixedTonalRange range;
  const TonalRangeLimiter tonal(&range);
  EXPECT_EQ(Limit(tonal, 1, 210.0f), (Result{205.0f, true}));  // 255 - shadow threshold
  EXPECT_EQ(Limit(tonal, 2, 201.0f), (Result{200.0f, true}));
  EXPECT_EQ(Limit(tonal, 3, 100.0f), (Result{100.0f, false}));
  EXPECT_EQ(Limit(tonal, 4, 49.0f), (Result{50.0f, true}));
  EXPECT_EQ(Limit(tonal, 4, 300.0f), (Result{255.0f, true}));
  EXPECT_EQ(Limit(tonal, 5, -9.0f), (Result{-9.0f, false}));
}

TEST(RangeLimiters, WithoutARangeControlLeaveEveryValueAlone) {
  const HueRangeLimiter hue(nullptr);
  const TonalRangeLimiter tonal(nullptr);
  EXPECT_EQ(Limit(hue, 5, 1000.0f), (Result{1000.0f, false}));
  EXPECT_EQ(Limit(tonal, 1, 1000.0f), (Result{1000.0f, false}));
}

}  // namespace
