#include "Host/Rows/SliderParameter.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Rows/ParameterCache.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/Static.h"
#include "Host/Toolkit/ViewBase.h"

SliderParameter::SliderParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void SliderParameter::ListenToMessage(const Message& message) {
  if (const auto* m = message.As<HotFloatControlChangingMessage>()) {
    OnHotFloatControlChanging(m->value, m->cookie);
  } else if (const auto* m2 = message.As<HotFloatControlChangedMessage>()) {
    OnHotFloatControlChanged(m2->value, m2->cookie);
  } else if (const auto* m3 = message.As<FloatSliderControlChangingMessage>()) {
    OnFloatSliderControlChanging(m3->value, m3->cookie);
  } else if (const auto* m4 = message.As<FloatSliderControlChangedMessage>()) {
    OnFloatSliderControlChanged(m4->value, m4->cookie);
  } else if (const auto* m5 = message.As<FloatSliderControlDoubleClickedMessage>()) {
    OnFloatSliderDoubleClicked(m5->value);
  } else {
    ParameterControl::ListenToMessage(message);
  }
}

void SliderParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  const int left = GetControlsLeft() + 10;
  if (mHotText) {
    PlaceView(*mHotText, Rect::FromSize(left, top + 2, kHotTextWidth + GetHotTextPaddingWidth(),
                                        kHotTextHeight));
  }
  const int sliderTop = top + OwnHeight() + 4;
  const int sliderWidth = std::max(width - left - 12, 20);
  if (mSlider) {
    PlaceView(*mSlider, Rect::FromSize(left, sliderTop, sliderWidth, kSliderHeight));
  }
  const int labelTop = sliderTop + kSliderHeight + 1;
  const int labelWidth = sliderWidth / 2;
  if (mMinLabel) {
    PlaceView(*mMinLabel, Rect::FromSize(left, labelTop, labelWidth, kLabelHeight));
  }
  if (mMaxLabel) {
    PlaceView(*mMaxLabel,
              Rect::FromSize(left + sliderWidth - labelWidth, labelTop, labelWidth, kLabelHeight));
  }
}

int SliderParameter::GetTitleRightEdge() const {
  return mHotText ? mHotText->GetBounds().left - 10 : GetControlsLeft();
}

void SliderParameter::SetControlID(int id) {
  ParameterControl::SetControlID(id);
  if (mHotText) {
    mHotText->SetOwnerCookie(id);
  }
  if (mSlider) {
    mSlider->SetOwnerCookie(id);
  }
}

void SliderParameter::SynchToCurrentTime() {
  ShowValue(ReadValue());
  UpdateCurrentVelocity();
}

void SliderParameter::SynchToFeedback(const ComponentParamRef& param) {
  if (param) {
    ShowValue(AsScalar(param->GetValueAt(GetClipEditTime())).value_or(0.0));
  }
}

void SliderParameter::RefreshSliderParameters() {
  const ComponentParamRef& param = GetParam();
  if (!param) {
    return;
  }
  mMinimum = param->GetMinimum();
  mMaximum = param->GetMaximum();
  mValueIncrement = param->GetStep();
  mExponential = param->IsExponential();
  mExponent = param->GetExponent();
  mHotTextMinimum = static_cast<int>(std::clamp(mMinimum, -2.0e9, 2.0e9));
  mHotTextMaximum = static_cast<int>(std::clamp(mMaximum, -2.0e9, 2.0e9));
  mSliderMinimum = static_cast<int>(std::clamp(param->GetSliderMinimum(), -2.0e9, 2.0e9));
  mSliderMaximum = static_cast<int>(std::clamp(param->GetSliderMaximum(), -2.0e9, 2.0e9));
  const int digits = GetDisplayDigits();
  if (mHotText) {
    mHotText->SetDigitsPastDecimal(digits);
    mHotText->SetMinValue(mMinimum);
    mHotText->SetMaxValue(mMaximum);
    if (mValueIncrement > 0.0) {
      mHotText->SetValueIncrement(mValueIncrement);
    }
    mHotText->SetExponential(mExponential, mExponent);
    mHotText->SetAppendedSymbol(GetUnitsSymbol());
  }
  if (mSlider) {
    mSlider->SetMinValue(static_cast<float>(param->GetSliderMinimum()));
    mSlider->SetMaxValue(static_cast<float>(param->GetSliderMaximum()));
    mSlider->SetExponential(mExponential, mExponent);
  }
  SetRangeLabels(FormatNumber(param->GetSliderMinimum(), digits),
                 FormatNumber(param->GetSliderMaximum(), digits));
  SynchToCurrentTime();
}

void SliderParameter::OnHotFloatControlChanging(float value, std::int32_t /*cookie*/) {
  if (mSlider) {
    mSlider->SetValue(value);
  }
  OnSliderValueChanging(value, true);
}

void SliderParameter::OnHotFloatControlChanged(float value, std::int32_t /*cookie*/) {
  if (mSlider) {
    mSlider->SetValue(value);
  }
  OnSliderValueChanged(value, true);
}

void SliderParameter::OnFloatSliderControlChanging(float value, std::int32_t /*cookie*/) {
  if (mHotText) {
    mHotText->SetValue(value);
  }
  OnSliderValueChanging(value, true);
}

void SliderParameter::OnFloatSliderControlChanged(float value, std::int32_t /*cookie*/) {
  if (mHotText) {
    mHotText->SetValue(value);
  }
  OnSliderValueChanged(value, true);
}

void SliderParameter::OnFloatSliderDoubleClicked(float /*value*/) {
  if (GetParam() && !IsReadOnly()) {
    ApplyValue(GetParam()->GetDefaultValue());
  }
  SynchToCurrentTime();
}

void SliderParameter::OnSliderValueChanging(float value, bool toModel) {
  if (!toModel) {
    ShowValue(value);
    return;
  }
  if (SetEditValue(ToParamValue(value))) {
    RedrawKeyframeView();
  }
  // What the model took (rounded, limited, or refused) is what the controls show.
  SynchToCurrentTime();
}

void SliderParameter::OnSliderValueChanged(float value, bool toModel) {
  if (!toModel) {
    ShowValue(value);
    return;
  }
  if (SynchParamActor()) {
    SetEditValue(ToParamValue(value));
    CommitEdit();
    ReleaseParamActor();
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

std::string SliderParameter::FormatNumber(double value, int digits) {
  digits = std::clamp(digits, 0, 10);
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%.*f", digits, value);
  std::string text = buffer;
  // "-0", "-0.00": the sign of a rounded zero means nothing to the user.
  if (text.front() == '-' && text.find_first_not_of("-0.") == std::string::npos) {
    text.erase(0, 1);
  }
  return text;
}

void SliderParameter::CreateControlsSelf() {
  ViewBase* parent = GetParentView();
  if (parent == nullptr) {
    return;
  }
  mHotText = GetParameterCache().CreateHotFloat(*parent, this);
  mHotText->SetOwnerCookie(GetControlID());
  AddListener(mHotText->GetStation(), *this);
  mSlider = AdoptControl(std::make_shared<FloatSliderControl>(Rect{}, 0.0f, 100.0f, 0.0f, this));
  if (mSlider) {
    mSlider->SetOwnerCookie(GetControlID());
    AddListener(mSlider->GetStation(), *this);
  }
  mMinLabel = AdoptControl(
      std::make_shared<Static>(Rect{}, std::string(), TextAlign::kLeft, Font(kFont_Small)));
  mMaxLabel = AdoptControl(
      std::make_shared<Static>(Rect{}, std::string(), TextAlign::kRight, Font(kFont_Small)));
}

void SliderParameter::DestroyControlsSelf() {
  if (mHotText) {
    RemoveListener(mHotText->GetStation(), *this);
    GetParameterCache().ReturnHotFloat(mHotText);
    mHotText.reset();
  }
  DestroyControl(mSlider);
  DestroyControl(mMinLabel);
  DestroyControl(mMaxLabel);
}

void SliderParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mHotText) {
    mHotText->SetVisible(show && ShowsHotText());
  }
  const bool expandedShow = show && IsExpanded();
  for (ViewBase* view :
       {static_cast<ViewBase*>(mSlider.get()), static_cast<ViewBase*>(mMinLabel.get()),
        static_cast<ViewBase*>(mMaxLabel.get())}) {
    if (view != nullptr) {
      view->SetVisible(expandedShow);
    }
  }
}

void SliderParameter::UpdateControlsEnabled(bool enabled) {
  if (mHotText) {
    mHotText->SetEnabled(enabled);
  }
  if (mSlider) {
    mSlider->SetEnabled(enabled);
  }
  if (mMinLabel) {
    mMinLabel->SetEnabled(enabled);
  }
  if (mMaxLabel) {
    mMaxLabel->SetEnabled(enabled);
  }
}

double SliderParameter::ReadValue() const {
  return AsScalar(GetValueAtEditTime()).value_or(0.0);
}

ParamValue SliderParameter::ToParamValue(double value) const {
  return std::round(value);
}

void SliderParameter::ShowValue(double value) {
  if (mHotText && mHotText->GetValue() != value && !mHotText->IsEditing()) {
    mHotText->SetValue(value);
  }
  if (mSlider && mSlider->GetValue() != static_cast<float>(value)) {
    mSlider->SetValue(static_cast<float>(value));
  }
}

std::string SliderParameter::GetUnitsSymbol() const {
  return GetParam() ? UnitSymbol(GetParam()->GetUnits()) : "";
}

void SliderParameter::SetRangeLabels(std::string minimum, std::string maximum) {
  mMinLabelText = std::move(minimum);
  mMaxLabelText = std::move(maximum);
  if (mMinLabel) {
    mMinLabel->SetText(mMinLabelText);
  }
  if (mMaxLabel) {
    mMaxLabel->SetText(mMaxLabelText);
  }
}
