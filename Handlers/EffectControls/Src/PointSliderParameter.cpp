#include "Handlers/EffectControls/Src/PointSliderParameter.h"

#include <cmath>
#include <variant>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/Sequence.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"

PointSliderParameter::PointSliderParameter(const ParameterControlInfo& info, Coordinate coordinate)
    : SliderParameter(info), mCoordinate(coordinate) {}

int PointSliderParameter::SliderMinimumFor(int extent) {
  return static_cast<int>(std::trunc(-0.5 * extent));
}

int PointSliderParameter::SliderMaximumFor(int extent) {
  return static_cast<int>(std::trunc(1.5 * extent));
}

void PointSliderParameter::SynchToCurrentTime() {
  const double value = ReadValue();
  mCachedValue = static_cast<float>(value);
  mCachedTime = GetEditTime();
  ShowValue(value);
  UpdateCurrentVelocity();
}

void PointSliderParameter::RefreshSliderParameters() {
  const ComponentParamRef& param = GetParam();
  if (!param) {
    return;
  }
  const int extent = GetFrameExtent();
  mSliderMinimum = mHotTextMinimum = SliderMinimumFor(extent);
  mSliderMaximum = mHotTextMaximum = SliderMaximumFor(extent);
  mMinimum = param->GetMinimum();
  mMaximum = param->GetMaximum();
  mValueIncrement = param->GetStep();
  mExponential = param->IsExponential();
  mExponent = param->GetExponent();
  if (mExponential) {
    mValueIncrement = static_cast<double>(0.1f);
  }
  if (FloatSliderControl* slider = GetSlider()) {
    slider->SetMaxValue(static_cast<float>(mSliderMaximum));
    slider->SetMinValue(static_cast<float>(mSliderMinimum));
    slider->SetExponential(mExponential, mExponent);
  }
  if (HotFloatControl* field = GetHotText()) {
    field->SetMaxValue(mMaximum);
    field->SetMinValue(mMinimum);
    if (mValueIncrement > 0.0) {
      field->SetValueIncrement(mValueIncrement);
    }
    field->SetAppendedSymbol(param->GetUnits() == ParamUnits::Percent ? "%" : "");
    field->SetDigitsPastDecimal(GetDisplayDigits());
    field->SetExponential(mExponential, mExponent);
  }
  SetRangeLabels(FormatNumber(mSliderMinimum, 0), FormatNumber(mSliderMaximum, 0));
  SynchToCurrentTime();
}

double PointSliderParameter::ReadValue() const {
  const ParamValue value = GetValueAtEditTime();
  const auto* point = std::get_if<ParamPoint>(&value);
  if (point == nullptr) {
    return 0.0;
  }
  return mCoordinate == Coordinate::X ? point->x : point->y;
}

ParamValue PointSliderParameter::ToParamValue(double value) const {
  // The other coordinate as the model holds it at the edit time, so a write never moves it.
  const ParamValue current = GetValueAtEditTime();
  ParamPoint point;
  if (const auto* held = std::get_if<ParamPoint>(&current)) {
    point = *held;
  }
  (mCoordinate == Coordinate::X ? point.x : point.y) = value;
  return point;
}

int PointSliderParameter::GetFrameExtent() const {
  const Sequence::FrameSize size =
      GetSequence() ? GetSequence()->GetFrameSize() : Sequence::FrameSize{};
  return mCoordinate == Coordinate::X ? size.width : size.height;
}
