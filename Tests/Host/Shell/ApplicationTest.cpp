#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/DemoProject.h"
#include "Host/Shell/Handler.h"
#include "Host/Shell/Module.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr CommandID kViewCommand = 29001;     // answered by the focused tab view
constexpr CommandID kHandlerCommand = 29002;  // answered by the handler only
constexpr const char* kCounterKey = "Test.OpenCount";

// A panel view that counts how often its tab was opened, through its saved state.
class CountingTabView : public TabView {
 public:
  int openCount = 0;
  int viewCommands = 0;
  int layouts = 0;  // after the tab was created

  void SetBoundsSelf(const Rect& /*bounds*/) override {
    if (IsTabCreated())
      ++layouts;
  }

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != kViewCommand)
      return TabView::FindCommandStatus(command, status);
    status.enabled = true;
    return true;
  }
  bool ObeyCommand(CommandID command) override {
    if (command != kViewCommand)
      return TabView::ObeyCommand(command);
    ++viewCommands;
    return true;
  }
  void SaveStateSelf(PropertyList& state) const override { state.SetInt(kCounterKey, openCount); }
  void RestoreStateSelf(const PropertyList& state) override {
    openCount = state.GetInt(kCounterKey, 0) + 1;
  }
};

// Behaves as a panel handler does: one view at a time, made anew on each request.
class TestHandler : public Handler {
 public:
  static inline std::vector<std::string>* log = nullptr;

  explicit TestHandler(std::string_view id, bool singleInstance = false)
      : Handler(id), mSingleInstance(singleInstance) {}
  ~TestHandler() override {
    if (log != nullptr) {
      log->push_back("~" + GetHandlerID() +
                     (Application::InstanceOrNull() != nullptr ? " (app alive)" : " (no app)"));
    }
    if (mView != nullptr)
      mView->Destroy();
  }

  TabView* CreateTabView(TabFrame* frame, const PropertyList& /*state*/) override {
    if (mView != nullptr && !mSingleInstance) {
      mView->Destroy();
      mView.reset();
    }
    mView = std::make_shared<CountingTabView>();
    mView->Create(GetHandlerID(), GetHandlerID() + " Panel", frame, true);
    return mView.get();
  }
  bool IsSingleInstance() const override { return mSingleInstance; }
  bool AllowClose() override { return allowClose; }
  bool ShouldHideWhenClosed() const override { return hideWhenClosed; }

  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    if (command != kHandlerCommand)
      return Handler::FindCommandStatus(command, status);
    status.enabled = true;
    return true;
  }
  bool ObeyCommand(CommandID command) override {
    if (command != kHandlerCommand)
      return Handler::ObeyCommand(command);
    ++handlerCommands;
    return true;
  }

  CountingTabView* GetView() const { return mView.get(); }

  int handlerCommands = 0;
  bool allowClose = true;
  bool hideWhenClosed = false;

 private:
  bool mSingleInstance;
  std::shared_ptr<CountingTabView> mView;
};

class TestModule : public Module {
 public:
  static inline std::vector<std::string>* log = nullptr;
  using Module::Module;
  ~TestModule() override {
    if (log != nullptr)
      log->push_back("~module");
  }
};

class ApplicationTest : public ::testing::Test {
 protected:
  ~ApplicationTest() override {
    for (const auto& id : mHandlerIDs)
      Handler::UnregisterFactory(id);
    for (const auto& id : mModuleIDs)
      Module::UnregisterFactory(id);
  }

  void RegisterHandler(const std::string& id, bool singleInstance = false) {
    ASSERT_TRUE(Handler::RegisterFactory(id, [singleInstance](std::string_view handlerID) {
      return std::make_unique<TestHandler>(handlerID, singleInstance);
    }));
    mHandlerIDs.push_back(id);
  }

  void RegisterModule(const std::string& id, std::vector<std::wstring>* names) {
    ASSERT_TRUE(Module::RegisterFactory(id, [names](const std::wstring& name) {
      names->push_back(name);
      return std::make_unique<TestModule>(name);
    }));
    mModuleIDs.push_back(id);
  }

  TestHandler& HandlerOf(Application& app, std::string_view id) {
    return *static_cast<TestHandler*>(app.FindHandler(id));
  }

  MessagingTestScope mMessaging;
  std::vector<std::string> mHandlerIDs;
  std::vector<std::string> mModuleIDs;
};

// Collects the type names of messages on one station.
class StationLog {
 public:
  explicit StationLog(const char* station)
      : mListener([this](const Message& m) { names.emplace_back(m.GetTypeName()); }) {
    AddListener(station, mListener);
  }
  std::vector<std::string> names;

 private:
  FunctionListener mListener;
};

TEST_F(ApplicationTest, ModuleFactoriesAreCalledOnceWithTheModuleName) {
  std::vector<std::wstring> names;
  RegisterModule("Test.ModuleA", &names);
  EXPECT_FALSE(Module::RegisterFactory("Test.ModuleA", [](const std::wstring& n) {
    return std::make_unique<TestModule>(n);
  })) << "a second factory for one id";
  EXPECT_FALSE(Module::RegisterFactory("Test.Empty", {}));
  ASSERT_TRUE(Module::RegisterFactory(
      "Test.Null", [](const std::wstring&) { return std::unique_ptr<Module>(); }));
  mModuleIDs.push_back("Test.Null");

  Application app;
  EXPECT_EQ(app.LoadModules(), 1u);
  EXPECT_EQ(app.LoadModules(), 0u) << "loading again makes no second module";
  ASSERT_EQ(names, std::vector<std::wstring>{L"Test.ModuleA"});
  ASSERT_EQ(app.GetModules().size(), 1u);
  EXPECT_EQ(app.GetModules()[0]->GetName(), L"Test.ModuleA");
}

TEST_F(ApplicationTest, HandlersAreMadeOnceAndAskedForCommandsAfterTheViews) {
  RegisterHandler("Test.H1");
  EXPECT_FALSE(Handler::RegisterFactory(
      "Test.H1", [](std::string_view id) { return std::make_unique<TestHandler>(id); }));
  EXPECT_FALSE(Handler::RegisterFactory(
      "", [](std::string_view id) { return std::make_unique<TestHandler>(id); }));

  Application app;
  EXPECT_EQ(app.CreateHandler("Test.Unknown"), nullptr);
  Handler* handler = app.CreateHandler("Test.H1");
  ASSERT_NE(handler, nullptr);
  EXPECT_EQ(app.CreateHandler("Test.H1"), handler);
  EXPECT_EQ(handler->GetHandlerID(), "Test.H1");
  EXPECT_TRUE(CommandHandler::IsFallbackHandler(*handler));

  auto& test = HandlerOf(app, "Test.H1");
  TabView* tab = app.OpenTab("Test.H1");
  ASSERT_NE(tab, nullptr);
  EXPECT_TRUE(app.GetCommandStatus(kViewCommand).enabled);
  EXPECT_TRUE(app.DoCommand(kViewCommand));
  EXPECT_EQ(test.GetView()->viewCommands, 1);
  EXPECT_TRUE(app.DoCommand(kHandlerCommand)) << "the chain declines; the handler takes it";
  EXPECT_EQ(test.handlerCommands, 1);
  EXPECT_FALSE(app.DoCommand(29999));
  EXPECT_FALSE(app.GetCommandStatus(29999).enabled);
}

TEST_F(ApplicationTest, OpeningATabHostsItInFrontWithTheFocus) {
  RegisterHandler("Test.H1");
  Application app({500, 300});
  app.CreateHandlers();
  TabView* tab = app.OpenTab("Test.H1");
  ASSERT_NE(tab, nullptr);
  WorkspaceFrame& frame = app.GetWorkspaceFrame();
  EXPECT_EQ(frame.GetFrontTab(), tab);
  EXPECT_EQ(tab->GetParent(), &frame);
  EXPECT_EQ(tab->GetBounds(), (Rect{0, WorkspaceFrame::kTabStripHeight, 500, 300}));
  EXPECT_TRUE(tab->IsTarget());
  EXPECT_EQ(app.FindTab("Test.H1"), tab);
  EXPECT_EQ(app.GetParentForNewViews(), &frame);
}

TEST_F(ApplicationTest, OpeningATabTwiceReplacesTheFirstAndCarriesItsState) {
  RegisterHandler("Test.Replacing");
  RegisterHandler("Test.Single", true);
  Application app;
  app.CreateHandlers();
  for (const char* id : {"Test.Replacing", "Test.Single"}) {
    SCOPED_TRACE(id);
    auto& handler = HandlerOf(app, id);
    TabView* first = app.OpenTab(id);
    ASSERT_NE(first, nullptr);
    const std::weak_ptr<ViewBase> firstAlive = first->weak_from_this();
    EXPECT_EQ(handler.GetView()->openCount, 1);

    TabView* second = app.OpenTab(id);
    ASSERT_NE(second, nullptr);
    EXPECT_NE(second, first);
    EXPECT_TRUE(firstAlive.expired()) << "the first view is gone";
    std::size_t tabsOfHandler = 0;
    for (TabView* tab : app.GetWorkspaceFrame().GetTabs())
      tabsOfHandler += tab->GetHandlerID() == id ? 1 : 0;
    EXPECT_EQ(tabsOfHandler, 1u);
    EXPECT_EQ(app.GetWorkspaceFrame().GetFrontTab(), second);
    if (handler.IsSingleInstance()) {
      // The application closed the first tab itself and saved its state on the way.
      EXPECT_EQ(handler.GetView()->openCount, 2);
    }
  }
}

TEST_F(ApplicationTest, ClosedTabsSaveTheirStateForTheNextOpening) {
  RegisterHandler("Test.H1");
  Application app;
  app.CreateHandlers();
  app.OpenTab("Test.H1");
  EXPECT_TRUE(app.CloseTab("Test.H1"));
  EXPECT_EQ(app.FindTab("Test.H1"), nullptr);
  EXPECT_EQ(app.GetSavedTabState("Test.H1").GetInt(kCounterKey, -1), 1);
  app.OpenTab("Test.H1");
  EXPECT_EQ(HandlerOf(app, "Test.H1").GetView()->openCount, 2);
  EXPECT_FALSE(app.CloseTab("Test.Unknown"));
}

TEST_F(ApplicationTest, CloseIsRefusedOrOnlyHidesWhenTheHandlerSaysSo) {
  RegisterHandler("Test.H1");
  Application app;
  app.CreateHandlers();
  auto& handler = HandlerOf(app, "Test.H1");
  TabView* tab = app.OpenTab("Test.H1");
  handler.allowClose = false;
  EXPECT_FALSE(app.CloseTab("Test.H1"));
  EXPECT_TRUE(tab->IsVisible());
  handler.allowClose = true;
  handler.hideWhenClosed = true;
  EXPECT_TRUE(app.CloseTab("Test.H1"));
  EXPECT_EQ(app.FindTab("Test.H1"), tab) << "hidden, not destroyed";
  EXPECT_FALSE(tab->IsVisible());
}

TEST_F(ApplicationTest, WindowClassesOpenTheirHandlersTabs) {
  RegisterHandler("Test.H1");
  Application app;
  app.CreateHandlers();
  EXPECT_TRUE(app.AddWindowClass("Test.Window", "Test.H1", 1));
  EXPECT_FALSE(app.AddWindowClass("Test.Window", "Test.Other", 1));
  EXPECT_TRUE(app.AddWindow("Test.Window", "$$$/Test/Title=Test", kDefaultWindowID,
                            kDefaultWindowContextID));
  EXPECT_FALSE(app.AddWindow("Test.Window", "again", kDefaultWindowID, kDefaultWindowContextID));
  EXPECT_EQ(app.OpenWindow("Test.NoSuchWindow"), nullptr);
  EXPECT_EQ(app.OpenAllWindows(), 1u);
  EXPECT_NE(app.FindTab("Test.H1"), nullptr);
  EXPECT_TRUE(app.RemoveWindowClass("Test.Window"));
  EXPECT_TRUE(app.GetWindows().empty()) << "its windows go with the class";
  EXPECT_FALSE(app.RemoveWindowClass("Test.Window"));
}

TEST_F(ApplicationTest, NextAndPreviousPanelCommandsCycleTheTabs) {
  RegisterHandler("Test.A");
  RegisterHandler("Test.B");
  Application app;
  app.CreateHandlers();
  EXPECT_FALSE(app.GetCommandStatus(kCommandSelectNextPanel).enabled) << "no tab yet";
  TabView* a = app.OpenTab("Test.A");
  TabView* b = app.OpenTab("Test.B");
  WorkspaceFrame& frame = app.GetWorkspaceFrame();
  ASSERT_EQ(frame.GetFrontTab(), b);
  EXPECT_FALSE(a->IsVisible());
  EXPECT_TRUE(app.GetCommandStatus(kCommandSelectNextPanel).enabled);
  EXPECT_TRUE(app.DoCommand(kCommandSelectNextPanel));
  EXPECT_EQ(frame.GetFrontTab(), a);
  EXPECT_TRUE(a->IsVisible());
  EXPECT_FALSE(b->IsVisible());
  EXPECT_TRUE(a->IsTarget());
  EXPECT_TRUE(app.DoCommand(kCommandSelectPreviousPanel));
  EXPECT_EQ(frame.GetFrontTab(), b);
  EXPECT_FALSE(app.DoCommand(kCommandSelectFindBox)) << "no find box in this host";
}

TEST_F(ApplicationTest, MaximisingTheFrameLetsTheTabsLayOutAgain) {
  RegisterHandler("Test.H1");
  Application app;
  app.CreateHandlers();
  TabView* tab = app.OpenTab("Test.H1");
  EXPECT_FALSE(tab->IsFrameMaximized());
  HandlerOf(app, "Test.H1").GetView()->layouts = 0;
  app.SetWorkspaceMaximized(true);
  EXPECT_TRUE(tab->IsFrameMaximized());
  EXPECT_EQ(HandlerOf(app, "Test.H1").GetView()->layouts, 1)
      << "same size, new layout: the panel keeps a separate split for a maximised frame";
  app.SetWorkspaceMaximized(true);
  EXPECT_EQ(HandlerOf(app, "Test.H1").GetView()->layouts, 1) << "no change, no layout";
}

TEST_F(ApplicationTest, ClickingATabNameBringsItToTheFront) {
  RegisterHandler("Test.A");
  RegisterHandler("Test.B");
  Application app({600, 200});
  app.CreateHandlers();
  TabView* a = app.OpenTab("Test.A");
  app.OpenTab("Test.B");
  const Rect label = app.GetWorkspaceFrame().GetTabLabelRect(0);
  ASSERT_FALSE(label.IsEmpty());
  app.GetViewHost().MouseDown(MouseButton::kLeft, label.Center(), kKeyModifierNone);
  app.GetViewHost().MouseUp(MouseButton::kLeft, label.Center(), kKeyModifierNone);
  EXPECT_EQ(app.GetWorkspaceFrame().GetFrontTab(), a);
}

TEST_F(ApplicationTest, ClosingTheFrontTabShowsAnother) {
  RegisterHandler("Test.A");
  RegisterHandler("Test.B");
  Application app;
  app.CreateHandlers();
  TabView* a = app.OpenTab("Test.A");
  app.OpenTab("Test.B");
  app.CloseTab("Test.B");
  EXPECT_EQ(app.GetWorkspaceFrame().GetFrontTab(), a);
  EXPECT_TRUE(a->IsVisible());
}

TEST_F(ApplicationTest, ProjectActivationIsAnnouncedOnTheActivationStation) {
  StationLog activation(kSequenceActivationStation);
  Application app;
  const ProjectRef demo = BuildDemoProject();
  app.OpenProject(demo);
  ASSERT_NE(app.GetActiveSequence(), nullptr);
  EXPECT_EQ(app.GetActiveSequence(), demo->GetSequences().front());
  EXPECT_EQ(activation.names,
            (std::vector<std::string>{"SequenceOpenedMessage", "SequenceActivatedMessage",
                                      "SequenceFocusedMessage"}));
  activation.names.clear();
  app.ActivateSequence(app.GetActiveSequence());
  EXPECT_EQ(activation.names,
            (std::vector<std::string>{"SequenceActivatedMessage", "SequenceFocusedMessage"}))
      << "opened only once";

  activation.names.clear();
  app.OpenProject(BuildDemoProject());
  ASSERT_GE(activation.names.size(), 2u);
  EXPECT_EQ(activation.names[0], "SequenceClosedMessage");
  EXPECT_EQ(activation.names[1], "SequenceOpenedMessage");
  EXPECT_NE(app.GetActiveSequence(), demo->GetSequences().front());
}

TEST_F(ApplicationTest, ASequenceOfAnotherProjectIsNotActivated) {
  Application app;
  app.OpenProject(BuildDemoProject());
  const ProjectRef other = BuildDemoProject();
  const SequenceRef active = app.GetActiveSequence();
  EXPECT_FALSE(app.ActivateSequence(other->GetSequences().front()));
  EXPECT_EQ(app.GetActiveSequence(), active);
}

TEST_F(ApplicationTest, SelectionGoesThroughTheSequenceAndRejectsUnknownIDs) {
  Application app;
  std::string error;
  EXPECT_FALSE(app.SelectTrackItems({kDemoVideoClipA}, &error));
  EXPECT_EQ(error, "there is no active sequence to select in");

  app.OpenProject(BuildDemoProject());
  const SequenceRef sequence = app.GetActiveSequence();
  StationLog selection(sequence->GetStation().c_str());
  ASSERT_TRUE(app.SelectTrackItems({kDemoVideoClipA}, &error)) << error;
  ASSERT_EQ(sequence->GetSelection().size(), 1u);
  const TrackItemGroup& group = sequence->GetSelection()[0];
  ASSERT_EQ(group.videoItems.size(), 1u);
  EXPECT_EQ(group.videoItems[0]->GetID(), kDemoVideoClipA);
  ASSERT_EQ(group.audioItems.size(), 1u) << "the linked audio comes along";
  EXPECT_EQ(group.audioItems[0]->GetID(), kDemoAudioClipA);
  EXPECT_NE(std::find(selection.names.begin(), selection.names.end(),
                      "SequenceClipSelectionChangedMessage"),
            selection.names.end());

  EXPECT_FALSE(app.SelectTrackItems({kDemoVideoClipB, 999999}, &error));
  EXPECT_EQ(error, "sequence 'Demo Sequence' has no track item with id 999999");
  EXPECT_EQ(sequence->GetSelection().size(), 1u) << "a failed select changes nothing";
  EXPECT_EQ(sequence->GetSelection()[0].videoItems[0]->GetID(), kDemoVideoClipA);

  app.ClearSelection();
  EXPECT_TRUE(sequence->GetSelection().empty());
}

TEST_F(ApplicationTest, ToolsAndOpenedSelectionsAreBroadcast) {
  StationLog tools(kToolStation);
  StationLog activation(kTrackItemActivationStation);
  Application app;
  app.SelectTool(HostTool::kPen);
  app.SelectTool(HostTool::kZoom);
  app.SelectTool(HostTool::kRipple);
  EXPECT_EQ(tools.names,
            (std::vector<std::string>{"PenToolSelectedMessage", "ZoomToolSelectedMessage",
                                      "RippleToolSelectedMessage"}));
  EXPECT_EQ(app.GetTool(), HostTool::kRipple);

  app.OpenProject(BuildDemoProject());
  app.OpenTrackItemSelection({app.GetActiveSequence()->FindTrackItem(kDemoTransition)});
  EXPECT_EQ(activation.names, std::vector<std::string>{"TrackItemSelectionOpenedMessage"});
}

TEST_F(ApplicationTest, UndoAndRedoKeysWorkOnTheOpenProject) {
  RegisterHandler("Test.H1");
  Application app;
  app.CreateHandlers();
  EXPECT_FALSE(app.GetCommandStatus(kCommandUndo).enabled) << "no project";
  app.OpenProject(BuildDemoProject());
  int value = 0;
  app.GetUndoStack()->Execute(
      FunctionAction::MakeSetter("Test.Set", 0, 5, [&value](int v) { value = v; }));
  ASSERT_EQ(value, 5);
  const CommandStatus status = app.GetCommandStatus(kCommandUndo);
  EXPECT_TRUE(status.enabled);
  EXPECT_EQ(status.text, "Undo Test.Set");
  EXPECT_FALSE(app.GetCommandStatus(kCommandRedo).enabled);

  ViewHost& host = app.GetViewHost();
  EXPECT_TRUE(host.KeyDown({KeyCode::kZ, kKeyModifierCtrl}));
  EXPECT_EQ(value, 0);
  EXPECT_TRUE(app.DoCommand(kCommandRedo));
  EXPECT_EQ(value, 5);
  app.SetMenusDisabled(true);
  EXPECT_FALSE(app.GetCommandStatus(kCommandUndo).enabled) << "handlers disable it";
}

TEST_F(ApplicationTest, ShutdownDeletesHandlersBeforeModulesWhileTheInstanceLives) {
  std::vector<std::string> log;
  TestHandler::log = &log;
  TestModule::log = &log;
  std::vector<std::wstring> names;
  RegisterModule("Test.ModuleA", &names);
  RegisterHandler("Test.A");
  RegisterHandler("Test.B");
  {
    Application app;
    app.LoadModules();
    app.CreateHandlers();
    app.OpenTab("Test.A");
    EXPECT_EQ(&Application::Instance(), &app);
  }
  TestHandler::log = nullptr;
  TestModule::log = nullptr;
  EXPECT_EQ(log,
            (std::vector<std::string>{"~Test.B (app alive)", "~Test.A (app alive)", "~module"}));
  EXPECT_EQ(Application::InstanceOrNull(), nullptr);
  EXPECT_THROW(Application::Instance(), NullInterfaceException);
}

TEST_F(ApplicationTest, ASecondApplicationIsRefused) {
  Application first;
  ClearRecordedDebugAssertions();
  {
    Application second;
    EXPECT_EQ(&Application::Instance(), &first);
    EXPECT_FALSE(RecordedDebugAssertions().empty());
  }
  EXPECT_EQ(&Application::Instance(), &first) << "the refused one does not clear the instance";
}

}  // namespace
