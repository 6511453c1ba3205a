// The flyout button of the tab strip: the only way a pointer reaches a panel's flyout menu.
#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr CommandID kToggleCommand = 29101;
constexpr CommandID kOtherCommand = 29102;
constexpr const char* kFlyoutName = "TestPanel_Flyout_Menu";

class FlyoutTabView : public TabView {
 public:
  explicit FlyoutTabView(std::string flyout) : mFlyout(std::move(flyout)) {}

  int toggles = 0;

  std::string GetFlyoutMenuName() const override { return mFlyout; }
  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != kToggleCommand)
      return TabView::FindCommandStatus(command, status);
    status.enabled = true;
    return true;
  }
  bool ObeyCommand(CommandID command) override {
    if (command != kToggleCommand)
      return TabView::ObeyCommand(command);
    ++toggles;
    return true;
  }

 private:
  std::string mFlyout;
};

class WorkspaceFrameFlyoutTest : public ::testing::Test {
 protected:
  WorkspaceFrameFlyoutTest() {
    Menu menu(kFlyoutName);
    menu.AddCommand(kToggleCommand, "Toggle");
    menu.AddCommand(kOtherCommand, "Nobody answers");
    MenuRegistry::Instance().Register(menu);
    mPrevious = SetMenuTrackerForTesting(mTracker);
    frame = std::make_shared<WorkspaceFrame>();
    host.SetRootView(frame);
    frame->SetBounds(Rect{0, 0, 600, 400});
  }
  ~WorkspaceFrameFlyoutTest() override {
    SetMenuTrackerForTesting(mPrevious);
    MenuRegistry::Instance().Remove(kFlyoutName);
  }

  std::shared_ptr<FlyoutTabView> Open(std::string flyout) {
    auto tab = std::make_shared<FlyoutTabView>(std::move(flyout));
    tab->Create("test.panel", "Test Panel", frame.get(), true);
    return tab;
  }

  void ClickAt(Point point) {
    host.MouseMove(point, kKeyModifierNone);
    host.MouseDown(MouseButton::kLeft, point, kKeyModifierNone);
    host.MouseUp(MouseButton::kLeft, point, kKeyModifierNone);
  }

  MessagingTestScope messaging;
  ViewHost host{Size{600, 400}};
  std::shared_ptr<WorkspaceFrame> frame;
  std::shared_ptr<ScriptedMenuTracker> mTracker = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<MenuTracker> mPrevious;
};

}  // namespace

TEST_F(WorkspaceFrameFlyoutTest, TheButtonOpensTheFrontTabsFlyoutAndSendsTheChoiceToIt) {
  const auto tab = Open(kFlyoutName);
  const Rect button = frame->GetFlyoutButtonRect();
  ASSERT_FALSE(button.IsEmpty());
  EXPECT_EQ(button.right, 600);
  EXPECT_LE(button.bottom, WorkspaceFrame::kTabStripHeight);

  mTracker->PushAnswer(kToggleCommand);
  ClickAt(button.Center());
  ASSERT_EQ(mTracker->GetRequests().size(), 1U);
  const PopupMenuRequest& request = mTracker->GetRequests()[0];
  EXPECT_EQ(request.menuName, kFlyoutName);
  ASSERT_EQ(request.entries.size(), 2U);
  EXPECT_TRUE(request.entries[0].enabled);
  EXPECT_FALSE(request.entries[1].enabled) << "status comes from the tab's chain";
  EXPECT_GE(request.windowPoint.y, button.bottom);
  EXPECT_EQ(tab->toggles, 1);
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(WorkspaceFrameFlyoutTest, ADismissedFlyoutSendsNothing) {
  const auto tab = Open(kFlyoutName);
  mTracker->PushAnswer(std::nullopt);
  ClickAt(frame->GetFlyoutButtonRect().Center());
  EXPECT_EQ(mTracker->GetRequests().size(), 1U);
  EXPECT_EQ(tab->toggles, 0);
}

TEST_F(WorkspaceFrameFlyoutTest, ATabWithoutAFlyoutHasNoButtonAndTheFileMenuTakesTheEnd) {
  Open("");
  EXPECT_TRUE(frame->GetFlyoutButtonRect().IsEmpty());
  EXPECT_EQ(frame->GetFileMenuButtonRect().right, 600);
  ClickAt(Point{595, 10});
  ASSERT_EQ(mTracker->GetRequests().size(), 1U);
  EXPECT_EQ(mTracker->GetRequests().front().menuName, "Workspace_File_Menu");
}

TEST_F(WorkspaceFrameFlyoutTest, TheFileMenuSitsLeftOfTheFlyoutButton) {
  Open(kFlyoutName);
  EXPECT_EQ(frame->GetFileMenuButtonRect().right, frame->GetFlyoutButtonRect().left);
}
