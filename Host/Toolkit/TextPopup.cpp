#include "Host/Toolkit/TextPopup.h"

#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"

TextPopup::TextPopup(const Rect& bounds, std::int32_t id, Commander* commander)
    : PopupControl(bounds, id, commander) {}

void TextPopup::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const Color ink = PaintFace(dc, bounds);
  const Rect chevron{bounds.right - kChevronWidth, bounds.top, bounds.right, bounds.bottom};
  PaintChevron(dc, chevron, ink);
  const Rect text{bounds.left + kTextInset, bounds.top, chevron.left, bounds.bottom};
  if (text.Width() > 0) {
    dc.DrawText(GetSelectedText(), text, Font(kFont_Normal), ink, TextAlign::kLeft,
                TextVAlign::kCenter);
  }
}
