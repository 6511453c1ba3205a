#include "Host/Rows/AngleParameter.h"

#include <algorithm>
#include <cmath>

#include "Host/Model/ComponentParam.h"
#include "Host/Rows/ParameterCache.h"
#include "Host/Toolkit/AngleControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/ViewBase.h"

AngleParameter::AngleParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void AngleParameter::ListenToMessage(const Message& message) {
  if (const auto* fieldChanging = message.As<HotFloatControlChangingMessage>()) {
    if (mDial) {
      mDial->SetValue(fieldChanging->value);
    }
    OnAngleChanging(fieldChanging->value);
  } else if (const auto* fieldChanged = message.As<HotFloatControlChangedMessage>()) {
    if (mDial) {
      mDial->SetValue(fieldChanged->value);
    }
    OnAngleChanged(fieldChanged->value);
  } else if (const auto* dialChanging = message.As<AngleControlChangingMessage>()) {
    if (mField) {
      mField->SetValue(dialChanging->degrees);
    }
    OnAngleChanging(dialChanging->degrees);
  } else if (const auto* dialChanged = message.As<AngleControlChangedMessage>()) {
    if (mField) {
      mField->SetValue(dialChanged->degrees);
    }
    OnAngleChanged(dialChanged->degrees);
  } else {
    ParameterControl::ListenToMessage(message);
  }
}

void AngleParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  const int left = GetControlsLeft() + 10;
  if (mField) {
    PlaceView(*mField, Rect::FromSize(left, top + 2, 70, 16));
  }
  if (mDial) {
    PlaceView(*mDial, Rect::FromSize(left, top + OwnHeight() + 4, kDialSize, kDialSize));
  }
}

int AngleParameter::GetTitleRightEdge() const {
  return mField ? mField->GetBounds().left - 10 : GetControlsLeft();
}

void AngleParameter::SynchToCurrentTime() {
  const double angle = GetAngle();
  if (mField && !mField->IsEditing() && mField->GetValue() != angle) {
    mField->SetValue(angle);
  }
  if (mDial && !mDial->IsDragging() && mDial->GetValue() != angle) {
    mDial->SetValue(angle);
  }
}

void AngleParameter::RefreshSliderParameters() {
  const ComponentParamRef& param = GetParam();
  if (!param || !mField) {
    return;
  }
  mField->SetDigitsPastDecimal(std::clamp(param->GetPrecision(), 0, 10));
  mField->SetMinValue(param->GetMinimum());
  mField->SetMaxValue(param->GetMaximum());
  if (param->GetStep() > 0.0) {
    mField->SetValueIncrement(param->GetStep());
  }
  mField->SetAppendedSymbol("\xC2\xB0");
  SynchToCurrentTime();
}

double AngleParameter::GetAngle() const {
  return AsScalar(GetValueAtEditTime()).value_or(0.0);
}

double AngleParameter::RoundToPrecision(double degrees) const {
  // The dial reports any fraction; what is written is what the field shows.
  const int digits = GetParam() ? std::clamp(GetParam()->GetPrecision(), 0, 10) : 1;
  const double scale = std::pow(10.0, digits);
  const double rounded = std::round(degrees * scale) / scale;
  return std::isfinite(rounded) ? rounded : degrees;
}

void AngleParameter::OnAngleChanging(double degrees) {
  degrees = RoundToPrecision(degrees);
  if (SetEditValue(degrees)) {
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

void AngleParameter::OnAngleChanged(double degrees) {
  degrees = RoundToPrecision(degrees);
  if (SynchParamActor()) {
    SetEditValue(degrees);
    CommitEdit();
    ReleaseParamActor();
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

void AngleParameter::CreateControlsSelf() {
  ViewBase* parent = GetParentView();
  if (parent == nullptr) {
    return;
  }
  mField = GetParameterCache().CreateHotFloat(*parent, this);
  mField->SetOwnerCookie(kFieldCookie);
  AddListener(mField->GetStation(), *this);
  mDial = AdoptControl(std::make_shared<AngleControl>(Rect{}, kDialCookie, 0.0, this));
  if (mDial) {
    AddListener(mDial->GetStation(), *this);
  }
}

void AngleParameter::DestroyControlsSelf() {
  if (mField) {
    RemoveListener(mField->GetStation(), *this);
    GetParameterCache().ReturnHotFloat(mField);
    mField.reset();
  }
  DestroyControl(mDial);
}

void AngleParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mField) {
    mField->SetVisible(show);
  }
  if (mDial) {
    mDial->SetVisible(show && IsExpanded());
  }
}

void AngleParameter::UpdateControlsEnabled(bool enabled) {
  if (mField) {
    mField->SetEnabled(enabled);
  }
  if (mDial) {
    mDial->SetEnabled(enabled);
  }
}
