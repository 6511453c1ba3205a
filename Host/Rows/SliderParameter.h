#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "Host/Rows/ParameterControl.h"

class FloatSliderControl;
class HotFloatControl;
class Static;

// The row of a numeric parameter: a number field (hot text: drag or type) in the value column
// and, while the row is expanded, a slider under it with the ends of its range printed below.
// The base of the float, double, angle and point rows.
//
// The controls report through messages; the row routes them to OnHotFloatControlChanging /
// Changed and OnFloatSliderControlChanging / Changed, which keep the other control in step and
// call OnSliderValueChanging (every step of a gesture) and OnSliderValueChanged (its end). The
// base implementations follow the edit contract: a gesture opens an edit at its first step,
// sets the value at every step (live, no undo step) and commits once at its end, so a drag is
// one undoable "MZ.ComponentParam.SetValue"; a typed value is one step too. This row edits a
// whole number (parameter type 1): values are rounded.
class SliderParameter : public ParameterControl {
 public:
  static constexpr int kHotTextWidth = 70;
  static constexpr int kHotTextHeight = 16;
  static constexpr int kSliderHeight = 16;
  static constexpr int kLabelHeight = 14;
  static constexpr int kControlAreaHeight = 40;

  explicit SliderParameter(const ParameterControlInfo& info);

  bool CanExpand() const override { return true; }
  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  // The name ends 10 pixels before the number field.
  int GetTitleRightEdge() const override;
  void SetControlID(int id) override;

  // Reads the value at the edit time into the field and the slider.
  void SynchToCurrentTime() override;
  // Reads range, digits, step, exponent and units from the parameter into the controls and
  // the labels, then shows the value.
  void RefreshSliderParameters() override;
  // Shows the value of `param` at the edit time without binding to it (feedback of another
  // parameter object); the next SynchToCurrentTime shows the row's own value again.
  virtual void SynchToFeedback(const ComponentParamRef& param);
  // Extra pixels the number field takes beyond its own width (a unit label).
  virtual int GetHotTextPaddingWidth() const { return 0; }

  // --- From the controls ---
  virtual void OnHotFloatControlChanging(float value, std::int32_t cookie);
  virtual void OnHotFloatControlChanged(float value, std::int32_t cookie);
  virtual void OnFloatSliderControlChanging(float value, std::int32_t cookie);
  virtual void OnFloatSliderControlChanged(float value, std::int32_t cookie);
  // A double click on the slider: the parameter goes back to its default value (one undoable
  // step).
  virtual void OnFloatSliderDoubleClicked(float value);
  // A step of a gesture and its end. `toModel` false only shows the value.
  virtual void OnSliderValueChanging(float value, bool toModel);
  virtual void OnSliderValueChanged(float value, bool toModel);

  HotFloatControl* GetHotText() const { return mHotText.get(); }
  FloatSliderControl* GetSlider() const { return mSlider.get(); }
  const std::string& GetMinLabel() const { return mMinLabelText; }
  const std::string& GetMaxLabel() const { return mMaxLabelText; }

  // `value` in fixed notation with `digits` after the decimal point ("-0" shows as "0").
  static std::string FormatNumber(double value, int digits);

 protected:
  int GetControlAreaHeight() const override { return kControlAreaHeight; }
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

  // The value at the edit time as the controls show it.
  virtual double ReadValue() const;
  // The parameter value for a value of the controls (rounded here).
  virtual ParamValue ToParamValue(double value) const;
  // Digits the field shows; 0 for this row.
  virtual int GetDisplayDigits() const { return 0; }
  // Whether the number field is shown (rows that show their value as text hide it).
  virtual bool ShowsHotText() const { return true; }
  // Puts `value` into the field and the slider (without messages).
  void ShowValue(double value);
  // The unit symbol the field appends for the parameter's units.
  std::string GetUnitsSymbol() const;
  void SetRangeLabels(std::string minimum, std::string maximum);

  // Range of the field and of the slider.
  int mHotTextMinimum = 0;
  int mHotTextMaximum = 0;
  int mSliderMinimum = 0;
  int mSliderMaximum = 0;
  // Field settings.
  double mValueIncrement = 1.0;
  double mMinimum = 0.0;
  double mMaximum = 0.0;
  double mExponent = 1.0;
  bool mExponential = false;

 private:
  std::shared_ptr<HotFloatControl> mHotText;
  std::shared_ptr<FloatSliderControl> mSlider;
  std::shared_ptr<Static> mMinLabel;
  std::shared_ptr<Static> mMaxLabel;
  std::string mMinLabelText;
  std::string mMaxLabelText;
};
