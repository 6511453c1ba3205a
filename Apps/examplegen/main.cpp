// Writes the example projects of examples/ from the model API, so that they always hold what the
// model can express. Run: examplegen <output folder>.

#include <cstdio>
#include <initializer_list>
#include <string>
#include <utility>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

constexpr TickTime Seconds(double s) {
  return static_cast<TickTime>(s * kTicksPerSecond);
}

const EffectCatalogue& Catalogue() {
  return EffectCatalogue::Standard();
}

// Ids are handed out in order from a fixed start, so the files are the same on every run.
class Builder {
 public:
  Builder() { ModelObject::ReserveObjectIDsThrough(0); }

  template <class Ref>
  Ref Number(Ref object) {
    object->SetID(++mNextID);
    return object;
  }

  // Gives every object below `component` (the component, its parameters, its masks) an id.
  ComponentRef Number(ComponentRef component) {
    component->SetID(++mNextID);
    for (const auto& param : component->GetParams())
      param->SetID(++mNextID);
    for (const auto& mask : component->GetMasks())
      Number(mask);
    return component;
  }

  TrackItemRef Clip(const TrackRef& track, const MasterClipRef& masterClip, TickTime start,
                    TickTime end, TickTime mediaIn, int link) {
    auto item =
        Number(TrackItem::CreateClip(track->GetMediaType(), start, end, masterClip, mediaIn));
    Number(item->GetComponentChain());
    item->SetLinkGroup(link);
    for (const auto& intrinsic : Catalogue().CreateIntrinsics(track->GetMediaType())) {
      item->GetComponentChain()->Append(Number(intrinsic));
    }
    track->AddItem(item);
    return item;
  }

  TrackItemRef Transition(const TrackRef& track, TickTime start, TickTime end,
                          TransitionData data) {
    auto item = Number(TrackItem::CreateTransition(track->GetMediaType(), start, end, data));
    Number(item->GetComponentChain());
    track->AddItem(item);
    return item;
  }

  ComponentRef Effect(const TrackItemRef& item, const char* matchName) {
    auto effect = Number(Catalogue().Create(matchName));
    item->GetComponentChain()->Append(effect);
    return effect;
  }

 private:
  ObjectID mNextID = 0;
};

// Keyframes at (seconds of clip time, value) with one interpolation each.
void Keyframes(const ComponentParamRef& param,
               std::initializer_list<std::tuple<double, ParamValue, TemporalInterpolation>> keys) {
  ComponentParam::State state = param->GetState();
  state.timeVarying = true;
  for (const auto& [seconds, value, mode] : keys) {
    Keyframe k;
    k.time = Seconds(seconds);
    k.value = value;
    k.interpolation = mode;
    if (state.keyframes.Add(k) != CurveStatus::Ok) {
      std::fprintf(stderr, "examplegen: keyframe of %s refused\n", param->GetName().c_str());
    }
  }
  param->ApplyState(std::move(state));
}

ComponentRef GraphicsLayer(Builder& b, const std::string& name, const std::string& text,
                           ParamPoint position, ParamColor fill) {
  auto layer = Component::Create("XO.KRVN GraphicsLayer", name, MediaType::Video, false);
  layer->SetRole(ComponentRole::Graphics);
  layer->AddParam(
      ComponentParam::Create("Source Text", ParamType::Text, text)->SetCanVaryOverTime(false));
  layer->AddParam(ComponentParam::Create("Position", ParamType::Point, position));
  layer->AddParam(ComponentParam::Create("Opacity", ParamType::FloatSlider, 100.0)
                      ->SetRange(0.0, 100.0)
                      ->SetUnits(ParamUnits::Percent));
  layer->AddParam(ComponentParam::Create("Fill Color", ParamType::Color, fill));
  return b.Number(layer);
}

ProjectRef BuildDemo() {
  Builder b;
  auto project = b.Number(Project::Create("Demo"));
  auto beachMedia = b.Number(Media::Create("Beach.mov", Seconds(30), true, true));
  auto sunsetMedia = b.Number(Media::Create("Sunset.mov", Seconds(20), true, true));
  auto titleMedia = b.Number(Media::Create("Lower Third", kTime_Max, true, false));
  auto beach = b.Number(MasterClip::Create("Beach.mov", beachMedia));
  auto sunset = b.Number(MasterClip::Create("Sunset.mov", sunsetMedia));
  auto title = b.Number(MasterClip::Create("Lower Third", titleMedia));
  b.Number(beach->GetVideoChain());
  b.Number(sunset->GetVideoChain());
  b.Number(title->GetVideoChain());
  title->SetGraphicsFlags(true, false, false);
  // The master-clip case: an effect on the source clip itself.
  auto tint = b.Number(Catalogue().Create(kMatchName_Tint));
  sunset->GetVideoChain()->Append(tint);
  Markers sourceMarkers;
  sourceMarkers.Add({Seconds(3), 0, "Sun touches the sea", "", 2});
  sunset->SetMarkers(sourceMarkers);
  for (const auto& clip : {beach, sunset, title})
    project->AddMasterClip(clip);

  auto sequence = b.Number(Sequence::Create("Beach Edit", kFrameRate_25, kFrameRate_Audio48000));
  auto v1 = b.Number(Track::Create(MediaType::Video, "V1"));
  auto v2 = b.Number(Track::Create(MediaType::Video, "V2"));
  auto a1 = b.Number(Track::Create(MediaType::Audio, "A1"));
  auto a2 = b.Number(Track::Create(MediaType::Audio, "A2"));
  auto a3 = b.Number(Track::Create(MediaType::Audio, "A3"));
  for (const auto& track : {v1, v2, a1, a2, a3})
    sequence->AddTrack(track);

  // Clip 1: intrinsics, two applied effects, keyframes of every interpolation, and linked audio
  // in three parts whose order keys are not the track order.
  auto beachVideo = b.Clip(v1, beach, 0, Seconds(8), Seconds(2), 1);
  auto blur = b.Effect(beachVideo, kMatchName_GaussianBlur);
  b.Effect(beachVideo, kMatchName_BrightnessContrast);
  const auto& chain = beachVideo->GetComponentChain();
  auto motion = chain->FindByMatchName(kMatchName_Motion);
  Keyframes(motion->FindParam("Scale"), {{2.0, 100.0, TemporalInterpolation::Linear},
                                         {3.0, 115.0, TemporalInterpolation::Bezier},
                                         {4.5, 105.0, TemporalInterpolation::ContinuousBezier},
                                         {6.0, 125.0, TemporalInterpolation::AutoBezier},
                                         {7.0, 125.0, TemporalInterpolation::Hold},
                                         {9.0, 100.0, TemporalInterpolation::Linear}});
  Keyframes(motion->FindParam("Position"),
            {{2.0, ParamPoint{960.0, 540.0}, TemporalInterpolation::Linear},
             {6.0, ParamPoint{1100.0, 480.0}, TemporalInterpolation::Bezier}});
  Keyframes(
      chain->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity"),
      {{2.0, 0.0, TemporalInterpolation::Linear}, {3.0, 100.0, TemporalInterpolation::Linear}});
  Keyframes(blur->FindParam("Blurriness"), {{5.0, 0.0, TemporalInterpolation::AutoBezier},
                                            {8.0, 40.0, TemporalInterpolation::AutoBezier}});
  auto part0 = b.Clip(a1, beach, 0, Seconds(8), Seconds(2), 1);
  auto part1 = b.Clip(a2, beach, 0, Seconds(8), Seconds(2), 1);
  auto part2 = b.Clip(a3, beach, 0, Seconds(8), Seconds(2), 1);
  part0->SetPartOrderKey(2);
  part1->SetPartOrderKey(0);
  part2->SetPartOrderKey(1);
  b.Effect(part1, kMatchName_Delay);

  // Clip 2 with a video and an audio transition over the cut.
  b.Clip(v1, sunset, Seconds(8), Seconds(16), 0, 2);
  b.Clip(a1, sunset, Seconds(8), Seconds(16), 0, 2);
  TransitionData dissolve;
  dissolve.matchName = "XO.KRVN CrossDissolve";
  dissolve.displayName = "Cross Dissolve";
  b.Transition(v1, Seconds(7.5), Seconds(8.5), dissolve);
  TransitionData power;
  power.matchName = "XO.KRVN ConstantPower";
  power.displayName = "Constant Power";
  b.Transition(a1, Seconds(7.5), Seconds(8.5), power);

  // A graphics clip with two layers.
  auto graphic = b.Clip(v2, title, Seconds(1), Seconds(6), 0, 0);
  graphic->SetIntroDuration(Seconds(1));
  graphic->SetOutroDuration(Seconds(1));
  graphic->GetComponentChain()->Append(
      GraphicsLayer(b, "Headline", "Beach Day", {960.0, 880.0}, {1.0f, 0.85f, 0.2f, 1.0f}));
  graphic->GetComponentChain()->Append(GraphicsLayer(b, "Subtitle", "Summer on the coast",
                                                     {960.0, 950.0}, {1.0f, 1.0f, 1.0f, 1.0f}));

  Markers markers;
  markers.Add({Seconds(4), 0, "Cut here?", "", 1});
  markers.Add({Seconds(12), Seconds(2), "Music swell", "", 4});
  sequence->SetMarkers(markers);
  sequence->SetCurrentTime(Seconds(3));
  project->AddSequence(sequence);
  project->SetActiveSequence(sequence);
  sequence->SetSelection({beachVideo}, false);
  return project;
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
