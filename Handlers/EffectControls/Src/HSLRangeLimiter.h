#pragma once

#include <optional>

#include "Host/Rows/DoubleSliderLimiter.h"

class HSLRangeValues;

// Keeps the four handles of a hue, saturation or luma range definition in order. The three
// limiters share this rule and differ only in the handle numbers they answer to: the first
// handle f (5 hue, 9 saturation, 13 luma) and the three after it.
//   f      between the minimum and the start threshold
//   f + 1  between the start softness and the end threshold
//   f + 2  between the minimum and the maximum less the end threshold
//   f + 3  between the start threshold and the maximum less the end softness
// Other handles have no bounds.
class HSLRangeLimiter : public DoubleSliderLimiter {
 public:
  std::optional<Bounds> GetBounds(int handleID) const override;
  int GetFirstHandle() const { return mFirstHandle; }

 protected:
  // `values`: the range control, which outlives the limiter (both belong to one group row).
  HSLRangeLimiter(const HSLRangeValues* values, int firstHandle);

 private:
  const HSLRangeValues* mValues;  // not owned; see the constructor
  int mFirstHandle;
};
