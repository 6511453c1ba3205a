#include "Host/Toolkit/HotFloatControl.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <limits>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ControlMessages.h"

namespace {

// Messages carry floats; a double beyond float's range would be undefined to convert.
float ToMessageFloat(double value) {
  constexpr double kLargest = std::numeric_limits<float>::max();
  return static_cast<float>(std::clamp(value, -kLargest, kLargest));
}

std::string_view Trim(std::string_view text) {
  const auto blank = [](char c) { return c == ' ' || c == '\t'; };
  while (!text.empty() && blank(text.front())) {
    text.remove_prefix(1);
  }
  while (!text.empty() && blank(text.back())) {
    text.remove_suffix(1);
  }
  return text;
}

}  // namespace

HotFloatControl::HotFloatControl(const Rect& bounds, double value, Commander* commander)
    : HotTextControl("HotFloatControl", commander),
      mMin(std::numeric_limits<double>::lowest()),
      mMax(std::numeric_limits<double>::max()) {
  SetBounds(bounds);
  SetValue(value, false);
}

double HotFloatControl::Normalize(double value) const {
  const double scale = std::pow(10.0, mDigits);
  double rounded = value;
  if (std::abs(value) * scale < 1e15) {
    rounded = std::round(value * scale) / scale;
  }
  rounded = std::max(mMin, std::min(rounded, mMax));
  return rounded == 0.0 ? 0.0 : rounded;  // no "-0"
}

void HotFloatControl::SetValue(double value, bool redraw) {
  if (!HOST_VERIFY(!std::isnan(value), "Invalid value")) {
    return;
  }
  const double normalized = Normalize(value);
  if (normalized != mValue) {
    mValue = normalized;
    if (redraw) {
      Invalidate();
    }
  }
}

void HotFloatControl::SetMinValue(double minimum) {
  if (!HOST_VERIFY(!std::isnan(minimum), "Invalid minimum")) {
    return;
  }
  mMin = minimum;
  SetValue(mValue);
}

void HotFloatControl::SetMaxValue(double maximum) {
  if (!HOST_VERIFY(!std::isnan(maximum), "Invalid maximum")) {
    return;
  }
  mMax = maximum;
  SetValue(mValue);
}

void HotFloatControl::SetValueIncrement(double increment) {
  if (HOST_VERIFY(increment > 0.0 && std::isfinite(increment), "Invalid increment")) {
    mIncrement = increment;
  }
}

void HotFloatControl::SetDigitsPastDecimal(int digits) {
  mDigits = std::clamp(digits, 0, kMaxDigits);
  SetValue(mValue);
  Invalidate();
}

void HotFloatControl::SetExponential(bool exponential, double exponent) {
  if (!exponential) {
    mExponential = false;
    return;
  }
  if (HOST_VERIFY(exponent > 0.0 && std::isfinite(exponent), "Invalid exponent")) {
    mExponential = true;
    mExponent = exponent;
  }
}

void HotFloatControl::SetMinimumValueString(std::string text) {
  mMinimumString = std::move(text);
  Invalidate();
}

void HotFloatControl::SetAppendedSymbol(std::string symbol) {
  mSymbol = std::move(symbol);
  Invalidate();
}

std::string HotFloatControl::FormatNumber(double value) const {
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%.*f", mDigits, value);
  std::string text(buffer);
  if (text.find_first_not_of("-0.") == std::string::npos && text.front() == '-') {
    text.erase(0, 1);  // "-0.00" reads as zero
  }
  return text;
}

std::string HotFloatControl::GetDisplayText() const {
  if (!mMinimumString.empty() && mValue <= mMin) {
    return mMinimumString;
  }
  return FormatNumber(mValue) + mSymbol;
}

std::string HotFloatControl::InitialEditTextSelf() const {
  if (!mMinimumString.empty() && mValue <= mMin) {
    return mMinimumString;
  }
  return FormatNumber(mValue);
}

std::optional<double> HotFloatControl::ParseText(std::string_view text) const {
  text = Trim(text);
  if (!mMinimumString.empty() && text == Trim(mMinimumString)) {
    return mMin;
  }
  const std::string_view symbol = Trim(mSymbol);
  if (!symbol.empty() && text.size() > symbol.size() && text.ends_with(symbol)) {
    text = Trim(text.substr(0, text.size() - symbol.size()));
  }
  bool negative = false;
  if (!text.empty() && (text.front() == '+' || text.front() == '-')) {
    negative = text.front() == '-';
    text.remove_prefix(1);
  }
  // Only digits and one decimal mark: no exponents, "inf" or "nan", no second sign.
  std::string number;
  bool mark = false;
  for (const char c : text) {
    if (c >= '0' && c <= '9') {
      number.push_back(c);
    } else if ((c == '.' || c == ',') && !mark) {
      mark = true;
      number.push_back('.');
    } else {
      return std::nullopt;
    }
  }
  if (number.empty() || number == ".") {
    return std::nullopt;
  }
  double value = 0.0;
  const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), value);
  if (error != std::errc() || end != number.data() + number.size() || !std::isfinite(value)) {
    return std::nullopt;
  }
  return Normalize(negative ? -value : value);
}

bool HotFloatControl::CommitTextSelf(std::string_view text) {
  const std::optional<double> value = ParseText(text);
  if (!value) {
    return false;
  }
  if (ApplyUserValue(*value)) {
    SendChanged();
  }
  return true;
}

bool HotFloatControl::UsesExponentialScrub() const {
  return mExponential && std::isfinite(mMax - mMin) && mMax > mMin;
}

bool HotFloatControl::ApplyUserValue(double value) {
  const double normalized = Normalize(value);
  if (normalized == mValue) {
    return false;
  }
  mValue = normalized;
  Invalidate();
  return true;
}

void HotFloatControl::BeginScrubSelf() {
  mScrubStartValue = mValue;
  mSentChanging = false;
}

void HotFloatControl::ScrubSelf(double units) {
  double value = mScrubStartValue + units * mIncrement;
  if (UsesExponentialScrub()) {
    const double range = mMax - mMin;
    const double start = std::clamp((mScrubStartValue - mMin) / range, 0.0, 1.0);
    const double position = std::pow(start, 1.0 / mExponent) + units * mIncrement / range;
    value = mMin + range * std::pow(std::clamp(position, 0.0, 1.0), mExponent);
  }
  if (ApplyUserValue(value)) {
    mSentChanging = true;
    SendChanging();
  }
}

void HotFloatControl::EndScrubSelf() {
  if (mSentChanging) {
    mSentChanging = false;
    SendChanged();
  }
}

void HotFloatControl::StepSelf(double units) {
  if (ApplyUserValue(mValue + units * mIncrement)) {
    SendChanged();
  }
}

void HotFloatControl::SendChanging() const {
  Broadcast(HotFloatControlChangingMessage(ToMessageFloat(mValue), GetOwnerCookie()));
}

void HotFloatControl::SendChanged() const {
  Broadcast(HotFloatControlChangedMessage(ToMessageFloat(mValue), GetOwnerCookie()));
}
