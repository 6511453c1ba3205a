#pragma once

#include "Handlers/EffectControls/Src/HSLRangeLimiter.h"

// The luma range definition's limiter: handles 13 to 16 (see HSLRangeLimiter).
class LumaRangeLimiter : public HSLRangeLimiter {
 public:
  static constexpr int kFirstHandle = 13;
  // `values`: the range control, not owned; it outlives the limiter.
  explicit LumaRangeLimiter(const HSLRangeValues* values);
};
