#include "Host/Rows/FloatSliderParameter.h"

#include <algorithm>

#include "Host/Model/ComponentParam.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/Static.h"

FloatSliderParameter::FloatSliderParameter(const ParameterControlInfo& info)
    : SliderParameter(info) {}

void FloatSliderParameter::PositionSelf(int top, int depth, int width) {
  SliderParameter::PositionSelf(top, depth, width);
  if (mValueLabel) {
    const int left = GetControlsLeft() + 10;
    PlaceView(*mValueLabel,
              Rect::FromSize(left, top + 2, std::max(width - left - 4, 0), kHotTextHeight));
  }
}

void FloatSliderParameter::SynchToCurrentTime() {
  const double value = ReadValue();
  mCachedValue = static_cast<float>(value);
  mCachedTime = GetEditTime();
  if (mShowValueAsText) {
    if (mValueLabel) {
      mValueLabel->SetText(GetValueText(value) + GetSuffixText());
    }
    if (GetSlider() && GetSlider()->GetValue() != static_cast<float>(value)) {
      GetSlider()->SetValue(static_cast<float>(value));
    }
  } else {
    ShowValue(value);
  }
  UpdateCurrentVelocity();
}

void FloatSliderParameter::RefreshSliderParameters() {
  SliderParameter::RefreshSliderParameters();
  if (const ComponentParamRef& param = GetParam()) {
    mHotTextMinimumF = static_cast<float>(param->GetMinimum());
    mHotTextMaximumF = static_cast<float>(param->GetMaximum());
    mSliderMinimumF = static_cast<float>(param->GetSliderMinimum());
    mSliderMaximumF = static_cast<float>(param->GetSliderMaximum());
  }
}

void FloatSliderParameter::SetShowValueAsText(bool showAsText) {
  if (mShowValueAsText == showAsText) {
    return;
  }
  mShowValueAsText = showAsText;
  if (IsShown()) {
    ShowControls(true);
  }
  SynchToCurrentTime();
}

std::string FloatSliderParameter::GetValueText(double value) const {
  return FormatNumber(value, GetDisplayDigits());
}

std::string FloatSliderParameter::GetSuffixText() const {
  return GetUnitsSymbol();
}

int FloatSliderParameter::GetDisplayDigits() const {
  return GetParam() ? std::clamp(GetParam()->GetPrecision(), 0, 10) : 2;
}

void FloatSliderParameter::CreateControlsSelf() {
  SliderParameter::CreateControlsSelf();
  mValueLabel = AdoptControl(std::make_shared<Static>(Rect{}));
}

void FloatSliderParameter::DestroyControlsSelf() {
  DestroyControl(mValueLabel);
  SliderParameter::DestroyControlsSelf();
}

void FloatSliderParameter::ShowControls(bool show) {
  SliderParameter::ShowControls(show);
  if (mValueLabel) {
    mValueLabel->SetVisible(show && mShowValueAsText);
  }
}

void FloatSliderParameter::UpdateControlsEnabled(bool enabled) {
  SliderParameter::UpdateControlsEnabled(enabled);
  if (mValueLabel) {
    mValueLabel->SetEnabled(enabled);
  }
}
