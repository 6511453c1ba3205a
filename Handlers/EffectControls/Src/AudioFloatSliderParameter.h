#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "Host/Model/AudioFilterParamInfo.h"
#include "Host/Rows/FloatSliderParameter.h"

// The row of a scalar parameter of an audio effect. Range, step, digits, slider curve and unit
// text come from the effect's description of the parameter (AudioFilterParamInfo), not from
// the parameter: a gain is stored linear and shown in dB, from minus infinity to the headroom.
//
// Units: the number field, the slider and the range labels are in display units; the model
// holds the stored value. With the description's value mapping set, ReadValue maps stored ->
// shown and ToParamValue maps shown -> stored, so a typed or dragged dB value reaches the model
// as a linear gain through the base's edit contract (one undoable step per gesture).
class AudioFloatSliderParameter : public FloatSliderParameter {
 public:
  // The minimum label and the field's text at the minimum of a fader.
  static constexpr const char* kMinusInfinityText = "-\xE2\x88\x9E";
  // The curve of the numeric field and the slider of a fader. These controls map a position p in
  // [0, 1] to min + range * p^e; 0.5 puts 0 dB at three quarters of the travel, as on a mixing
  // console, and scrubs about 0.1 dB a pixel near it.
  static constexpr double kFaderExponent = 0.5;
  // Fine steps near the bottom of a frequency-like range.
  static constexpr double kFrequencyExponent = 4.0;

  // Throws NullInterfaceException when the row's component has no audio description (not an
  // audio effect).
  explicit AudioFloatSliderParameter(const ParameterControlInfo& info);

  // A ParamChangedMessage of the row's parameter forgets the cached value before the base
  // refreshes, so the next refresh reads the model again.
  void ListenToMessage(const Message& message) override;
  void RefreshSliderParameters() override;
  // Pixels the unit text takes beside the number: none 0, one or two characters 4, longer 30.
  int GetHotTextPaddingWidth() const override;

  std::uint32_t GetParamIndex() const { return mParamIndex; }
  const AudioParamDisplayInfo& GetDisplayInfo() const { return mDisplayInfo; }
  // The unit text the effect gives the parameter ("" for none).
  std::string GetUnitText() const;
  std::string GetSuffixText() const override { return GetUnitText(); }
  // The bottom of a fader reads minus infinity.
  std::string GetValueText(double value) const override;

 protected:
  // The stored value at the edit time, mapped for display when the description says so.
  double ReadValue() const override;
  // A shown value mapped back to the stored scale when the description says so.
  ParamValue ToParamValue(double value) const override;
  int GetDisplayDigits() const override;

 private:
  std::shared_ptr<const AudioFilterParamInfo> mAudioInfo;  // never null after construction
  std::uint32_t mParamIndex = 0xFFFFFFFF;
  AudioParamDisplayInfo mDisplayInfo;
};
