#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Image.h"
#include "Tests/Host/Toolkit/DrawingTestSupport.h"

namespace {

constexpr int kFar = 1 << 30;

TEST(DCFill, OpaqueRectPaintsExactlyItsPixels) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.FillRect({3, 4, 8, 10}, kTestRed);
  EXPECT_EQ(image.GetPixel(3, 4), kTestRed);
  EXPECT_EQ(image.GetPixel(7, 9), kTestRed);
  EXPECT_EQ(image.GetPixel(8, 9), kTestBackground);
  EXPECT_EQ(image.GetPixel(7, 10), kTestBackground);
  EXPECT_EQ(CountChangedInside(image, {3, 4, 8, 10}, kTestBackground), 5 * 6);
  EXPECT_EQ(CountChangedOutside(image, {3, 4, 8, 10}, kTestBackground), 0);
}

TEST(DCFill, AlphaBlendsOverTheBackground) {
  Image image = MakeCanvas({4, 4}, Color(255, 255, 255));
  DC dc(image);
  dc.FillRect({0, 0, 4, 4}, Color(0, 0, 0, 128));
  const Color c = image.GetPixel(1, 1);
  EXPECT_TRUE(NearColor(c, Color(127, 127, 127), 1)) << c.ToHex();
  dc.FillRect({0, 0, 2, 4}, Color(255, 0, 0, 0));  // fully transparent: no change
  EXPECT_EQ(image.GetPixel(0, 0), c);
}

TEST(DCFill, ClearRectReplacesAlpha) {
  Image image = MakeCanvas({4, 4}, kTestRed);
  DC dc(image);
  dc.ClearRect({0, 0, 2, 2});
  EXPECT_EQ(image.GetPixel(0, 0).a, 0);
  EXPECT_EQ(image.GetPixel(3, 3), kTestRed);
}

TEST(DCFill, FrameRectDrawsOnlyTheBorder) {
  Image image = MakeCanvas({10, 10}, kTestBackground);
  DC dc(image);
  dc.FrameRect({1, 1, 9, 9}, kTestRed);
  EXPECT_EQ(image.GetPixel(1, 1), kTestRed);
  EXPECT_EQ(image.GetPixel(8, 8), kTestRed);
  EXPECT_EQ(image.GetPixel(4, 4), kTestBackground);
  EXPECT_EQ(CountChangedInside(image, {0, 0, 10, 10}, kTestBackground), 8 * 4 - 4);
}

TEST(DCFill, TranslucentFramesOfThinRectsBlendEachPixelOnce) {
  Image image = MakeCanvas({10, 10}, Color(255, 255, 255));
  DC dc(image);
  dc.FrameRect({1, 1, 9, 2}, Color(0, 0, 0, 128), 2);  // one pixel high: top and bottom coincide
  dc.FrameRect({1, 4, 2, 9}, Color(0, 0, 0, 128), 2);  // one pixel wide
  EXPECT_TRUE(NearColor(image.GetPixel(4, 1), Color(127, 127, 127), 1));
  EXPECT_TRUE(NearColor(image.GetPixel(1, 6), Color(127, 127, 127), 1));
}

TEST(DCLine, HorizontalAndVerticalLinesEndBeforeTheirEndPoint) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.DrawLine({2, 5}, {12, 5}, kTestRed);
  EXPECT_EQ(CountChangedInside(image, {2, 5, 12, 6}, kTestBackground), 10);
  EXPECT_EQ(CountChangedOutside(image, {2, 5, 12, 6}, kTestBackground), 0);

  Image vertical = MakeCanvas({20, 20}, kTestBackground);
  DC vdc(vertical);
  vdc.DrawLine({7, 15}, {7, 3}, kTestRed);  // drawn upwards: 15 down to 4
  EXPECT_EQ(CountChangedInside(vertical, {7, 4, 8, 16}, kTestBackground), 12);
  EXPECT_EQ(CountChangedOutside(vertical, {7, 4, 8, 16}, kTestBackground), 0);
}

TEST(DCLine, WideLinesAreCentredOnTheirRow) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.DrawLine({0, 10}, {20, 10}, kTestRed, 3);
  EXPECT_EQ(CountChangedInside(image, {0, 9, 20, 12}, kTestBackground), 60);
  EXPECT_EQ(CountChangedOutside(image, {0, 9, 20, 12}, kTestBackground), 0);
}

TEST(DCLine, DiagonalLineFollowsTheDiagonal) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.DrawLine({0, 0}, {19, 19}, kTestRed);
  for (int i = 2; i < 17; ++i) {
    EXPECT_FALSE(NearColor(image.GetPixel(i, i), kTestBackground, 20)) << i;
    EXPECT_EQ(image.GetPixel(i, i + 3), kTestBackground) << i;
  }
}

TEST(DCLine, PolylineConnectsItsPoints) {
  Image image = MakeCanvas({30, 30}, kTestBackground);
  DC dc(image);
  const std::array<Point, 3> points = {Point{2, 2}, Point{20, 2}, Point{20, 25}};
  dc.Polyline(points, kTestGreen, 1.0);
  EXPECT_TRUE(NearColor(image.GetPixel(10, 2), kTestGreen, 2));
  EXPECT_TRUE(NearColor(image.GetPixel(20, 15), kTestGreen, 2));
  EXPECT_EQ(image.GetPixel(10, 15), kTestBackground);
  Image single = MakeCanvas({30, 30}, kTestBackground);
  DC singleDC(single);
  singleDC.Polyline(std::span<const Point>(points.data(), 1), kTestRed);  // one point: nothing
  EXPECT_EQ(CountChangedInside(single, {0, 0, 30, 30}, kTestBackground), 0);
}

TEST(DCShapes, CircleFillCoversItsDiscOnly) {
  Image image = MakeCanvas({40, 40}, kTestBackground);
  DC dc(image);
  dc.DrawCircleFill({20, 20}, 6, kTestRed);
  EXPECT_EQ(image.GetPixel(20, 20), kTestRed);
  EXPECT_EQ(image.GetPixel(24, 20), kTestRed);
  EXPECT_EQ(image.GetPixel(28, 20), kTestBackground);
  EXPECT_EQ(image.GetPixel(25, 25), kTestBackground);  // outside the disc, inside its box
  // Symmetric around the centre pixel.
  EXPECT_EQ(image.GetPixel(14, 20), image.GetPixel(26, 20));
  dc.DrawCircleFill({5, 5}, 0, kTestGreen);
  EXPECT_EQ(image.GetPixel(5, 5), kTestBackground);
}

TEST(DCShapes, PolygonFillsItsInside) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  const std::array<Point, 3> triangle = {Point{0, 0}, Point{20, 0}, Point{0, 20}};
  dc.FillPolygon(triangle, kTestRed);
  EXPECT_EQ(image.GetPixel(3, 3), kTestRed);
  EXPECT_EQ(image.GetPixel(16, 16), kTestBackground);
}

TEST(DCClip, PixelsOutsideTheClipStayUntouched) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.PushClip({5, 5, 10, 12});
  EXPECT_EQ(dc.GetClipBox(), (Rect{5, 5, 10, 12}));
  dc.FillRect({0, 0, 20, 20}, kTestRed);
  dc.DrawLine({0, 6}, {20, 6}, kTestGreen);
  dc.DrawCircleFill({10, 10}, 9, kTestGreen);
  dc.DrawText("Clipped text", {0, 0, 20, 20}, Font(), kTestGreen);
  EXPECT_EQ(CountChangedOutside(image, {5, 5, 10, 12}, kTestBackground), 0);
  EXPECT_EQ(CountChangedInside(image, {5, 5, 10, 12}, kTestBackground), 35);
  dc.PopClip();
  dc.FillRect({0, 0, 1, 1}, kTestRed);
  EXPECT_EQ(image.GetPixel(0, 0), kTestRed);
}

TEST(DCClip, NestedClipsIntersectAndPopInOrder) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.PushClip({0, 0, 10, 10});
  dc.PushClip({5, 5, 15, 15});
  EXPECT_EQ(dc.GetClipBox(), (Rect{5, 5, 10, 10}));
  dc.PushClip({12, 12, 14, 14});  // disjoint: nothing visible
  EXPECT_TRUE(dc.GetClipBox().IsEmpty());
  dc.FillRect({0, 0, 20, 20}, kTestRed);
  EXPECT_EQ(CountChangedInside(image, {0, 0, 20, 20}, kTestBackground), 0);
  dc.PopClip();
  dc.PopClip();
  EXPECT_EQ(dc.GetClipBox(), (Rect{0, 0, 10, 10}));
}

TEST(DCClip, UnmatchedPopIsReportedAndIgnored) {
  MessagingTestScope scope;
  Image image = MakeCanvas({8, 8}, kTestBackground);
  DC dc(image);
  dc.PopClip();
  EXPECT_EQ(dc.GetClipBox(), (Rect{0, 0, 8, 8}));
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "PopClip without PushClip");
}

TEST(DCOrigin, ChildViewsPaintInTheirOwnCoordinates) {
  Image image = MakeCanvas({30, 30}, kTestBackground);
  DC dc(image);
  {
    DC::ScopedState child(dc);
    dc.OffsetOrigin(10, 12);
    dc.PushClip({0, 0, 5, 5});  // the child's bounds, in its coordinates
    EXPECT_EQ(dc.GetClipBox(), (Rect{0, 0, 5, 5}));
    dc.FillRect({-100, -100, 100, 100}, kTestRed);
  }
  EXPECT_EQ(dc.GetOrigin(), (Point{0, 0}));
  EXPECT_EQ(dc.GetClipBox(), (Rect{0, 0, 30, 30}));
  EXPECT_EQ(CountChangedInside(image, {10, 12, 15, 17}, kTestBackground), 25);
  EXPECT_EQ(CountChangedOutside(image, {10, 12, 15, 17}, kTestBackground), 0);
}

TEST(DCFarCoordinates, HugeRectsAndLinesDrawOnlyTheirVisiblePart) {
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.FillRect({kFar, kFar, kFar + 10, kFar + 10}, kTestRed);
  dc.FillRect({-kFar, -kFar, -kFar + 10, 5}, kTestRed);
  EXPECT_EQ(CountChangedInside(image, {0, 0, 20, 20}, kTestBackground), 0);

  dc.FillRect({-kFar, 3, kFar, 4}, kTestRed);
  EXPECT_EQ(CountChangedInside(image, {0, 3, 20, 4}, kTestBackground), 20);
  EXPECT_EQ(CountChangedOutside(image, {0, 3, 20, 4}, kTestBackground), 0);

  dc.DrawLine({5, -kFar}, {5, kFar}, kTestGreen);
  EXPECT_EQ(image.GetPixel(5, 0), kTestGreen);
  EXPECT_EQ(image.GetPixel(5, 19), kTestGreen);
  EXPECT_EQ(image.GetPixel(6, 10), kTestBackground);
}

TEST(DCFarCoordinates, HugeDiagonalsPolylinesAndCirclesKeepTheirGeometry) {
  Image image = MakeCanvas({40, 40}, kTestBackground);
  DC dc(image);
  dc.DrawLine({-kFar, -kFar}, {kFar, kFar}, kTestRed);
  EXPECT_FALSE(NearColor(image.GetPixel(20, 20), kTestBackground, 20));
  EXPECT_EQ(image.GetPixel(20, 30), kTestBackground);

  const std::array<Point, 4> points = {Point{-kFar, 10}, Point{30, 10}, Point{30, kFar},
                                       Point{kFar, -kFar}};
  dc.Polyline(points, kTestGreen);
  EXPECT_TRUE(NearColor(image.GetPixel(2, 10), kTestGreen, 2));
  EXPECT_TRUE(NearColor(image.GetPixel(30, 35), kTestGreen, 2));

  Image circles = MakeCanvas({40, 40}, kTestBackground);
  DC cdc(circles);
  cdc.DrawCircleFill({kFar, kFar}, 10, kTestRed);  // far away
  EXPECT_EQ(CountChangedInside(circles, {0, 0, 40, 40}, kTestBackground), 0);
  cdc.DrawCircleFill({20, kFar}, kFar - 20, kTestRed);  // an enormous disc whose top is at y 20
  EXPECT_EQ(circles.GetPixel(20, 10), kTestBackground);
  EXPECT_EQ(circles.GetPixel(20, 30), kTestRed);
  EXPECT_EQ(circles.GetPixel(0, 30), kTestRed);
  cdc.DrawCircleFill({20, 20}, kFar, kTestGreen);  // covers everything
  EXPECT_EQ(CountChangedInside(circles, {0, 0, 40, 40}, kTestGreen), 0);
  cdc.DrawCircle({kFar, 20}, kFar - 10, kTestRed);  // outline through x 10
  EXPECT_FALSE(NearColor(circles.GetPixel(10, 20), kTestGreen, 20));
  EXPECT_EQ(circles.GetPixel(30, 20), kTestGreen);
}

TEST(DCFarCoordinates, FarTextImagesAndOriginsDrawNothing) {
  Image image = MakeCanvas({40, 40}, kTestBackground);
  DC dc(image);
  const Font font;
  dc.DrawText("far away", {kFar, kFar, kFar + 100, kFar + 20}, font, kTestRed);
  dc.DrawText("far away", {-kFar, 0, -kFar + 200, 20}, font, kTestRed);
  dc.DrawTextAt("far away", {-kFar, -kFar}, font, kTestRed);
  dc.DrawBitmap(*Bitmap::GetBitmap(kPlayNormalDecal), {kFar, 0});
  dc.DrawImage(Bitmap::GetBitmap(kPlayNormalDecal)->GetImage(1.0), Rect{-kFar, 0, -kFar + 16, 16});
  dc.SetOrigin({kFar, kFar});
  dc.FillRect({kFar, kFar, kFar + 5, kFar + 5}, kTestRed);  // sums beyond int: no overflow
  dc.PushClip({kFar, kFar, kFar, kFar});
  dc.PopClip();
  EXPECT_EQ(CountChangedInside(image, {0, 0, 40, 40}, kTestBackground), 0);
  // A rect spanning everything still centres its text in the visible middle.
  dc.SetOrigin({0, 0});
  dc.DrawText("centre", {-kFar, 10, kFar, 30}, font, kTestRed, TextAlign::kCenter);
  const int half = font.StringWidth("centre") / 2;
  EXPECT_GT(CountChangedInside(image, {0, 10, half + 1, 30}, kTestBackground), 0);
  EXPECT_EQ(CountChangedOutside(image, {0, 10, half + 2, 30}, kTestBackground), 0);
}

TEST(DCText, TextDrawsInsideItsRectOnly) {
  Image image = MakeCanvas({120, 40}, kTestBackground);
  DC dc(image);
  const Rect rect{10, 10, 110, 30};
  dc.DrawText("Opacity", rect, Font(), Color(230, 230, 230));
  EXPECT_GT(CountChangedInside(image, rect, kTestBackground), 20);
  EXPECT_EQ(CountChangedOutside(image, rect, kTestBackground), 0);
}

TEST(DCText, AlignmentMovesTheInk) {
  auto inkLeft = [](TextAlign align) {
    Image image = MakeCanvas({200, 20}, kTestBackground);
    DC dc(image);
    dc.DrawText("Scale", {0, 0, 200, 20}, Font(), Color(255, 255, 255), align);
    for (int x = 0; x < 200; ++x) {
      for (int y = 0; y < 20; ++y) {
        if (!NearColor(image.GetPixel(x, y), kTestBackground, 0))
          return x;
      }
    }
    return -1;
  };
  const int left = inkLeft(TextAlign::kLeft);
  const int centre = inkLeft(TextAlign::kCenter);
  const int right = inkLeft(TextAlign::kRight);
  const int width = Font().StringWidth("Scale");
  EXPECT_LE(left, 2);
  EXPECT_NEAR(centre, (200 - width) / 2, 3);
  EXPECT_NEAR(right, 200 - width, 3);
}

TEST(DCText, LongTextIsEllipsizedWithinItsRect) {
  Image image = MakeCanvas({80, 20}, kTestBackground);
  DC dc(image);
  const Font font;
  const std::string text = "A very long effect name that cannot fit";
  const auto layout = font.GetLayout(text, 60);
  EXPECT_LT(font.StringWidth(text), 1000);
  dc.DrawText(text, {0, 0, 60, 20}, font, Color(255, 255, 255));
  EXPECT_EQ(CountChangedOutside(image, {0, 0, 60, 20}, kTestBackground), 0);
  // The ellipsis ends the text before the rect's right edge: the last columns carry ink of "…".
  EXPECT_GT(CountChangedInside(image, {40, 0, 60, 20}, kTestBackground), 0);
}

TEST(DCText, VerticalCentringUsesTheFontHeight) {
  Image image = MakeCanvas({60, 60}, kTestBackground);
  DC dc(image);
  dc.DrawText("Hg", {0, 0, 60, 60}, Font(), Color(255, 255, 255), TextAlign::kLeft,
              TextVAlign::kCenter);
  EXPECT_EQ(CountChangedInside(image, {0, 0, 60, 18}, kTestBackground), 0);
  EXPECT_EQ(CountChangedInside(image, {0, 42, 60, 60}, kTestBackground), 0);
  EXPECT_GT(CountChangedInside(image, {0, 18, 60, 42}, kTestBackground), 0);
}

TEST(DCScale, ScaleTwoDrawsTheSamePictureAtTwiceThePixels) {
  auto scene = [](DC& dc) {
    dc.FillRect({0, 0, 40, 30}, Color(40, 40, 40));
    dc.FillRect({3, 4, 20, 9}, kTestRed);
    dc.DrawLine({0, 20}, {40, 20}, kTestGreen);
    dc.DrawCircleFill({30, 10}, 5, Color(200, 200, 50));
  };
  Image one = MakeCanvas({40, 30}, kTestBackground, 1.0);
  Image two = MakeCanvas({40, 30}, kTestBackground, 2.0);
  ASSERT_EQ(two.GetPixelSize(), (Size{80, 60}));
  EXPECT_EQ(two.GetLogicalSize(), (Size{40, 30}));
  DC dcOne(one);
  DC dcTwo(two);
  EXPECT_EQ(dcTwo.GetBounds(), (Rect{0, 0, 40, 30}));
  scene(dcOne);
  scene(dcTwo);
  // Exact-pixel shapes: each logical pixel is a 2 x 2 block of the same colour.
  EXPECT_EQ(two.GetPixel(6, 8), kTestRed);
  EXPECT_EQ(two.GetPixel(39, 17), kTestRed);
  EXPECT_EQ(two.GetPixel(40, 17), Color(40, 40, 40));
  EXPECT_EQ(two.GetPixel(10, 40), kTestGreen);
  EXPECT_EQ(two.GetPixel(10, 41), kTestGreen);
  EXPECT_EQ(two.GetPixel(10, 42), Color(40, 40, 40));
  // Away from the antialiased circle edge the two pictures agree pixel for pixel.
  const Rect circleBox{24, 4, 37, 17};
  int differing = 0;
  for (int y = 0; y < 30; ++y) {
    for (int x = 0; x < 40; ++x) {
      if (circleBox.Contains({x, y}))
        continue;
      if (one.GetPixel(x, y) != two.GetPixel(2 * x, 2 * y) ||
          one.GetPixel(x, y) != two.GetPixel(2 * x + 1, 2 * y + 1)) {
        ++differing;
      }
    }
  }
  EXPECT_EQ(differing, 0);
  EXPECT_EQ(two.GetPixel(60, 20), one.GetPixel(30, 10));  // the circle's centre
}

TEST(DCScale, TextHasTheSameLogicalExtentAtScaleTwo) {
  Image one = MakeCanvas({100, 20}, kTestBackground, 1.0);
  Image two = MakeCanvas({100, 20}, kTestBackground, 2.0);
  DC dcOne(one);
  DC dcTwo(two);
  dcOne.DrawText("Position", {0, 0, 100, 20}, Font(), Color(255, 255, 255));
  dcTwo.DrawText("Position", {0, 0, 100, 20}, Font(), Color(255, 255, 255));
  auto rightmostInk = [](const Image& image) {
    int right = -1;
    CountPixels(image, [&](int x, int, Color c) {
      if (!NearColor(c, kTestBackground, 0))
        right = std::max(right, x);
      return false;
    });
    return right;
  };
  EXPECT_NEAR(rightmostInk(two) / 2.0, rightmostInk(one), 1.5);
}

TEST(DCBitBlt, CopiesFromAnotherDCAtItsOrigin) {
  Image source = MakeCanvas({20, 20}, kTestBackground);
  DC sourceDC(source);
  sourceDC.FillRect({10, 10, 14, 14}, kTestRed);
  sourceDC.SetOrigin({10, 10});
  Image target = MakeCanvas({20, 20}, Color(0, 0, 0));
  DC targetDC(target);
  targetDC.BitBlt({2, 2, 6, 6}, sourceDC, {0, 0});
  EXPECT_EQ(CountChangedInside(target, {2, 2, 6, 6}, kTestRed), 0);
  EXPECT_EQ(CountChangedOutside(target, {2, 2, 6, 6}, Color(0, 0, 0)), 0);
}

TEST(DCBitBlt, ReplacesPixelsIncludingAlphaAndCopiesOnlyWhatTheSourceHas) {
  Image source = MakeCanvas({4, 4}, Color(255, 0, 0, 0));
  Image target = MakeCanvas({10, 10}, kTestGreen);
  DC dc(target);
  dc.BitBlt({0, 0, 10, 10}, source, {-2, -2});  // source covers target (2..6, 2..6)
  EXPECT_EQ(target.GetPixel(3, 3).a, 0);
  EXPECT_EQ(target.GetPixel(0, 0), kTestGreen);
  EXPECT_EQ(target.GetPixel(6, 6), kTestGreen);
  dc.BitBlt({0, 0, 10, 10}, source, {-kFar, kFar});
  EXPECT_EQ(target.GetPixel(0, 0), kTestGreen);
}

TEST(DCBitBlt, OverlappingCopyOntoItselfScrollsCorrectly) {
  Image image = MakeCanvas({10, 1}, kTestBackground);
  DC dc(image);
  for (int x = 0; x < 10; ++x)
    dc.FillRect({x, 0, x + 1, 1}, Color(static_cast<std::uint8_t>(x * 20), 0, 0));
  dc.BitBlt({2, 0, 10, 1}, dc, {0, 0});  // shift right by two
  for (int x = 2; x < 10; ++x)
    EXPECT_EQ(image.GetPixel(x, 0).r, (x - 2) * 20) << x;
}

TEST(DCImages, BitmapsDrawAtTheirPositionAndScale) {
  Image image = MakeCanvas({32, 32}, kTestBackground, 2.0);
  DC dc(image);
  const auto bitmap = Bitmap::GetBitmap(kStopNormalDecal);
  dc.DrawBitmap(*bitmap, {4, 4});
  EXPECT_GT(CountChangedInside(image, {8, 8, 40, 40}, kTestBackground), 100);
  EXPECT_EQ(CountChangedOutside(image, {8, 8, 40, 40}, kTestBackground), 0);
}

TEST(DCImages, StretchedImagesFillTheirRect) {
  Image small = MakeCanvas({2, 2}, kTestRed);
  Image image = MakeCanvas({20, 20}, kTestBackground);
  DC dc(image);
  dc.DrawImage(small, Rect{0, 0, 4, 4}, std::numeric_limits<double>::quiet_NaN());
  dc.DrawImage(small, Point{0, 0}, -1.0);
  EXPECT_EQ(image.GetPixel(0, 0), kTestBackground);
  dc.DrawImage(small, Rect{5, 5, 15, 15});
  EXPECT_EQ(image.GetPixel(5, 5), kTestRed);
  EXPECT_EQ(image.GetPixel(14, 14), kTestRed);
  EXPECT_EQ(CountChangedOutside(image, {5, 5, 15, 15}, kTestBackground), 0);
}

TEST(DCEmpty, DrawingIntoAnEmptyImageDoesNothing) {
  Image empty;
  DC dc(empty);
  dc.FillRect({0, 0, 10, 10}, kTestRed);
  dc.DrawText("x", {0, 0, 10, 10}, Font(), kTestRed);
  dc.DrawCircleFill({0, 0}, 4, kTestRed);
  EXPECT_TRUE(dc.GetClipBox().IsEmpty());
}

}  // namespace
