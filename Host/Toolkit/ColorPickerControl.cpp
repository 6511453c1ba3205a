#include "Host/Toolkit/ColorPickerControl.h"

#include <algorithm>
#include <cstdio>
#include <memory>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/InputBox.h"

namespace {

constexpr std::string_view kDefaultTitle = "$$$/Vantile/Host/ColorPicker/Title=Color";
constexpr std::string_view kPrompt =
    "$$$/Vantile/Host/ColorPicker/Prompt=Enter the color as #RRGGBB (hexadecimal red, green, "
    "blue):";
constexpr std::string_view kRefusedPrompt =
    "$$$/Vantile/Host/ColorPicker/NotAColor=\"@0\" is not a color. Enter six hexadecimal digits "
    "as #RRGGBB, for example #FF8000:";

int HexDigit(char c) {
  if (c >= '0' && c <= '9') {
    return c - '0';
  }
  if (c >= 'a' && c <= 'f') {
    return c - 'a' + 10;
  }
  if (c >= 'A' && c <= 'F') {
    return c - 'A' + 10;
  }
  return -1;
}

bool IsBlank(char c) {
  return c == ' ' || c == '\t' || c == '\n' || c == '\r';
}

}  // namespace

ColorPickerControl::ColorPickerControl(const Rect& bounds, Color color, std::int32_t id,
                                       Commander* commander)
    : ButtonControl(kNoCommand, commander), mColor(color), mID(id), mTitle(kDefaultTitle) {
  SetBounds(bounds);
}

void ColorPickerControl::SetColor(Color color) {
  if (color != mColor) {
    mColor = color;
    Invalidate();
  }
}

std::string ColorPickerControl::FormatHex(Color color) {
  char text[8];
  std::snprintf(text, sizeof text, "#%02X%02X%02X", color.r, color.g, color.b);
  return text;
}

std::optional<Color> ColorPickerControl::ParseHex(std::string_view text, std::uint8_t alpha) {
  while (!text.empty() && IsBlank(text.front())) {
    text.remove_prefix(1);
  }
  while (!text.empty() && IsBlank(text.back())) {
    text.remove_suffix(1);
  }
  if (!text.empty() && text.front() == '#') {
    text.remove_prefix(1);
  }
  if (text.size() != 6) {
    return std::nullopt;
  }
  std::uint8_t channels[3];
  for (int i = 0; i < 3; ++i) {
    const int high = HexDigit(text[2 * i]);
    const int low = HexDigit(text[2 * i + 1]);
    if (high < 0 || low < 0) {
      return std::nullopt;
    }
    channels[i] = static_cast<std::uint8_t>(high * 16 + low);
  }
  return Color(channels[0], channels[1], channels[2], alpha);
}

bool ColorPickerControl::ClickSelf(KeyModifiers /*modifiers*/) {
  Pick();
  return true;
}

std::optional<Color> ColorPickerControl::Pick() {
  if (!IsEnabledInTree() || !IsVisible()) {
    return std::nullopt;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  mStation.Broadcast(ColorPickerSwatchClickedMessage(mColor, mID));
  // The listener may have disabled, hidden or destroyed the swatch.
  if (IsDestroyed() || !IsEnabledInTree() || !IsVisible()) {
    return std::nullopt;
  }
  const Color before = mColor;
  std::string prompt = LocalizeString(kPrompt);
  std::string text = FormatHex(before);
  for (int attempt = 0; attempt < kMaxAttempts; ++attempt) {
    const std::optional<std::string> answer = InputBox::Ask(mTitle, prompt, text);
    if (!answer || IsDestroyed()) {
      return std::nullopt;
    }
    const std::optional<Color> color = ParseHex(*answer, before.a);
    if (!color) {
      text = *answer;
      prompt = LocalizeString(kRefusedPrompt, {*answer});
      continue;
    }
    if (*color == before) {
      return std::nullopt;
    }
    SetColor(*color);
    mStation.Broadcast(ColorPickerControlChangedMessage(*color, mID));
    return color;
  }
  return std::nullopt;
}

void ColorPickerControl::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const bool enabled = IsEnabledInTree();
  const Rect swatch = bounds.Inset(1, 1);
  if (!mColor.IsOpaque()) {
    // A checkerboard shows through a translucent colour.
    const Color light(204, 204, 204);
    const Color dark(153, 153, 153);
    constexpr int kCell = 4;
    for (int y = swatch.top; y < swatch.bottom; y += kCell) {
      for (int x = swatch.left; x < swatch.right; x += kCell) {
        const bool odd = ((x - swatch.left) / kCell + (y - swatch.top) / kCell) % 2 != 0;
        dc.FillRect(
            Rect{x, y, std::min(x + kCell, swatch.right), std::min(y + kCell, swatch.bottom)},
            odd ? dark : light);
      }
    }
  }
  Color shown = mColor;
  if (!enabled) {
    shown = shown.Mix(ColorManager::GetColor(kColor_ControlBackground), 0.6);
  }
  dc.FillRect(swatch, shown);
  const bool highlighted = enabled && (IsHovered() || IsPressed() || IsTarget());
  dc.FrameRect(bounds, ColorManager::GetColor(highlighted ? kColor_Focus : kColor_ControlBorder));
}
