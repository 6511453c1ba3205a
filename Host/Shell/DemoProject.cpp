#include "Host/Shell/DemoProject.h"

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/TrackItem.h"

namespace {

constexpr TickTime Seconds(double s) {
  return static_cast<TickTime>(s * kTicksPerSecond);
}

TrackItemRef AddVideoClip(ProjectBuilder& builder, const TrackRef& track, const MasterClipRef& clip,
                          const ProjectBuilder::ClipPlacement& placement) {
  TrackItemRef item = builder.AddClip(track, clip, placement);
  builder.AddEffect(item, kMatchName_GaussianBlur);
  return item;
}

}  // namespace

ProjectRef BuildDemoProject() {
  // The fixed ids below must not collide with ids handed out later in this process.
  ModelObject::ReserveObjectIDsThrough(1000);

  ProjectBuilder builder("Demo");
  using Streams = ProjectBuilder::Streams;
  const MasterClipRef beach = builder.AddMasterClip(
      "Beach.mov", builder.AddMedia("Beach.mov", Seconds(20), Streams::VideoAndAudio));
  const MasterClipRef sunset = builder.AddMasterClip(
      "Sunset.mov", builder.AddMedia("Sunset.mov", Seconds(15), Streams::VideoAndAudio));

  const SequenceRef sequence =
      builder.AddSequence("Demo Sequence", kFrameRate_25, kFrameRate_Audio48000);
  const TrackRef video = builder.AddTrack(sequence, MediaType::Video, "V1");
  const TrackRef audio = builder.AddTrack(sequence, MediaType::Audio, "A1");

  const TrackItemRef clipA = AddVideoClip(builder, video, beach,
                                          {.start = 0,
                                           .end = Seconds(5),
                                           .mediaIn = Seconds(2),
                                           .linkGroup = 1,
                                           .id = kDemoVideoClipA});
  const ComponentChainRef& chain = clipA->GetComponentChain();
  const TickTime mediaIn = clipA->GetMediaIn();
  ProjectBuilder::AddKeyframes(chain->FindByMatchName(kMatchName_Motion)->FindParam("Scale"),
                               {{mediaIn, 100.0}, {mediaIn + Seconds(2), 120.0}});
  ProjectBuilder::AddKeyframes(chain->FindByMatchName(kMatchName_Opacity)->FindParam("Opacity"),
                               {{mediaIn, 0.0}, {mediaIn + Seconds(1), 100.0}});
  AddVideoClip(builder, video, sunset,
               {.start = Seconds(5), .end = Seconds(10), .linkGroup = 2, .id = kDemoVideoClipB});
  TransitionData dissolve;
  dissolve.matchName = "XO.KRVN CrossDissolve";
  dissolve.displayName = "Cross Dissolve";
  builder.AddTransition(video, Seconds(4.5), Seconds(5.5), dissolve, kDemoTransition);

  builder.AddClip(audio, beach,
                  {.start = 0,
                   .end = Seconds(5),
                   .mediaIn = Seconds(2),
                   .linkGroup = 1,
                   .id = kDemoAudioClipA});
  builder.AddClip(audio, sunset,
                  {.start = Seconds(5), .end = Seconds(10), .linkGroup = 2, .id = kDemoAudioClipB});
  return builder.GetProject();
}
