#include <gtest/gtest.h>

#include "Host/Model/SequenceActions.h"
#include "Host/Model/SequenceEditing.h"
#include "Host/Model/TransitionActions.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

using Edge = SequenceEditing::Edge;

class SequenceEditingTest : public EditingModelTest {
 protected:
  // Frames of 25 fps.
  static constexpr TickTime F(double frames) { return static_cast<TickTime>(frames * kFrame25); }
};

TEST_F(SequenceEditingTest, FindsTheClipsOnEitherSideOfATransition) {
  const auto clips = SequenceEditing::FindTransitionClips(*transition);
  EXPECT_EQ(clips.clipA, a);
  EXPECT_EQ(clips.clipB, b);
  EXPECT_EQ(clips.cut, 5 * kSec);
  EXPECT_EQ(SequenceEditing::FindTransitionAt(*a, Edge::End), transition);
  EXPECT_EQ(SequenceEditing::FindTransitionAt(*b, Edge::Start), transition);
  EXPECT_EQ(SequenceEditing::FindTransitionAt(*b, Edge::End), nullptr);
}

TEST_F(SequenceEditingTest, TransitionStartStopsAtTheHeadMaterialOfClipBAndAtTheCut) {
  // B's media starts at 2 s in the sequence; the start may not go past the cut at 5 s.
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::Start, -10 * kSec),
            -2500 * kSec / 1000);
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::Start, 10 * kSec),
            500 * kSec / 1000);
  EXPECT_EQ(SequenceActions::TrimTransitions(transition, Edge::Start, -3 * kSec),
            EditStatus::TimeOutOfRange);
  CheckUndoRoundTrip(
      {.name = SequenceActions::kTrimTransitions,
       .edit = [&] { return SequenceActions::TrimTransitions(transition, Edge::Start, -kSec); },
       .checkEdited =
           [&] {
             EXPECT_EQ(transition->GetStart(), 3500 * kSec / 1000);
             EXPECT_EQ(transition->GetEnd(), 5500 * kSec / 1000);
             EXPECT_DOUBLE_EQ(transition->GetTransitionData().cutRatio, 0.75);
             EXPECT_EQ(Span(a), "[0,125)");
             EXPECT_EQ(Span(b), "[125,250)");
           }});
}

TEST_F(SequenceEditingTest, TransitionEndStopsAtClipBsEndAndAtTheCut) {
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::End, 20 * kSec),
            4500 * kSec / 1000);
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::End, -20 * kSec),
            -500 * kSec / 1000);
  CheckUndoRoundTrip({.name = SequenceActions::kTrimTransitions,
                      .edit =
                          [&] {
                            return SequenceActions::TrimTransitions(transition, Edge::End,
                                                                    -500 * kSec / 1000);
                          },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(transition->GetEnd(), 5 * kSec);
                            EXPECT_EQ(TransitionActions::GetAlignment(*transition),
                                      TransitionActions::Alignment::EndAtCut);
                          }});
}

TEST_F(SequenceEditingTest, QueriesRoundDraggedDeltasToFrames) {
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::End, F(2.4)), F(2));
  EXPECT_EQ(SequenceActions::QueryTrimTransition(transition, Edge::End, F(2.6)), F(3));
}

TEST_F(SequenceEditingTest, SlideKeepsTheCutInsideTheTransition) {
  EXPECT_EQ(SequenceActions::QuerySlideTransition(transition, 10 * kSec), 500 * kSec / 1000);
  EXPECT_EQ(SequenceActions::QuerySlideTransition(transition, -10 * kSec), -500 * kSec / 1000);
  CheckUndoRoundTrip(
      {.name = SequenceActions::kSlideTransition,
       .edit = [&] { return SequenceActions::SlideTransition(transition, 500 * kSec / 1000); },
       .checkEdited =
           [&] {
             EXPECT_EQ(transition->GetStart(), 5 * kSec);
             EXPECT_EQ(transition->GetDuration(), kSec);
             EXPECT_EQ(TransitionActions::GetAlignment(*transition),
                       TransitionActions::Alignment::StartAtCut);
           }});
}

TEST_F(SequenceEditingTest, SlideNeedsBothClips) {
  // A transition at the start of clip C has no clip A.
  TransitionData data = transition->GetTransitionData();
  data.cutRatio = 0.0;
  const TrackItemRef opening = builder.AddTransition(v1, 12 * kSec, 13 * kSec, data);
  EXPECT_EQ(SequenceEditing::FindTransitionClips(*opening).clipB, c);
  EXPECT_EQ(SequenceEditing::FindTransitionClips(*opening).clipA, nullptr);
  EXPECT_EQ(SequenceActions::QuerySlideTransition(opening, kSec), 0);
  EXPECT_EQ(SequenceActions::SlideTransition(opening, F(1)), EditStatus::TimeOutOfRange);
  // Its end may still be trimmed, up to C's end.
  EXPECT_EQ(SequenceActions::QueryTrimTransition(opening, Edge::End, 5 * kSec), kSec);
}

TEST_F(SequenceEditingTest, RollMovesTheCutAndTheTransitionWithinBothClipsMedia) {
  // Left: B's head (media from 2 s) must still fill the transition's first half.
  EXPECT_EQ(SequenceActions::QueryRollItems(a, b, -10 * kSec), -2500 * kSec / 1000);
  // Right: the transition may not pass B's end.
  EXPECT_EQ(SequenceActions::QueryRollItems(a, b, 10 * kSec), 4500 * kSec / 1000);
  CheckUndoRoundTrip({.name = SequenceActions::kRollItems,
                      .edit = [&] { return SequenceActions::RollItems(a, b, kSec); },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(Span(a), "[0,150)");
                            EXPECT_EQ(Span(b), "[150,250)");
                            EXPECT_EQ(b->GetMediaIn(), 4 * kSec);
                            EXPECT_EQ(transition->GetStart(), 5500 * kSec / 1000);
                            EXPECT_EQ(Span(c), "[300,350)");
                            EXPECT_EQ(Span(aAudio), "[0,125)");  // a roll moves only the two clips
                          }});
}

TEST_F(SequenceEditingTest, RollRefusesClipsThatDoNotMeet) {
  EXPECT_EQ(SequenceActions::QueryRollItems(b, c, kSec), 0);
  EXPECT_EQ(SequenceEditing::GetRollLimits(*b, *c).maximum, 0);
}

TEST_F(SequenceEditingTest, RippleOfClipAsEndMovesEverythingAfterItOnItsAndItsLinkedTracks) {
  const std::vector<TrackItemRef> items{a, aAudio};
  // A's media ends at 18 s in the sequence and the transition needs 0.5 s of it after the cut.
  EXPECT_EQ(SequenceActions::QueryTrimItems(items, Edge::End, 20 * kSec, true),
            12500 * kSec / 1000);
  // The transition's start may not go before A's start.
  EXPECT_EQ(SequenceActions::QueryTrimItems(items, Edge::End, -20 * kSec, true),
            -4500 * kSec / 1000);
  CheckUndoRoundTrip(
      {.name = SequenceActions::kRippleTrimItems,
       .edit = [&] { return SequenceActions::TrimItems(items, Edge::End, kSec, true); },
       .checkEdited =
           [&] {
             EXPECT_EQ(Span(a), "[0,150)");
             EXPECT_EQ(Span(b), "[150,275)");
             EXPECT_EQ(b->GetMediaIn(), 3 * kSec);
             EXPECT_EQ(Span(c), "[325,375)");
             EXPECT_EQ(transition->GetStart(), 5500 * kSec / 1000);
             EXPECT_EQ(Span(aAudio), "[0,150)");
             EXPECT_EQ(Span(bAudio), "[150,275)");
             EXPECT_EQ(Span(cAudio), "[325,375)");
           }});
}

TEST_F(SequenceEditingTest, RippleOfTheClipAloneLeavesTheLinkedTrack) {
  ASSERT_EQ(SequenceActions::TrimItems({a}, Edge::End, -kSec, true), EditStatus::Done);
  EXPECT_EQ(Span(a), "[0,100)");
  EXPECT_EQ(Span(b), "[100,225)");
  EXPECT_EQ(Span(aAudio), "[0,125)");
  EXPECT_EQ(Span(bAudio), "[125,250)");
}

TEST_F(SequenceEditingTest, RippleOfClipBsStartTrimsItsHeadAndPullsTheRestIn) {
  // B's media starts 2.5 s before the transition's start at 4.5 s; B must keep a frame.
  EXPECT_EQ(SequenceActions::QueryTrimItems({b}, Edge::Start, -10 * kSec, true),
            -2500 * kSec / 1000);
  EXPECT_EQ(SequenceActions::QueryTrimItems({b}, Edge::Start, 10 * kSec, true), 5 * kSec - F(1));
  CheckUndoRoundTrip(
      {.name = SequenceActions::kRippleTrimItems,
       .edit = [&] { return SequenceActions::TrimItems({b}, Edge::Start, kSec, true); },
       .checkEdited =
           [&] {
             EXPECT_EQ(Span(b), "[125,225)");
             EXPECT_EQ(b->GetMediaIn(), 4 * kSec);
             EXPECT_EQ(Span(c), "[275,325)");
             EXPECT_EQ(transition->GetStart(), 4500 * kSec / 1000);
             EXPECT_EQ(Span(cAudio), "[300,350)");
           }});
}

TEST_F(SequenceEditingTest, PlainTrimStopsAtTheNeighbourAndAtTheMedia) {
  // A's end carries the transition: no plain trim there.
  EXPECT_EQ(SequenceActions::QueryTrimItems({a}, Edge::End, kSec, false), 0);
  // C's start may reach B's end at 10 s (its media would allow 2 s).
  EXPECT_EQ(SequenceActions::QueryTrimItems({c}, Edge::Start, -10 * kSec, false), -2 * kSec);
  EXPECT_EQ(SequenceActions::QueryTrimItems({c}, Edge::Start, 10 * kSec, false), 2 * kSec - F(1));
  CheckUndoRoundTrip(
      {.name = SequenceActions::kTrimItems,
       .edit = [&] { return SequenceActions::TrimItems({c}, Edge::Start, -kSec, false); },
       .checkEdited =
           [&] {
             EXPECT_EQ(Span(c), "[275,350)");
             EXPECT_EQ(c->GetMediaIn(), 9 * kSec);
             EXPECT_EQ(Span(cAudio), "[300,350)");
           }});
}

// Clip D [14 s, 16 s) touching C's end with no transition, showing B's file from 20 s: media
// long before its in point, so only C and the one-frame minimum bound the edits at the cut.
class TouchingClipsTest : public SequenceEditingTest {
 protected:
  TrackItemRef d = builder.AddClip(
      v1, clipB, {.start = 14 * kSec, .end = 16 * kSec, .mediaIn = 20 * kSec, .linkGroup = 4});
};

TEST_F(TouchingClipsTest, PlainTrimOfAStartThatTouchesTheClipBeforeCannotGrowOverIt) {
  EXPECT_EQ(SequenceActions::QueryTrimItems({d}, Edge::Start, -kSec, false), 0);
  const std::string before = State();
  EXPECT_EQ(SequenceActions::TrimItems({d}, Edge::Start, -F(1), false), EditStatus::TimeOutOfRange);
  EXPECT_EQ(State(), before);
  // Shortening stays possible, down to one frame.
  EXPECT_EQ(SequenceActions::QueryTrimItems({d}, Edge::Start, 10 * kSec, false), 2 * kSec - F(1));
  // And the end of C, touching D, cannot grow either.
  EXPECT_EQ(SequenceActions::QueryTrimItems({c}, Edge::End, kSec, false), 0);
}

TEST_F(TouchingClipsTest, RollingACutWithoutATransitionKeepsAFrameOfEachClip) {
  EXPECT_EQ(SequenceActions::QueryRollItems(c, d, -10 * kSec), -2 * kSec + F(1));
  EXPECT_EQ(SequenceActions::QueryRollItems(c, d, 10 * kSec), 2 * kSec - F(1));
  const std::string before = State();
  EXPECT_EQ(SequenceActions::RollItems(c, d, -2 * kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(SequenceActions::RollItems(c, d, 2 * kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(State(), before);
  CheckUndoRoundTrip({.name = SequenceActions::kRollItems,
                      .edit = [&] { return SequenceActions::RollItems(c, d, -2 * kSec + F(1)); },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(Span(c), "[300,301)");
                            EXPECT_EQ(Span(d), "[301,400)");
                          }});
}

TEST_F(SequenceEditingTest, EditsBeyondTheLimitsOrOnAReadOnlySequenceChangeNothing) {
  const std::string before = State();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  EXPECT_EQ(SequenceActions::RollItems(a, b, 6 * kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(SequenceActions::SlideTransition(transition, 0), EditStatus::NoChange);
  EXPECT_EQ(SequenceActions::TrimItems({a, aAudio}, Edge::End, 13 * kSec, true),
            EditStatus::TimeOutOfRange);
  // Two items on one track cannot be ripple-trimmed together.
  EXPECT_EQ(SequenceActions::QueryTrimItems({a, b}, Edge::End, kSec, true), 0);
  EXPECT_EQ(State(), before);
  sequence->SetReadOnly(true);
  const std::string readOnly = State();
  EXPECT_EQ(SequenceActions::QueryRollItems(a, b, kSec), 0);
  EXPECT_EQ(SequenceActions::RollItems(a, b, kSec), EditStatus::ReadOnly);
  EXPECT_EQ(State(), readOnly);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);
}

TEST_F(SequenceEditingTest, RemovedItemsComeBackExactlyOnUndo) {
  CheckUndoRoundTrip({.name = SequenceActions::kRemoveItems,
                      .edit =
                          [&] {
                            return SequenceActions::RemoveItems({transition, c});
                          },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(transition->GetTrack(), nullptr);
                            EXPECT_EQ(v1->GetItems().size(), 2u);
                          }});
  EXPECT_EQ(transition->GetTrack(), v1.get());
}

}  // namespace
