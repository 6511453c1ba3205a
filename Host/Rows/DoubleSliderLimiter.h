#pragma once

#include <optional>

#include "Host/Rows/Limiter.h"

// A limiter whose bounds come from a range control's current handle values: for each handle a
// lower bound L and an upper bound U. A value below L becomes L, else one above U becomes U.
// When the bounds cross (L > U) no value passes unchanged: one below L becomes L and any other
// becomes U. Subclasses name the bounds of each handle they answer for.
class DoubleSliderLimiter : public Limiter {
 public:
  struct Bounds {
    float lower = 0.0f;
    float upper = 0.0f;
  };

  float Limit(int handleID, float value, bool& clamped) const override;

  // The bounds of `handleID` as the control stands now; nullopt for a handle without bounds.
  virtual std::optional<Bounds> GetBounds(int handleID) const = 0;
};
