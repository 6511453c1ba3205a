#include "Host/Toolkit/TextButton.h"

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

TextButton::TextButton(const Rect& bounds, std::string label, CommandID command,
                       Commander* commander, Font font)
    : ButtonControl(command, commander), mLabel(LocalizeString(label)), mFont(font) {
  SetBounds(bounds);
}

void TextButton::SetLabel(std::string label) {
  std::string localized = LocalizeString(label);
  if (localized != mLabel) {
    mLabel = std::move(localized);
    Invalidate();
  }
}

void TextButton::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  PaintFace(dc, bounds, true);
  const bool enabled = IsEnabledInTree();
  const Color text =
      ColorManager::GetColor(enabled ? kColor_ControlText : kColor_ControlTextDisabled);
  const int shift = IsPressed() ? 1 : 0;
  dc.DrawText(mLabel, bounds.Inset(4, 1).Offset(shift, shift), mFont, text, TextAlign::kCenter,
              TextVAlign::kCenter);
}
