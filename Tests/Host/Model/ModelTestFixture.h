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
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Tests/Host/Model/MessageRecorder.h"

inline constexpr TickTime kSecond = kTicksPerSecond;

// A project with one 25 fps sequence: a linked clip "Interview" (video on V1 at [2 s, 7 s),
// media from 1 s; two audio parts on A1 and A2 with order keys 1 and 0) carrying the intrinsics
// plus Gaussian Blur and Crop on the video and Delay on the first audio part; a second clip on V1
// at [7 s, 12 s) and a transition over the cut at [6.5 s, 7.5 s).
class ModelTest : public ::testing::Test {
 protected:
  ModelTest() {
    project = Project::Create("Test");
    sequence = Sequence::Create("Sequence 01", kFrameRate_25);
    project->AddSequence(sequence);
    project->SetActiveSequence(sequence);
    v1 = Track::Create(MediaType::Video, "V1");
    a1 = Track::Create(MediaType::Audio, "A1");
    a2 = Track::Create(MediaType::Audio, "A2");
    sequence->AddTrack(v1);
    sequence->AddTrack(a1);
    sequence->AddTrack(a2);

    media = Media::Create("interview.mov", 60 * kSecond, true, true);
    masterClip = MasterClip::Create("Interview", media);
    project->AddMasterClip(masterClip);

    video = AddClip(v1, MediaType::Video, 2 * kSecond, 7 * kSecond, 1 * kSecond);
    audio1 = AddClip(a1, MediaType::Audio, 2 * kSecond, 7 * kSecond, 1 * kSecond);
    audio2 = AddClip(a2, MediaType::Audio, 2 * kSecond, 7 * kSecond, 1 * kSecond);
    audio1->SetPartOrderKey(1);
    audio2->SetPartOrderKey(0);
    for (const TrackItemRef& item : {video, audio1, audio2}) {
      item->SetLinkGroup(1);
    }
    videoChain = video->GetComponentChain();
    blur = Catalogue().Create(kMatchName_GaussianBlur);
    crop = Catalogue().Create(kMatchName_Crop);
    videoChain->Append(blur);
    videoChain->Append(crop);
    audio1->GetComponentChain()->Append(Catalogue().Create(kMatchName_Delay));

    second = AddClip(v1, MediaType::Video, 7 * kSecond, 12 * kSecond, 10 * kSecond);
    TransitionData data;
    data.matchName = "XO.KRVN CrossDissolve";
    data.displayName = "Cross Dissolve";
    transition = TrackItem::CreateTransition(MediaType::Video, 6 * kSecond + kSecond / 2,
                                             7 * kSecond + kSecond / 2, data);
    v1->AddItem(transition);
  }

  static const EffectCatalogue& Catalogue() { return EffectCatalogue::Standard(); }

  TrackItemRef AddClip(const TrackRef& track, MediaType type, TickTime start, TickTime end,
                       TickTime mediaIn) {
    TrackItemRef item = TrackItem::CreateClip(type, start, end, masterClip, mediaIn);
    for (const ComponentRef& intrinsic : Catalogue().CreateIntrinsics(type)) {
      item->GetComponentChain()->Append(intrinsic);
    }
    track->AddItem(item);
    return item;
  }

  ComponentRef Intrinsic(const char* matchName) const {
    return videoChain->FindByMatchName(matchName);
  }
  ComponentParamRef Param(const ComponentRef& component, const char* name) const {
    return component->FindParam(name);
  }
  std::string Dump() const { return DescribeForTest(*project); }
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
