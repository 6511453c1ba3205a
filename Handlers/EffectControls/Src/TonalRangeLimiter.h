#pragma once

#include <optional>

#include "Host/Rows/DoubleSliderLimiter.h"

class TonalRangeValues;

// Keeps the handles of a tonal range definition (shadows and highlights) in order:
//   1     between the minimum and the maximum less the shadow threshold
//   2, 3  between the minimum and the highlight threshold
//   4     between the shadow threshold and the maximum
// Other handles have no bounds.
class TonalRangeLimiter : public DoubleSliderLimiter {
 public:
  // `values`: the range control, not owned; it outlives the limiter.
  explicit TonalRangeLimiter(const TonalRangeValues* values);

  std::optional<Bounds> GetBounds(int handleID) const override;

 private:
  const TonalRangeValues* mValues;  // not owned; see the constructor
};
