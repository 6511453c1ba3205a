#include <gtest/gtest.h>

#include "Host/Time/TimeRange.h"

namespace {

TEST(TimeRange, HoldsItsStartButNotItsEnd) {
  const TimeRange range{10, 20};
  EXPECT_FALSE(range.Contains(9));
  EXPECT_TRUE(range.Contains(10));
  EXPECT_TRUE(range.Contains(19));
  EXPECT_FALSE(range.Contains(20));
  EXPECT_EQ(range.Duration(), 10);
}

TEST(TimeRange, AnEmptyOrInvertedRangeHoldsNothing) {
  EXPECT_FALSE((TimeRange{5, 5}).Contains(5));
  EXPECT_EQ((TimeRange{5, 5}).Duration(), 0);
  const TimeRange inverted{20, 10};
  EXPECT_FALSE(inverted.Contains(10));
  EXPECT_FALSE(inverted.Contains(15));
  EXPECT_EQ(inverted.Duration(), -10);
}

TEST(TimeRange, SpansUpToTheSentinelsMeasureWithoutOverflow) {
  const TimeRange all{kTime_Min, kTime_Max};
  EXPECT_EQ(all.Duration(), 2 * kTime_Max);
  EXPECT_TRUE(all.Contains(kTime_Min));
  EXPECT_TRUE(all.Contains(kTime_Max - 1));
  EXPECT_FALSE(all.Contains(kTime_Max));
}

}  // namespace
