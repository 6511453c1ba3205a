#include <gtest/gtest.h>

#include <string>

#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/TextLayout.h"

namespace {

TEST(FontMetrics, WidthGrowsWithTheText) {
  const Font font;
  EXPECT_EQ(font.StringWidth(""), 0);
  const int one = font.StringWidth("W");
  const int word = font.StringWidth("Wide");
  const int words = font.StringWidth("Wide words");
  EXPECT_GT(one, 0);
  EXPECT_GT(word, one);
  EXPECT_GT(words, word);
  EXPECT_EQ(font.MeasureString("Wide").width, word);
}

TEST(FontMetrics, HeightAscentAndDescentAreConsistent) {
  for (FontID id : {kFont_Normal, kFont_Bold, kFont_Small, kFont_SmallBold, kFont_Label,
                    kFont_Title, kFont_Timecode}) {
    const Font font(id);
    EXPECT_GT(font.GetAscent(), 0) << id;
    EXPECT_GT(font.GetDescent(), 0) << id;
    EXPECT_EQ(font.GetAscent() + font.GetDescent(), font.GetHeight()) << id;
    EXPECT_GE(font.GetHeight(), font.GetPixelSize()) << id;
  }
  // A list row is 21 pixels: the normal font must fit its 17-pixel label rect.
  EXPECT_LE(Font(kFont_Normal).GetHeight(), 17);
  EXPECT_GT(Font(kFont_Title).GetHeight(), Font(kFont_Small).GetHeight());
}

TEST(FontMetrics, BoldIsWiderAndTimecodeIsMonospaced) {
  EXPECT_GT(Font(kFont_Bold).StringWidth("Position"), Font(kFont_Normal).StringWidth("Position"));
  EXPECT_TRUE(Font(kFont_Bold).IsBold());
  EXPECT_FALSE(Font(kFont_Normal).IsBold());
  const Font timecode(kFont_Timecode);
  EXPECT_EQ(timecode.StringWidth("11111111"), timecode.StringWidth("00:00:00"));
}

TEST(FontMetrics, CustomFontsAreSharedAndClamped) {
  const Font a(12.0, false);
  const Font b(12.0, false);
  EXPECT_EQ(a, b);
  EXPECT_FALSE(a == Font(12.0, true));
  EXPECT_EQ(Font(-5.0, false).GetPixelSize(), 1.0);
  EXPECT_EQ(Font(1e9, false).GetPixelSize(), 512.0);
  EXPECT_GT(Font(24.0, false).StringWidth("Scale"), Font(12.0, false).StringWidth("Scale"));
}

TEST(FontMetrics, InvalidUtf8AndNulBytesAreMeasuredNotDropped) {
  const Font font;
  const std::string broken = std::string("Blur\xff\xfe") + '\0' + "Amount";
  const int width = font.StringWidth(broken);
  EXPECT_GT(width, font.StringWidth("BlurAmount"));
}

TEST(FontLayoutCache, RepeatedMeasurementsReuseTheLayout) {
  const Font font(kFont_Small);
  const std::string text = "Layout cache probe 7f3a";
  const int first = font.StringWidth(text);
  const auto built = Font::LayoutsBuilt();
  EXPECT_EQ(font.StringWidth(text), first);
  EXPECT_EQ(font.StringWidth(text), first);
  EXPECT_EQ(Font::LayoutsBuilt(), built);
  EXPECT_EQ(font.GetLayout(text), font.GetLayout(text));
  // Another font with the same text is another layout.
  Font(kFont_Bold).StringWidth(text);
  EXPECT_EQ(Font::LayoutsBuilt(), built + 1);
}

TEST(FontLayoutCache, EllipsizedLayoutsFitTheirWidthAndAreCachedApart) {
  const Font font;
  const std::string text = "Gaussian Blur with a rather long title";
  const auto natural = font.GetLayout(text);
  const auto shortened = font.GetLayout(text, 60);
  EXPECT_NE(natural, shortened);
  EXPECT_LE(shortened->GetWidth(), 60.0 + 0.5);
  // A width that fits gives the natural layout back.
  EXPECT_EQ(font.GetLayout(text, 1000), natural);
}

TEST(FontLayoutCache, TheCacheIsBounded) {
  const Font font;
  for (int i = 0; i < 3000; ++i)
    font.StringWidth("entry " + std::to_string(i));
  EXPECT_LE(Font::CachedLayoutCount(), 2048u);
  // A layout handed out stays valid after it has been evicted.
  const auto held = font.GetLayout("held layout");
  Font::ClearLayoutCache();
  EXPECT_EQ(Font::CachedLayoutCount(), 0u);
  EXPECT_GT(held->GetWidth(), 0.0);
  EXPECT_GT(font.StringWidth("after clear"), 0);
}

}  // namespace
