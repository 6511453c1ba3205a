#include "Host/Rows/ColorPickerParameter.h"

#include <algorithm>
#include <cmath>
#include <variant>

#include "Host/Model/ComponentParam.h"
#include "Host/Toolkit/ColorPickerControl.h"
#include "Host/Toolkit/ControlMessages.h"

namespace {

std::uint8_t ToByte(float channel) {
  if (!std::isfinite(channel)) {
    return 0;
  }
  return static_cast<std::uint8_t>(std::lround(std::clamp(channel, 0.0f, 1.0f) * 255.0f));
}

}  // namespace

ColorPickerParameter::ColorPickerParameter(const ParameterControlInfo& info)
    : ParameterControl(info) {}

void ColorPickerParameter::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<ColorPickerControlChangedMessage>()) {
    if (!SetColor(changed->color)) {
      SynchToCurrentTime();  // refused: the swatch shows the model again
    }
    return;
  }
  ParameterControl::ListenToMessage(message);
}

void ColorPickerParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mSwatch) {
    PlaceView(*mSwatch,
              Rect::FromSize(GetControlsLeft() + 10, top + 3, kSwatchWidth, kSwatchHeight));
  }
}

void ColorPickerParameter::SynchToCurrentTime() {
  if (mSwatch) {
    mSwatch->SetColor(ToColor(GetParamColor()));
  }
}

ParamColor ColorPickerParameter::GetParamColor() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* color = std::get_if<ParamColor>(&value)) {
    return *color;
  }
  return ParamColor{};
}

bool ColorPickerParameter::SetColor(Color color) {
  const ParamColor before = GetParamColor();
  const ParamColor after = ToParamColor(color, before.a);
  // Only what the swatch can show counts: an unchanged pick must not round a bright value.
  if (ToColor(before) == ToColor(after)) {
    return false;
  }
  return ApplyValue(after);
}

Color ColorPickerParameter::ToColor(const ParamColor& color) {
  return Color(ToByte(color.r), ToByte(color.g), ToByte(color.b), ToByte(color.a));
}

ParamColor ColorPickerParameter::ToParamColor(Color color, float alpha) {
  return ParamColor{color.r / 255.0f, color.g / 255.0f, color.b / 255.0f, alpha};
}

void ColorPickerParameter::CreateControlsSelf() {
  mSwatch = AdoptControl(std::make_shared<ColorPickerControl>(
      Rect::FromSize(0, 0, kSwatchWidth, kSwatchHeight), Color(), GetControlID(), this));
  if (mSwatch) {
    if (GetParam()) {
      mSwatch->SetTitle(GetParam()->GetDisplayName());
    }
    AddListener(mSwatch->GetStation(), *this);
  }
}

void ColorPickerParameter::DestroyControlsSelf() {
  if (mSwatch) {
    RemoveListener(mSwatch->GetStation(), *this);
  }
  DestroyControl(mSwatch);
}

void ColorPickerParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mSwatch) {
    mSwatch->SetVisible(show);
  }
}

void ColorPickerParameter::UpdateControlsEnabled(bool enabled) {
  if (mSwatch) {
    mSwatch->SetEnabled(enabled);
  }
}
