#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Host/Toolkit/ButtonControl.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/ControlStation.h"

// A colour swatch with a 1-pixel frame. A click (or Space/Return while focused) broadcasts
// ColorPickerSwatchClickedMessage, then asks for the new colour through the input box as
// "#RRGGBB" text. A text that is not a colour is refused: the box is asked again with a prompt
// that says why, up to kMaxAttempts times, and cancelling leaves everything as it was. A new
// colour (alpha kept from the current one) is shown and broadcast as
// ColorPickerControlChangedMessage; the same colour again sends nothing. SetColor sends nothing.
// A listener may destroy the control. UI thread only.
class ColorPickerControl : public ButtonControl {
 public:
  static constexpr int kMaxAttempts = 5;

  // `id` travels in the messages; `commander`: see ButtonControl.
  explicit ColorPickerControl(const Rect& bounds, Color color = Color(), std::int32_t id = 0,
                              Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetControlID(std::int32_t id) { mID = id; }
  std::int32_t GetControlID() const { return mID; }

  void SetColor(Color color);
  Color GetColor() const { return mColor; }
  // The colour entry's title; may be a "$$$/" key.
  void SetTitle(std::string title) { mTitle = std::move(title); }

  // "#RRGGBB" (upper case, alpha left out).
  static std::string FormatHex(Color color);
  // Six hexadecimal digits, with or without a leading '#', blanks around allowed, any case;
  // the result has `alpha`. nullopt for anything else.
  static std::optional<Color> ParseHex(std::string_view text, std::uint8_t alpha = 255);

  // Asks for a colour as a click does. The new colour, or nullopt when the control is disabled
  // or hidden, the entry was cancelled or refused, or the colour did not change.
  std::optional<Color> Pick();

  void PaintSelf(DC& dc) override;

 protected:
  bool ClickSelf(KeyModifiers modifiers) override;

 private:
  ControlStation mStation{"ColorPickerControl"};
  Color mColor;
  std::int32_t mID;
  std::string mTitle;
};
