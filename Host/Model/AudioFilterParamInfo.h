#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

class Component;
class ComponentParam;
class EffectCatalogue;

// How an audio effect wants one parameter's numbers shown: display mode, range and step of the
// controls (in display units), and whether the controls show a mapped value (for a gain: dB)
// rather than the stored one.
struct AudioParamDisplayInfo {
  std::uint32_t displayMode = 0xFFFFFFFF;  // kNoDisplayMode
  float maximum = 1.0f;
  float minimum = 0.0f;
  float increment = 0.0f;
  bool valueMapping = false;
};

// How a stored value becomes the value the controls show.
enum class AudioValueScale {
  Linear,    // shown as stored
  Decibels,  // a linear gain shown in dB (20 log10); 0 is the floor, shown as minus infinity
};

// An audio effect's description of one of its parameters.
struct AudioParamDescription {
  bool shown = true;  // false: the parameter has no row
  AudioParamDisplayInfo display;
  AudioValueScale scale = AudioValueScale::Linear;
  std::string unitText;  // appended to the number as it stands, e.g. " dB"; empty: none
};

// The audio effect's description of its parameters, one per parameter position (0-based, in the
// component's parameter order). Immutable once made; shared by the rows that read it. Indices
// past the last parameter are not described: they are not shown, map values unchanged and have
// no unit text.
class AudioFilterParamInfo {
 public:
  static constexpr std::uint32_t kNoDisplayMode = 0xFFFFFFFF;
  // A fader: dB from minus infinity to the headroom, fine steps near the top.
  static constexpr std::uint32_t kDisplayModeFader = 1;
  // A frequency-like range, fine steps near the bottom.
  static constexpr std::uint32_t kDisplayModeFrequency = 2;
  // Linear with three digits after the decimal point.
  static constexpr std::uint32_t kDisplayModeFine = 3;

  // Gains at or below this level are silence: shown as minus infinity, stored as 0.
  static constexpr double kGainFloorDecibels = -96.0;
  // The most a gain can raise the level.
  static constexpr double kGainHeadroomDecibels = 15.0;

  explicit AudioFilterParamInfo(std::vector<AudioParamDescription> params);

  // The description of `component`'s parameters: for each one the description the catalogue
  // holds for the effect's match name and the parameter's name, else the one the parameter
  // implies (Describe). Null for a component that is not audio.
  static std::shared_ptr<const AudioFilterParamInfo> ForComponent(const Component& component);
  static std::shared_ptr<const AudioFilterParamInfo> ForComponent(const Component& component,
                                                                  const EffectCatalogue& catalogue);
  // What a parameter implies by itself: a gain is a fader in dB from the floor to the headroom;
  // another number is linear over its range with its step, precision and unit; anything else is
  // shown as stored.
  static AudioParamDescription Describe(const ComponentParam& param);

  std::size_t GetParamCount() const { return mParams.size(); }
  bool IsParamShown(std::uint32_t index) const;
  // Fills `info`; false, leaving it untouched, for an index not described.
  bool GetParamDisplayInfo(std::uint32_t index, AudioParamDisplayInfo& info) const;
  // Stored value -> shown value and back; inverses of each other above the floor. A gain of NaN
  // shows as the floor; a shown NaN stays NaN (the parameter refuses it).
  double MapValueToDisplay(std::uint32_t index, double value) const;
  double MapDisplayToValue(std::uint32_t index, double displayValue) const;
  std::string GetUnitText(std::uint32_t index) const;

  // 20 log10(gain), not below the floor (0 and negative gains give the floor).
  static double GainToDecibels(double gain);
  // 10^(dB / 20); at or below the floor 0 (silence).
  static double DecibelsToGain(double decibels);

 private:
  const AudioParamDescription* Find(std::uint32_t index) const;

  std::vector<AudioParamDescription> mParams;
};
