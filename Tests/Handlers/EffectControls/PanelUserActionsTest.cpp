// What a user does to the panel with the pointer and the keyboard, and what must never follow
// from it: a model the panel cannot show, a change without an undo step.
#include <gtest/gtest.h>

#include "EffectControlsViewTestSupport.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/HotTimecodeControl.h"

using namespace panel_view_test;

namespace {

Point CentreOf(const Rect& r) {
  return Point{(r.left + r.right) / 2, (r.top + r.bottom) / 2};
}

}  // namespace

TEST_F(PanelViewTest, ScrubbingTheTimeFieldFarLeftStopsTheEditLineAtTheSequenceStart) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  sequence->SetCurrentTime(3 * kSec);
  const Point from = CentreOf(view->GetTimecodeControl()->GetBounds());
  host->MouseMove(from, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  for (int x = from.x; x > from.x - 600; x -= 50) {
    host->MouseMove(Point{x, from.y}, kKeyModifierNone);
  }
  host->MouseUp(MouseButton::kLeft, Point{from.x - 600, from.y}, kKeyModifierNone);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  EXPECT_EQ(view->GetTimecodeControl()->GetTime(), 0);
}

TEST_F(PanelViewTest, ANegativeTimeTypedInTheTimeFieldPutsTheEditLineAtTheSequenceStart) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  sequence->SetCurrentTime(3 * kSec);
  const Point at = CentreOf(view->GetTimecodeControl()->GetBounds());
  host->MouseMove(at, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  ASSERT_TRUE(host->TextInput("-00:00:01:00"));
  host->KeyDown(KeyEvent{KeyCode::kReturn, kKeyModifierNone, false});
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
}
