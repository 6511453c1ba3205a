#pragma once

#include <gtest/gtest.h>

#include <string>

#include "Host/Messaging/MessagingTestScope.h"
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
    sequence = builder.AddSequence("Sequence", kFrameRate_25);
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    a1 = builder.AddTrack(sequence, MediaType::Audio, "A1");
    mediaA = builder.AddMedia("a.mov", 20 * kSec, ProjectBuilder::Streams::VideoAndAudio);
    mediaB = builder.AddMedia("b.mov", 30 * kSec, ProjectBuilder::Streams::VideoAndAudio);
    clipA = builder.AddMasterClip("A", mediaA);
    clipB = builder.AddMasterClip("B", mediaB);

    const ProjectBuilder::ClipPlacement spanA{
        .start = 0, .end = 5 * kSec, .mediaIn = 2 * kSec, .linkGroup = 1};
    const ProjectBuilder::ClipPlacement spanB{
        .start = 5 * kSec, .end = 10 * kSec, .mediaIn = 3 * kSec, .linkGroup = 2};
    const ProjectBuilder::ClipPlacement spanC{
        .start = 12 * kSec, .end = 14 * kSec, .mediaIn = 10 * kSec, .linkGroup = 3};
    a = builder.AddClip(v1, clipA, spanA);
    b = builder.AddClip(v1, clipB, spanB);
    c = builder.AddClip(v1, clipB, spanC);
    aAudio = builder.AddClip(a1, clipA, spanA);
    bAudio = builder.AddClip(a1, clipB, spanB);
    cAudio = builder.AddClip(a1, clipB, spanC);

    TransitionData dissolve;
    dissolve.matchName = "XO.KRVN CrossDissolve";
    dissolve.displayName = "Cross Dissolve";
    dissolve.allowedDirections = 0xFF;
    transition = builder.AddTransition(v1, 4500 * kSec / 1000, 5500 * kSec / 1000, dissolve);

    blur = builder.AddEffect(a, kMatchName_GaussianBlur);
    crop = builder.AddEffect(a, kMatchName_Crop);
  }

  std::string State() const { return DescribeForTest(*project); }

  // Listens to the sequence, every item of the fixture and their chains.
  void ListenToEverything(MessageRecorder& recorder) const {
    recorder.Listen(sequence->GetStation());
    for (const TrackItemRef& item : {a, b, c, aAudio, bAudio, cAudio, transition}) {
      recorder.Listen(item->GetStation());
      recorder.Listen(item->GetComponentChain()->GetStation());
    }
  }

  // Checks an edit, its undo and its redo against the whole project, hearing what
  // ListenToEverything hears.
  void CheckUndoRoundTrip(const UndoRoundTrip::Step& step) {
    MessageRecorder recorder;
    ListenToEverything(recorder);
    UndoRoundTrip(
        *project, [this] { return State(); }, recorder)
        .Check(step);
  }

  // "[start,end)" of an item in whole frames of 25 fps, for short expectations.
  static std::string Span(const TrackItemRef& item) {
    return "[" + std::to_string(item->GetStart() / kFrame25) + "," +
           std::to_string(item->GetEnd() / kFrame25) + ")";
  }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Editing"};  // for items a test adds
  ProjectRef project = builder.GetProject();
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
