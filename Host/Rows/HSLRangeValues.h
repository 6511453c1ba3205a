#pragma once

// The current handle values of a hue, saturation or luma range-definition control, as the
// limiters that keep its handles in order read them. The control implements it; a limiter holds
// a non-owning pointer to it.
class HSLRangeValues {
 public:
  virtual ~HSLRangeValues() = default;

  virtual float GetMinValue() const = 0;
  virtual float GetMaxValue() const = 0;
  virtual float GetStartThreshold() const = 0;
  virtual float GetStartSoftness() const = 0;
  virtual float GetEndThreshold() const = 0;
  virtual float GetEndSoftness() const = 0;
};
