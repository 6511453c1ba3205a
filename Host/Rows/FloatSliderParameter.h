#pragma once

#include <memory>
#include <string>

#include "Host/Rows/SliderParameter.h"

class Static;

// The row of a scalar parameter (float): number field and slider as SliderParameter, with the
// parameter's digits and without rounding to whole numbers. It caches the value it read and the
// edit time it read it at (kTime_Min: not read yet), and can show its value as text (a label in
// place of the number field) for parameters whose value reads better as words.
class FloatSliderParameter : public SliderParameter {
 public:
  explicit FloatSliderParameter(const ParameterControlInfo& info);

  void PositionSelf(int top, int depth, int width) override;
  // Reads the value into the cache and the controls; nothing changes when the controls show it
  // already.
  void SynchToCurrentTime() override;
  void RefreshSliderParameters() override;

  void SetShowValueAsText(bool showAsText);
  bool IsShowingValueAsText() const { return mShowValueAsText; }
  // In text mode: the value's text followed by the suffix text.
  virtual std::string GetValueText(double value) const;
  virtual std::string GetSuffixText() const;
  Static* GetValueLabel() const { return mValueLabel.get(); }

  float GetCachedValue() const { return mCachedValue; }
  TickTime GetCachedTime() const { return mCachedTime; }
  // Forgets the cache, so the next refresh reads the model again.
  void InvalidateCachedValue() { mCachedTime = kTime_Min; }

 protected:
  int GetDisplayDigits() const override;
  ParamValue ToParamValue(double value) const override { return value; }
  bool ShowsHotText() const override { return !mShowValueAsText; }
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

  // The four ranges as floats: field minimum and maximum, slider minimum and maximum.
  float mHotTextMinimumF = 0.0f;
  float mHotTextMaximumF = 0.0f;
  float mSliderMinimumF = 0.0f;
  float mSliderMaximumF = 0.0f;
  float mCachedValue = 0.0f;
  TickTime mCachedTime = kTime_Min;

 private:
  std::shared_ptr<Static> mValueLabel;
  bool mShowValueAsText = false;
};
