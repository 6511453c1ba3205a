#pragma once

#include <pango/pango.h>

// A laid-out line of text in logical pixels, made and cached by Font::GetLayout. Owns its
// Pango layout. Toolkit-internal: only the toolkit's .cpp files include this header.
class TextLayout {
 public:
  // Adopts the reference. `cut`: the text was shortened before it was laid out.
  TextLayout(PangoLayout* layout, bool cut);
  ~TextLayout();
  TextLayout(const TextLayout&) = delete;
  TextLayout& operator=(const TextLayout&) = delete;

  PangoLayout* GetPangoLayout() const { return mLayout; }
  // Logical extents, relative to the layout's top-left.
  double GetWidth() const { return mWidth; }
  double GetHeight() const { return mHeight; }
  double GetBaseline() const { return mBaseline; }
  // Ink extents can reach outside the logical box (e.g. italics, accents).
  double GetInkLeft() const { return mInkLeft; }
  double GetInkRight() const { return mInkRight; }
  // True when the layout shows less than its text, ending in "…".
  bool IsElided() const { return mElided; }

 private:
  PangoLayout* mLayout;
  double mWidth = 0;
  double mHeight = 0;
  double mBaseline = 0;
  double mInkLeft = 0;
  double mInkRight = 0;
  bool mElided = false;
};
