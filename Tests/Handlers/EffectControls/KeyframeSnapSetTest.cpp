#include <gtest/gtest.h>

#include "Handlers/EffectControls/Src/KeyframeSnapSet.h"

namespace {

constexpr TickTime kPixel = 1000;
constexpr TickTime kTolerance = 6 * kPixel;

KeyframeSnapSet Set(std::initializer_list<TickTime> times) {
  KeyframeSnapSet set;
  for (const TickTime time : times) {
    set.Add(time);
  }
  return set;
}

}  // namespace

TEST(KeyframeSnapSet, SnapsToTheLaterOfTwoTimesInRange) {
  // 3 pixels before one snap time and 5 after an earlier one.
  const KeyframeSnapSet set = Set({100 * kPixel, 108 * kPixel});
  EXPECT_EQ(set.Snap(105 * kPixel, kTolerance), 108 * kPixel);
}

TEST(KeyframeSnapSet, ExactlySixPixelsAwayDoesNotSnap) {
  const KeyframeSnapSet set = Set({100 * kPixel});
  EXPECT_EQ(set.Snap(94 * kPixel, kTolerance), std::nullopt);
  EXPECT_EQ(set.Snap(106 * kPixel, kTolerance), std::nullopt);
  EXPECT_EQ(set.Snap(95 * kPixel, kTolerance), 100 * kPixel);
  EXPECT_EQ(set.Snap(105 * kPixel, kTolerance), 100 * kPixel);
}

TEST(KeyframeSnapSet, ATimeAfterEverySnapTimeStillSnapsToTheLastOne) {
  const KeyframeSnapSet set = Set({10 * kPixel, 50 * kPixel});
  EXPECT_EQ(set.Snap(53 * kPixel, kTolerance), 50 * kPixel);
}

TEST(KeyframeSnapSet, AnEmptySetNeverSnaps) {
  EXPECT_EQ(KeyframeSnapSet().Snap(0, kTolerance), std::nullopt);
}

TEST(KeyframeSnapSet, FarOffTimesDoNotOverflowTheDistance) {
  const KeyframeSnapSet set = Set({kTime_Min + 1, kTime_Max - 1});
  EXPECT_EQ(set.Snap(0, kTolerance), std::nullopt);
  EXPECT_EQ(set.Snap(kTime_Max - 2, kTolerance), kTime_Max - 1);
}
