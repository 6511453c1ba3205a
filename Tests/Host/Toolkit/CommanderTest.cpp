#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/Commander.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

using Lines = std::vector<std::string>;

// An application-level handler outside every chain.
class FallbackHandler : public CommandHandler {
 public:
  explicit FallbackHandler(std::shared_ptr<EventLog> log) : mLog(std::move(log)) {}
  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != 900) {
      return false;
    }
    status.enabled = true;
    status.text = "From the application";
    return true;
  }
  bool ObeyCommand(CommandID command) override {
    mLog->Add("fallback " + std::to_string(command));
    return command == 900;
  }

 private:
  std::shared_ptr<EventLog> mLog;
};

// host > panel > list, and host > panel > keyframes.
class CommanderTest : public ::testing::Test {
 protected:
  void SetUp() override {
    auto root = RecordingView::Make("root", log, Rect{});
    host.SetRootView(root);
    panel = RecordingView::Make("panel", log, Rect{0, 0, 100, 100});
    root->AddChild(panel);
    list = RecordingView::Make("list", log, Rect{0, 0, 50, 100});
    keyframes = RecordingView::Make("keyframes", log, Rect{50, 0, 100, 100});
    panel->AddChild(list);
    panel->AddChild(keyframes);
    log->Clear();
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  ViewHost host{Size{100, 100}};
  std::shared_ptr<RecordingView> panel;
  std::shared_ptr<RecordingView> list;
  std::shared_ptr<RecordingView> keyframes;
};

TEST_F(CommanderTest, CommandsTravelFromTheTargetUpToTheFirstThatHandlesThem) {
  list->BecomeTarget();
  EXPECT_EQ(log->lines, (Lines{"root on duty", "panel on duty", "list on duty"}));
  log->Clear();
  panel->obeys = {18006, 57632};
  list->obeys = {57632};
  EXPECT_TRUE(host.DoCommand(57632));
  EXPECT_TRUE(host.DoCommand(18006));
  EXPECT_FALSE(host.DoCommand(12345));
  EXPECT_EQ(log->lines, (Lines{"list command 57632", "panel command 18006"}));
}

TEST_F(CommanderTest, TheStatusComesFromTheFirstThatKnowsTheCommand) {
  list->BecomeTarget();
  panel->statuses[18006] = CommandStatus{true, true, CommandMark::kBullet, "Snap"};
  keyframes->statuses[18006] = CommandStatus{};  // not on the chain: never asked
  const CommandStatus status = host.GetCommandStatus(18006);
  EXPECT_TRUE(status.enabled);
  EXPECT_TRUE(status.checked);
  EXPECT_EQ(status.mark, CommandMark::kBullet);
  EXPECT_EQ(status.text, "Snap");
  EXPECT_EQ(host.GetCommandStatus(1), CommandStatus{});
}

TEST_F(CommanderTest, RegisteredHandlersAreAskedAfterTheWholeChain) {
  FallbackHandler fallback(log);
  CommandHandler::RegisterFallbackHandler(fallback);
  CommandHandler::RegisterFallbackHandler(fallback);
  list->BecomeTarget();
  log->Clear();
  EXPECT_TRUE(host.DoCommand(900));
  EXPECT_FALSE(host.DoCommand(901));
  EXPECT_EQ(host.GetCommandStatus(900).text, "From the application");
  panel->obeys = {900};
  host.DoCommand(900);
  EXPECT_EQ(log->lines, (Lines{"fallback 900", "fallback 901", "panel command 900"}));
}

TEST_F(CommanderTest, AHandlerDestroyedWhileTheFallbacksAreAskedIsSkipped) {
  struct Destroying : CommandHandler {
    std::unique_ptr<FallbackHandler>* mVictim = nullptr;
    bool ObeyCommand(CommandID) override {
      mVictim->reset();
      return false;
    }
  };
  Destroying first;
  auto second = std::make_unique<FallbackHandler>(log);
  first.mVictim = &second;
  FallbackHandler third(log);
  CommandHandler::RegisterFallbackHandler(first);
  CommandHandler::RegisterFallbackHandler(*second);
  CommandHandler::RegisterFallbackHandler(third);
  EXPECT_FALSE(host.DoCommand(901));
  EXPECT_EQ(log->lines, (Lines{"fallback 901"}));  // the third one only
  EXPECT_TRUE(CommandHandler::IsFallbackHandler(third));
}

TEST_F(CommanderTest, SwitchingTheTargetTellsWhoLeavesAndWhoJoinsTheDutyChain) {
  list->BecomeTarget();
  log->Clear();
  keyframes->BecomeTarget();
  EXPECT_EQ(log->lines, (Lines{"list off duty", "keyframes on duty"}));
  EXPECT_TRUE(panel->IsOnDuty());
  EXPECT_FALSE(list->IsOnDuty());
  EXPECT_TRUE(keyframes->IsTarget());
  log->Clear();
  host.BecomeTarget();
  EXPECT_EQ(log->lines, (Lines{"keyframes off duty", "panel off duty", "root off duty"}));
}

TEST_F(CommanderTest, AHookThatSwitchesTheTargetAgainWins) {
  struct Redirecting : SubView {
    Commander* mTo = nullptr;
    void NowOnDuty() override { mTo->BecomeTarget(); }
  };
  auto redirecting = std::make_shared<Redirecting>();
  redirecting->mTo = list.get();
  panel->AddChild(redirecting);
  redirecting->BecomeTarget();
  EXPECT_TRUE(list->IsTarget());
  EXPECT_FALSE(redirecting->IsOnDuty());
}

TEST_F(CommanderTest, TheTargetFallsBackToTheSuperCommanderWhenItGoesAway) {
  list->BecomeTarget();
  list->Destroy();
  EXPECT_TRUE(panel->IsTarget());

  keyframes->BecomeTarget();
  keyframes->Hide();
  EXPECT_TRUE(panel->IsTarget());

  keyframes->Show();
  keyframes->BecomeTarget();
  panel->RemoveChild(*keyframes);
  EXPECT_TRUE(panel->IsTarget());
  EXPECT_EQ(keyframes->GetSuperCommander(), nullptr);

  // A commander freed while it is the target.
  auto plain = std::make_unique<Commander>(panel.get());
  plain->BecomeTarget();
  plain.reset();
  EXPECT_TRUE(panel->IsTarget());
}

TEST_F(CommanderTest, AnExplicitSuperCommanderIsKeptWhenTheViewIsAdopted) {
  auto field = std::make_shared<RecordingView>("field", log, Color(), list.get());
  keyframes->AddChild(field);
  EXPECT_EQ(field->GetParent(), keyframes.get());
  EXPECT_EQ(field->GetSuperCommander(), list.get());
  field->BecomeTarget();
  list->obeys = {5};
  host.DoCommand(5);
  EXPECT_EQ(log->Last(), "list command 5");
}

TEST_F(CommanderTest, AViewMayDestroyItselfWhileObeyingACommand) {
  list->BecomeTarget();
  std::weak_ptr<RecordingView> weakList = list;
  list->onCommand = [](RecordingView& view, CommandID) {
    view.Destroy();
    return false;  // passes it on after destroying itself
  };
  panel->obeys = {7};
  list.reset();
  // The destroyed list left the chain, so the command goes on to the fallbacks, not the panel.
  EXPECT_FALSE(host.DoCommand(7));
  EXPECT_TRUE(weakList.expired());
  EXPECT_TRUE(panel->IsTarget());
}

TEST_F(CommanderTest, AMissingInterfaceDuringACommandIsRecordedAndCountsAsHandled) {
  ClearRecordedDebugAssertions();
  list->BecomeTarget();
  list->onCommand = [](RecordingView&, CommandID) -> bool {
    throw NullInterfaceException("ISequence");
  };
  panel->obeys = {8};
  EXPECT_TRUE(host.DoCommand(8));
  EXPECT_EQ(log->Last(), "list on duty");  // the panel never saw it
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("ISequence"), std::string::npos);
}

TEST_F(CommanderTest, ACommanderCannotBecomeItsOwnSuperCommander) {
  ClearRecordedDebugAssertions();
  panel->SetSuperCommander(list.get());
  EXPECT_EQ(panel->GetSuperCommander(), panel->GetParent());
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST(CommanderFocusOnClick, ClickingIntoATabFocusesItUnlessTheFocusIsAlreadyInside) {
  ToolkitTestScope scope;
  auto log = std::make_shared<EventLog>();
  ViewHost host(Size{100, 100});
  auto root = RecordingView::Make("root", log, Rect{});
  host.SetRootView(root);
  auto tab = std::make_shared<TabView>();
  tab->SetBounds(Rect{0, 0, 100, 100});
  root->AddChild(tab);
  auto list = RecordingView::Make("list", log, Rect{0, 0, 50, 50});
  tab->AddChild(list);

  host.MouseDown(MouseButton::kLeft, {10, 10}, kKeyModifierNone);
  EXPECT_TRUE(tab->IsTarget());
  list->BecomeTarget();
  host.MouseDown(MouseButton::kLeft, {10, 10}, kKeyModifierNone);
  host.MouseDown(MouseButton::kLeft, {80, 80}, kKeyModifierNone);
  EXPECT_TRUE(list->IsTarget());
  // A click outside every focus-taking view leaves the focus alone.
  root->SetBounds(Rect{0, 0, 100, 100});
  tab->SetBounds(Rect{0, 0, 50, 100});
  host.MouseDown(MouseButton::kLeft, {80, 80}, kKeyModifierNone);
  EXPECT_TRUE(list->IsTarget());
}

}  // namespace
