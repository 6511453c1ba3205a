#pragma once

#include <memory>

#include "Host/Rows/FloatSliderParameter.h"

class Limiter;

// The row of a double-precision parameter (types 8 and 21). A group row that keeps several such
// rows consistent (the handles of a range control) registers a limiter on each with the handle
// the row stands for; a value the user sets in the row is then passed through the limiter, and
// the clamped value is the one written and shown.
class DoubleSliderParameter : public FloatSliderParameter {
 public:
  explicit DoubleSliderParameter(const ParameterControlInfo& info);

  // Registers `limiter` on `row` for `handleID`; false (nothing registered) when the row is no
  // DoubleSliderParameter. The row does not own the limiter: it stops using it when the owner
  // lets it go.
  static bool RegisterLimiter(EffectItem& row, int handleID,
                              const std::shared_ptr<const Limiter>& limiter);
  void SetLimiter(int handleID, const std::shared_ptr<const Limiter>& limiter);
  bool HasLimiter() const { return !mLimiter.expired(); }
  int GetLimiterHandle() const { return mHandleID; }
  // `value` as the limiter lets it be (unchanged without one); `clamped` says whether it moved.
  double Limit(double value, bool& clamped) const;

  // The value at the edit time, at full precision.
  double GetValue() const { return ReadValue(); }

  void OnSliderValueChanging(float value, bool toModel) override;
  void OnSliderValueChanged(float value, bool toModel) override;

 private:
  std::weak_ptr<const Limiter> mLimiter;
  int mHandleID = 0;
};
