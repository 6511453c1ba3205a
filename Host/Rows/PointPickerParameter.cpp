#include "Host/Rows/PointPickerParameter.h"

#include <algorithm>
#include <variant>

#include "Host/Model/ComponentParam.h"
#include "Host/Rows/ParameterCache.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/ViewBase.h"

PointPickerParameter::PointPickerParameter(const ParameterControlInfo& info)
    : ParameterControl(info) {}

void PointPickerParameter::ListenToMessage(const Message& message) {
  if (const auto* changing = message.As<HotFloatControlChangingMessage>()) {
    OnFieldChanging(changing->value, changing->cookie);
  } else if (const auto* changed = message.As<HotFloatControlChangedMessage>()) {
    OnFieldChanged(changed->value, changed->cookie);
  } else {
    ParameterControl::ListenToMessage(message);
  }
}

void PointPickerParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  const int left = GetControlsLeft() + 10;
  if (mX) {
    PlaceView(*mX, Rect::FromSize(left, top + 2, kFieldWidth, 16));
  }
  if (mY) {
    PlaceView(*mY, Rect::FromSize(left + kFieldWidth + kFieldGap, top + 2, kFieldWidth, 16));
  }
}

int PointPickerParameter::GetTitleRightEdge() const {
  return GetControlsLeft();
}

int PointPickerParameter::GetFieldsRight() const {
  return GetControlsLeft() + 10 + 2 * kFieldWidth + kFieldGap;
}

void PointPickerParameter::SynchToCurrentTime() {
  const ParamPoint point = GetPoint();
  if (mX && !mX->IsEditing()) {
    mX->SetValue(point.x);
  }
  if (mY && !mY->IsEditing()) {
    mY->SetValue(point.y);
  }
}

void PointPickerParameter::RefreshSliderParameters() {
  const ComponentParamRef& param = GetParam();
  if (!param) {
    return;
  }
  for (HotFloatControl* field : {mX.get(), mY.get()}) {
    if (field == nullptr) {
      continue;
    }
    field->SetDigitsPastDecimal(std::clamp(param->GetPrecision(), 0, 10));
    field->SetMinValue(param->GetMinimum());
    field->SetMaxValue(param->GetMaximum());
    if (param->GetStep() > 0.0) {
      field->SetValueIncrement(param->GetStep());
    }
    field->SetExponential(param->IsExponential(), param->GetExponent());
    field->SetAppendedSymbol(param->GetUnits() == ParamUnits::Percent ? "%" : "");
  }
  SynchToCurrentTime();
}

ParamPoint PointPickerParameter::GetPoint() const {
  const ParamValue value = GetValueAtEditTime();
  if (const auto* point = std::get_if<ParamPoint>(&value)) {
    return *point;
  }
  return {};
}

ParamPoint PointPickerParameter::MakePoint(const ParamPoint& current, bool isX,
                                           double value) const {
  ParamPoint point = current;
  (isX ? point.x : point.y) = value;
  return point;
}

void PointPickerParameter::OnFieldChanging(double value, std::int32_t cookie) {
  if (cookie != kXCookie && cookie != kYCookie) {
    return;
  }
  if (SetEditValue(MakePoint(GetPoint(), cookie == kXCookie, value))) {
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

void PointPickerParameter::OnFieldChanged(double value, std::int32_t cookie) {
  if (cookie != kXCookie && cookie != kYCookie) {
    return;
  }
  if (SynchParamActor()) {
    SetEditValue(MakePoint(GetPoint(), cookie == kXCookie, value));
    CommitEdit();
    ReleaseParamActor();
    RedrawKeyframeView();
  }
  SynchToCurrentTime();
}

void PointPickerParameter::CreateControlsSelf() {
  ViewBase* parent = GetParentView();
  if (parent == nullptr) {
    return;
  }
  mX = GetParameterCache().CreateHotFloat(*parent, this);
  mY = GetParameterCache().CreateHotFloat(*parent, this);
  mX->SetOwnerCookie(kXCookie);
  mY->SetOwnerCookie(kYCookie);
  AddListener(mX->GetStation(), *this);
  AddListener(mY->GetStation(), *this);
}

void PointPickerParameter::DestroyControlsSelf() {
  for (std::shared_ptr<HotFloatControl>* field : {&mX, &mY}) {
    if (*field) {
      RemoveListener((*field)->GetStation(), *this);
      GetParameterCache().ReturnHotFloat(*field);
      field->reset();
    }
  }
}

void PointPickerParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  for (HotFloatControl* field : {mX.get(), mY.get()}) {
    if (field != nullptr) {
      field->SetVisible(show);
    }
  }
}

void PointPickerParameter::UpdateControlsEnabled(bool enabled) {
  for (HotFloatControl* field : {mX.get(), mY.get()}) {
    if (field != nullptr) {
      field->SetEnabled(enabled);
    }
  }
}
