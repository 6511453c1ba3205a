#include <gtest/gtest.h>

#include <functional>
#include <utility>

#include "Host/Model/SequenceActions.h"
#include "Host/Model/TransitionActions.h"
#include "Host/Model/TransitionPercentActor.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

class TransitionActionsTest : public EditingModelTest {
 protected:
  // Checks a setting's edit: one undo step named `name` and one TrackItemChangedMessage on the
  // transition for each of do, undo and redo.
  void DoAndUndo(const char* name, std::function<EditStatus()> edit) {
    MessageRecorder recorder;
    recorder.Listen(transition->GetStation());
    UndoRoundTrip(
        *project, [this] { return State(); }, recorder)
        .Check({.name = name, .edit = std::move(edit), .messages = {"TrackItemChangedMessage"}});
  }

  const TransitionData& Data() const { return transition->GetTransitionData(); }
};

TEST_F(TransitionActionsTest, EverySettingIsOneUndoableStep) {
  TransitionData data = Data();
  data.startPositionMovable = true;
  data.takesDirectionPair = true;
  transition->SetTransitionData(data);

  DoAndUndo(TransitionActions::kSetStartPercent,
            [&] { return TransitionActions::SetStartPercent(transition, 0.25f); });
  DoAndUndo(TransitionActions::kSetEndPercent,
            [&] { return TransitionActions::SetEndPercent(transition, 0.5f, 0.5f); });
  DoAndUndo(TransitionActions::kSetStartPosition, [&] {
    return TransitionActions::SetStartPosition(transition, {0.1, 0.9});
  });
  DoAndUndo(TransitionActions::kSetBorderWidth,
            [&] { return TransitionActions::SetBorderWidth(transition, 3.5f); });
  DoAndUndo(TransitionActions::kSetBorderColor, [&] {
    return TransitionActions::SetBorderColor(transition, {1.0f, 0.0f, 0.0f, 1.0f});
  });
  DoAndUndo(TransitionActions::kSetSwitchSources,
            [&] { return TransitionActions::SetSwitchSources(transition, true); });
  DoAndUndo(TransitionActions::kSetReverse,
            [&] { return TransitionActions::SetReverse(transition, true); });
  DoAndUndo(TransitionActions::kSetOrientation, [&] {
    return TransitionActions::SetDirection(transition,
                                           {kTransitionDirectionWest, kTransitionDirectionEast});
  });
  DoAndUndo(TransitionActions::kSetAntiAliasQuality,
            [&] { return TransitionActions::SetAntiAliasQuality(transition, 4); });
  DoAndUndo(TransitionActions::kSetPrivateData, [&] {
    return TransitionActions::SetPrivateData(transition, ParamBlob{{1, 2, 3}});
  });
}

TEST_F(TransitionActionsTest, BadValuesAreRefusedAndTheSameValueMakesNoStep) {
  const std::string before = State();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  EXPECT_EQ(TransitionActions::SetStartPercent(transition, 1.5f), EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetEndPercent(transition, std::nanf("")),
            EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetBorderWidth(transition, -1.0f), EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetBorderColor(transition, {INFINITY, 0, 0, 1}),
            EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetAntiAliasQuality(transition, 5), EditStatus::InvalidArgument);
  // Not movable, a direction that is not one bit, or a pair for a single-direction transition.
  EXPECT_EQ(TransitionActions::SetStartPosition(transition, {0.2, 0.2}),
            EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetDirection(transition, {3}), EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetDirection(transition, {1, 4}), EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetReverse(transition, false), EditStatus::NoChange);
  EXPECT_EQ(TransitionActions::SetAntiAliasQuality(b, 2), EditStatus::InvalidArgument);
  EXPECT_EQ(State(), before);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);
}

TEST_F(TransitionActionsTest, ADirectionNotOfferedIsRefused) {
  TransitionData data = Data();
  data.allowedDirections = kTransitionDirectionNorth | kTransitionDirectionSouth;
  transition->SetTransitionData(data);
  EXPECT_EQ(TransitionActions::SetDirection(transition, {kTransitionDirectionEast}),
            EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetDirection(transition, {kTransitionDirectionSouth}),
            EditStatus::Done);
}

TEST_F(TransitionActionsTest, ReadOnlySequenceRefusesEveryChange) {
  sequence->SetReadOnly(true);
  EXPECT_EQ(TransitionActions::SetReverse(transition, true), EditStatus::ReadOnly);
  EXPECT_EQ(TransitionActions::SetDuration(transition, 2 * kSec), EditStatus::ReadOnly);
  EXPECT_FALSE(TransitionActions::CanAlign(transition, TransitionActions::Alignment::StartAtCut));
  EXPECT_FALSE(Data().reverse);
}

TEST_F(TransitionActionsTest, DurationKeepsTheAlignmentAndIsLimitedByTheClips) {
  CheckUndoRoundTrip({.name = TransitionActions::kSetDuration,
                      .edit = [&] { return TransitionActions::SetDuration(transition, 2 * kSec); },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(transition->GetStart(), 4 * kSec);
                            EXPECT_EQ(transition->GetEnd(), 6 * kSec);
                          }});

  // B's media starts at 2 s and B ends at 10 s: 20 s becomes [2 s, 10 s).
  ASSERT_EQ(TransitionActions::SetDuration(transition, 20 * kSec), EditStatus::Done);
  EXPECT_EQ(transition->GetStart(), 2 * kSec);
  EXPECT_EQ(transition->GetEnd(), 10 * kSec);
  EXPECT_EQ(TransitionActions::SetDuration(transition, 0), EditStatus::InvalidArgument);
  EXPECT_EQ(TransitionActions::SetDuration(transition, -kSec), EditStatus::InvalidArgument);
  EXPECT_EQ(transition->GetDuration(), 8 * kSec);
}

TEST_F(TransitionActionsTest, AlignmentSlidesTheTransitionOntoTheCut) {
  using Alignment = TransitionActions::Alignment;
  EXPECT_EQ(TransitionActions::GetAlignment(*transition), Alignment::CenterAtCut);
  EXPECT_EQ(TransitionActions::SetAlignment(transition, Alignment::CenterAtCut),
            EditStatus::NoChange);
  ASSERT_TRUE(TransitionActions::CanAlign(transition, Alignment::StartAtCut));
  ASSERT_EQ(TransitionActions::SetAlignment(transition, Alignment::StartAtCut), EditStatus::Done);
  EXPECT_EQ(transition->GetStart(), 5 * kSec);
  EXPECT_EQ(TransitionActions::GetAlignment(*transition), Alignment::StartAtCut);
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), SequenceActions::kSlideTransition);
  ASSERT_EQ(TransitionActions::SetAlignment(transition, Alignment::EndAtCut), EditStatus::Done);
  EXPECT_EQ(transition->GetEnd(), 5 * kSec);
  EXPECT_EQ(TransitionActions::SetAlignment(transition, Alignment::Custom), EditStatus::NoChange);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(TransitionActions::GetAlignment(*transition), Alignment::CenterAtCut);
}

TEST_F(TransitionActionsTest, AlignmentNeedsMaterialToFillTheTransition) {
  // With B starting at its media's first frame, the transition cannot start before the cut.
  b->SetTimes(b->GetStart(), b->GetEnd(), 0);
  EXPECT_FALSE(TransitionActions::CanAlign(transition, TransitionActions::Alignment::EndAtCut));
  EXPECT_EQ(TransitionActions::SetAlignment(transition, TransitionActions::Alignment::EndAtCut),
            EditStatus::TimeOutOfRange);
}

TEST_F(TransitionActionsTest, PercentDragPushesTheEndAndCommitsOneStep) {
  const std::string before = State();
  {
    TransitionPercentActor actor(transition, TransitionPercentActor::Which::Start);
    ASSERT_TRUE(actor.SetPercents(0.5f));
    ASSERT_TRUE(actor.SetPercents(0.8f, 0.8f));  // past the end: the end follows
    EXPECT_FALSE(actor.SetPercents(1.2f));
    EXPECT_EQ(Data().startPercent, 0.8f);
    EXPECT_EQ(Data().endPercent, 0.8f);
    EXPECT_TRUE(project->GetUndoStack().GetUndoNames().empty());
    EXPECT_EQ(actor.Commit(), EditStatus::Done);
  }
  EXPECT_EQ(Data().endPercent, 0.8f);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames(),
            std::vector<std::string>{TransitionActions::kSetStartPercent});
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(TransitionActionsTest, AnUncommittedPercentDragIsRolledBack) {
  const std::string before = State();
  {
    TransitionPercentActor actor(transition, TransitionPercentActor::Which::End);
    ASSERT_TRUE(actor.SetPercents(0.3f));
  }
  EXPECT_EQ(State(), before);
  EXPECT_TRUE(project->GetUndoStack().GetUndoNames().empty());
}

}  // namespace
