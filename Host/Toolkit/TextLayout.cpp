#include "Host/Toolkit/TextLayout.h"

#include <algorithm>

TextLayout::TextLayout(PangoLayout* layout, bool cut)
    : mLayout(layout), mElided(cut || pango_layout_is_ellipsized(layout)) {
  PangoRectangle ink;
  PangoRectangle logical;
  pango_layout_get_extents(mLayout, &ink, &logical);
  mWidth = static_cast<double>(logical.width) / PANGO_SCALE;
  mHeight = static_cast<double>(logical.height) / PANGO_SCALE;
  mBaseline = static_cast<double>(pango_layout_get_baseline(mLayout)) / PANGO_SCALE;
  mInkLeft = std::min(0.0, static_cast<double>(ink.x) / PANGO_SCALE);
  // Summed in double: a wide line's x + width may not fit an int.
  mInkRight = std::max(mWidth, (static_cast<double>(ink.x) + ink.width) / PANGO_SCALE);
}

TextLayout::~TextLayout() {
  g_object_unref(mLayout);
}
