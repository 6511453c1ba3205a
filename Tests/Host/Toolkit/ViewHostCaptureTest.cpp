#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Toolkit/DataObject.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

// Counts the times its capture was taken away.
class CapturingView : public SubView {
 public:
  void MouseCaptureLostSelf() override {
    ++lost;
    stillCapturedWhenTold = HasMouseCapture();
  }
  int lost = 0;
  bool stillCapturedWhenTold = false;
};

class ViewHostCaptureTest : public ::testing::Test {
 protected:
  void SetUp() override {
    host.SetShortcutManager(&shortcuts);
    root = std::make_shared<SubView>();
    host.SetRootView(root);
    for (auto* view : {&first, &second}) {
      *view = std::make_shared<CapturingView>();
      (*view)->SetBounds(Rect{0, 0, 50, 50});
      root->AddChild(*view);
    }
  }

  ToolkitTestScope scope;
  ShortcutManager shortcuts;
  ViewHost host{Size{100, 80}};
  std::shared_ptr<SubView> root;
  std::shared_ptr<CapturingView> first;
  std::shared_ptr<CapturingView> second;
};

TEST_F(ViewHostCaptureTest, ReleasingTheCaptureItselfIsNoLoss) {
  first->CaptureMouse();
  first->ReleaseMouse();
  EXPECT_EQ(first->lost, 0);
}

TEST_F(ViewHostCaptureTest, AnotherViewCapturingTellsTheOneThatHadIt) {
  first->CaptureMouse();
  first->CaptureMouse();
  EXPECT_EQ(first->lost, 0);
  second->CaptureMouse();
  EXPECT_EQ(first->lost, 1);
  EXPECT_FALSE(first->stillCapturedWhenTold);
  EXPECT_EQ(second->lost, 0);
}

TEST_F(ViewHostCaptureTest, HidingRemovingOrADragTakesTheCaptureAway) {
  first->CaptureMouse();
  first->Hide();
  EXPECT_EQ(first->lost, 1);

  second->CaptureMouse();
  root->RemoveChild(*second);
  EXPECT_EQ(second->lost, 1);

  first->Show();
  first->CaptureMouse();
  host.MouseMove(Point{5, 5}, kKeyModifierNone);
  auto data = std::make_shared<DataObject>();
  data->SetString(kDataTypeName_Text, "x");
  ASSERT_TRUE(host.StartDrag(data, kDropEffectCopy));
  EXPECT_EQ(first->lost, 2);
  host.CancelDrag();
}

TEST_F(ViewHostCaptureTest, ADestroyedViewIsNotTold) {
  first->CaptureMouse();
  first->Destroy();
  EXPECT_EQ(first->lost, 0);
  EXPECT_EQ(host.GetCaptureView(), nullptr);
}

}  // namespace
