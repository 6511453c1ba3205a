#pragma once

#include <cstddef>
#include <memory>
#include <string_view>

#include "Host/Toolkit/Geometry.h"

// The toolkit's fonts. All are DejaVu Sans (DejaVu Sans Mono for timecode); sizes are in
// logical pixels.
enum FontID {
  kFont_Normal,     // 11 px: labels, names, row titles
  kFont_Bold,       // 11 px bold: section headers, emphasised names
  kFont_Small,      // 10 px: secondary text, ruler numbers
  kFont_SmallBold,  // 10 px bold
  kFont_Label,      // 11 px, the row label font (same face as normal)
  kFont_Title,      // 13 px bold: panel titles
  kFont_Timecode,   // 14 px mono: timecode displays
  kFontCount
};

class TextLayout;

// A font: a cheap copyable handle to a process-wide face description. Measurements are in
// logical pixels and do not depend on any DC's scale factor (layout is done without hinting, so
// a string measures the same everywhere). Text is UTF-8; invalid bytes show as U+FFFD.
// UI thread only.
class Font {
 public:
  Font();  // kFont_Normal
  explicit Font(FontID id);
  // A custom DejaVu Sans face; pixelSize is clamped to [1, 512].
  Font(double pixelSize, bool bold, bool italic = false, bool monospace = false);

  friend bool operator==(const Font& a, const Font& b) { return a.mFace == b.mFace; }

  // Advance width of a single line of text, rounded up to whole pixels. A text too long to lay
  // out whole (see GetLayout) measures as its laid-out part and the "…" after it.
  int StringWidth(std::string_view text) const;
  // min(StringWidth(text), maxWidth), for a caller that never uses more than maxWidth: only what
  // can show in maxWidth is measured, so the cost does not grow with the text. A text cut for
  // length gives maxWidth; maxWidth <= 0 gives 0.
  int StringWidth(std::string_view text, int maxWidth) const;
  Size MeasureString(std::string_view text) const;
  // Line height = ascent + descent, rounded up.
  int GetHeight() const;
  int GetAscent() const;
  int GetDescent() const;
  double GetPixelSize() const;
  bool IsBold() const;

  // The cached layout of `text` in this font; when ellipsizeWidth > 0 and the text is wider,
  // the layout is shortened to fit with "…" at the end. Shared: the cache may drop its
  // reference at any time, the caller's stays valid.
  //
  // Cost: only a prefix of the text is laid out, cut between characters: with a width, 16
  // characters per em of it (more than can show); without, as many as could make 2^20 pixels
  // (Pango's int units overflow at 2^21). A text cut for length still ends in "…". A lookup
  // reads no more of the text than that prefix, so a name of any length costs about what a
  // name that fills the width does.
  std::shared_ptr<const TextLayout> GetLayout(std::string_view text, int ellipsizeWidth = 0) const;

  // Layout-cache statistics, for tests and benchmarks: layouts built since start, and entries
  // now cached (bounded).
  static std::size_t LayoutsBuilt();
  static std::size_t CachedLayoutCount();
  static void ClearLayoutCache();

 private:
  int mFace = 0;  // index into the process-wide face table
};
