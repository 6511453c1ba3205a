#pragma once

// The current handle values of a tonal range-definition control (shadows and highlights), as
// its limiter reads them. The control implements it; the limiter holds a non-owning pointer.
class TonalRangeValues {
 public:
  virtual ~TonalRangeValues() = default;

  virtual float GetMinValue() const = 0;
  virtual float GetMaxValue() const = 0;
  virtual float GetShadowThreshold() const = 0;
  virtual float GetHighlightThreshold() const = 0;
};
