#include "Host/Rows/DoubleSliderParameter.h"

#include "Host/Rows/Limiter.h"

DoubleSliderParameter::DoubleSliderParameter(const ParameterControlInfo& info)
    : FloatSliderParameter(info) {}

bool DoubleSliderParameter::RegisterLimiter(EffectItem& row, int handleID,
                                            const std::shared_ptr<const Limiter>& limiter) {
  auto* slider = dynamic_cast<DoubleSliderParameter*>(&row);
  if (slider == nullptr) {
    return false;
  }
  slider->SetLimiter(handleID, limiter);
  return true;
}

void DoubleSliderParameter::SetLimiter(int handleID,
                                       const std::shared_ptr<const Limiter>& limiter) {
  mHandleID = handleID;
  mLimiter = limiter;
}

double DoubleSliderParameter::Limit(double value, bool& clamped) const {
  clamped = false;
  const std::shared_ptr<const Limiter> limiter = mLimiter.lock();
  if (!limiter) {
    return value;
  }
  return limiter->Limit(mHandleID, static_cast<float>(value), clamped);
}

void DoubleSliderParameter::OnSliderValueChanging(float value, bool toModel) {
  bool clamped = false;
  FloatSliderParameter::OnSliderValueChanging(static_cast<float>(Limit(value, clamped)), toModel);
}

void DoubleSliderParameter::OnSliderValueChanged(float value, bool toModel) {
  bool clamped = false;
  FloatSliderParameter::OnSliderValueChanged(static_cast<float>(Limit(value, clamped)), toModel);
}
