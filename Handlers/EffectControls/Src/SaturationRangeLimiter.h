#pragma once

#include "Handlers/EffectControls/Src/HSLRangeLimiter.h"

// The saturation range definition's limiter: handles 9 to 12 (see HSLRangeLimiter).
class SaturationRangeLimiter : public HSLRangeLimiter {
 public:
  static constexpr int kFirstHandle = 9;
  // `values`: the range control, not owned; it outlives the limiter.
  explicit SaturationRangeLimiter(const HSLRangeValues* values);
};
