#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/ViewBase.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

// root (0,0 200x200) > A (10,10 100x100) > B (20,20 40x40): B covers window (30,30)-(70,70).
class ViewTreeTest : public ::testing::Test {
 protected:
  void SetUp() override {
    root = RecordingView::Make("root", log, Rect{0, 0, 200, 200});
    host.SetRootView(root);
    a = RecordingView::Make("A", log, Rect{10, 10, 110, 110});
    root->AddChild(a);
    b = RecordingView::Make("B", log, Rect{20, 20, 60, 60});
    a->AddChild(b);
    log->Clear();
  }

  void Click(Point point, KeyModifiers modifiers = kKeyModifierNone) {
    host.MouseDown(MouseButton::kLeft, point, modifiers);
    host.MouseUp(MouseButton::kLeft, point, modifiers);
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  ViewHost host{Size{200, 200}};
  std::shared_ptr<RecordingView> root;
  std::shared_ptr<RecordingView> a;
  std::shared_ptr<RecordingView> b;
};

using Lines = std::vector<std::string>;

// The lines without the pointer-left notices, for tests about where events land.
Lines WithoutLeaves(const Lines& lines) {
  Lines kept;
  for (const std::string& line : lines) {
    if (!line.ends_with(" leave")) {
      kept.push_back(line);
    }
  }
  return kept;
}

TEST_F(ViewTreeTest, ClicksGoToTheDeepestViewInItsOwnCoordinates) {
  Click({35, 36}, kKeyModifierShift);
  Click({15, 15});
  Click({150, 150});
  EXPECT_EQ(log->lines, (Lines{"B down 5,6 mods 2", "B up 5,6 mods 2", "B leave", "A down 5,5",
                               "A up 5,5", "A leave", "root down 150,150", "root up 150,150"}));
}

TEST_F(ViewTreeTest, HiddenViewsAndTheirChildrenAreSkipped) {
  b->Hide();
  Click({35, 35});
  b->Show();
  a->Hide();
  Click({35, 35});
  EXPECT_EQ(WithoutLeaves(log->lines),
            (Lines{"A down 25,25", "A up 25,25", "root down 35,35", "root up 35,35"}));
  EXPECT_FALSE(b->IsShown());
  EXPECT_TRUE(b->IsVisible());
}

TEST_F(ViewTreeTest, TheLaterSiblingIsOnTop) {
  auto c = RecordingView::Make("C", log, Rect{0, 0, 50, 50});
  a->AddChild(c);
  log->Clear();
  Click({35, 35});
  EXPECT_EQ(log->Last(), "C up 25,25");
}

TEST_F(ViewTreeTest, ChildrenOutsideTheirParentAreNotHit) {
  b->SetBounds(Rect{90, 90, 150, 150});  // sticks out of A at the bottom right
  log->Clear();
  Click({105, 105});  // inside A and B
  Click({130, 130});  // inside B's bounds, outside A
  EXPECT_EQ(WithoutLeaves(log->lines),
            (Lines{"B down 5,5", "B up 5,5", "root down 130,130", "root up 130,130"}));
}

TEST_F(ViewTreeTest, ADisabledViewSwallowsClicksForItselfAndItsChildren) {
  a->Disable();
  Click({35, 35});
  Click({15, 15});
  EXPECT_TRUE(WithoutLeaves(log->lines).empty());
  a->Enable();
  Click({35, 35});
  EXPECT_EQ(log->Last(), "B up 5,5");
}

TEST_F(ViewTreeTest, MultiClicksAndTheRightButtonReachTheirHooks) {
  host.MouseDown(MouseButton::kLeft, {35, 35}, kKeyModifierNone, 2);
  host.MouseDown(MouseButton::kRight, {35, 35}, kKeyModifierNone);
  host.MouseUp(MouseButton::kRight, {36, 35}, kKeyModifierNone);
  EXPECT_EQ(log->lines, (Lines{"B multiclick 2 5,5", "B down 5,5", "B rdown 5,5", "B rup 6,5"}));
}

TEST_F(ViewTreeTest, CaptureSendsEveryMouseEventToTheCapturingViewEvenOutsideIt) {
  b->onLeftDown = [](RecordingView& view, Point) { view.CaptureMouse(); };
  host.MouseDown(MouseButton::kLeft, {35, 35}, kKeyModifierNone);
  EXPECT_TRUE(b->HasMouseCapture());
  host.MouseMove({190, 5}, kKeyModifierNone);
  host.MouseDown(MouseButton::kRight, {150, 150}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {-10, 195}, kKeyModifierNone);
  EXPECT_EQ(log->lines, (Lines{"B down 5,5", "B move 160,-25", "B rdown 120,120", "B up -40,165"}));

  b->ReleaseMouse();
  log->Clear();
  host.MouseMove({190, 5}, kKeyModifierNone);
  EXPECT_EQ(log->lines, (Lines{"B leave", "root move 190,5"}));
}

TEST_F(ViewTreeTest, CaptureEndsWhenTheCapturingViewIsHiddenOrRemoved) {
  b->CaptureMouse();
  b->Hide();
  EXPECT_EQ(host.GetCaptureView(), nullptr);
  host.MouseMove({150, 150}, kKeyModifierNone);
  EXPECT_EQ(log->Last(), "root move 150,150");

  b->Show();
  b->CaptureMouse();
  a->RemoveChild(*b);
  EXPECT_FALSE(b->HasMouseCapture());
  host.MouseMove({35, 35}, kKeyModifierNone);
  EXPECT_EQ(log->Last(), "A move 25,25");
}

TEST_F(ViewTreeTest, CapturingAHiddenViewIsRefused) {
  ClearRecordedDebugAssertions();
  b->Hide();
  b->CaptureMouse();
  EXPECT_EQ(host.GetCaptureView(), nullptr);
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST_F(ViewTreeTest, MovingBetweenViewsTellsTheOldOneThePointerLeft) {
  host.MouseMove({35, 35}, kKeyModifierNone);
  host.MouseMove({36, 35}, kKeyModifierNone);
  host.MouseMove({15, 15}, kKeyModifierNone);
  host.MouseExit();
  EXPECT_EQ(log->lines, (Lines{"B move 5,5", "B move 6,5", "B leave", "A move 5,5", "A leave"}));
  EXPECT_EQ(b->GetMouseLocation(), std::nullopt);
}

TEST_F(ViewTreeTest, TheCursorComesFromTheInnermostViewThatSetsOneElseTheArrow) {
  a->onSetCursor = [](RecordingView&, Point) {
    SetCurrentCursor(Cursor::kHand);
    return true;
  };
  host.MouseMove({35, 35}, kKeyModifierNone);  // B sets none, its parent A does
  EXPECT_EQ(GetCurrentCursor(), Cursor::kHand);
  host.MouseMove({150, 150}, kKeyModifierNone);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kOSArrow);

  // A cursor set in the move hook wins over the cursor query, which runs first.
  b->onMouseMove = [](RecordingView&, Point) { SetCurrentCursor(Cursor::kFist); };
  host.MouseMove({35, 35}, kKeyModifierNone);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kFist);
}

TEST_F(ViewTreeTest, WhileCapturedTheCursorIsLeftToTheCapturingView) {
  root->onSetCursor = [](RecordingView&, Point) {
    SetCurrentCursor(Cursor::kHand);
    return true;
  };
  b->CaptureMouse();
  SetCurrentCursor(Cursor::kSplitterHorizontal);
  host.MouseMove({150, 150}, kKeyModifierNone);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kSplitterHorizontal);
}

TEST_F(ViewTreeTest, WheelAndGesturesBubbleUpToTheFirstViewThatTakesThem) {
  a->takesWheel = true;
  EXPECT_TRUE(host.MouseWheel(WheelEvent{{35, 35}, 0, -2, kKeyModifierNone}));
  EXPECT_EQ(log->lines, (Lines{"B wheel -2 at 5,5", "A wheel -2 at 25,25"}));
  log->Clear();
  EXPECT_FALSE(host.MouseMagnify(MagnifyEvent{{35, 35}, 0.5, kKeyModifierNone}));
  EXPECT_EQ(log->lines, (Lines{"B magnify at 5,5", "A magnify at 25,25", "root magnify at 35,35"}));
}

TEST_F(ViewTreeTest, CoordinatesConvertBetweenViewAndWindow) {
  EXPECT_EQ(b->LocalToWindow(Point{1, 2}), (Point{31, 32}));
  EXPECT_EQ(b->WindowToLocal(Point{31, 32}), (Point{1, 2}));
  EXPECT_EQ(b->LocalToWindow(Rect{0, 0, 5, 5}), (Rect{30, 30, 35, 35}));
  EXPECT_EQ(host.GetViewAt({30, 30}), b.get());
  EXPECT_EQ(host.GetViewAt({70, 70}), a.get());  // half-open: B ends before 70
  EXPECT_EQ(host.GetViewAt({-1, 0}), nullptr);
}

TEST_F(ViewTreeTest, AViewDestroyedDuringItsOwnHandlerIsKeptAliveUntilItReturns) {
  std::weak_ptr<RecordingView> weakB = b;
  b->onLeftDown = [](RecordingView& view, Point) {
    view.Destroy();
    // Still usable here: the dispatch holds it.
    view.Invalidate();
    EXPECT_EQ(view.GetParent(), nullptr);
  };
  b.reset();
  host.MouseDown(MouseButton::kLeft, {35, 35}, kKeyModifierNone);
  EXPECT_TRUE(weakB.expired());
  host.MouseUp(MouseButton::kLeft, {35, 35}, kKeyModifierNone);
  EXPECT_EQ(log->lines, (Lines{"B down 5,5", "B destroyed", "A up 25,25"}));
}

TEST_F(ViewTreeTest, AHandlerMayDestroyItsOwnParent) {
  std::weak_ptr<RecordingView> weakA = a;
  std::weak_ptr<RecordingView> weakB = b;
  b->onLeftDown = [this](RecordingView&, Point) {
    a->Destroy();
    a.reset();
  };
  b.reset();
  host.MouseDown(MouseButton::kLeft, {35, 35}, kKeyModifierNone);
  EXPECT_TRUE(weakA.expired());
  EXPECT_TRUE(weakB.expired());
  EXPECT_EQ(log->lines, (Lines{"B down 5,5", "A destroyed", "B destroyed"}));
  EXPECT_TRUE(root->GetChildren().empty());
}

TEST_F(ViewTreeTest, DestroyTearsDownOnceParentFirstThenChildrenLastToFirst) {
  auto c = RecordingView::Make("C", log, Rect{0, 0, 5, 5});
  a->AddChild(c);
  log->Clear();
  a->Destroy();
  a->Destroy();
  EXPECT_EQ(log->lines, (Lines{"A destroyed", "C destroyed", "B destroyed"}));
  EXPECT_TRUE(a->IsDestroyed());
  EXPECT_EQ(a->GetParent(), nullptr);
  EXPECT_TRUE(a->GetChildren().empty());
}

TEST_F(ViewTreeTest, FinishCreateRunsOnceWhenTheViewIsFirstAdopted) {
  auto c = RecordingView::Make("C", log, Rect{0, 0, 5, 5});
  log->Clear();
  EXPECT_FALSE(c->IsCreated());
  a->AddChild(c);
  b->AddChild(c);  // moved: not created again
  EXPECT_EQ(log->lines, (Lines{"C created"}));
  EXPECT_EQ(c->GetParent(), b.get());
  EXPECT_EQ(a->GetChildren().size(), 1u);
}

TEST_F(ViewTreeTest, AdoptingAnAncestorOrItselfIsRefused) {
  ClearRecordedDebugAssertions();
  b->AddChild(a);
  b->AddChild(b);
  b->AddChild(nullptr);
  EXPECT_EQ(a->GetParent(), root.get());
  EXPECT_TRUE(b->GetChildren().empty());
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);  // one site, fired three times
  EXPECT_EQ(RecordedDebugAssertions()[0].count, 3);
}

TEST_F(ViewTreeTest, AReleasedChildLivesOnWhileHeldAndKnowsNoParent) {
  std::shared_ptr<ViewBase> released = a->RemoveChild(*b);
  EXPECT_EQ(released, b);
  EXPECT_EQ(b->GetParent(), nullptr);
  EXPECT_EQ(b->GetHost(), nullptr);
  EXPECT_EQ(a->RemoveChild(*b), nullptr);
  // A parent that goes away while a child is held elsewhere leaves the child parentless.
  a->AddChild(b);
  root->RemoveChild(*a);
  a.reset();
  EXPECT_EQ(b->GetParent(), nullptr);
}

TEST_F(ViewTreeTest, NegativeSizesAreTakenAsEmpty) {
  b->SetBounds(Rect{50, 50, 40, 30});
  EXPECT_EQ(b->GetBounds(), (Rect{50, 50, 50, 50}));
  EXPECT_EQ(log->Last(), "B bounds 50,50 0x0");
}

}  // namespace
