#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/ImageList.h"
#include "Tests/Host/Toolkit/DrawingTestSupport.h"

namespace {

TEST(ImageList, KeepsTheOrderOfAddition) {
  ImageList list;
  EXPECT_EQ(list.Add(kPlayNormalDecal), 0);
  EXPECT_EQ(list.Add(Bitmap::GetBitmap(kStopNormalDecal)), 1);
  EXPECT_EQ(list.Add(kEffectControlsSampleADecal), 2);
  EXPECT_EQ(list.GetCount(), 3);
  EXPECT_EQ(list.GetBitmap(1), Bitmap::GetBitmap(kStopNormalDecal));
  EXPECT_EQ(list.GetImageSize(2), (Size{160, 120}));
  EXPECT_EQ(list.GetBitmap(3), nullptr);
  EXPECT_EQ(list.GetImageSize(-1), (Size{}));
  list.Clear();
  EXPECT_EQ(list.GetCount(), 0);
}

TEST(ImageList, TheKeyframeListFindsEachGlyphByKindAndVariant) {
  ImageList list;
  for (int i = 0; i < 48; ++i)
    list.Add(static_cast<Decal>(kFirstKeyframeDecal + i));
  EXPECT_EQ(list.GetBitmap(10)->GetDecal(), kEffectControlsKeyBezierFirstSelectedDecal);
  EXPECT_EQ(list.GetBitmap(0)->GetDecal(), kEffectControlsKeyLinearNormalDecal);
  EXPECT_EQ(list.GetBitmap(36)->GetDecal(), kEffectControlsKeyTRDualControlPointNormalDecal);
  EXPECT_EQ(list.GetBitmap(47)->GetDecal(), kEffectControlsKeyTRDualHoldLeftSelectedDecal);
}

TEST(ImageList, DrawsTheChosenImageAtItsPoint) {
  ImageList list;
  list.Add(kPlayNormalDecal);
  list.Add(kStopNormalDecal);
  Image viaList = MakeCanvas({40, 40}, kTestBackground);
  Image direct = MakeCanvas({40, 40}, kTestBackground);
  {
    DC dc(viaList);
    dc.OffsetOrigin(5, 5);
    list.Draw(dc, 1, {10, 12});
    DC other(direct);
    other.DrawBitmap(*Bitmap::GetBitmap(kStopNormalDecal), {15, 17});
  }
  EXPECT_GT(CountChangedInside(viaList, Rect::FromSize(15, 17, 16, 16), kTestBackground), 30);
  EXPECT_EQ(CountChangedOutside(viaList, Rect::FromSize(15, 17, 16, 16), kTestBackground), 0);
  EXPECT_EQ(CountPixels(viaList, [&](int x, int y, Color c) { return c != direct.GetPixel(x, y); }),
            0);
}

TEST(ImageList, OutOfRangeIndicesDrawNothingAndAreReported) {
  MessagingTestScope scope;
  ImageList list;
  list.Add(kPlayNormalDecal);
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  list.Draw(dc, 1, {0, 0});
  dc.DrawImageListImage(list, -1, {0, 0});
  EXPECT_EQ(CountChangedInside(image, {0, 0, 20, 20}, kTestBackground), 0);
  ASSERT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "Image list index out of range");
  EXPECT_EQ(list.Add(std::shared_ptr<const Bitmap>()), -1);
  EXPECT_EQ(list.GetCount(), 1);
}

}  // namespace
