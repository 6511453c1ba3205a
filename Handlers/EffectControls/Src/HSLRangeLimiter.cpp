#include "Handlers/EffectControls/Src/HSLRangeLimiter.h"

#include "Host/Rows/HSLRangeValues.h"

HSLRangeLimiter::HSLRangeLimiter(const HSLRangeValues* values, int firstHandle)
    : mValues(values), mFirstHandle(firstHandle) {}

std::optional<DoubleSliderLimiter::Bounds> HSLRangeLimiter::GetBounds(int handleID) const {
  if (mValues == nullptr) {
    return std::nullopt;
  }
  const HSLRangeValues& v = *mValues;
  switch (handleID - mFirstHandle) {
    case 0:
      return Bounds{v.GetMinValue(), v.GetStartThreshold()};
    case 1:
      return Bounds{v.GetStartThreshold() - (v.GetStartThreshold() - v.GetStartSoftness()),
                    v.GetEndThreshold()};
    case 2:
      return Bounds{v.GetMinValue(), v.GetMaxValue() - v.GetEndThreshold()};
    case 3:
      return Bounds{v.GetStartThreshold(), v.GetMaxValue() - v.GetEndSoftness()};
    default:
      return std::nullopt;
  }
}
