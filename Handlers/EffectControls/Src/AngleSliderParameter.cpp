#include "Handlers/EffectControls/Src/AngleSliderParameter.h"

#include <algorithm>
#include <cmath>

#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Rows/ParameterCache.h"
#include "Host/Toolkit/AngleControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/ViewBase.h"

namespace {

constexpr double kHalfTurn = 180.0;
constexpr double kTurn = 360.0;

}  // namespace

AngleSliderParameter::AngleSliderParameter(const ParameterControlInfo& info)
    : SliderParameter(info) {}

AngleSliderParameter::Turns AngleSliderParameter::SplitTurns(double angle) {
  if (!std::isfinite(angle)) {
    return {};
  }
  const double turns = std::ceil((angle - kHalfTurn) / kTurn);
  return {turns, angle - turns * kTurn};
}

double AngleSliderParameter::ComputeValueIncrement(const ComponentParam& param,
                                                   std::string_view matchName,
                                                   std::size_t paramIndex) {
  if (param.IsExponential()) {
    return static_cast<double>(0.1f);
  }
  const double hundredth = (param.GetMaximum() - param.GetMinimum()) / 100.0;
  if (matchName == kWriteOnMatchName && paramIndex == 2 && hundredth <= 0.01) {
    return 0.01;
  }
  return hundredth > 0.1 ? 1.0 : 0.1;
}

void AngleSliderParameter::ListenToMessage(const Message& message) {
  if (const auto* turning = message.As<AngleControlChangingMessage>()) {
    mTurns = SplitTurns(turning->degrees).turns;
    WriteAngle(RoundToPrecision(turning->degrees), false);
  } else if (const auto* turned = message.As<AngleControlChangedMessage>()) {
    mTurns = SplitTurns(turned->degrees).turns;
    WriteAngle(RoundToPrecision(turned->degrees), true);
  } else {
    SliderParameter::ListenToMessage(message);
  }
}

void AngleSliderParameter::PositionSelf(int top, int depth, int width) {
  SliderParameter::PositionSelf(top, depth, width);
  const int fieldsRight = GetControlsLeft() + 10 + kHotTextWidth + 4;
  if (mTurnsField) {
    PlaceView(*mTurnsField, Rect::FromSize(fieldsRight, top + 2, kTurnsFieldWidth, kHotTextHeight));
  }
  if (mDial) {
    PlaceView(*mDial,
              Rect::FromSize(fieldsRight + kTurnsFieldWidth + 6, top + 1, kDialSize, kDialSize));
  }
}

void AngleSliderParameter::SynchToCurrentTime() {
  const double angle = GetParam() ? ReadAngle(*GetParam()) : 0.0;
  // An open gesture keeps the turns it began with; the rest may then pass +-180.
  if (!IsEditOpen()) {
    mTurns = SplitTurns(angle).turns;
  }
  mCachedValue = angle;
  mCachedTime = GetEditTime();
  ShowValue(angle - mTurns * kTurn);
  ShowTurnsAndDial(angle);
  UpdateCurrentVelocity();
}

void AngleSliderParameter::RefreshSliderParameters() {
  const ComponentParamRef& param = GetParam();
  if (!param) {
    return;
  }
  mHotTextMinimum = mSliderMinimum = -180;
  mHotTextMaximum = mSliderMaximum = 180;
  mMinimum = -kHalfTurn;
  mMaximum = kHalfTurn;
  const Component* component = param->GetComponent();
  mValueIncrement = ComputeValueIncrement(
      *param, component ? std::string_view(component->GetMatchName()) : std::string_view(),
      component ? component->GetParamIndex(param.get()) : 0);
  mExponential = param->IsExponential();
  mExponent = param->GetExponent();
  if (FloatSliderControl* slider = GetSlider()) {
    slider->SetMaxValue(static_cast<float>(kHalfTurn));
    slider->SetMinValue(static_cast<float>(-kHalfTurn));
    slider->SetExponential(mExponential, mExponent);
  }
  if (HotFloatControl* field = GetHotText()) {
    field->SetAppendedSymbol(param->GetUnits() == ParamUnits::Percent ? "%" : "\xC2\xB0");
    field->SetValueIncrement(mValueIncrement);
    field->SetDigitsPastDecimal(GetDisplayDigits());
    field->SetMaxValue(kHalfTurn);
    field->SetMinValue(-kHalfTurn);
    field->SetExponential(mExponential, mExponent);
  }
  SetRangeLabels(FormatNumber(-kHalfTurn, 0), FormatNumber(kHalfTurn, 0));
  SynchToCurrentTime();
}

void AngleSliderParameter::SynchToFeedback(const ComponentParamRef& param) {
  if (!param) {
    return;
  }
  // Shown, not bound: the next SynchToCurrentTime shows the row's own parameter again.
  const double angle = ReadAngle(*param);
  const Turns split = SplitTurns(angle);
  ShowValue(split.degrees);
  if (mTurnsField && !mTurnsField->IsEditing()) {
    mTurnsField->SetValue(split.turns);
  }
  if (mDial && !mDial->IsDragging()) {
    mDial->SetValue(angle);
  }
}

void AngleSliderParameter::OnHotFloatControlChanging(float value, std::int32_t cookie) {
  if (cookie != kTurnsFieldCookie) {
    SliderParameter::OnHotFloatControlChanging(value, cookie);
    return;
  }
  const double rest = mCachedValue - mTurns * kTurn;
  mTurns = std::round(value);
  WriteAngle(mTurns * kTurn + rest, false);
}

void AngleSliderParameter::OnHotFloatControlChanged(float value, std::int32_t cookie) {
  if (cookie != kTurnsFieldCookie) {
    SliderParameter::OnHotFloatControlChanged(value, cookie);
    return;
  }
  const double rest = mCachedValue - mTurns * kTurn;
  mTurns = std::round(value);
  WriteAngle(mTurns * kTurn + rest, true);
}

void AngleSliderParameter::OnSliderValueChanging(float value, bool /*toModel*/) {
  SliderParameter::OnSliderValueChanging(value, true);
}

void AngleSliderParameter::OnSliderValueChanged(float value, bool /*toModel*/) {
  SliderParameter::OnSliderValueChanged(value, true);
}

void AngleSliderParameter::CreateControlsSelf() {
  SliderParameter::CreateControlsSelf();
  ViewBase* parent = GetParentView();
  if (parent == nullptr) {
    return;
  }
  mTurnsField = GetParameterCache().CreateHotFloat(*parent, this);
  mTurnsField->SetOwnerCookie(kTurnsFieldCookie);
  mTurnsField->SetMinValue(-kTurnsLimit);
  mTurnsField->SetMaxValue(kTurnsLimit);
  mTurnsField->SetDigitsPastDecimal(0);
  mTurnsField->SetValueIncrement(1.0);
  mTurnsField->SetAppendedSymbol("x");
  AddListener(mTurnsField->GetStation(), *this);
  mDial = AdoptControl(std::make_shared<AngleControl>(Rect::FromSize(0, -24, kDialSize, kDialSize),
                                                      kDialCookie, 0.0, this));
  if (mDial) {
    AddListener(mDial->GetStation(), *this);
  }
}

void AngleSliderParameter::DestroyControlsSelf() {
  if (mTurnsField) {
    RemoveListener(mTurnsField->GetStation(), *this);
    mTurnsField->SetVisible(false);
    GetParameterCache().ReturnHotFloat(mTurnsField);
    mTurnsField.reset();
  }
  DestroyControl(mDial);
  SliderParameter::DestroyControlsSelf();
}

void AngleSliderParameter::ShowControls(bool show) {
  SliderParameter::ShowControls(show);
  if (mTurnsField) {
    mTurnsField->SetVisible(show);
  }
  if (mDial) {
    mDial->SetVisible(show);
  }
}

void AngleSliderParameter::UpdateControlsEnabled(bool enabled) {
  SliderParameter::UpdateControlsEnabled(enabled);
  if (mTurnsField) {
    mTurnsField->SetEnabled(enabled);
  }
  if (mDial) {
    mDial->SetEnabled(enabled);
  }
}

double AngleSliderParameter::ReadValue() const {
  return (GetParam() ? ReadAngle(*GetParam()) : 0.0) - mTurns * kTurn;
}

ParamValue AngleSliderParameter::ToParamValue(double degrees) const {
  return RoundToPrecision(mTurns * kTurn + degrees);
}

int AngleSliderParameter::GetDisplayDigits() const {
  return GetParam() ? std::clamp(GetParam()->GetPrecision(), 0, 10) : 0;
}

double AngleSliderParameter::ReadAngle(const ComponentParam& param) const {
  return param.GetScalarAt(GetClipEditTime()).value_or(0.0);
}

double AngleSliderParameter::RoundToPrecision(double degrees) const {
  // The slider reports any fraction; what is written is what the field can show.
  const int digits = GetParam() ? std::clamp(GetParam()->GetPrecision(), 0, 10) : 1;
  const double scale = std::pow(10.0, digits);
  const double rounded = std::round(degrees * scale) / scale;
  return std::isfinite(rounded) ? rounded : degrees;
}

void AngleSliderParameter::WriteAngle(double angle, bool finished) {
  if (!finished) {
    if (SetEditValue(angle)) {
      RedrawKeyframeView();
    }
  } else if (SynchParamActor()) {
    SetEditValue(angle);
    CommitEdit();
    ReleaseParamActor();
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

void AngleSliderParameter::ShowTurnsAndDial(double angle) {
  if (mTurnsField && !mTurnsField->IsEditing() && mTurnsField->GetValue() != mTurns) {
    mTurnsField->SetValue(mTurns);
  }
  if (mDial && !mDial->IsDragging() && mDial->GetValue() != angle) {
    mDial->SetValue(angle);
  }
}
