#include "Host/Model/EffectCatalogue.h"

#include <cmath>
#include <string>
#include <utility>

#include "Host/Model/ComponentParam.h"

namespace {

ComponentRef MakeEffect(const char* matchName, const char* name, MediaType mediaType,
                        bool intrinsic) {
  ComponentRef effect = Component::Create(matchName, name, mediaType, intrinsic);
  effect->SetPresets({ComponentPreset{"Default", {}}});
  effect->SetCurrentPreset(0);
  return effect;
}

ComponentParamRef Scalar(const char* name, double value, double minimum, double maximum,
                         int precision, ParamUnits units = ParamUnits::None,
                         ParamType type = ParamType::FloatSlider) {
  return ComponentParam::Create(name, type, value)
      ->SetRange(minimum, maximum)
      ->SetPrecision(precision)
      ->SetUnits(units);
}

ComponentParamRef Point(const char* name, double x, double y) {
  return ComponentParam::Create(name, ParamType::Point, ParamPoint{x, y})
      ->SetRange(-100000.0, 100000.0)
      ->SetPrecision(1)
      ->SetUnits(ParamUnits::Pixels);
}

ComponentParamRef Check(const char* name, bool value, bool canVary = true) {
  return ComponentParam::Create(name, ParamType::Checkbox, value)->SetCanVaryOverTime(canVary);
}

ComponentParamRef Menu(const char* name, std::vector<std::string> entries, bool canVary = true) {
  return ComponentParam::Create(name, ParamType::Menu, ParamChoice{0})
      ->SetMenuEntries(std::move(entries))
      ->SetCanVaryOverTime(canVary);
}

ComponentParamRef Color(const char* name, ParamColor value) {
  return ComponentParam::Create(name, ParamType::Color, value);
}

ComponentParamRef Group(const char* name, GroupKind kind = GroupKind::None,
                        ParamValue value = false) {
  return ComponentParam::Create(name, ParamType::GroupBegin, std::move(value))->SetGroupKind(kind);
}

ComponentParamRef GroupEnd() {
  return ComponentParam::Create("", ParamType::GroupEnd, false);
}

// Wide text as the rows read it: UTF-16 code units, low byte first (the texts here are ASCII).
ParamBlob TextBlob(std::string_view text) {
  ParamBlob blob;
  blob.bytes.reserve(text.size() * 2);
  for (const char c : text) {
    blob.bytes.push_back(static_cast<std::uint8_t>(c));
    blob.bytes.push_back(0);
  }
  return blob;
}

ComponentRef Motion() {
  ComponentRef effect = MakeEffect(kMatchName_Motion, "Motion", MediaType::Video, true);
  effect->AddParam(Point("Position", 960.0, 540.0));
  effect->AddParam(
      Scalar("Scale", 100.0, 0.0, 10000.0, 1, ParamUnits::Percent)->SetSliderRange(0.0, 100.0));
  ComponentParamRef scaleWidth = Scalar("Scale Width", 100.0, 0.0, 10000.0, 1, ParamUnits::Percent)
                                     ->SetSliderRange(0.0, 100.0);
  scaleWidth->SetEnabled(false);  // follows Uniform Scale
  effect->AddParam(scaleWidth);
  effect->AddParam(Check("Uniform Scale", true, false)->SetDisablesWhenOn({"Scale Width"}));
  effect->AddParam(Scalar("Rotation", 0.0, -1.0e6, 1.0e6, 1, ParamUnits::Degrees, ParamType::Angle)
                       ->SetSliderRange(-180.0, 180.0));
  effect->AddParam(Point("Anchor Point", 960.0, 540.0));
  effect->AddParam(Scalar("Anti-flicker Filter", 0.0, 0.0, 1.0, 2)->SetStep(0.01));
  return effect;
}

ComponentRef Opacity() {
  ComponentRef effect = MakeEffect(kMatchName_Opacity, "Opacity", MediaType::Video, true);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Scalar("Opacity", 100.0, 0.0, 100.0, 1, ParamUnits::Percent));
  effect->AddParam(Menu(
      "Blend Mode",
      {"Normal", "Dissolve", "Darken", "Multiply", "Lighten", "Screen", "Overlay", "Difference"},
      false));
  return effect;
}

ComponentRef TimeRemapping() {
  ComponentRef effect =
      MakeEffect(kMatchName_TimeRemapping, "Time Remapping", MediaType::Video, true);
  effect->SetRole(ComponentRole::TimeRemapping);
  effect->AddParam(
      Scalar("Speed", 100.0, -1000.0, 1000.0, 2, ParamUnits::Percent, ParamType::TimeRemapping)
          ->SetSliderRange(0.0, 200.0));
  return effect;
}

ComponentParamRef Gain(const char* name) {
  // Linear, from silence to the headroom; presented in dB.
  const double headroom = std::pow(10.0, AudioFilterParamInfo::kGainHeadroomDecibels / 20.0);
  return Scalar(name, 1.0, 0.0, headroom, 1, ParamUnits::Decibels)
      ->SetStep(0.01)
      ->SetAudioGain(true);
}

ComponentRef Volume() {
  ComponentRef effect = MakeEffect(kMatchName_Volume, "Volume", MediaType::Audio, true);
  effect->AddParam(Check("Bypass", false));
  effect->AddParam(Gain("Level"));
  return effect;
}

ComponentRef ChannelVolume() {
  ComponentRef effect =
      MakeEffect(kMatchName_ChannelVolume, "Channel Volume", MediaType::Audio, true);
  effect->AddParam(Check("Bypass", false));
  effect->AddParam(Gain("Left"));
  effect->AddParam(Gain("Right"));
  return effect;
}

ComponentRef Panner() {
  ComponentRef effect = MakeEffect(kMatchName_Panner, "Panner", MediaType::Audio, true);
  effect->AddParam(Scalar("Balance", 0.0, -100.0, 100.0, 1));
  return effect;
}

ComponentRef GaussianBlur() {
  ComponentRef effect =
      MakeEffect(kMatchName_GaussianBlur, "Gaussian Blur", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Scalar("Blurriness", 0.0, 0.0, 3000.0, 1)->SetSliderRange(0.0, 100.0));
  effect->AddParam(Menu("Blur Dimensions", {"Horizontal and Vertical", "Horizontal", "Vertical"}));
  effect->AddParam(Check("Repeat Edge Pixels", false));
  effect->SetPresets({ComponentPreset{"Default", {}}, ComponentPreset{"Soft", {{0, 10.0}}},
                      ComponentPreset{"Strong", {{0, 60.0}, {2, true}}}});
  return effect;
}

ComponentRef BrightnessContrast() {
  ComponentRef effect =
      MakeEffect(kMatchName_BrightnessContrast, "Brightness & Contrast", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Scalar("Brightness", 0.0, -100.0, 100.0, 1));
  effect->AddParam(Scalar("Contrast", 0.0, -100.0, 100.0, 1));
  return effect;
}

ComponentRef Crop() {
  ComponentRef effect = MakeEffect(kMatchName_Crop, "Crop", MediaType::Video, false);
  for (const char* edge : {"Left", "Top", "Right", "Bottom"}) {
    effect->AddParam(Scalar(edge, 0.0, 0.0, 100.0, 1, ParamUnits::Percent));
  }
  effect->AddParam(Check("Zoom", false));
  effect->AddParam(
      Scalar("Edge Feather", 0.0, 0.0, 1000.0, 0, ParamUnits::Pixels, ParamType::Slider)
          ->SetSliderRange(0.0, 100.0));
  return effect;
}

ComponentRef Tint() {
  ComponentRef effect = MakeEffect(kMatchName_Tint, "Tint", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Color("Map Black To", ParamColor{0.0f, 0.0f, 0.0f, 1.0f}));
  effect->AddParam(Color("Map White To", ParamColor{1.0f, 1.0f, 1.0f, 1.0f}));
  effect->AddParam(Scalar("Amount to Tint", 100.0, 0.0, 100.0, 1, ParamUnits::Percent));
  return effect;
}

ComponentRef Timecode() {
  ComponentRef effect = MakeEffect(kMatchName_Timecode, "Timecode", MediaType::Video, false);
  effect->AddParam(Group("Position and Size"));
  effect->AddParam(Point("Position", 960.0, 900.0));
  effect->AddParam(
      Scalar("Size", 10.0, 0.0, 100.0, 1, ParamUnits::Percent, ParamType::DoubleSlider));
  effect->AddParam(GroupEnd());
  effect->AddParam(Menu("Time Display", {"Timecode", "Frames", "Feet + Frames"}, false));
  effect->AddParam(Check("Field Symbol", true, false));
  // Ticks, held as a double: exact below about 9.8 hours.
  effect->AddParam(ComponentParam::Create("Starting Timecode", ParamType::Timecode, 0.0)
                       ->SetRange(0.0, 9.0e15)
                       ->SetParameterTimebase(kFrameRate_25)
                       ->SetCanVaryOverTime(false));
  effect->AddParam(Scalar("Offset", 0.0, -100.0, 100.0, 0, ParamUnits::None, ParamType::Slider));
  return effect;
}

ComponentRef GridDistortion() {
  ComponentRef effect =
      MakeEffect(kMatchName_GridDistortion, "Grid Distortion", MediaType::Video, false);
  effect->SetHasSetupDialog(true);
  effect->AddParam(ComponentParam::Create("Grid", ParamType::Custom, ParamBlob{}));
  effect->AddParam(ComponentParam::Create("Reset Grid", ParamType::Button, false)
                       ->SetCheckboxDisplayName("Reset")
                       ->SetCanVaryOverTime(false));
  // A counted group: its value lists the parameters it spans, one per semicolon.
  effect->AddParam(Group("Advanced", GroupKind::Counted, TextBlob("Smoothness;Settings;")));
  effect->AddParam(Scalar("Smoothness", 0.5, 0.0, 1.0, 2, ParamUnits::None, ParamType::DoubleSlider)
                       ->SetStep(0.01));
  effect->AddParam(ComponentParam::Create("Settings", ParamType::Opaque, ParamBlob{}));
  return effect;
}

// Keys the clip with the picture of another video track; the choice is an index into the
// sequence's track-menu strings (Sequence::GetTrackComboParamStrings).
ComponentRef MatteFromTrack() {
  ComponentRef effect =
      MakeEffect(kMatchName_MatteFromTrack, "Matte From Track", MediaType::Video, false);
  effect->AddParam(ComponentParam::Create("Matte", ParamType::TrackMenu, ParamChoice{0}));
  effect->AddParam(Menu("Composite Using", {"Matte Alpha", "Matte Luma"}, false));
  effect->AddParam(Check("Reverse", false));
  return effect;
}

ComponentRef Delay() {
  ComponentRef effect = MakeEffect(kMatchName_Delay, "Delay", MediaType::Audio, false);
  effect->AddParam(Scalar("Delay", 1.0, 0.0, 2.0, 3, ParamUnits::Seconds)->SetStep(0.001));
  effect->AddParam(Scalar("Feedback", 0.0, 0.0, 100.0, 1, ParamUnits::Percent));
  effect->AddParam(Scalar("Mix", 50.0, 0.0, 100.0, 1, ParamUnits::Percent));
  // The plug-in's own state, which it restores itself and never shows.
  effect->AddParam(ComponentParam::Create("Plug-in State", ParamType::Opaque, ParamBlob{})
                       ->SetCanVaryOverTime(false));
  return effect;
}

void DescribeAudioParams(EffectCatalogue& catalogue) {
  AudioParamDescription delay;
  delay.display.displayMode = AudioFilterParamInfo::kDisplayModeFine;
  delay.display.minimum = 0.0f;
  delay.display.maximum = 2.0f;
  delay.display.increment = 0.001f;
  delay.unitText = " s";
  catalogue.DescribeAudioParam(kMatchName_Delay, "Delay", delay);

  AudioParamDescription hidden;
  hidden.shown = false;
  catalogue.DescribeAudioParam(kMatchName_Delay, "Plug-in State", hidden);
}

ComponentRef Mask() {
  ComponentRef effect = MakeEffect(kMatchName_Mask, "Mask", MediaType::Video, false);
  effect->AddParam(
      Scalar("Mask Feather", 10.0, 0.0, 1000.0, 1, ParamUnits::Pixels)->SetSliderRange(0.0, 100.0));
  effect->AddParam(Scalar("Mask Opacity", 100.0, 0.0, 100.0, 1, ParamUnits::Percent));
  effect->AddParam(Scalar("Mask Expansion", 0.0, -1000.0, 1000.0, 1, ParamUnits::Pixels)
                       ->SetSliderRange(-100.0, 100.0));
  effect->AddParam(Check("Inverted", false));
  effect->AddParam(Menu("Mask Mode", {"None", "Add", "Subtract", "Intersect"}, false));
  effect->AddParam(Color("Mask Color", ParamColor{0.6f, 0.6f, 1.0f, 1.0f}));
  effect->AddParam(ComponentParam::Create("Mask Path", ParamType::Custom, ParamBlob{}));
  effect->AddParam(Group("Track Mask", GroupKind::Buttons));
  effect->AddParam(GroupEnd());
  effect->AddParam(ComponentParam::Create("Shape", ParamType::Info, std::string("Ellipse"))
                       ->SetCanVaryOverTime(false));
  effect->AddParam(
      ComponentParam::Create("Notes", ParamType::Text, std::string())->SetCanVaryOverTime(false));
  effect->AddParam(Menu("Tracking Method",
                        {"Position", "Position & Rotation", "Position, Scale & Rotation"}, false));
  return effect;
}

// The 32 hidden point parameters of one tone curve: x then y of points 1 to 16, levels 0 to 255;
// x = -1 marks an unused point. The curve starts as the diagonal.
void AddCurvePoints(const ComponentRef& effect, const std::string& curve) {
  constexpr int kPoints = 16;
  constexpr double kTop = 255.0;
  for (int i = 0; i < kPoints; ++i) {
    const double level = i == 0 ? 0.0 : (i == 1 ? kTop : -1.0);
    for (const char* axis : {"X", "Y"}) {
      const std::string name = curve + " Point " + std::to_string(i + 1) + " " + axis;
      ComponentParamRef point =
          Scalar(name.c_str(), level, -1.0, kTop, 0, ParamUnits::None, ParamType::DoubleSlider);
      point->SetVisible(false);
      effect->AddParam(std::move(point));
    }
  }
}

ComponentRef LumaCurve() {
  ComponentRef effect = MakeEffect(kMatchName_LumaCurve, "Luma Curve", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Group("Luma Curve", GroupKind::Curve));
  AddCurvePoints(effect, "Luma");
  effect->AddParam(GroupEnd());
  return effect;
}

ComponentRef RGBCurves() {
  ComponentRef effect = MakeEffect(kMatchName_RGBCurves, "RGB Curves", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Group("Curves", GroupKind::RGBCurves));
  for (const char* curve : {"Master", "Red", "Green", "Blue"}) {
    AddCurvePoints(effect, curve);
  }
  effect->AddParam(GroupEnd());
  return effect;
}

// A colour wheel's two parameters: the hue angle in degrees and the balance magnitude.
void AddWheel(const ComponentRef& effect, const std::string& wheel) {
  effect->AddParam(Scalar((wheel + " Angle").c_str(), 0.0, -1.0e6, 1.0e6, 1, ParamUnits::Degrees,
                          ParamType::Angle));
  effect->AddParam(Scalar((wheel + " Magnitude").c_str(), 0.0, 0.0, 100.0, 1, ParamUnits::None,
                          ParamType::DoubleSlider));
}

ComponentRef ColorBalanceWheel() {
  ComponentRef effect =
      MakeEffect(kMatchName_ColorBalanceWheel, "Color Balance Wheel", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Group("Balance", GroupKind::HueBalanceAndPhase));
  AddWheel(effect, "Balance");
  effect->AddParam(GroupEnd());
  effect->AddParam(Scalar("Saturation", 100.0, 0.0, 200.0, 1, ParamUnits::Percent));
  return effect;
}

ComponentRef ThreeWayColor() {
  ComponentRef effect =
      MakeEffect(kMatchName_ThreeWayColor, "Three-Way Color", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Group("Tonal Balance", GroupKind::ThreeWayHueBalance));
  for (const char* wheel : {"Shadows", "Midtones", "Highlights"}) {
    AddWheel(effect, wheel);
  }
  effect->AddParam(Check("Link Wheels", false));
  effect->AddParam(GroupEnd());
  return effect;
}

// A hue range with soft edges; the end softness is measured down from 360.
ComponentRef HueRange() {
  ComponentRef effect = MakeEffect(kMatchName_HueRange, "Hue Range", MediaType::Video, false);
  effect->AddParam(Group("Hue Range", GroupKind::HueRangeDefinition));
  effect->AddParam(Check("Show Range", false));
  effect->AddParam(
      Scalar("Start Threshold", 60.0, 0.0, 360.0, 1, ParamUnits::Degrees, ParamType::DoubleSlider));
  effect->AddParam(
      Scalar("Start Softness", 30.0, 0.0, 360.0, 1, ParamUnits::Degrees, ParamType::DoubleSlider));
  effect->AddParam(
      Scalar("End Threshold", 180.0, 0.0, 360.0, 1, ParamUnits::Degrees, ParamType::DoubleSlider));
  effect->AddParam(
      Scalar("End Softness", 150.0, 0.0, 360.0, 1, ParamUnits::Degrees, ParamType::DoubleSlider));
  effect->AddParam(GroupEnd());
  effect->AddParam(Scalar("Desaturate Outside", 0.0, 0.0, 100.0, 1, ParamUnits::Percent));
  return effect;
}

// A saturation or luma range in percent, laid out as the hue range.
ComponentRef PercentRange(const char* matchName, const char* name, GroupKind kind) {
  ComponentRef effect = MakeEffect(matchName, name, MediaType::Video, false);
  effect->AddParam(Group(name, kind));
  effect->AddParam(Check("Show Range", false));
  const std::pair<const char*, double> handles[] = {{"Start Threshold", 30.0},
                                                    {"Start Softness", 10.0},
                                                    {"End Threshold", 70.0},
                                                    {"End Softness", 20.0}};
  for (const auto& [handle, value] : handles) {
    effect->AddParam(
        Scalar(handle, value, 0.0, 100.0, 1, ParamUnits::Percent, ParamType::DoubleSlider));
  }
  effect->AddParam(GroupEnd());
  return effect;
}

// Shadows and highlights of a tonal range in percent, each with a soft edge.
ComponentRef TonalRange() {
  ComponentRef effect = MakeEffect(kMatchName_TonalRange, "Tonal Range", MediaType::Video, false);
  effect->AddParam(Group("Tonal Range", GroupKind::TonalRangeDefinition));
  const std::pair<const char*, double> handles[] = {{"Shadow Threshold", 25.0},
                                                    {"Shadow Softness", 10.0},
                                                    {"Highlight Threshold", 75.0},
                                                    {"Highlight Softness", 10.0}};
  for (const auto& [handle, value] : handles) {
    effect->AddParam(
        Scalar(handle, value, 0.0, 100.0, 1, ParamUnits::Percent, ParamType::DoubleSlider));
  }
  effect->AddParam(GroupEnd());
  return effect;
}

// Input black, gray and white and output black and white, levels 0 to 255, shown through the
// group's own controls and fields; then a line of buttons that set the levels automatically.
ComponentRef Levels() {
  ComponentRef effect = MakeEffect(kMatchName_Levels, "Levels", MediaType::Video, false);
  effect->SetCanTakeMasks(true);
  effect->AddParam(Group("Levels", GroupKind::Levels));
  const std::pair<const char*, double> levels[] = {{"Input Black Level", 0.0},
                                                   {"Input Gray Level", 128.0},
                                                   {"Input White Level", 255.0},
                                                   {"Output Black Level", 0.0},
                                                   {"Output White Level", 255.0}};
  for (const auto& [name, value] : levels) {
    ComponentParamRef level =
        Scalar(name, value, 0.0, 255.0, 0, ParamUnits::None, ParamType::DoubleSlider);
    level->SetVisible(false);
    effect->AddParam(std::move(level));
  }
  effect->AddParam(GroupEnd());
  effect->AddParam(Group("Auto Levels", GroupKind::Buttons));
  for (const char* name : {"Auto Black Level", "Auto Contrast", "Auto White Level"}) {
    effect->AddParam(ComponentParam::Create(name, ParamType::Button, false)
                         ->SetCheckboxDisplayName(name)
                         ->SetCanVaryOverTime(false));
  }
  effect->AddParam(GroupEnd());
  return effect;
}

EffectCatalogue MakeStandard() {
  EffectCatalogue catalogue;
  for (ComponentRef effect :
       {Motion(),
        Opacity(),
        TimeRemapping(),
        Volume(),
        ChannelVolume(),
        Panner(),
        GaussianBlur(),
        BrightnessContrast(),
        Crop(),
        Tint(),
        Timecode(),
        GridDistortion(),
        Delay(),
        Mask(),
        MatteFromTrack(),
        LumaCurve(),
        RGBCurves(),
        ColorBalanceWheel(),
        ThreeWayColor(),
        HueRange(),
        Levels(),
        PercentRange(kMatchName_SaturationRange, "Saturation Range",
                     GroupKind::SaturationRangeDefinition),
        PercentRange(kMatchName_LumaRange, "Luma Range", GroupKind::LumaRangeDefinition),
        TonalRange()}) {
    catalogue.Register(std::move(effect));
  }
  DescribeAudioParams(catalogue);
  return catalogue;
}

}  // namespace

const EffectCatalogue& EffectCatalogue::Standard() {
  // Never destroyed: its templates would dispose their stations during exit, possibly after the
  // station registry itself is gone.
  static const EffectCatalogue* const standard = new EffectCatalogue(MakeStandard());
  return *standard;
}

void EffectCatalogue::Register(ComponentRef effectTemplate) {
  if (!effectTemplate) {
    return;
  }
  std::erase_if(mTemplates, [&](const ComponentRef& existing) {
    return existing->GetMatchName() == effectTemplate->GetMatchName();
  });
  mTemplates.push_back(std::move(effectTemplate));
}

const Component* EffectCatalogue::FindTemplate(std::string_view matchName) const {
  for (const ComponentRef& effect : mTemplates) {
    if (effect->GetMatchName() == matchName) {
      return effect.get();
    }
  }
  return nullptr;
}

ComponentRef EffectCatalogue::Create(std::string_view matchName) const {
  const Component* effect = FindTemplate(matchName);
  return effect ? effect->Clone() : nullptr;
}

std::vector<std::string> EffectCatalogue::GetMatchNames() const {
  std::vector<std::string> names;
  for (const ComponentRef& effect : mTemplates) {
    names.push_back(effect->GetMatchName());
  }
  return names;
}

std::vector<ComponentRef> EffectCatalogue::CreateIntrinsics(MediaType mediaType) const {
  std::vector<ComponentRef> intrinsics;
  const auto names = mediaType == MediaType::Video
                         ? std::vector<const char*>{kMatchName_Motion, kMatchName_Opacity,
                                                    kMatchName_TimeRemapping}
                         : std::vector<const char*>{kMatchName_Volume, kMatchName_ChannelVolume,
                                                    kMatchName_Panner};
  for (const char* name : names) {
    if (ComponentRef effect = Create(name)) {
      intrinsics.push_back(std::move(effect));
    }
  }
  return intrinsics;
}

void EffectCatalogue::DescribeAudioParam(std::string_view matchName, std::string_view paramName,
                                         AudioParamDescription description) {
  for (AudioParamEntry& entry : mAudioParams) {
    if (entry.matchName == matchName && entry.paramName == paramName) {
      entry.description = std::move(description);
      return;
    }
  }
  mAudioParams.push_back(
      AudioParamEntry{std::string(matchName), std::string(paramName), std::move(description)});
}

const AudioParamDescription* EffectCatalogue::FindAudioParamDescription(
    std::string_view matchName, std::string_view paramName) const {
  for (const AudioParamEntry& entry : mAudioParams) {
    if (entry.matchName == matchName && entry.paramName == paramName) {
      return &entry.description;
    }
  }
  return nullptr;
}
