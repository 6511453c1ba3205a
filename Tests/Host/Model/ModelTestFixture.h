#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/ModelDescription.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Tests/Host/Model/MessageRecorder.h"
#include "Tests/Host/Model/UndoRoundTrip.h"

inline constexpr TickTime kSecond = kTicksPerSecond;

// A project with one 25 fps sequence: a linked clip "Interview" (video on V1 at [2 s, 7 s),
// media from 1 s; two audio parts on A1 and A2 with order keys 1 and 0) carrying the intrinsics
// plus Gaussian Blur and Crop on the video and Delay on the first audio part; a second clip on V1
// at [7 s, 12 s) and a transition over the cut at [6.5 s, 7.5 s).
class ModelTest : public ::testing::Test {
 protected:
  ModelTest() {
    ProjectBuilder builder("Test");
    project = builder.GetProject();
    sequence = builder.AddSequence("Sequence 01", kFrameRate_25);
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    a1 = builder.AddTrack(sequence, MediaType::Audio, "A1");
    a2 = builder.AddTrack(sequence, MediaType::Audio, "A2");
    media = builder.AddMedia("interview.mov", 60 * kSecond, ProjectBuilder::Streams::VideoAndAudio);
    masterClip = builder.AddMasterClip("Interview", media);

    const ProjectBuilder::ClipPlacement interview{
        .start = 2 * kSecond, .end = 7 * kSecond, .mediaIn = kSecond, .linkGroup = 1};
    video = builder.AddClip(v1, masterClip, interview);
    audio1 = builder.AddClip(a1, masterClip, interview);
    audio2 = builder.AddClip(a2, masterClip, interview);
    audio1->SetPartOrderKey(1);
    audio2->SetPartOrderKey(0);
    videoChain = video->GetComponentChain();
    blur = builder.AddEffect(video, kMatchName_GaussianBlur);
    crop = builder.AddEffect(video, kMatchName_Crop);
    builder.AddEffect(audio1, kMatchName_Delay);

    second = builder.AddClip(v1, masterClip,
                             {.start = 7 * kSecond, .end = 12 * kSecond, .mediaIn = 10 * kSecond});
    TransitionData data;
    data.matchName = "XO.KRVN CrossDissolve";
    data.displayName = "Cross Dissolve";
    transition =
        builder.AddTransition(v1, 6 * kSecond + kSecond / 2, 7 * kSecond + kSecond / 2, data);
  }

  static const EffectCatalogue& Catalogue() { return EffectCatalogue::Standard(); }

  ComponentRef Intrinsic(const char* matchName) const {
    return videoChain->FindByMatchName(matchName);
  }
  ComponentParamRef Param(const ComponentRef& component, const char* name) const {
    return component->FindParam(name);
  }
  std::string Dump() const { return DescribeForTest(*project); }

  // Checks an edit, its undo and its redo against the whole project; `recorder` hears what the
  // test listens to.
  void CheckUndoRoundTrip(const UndoRoundTrip::Step& step, MessageRecorder& recorder) {
    UndoRoundTrip(
        *project, [this] { return Dump(); }, recorder)
        .Check(step);
  }
  // The same, hearing the sequence, every item and their chains.
  void CheckUndoRoundTrip(const UndoRoundTrip::Step& step) {
    MessageRecorder recorder;
    recorder.Listen(sequence->GetStation());
    for (const TrackItemRef& item : {video, audio1, audio2, second, transition}) {
      recorder.Listen(item->GetStation());
      recorder.Listen(item->GetComponentChain()->GetStation());
    }
    CheckUndoRoundTrip(step, recorder);
  }
  UndoStack& Undo() { return project->GetUndoStack(); }

  MessagingTestScope messaging;
  ProjectRef project;
  SequenceRef sequence;
  TrackRef v1, a1, a2;
  MediaRef media;
  MasterClipRef masterClip;
  TrackItemRef video, audio1, audio2, second, transition;
  ComponentChainRef videoChain;
  ComponentRef blur, crop;
};
