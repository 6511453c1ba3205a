#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <string_view>
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

// Records the type name of every message on the stations it listens on, in order.
class EditingMessageLog : public Listener {
 public:
  void Listen(const StationName& station) { AddListener(station, *this); }
  void ListenToMessage(const Message& message) override {
    entries.emplace_back(message.GetTypeName());
  }
  int Count(std::string_view typeName) const {
    int count = 0;
    for (const std::string& entry : entries) {
      count += entry == typeName ? 1 : 0;
    }
    return count;
  }
  // The messages as a sorted multiset, for comparing an edit's messages with its undo's.
  std::vector<std::string> Sorted() const {
    std::vector<std::string> sorted = entries;
    std::sort(sorted.begin(), sorted.end());
    return sorted;
  }
  void Clear() { entries.clear(); }

  std::vector<std::string> entries;
};

inline constexpr TickTime kSec = kTicksPerSecond;
inline constexpr TickTime kFrame25 = kTicksPerSecond / 25;

// A project with one 25 fps sequence. V1: clip A [0 s, 5 s) showing media from 2 s of a 20 s
// file (media in the sequence from -2 s to 18 s), clip B [5 s, 10 s) from 3 s of a 30 s file
// (media from 2 s to 32 s), a dissolve over the cut [4.5 s, 5.5 s);
// then clip C [12 s, 14 s) from 10 s of B's file. A1: A's and B's linked audio at the same times,
// C's audio. Every clip carries its intrinsics; clip A's video also Gaussian Blur and Crop.
class EditingModelTest : public ::testing::Test {
 protected:
  EditingModelTest() {
    project = Project::Create("Editing");
    sequence = Sequence::Create("Sequence", kFrameRate_25);
    project->AddSequence(sequence);
    project->SetActiveSequence(sequence);
    v1 = Track::Create(MediaType::Video, "V1");
    a1 = Track::Create(MediaType::Audio, "A1");
    sequence->AddTrack(v1);
    sequence->AddTrack(a1);
    mediaA = Media::Create("a.mov", 20 * kSec, true, true);
    mediaB = Media::Create("b.mov", 30 * kSec, true, true);
    clipA = MasterClip::Create("A", mediaA);
    clipB = MasterClip::Create("B", mediaB);
    project->AddMasterClip(clipA);
    project->AddMasterClip(clipB);

    a = AddClip(v1, clipA, 0, 5 * kSec, 2 * kSec, 1);
    b = AddClip(v1, clipB, 5 * kSec, 10 * kSec, 3 * kSec, 2);
    c = AddClip(v1, clipB, 12 * kSec, 14 * kSec, 10 * kSec, 3);
    aAudio = AddClip(a1, clipA, 0, 5 * kSec, 2 * kSec, 1);
    bAudio = AddClip(a1, clipB, 5 * kSec, 10 * kSec, 3 * kSec, 2);
    cAudio = AddClip(a1, clipB, 12 * kSec, 14 * kSec, 10 * kSec, 3);

    TransitionData dissolve;
    dissolve.matchName = "XO.KRVN CrossDissolve";
    dissolve.displayName = "Cross Dissolve";
    dissolve.allowedDirections = 0xFF;
    transition = TrackItem::CreateTransition(MediaType::Video, 4500 * kSec / 1000,
                                             5500 * kSec / 1000, dissolve);
    v1->AddItem(transition);

    blur = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
    crop = EffectCatalogue::Standard().Create(kMatchName_Crop);
    a->GetComponentChain()->Append(blur);
    a->GetComponentChain()->Append(crop);
  }

  TrackItemRef AddClip(const TrackRef& track, const MasterClipRef& clip, TickTime start,
                       TickTime end, TickTime mediaIn, int link) {
    TrackItemRef item = TrackItem::CreateClip(track->GetMediaType(), start, end, clip, mediaIn);
    for (const ComponentRef& intrinsic :
         EffectCatalogue::Standard().CreateIntrinsics(track->GetMediaType())) {
      item->GetComponentChain()->Append(intrinsic);
    }
    track->AddItem(item);
    item->SetLinkGroup(link);
    return item;
  }

  std::string State() const { return DescribeForTest(*project); }

  // Listens to the sequence and every item of the fixture.
  void ListenToEverything(EditingMessageLog& log) const {
    log.Listen(sequence->GetStation());
    for (const TrackItemRef& item : {a, b, c, aAudio, bAudio, cAudio, transition}) {
      log.Listen(item->GetStation());
    }
  }

  // "[start,end)" of an item in whole frames of 25 fps, for short expectations.
  static std::string Span(const TrackItemRef& item) {
    return "[" + std::to_string(item->GetStart() / kFrame25) + "," +
           std::to_string(item->GetEnd() / kFrame25) + ")";
  }

  MessagingTestScope messaging;
  ProjectRef project;
  SequenceRef sequence;
  TrackRef v1;
  TrackRef a1;
  MediaRef mediaA;
  MediaRef mediaB;
  MasterClipRef clipA;
  MasterClipRef clipB;
  TrackItemRef a;
  TrackItemRef b;
  TrackItemRef c;
  TrackItemRef aAudio;
  TrackItemRef bAudio;
  TrackItemRef cAudio;
  TrackItemRef transition;
  ComponentRef blur;
  ComponentRef crop;
};
