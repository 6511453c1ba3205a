// Moving keyframes in the keyframe area (drag, snapping, cancel, nudge), the keyframe commands
// and their states, and intro and outro resizing: each edit is one undo step.
#include <gtest/gtest.h>

#include "Host/Model/IntroOutroActions.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/ViewBase.h"
#include "Tests/Handlers/EffectControls/KeyframeAreaTestSupport.h"

using namespace keyframe_area_test;
using Times = std::vector<TickTime>;

namespace {

constexpr TickTime kFrame = kSec / 25;

}  // namespace

TEST_F(KeyframeAreaTest, ADragEndingWithinSixPixelsOfTheCurrentTimeLandsOnItAsOneUndoStep) {
  OpenClip();
  sequence->SetCurrentTime(5 * kSec + 10 * kFrame);
  Area().SetSnapFlags(EffectControlsKeyframeView::kSnapKeyframes |
                      EffectControlsKeyframeView::kSnapCurrentTime);
  const std::size_t steps = Undo().GetUndoNames().size();
  const Point from = Glyph(fade, 5 * kSec);
  Drag(from, Point{XOf(5 * kSec + 10 * kFrame) + 5, from.y});
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec + 10 * kFrame, 6 * kSec}));
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{5 * kSec + 10 * kFrame});
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, WithSnappingOffADragFollowsThePointer) {
  OpenClip();
  sequence->SetCurrentTime(5 * kSec + 10 * kFrame);
  Area().SetSnapFlags(0);
  const Point from = Glyph(fade, 5 * kSec);
  const int to = XOf(5 * kSec + 10 * kFrame) + 5;
  Drag(from, Point{to, from.y});
  const TickTime moved = SequenceTimes(fade)[1];
  EXPECT_NE(moved, 5 * kSec + 10 * kFrame);
  EXPECT_EQ(Area().TimeToX(moved) + Area().GetBounds().left, to);
}

TEST_F(KeyframeAreaTest, ADragShowsTheSnapGuideAndTheRulerFollowsUntilTheRelease) {
  OpenClip();
  Area().SetSnapFlags(EffectControlsKeyframeView::kSnapKeyframes |
                      EffectControlsKeyframeView::kSnapVideo);
  const Point from = Glyph(fade, 5 * kSec);
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  // Onto Position's 4 s keyframe, 2 pixels short of it.
  host->MouseMove(Point{XOf(4 * kSec) + 2, from.y}, kKeyModifierNone);
  EXPECT_TRUE(Area().HasDragGuide());
  EXPECT_TRUE(Area().IsDragGuideSnapped());
  EXPECT_EQ(Area().GetDragGuideX(), Area().TimeToX(4 * kSec));
  EXPECT_EQ(SequenceTimes(fade)[1], 4 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetCurrentTime(), 4 * kSec);
  host->MouseUp(MouseButton::kLeft, Point{XOf(4 * kSec) + 2, from.y}, kKeyModifierNone);
  EXPECT_EQ(view->GetTimeRuler()->GetCurrentTime(), 2 * kSec);
  EXPECT_FALSE(Area().HasDragGuide());
}

TEST_F(KeyframeAreaTest, SeveralSelectedKeyframesAcrossParametersMoveTogether) {
  OpenClip();
  Area().SetSnapFlags(0);
  Click(Glyph(position, 4 * kSec));
  Click(Glyph(fade, 5 * kSec), kKeyModifierShift);
  const Point from = Glyph(fade, 5 * kSec);
  Drag(from, Point{from.x + 20, from.y});
  const TickTime delta = SequenceTimes(fade)[1] - 5 * kSec;
  EXPECT_GT(delta, 0);
  EXPECT_EQ(SequenceTimes(position)[1], 4 * kSec + delta);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(position), (Times{3 * kSec, 4 * kSec}));
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, AMoveHeldAtTheClipStartDoesNotDriftWhenThePointerComesBack) {
  OpenClip();
  Area().SetSnapFlags(0);
  Click(Glyph(position, 3 * kSec));
  Click(Glyph(position, 4 * kSec), kKeyModifierShift);
  const Point from = Glyph(position, 3 * kSec);
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  // Far left of the clip's start (2 s): the first keyframe stops there.
  host->MouseMove(Point{XOf(2 * kSec) - 60, from.y}, kKeyModifierNone);
  EXPECT_EQ(SequenceTimes(position), (Times{2 * kSec, 3 * kSec}));
  // Back where it started: the keyframes go where the pointer is, as if never held back.
  const Point back{from.x + 30, from.y};
  host->MouseMove(back, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, back, kKeyModifierNone);
  const TickTime atPointer =
      Area().GetVisibleStartTime() + (back.x - Area().GetBounds().left) * Area().GetPixelSpan();
  EXPECT_EQ(SequenceTimes(position), (Times{atPointer, atPointer + kSec}));
}

TEST_F(KeyframeAreaTest, EscapeDuringADragPutsTheKeyframesBackWithoutAnUndoStep) {
  OpenClip();
  Area().SetSnapFlags(0);
  Click(Glyph(fade, 6 * kSec));
  const std::size_t steps = Undo().GetUndoNames().size();
  const Point from = Glyph(fade, 5 * kSec);
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  host->MouseMove(Point{from.x + 15, from.y}, kKeyModifierNone);
  ASSERT_NE(SequenceTimes(fade)[1], 5 * kSec);
  EXPECT_TRUE(Key(KeyCode::kEscape));
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{6 * kSec});
  host->MouseMove(Point{from.x + 30, from.y}, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, Point{from.x + 30, from.y}, kKeyModifierNone);
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
  EXPECT_EQ(Undo().GetUndoNames().size(), steps);
  EXPECT_EQ(view->GetTimeRuler()->GetCurrentTime(), 2 * kSec);
}

TEST_F(KeyframeAreaTest, LosingTheMouseMidDragRollsBackLikeEscape) {
  OpenClip();
  Area().SetSnapFlags(0);
  const std::size_t steps = Undo().GetUndoNames().size();
  const Point from = Glyph(fade, 5 * kSec);
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  host->MouseMove(Point{from.x + 15, from.y}, kKeyModifierNone);
  ASSERT_NE(SequenceTimes(fade)[1], 5 * kSec);
  // Hiding the area takes the capture away.
  Area().Hide();
  EXPECT_EQ(Area().GetGesture(), EffectControlsKeyframeView::Gesture::kIdle);
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
  EXPECT_EQ(Undo().GetUndoNames().size(), steps);
}

TEST_F(KeyframeAreaTest, ArrowKeysNudgeTheSelectionOneFrameAndShiftTenAsOneStepEach) {
  OpenClip();
  Click(Glyph(fade, 5 * kSec));
  const std::size_t steps = Undo().GetUndoNames().size();
  EXPECT_TRUE(Key(KeyCode::kRight));
  EXPECT_EQ(SequenceTimes(fade)[1], 5 * kSec + kFrame);
  EXPECT_TRUE(Key(KeyCode::kLeft, kKeyModifierShift));
  EXPECT_EQ(SequenceTimes(fade)[1], 5 * kSec - 9 * kFrame);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 2);
  ASSERT_TRUE(Undo().Undo());
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, DeleteRemovesTheSelectedKeyframesAsOneStep) {
  OpenClip();
  Click(Glyph(position, 4 * kSec));
  Click(Glyph(fade, 6 * kSec), kKeyModifierShift);
  ASSERT_TRUE(host->DoCommand(kCommandClear));
  EXPECT_EQ(SequenceTimes(position), Times{3 * kSec});
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec}));
  EXPECT_TRUE(Selection().IsEmpty());
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(position), (Times{3 * kSec, 4 * kSec}));
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, PastePutsTheEarliestCopiedKeyframeAtTheCurrentTime) {
  OpenClip();
  Click(Glyph(fade, 5 * kSec));
  Click(Glyph(fade, 6 * kSec), kKeyModifierShift);
  ASSERT_TRUE(host->DoCommand(kCommandCopy));
  sequence->SetCurrentTime(7 * kSec);
  ASSERT_TRUE(host->GetCommandStatus(kCommandPaste).enabled);
  ASSERT_TRUE(host->DoCommand(kCommandPaste));
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec, 7 * kSec, 8 * kSec}));
  EXPECT_EQ(SelectedSequenceTimes(fade), (Times{7 * kSec, 8 * kSec}));
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, CutRemovesTheKeyframesAndPasteBringsThemBack) {
  OpenClip();
  Click(Glyph(position, 4 * kSec));
  ASSERT_TRUE(host->DoCommand(kCommandCut));
  EXPECT_EQ(SequenceTimes(position), Times{3 * kSec});
  sequence->SetCurrentTime(5 * kSec);
  ASSERT_TRUE(host->DoCommand(kCommandPaste));
  EXPECT_EQ(SequenceTimes(position), (Times{3 * kSec, 5 * kSec}));
}

TEST_F(KeyframeAreaTest, InterpolationFromTheMenuIsOneStepAndShowsItsCheckMark) {
  OpenClip();
  menus->PushAnswer(EffectControlsKeyframeView::kInterpolationHoldCommand);
  RightClick(Glyph(fade, 5 * kSec));
  const auto& keys = fade->GetKeyframes();
  EXPECT_EQ(keys.At(1).interpolation, TemporalInterpolation::Hold);
  EXPECT_EQ(keys.At(0).interpolation, TemporalInterpolation::Linear);
  EXPECT_TRUE(
      host->GetCommandStatus(EffectControlsKeyframeView::kInterpolationHoldCommand).checked);
  EXPECT_FALSE(
      host->GetCommandStatus(EffectControlsKeyframeView::kInterpolationLinearCommand).checked);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(fade->GetKeyframes().At(1).interpolation, TemporalInterpolation::Linear);
}

TEST_F(KeyframeAreaTest, TheSpatialCommandsAreDisabledWhenANonSpatialKeyframeIsSelected) {
  OpenClip();
  Click(Glyph(position, 3 * kSec));
  EXPECT_TRUE(host->GetCommandStatus(EffectControlsKeyframeView::kSpatialBezierCommand).enabled);
  Click(Glyph(fade, 5 * kSec), kKeyModifierShift);
  for (CommandID command = EffectControlsKeyframeView::kSpatialLinearCommand;
       command <= EffectControlsKeyframeView::kSpatialContinuousBezierCommand; ++command) {
    EXPECT_FALSE(host->GetCommandStatus(command).enabled) << command;
  }
  EXPECT_TRUE(
      host->GetCommandStatus(EffectControlsKeyframeView::kInterpolationBezierCommand).enabled);
  EXPECT_FALSE(host->GetCommandStatus(EffectControlsKeyframeView::kEaseInCommand).checked);
}

TEST_F(KeyframeAreaTest, AReadOnlyTargetSwallowsEveryKeyframeCommand) {
  OpenClip();
  Click(Glyph(position, 3 * kSec));
  Click(Glyph(fade, 5 * kSec), kKeyModifierShift);
  ASSERT_TRUE(host->DoCommand(kCommandCopy));
  sequence->SetReadOnly(true);
  const std::size_t steps = Undo().GetUndoNames().size();
  const std::vector<CommandID> commands = {
      kCommandClear,
      kCommandCut,
      kCommandPaste,
      EffectControlsKeyframeView::kInterpolationLinearCommand,
      EffectControlsKeyframeView::kInterpolationBezierCommand,
      EffectControlsKeyframeView::kInterpolationAutoBezierCommand,
      EffectControlsKeyframeView::kInterpolationContinuousBezierCommand,
      EffectControlsKeyframeView::kInterpolationHoldCommand,
      EffectControlsKeyframeView::kEaseInCommand,
      EffectControlsKeyframeView::kEaseOutCommand,
      EffectControlsKeyframeView::kSpatialLinearCommand,
      EffectControlsKeyframeView::kSpatialBezierCommand,
      EffectControlsKeyframeView::kSpatialAutoBezierCommand,
      EffectControlsKeyframeView::kSpatialContinuousBezierCommand,
      EffectControlsKeyframeView::kClearAllKeyframesCommand};
  for (const CommandID command : commands) {
    EXPECT_FALSE(host->GetCommandStatus(command).enabled) << command;
    EXPECT_TRUE(Area().ObeyCommand(command)) << command;
  }
  Key(KeyCode::kRight);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps);
  EXPECT_EQ(SequenceTimes(position), (Times{3 * kSec, 4 * kSec}));
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
  EXPECT_EQ(fade->GetKeyframes().At(1).interpolation, TemporalInterpolation::Linear);
  // A drag on a read-only target moves nothing either.
  const Point from = Glyph(fade, 5 * kSec);
  Drag(from, Point{from.x + 30, from.y});
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

TEST_F(KeyframeAreaTest, ClearAllRemovesEveryKeyframeButTheSpeedKeyframesInOneStep) {
  OpenClip();
  const ComponentRef speed = EffectCatalogue::Standard().Create(kMatchName_TimeRemapping);
  builder.AddComponent(clip->GetComponentChain(), speed);
  ProjectBuilder::AddKeyframes(
      speed->GetParams().front(),
      {{.time = ClipAt(3 * kSec), .value = 1.0}, {.time = ClipAt(5 * kSec), .value = 2.0}});
  view->RefreshFromClipSelection();
  // No click made anything the target: the command comes to the panel, as from its menu.
  CommandStatus status;
  ASSERT_TRUE(
      view->FindCommandStatus(EffectControlsKeyframeView::kClearAllKeyframesCommand, status));
  EXPECT_TRUE(status.enabled);
  ASSERT_TRUE(view->ObeyCommand(EffectControlsKeyframeView::kClearAllKeyframesCommand));
  EXPECT_EQ(SequenceTimes(position), Times{});
  EXPECT_EQ(SequenceTimes(fade), Times{});
  EXPECT_EQ(speed->GetParams().front()->GetKeyframes().Size(), 2u);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(SequenceTimes(fade), (Times{3 * kSec, 5 * kSec, 6 * kSec}));
}

// --- Intro and outro ---

class IntroOutroTest : public KeyframeAreaTest {
 protected:
  void OpenGraphic(TickTime intro, TickTime outro) {
    master->SetGraphicsFlags(true, false, false);
    OpenClip();
    clip->SetIntroDuration(intro);
    clip->SetOutroDuration(outro);
    host->Render();
  }
  // The intro handle in the clip bar, window coordinates.
  Point IntroHandle() const {
    const int x = XOf(clip->GetStart() + clip->GetEffectiveIntroDuration());
    return Point{x, BarTop() + 10};
  }
  Point OutroHandle() const {
    const int x = XOf(clip->GetEnd() - clip->GetEffectiveOutroDuration());
    return Point{x, BarTop() + 10};
  }
  // The bar sits on the first row's top (Motion's title row).
  int BarTop() const {
    return view->GetListView()->GetVideoItems().At(0)->GetTop() + Area().GetBounds().top -
           EffectControlsKeyframeView::kClipBarHeight;
  }
};

TEST_F(IntroOutroTest, AnIntroDragIsFrameAlignedAndOneUndoStep) {
  OpenGraphic(kSec, kSec);
  const std::size_t steps = Undo().GetUndoNames().size();
  Drag(IntroHandle(), Point{XOf(3 * kSec + kFrame * 3 + kFrame / 2), IntroHandle().y});
  EXPECT_EQ(clip->GetIntroDuration() % kFrame, 0);
  EXPECT_GT(clip->GetIntroDuration(), kSec);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  EXPECT_EQ(Undo().GetUndoName(), IntroOutroActions::kSetIntroDuration);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(clip->GetIntroDuration(), kSec);
}

TEST_F(IntroOutroTest, AnIntroDraggedPastTheClipStartStopsAtZero) {
  OpenGraphic(kSec, kSec);
  const Point from = IntroHandle();
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  ASSERT_EQ(Area().GetGesture(), EffectControlsKeyframeView::Gesture::kIntro);
  ASSERT_NE(Area().GetIntroOutroToolTip(), nullptr);
  host->MouseMove(Point{XOf(kSec), from.y}, kKeyModifierNone);
  EXPECT_EQ(Area().GetShownIntroDuration(), 0);
  EXPECT_NE(Area().GetIntroOutroToolTip()->GetText().find("Intro Duration: "), std::string::npos);
  host->MouseUp(MouseButton::kLeft, Point{XOf(kSec), from.y}, kKeyModifierNone);
  EXPECT_EQ(clip->GetIntroDuration(), 0);
  EXPECT_EQ(Area().GetIntroOutroToolTip(), nullptr);
}

TEST_F(IntroOutroTest, OnAClipTooShortForBothTheIntroStaysAtZeroInsteadOfFailing) {
  // Intro and outro fill the clip: the intro's upper bound is below zero. Unpinned, the clip's
  // start is away from the area's left edge (the separator's grab zone).
  OpenGraphic(0, 6 * kSec);
  ASSERT_TRUE(view->ObeyCommand(EffectControlsView::kPinToClipCommand));
  view->ScrollVisibleTime(-kSec);
  host->Render();
  ASSERT_LT(clip->GetDuration() - clip->GetEffectiveOutroDuration() -
                IntroOutroActions::GetMinimumGap(*clip),
            0);
  const Point from{IntroHandle().x - 3, IntroHandle().y};
  ASSERT_GT(from.x, Area().GetBounds().left + EffectControlsKeyframeView::kSeparatorGrabWidth);
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  ASSERT_EQ(Area().GetGesture(), EffectControlsKeyframeView::Gesture::kIntro);
  host->MouseMove(Point{from.x + 30, from.y}, kKeyModifierNone);
  EXPECT_EQ(Area().GetShownIntroDuration(), 0);
  host->MouseUp(MouseButton::kLeft, Point{from.x + 30, from.y}, kKeyModifierNone);
  EXPECT_EQ(clip->GetIntroDuration(), 0);
}

TEST_F(IntroOutroTest, EscapeDuringAnOutroDragLeavesTheOutroAsItWas) {
  OpenGraphic(kSec, kSec);
  const Point from = OutroHandle();
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  ASSERT_EQ(Area().GetGesture(), EffectControlsKeyframeView::Gesture::kOutro);
  host->MouseMove(Point{XOf(5 * kSec), from.y}, kKeyModifierNone);
  EXPECT_EQ(Area().GetShownOutroDuration(), 3 * kSec);
  EXPECT_TRUE(Key(KeyCode::kEscape));
  host->MouseUp(MouseButton::kLeft, Point{XOf(5 * kSec), from.y}, kKeyModifierNone);
  EXPECT_EQ(clip->GetOutroDuration(), kSec);
}
