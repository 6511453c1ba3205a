#include <gtest/gtest.h>

#include <string>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/Decals.h"
#include "Tests/Host/Toolkit/DrawingTestSupport.h"

namespace {

int InkedPixels(const Image& image) {
  return CountPixels(image, [](int, int, Color c) { return c.a > 0; });
}

bool SamePixels(const Image& a, const Image& b) {
  if (a.GetPixelSize() != b.GetPixelSize())
    return false;
  return CountPixels(a, [&](int x, int y, Color c) { return c != b.GetPixel(x, y); }) == 0;
}

Decal KeyframeDecal(int kind, int variant) {
  return static_cast<Decal>(kFirstKeyframeDecal + kind * kKeyframeDecalVariants + variant);
}

TEST(Decals, NamesMapBackToTheirDecals) {
  for (int i = 0; i < kDecalCount; ++i) {
    const auto decal = static_cast<Decal>(i);
    const std::string_view name = GetDecalName(decal);
    ASSERT_TRUE(name.starts_with("k") && name.ends_with("Decal")) << i;
    EXPECT_EQ(FindDecalByName(name), decal) << name;
  }
  EXPECT_EQ(FindDecalByName("kNoSuchDecal"), std::nullopt);
  EXPECT_EQ(GetDecalName(static_cast<Decal>(-1)), "");
  EXPECT_EQ(GetDecalSize(kDecalCount), (Size{}));
}

TEST(Decals, KeyframeGlyphsFollowTheKindTimesSixPlusVariantRule) {
  EXPECT_EQ(GetDecalName(KeyframeDecal(1, 4)), "kEffectControlsKeyBezierFirstSelectedDecal");
  EXPECT_EQ(KeyframeDecal(1, 4) - kFirstKeyframeDecal, 10);
  EXPECT_EQ(GetDecalName(KeyframeDecal(5, 5)), "kEffectControlsKeyEaseOutLastSelectedDecal");
  EXPECT_EQ(kEffectControlsKeyTRDualControlPointNormalDecal - kFirstKeyframeDecal, 36);
  EXPECT_EQ(kEffectControlsKeyTRDualHoldLeftSelectedDecal - kFirstKeyframeDecal, 47);
  EXPECT_EQ(GetDecalSize(kEffectControlsKeyLinearNormalDecal), (Size{16, 16}));
  EXPECT_EQ(GetDecalSize(kEffectControlsSampleADecal), (Size{160, 120}));
}

TEST(Decals, EveryDecalRendersAVisiblePictureAtEveryScale) {
  for (int i = 0; i < kDecalCount; ++i) {
    const auto decal = static_cast<Decal>(i);
    const auto bitmap = Bitmap::GetBitmap(decal);
    ASSERT_NE(bitmap, nullptr);
    EXPECT_EQ(bitmap->GetSize(), GetDecalSize(decal));
    for (double scale : {1.0, 2.0}) {
      const Image& image = bitmap->GetImage(scale);
      ASSERT_FALSE(image.IsEmpty()) << GetDecalName(decal);
      EXPECT_EQ(image.GetLogicalSize(), GetDecalSize(decal)) << GetDecalName(decal);
      const int area = image.GetPixelSize().width * image.GetPixelSize().height;
      const int inked = InkedPixels(image);
      EXPECT_GT(inked, area / 50) << GetDecalName(decal) << " at " << scale;
      // The missing-glyph placeholder is a solid magenta square.
      EXPECT_NE(image.GetPixel(0, 0), ColorManager::kFallbackColor) << GetDecalName(decal);
    }
  }
}

TEST(Decals, SelectedKeyframesDifferFromNormalOnes) {
  for (int kind = 0; kind < kKeyframeDecalKinds; ++kind) {
    for (int part = 0; part < 3; ++part) {
      const Image& normal = Bitmap::GetBitmap(KeyframeDecal(kind, part))->GetImage(1.0);
      const Image& selected = Bitmap::GetBitmap(KeyframeDecal(kind, part + 3))->GetImage(1.0);
      EXPECT_FALSE(SamePixels(normal, selected)) << kind << "/" << part;
      // Selected glyphs are filled with the accent blue.
      const int blue =
          CountPixels(selected, [](int, int, Color c) { return c.a == 255 && c.b > c.r + 60; });
      EXPECT_GE(blue, 8) << kind << "/" << part;
      EXPECT_EQ(CountPixels(normal, [](int, int, Color c) { return c.a == 255 && c.b > c.r + 60; }),
                0);
    }
  }
  for (int i = kEffectControlsKeyTRDualControlPointNormalDecal;
       i <= kEffectControlsKeyTRDualHoldLeftSelectedDecal; i += 2) {
    EXPECT_FALSE(SamePixels(Bitmap::GetBitmap(static_cast<Decal>(i))->GetImage(1.0),
                            Bitmap::GetBitmap(static_cast<Decal>(i + 1))->GetImage(1.0)))
        << GetDecalName(static_cast<Decal>(i));
  }
}

TEST(Decals, FirstAndLastKeyframesAreHalfGlyphs) {
  for (int kind = 0; kind < kKeyframeDecalKinds; ++kind) {
    const Image& whole = Bitmap::GetBitmap(KeyframeDecal(kind, 0))->GetImage(1.0);
    const Image& first = Bitmap::GetBitmap(KeyframeDecal(kind, 1))->GetImage(1.0);
    const Image& last = Bitmap::GetBitmap(KeyframeDecal(kind, 2))->GetImage(1.0);
    // The glyph's centre is pixel column 7: a first keyframe shows only what lies right of it.
    auto inkLeftOf = [](const Image& image, int column) {
      return CountPixels(image, [&](int x, int, Color c) { return x < column && c.a > 0; });
    };
    auto inkRightOf = [](const Image& image, int column) {
      return CountPixels(image, [&](int x, int, Color c) { return x > column && c.a > 0; });
    };
    EXPECT_EQ(inkLeftOf(first, 7), 0) << kind;
    EXPECT_GT(inkRightOf(first, 7), 5) << kind;
    EXPECT_EQ(inkRightOf(last, 8), 0) << kind;
    EXPECT_GT(inkLeftOf(last, 7), 5) << kind;
    EXPECT_GT(InkedPixels(whole), InkedPixels(first)) << kind;
  }
}

TEST(Decals, KindsLookDifferent) {
  for (int a = 0; a < kKeyframeDecalKinds; ++a) {
    for (int b = a + 1; b < kKeyframeDecalKinds; ++b) {
      EXPECT_FALSE(SamePixels(Bitmap::GetBitmap(KeyframeDecal(a, 0))->GetImage(1.0),
                              Bitmap::GetBitmap(KeyframeDecal(b, 0))->GetImage(1.0)))
          << a << " vs " << b;
    }
  }
  EXPECT_FALSE(SamePixels(Bitmap::GetBitmap(kChevronUpNormalDecal)->GetImage(1.0),
                          Bitmap::GetBitmap(kChevronDownNormalDecal)->GetImage(1.0)));
  EXPECT_FALSE(SamePixels(Bitmap::GetBitmap(kEffectControlsOnToggleNormalDecal)->GetImage(1.0),
                          Bitmap::GetBitmap(kEffectControlsOffToggleNormalDecal)->GetImage(1.0)));
  EXPECT_FALSE(SamePixels(Bitmap::GetBitmap(kStopwatchOnDecal)->GetImage(1.0),
                          Bitmap::GetBitmap(kStopwatchOffDecal)->GetImage(1.0)));
}

TEST(BitmapCache, BitmapsAreSharedAndDrawnOncePerScale) {
  const auto a = Bitmap::GetBitmap(kEffectControlsResetNormalDecal);
  EXPECT_EQ(a, Bitmap::GetBitmap(kEffectControlsResetNormalDecal));
  a->GetImage(1.0);
  a->GetImage(2.0);
  const auto renders = Bitmap::GlyphRenderCount();
  const Image* one = &a->GetImage(1.0);
  a->GetImage(2.0);
  EXPECT_EQ(Bitmap::GlyphRenderCount(), renders);
  EXPECT_EQ(one, &a->GetImage(1.0));
  a->GetImage(1.5);
  EXPECT_EQ(Bitmap::GlyphRenderCount(), renders + 1);
}

TEST(BitmapCache, ThemeChangesRedrawTheGlyphs) {
  ColorManager::ResetForTesting();
  const auto bitmap = Bitmap::GetBitmap(kEffectControlsKeyLinearNormalDecal);
  const Image dark = bitmap->GetImage(1.0).Clone();
  ColorManager::SetTheme(ColorTheme::kLight);
  const Image& light = bitmap->GetImage(1.0);
  EXPECT_FALSE(SamePixels(dark, light));
  ColorManager::SetTheme(ColorTheme::kDark);
  EXPECT_TRUE(SamePixels(dark, bitmap->GetImage(1.0)));
}

TEST(BitmapCache, ImagesMakeBitmapsOfTheirOwnSize) {
  Image image = MakeCanvas({6, 4}, kTestRed, 2.0);
  const auto bitmap = Bitmap::FromImage(std::move(image));
  EXPECT_EQ(bitmap->GetSize(), (Size{6, 4}));
  EXPECT_EQ(bitmap->GetDecal(), std::nullopt);
  EXPECT_EQ(bitmap->GetImage(1.0).GetPixel(0, 0), kTestRed);
}

TEST(BitmapCache, AnUnknownDecalGivesAPlaceholderAndIsReported) {
  MessagingTestScope scope;
  const auto bitmap = Bitmap::GetBitmap(static_cast<Decal>(kDecalCount + 5));
  ASSERT_NE(bitmap, nullptr);
  EXPECT_EQ(bitmap->GetImage(1.0).GetPixel(3, 3), ColorManager::kFallbackColor);
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "Unknown decal");
}

}  // namespace
