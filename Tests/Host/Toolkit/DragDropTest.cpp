#include <gtest/gtest.h>

#include "Host/Toolkit/DataObject.h"
#include "Host/Toolkit/DragDrop.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

using Lines = std::vector<std::string>;

// root > list (0,0 100x100, a drop target) > row (0,0 100x20, not one)
//      > browser (100,0 100x100, the drag source)
class DragDropTest : public ::testing::Test {
 protected:
  void SetUp() override {
    root = RecordingView::Make("root", log, Rect{});
    host.SetRootView(root);
    list = RecordingView::Make("list", log, Rect{0, 0, 100, 100});
    list->SetAcceptsDrops(true);
    list->dragAnswer = kDropEffectMove;
    root->AddChild(list);
    row = RecordingView::Make("row", log, Rect{0, 0, 100, 20});
    list->AddChild(row);
    browser = RecordingView::Make("browser", log, Rect{100, 0, 200, 100});
    root->AddChild(browser);
    // The browser starts a drag once the pointer moves with the button down.
    browser->onMouseMove = [this](RecordingView& view, Point) {
      if (host.IsMouseButtonDown() && !host.IsDragging()) {
        view.DoDragDrop(data, kDropEffectCopy | kDropEffectMove);
      }
    };
    log->Clear();
  }

  std::shared_ptr<DataObject> MakeData() {
    auto made = std::make_shared<DataObject>();
    made->SetString(kDataTypeName_Text, "Gaussian Blur");
    return made;
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  ViewHost host{Size{200, 100}};
  std::shared_ptr<DataObject> data = MakeData();
  std::shared_ptr<RecordingView> root;
  std::shared_ptr<RecordingView> list;
  std::shared_ptr<RecordingView> row;
  std::shared_ptr<RecordingView> browser;
};

Lines WithoutSourceMoves(const Lines& lines) {
  Lines kept;
  for (const std::string& line : lines) {
    if (!line.starts_with("browser move") && !line.starts_with("browser down") &&
        !line.ends_with(" leave")) {
      kept.push_back(line);
    }
  }
  return kept;
}

TEST_F(DragDropTest, EnterOverLeaveAndDropReachTheTargetInItsCoordinates) {
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);  // the drag starts here, over the browser
  ASSERT_TRUE(host.IsDragging());
  host.MouseMove({50, 10}, kKeyModifierNone);  // over the row: the list is the target
  host.MouseMove({50, 60}, kKeyModifierNone);
  host.MouseMove({150, 60}, kKeyModifierNone);  // back out
  host.MouseMove({40, 70}, kKeyModifierCtrl);
  host.MouseUp(MouseButton::kLeft, {40, 70}, kKeyModifierCtrl);
  EXPECT_FALSE(host.IsDragging());
  EXPECT_EQ(
      WithoutSourceMoves(log->lines),
      (Lines{"list dragenter 50,10", "list dragover 50,60", "list dragleave",
             "list dragenter 40,70", "list drop 2 40,70 Gaussian Blur", "browser dragfinished 2"}));
}

TEST_F(DragDropTest, MovesDuringTheDragAreNotMouseMoves) {
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  log->Clear();
  host.MouseMove({50, 50}, kKeyModifierNone);
  host.MouseMove({60, 50}, kKeyModifierNone);
  EXPECT_EQ(log->lines, (Lines{"list dragenter 50,50", "list dragover 60,50"}));
}

TEST_F(DragDropTest, ReleasingWhereNoTargetTakesItEndsWithNoEffect) {
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {160, 50}, kKeyModifierNone);
  EXPECT_EQ(log->Last(), "browser dragfinished 0");
  EXPECT_FALSE(host.IsDragging());
}

TEST_F(DragDropTest, ATargetThatAnswersNoEffectHearsLeaveInsteadOfDrop) {
  list->dragAnswer = kDropEffectNone;
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  host.MouseMove({50, 50}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {50, 50}, kKeyModifierNone);
  EXPECT_EQ(WithoutSourceMoves(log->lines),
            (Lines{"list dragenter 50,50", "list dragleave", "browser dragfinished 0"}));
}

TEST_F(DragDropTest, AnEffectTheSourceDidNotOfferCountsAsNone) {
  list->dragAnswer = kDropEffectLink;
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  host.MouseMove({50, 50}, kKeyModifierNone);
  EXPECT_EQ(host.GetDrag()->GetCurrentEffect(), kDropEffectNone);
  host.MouseUp(MouseButton::kLeft, {50, 50}, kKeyModifierNone);
  EXPECT_EQ(log->Last(), "browser dragfinished 0");
}

TEST_F(DragDropTest, ARefusedDropEndsWithNoEffect) {
  list->takesDrop = false;
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  host.MouseMove({50, 50}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {50, 50}, kKeyModifierNone);
  EXPECT_EQ(
      WithoutSourceMoves(log->lines),
      (Lines{"list dragenter 50,50", "list drop 2 50,50 Gaussian Blur", "browser dragfinished 0"}));
}

TEST_F(DragDropTest, EscapeCancelsAndTheTargetHearsLeave) {
  host.MouseDown(MouseButton::kLeft, {150, 50}, kKeyModifierNone);
  host.MouseMove({151, 50}, kKeyModifierNone);
  host.MouseMove({50, 50}, kKeyModifierNone);
  EXPECT_TRUE(host.KeyDown(KeyEvent{KeyCode::kEscape, kKeyModifierNone, false}));
  EXPECT_FALSE(host.IsDragging());
  host.MouseUp(MouseButton::kLeft, {50, 50}, kKeyModifierNone);
  EXPECT_EQ(WithoutSourceMoves(log->lines), (Lines{"list dragenter 50,50", "list dragleave",
                                                   "browser dragfinished 0", "list up 50,50"}));
}

TEST_F(DragDropTest, ADragFromOutsideTheWindowReportsThroughItsCallback) {
  std::optional<DropEffect> result;
  host.MouseMove({50, 50}, kKeyModifierNone);
  ASSERT_TRUE(
      host.StartDrag(data, kDropEffectCopy, {}, [&](DropEffect effect) { result = effect; }));
  EXPECT_EQ(log->Last(), "list dragenter 50,50");       // routed at once at the pointer
  EXPECT_FALSE(host.StartDrag(data, kDropEffectCopy));  // one at a time
  list->dragAnswer = kDropEffectCopy;
  host.MouseMove({55, 50}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {55, 50}, kKeyModifierNone);
  EXPECT_EQ(result, kDropEffectCopy);
  EXPECT_EQ(log->Last(), "list drop 1 55,50 Gaussian Blur");
}

TEST_F(DragDropTest, ATargetRemovedDuringTheDragHearsLeaveAndTheNextOneIsFound) {
  auto outer = RecordingView::Make("outer", log, Rect{0, 0, 100, 100});
  outer->SetAcceptsDrops(true);
  root->AddChild(outer);
  root->RemoveChild(*list);
  root->AddChild(list);  // the list is on top again, inside the outer target's area
  host.MouseMove({50, 50}, kKeyModifierNone);
  host.StartDrag(data, kDropEffectMove);
  log->Clear();
  list->RemoveFromParent();
  EXPECT_EQ(log->lines, (Lines{"list dragleave", "outer dragenter 50,50"}));
  host.CancelDrag();
}

TEST_F(DragDropTest, ATargetDestroyedByItsOwnDropDoesNotBreakTheDrag) {
  struct Destroyer : RecordingView {
    using RecordingView::RecordingView;
    bool DropSelf(const DataObject& dropped, DropEffect effect, Point point) override {
      RecordingView::DropSelf(dropped, effect, point);
      Destroy();
      return true;
    }
  };
  auto destroyer = std::make_shared<Destroyer>("destroyer", log);
  destroyer->SetBounds(Rect{0, 0, 50, 50});
  destroyer->SetAcceptsDrops(true);
  destroyer->dragAnswer = kDropEffectCopy;
  list->AddChild(destroyer);
  std::weak_ptr<Destroyer> weakDestroyer = destroyer;
  destroyer.reset();

  host.MouseMove({10, 10}, kKeyModifierNone);
  std::optional<DropEffect> result;
  host.StartDrag(data, kDropEffectAll, {}, [&](DropEffect effect) { result = effect; });
  host.MouseUp(MouseButton::kLeft, {10, 10}, kKeyModifierNone);
  EXPECT_EQ(result, kDropEffectCopy);
  EXPECT_TRUE(weakDestroyer.expired());
  EXPECT_EQ(log->Last(), "destroyer destroyed");
}

TEST_F(DragDropTest, NullDataStartsNothing) {
  EXPECT_FALSE(host.StartDrag(nullptr, kDropEffectCopy));
  EXPECT_FALSE(host.IsDragging());
}

}  // namespace
