#include "Handlers/EffectControls/Src/AudioFloatSliderParameter.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"

namespace {

std::shared_ptr<const AudioFilterParamInfo> RequireAudioInfo(const ComponentRef& component) {
  std::shared_ptr<const AudioFilterParamInfo> info =
      component ? AudioFilterParamInfo::ForComponent(*component) : nullptr;
  if (!info) {
    throw NullInterfaceException("AudioFilterParamInfo");
  }
  return info;
}

// Position of the parameter in its component from 0; "none" when it is not the component's.
std::uint32_t ParamIndexOf(const ParameterControlInfo& info) {
  const std::size_t oneBased =
      info.component && info.param ? info.component->GetParamIndex(info.param.get()) : 0;
  return static_cast<std::uint32_t>(oneBased) - 1u;
}

}  // namespace

AudioFloatSliderParameter::AudioFloatSliderParameter(const ParameterControlInfo& info)
    : FloatSliderParameter(info),
      mAudioInfo(RequireAudioInfo(info.component)),
      mParamIndex(ParamIndexOf(info)) {
  mAudioInfo->GetParamDisplayInfo(mParamIndex, mDisplayInfo);
}

void AudioFloatSliderParameter::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<ParamChangedMessage>()) {
    if (changed->param && changed->param == GetParam()) {
      InvalidateCachedValue();
    }
    ParameterControl::OnParamChanged(changed->param);
    return;
  }
  FloatSliderParameter::ListenToMessage(message);
}

void AudioFloatSliderParameter::RefreshSliderParameters() {
  if (!GetParam()) {
    return;
  }
  const AudioParamDisplayInfo& display = mDisplayInfo;
  mHotTextMaximumF = mSliderMaximumF = display.maximum;
  mHotTextMinimumF = mSliderMinimumF = display.minimum;
  mMinimum = display.minimum;
  mMaximum = display.maximum;
  mValueIncrement = display.increment;
  switch (display.displayMode) {
    case AudioFilterParamInfo::kDisplayModeFader:
      mExponential = true;
      mExponent = kFaderExponent;
      break;
    case AudioFilterParamInfo::kDisplayModeFrequency:
      mExponential = true;
      mExponent = kFrequencyExponent;
      mValueIncrement = 0.1;
      break;
    default:
      mExponential = false;
      mExponent = 1.0;
      break;
  }

  const int digits = GetDisplayDigits();
  std::string minimumLabel = FormatNumber(display.minimum, digits);
  const std::string unitText = GetUnitText();
  if (HotFloatControl* field = GetHotText()) {
    if (mValueIncrement > 0.0) {
      field->SetValueIncrement(mValueIncrement);
    }
    field->SetDigitsPastDecimal(digits);
    field->SetMaxValue(display.maximum);
    field->SetMinValue(display.minimum);
    field->SetExponential(mExponential, mExponent);
    field->SetMinimumValueString(
        display.displayMode == AudioFilterParamInfo::kDisplayModeFader ? kMinusInfinityText : "");
    if (!unitText.empty()) {
      field->SetHorizontalTextAlignment(0);
    }
    // The effect's unit replaces the one the parameter's units would give.
    field->SetAppendedSymbol(unitText);
  }
  if (FloatSliderControl* slider = GetSlider()) {
    slider->SetMaxValue(display.maximum);
    slider->SetMinValue(display.minimum);
    slider->SetExponential(mExponential, mExponent);
  }
  if (display.displayMode == AudioFilterParamInfo::kDisplayModeFader) {
    minimumLabel = kMinusInfinityText;
  }
  SetRangeLabels(std::move(minimumLabel), FormatNumber(display.maximum, digits));
  InvalidateCachedValue();
  SynchToCurrentTime();
}

int AudioFloatSliderParameter::GetHotTextPaddingWidth() const {
  const std::string unit = GetUnitText();
  // Characters, not bytes: "°" is one.
  const auto length = std::count_if(unit.begin(), unit.end(), [](char c) {
    return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
  });
  if (length == 0) {
    return 0;
  }
  return length <= 2 ? 4 : 30;
}

std::string AudioFloatSliderParameter::GetValueText(double value) const {
  if (mDisplayInfo.displayMode == AudioFilterParamInfo::kDisplayModeFader &&
      value <= mDisplayInfo.minimum) {
    return kMinusInfinityText;
  }
  return FloatSliderParameter::GetValueText(value);
}

std::string AudioFloatSliderParameter::GetUnitText() const {
  return mAudioInfo->GetUnitText(mParamIndex);
}

double AudioFloatSliderParameter::ReadValue() const {
  const double stored = FloatSliderParameter::ReadValue();
  return mDisplayInfo.valueMapping ? mAudioInfo->MapValueToDisplay(mParamIndex, stored) : stored;
}

ParamValue AudioFloatSliderParameter::ToParamValue(double value) const {
  if (!mDisplayInfo.valueMapping) {
    return value;
  }
  // A fader's bottom reads minus infinity and means the lowest the effect knows, whatever
  // rounding the field did on the way.
  if (mDisplayInfo.displayMode == AudioFilterParamInfo::kDisplayModeFader &&
      value <= mDisplayInfo.minimum) {
    value = -std::numeric_limits<double>::infinity();
  }
  return mAudioInfo->MapDisplayToValue(mParamIndex, value);
}

int AudioFloatSliderParameter::GetDisplayDigits() const {
  if (mDisplayInfo.displayMode == AudioFilterParamInfo::kDisplayModeFine) {
    return 3;
  }
  return FloatSliderParameter::GetDisplayDigits();
}
