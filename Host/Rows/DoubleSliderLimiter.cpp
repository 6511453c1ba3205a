#include "Host/Rows/DoubleSliderLimiter.h"

#include <cmath>

float DoubleSliderLimiter::Limit(int handleID, float value, bool& clamped) const {
  clamped = false;
  const std::optional<Bounds> bounds = GetBounds(handleID);
  if (!bounds || std::isnan(value)) {
    return value;
  }
  if (bounds->lower > value) {
    clamped = true;
    return bounds->lower;
  }
  if (value > bounds->upper) {
    clamped = true;
    return bounds->upper;
  }
  return value;
}
