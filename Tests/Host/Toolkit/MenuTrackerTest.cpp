#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

using Lines = std::vector<std::string>;

class MenuTrackerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    host.SetShortcutManager(&shortcuts);
    auto root = RecordingView::Make("root", log, Rect{});
    host.SetRootView(root);
    list = RecordingView::Make("list", log, Rect{10, 20, 110, 120});
    root->AddChild(list);
    root->obeys = {18006};
    list->obeys = {57634, 18001};
    list->statuses[57634] = CommandStatus{true, false, CommandMark::kCheck, ""};
    list->statuses[18001] = CommandStatus{false, false, CommandMark::kCheck, ""};
    list->statuses[18006] = CommandStatus{true, true, CommandMark::kBullet, "Snap Now"};
    SetMenuTracker(tracker);
    ASSERT_TRUE(MenuRegistry::Instance().RegisterFromText(R"(
menu Edit
  item cmd.edit.copy "$$$/Vantile/Menu/Copy=Copy"
  item 18001 "Rename..."
  separator
  submenu "More"
    item 18006 "Snap"
  end
end)"));
    log->Clear();
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  ShortcutManager shortcuts;
  ViewHost host{Size{200, 200}};
  std::shared_ptr<RecordingView> list;
  std::shared_ptr<ScriptedMenuTracker> tracker = std::make_shared<ScriptedMenuTracker>();
};

TEST_F(MenuTrackerTest, TheTrackerSeesEachItemsStatusTextAndKey) {
  SetLocalizedString("Vantile/Menu/Copy", "Kopieren");
  list->TrackPopupMenu("Edit", Point{5, 6});
  ASSERT_EQ(tracker->GetRequests().size(), 1u);
  const PopupMenuRequest& request = tracker->GetRequests()[0];
  EXPECT_EQ(request.menuName, "Edit");
  EXPECT_EQ(request.windowPoint, (Point{15, 26}));
  ASSERT_EQ(request.entries.size(), 4u);
  EXPECT_EQ(request.entries[0].command, 57634);
  EXPECT_EQ(request.entries[0].text, "Kopieren");
  EXPECT_EQ(request.entries[0].shortcut, "Ctrl+C");
  EXPECT_TRUE(request.entries[0].enabled);
  EXPECT_FALSE(request.entries[1].enabled);
  EXPECT_EQ(request.entries[2].kind, MenuItem::Kind::kSeparator);
  const PopupMenuEntry& snap = request.entries[3].submenu.at(0);
  EXPECT_TRUE(snap.checked);
  EXPECT_EQ(snap.mark, CommandMark::kBullet);
  EXPECT_EQ(snap.text, "Snap Now");
  EXPECT_EQ(tracker->GetUnansweredCount(), 1);
}

TEST_F(MenuTrackerTest, TheChosenCommandGoesFromTheViewUpItsChain) {
  tracker->PushAnswer(57634);
  tracker->PushAnswer(18006);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), 57634);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), 18006);
  EXPECT_EQ(log->lines, (Lines{"list command 57634", "root command 18006"}));
}

TEST_F(MenuTrackerTest, DismissingTheMenuSendsNothing) {
  tracker->PushAnswer(std::nullopt);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::nullopt);
  EXPECT_TRUE(log->lines.empty());
  EXPECT_EQ(tracker->PendingAnswers(), 0u);
}

TEST_F(MenuTrackerTest, AnAnswerThatIsNoEnabledItemIsRefused) {
  ClearRecordedDebugAssertions();
  tracker->PushAnswer(18001);  // disabled
  tracker->PushAnswer(4711);   // not in the menu
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::nullopt);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::nullopt);
  EXPECT_TRUE(log->lines.empty());
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].count, 2);
}

TEST_F(MenuTrackerTest, APickChoosesAmongTheEnabledCommandsCountingRound) {
  // Enabled, in the order shown: Copy (57634), then Snap (18006) in the submenu; Rename is not.
  tracker->PushPick(0);
  tracker->PushPick(1);
  tracker->PushPick(2);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::optional<CommandID>(57634));
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::optional<CommandID>(18006));
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::optional<CommandID>(57634));
  list->statuses[57634].enabled = false;
  list->statuses[18006].enabled = false;
  tracker->PushPick(5);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::nullopt);
  EXPECT_EQ(tracker->PendingAnswers(), 0u);
}

TEST_F(MenuTrackerTest, AnUnknownMenuOrNoTrackerShowsNothing) {
  ClearRecordedDebugAssertions();
  tracker->PushAnswer(57634);
  EXPECT_EQ(list->TrackPopupMenu("Nope", Point{}), std::nullopt);
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_TRUE(tracker->GetRequests().empty());
  SetMenuTracker(nullptr);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), std::nullopt);
  EXPECT_TRUE(log->lines.empty());
}

TEST_F(MenuTrackerTest, ACommandNameNobodyDeclaredShowsDisabled) {
  ASSERT_TRUE(MenuRegistry::Instance().Register(
      Menu("Named").AddCommand(std::string("cmd.nobody"), "Ghost")));
  tracker->PushAnswer(kNoCommand);
  EXPECT_EQ(list->TrackPopupMenu("Named", Point{}), std::nullopt);
  EXPECT_FALSE(tracker->GetRequests()[0].entries[0].enabled);
}

TEST_F(MenuTrackerTest, AViewMayDestroyItselfFromTheChosenCommand) {
  std::weak_ptr<RecordingView> weakList = list;
  list->onCommand = [](RecordingView& view, CommandID) {
    view.Destroy();
    return true;
  };
  tracker->PushAnswer(57634);
  EXPECT_EQ(list->TrackPopupMenu("Edit", Point{}), 57634);
  list.reset();
  EXPECT_TRUE(weakList.expired());
}

}  // namespace
