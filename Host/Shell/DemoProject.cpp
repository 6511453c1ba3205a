#include "Host/Shell/DemoProject.h"

#include <string>
#include <utility>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

constexpr TickTime Seconds(double s) {
  return static_cast<TickTime>(s * kTicksPerSecond);
}

// Keyframes at (clip time, value) pairs; the parameter becomes time-varying.
void AddKeyframes(const ComponentParamRef& param,
                  std::initializer_list<std::pair<TickTime, double>> keys) {
  if (param == nullptr)
    return;
  ComponentParam::State state = param->GetState();
  state.timeVarying = true;
  param->ApplyState(std::move(state));
  for (const auto& [time, value] : keys)
    param->SetValueAt(time, value);
}

TrackItemRef MakeVideoClip(ObjectID id, const MasterClipRef& clip, TickTime start, TickTime end,
                           TickTime mediaIn, int link, bool keyed) {
  TrackItemRef item = TrackItem::CreateClip(MediaType::Video, start, end, clip, mediaIn);
  item->SetID(id);
  item->SetLinkGroup(link);
  const EffectCatalogue& catalogue = EffectCatalogue::Standard();
  for (const ComponentRef& intrinsic : catalogue.CreateIntrinsics(MediaType::Video))
    item->GetComponentChain()->Append(intrinsic);
  item->GetComponentChain()->Append(catalogue.Create(kMatchName_GaussianBlur));
  if (keyed) {
    const ComponentChainRef& chain = item->GetComponentChain();
    AddKeyframes(chain->FindByMatchName(kMatchName_Motion)->FindParam("Scale"),
                 {{mediaIn, 100.0}, {mediaIn + Seconds(2), 120.0}});
    AddKeyframes(chain->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity"),
                 {{mediaIn, 0.0}, {mediaIn + Seconds(1), 100.0}});
  }
  return item;
}

TrackItemRef MakeAudioClip(ObjectID id, const MasterClipRef& clip, TickTime start, TickTime end,
                           TickTime mediaIn, int link) {
  TrackItemRef item = TrackItem::CreateClip(MediaType::Audio, start, end, clip, mediaIn);
  item->SetID(id);
  item->SetLinkGroup(link);
  for (const ComponentRef& intrinsic :
       EffectCatalogue::Standard().CreateIntrinsics(MediaType::Audio))
    item->GetComponentChain()->Append(intrinsic);
  return item;
}

}  // namespace

ProjectRef BuildDemoProject() {
  // The fixed ids below must not collide with ids handed out later in this process.
  ModelObject::ReserveObjectIDsThrough(1000);

  ProjectRef project = Project::Create("Demo");
  const MasterClipRef beach =
      MasterClip::Create("Beach.mov", Media::Create("Beach.mov", Seconds(20), true, true));
  const MasterClipRef sunset =
      MasterClip::Create("Sunset.mov", Media::Create("Sunset.mov", Seconds(15), true, true));
  project->AddMasterClip(beach);
  project->AddMasterClip(sunset);

  SequenceRef sequence = Sequence::Create("Demo Sequence", kFrameRate_25, kFrameRate_Audio48000);
  const TrackRef video = Track::Create(MediaType::Video, "V1");
  const TrackRef audio = Track::Create(MediaType::Audio, "A1");
  sequence->AddTrack(video);
  sequence->AddTrack(audio);

  video->AddItem(MakeVideoClip(kDemoVideoClipA, beach, 0, Seconds(5), Seconds(2), 1, true));
  video->AddItem(MakeVideoClip(kDemoVideoClipB, sunset, Seconds(5), Seconds(10), 0, 2, false));
  TransitionData dissolve;
  dissolve.matchName = "XO.KRVN CrossDissolve";
  dissolve.displayName = "Cross Dissolve";
  TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, Seconds(4.5), Seconds(5.5), dissolve);
  transition->SetID(kDemoTransition);
  video->AddItem(transition);

  audio->AddItem(MakeAudioClip(kDemoAudioClipA, beach, 0, Seconds(5), Seconds(2), 1));
  audio->AddItem(MakeAudioClip(kDemoAudioClipB, sunset, Seconds(5), Seconds(10), 0, 2));

  project->AddSequence(sequence);
  project->SetActiveSequence(sequence);
  return project;
}
