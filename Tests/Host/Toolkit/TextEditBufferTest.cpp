// Placing the caret where a field is clicked.
#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <string>
#include <vector>

#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/TextEditBuffer.h"

namespace {

// The character boundaries of `text` (UTF-8), with the width of the text before each.
std::vector<std::pair<std::size_t, int>> BoundaryWidths(const std::string& text, const Font& font) {
  std::vector<std::pair<std::size_t, int>> widths{{0, 0}};
  for (std::size_t i = 1; i <= text.size(); ++i) {
    if (i == text.size() || (static_cast<unsigned char>(text[i]) & 0xC0) != 0x80)
      widths.emplace_back(i, font.StringWidth(std::string_view(text).substr(0, i)));
  }
  return widths;
}

TEST(TextEditBufferCaret, AClickPutsTheCaretOnTheNearestCharacterBoundary) {
  const Font font(kFont_Normal);
  for (const std::string text :
       {"Position", "W i d e  and thin ||||", "Grüße, naïve café", "12.5"}) {
    TextEditBuffer buffer;
    buffer.Reset(text);
    const auto boundaries = BoundaryWidths(text, font);
    for (int x = -10; x <= font.StringWidth(text) + 10; ++x) {
      buffer.SetCaretFromX(x, font, false);
      int best = INT_MAX;
      int caretWidth = -1;
      for (const auto& [offset, width] : boundaries) {
        best = std::min(best, std::abs(width - x));
        if (offset == buffer.GetCaret())
          caretWidth = width;
      }
      ASSERT_NE(caretWidth, -1) << text << " x " << x << ": caret inside a character";
      // Pango rounds positions in its own units: within a pixel of the nearest boundary.
      EXPECT_LE(std::abs(caretWidth - x), best + 1) << text << " x " << x;
      EXPECT_FALSE(buffer.HasSelection());
    }
  }
}

TEST(TextEditBufferCaret, AShiftClickExtendsTheSelectionAndFarClicksStopAtTheEnds) {
  const Font font(kFont_Normal);
  TextEditBuffer buffer;
  buffer.Reset("Opacity");
  buffer.SetCaretFromX(-1'000'000'000, font, false);
  EXPECT_EQ(buffer.GetCaret(), 0u);
  buffer.SetCaretFromX(INT_MAX, font, true);
  EXPECT_EQ(buffer.GetCaret(), 7u);
  EXPECT_EQ(buffer.GetSelectionStart(), 0u);
  EXPECT_EQ(buffer.GetSelectionEnd(), 7u);

  TextEditBuffer empty;
  empty.SetCaretFromX(40, font, false);
  EXPECT_EQ(empty.GetCaret(), 0u);
}

}  // namespace
