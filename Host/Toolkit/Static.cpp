#include "Host/Toolkit/Static.h"

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"

Static::Static(const Rect& bounds, std::string text, TextAlign align, Font font)
    : mText(LocalizeString(text)), mAlign(align), mFont(font), mColorKey(kColor_ControlText) {
  SetBounds(bounds);
}

void Static::SetText(std::string text) {
  std::string localized = LocalizeString(text);
  if (localized != mText) {
    mText = std::move(localized);
    Invalidate();
  }
}

void Static::SetAlignment(TextAlign align) {
  mAlign = align;
  Invalidate();
}

void Static::SetFont(Font font) {
  mFont = font;
  Invalidate();
}

void Static::SetColorKey(std::string colorKey) {
  mColorKey = std::move(colorKey);
  Invalidate();
}

void Static::SetBackgroundColorKey(std::string colorKey) {
  mBackgroundKey = std::move(colorKey);
  Invalidate();
}

// Clicks go through a label to what lies below it.
bool Static::HitTestSelf(Point /*point*/) const {
  return false;
}

void Static::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  if (!mBackgroundKey.empty()) {
    dc.FillRect(bounds, ColorManager::GetColor(mBackgroundKey));
  }
  const Color color = ColorManager::GetColor(IsEnabledInTree() ? std::string_view(mColorKey)
                                                               : kColor_ControlTextDisabled);
  dc.DrawText(mText, bounds, mFont, color, mAlign, TextVAlign::kCenter);
}
