#include "Host/Model/AudioFilterParamInfo.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/ModelTypes.h"

AudioFilterParamInfo::AudioFilterParamInfo(std::vector<AudioParamDescription> params)
    : mParams(std::move(params)) {}

std::shared_ptr<const AudioFilterParamInfo> AudioFilterParamInfo::ForComponent(
    const Component& component) {
  return ForComponent(component, EffectCatalogue::Standard());
}

std::shared_ptr<const AudioFilterParamInfo> AudioFilterParamInfo::ForComponent(
    const Component& component, const EffectCatalogue& catalogue) {
  if (component.GetMediaType() != MediaType::Audio) {
    return nullptr;
  }
  std::vector<AudioParamDescription> params;
  params.reserve(component.GetParamCount());
  for (const ComponentParamRef& param : component.GetParams()) {
    const AudioParamDescription* given =
        catalogue.FindAudioParamDescription(component.GetMatchName(), param->GetName());
    params.push_back(given ? *given : Describe(*param));
  }
  return std::make_shared<const AudioFilterParamInfo>(std::move(params));
}

AudioParamDescription AudioFilterParamInfo::Describe(const ComponentParam& param) {
  AudioParamDescription description;
  if (param.GetValueKind() != ParamValueKind::Double) {
    return description;
  }
  AudioParamDisplayInfo& display = description.display;
  if (param.IsAudioGain()) {
    display.displayMode = kDisplayModeFader;
    display.minimum = static_cast<float>(kGainFloorDecibels);
    display.maximum = static_cast<float>(GainToDecibels(param.GetMaximum()));
    display.increment = 0.1f;
    display.valueMapping = true;
    description.scale = AudioValueScale::Decibels;
    description.unitText = " dB";
    return description;
  }
  display.minimum = static_cast<float>(param.GetMinimum());
  display.maximum = static_cast<float>(param.GetMaximum());
  display.increment = static_cast<float>(param.GetStep());
  description.unitText = UnitSymbol(param.GetUnits());
  return description;
}

const AudioParamDescription* AudioFilterParamInfo::Find(std::uint32_t index) const {
  return index < mParams.size() ? &mParams[index] : nullptr;
}

bool AudioFilterParamInfo::IsParamShown(std::uint32_t index) const {
  const AudioParamDescription* param = Find(index);
  return param != nullptr && param->shown;
}

bool AudioFilterParamInfo::GetParamDisplayInfo(std::uint32_t index,
                                               AudioParamDisplayInfo& info) const {
  const AudioParamDescription* param = Find(index);
  if (param == nullptr) {
    return false;
  }
  info = param->display;
  return true;
}

double AudioFilterParamInfo::MapValueToDisplay(std::uint32_t index, double value) const {
  const AudioParamDescription* param = Find(index);
  if (param == nullptr || param->scale == AudioValueScale::Linear) {
    return value;
  }
  return GainToDecibels(value);
}

double AudioFilterParamInfo::MapDisplayToValue(std::uint32_t index, double displayValue) const {
  const AudioParamDescription* param = Find(index);
  if (param == nullptr || param->scale == AudioValueScale::Linear) {
    return displayValue;
  }
  return DecibelsToGain(displayValue);
}

std::string AudioFilterParamInfo::GetUnitText(std::uint32_t index) const {
  const AudioParamDescription* param = Find(index);
  return param ? param->unitText : std::string();
}

double AudioFilterParamInfo::GainToDecibels(double gain) {
  // NaN and silence alike sit at the floor; +inf stays +inf for the caller to clamp.
  if (!(gain > 0.0)) {
    return kGainFloorDecibels;
  }
  return std::max(20.0 * std::log10(gain), kGainFloorDecibels);
}

double AudioFilterParamInfo::DecibelsToGain(double decibels) {
  if (std::isnan(decibels)) {
    return decibels;  // refused by the parameter, not taken as silence
  }
  if (!(decibels > kGainFloorDecibels)) {
    return 0.0;
  }
  return std::pow(10.0, decibels / 20.0);
}
