#include <gtest/gtest.h>
#include <pango/pango.h>

#include <limits>
#include <string>
#include <string_view>

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

// --- Texts of any length ---
// A clip name of 10 MB was laid out whole on every paint: seconds each, and its width in
// Pango's int units (1/1024 px) overflowed.

constexpr std::string_view kEllipsis = "\xE2\x80\xA6";

std::string TextOf(const TextLayout& layout) {
  return pango_layout_get_text(layout.GetPangoLayout());
}

int CharactersOf(const TextLayout& layout) {
  return pango_layout_get_character_count(layout.GetPangoLayout());
}

TEST(FontLongText, AHugeTextMeasuresWithoutOverflowAndShowsItWasCut) {
  const std::string huge(10'000'000, 'W');
  for (const Font& font : {Font(), Font(512.0, true), Font(1.0, false)}) {
    const int width = font.StringWidth(huge);
    EXPECT_GE(width, font.StringWidth(std::string(200, 'W'))) << font.GetPixelSize();
    EXPECT_LT(width, 1 << 21) << "beyond 2^21 px Pango's units overflow";
    const auto layout = font.GetLayout(huge);
    EXPECT_TRUE(layout->IsElided());
    EXPECT_TRUE(TextOf(*layout).ends_with(kEllipsis));
    EXPECT_GT(layout->GetInkRight(), 0.0);
  }
}

TEST(FontLongText, AHugeTextElidesToItsWidthLikeAMerelyLongOne) {
  const Font font;
  const std::string huge(10'000'000, 'x');
  const auto elided = font.GetLayout(huge, 300);
  EXPECT_TRUE(elided->IsElided());
  EXPECT_LE(elided->GetWidth(), 300.5);
  EXPECT_LT(CharactersOf(*elided), 10'000) << "only what can show is laid out";
  const auto longOne = font.GetLayout(std::string(2000, 'x'), 300);
  EXPECT_TRUE(longOne->IsElided());
  EXPECT_DOUBLE_EQ(elided->GetWidth(), longOne->GetWidth());
  EXPECT_DOUBLE_EQ(elided->GetInkRight(), longOne->GetInkRight());
  // The bounded measurement agrees with the whole one wherever the whole one fits.
  EXPECT_EQ(font.StringWidth(huge, 300), 300);
  EXPECT_EQ(font.StringWidth("Beach.mov", 300), font.StringWidth("Beach.mov"));
  EXPECT_EQ(font.StringWidth("Beach.mov", 20), 20);
  EXPECT_EQ(font.StringWidth("Beach.mov", 0), 0);
  EXPECT_EQ(font.StringWidth("Beach.mov", -5), 0);
  // A width beyond any layout gives the whole (bounded) layout.
  EXPECT_EQ(font.GetLayout(huge, std::numeric_limits<int>::max()), font.GetLayout(huge));
}

TEST(FontLongText, ACutNeverSplitsACharacter) {
  const Font font;
  // Two-, three- and four-byte characters, and a mix, after 0 to 3 bytes of ASCII so that the
  // cut meets every byte position of a sequence.
  for (const std::string_view unit :
       {"\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"}) {
    for (int shift = 0; shift < 4; ++shift) {
      std::string text(static_cast<std::size_t>(shift), 'a');
      while (text.size() < 200'000) {
        text += unit;
      }
      for (const int width : {0, 150}) {
        const auto layout = font.GetLayout(text, width);
        const std::string shown = TextOf(*layout);
        ASSERT_TRUE(layout->IsElided());
        ASSERT_TRUE(shown.ends_with(kEllipsis));
        const std::string_view kept(shown.data(), shown.size() - kEllipsis.size());
        EXPECT_TRUE(g_utf8_validate(kept.data(), static_cast<gssize>(kept.size()), nullptr));
        EXPECT_EQ(kept.find("\xEF\xBF\xBD"), std::string_view::npos) << "a split shows as U+FFFD";
        EXPECT_TRUE(std::string_view(text).starts_with(kept)) << "the kept part is a prefix";
        EXPECT_GT(kept.size(), 0u);
      }
    }
  }
}

TEST(FontLongText, RunsOfStrayBytesAreCutLikeCharacters) {
  const Font font;
  const std::string stray(1'000'000, '\x80');
  for (const std::string& text : {stray, "\xF0" + stray, "A" + stray}) {
    const auto layout = font.GetLayout(text);
    EXPECT_TRUE(layout->IsElided());
    EXPECT_LT(CharactersOf(*layout), 100'000);
    EXPECT_GT(font.StringWidth(text), 0);
    EXPECT_LE(font.GetLayout(text, 100)->GetWidth(), 100.5);
  }
}

TEST(FontLongText, AHugeTextsLayoutIsCachedAndEqualsAFreshOne) {
  const Font font;
  const std::string huge(10'000'000, 'x');
  const auto first = font.GetLayout(huge, 240);
  const auto built = Font::LayoutsBuilt();
  EXPECT_EQ(font.GetLayout(huge, 240), first);
  EXPECT_EQ(font.StringWidth(huge, 240), 240);
  EXPECT_EQ(Font::LayoutsBuilt(), built) << "a repaint lays nothing out";
  Font::ClearLayoutCache();
  const auto fresh = font.GetLayout(huge, 240);
  EXPECT_NE(fresh, first);
  EXPECT_EQ(TextOf(*fresh), TextOf(*first));
  EXPECT_DOUBLE_EQ(fresh->GetWidth(), first->GetWidth());
  EXPECT_EQ(fresh->IsElided(), first->IsElided());
  // Texts that differ only past what can show share the layout.
  EXPECT_EQ(font.GetLayout(huge + "tail", 240), fresh);
  EXPECT_NE(font.GetLayout(huge.substr(0, 40), 240), fresh);
}

}  // namespace
