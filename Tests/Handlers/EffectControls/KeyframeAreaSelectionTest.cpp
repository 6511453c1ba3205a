// Selecting keyframes in the keyframe area: clicks with and without modifiers, right clicks and
// their menus, and the marquee's replace, add and invert rules.
#include <gtest/gtest.h>

#include "Host/Model/MarkerActions.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Tests/Handlers/EffectControls/KeyframeAreaTestSupport.h"

using namespace keyframe_area_test;
using Times = std::vector<TickTime>;

TEST_F(KeyframeAreaTest, AClickSelectsTheKeyframeAloneAndAnEmptyClickDeselects) {
  OpenClip();
  Click(Glyph(position, 3 * kSec));
  EXPECT_EQ(SelectedSequenceTimes(position), Times{3 * kSec});
  Click(Glyph(fade, 5 * kSec));
  EXPECT_EQ(Selection().GetKeyframeCount(), 1u);
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{5 * kSec});
  Click(Empty());
  EXPECT_TRUE(Selection().IsEmpty());
}

TEST_F(KeyframeAreaTest, ShiftClickAddsAndShiftClickOnASelectedKeyframeDeselectsIt) {
  OpenClip();
  Click(Glyph(position, 3 * kSec));
  Click(Glyph(fade, 6 * kSec), kKeyModifierShift);
  EXPECT_EQ(Selection().GetKeyframeCount(), 2u);
  Click(Glyph(position, 3 * kSec), kKeyModifierShift);
  EXPECT_EQ(SelectedSequenceTimes(position), Times{});
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{6 * kSec});
  // Ctrl toggles the same way.
  Click(Glyph(fade, 6 * kSec), kKeyModifierCtrl);
  EXPECT_TRUE(Selection().IsEmpty());
}

TEST_F(KeyframeAreaTest, RightClickOnAnUnselectedKeyframeSelectsItAloneAndOpensTheKeyframeMenu) {
  OpenClip();
  Click(Glyph(fade, 5 * kSec));
  Click(Glyph(fade, 6 * kSec), kKeyModifierShift);
  menus->PushAnswer(std::nullopt);
  RightClick(Glyph(fade, 3 * kSec));
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{3 * kSec});
  ASSERT_FALSE(menus->GetRequests().empty());
  EXPECT_EQ(menus->GetRequests().back().menuName, EffectControlsKeyframeView::kKeyframeMenu);
}

TEST_F(KeyframeAreaTest, RightClickOnASpatialKeyframeOpensTheSpatialMenu) {
  OpenClip();
  menus->PushAnswer(std::nullopt);
  RightClick(Glyph(position, 4 * kSec));
  ASSERT_FALSE(menus->GetRequests().empty());
  EXPECT_EQ(menus->GetRequests().back().menuName, EffectControlsKeyframeView::kSpatialKeyframeMenu);
}

TEST_F(KeyframeAreaTest, RightClickOnAnEmptyPlaceOpensTheAreaMenuAndKeepsTheSelection) {
  OpenClip();
  Click(Glyph(position, 3 * kSec));
  menus->PushAnswer(std::nullopt);
  RightClick(Empty());
  ASSERT_FALSE(menus->GetRequests().empty());
  EXPECT_EQ(menus->GetRequests().back().menuName, EffectControlsKeyframeView::kAreaMenu);
  EXPECT_EQ(Selection().GetKeyframeCount(), 1u);
}

TEST_F(KeyframeAreaTest, APressNineteenPixelsBelowTheRowTopIsInTheStripAndTwentyIsNot) {
  OpenClip();
  const Point glyph = Glyph(fade, 5 * kSec);
  const int top = glyph.y - ParameterControl::kKeyframeStripHeight / 2;
  Click(Point{glyph.x, top + 19});
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{5 * kSec});
  Click(Point{glyph.x, top + 20});
  EXPECT_TRUE(Selection().IsEmpty());
}

TEST_F(KeyframeAreaTest, AMarqueeOverTwoRowsSelectsExactlyTheKeyframesInside) {
  OpenClip();
  const Point a = Glyph(position, 3 * kSec);
  const Point b = Glyph(fade, 5 * kSec);
  Drag(Point{a.x - 12, a.y - 4}, Point{b.x + 12, b.y + 4});
  EXPECT_EQ(SelectedSequenceTimes(position), (Times{3 * kSec, 4 * kSec}));
  EXPECT_EQ(SelectedSequenceTimes(fade), (Times{3 * kSec, 5 * kSec}));
  EXPECT_FALSE(Area().IsMarqueeActive());
}

TEST_F(KeyframeAreaTest, AMarqueeReplacesTheSelectionAndWithShiftAddsToIt) {
  OpenClip();
  Click(Glyph(fade, 6 * kSec));
  const Point a = Glyph(position, 3 * kSec);
  Drag(Point{a.x - 12, a.y - 4}, Point{a.x + 12, a.y + 4});
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{});
  EXPECT_EQ(SelectedSequenceTimes(position), Times{3 * kSec});
  const Point b = Glyph(fade, 6 * kSec);
  Drag(Point{b.x - 12, b.y - 4}, Point{b.x + 12, b.y + 4}, kKeyModifierShift);
  EXPECT_EQ(SelectedSequenceTimes(position), Times{3 * kSec});
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{6 * kSec});
}

TEST_F(KeyframeAreaTest, AMarqueeWithCtrlInvertsOnlyTheKeyframesInside) {
  OpenClip();
  Click(Glyph(fade, 3 * kSec));
  Click(Glyph(fade, 6 * kSec), kKeyModifierShift);
  // Over Opacity's 3 s (selected) and 5 s (not) keyframes; 6 s stays outside.
  const Point a = Glyph(fade, 3 * kSec);
  const Point b = Glyph(fade, 5 * kSec);
  Drag(Point{a.x - 12, a.y - 4}, Point{b.x + 12, b.y + 4}, kKeyModifierCtrl);
  EXPECT_EQ(SelectedSequenceTimes(fade), (Times{5 * kSec, 6 * kSec}));
  EXPECT_EQ(SelectedSequenceTimes(position), Times{});
}

TEST_F(KeyframeAreaTest, EscapeDuringAMarqueeRestoresTheSelectionBeforeThePress) {
  OpenClip();
  Click(Glyph(fade, 6 * kSec));
  const Point a = Glyph(position, 3 * kSec);
  host->MouseMove(Point{a.x - 12, a.y - 4}, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, Point{a.x - 12, a.y - 4}, kKeyModifierNone);
  host->MouseMove(Point{a.x + 40, a.y + 4}, kKeyModifierNone);
  ASSERT_TRUE(Area().IsMarqueeActive());
  EXPECT_EQ(SelectedSequenceTimes(position), Times{3 * kSec});
  EXPECT_TRUE(Key(KeyCode::kEscape));
  EXPECT_FALSE(Area().IsMarqueeActive());
  EXPECT_EQ(SelectedSequenceTimes(position), Times{});
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{6 * kSec});
  host->MouseUp(MouseButton::kLeft, Point{a.x + 40, a.y + 4}, kKeyModifierNone);
  EXPECT_EQ(SelectedSequenceTimes(fade), Times{6 * kSec});
}

TEST_F(KeyframeAreaTest, SelectAllSelectsEveryKeyframeAndKeyframeNavigationSelectsTheNextTime) {
  OpenClip();
  Click(Glyph(fade, 3 * kSec));
  ASSERT_TRUE(host->DoCommand(kCommandSelectAll));
  EXPECT_EQ(Selection().GetKeyframeCount(), 5u);
  EXPECT_EQ(Area().CollectKeyframeTimes(),
            (std::set<TickTime>{3 * kSec, 4 * kSec, 5 * kSec, 6 * kSec}));
  sequence->SetCurrentTime(3 * kSec);
  EXPECT_EQ(Area().NavigateKeyframe(true), 4 * kSec);
  EXPECT_EQ(SelectedSequenceTimes(position), Times{4 * kSec});
  EXPECT_EQ(Selection().GetKeyframeCount(), 1u);
  EXPECT_EQ(Area().NavigateKeyframe(false), std::nullopt);
}

TEST(KeyframeAreaMarquee, HeldNearAnEdgeItScrollsByHalfTheDistancePastTheMargin) {
  const Rect area = Rect::FromSize(0, 0, 300, 200);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(-15, area), -12);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(-60, area), -20);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(5, area), -2);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(9, area), 0);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(10, area), 0);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(100, area), 0);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(195, area), 2);
  EXPECT_EQ(EffectControlsKeyframeView::MarqueeScrollStep(260, area), 20);
}

TEST_F(KeyframeAreaTest, APressOnAKeyframeSnapsToEverythingButTheSelectedKeyframes) {
  Marker marker;
  marker.time = 7 * kSec;
  ASSERT_EQ(MarkerActions::AddMarker(sequence, marker), EditStatus::Done);
  OpenClip();
  Click(Glyph(fade, 5 * kSec));
  Click(Glyph(position, 4 * kSec), kKeyModifierShift);
  host->MouseDown(MouseButton::kLeft, Glyph(fade, 5 * kSec), kKeyModifierNone);
  const std::set<TickTime>& snaps = Area().GetSnapSet().GetTimes();
  host->MouseUp(MouseButton::kLeft, Glyph(fade, 5 * kSec), kKeyModifierNone);
  // The edit line (2 s), the clip's edges (2 s, 8 s), the other keyframes and the marker.
  EXPECT_EQ(snaps, (std::set<TickTime>{2 * kSec, 3 * kSec, 6 * kSec, 7 * kSec, 8 * kSec}));
}

TEST_F(KeyframeAreaTest, AMovingEditLineDoesNotTakeTheKeysFromATimeFieldBeingEdited) {
  OpenClip();
  Click(Glyph(fade, 5 * kSec));
  ASSERT_TRUE(Area().IsTarget());
  HotTimecodeControl& field = *view->GetTimecodeControl();
  const Point at = field.GetBounds().Center();
  host->MouseMove(at, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  ASSERT_TRUE(field.IsEditing());
  sequence->SetCurrentTime(4 * kSec);
  EXPECT_TRUE(field.IsEditing());
  EXPECT_FALSE(Area().IsTarget());
}
