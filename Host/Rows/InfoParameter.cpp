#include "Host/Rows/InfoParameter.h"

#include <algorithm>
#include <variant>

#include "Host/Model/ParamValue.h"
#include "Host/Toolkit/Static.h"

InfoParameter::InfoParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void InfoParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mLabel) {
    const int left = GetControlsLeft() + 10;
    PlaceView(*mLabel, Rect::FromSize(left, top + 3, std::max(width - left - 4, 0), 15));
  }
}

void InfoParameter::SynchToCurrentTime() {
  if (mLabel) {
    mLabel->SetText(GetText());
  }
}

std::string InfoParameter::GetText() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* text = std::get_if<std::string>(&value)) {
    return *text;
  }
  return ToString(value);
}

void InfoParameter::CreateControlsSelf() {
  mLabel = AdoptControl(std::make_shared<Static>(Rect{}));
}

void InfoParameter::DestroyControlsSelf() {
  DestroyControl(mLabel);
}

void InfoParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mLabel) {
    mLabel->SetVisible(show);
  }
}

void InfoParameter::UpdateControlsEnabled(bool enabled) {
  if (mLabel) {
    mLabel->SetEnabled(enabled);
  }
}
