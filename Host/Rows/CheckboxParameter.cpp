#include "Host/Rows/CheckboxParameter.h"

#include <variant>

#include "Host/Model/ParamValue.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/ControlMessages.h"

CheckboxParameter::CheckboxParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

void CheckboxParameter::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<CheckBoxControlChangedMessage>()) {
    if (!ApplyValue(changed->checked)) {
      SynchToCurrentTime();  // refused: the box shows the model again
    }
    return;
  }
  ParameterControl::ListenToMessage(message);
}

void CheckboxParameter::PositionSelf(int top, int depth, int width) {
  ParameterControl::PositionSelf(top, depth, width);
  if (mCheckBox) {
    PlaceView(*mCheckBox, Rect::FromSize(GetControlsLeft() + 10, top + 3, CheckBoxControl::kBoxSize,
                                         CheckBoxControl::kBoxSize));
  }
}

void CheckboxParameter::SynchToCurrentTime() {
  if (!mCheckBox) {
    return;
  }
  const ParamValue value = GetValueAtEditTime();
  const std::optional<double> scalar = AsScalar(value);
  mCheckBox->SetChecked(scalar.has_value() && *scalar != 0.0);
}

void CheckboxParameter::CreateControlsSelf() {
  mCheckBox = AdoptControl(std::make_shared<CheckBoxControl>(
      Rect::FromSize(0, 0, CheckBoxControl::kBoxSize, CheckBoxControl::kBoxSize), 0));
  if (mCheckBox) {
    AddListener(mCheckBox->GetStation(), *this);
  }
}

void CheckboxParameter::DestroyControlsSelf() {
  DestroyControl(mCheckBox);
}

void CheckboxParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mCheckBox) {
    mCheckBox->SetVisible(show);
  }
}

void CheckboxParameter::UpdateControlsEnabled(bool enabled) {
  if (mCheckBox) {
    mCheckBox->SetEnabled(enabled);
  }
}
