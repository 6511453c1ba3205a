#include <gtest/gtest.h>

#include "Host/Toolkit/Region.h"

namespace {

TEST(Region, KeepsSeparateAreasApartAndIgnoresEmptyOnes) {
  Region region;
  region.Add(Rect{0, 0, 10, 10});
  region.Add(Rect{20, 0, 30, 10});
  region.Add(Rect{5, 5, 5, 50});
  EXPECT_EQ(region.Rects(), (std::vector<Rect>{{0, 0, 10, 10}, {20, 0, 30, 10}}));
  EXPECT_TRUE(region.Contains({25, 5}));
  EXPECT_FALSE(region.Contains({15, 5}));
  EXPECT_EQ(region.Bounds(), (Rect{0, 0, 30, 10}));
}

TEST(Region, MergesOverlapsUntilNoRectsOverlap) {
  Region region;
  region.Add(Rect{0, 0, 10, 10});
  region.Add(Rect{20, 0, 30, 10});
  region.Add(Rect{8, 8, 22, 12});  // bridges both
  EXPECT_EQ(region.Rects(), (std::vector<Rect>{{0, 0, 30, 12}}));
  region.Add(Rect{1, 1, 3, 3});  // already covered
  EXPECT_EQ(region.Rects().size(), 1u);
}

TEST(Region, NeverCoversLessThanWasAdded) {
  Region region;
  for (int i = 0; i < 20; ++i) {
    region.Add(Rect::FromSize(i * 10, i * 10, 5, 5));
  }
  EXPECT_LE(region.Rects().size(), Region::kMaxRects);
  for (int i = 0; i < 20; ++i) {
    EXPECT_TRUE(region.Contains({i * 10 + 4, i * 10 + 4}));
  }
}

TEST(Region, IntersectsAndOffsets) {
  Region region(Rect{0, 0, 10, 10});
  region.Add(Rect{50, 50, 60, 60});
  region.IntersectWith(Rect{5, 5, 55, 55});
  EXPECT_EQ(region.Rects(), (std::vector<Rect>{{5, 5, 10, 10}, {50, 50, 55, 55}}));
  region.Offset(-5, 1);
  EXPECT_EQ(region.Rects()[0], (Rect{0, 6, 5, 11}));
  region.IntersectWith(Rect{100, 100, 110, 110});
  EXPECT_TRUE(region.IsEmpty());
}

}  // namespace
