#include <gtest/gtest.h>

#include <climits>

#include "Host/Toolkit/Geometry.h"

namespace {

TEST(Rect, ExtentsBeyondAnIntSaturateInsteadOfWrapping) {
  const Rect farApart{INT_MIN + 10, -5, INT_MAX - 10, 5};
  EXPECT_EQ(farApart.Width(), INT_MAX);
  EXPECT_EQ(farApart.Height(), 10);
  EXPECT_FALSE(farApart.IsEmpty());
  const Rect inverted{INT_MAX, INT_MAX, INT_MIN, INT_MIN};
  EXPECT_EQ(inverted.Width(), INT_MIN);
  EXPECT_TRUE(inverted.IsEmpty());
}

TEST(Rect, TheCentreOfAHugeRectLiesInsideIt) {
  const Rect huge{INT_MIN, INT_MIN, INT_MAX, INT_MAX};
  EXPECT_EQ(huge.Center(), (Point{0, 0}));
  EXPECT_TRUE(huge.Contains(huge.Center()));
  EXPECT_EQ((Rect{10, 20, 31, 41}.Center()), (Point{20, 30}));
}

}  // namespace
