#pragma once

#include "Handlers/EffectControls/Src/HSLRangeLimiter.h"

// The hue range definition's limiter: handles 5 to 8 (see HSLRangeLimiter).
class HueRangeLimiter : public HSLRangeLimiter {
 public:
  static constexpr int kFirstHandle = 5;
  // `values`: the range control, not owned; it outlives the limiter.
  explicit HueRangeLimiter(const HSLRangeValues* values);
};
