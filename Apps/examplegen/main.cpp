// Writes the example projects of examples/ from the model API, so that they always hold what the
// model can express. Run: examplegen <output folder>.

#include <cstdio>
#include <initializer_list>
#include <string>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

namespace {

using Ids = ProjectBuilder::Ids;
using Streams = ProjectBuilder::Streams;
using Interpolation = TemporalInterpolation;

constexpr TickTime Seconds(double s) {
  return static_cast<TickTime>(s * kTicksPerSecond);
}

void Keyframes(const ComponentParamRef& param,
               std::initializer_list<ProjectBuilder::KeyframeEntry> keys) {
  if (!ProjectBuilder::AddKeyframes(param, keys)) {
    std::fprintf(stderr, "examplegen: keyframe of %s refused\n", param->GetName().c_str());
  }
}

ComponentRef GraphicsLayer(const std::string& name, const std::string& text, ParamPoint position,
                           ParamColor fill) {
  auto layer = Component::Create("XO.KRVN GraphicsLayer", name, MediaType::Video, false);
  layer->SetRole(ComponentRole::Graphics);
  layer->AddParam(
      ComponentParam::Create("Source Text", ParamType::Text, text)->SetCanVaryOverTime(false));
  layer->AddParam(ComponentParam::Create("Position", ParamType::Point, position));
  layer->AddParam(ComponentParam::Create("Opacity", ParamType::FloatSlider, 100.0)
                      ->SetRange(0.0, 100.0)
                      ->SetUnits(ParamUnits::Percent));
  layer->AddParam(ComponentParam::Create("Fill Color", ParamType::Color, fill));
  return layer;
}

// Ids are sequential, so the files are the same on every run.
ProjectRef BuildDemo() {
  ProjectBuilder b("Demo", Ids::Sequential);
  auto beachMedia = b.AddMedia("Beach.mov", Seconds(30), Streams::VideoAndAudio);
  auto sunsetMedia = b.AddMedia("Sunset.mov", Seconds(20), Streams::VideoAndAudio);
  auto titleMedia = b.AddMedia("Lower Third", kTime_Max, Streams::Video);
  const auto clips = b.AddMasterClips(
      {{"Beach.mov", beachMedia}, {"Sunset.mov", sunsetMedia}, {"Lower Third", titleMedia}});
  const MasterClipRef& beach = clips[0];
  const MasterClipRef& sunset = clips[1];
  const MasterClipRef& title = clips[2];
  title->SetGraphicsFlags(true, false, false);
  // The master-clip case: an effect on the source clip itself.
  b.AddEffect(sunset, kMatchName_Tint);
  Markers sourceMarkers;
  sourceMarkers.Add({Seconds(3), 0, "Sun touches the sea", "", 2});
  sunset->SetMarkers(sourceMarkers);

  auto sequence = b.AddSequence("Beach Edit", kFrameRate_25, kFrameRate_Audio48000);
  auto v1 = b.AddTrack(sequence, MediaType::Video, "V1");
  auto v2 = b.AddTrack(sequence, MediaType::Video, "V2");
  auto a1 = b.AddTrack(sequence, MediaType::Audio, "A1");
  auto a2 = b.AddTrack(sequence, MediaType::Audio, "A2");
  auto a3 = b.AddTrack(sequence, MediaType::Audio, "A3");

  // Clip 1: intrinsics, two applied effects, keyframes of every interpolation, and linked audio
  // in three parts whose order keys are not the track order.
  const ProjectBuilder::ClipPlacement beachSpan{
      .start = 0, .end = Seconds(8), .mediaIn = Seconds(2), .linkGroup = 1};
  auto beachVideo = b.AddClip(v1, beach, beachSpan);
  auto blur = b.AddEffect(beachVideo, kMatchName_GaussianBlur);
  b.AddEffect(beachVideo, kMatchName_BrightnessContrast);
  const auto& chain = beachVideo->GetComponentChain();
  auto motion = chain->FindByMatchName(kMatchName_Motion);
  Keyframes(motion->FindParam("Scale"), {{Seconds(2.0), 100.0, Interpolation::Linear},
                                         {Seconds(3.0), 115.0, Interpolation::Bezier},
                                         {Seconds(4.5), 105.0, Interpolation::ContinuousBezier},
                                         {Seconds(6.0), 125.0, Interpolation::AutoBezier},
                                         {Seconds(7.0), 125.0, Interpolation::Hold},
                                         {Seconds(9.0), 100.0, Interpolation::Linear}});
  Keyframes(motion->FindParam("Position"),
            {{Seconds(2.0), ParamPoint{960.0, 540.0}, Interpolation::Linear},
             {Seconds(6.0), ParamPoint{1100.0, 480.0}, Interpolation::Bezier}});
  Keyframes(
      chain->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity"),
      {{Seconds(2.0), 0.0, Interpolation::Linear}, {Seconds(3.0), 100.0, Interpolation::Linear}});
  Keyframes(blur->FindParam("Blurriness"), {{Seconds(5.0), 0.0, Interpolation::AutoBezier},
                                            {Seconds(8.0), 40.0, Interpolation::AutoBezier}});
  auto part0 = b.AddClip(a1, beach, beachSpan);
  auto part1 = b.AddClip(a2, beach, beachSpan);
  auto part2 = b.AddClip(a3, beach, beachSpan);
  part0->SetPartOrderKey(2);
  part1->SetPartOrderKey(0);
  part2->SetPartOrderKey(1);
  b.AddEffect(part1, kMatchName_Delay);

  // Clip 2 with a video and an audio transition over the cut.
  const ProjectBuilder::ClipPlacement sunsetSpan{
      .start = Seconds(8), .end = Seconds(16), .linkGroup = 2};
  b.AddClip(v1, sunset, sunsetSpan);
  b.AddClip(a1, sunset, sunsetSpan);
  TransitionData dissolve;
  dissolve.matchName = "XO.KRVN CrossDissolve";
  dissolve.displayName = "Cross Dissolve";
  b.AddTransition(v1, Seconds(7.5), Seconds(8.5), dissolve);
  TransitionData power;
  power.matchName = "XO.KRVN ConstantPower";
  power.displayName = "Constant Power";
  b.AddTransition(a1, Seconds(7.5), Seconds(8.5), power);

  // A graphics clip with two layers.
  auto graphic = b.AddClip(v2, title, {.start = Seconds(1), .end = Seconds(6)});
  graphic->SetIntroDuration(Seconds(1));
  graphic->SetOutroDuration(Seconds(1));
  b.AddComponent(graphic->GetComponentChain(),
                 GraphicsLayer("Headline", "Beach Day", {960.0, 880.0}, {1.0f, 0.85f, 0.2f, 1.0f}));
  b.AddComponent(
      graphic->GetComponentChain(),
      GraphicsLayer("Subtitle", "Summer on the coast", {960.0, 950.0}, {1.0f, 1.0f, 1.0f, 1.0f}));

  // Made after everything above, so the ids scripts use stay where they were: a clip whose
  // effects show the timecode, button, track-menu and opaque rows, and whose Rotation keeps two
  // whole turns.
  auto effectsClip =
      b.AddClip(v2, beach, {.start = Seconds(10), .end = Seconds(15), .mediaIn = Seconds(20)});
  b.AddEffect(effectsClip, kMatchName_Timecode);
  b.AddEffect(effectsClip, kMatchName_GridDistortion);
  b.AddEffect(effectsClip, kMatchName_MatteFromTrack);
  const ComponentParamRef rotation =
      effectsClip->GetComponentChain()->FindByMatchName(kMatchName_Motion)->FindParam("Rotation");
  ComponentParam::State turned = rotation->GetState();
  turned.value = 720.0;
  rotation->ApplyState(turned);

  // Made after the effects clip, for the same reason: a colour grade whose effects show the
  // curve, RGB curves, colour wheel, three-way wheel and hue range groups.
  auto gradeClip =
      b.AddClip(v1, beach, {.start = Seconds(16), .end = Seconds(22), .mediaIn = Seconds(5)});
  gradeClip->SetName("Colour Grade");
  auto lumaCurve = b.AddEffect(gradeClip, kMatchName_LumaCurve);
  auto rgbCurves = b.AddEffect(gradeClip, kMatchName_RGBCurves);
  auto wheel = b.AddEffect(gradeClip, kMatchName_ColorBalanceWheel);
  auto threeWay = b.AddEffect(gradeClip, kMatchName_ThreeWayColor);
  b.AddEffect(gradeClip, kMatchName_HueRange);
  // A gentle S on the luma and a warmer red; the wheels push the shadows to blue and the
  // highlights to orange.
  const auto setParam = [](const ComponentRef& effect, const std::string& name, double value) {
    effect->FindParam(name)->SetValueAt(0, ParamValue(value));
  };
  const auto setPoint = [&](const ComponentRef& effect, const std::string& curve, int point,
                            double x, double y) {
    const std::string prefix = curve + " Point " + std::to_string(point);
    setParam(effect, prefix + " X", x);
    setParam(effect, prefix + " Y", y);
  };
  setPoint(lumaCurve, "Luma", 2, 64.0, 52.0);
  setPoint(lumaCurve, "Luma", 3, 192.0, 206.0);
  setPoint(lumaCurve, "Luma", 4, 255.0, 255.0);
  setPoint(rgbCurves, "Red", 2, 128.0, 142.0);
  setPoint(rgbCurves, "Red", 3, 255.0, 255.0);
  setParam(wheel, "Balance Angle", 30.0);
  setParam(wheel, "Balance Magnitude", 20.0);
  setParam(threeWay, "Shadows Angle", 230.0);
  setParam(threeWay, "Shadows Magnitude", 25.0);
  setParam(threeWay, "Highlights Angle", 40.0);
  setParam(threeWay, "Highlights Magnitude", 15.0);
  // Appended later, so that the objects above keep their ids: levels with a line of auto
  // buttons, the saturation and luma ranges and a tonal range.
  auto levels = b.AddEffect(gradeClip, kMatchName_Levels);
  b.AddEffect(gradeClip, kMatchName_SaturationRange);
  b.AddEffect(gradeClip, kMatchName_LumaRange);
  b.AddEffect(gradeClip, kMatchName_TonalRange);
  setParam(levels, "Input White Level", 235.0);
  setParam(levels, "Output Black Level", 10.0);

  Markers markers;
  markers.Add({Seconds(4), 0, "Cut here?", "", 1});
  markers.Add({Seconds(12), Seconds(2), "Music swell", "", 4});
  sequence->SetMarkers(markers);
  sequence->SetCurrentTime(Seconds(3));
  sequence->SetSelection({beachVideo}, false);
  return b.GetProject();
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: examplegen <output folder>\n");
    return 2;
  }
  const std::string folder = argv[1];
  std::string error;
  if (!ProjectFile::Save(*BuildDemo(), folder + "/demo.json", &error)) {
    std::fprintf(stderr, "examplegen: %s\n", error.c_str());
    return 1;
  }
  std::printf("wrote %s/demo.json\n", folder.c_str());
  return 0;
}
