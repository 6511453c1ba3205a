#include "Handlers/EffectControls/Src/TonalRangeLimiter.h"

#include "Host/Rows/TonalRangeValues.h"

TonalRangeLimiter::TonalRangeLimiter(const TonalRangeValues* values) : mValues(values) {}

std::optional<DoubleSliderLimiter::Bounds> TonalRangeLimiter::GetBounds(int handleID) const {
  if (mValues == nullptr) {
    return std::nullopt;
  }
  const TonalRangeValues& v = *mValues;
  switch (handleID) {
    case 1:
      return Bounds{v.GetMinValue(), v.GetMaxValue() - v.GetShadowThreshold()};
    case 2:
    case 3:
      return Bounds{v.GetMinValue(), v.GetHighlightThreshold()};
    case 4:
      return Bounds{v.GetShadowThreshold(), v.GetMaxValue()};
    default:
      return std::nullopt;
  }
}
