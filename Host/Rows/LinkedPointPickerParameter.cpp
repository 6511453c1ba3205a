#include "Host/Rows/LinkedPointPickerParameter.h"

#include <cmath>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/ControlMessages.h"

LinkedPointPickerParameter::LinkedPointPickerParameter(const ParameterControlInfo& info,
                                                       bool isTemplateScale)
    : PointPickerParameter(info), mIsTemplateScale(isTemplateScale) {}

void LinkedPointPickerParameter::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<CheckBoxControlChangedMessage>()) {
    SetLinked(changed->checked);
    return;
  }
  PointPickerParameter::ListenToMessage(message);
}

void LinkedPointPickerParameter::PositionSelf(int top, int depth, int width) {
  PointPickerParameter::PositionSelf(top, depth, width);
  if (mLink) {
    PlaceView(*mLink, Rect::FromSize(GetFieldsRight() + 8, top + 3, 80, 14));
  }
}

bool LinkedPointPickerParameter::IsLinked() const {
  if (!GetComponent()) {
    return mIsTemplateScale;
  }
  return GetComponent()->GetExpansionProperties().GetBool(GetLinkedPropertyKey(), mIsTemplateScale);
}

void LinkedPointPickerParameter::SetLinked(bool linked) {
  if (GetComponent()) {
    GetComponent()->GetExpansionProperties().SetBool(GetLinkedPropertyKey(), linked);
  }
  if (mLink) {
    mLink->SetChecked(IsLinked());
  }
}

ParamPoint LinkedPointPickerParameter::MakePoint(const ParamPoint& current, bool isX,
                                                 double value) const {
  if (!IsLinked()) {
    return PointPickerParameter::MakePoint(current, isX, value);
  }
  const double from = isX ? current.x : current.y;
  const double other = isX ? current.y : current.x;
  // From zero no factor exists; the other coordinate then takes the same value.
  const double scaled = from != 0.0 ? other * (value / from) : value;
  ParamPoint point;
  (isX ? point.x : point.y) = value;
  (isX ? point.y : point.x) = std::isfinite(scaled) ? scaled : other;
  return point;
}

void LinkedPointPickerParameter::CreateControlsSelf() {
  PointPickerParameter::CreateControlsSelf();
  mLink = AdoptControl(std::make_shared<CheckBoxControl>(
      Rect{}, 0, "$$$/Vantile/Host/Rows/LinkedScale=Uniform", IsLinked()));
  if (mLink) {
    AddListener(mLink->GetStation(), *this);
  }
}

void LinkedPointPickerParameter::DestroyControlsSelf() {
  DestroyControl(mLink);
  PointPickerParameter::DestroyControlsSelf();
}

void LinkedPointPickerParameter::ShowControls(bool show) {
  PointPickerParameter::ShowControls(show);
  if (mLink) {
    mLink->SetVisible(show);
  }
}

void LinkedPointPickerParameter::UpdateControlsEnabled(bool enabled) {
  PointPickerParameter::UpdateControlsEnabled(enabled);
  if (mLink) {
    mLink->SetEnabled(enabled);
  }
}

std::string LinkedPointPickerParameter::GetLinkedPropertyKey() const {
  const std::size_t index =
      GetComponent() && GetParam() ? GetComponent()->GetParamIndex(GetParam().get()) : 0;
  return std::string(kLinkedPropertyPrefix) + "." + std::to_string(index);
}
