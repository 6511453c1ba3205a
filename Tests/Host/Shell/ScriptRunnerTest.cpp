#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/DemoProject.h"
#include "Host/Shell/Handler.h"
#include "Host/Shell/ScriptRunner.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/StateDumpSource.h"
#include "Host/Shell/ViewHostInputRoute.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/CommandContext.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr const char* kHandlerID = "Test.ScriptPanel";
constexpr const char* kPopupMenu = "Test_Script_Popup";
constexpr CommandID kToggle = 29101;    // an undoable edit: "Test.Toggle"
constexpr CommandID kAsk = 29102;       // asks for a name
constexpr CommandID kAssert = 29103;    // raises a debug assertion
constexpr CommandID kDisabled = 29104;  // declared, never enabled
constexpr CommandID kOther = 29105;     // in the popup, enabled
constexpr Color kPanelColor(20, 120, 60);

void DeclareTestCommands() {
  ShortcutManager::Instance().RegisterCommandContext([](ShortcutManager& manager) {
    CommandContext* context = manager.AddContext("scripttest", "Script Test");
    context->DeclareCommand("cmd.test.toggle", kToggle, 0, "", std::nullopt, false);
    context->DeclareCommand("cmd.test.ask", kAsk, 0, "", std::nullopt, false);
    context->DeclareCommand("cmd.test.assert", kAssert, 0, "", std::nullopt, false);
    context->DeclareCommand("cmd.test.disabled", kDisabled, 0, "", std::nullopt, false);
    context->DeclareCommand("cmd.test.other", kOther, 0, "", std::nullopt, false);
  });
  Menu popup(kPopupMenu);
  popup.AddCommand(kToggle, "Toggle").AddCommand(kDisabled, "Disabled").AddCommand(kOther, "Other");
  MenuRegistry::Instance().Register(popup);
}

// A small panel: paints one colour, writes down its input, answers the test commands, shows a
// popup on right click and reports a state dump.
class ScriptPanel : public TabView, public StateDumpSource {
 public:
  std::vector<std::string> events;
  bool toggled = false;
  std::string askedName = "(not asked)";
  int otherCommands = 0;

  void PaintSelf(DC& dc) override { dc.FillRect(GetLocalBounds(), kPanelColor); }
  void LeftButtonDownSelf(Point p, KeyModifiers m) override { Note("down", p, m); }
  void LeftButtonMultiClickSelf(Point p, KeyModifiers m, int count) override {
    Note("multi" + std::to_string(count), p, m);
  }
  void LeftButtonUpSelf(Point p, KeyModifiers m) override { Note("up", p, m); }
  void RightButtonDownSelf(Point p, KeyModifiers /*m*/) override { TrackPopupMenu(kPopupMenu, p); }
  void MouseMoveSelf(Point p, KeyModifiers m) override { Note("move", p, m); }
  bool MouseWheelSelf(const WheelEvent& e) override {
    Note("wheel" + std::to_string(e.deltaY), e.point, e.modifiers);
    return true;
  }
  bool KeyDownSelf(const KeyEvent& e) override {
    events.push_back("key " + std::string(KeyCodeName(e.key)) + " m" + std::to_string(e.modifiers));
    return true;
  }
  bool TextInputSelf(std::string_view text) override {
    events.push_back("text " + std::string(text));
    return true;
  }

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    switch (command) {
      case kToggle:
      case kAsk:
      case kAssert:
      case kOther:
        status.enabled = true;
        return true;
      case kDisabled:
        status.enabled = false;
        return true;
      default:
        return TabView::FindCommandStatus(command, status);
    }
  }
  bool ObeyCommand(CommandID command) override {
    switch (command) {
      case kToggle: {
        const bool before = toggled;
        Application::Instance().GetUndoStack()->Execute(FunctionAction::MakeSetter(
            "Test.Toggle", before, !before, [this](bool value) { toggled = value; }));
        return true;
      }
      case kAsk:
        askedName = InputBox::Ask("Rename", "New Name", "old").value_or("(cancelled)");
        return true;
      case kAssert:
        HOST_ASSERT(!toggled, "Test assertion");
        return true;
      case kOther:
        ++otherCommands;
        return true;
      default:
        return TabView::ObeyCommand(command);
    }
  }

  void FillStateDump(PanelStateDump& dump) const override {
    dump.headerText = toggled ? "Toggled" : "Plain";
    dump.targetMode = 1;
    StateDumpRow row;
    row.path = {"Motion", "Scale"};
    row.className = "FloatSliderParameter";
    row.top = 20;
    row.height = 18;
    row.groupLevel = 1;
    row.shown = true;
    row.rect = StateDumpRect{5, 40, 200, 18};
    row.controls.push_back({"PictureButton", {180, 41, 16, 16}, true, false});
    dump.rows.push_back(row);
    StateDumpKeyframeArea area;
    area.visibleStartTime = 0;
    area.secondsPerPixel = 0.01;
    area.selectedKeyframes.push_back({{"Motion", "Scale"}, 254016000000});
    dump.keyframeArea = area;
    dump.extra.emplace_back("answer", std::int64_t{42});
  }

 private:
  void Note(const std::string& what, Point p, KeyModifiers m) {
    events.push_back(what + " " + std::to_string(p.x) + "," + std::to_string(p.y) + " m" +
                     std::to_string(m));
  }
};

class ScriptPanelHandler : public Handler {
 public:
  using Handler::Handler;
  ~ScriptPanelHandler() override {
    if (mView != nullptr)
      mView->Destroy();
  }
  TabView* CreateTabView(TabFrame* frame, const PropertyList& /*state*/) override {
    if (mView != nullptr)
      mView->Destroy();
    mView = std::make_shared<ScriptPanel>();
    mView->Create(GetHandlerID(), "Script Panel", frame, true);
    return mView.get();
  }
  ScriptPanel* GetView() const { return mView.get(); }

 private:
  std::shared_ptr<ScriptPanel> mView;
};

class ScriptRunnerTest : public ::testing::Test {
 protected:
  ScriptRunnerTest() {
    DeclareTestCommands();
    Handler::RegisterFactory(
        kHandlerID, [](std::string_view id) { return std::make_unique<ScriptPanelHandler>(id); });
    mOut = std::filesystem::temp_directory_path() /
           ("ScriptRunnerTest-" + std::to_string(::getpid()) + "-" +
            ::testing::UnitTest::GetInstance()->current_test_info()->name());
    std::filesystem::remove_all(mOut);
    mApp = std::make_unique<Application>(Size{320, 200});
    mApp->CreateHandlers();
    mApp->OpenProject(BuildDemoProject());
    mApp->OpenTab(kHandlerID);
    mInput = std::make_unique<ViewHostInputRoute>(mApp->GetViewHost());
    mRunner = std::make_unique<ScriptRunner>(*mApp, *mInput, mOut.string());
  }
  ~ScriptRunnerTest() override {
    mRunner.reset();
    mInput.reset();
    mApp.reset();
    Handler::UnregisterFactory(kHandlerID);
    std::filesystem::remove_all(mOut);
  }

  ScriptRunResult RunText(std::string_view text) {
    auto parsed = AutomationScript::Parse(text);
    if (const auto* error = std::get_if<ScriptError>(&parsed)) {
      ADD_FAILURE() << "script does not parse: " << error->Describe();
      return {};
    }
    return mRunner->Run(std::get<AutomationScript>(parsed));
  }

  ScriptPanel& Panel() {
    return *static_cast<ScriptPanelHandler*>(mApp->FindHandler(kHandlerID))->GetView();
  }

  bool Saw(const std::string& event) {
    const auto& events = Panel().events;
    return std::find(events.begin(), events.end(), event) != events.end();
  }

  MessagingTestScope mMessaging;
  std::filesystem::path mOut;
  std::unique_ptr<Application> mApp;
  std::unique_ptr<ViewHostInputRoute> mInput;
  std::unique_ptr<ScriptRunner> mRunner;
};

TEST_F(ScriptRunnerTest, PointerInputArrivesAtPanelCoordinates) {
  const auto result = RunText(
      "click 10 20 shift\n"
      "dblclick 30 40\n"
      "drag 0 0 40 20 steps 4 ctrl\n"
      "move 5 6\n"
      "wheel -3\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_TRUE(Saw("down 10,20 m2"));
  EXPECT_TRUE(Saw("up 10,20 m2"));
  EXPECT_TRUE(Saw("multi2 30,40 m0"));
  for (const char* step : {"move 10,5 m4", "move 20,10 m4", "move 30,15 m4", "move 40,20 m4"})
    EXPECT_TRUE(Saw(step)) << step;
  EXPECT_TRUE(Saw("up 40,20 m4"));
  EXPECT_TRUE(Saw("wheel-3 5,6 m0"));
}

TEST_F(ScriptRunnerTest, WheelNeedsThePointerInThePanel) {
  const auto result = RunText("wheel 2\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.line, 1);
  EXPECT_NE(result.message.find("move X Y first"), std::string::npos);
}

TEST_F(ScriptRunnerTest, KeysAndTextGoToTheFocusedView) {
  const auto result = RunText("key delete ctrl\nkey a\ntype Hello # not a comment\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_TRUE(Saw("key Delete m4"));
  EXPECT_TRUE(Saw("key A m0"));
  EXPECT_TRUE(Saw("text Hello # not a comment"));
  const auto bad = RunText("\nkey hyperspace\n");
  EXPECT_FALSE(bad.ok);
  EXPECT_EQ(bad.Describe(), "line 2: unknown key name 'hyperspace'");
}

TEST_F(ScriptRunnerTest, CommandsByNameAndByIDReachTheFocusedView) {
  auto result = RunText("command cmd.test.toggle\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_TRUE(Panel().toggled);
  result = RunText("command 29101\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_FALSE(Panel().toggled);
}

TEST_F(ScriptRunnerTest, AnUnknownCommandNameStopsTheRunAtItsLine) {
  const auto result = RunText(
      "command cmd.test.toggle\n# two\ncommand cmd.test.nonesuch\n"
      "command cmd.test.toggle\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.Describe(), "line 3: unknown command name 'cmd.test.nonesuch'");
  EXPECT_TRUE(Panel().toggled) << "line 1 ran, line 4 did not";
}

TEST_F(ScriptRunnerTest, ADisabledCommandIsNotSentAndSaysSo) {
  const auto result = RunText("command cmd.test.disabled\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  ASSERT_EQ(result.warnings.size(), 1u);
  EXPECT_EQ(result.warnings[0],
            "line 1: command cmd.test.disabled is disabled here; it was not sent");
}

TEST_F(ScriptRunnerTest, AMenuAnswerIsTakenByTheNextPopup) {
  auto result = RunText("menu-answer cmd.test.other\nrclick 50 50\nrclick 50 50\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_EQ(Panel().otherCommands, 1);
  ASSERT_EQ(result.warnings.size(), 1u) << "the second popup had no answer";
  EXPECT_EQ(result.warnings[0],
            "line 3: popup menu 'Test_Script_Popup' was dismissed: no menu-answer was given");

  result = RunText("menu-answer none\nrclick 50 50\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_TRUE(result.warnings.empty());
  EXPECT_EQ(Panel().otherCommands, 1);
}

TEST_F(ScriptRunnerTest, AMenuAnswerThatThePopupCannotGiveStopsTheRun) {
  const auto result = RunText("menu-answer 29104\nclick 1 1\nrclick 50 50\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.line, 3) << "the line that opened the popup";
  EXPECT_EQ(result.message,
            "popup menu 'Test_Script_Popup' has no enabled command 29104; the menu was dismissed");
}

TEST_F(ScriptRunnerTest, UnusedAnswersAreReported) {
  const auto result = RunText("menu-answer none\ninput-answer x\n");
  ASSERT_TRUE(result.ok);
  EXPECT_EQ(result.warnings.size(), 2u);
}

TEST_F(ScriptRunnerTest, AnInputAnswerIsTakenByTheNextInputBox) {
  auto result = RunText("input-answer Brighter Blur\ncommand cmd.test.ask\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_EQ(Panel().askedName, "Brighter Blur");
  result = RunText("command cmd.test.ask\n");
  EXPECT_EQ(Panel().askedName, "(cancelled)") << "no answer cancels the box";
}

TEST_F(ScriptRunnerTest, UndoAndRedoGoThroughTheProjectHistory) {
  auto result = RunText("command cmd.test.toggle\nundo\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_FALSE(Panel().toggled);
  result = RunText("redo\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_TRUE(Panel().toggled);
  result = RunText("undo\nundo\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.Describe(), "line 2: nothing to undo");
  result = RunText("redo\nredo\n");
  EXPECT_EQ(result.Describe(), "line 2: nothing to redo");
}

TEST_F(ScriptRunnerTest, SelectAndTimeGoThroughTheActiveSequence) {
  auto result = RunText("select 101\ntime 00:00:01:05\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  const SequenceRef sequence = mApp->GetActiveSequence();
  ASSERT_EQ(sequence->GetSelection().size(), 1u);
  EXPECT_EQ(sequence->GetSelection()[0].videoItems.at(0)->GetID(), kDemoVideoClipA);
  EXPECT_EQ(sequence->GetCurrentTime(), kTicksPerSecond + 5 * (kTicksPerSecond / 25));

  result = RunText("time 1234\nselect-none\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_EQ(sequence->GetCurrentTime(), 1234);
  EXPECT_TRUE(sequence->GetSelection().empty());

  result = RunText("select 101\nselect 103 4242\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.Describe(), "line 2: sequence 'Demo Sequence' has no track item with id 4242");
  EXPECT_EQ(sequence->GetSelection().size(), 1u) << "the failed line selected nothing";

  result = RunText("time 00:00:01:30\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.line, 1) << "25 fps has no frame 30";
  result = RunText("time -5\n");
  EXPECT_EQ(result.Describe(), "line 1: time must not be negative");
}

TEST_F(ScriptRunnerTest, ShotWritesTheWorkspaceAsPNG) {
  const auto result = RunText("shot shots/first.png\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  const std::string path = (mOut / "shots" / "first.png").string();
  ASSERT_EQ(result.written, std::vector<std::string>{path});
  std::string error;
  const Image image = Image::LoadPNG(path, 1.0, &error);
  ASSERT_FALSE(image.IsEmpty()) << error;
  EXPECT_EQ(image.GetPixelSize(), (Size{320, 200}));
  EXPECT_EQ(image.GetPixel(100, WorkspaceFrame::kTabStripHeight + 50), kPanelColor);

  EXPECT_EQ(RunText("shot picture.jpg\n").Describe(),
            "line 1: shot writes PNG files: 'picture.jpg' does not end in .png");
}

TEST_F(ScriptRunnerTest, ResizeChangesTheShotSize) {
  const auto result = RunText("resize 200 150\nshot small.png\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  const Image image = Image::LoadPNG((mOut / "small.png").string());
  EXPECT_EQ(image.GetPixelSize(), (Size{200, 150}));
  EXPECT_EQ(Panel().GetBounds().Width(), 200);
}

TEST_F(ScriptRunnerTest, DumpIsJSONWithHistoryAssertionsAndPanelState) {
  ClearRecordedDebugAssertions();
  const auto result = RunText(
      "select 101 201\ncommand cmd.test.toggle\ncommand cmd.test.toggle\nundo\n"
      "command cmd.test.assert\ndump state.json\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  std::ifstream in(mOut / "state.json");
  ASSERT_TRUE(in);
  const nlohmann::json dump = nlohmann::json::parse(in);  // throws when not JSON

  EXPECT_EQ(dump["undo"]["done"], nlohmann::json::array({"Test.Toggle"}));
  EXPECT_EQ(dump["undo"]["undone"], nlohmann::json::array({"Test.Toggle"}));
  ASSERT_EQ(dump["assertions"].size(), 1u);
  EXPECT_EQ(dump["assertions"][0]["message"], "Test assertion");
  EXPECT_EQ(dump["assertions"][0]["condition"], "!toggled");

  EXPECT_EQ(dump["sequence"]["name"], "Demo Sequence");
  EXPECT_EQ(dump["sequence"]["selection"], nlohmann::json::parse("[[101, 201]]"));
  ASSERT_EQ(dump["sequence"]["items"].size(), 5u);
  EXPECT_EQ(dump["sequence"]["items"][0]["id"], kDemoVideoClipA);
  EXPECT_EQ(dump["sequence"]["items"][1]["kind"], "transition");
  EXPECT_EQ(dump["sequence"]["items"][4]["media"], "audio");
  EXPECT_EQ(dump["workspace"]["frontTab"], kHandlerID);

  ASSERT_EQ(dump["panels"].size(), 1u);
  const auto& panel = dump["panels"][0];
  EXPECT_EQ(panel["dumped"], true);
  EXPECT_EQ(panel["header"], "Toggled");
  EXPECT_EQ(panel["rows"][0]["path"], nlohmann::json::array({"Motion", "Scale"}));
  EXPECT_EQ(panel["rows"][0]["class"], "FloatSliderParameter");
  EXPECT_EQ(panel["keyframeArea"]["selectedKeyframes"][0]["time"], 254016000000);
  EXPECT_EQ(panel["extra"]["answer"], 42);
  EXPECT_EQ(panel["rows"][0]["rect"],
            nlohmann::json::parse(R"({"x": 5, "y": 40, "width": 200, "height": 18})"));
  EXPECT_EQ(panel["rows"][0]["controls"][0]["class"], "PictureButton");
  EXPECT_EQ(panel["rows"][0]["controls"][0]["rect"]["x"], 180);
  EXPECT_EQ(panel["rows"][0]["controls"][0]["enabled"], false);
  EXPECT_EQ(dump["workspace"]["cursor"], "kOSArrow");
}

TEST_F(ScriptRunnerTest, AToolPickedInAScriptReachesTheToolStation) {
  std::vector<std::string> heard;
  FunctionListener listener(
      [&heard](const Message& message) { heard.push_back(std::string(message.GetTypeName())); });
  AddListener(kToolStation, listener);
  const auto result = RunText("tool pen\ntool pointer\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_EQ(heard,
            (std::vector<std::string>{"PenToolSelectedMessage", "PointerToolSelectedMessage"}));
  EXPECT_EQ(mApp->GetTool(), HostTool::kPointer);
}

TEST_F(ScriptRunnerTest, OpenSelectsTheItemsAndAnnouncesThemOpened) {
  std::vector<ObjectID> opened;
  FunctionListener listener([&opened](const Message& message) {
    if (const auto* open = message.As<TrackItemSelectionOpenedMessage>()) {
      for (const auto& item : open->items)
        opened.push_back(item->GetID());
    }
  });
  AddListener(kTrackItemActivationStation, listener);
  const auto result = RunText("open 101\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_EQ(opened, std::vector<ObjectID>{101});
  ASSERT_EQ(mApp->GetActiveSequence()->GetSelection().size(), 1u);

  const auto missing = RunText("open 987654321\n");
  EXPECT_FALSE(missing.ok);
  EXPECT_EQ(opened.size(), 1u);
}

TEST_F(ScriptRunnerTest, ReopenPanelGivesTheTabANewView) {
  const ScriptPanel* before = &Panel();
  const auto result = RunText("reopen-panel\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  EXPECT_NE(&Panel(), before);
  EXPECT_EQ(mApp->GetWorkspaceFrame().GetFrontTab()->GetHandlerID(), kHandlerID);
}

TEST_F(ScriptRunnerTest, SaveIsRefusedAndNothingIsWritten) {
  const auto result = RunText("save copy.json\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.line, 1);
  EXPECT_EQ(result.message.rfind("saving is not available yet", 0), 0u) << result.message;
  EXPECT_FALSE(std::filesystem::exists(mOut / "copy.json"));
}

TEST_F(ScriptRunnerTest, SaveWritesThroughTheProjectSaverOnlyWhenAsked) {
  std::vector<std::string> saved;
  mRunner->SetProjectSaver([&saved](const Project& project, const std::string& path, std::string*) {
    saved.push_back(project.GetName() + " -> " + path);
    return true;
  });
  auto result = RunText("command cmd.test.toggle\nsave copies/demo.json\n");
  ASSERT_TRUE(result.ok) << result.Describe();
  const std::string path = (mOut / "copies" / "demo.json").string();
  EXPECT_EQ(saved, std::vector<std::string>{"Demo -> " + path});
  EXPECT_EQ(result.written, std::vector<std::string>{path});

  mRunner->SetProjectSaver([](const Project&, const std::string&, std::string* error) {
    *error = "disk full";
    return false;
  });
  result = RunText("save demo.json\n");
  EXPECT_EQ(result.Describe(),
            "line 1: cannot save '" + (mOut / "demo.json").string() + "': disk full");
}

TEST_F(ScriptRunnerTest, AnExceptionFromTheViewStopsTheRunAtItsLine) {
  // The null-interface exception is caught at command dispatch; a view must not see others,
  // but if one escapes the runner reports it instead of crashing.
  struct Thrower : CommandHandler {
    bool FindCommandStatus(CommandID c, CommandStatus& s) override {
      if (c != 29199)
        return false;
      s.enabled = true;
      return true;
    }
    bool ObeyCommand(CommandID c) override {
      if (c == 29199)
        throw std::runtime_error("boom");
      return false;
    }
  } thrower;
  CommandHandler::RegisterFallbackHandler(thrower);
  const auto result = RunText("command 29199\n");
  EXPECT_FALSE(result.ok);
  EXPECT_EQ(result.Describe(), "line 1: failed unexpectedly: boom");
}

}  // namespace
