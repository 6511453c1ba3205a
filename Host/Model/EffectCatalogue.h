#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Host/Model/AudioFilterParamInfo.h"
#include "Host/Model/Component.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// Match names of the built-in effects.
inline constexpr const char* kMatchName_Motion = "XO.KRVN Motion";
inline constexpr const char* kMatchName_Opacity = "XO.KRVN Opacity";
inline constexpr const char* kMatchName_TimeRemapping = "XO.KRVN TimeRemapping";
inline constexpr const char* kMatchName_Volume = "XO.KRVN Volume";
inline constexpr const char* kMatchName_ChannelVolume = "XO.KRVN ChannelVolume";
inline constexpr const char* kMatchName_Panner = "XO.KRVN Panner";
inline constexpr const char* kMatchName_GaussianBlur = "XO.KRVN GaussianBlur";
inline constexpr const char* kMatchName_BrightnessContrast = "XO.KRVN BrightnessContrast";
inline constexpr const char* kMatchName_Crop = "XO.KRVN Crop";
inline constexpr const char* kMatchName_Tint = "XO.KRVN Tint";
inline constexpr const char* kMatchName_Timecode = "XO.KRVN Timecode";
inline constexpr const char* kMatchName_GridDistortion = "XO.KRVN GridDistortion";
inline constexpr const char* kMatchName_Delay = "XO.KRVN Delay";
inline constexpr const char* kMatchName_Mask = "XO.KRVN Mask";
inline constexpr const char* kMatchName_MatteFromTrack = "XO.KRVN MatteFromTrack";
inline constexpr const char* kMatchName_LumaCurve = "XO.KRVN LumaCurve";
inline constexpr const char* kMatchName_RGBCurves = "XO.KRVN RGBCurves";
inline constexpr const char* kMatchName_ColorBalanceWheel = "XO.KRVN ColorBalanceWheel";
inline constexpr const char* kMatchName_ThreeWayColor = "XO.KRVN ThreeWayColor";
inline constexpr const char* kMatchName_HueRange = "XO.KRVN HueRange";
inline constexpr const char* kMatchName_Levels = "XO.KRVN Levels";
inline constexpr const char* kMatchName_SaturationRange = "XO.KRVN SaturationRange";
inline constexpr const char* kMatchName_LumaRange = "XO.KRVN LumaRange";
inline constexpr const char* kMatchName_TonalRange = "XO.KRVN TonalRange";

// Positions (from 0) of the mask parameters the tracker works with.
inline constexpr std::size_t kMaskParamPath = 6;
inline constexpr std::size_t kMaskParamTrackingMethod = 11;

// The effects the host can create, by match name: templates that are cloned, never used in a
// chain themselves. Each template has preset 0 holding its defaults.
class EffectCatalogue {
 public:
  EffectCatalogue() = default;

  // The built-in effects: intrinsics (motion, opacity, time remapping; volume, channel volume,
  // panner), applied video and audio effects and the mask. Thread-safe to read.
  static const EffectCatalogue& Standard();

  // Adds a template, replacing one with the same match name. The catalogue adopts it.
  void Register(ComponentRef effectTemplate);
  // nullptr when unknown.
  const Component* FindTemplate(std::string_view matchName) const;
  // A fresh copy of the template (new ids), or nullptr when unknown.
  ComponentRef Create(std::string_view matchName) const;
  std::vector<std::string> GetMatchNames() const;
  // Fresh copies of the intrinsics every clip of the media type carries, in chain order.
  std::vector<ComponentRef> CreateIntrinsics(MediaType mediaType) const;

  // How an audio effect presents its parameter `paramName` where that differs from what the
  // parameter implies by itself (AudioFilterParamInfo::Describe); replaces an earlier one.
  void DescribeAudioParam(std::string_view matchName, std::string_view paramName,
                          AudioParamDescription description);
  // nullptr when the effect gives no description of its own for the parameter.
  const AudioParamDescription* FindAudioParamDescription(std::string_view matchName,
                                                         std::string_view paramName) const;

 private:
  struct AudioParamEntry {
    std::string matchName;
    std::string paramName;
    AudioParamDescription description;
  };

  std::vector<ComponentRef> mTemplates;
  std::vector<AudioParamEntry> mAudioParams;
};
