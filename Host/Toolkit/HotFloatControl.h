#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "Host/Toolkit/HotTextControl.h"

// A number as hot text (see HotTextControl for the gestures): scrubbing reports
// HotFloatControlChangingMessage for every new value and HotFloatControlChangedMessage at the
// release; typing, Up and Down report one HotFloatControlChangedMessage. Each message carries the
// value (as float) and the owner cookie. Values are clamped to [minimum, maximum] and rounded to
// the digits shown, so what is reported is what the user sees. SetValue sends nothing.
//
// Scrubbing moves the value by one increment per unit. Exponential controls (with a finite
// range) scrub a position p in [0, 1] instead, value = min + (max - min) x p^exponent, one
// increment per unit in p's scale, so an exponent above 1 gives fine steps near the minimum.
//
// Typed text: a number with '.' or ',' as the decimal mark, an optional sign, blanks around,
// and optionally the appended symbol after it; the minimum-value string stands for the minimum.
class HotFloatControl : public HotTextControl {
 public:
  static constexpr int kMaxDigits = 10;

  explicit HotFloatControl(const Rect& bounds, double value = 0.0, Commander* commander = nullptr);

  // Clamped and rounded like a user's value; NaN is refused with a debug assertion.
  // `redraw` false leaves the view as painted (the owner repaints later). Sends nothing.
  void SetValue(double value, bool redraw = true);
  double GetValue() const { return mValue; }

  // The range; the current value is clamped into it. With minimum > maximum the minimum wins.
  void SetMinValue(double minimum);
  void SetMaxValue(double maximum);
  double GetMinValue() const { return mMin; }
  double GetMaxValue() const { return mMax; }
  // The step of one scrub unit and of Up/Down; non-positive or NaN increments are refused.
  void SetValueIncrement(double increment);
  double GetValueIncrement() const { return mIncrement; }
  // Digits shown (and kept) after the decimal mark, 0 to kMaxDigits.
  void SetDigitsPastDecimal(int digits);
  int GetDigitsPastDecimal() const { return mDigits; }
  // Exponent must be finite and above 0 (else refused); false switches back to linear.
  void SetExponential(bool exponential, double exponent);
  bool IsExponential() const { return mExponential; }
  double GetExponent() const { return mExponent; }
  // Shown instead of the number while the value is at the minimum (e.g. "-∞"); empty: none.
  void SetMinimumValueString(std::string text);
  const std::string& GetMinimumValueString() const { return mMinimumString; }
  // Text after the number, e.g. "%", "°", " dB"; empty: none.
  void SetAppendedSymbol(std::string symbol);
  const std::string& GetAppendedSymbol() const { return mSymbol; }

  std::string GetDisplayText() const override;
  // The number `text` stands for (clamped and rounded), or nullopt when it cannot be read.
  std::optional<double> ParseText(std::string_view text) const;
  // The number as shown, without the symbol.
  std::string FormatNumber(double value) const;

 protected:
  std::string InitialEditTextSelf() const override;
  bool CommitTextSelf(std::string_view text) override;
  void BeginScrubSelf() override;
  void ScrubSelf(double units) override;
  void EndScrubSelf() override;
  void StepSelf(double units) override;

 private:
  double Normalize(double value) const;
  bool UsesExponentialScrub() const;
  // Sets the value from a gesture; true when it changed.
  bool ApplyUserValue(double value);
  void SendChanging() const;
  void SendChanged() const;

  double mValue = 0.0;
  double mMin;
  double mMax;
  double mIncrement = 1.0;
  int mDigits = 2;
  bool mExponential = false;
  double mExponent = 1.0;
  std::string mMinimumString;
  std::string mSymbol;
  double mScrubStartValue = 0.0;
  bool mSentChanging = false;
};
