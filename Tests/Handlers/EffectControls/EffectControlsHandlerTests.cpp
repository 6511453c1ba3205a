#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsModule.h"
#include "Handlers/EffectControls/Src/EffectControlsHandler.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TransitionData.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/ShellIdentifiers.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/CommandContext.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/TabView.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;
constexpr std::string_view kOtherPanelID = "Test.OtherPanel";

// A second panel, so that the effect controls tab can be behind another one.
class OtherPanelHandler : public Handler {
 public:
  explicit OtherPanelHandler(std::string_view id) : Handler(id) {}
  ~OtherPanelHandler() override {
    if (mView) {
      mView->Destroy();
    }
  }
  TabView* CreateTabView(TabFrame* frame, const PropertyList& /*state*/) override {
    if (mView) {
      mView->Destroy();
    }
    mView = std::make_shared<TabView>();
    mView->Create(GetHandlerID(), "Other", frame, true);
    return mView.get();
  }

 private:
  std::shared_ptr<TabView> mView;
};

class EffectControlsHandlerTest : public ::testing::Test {
 protected:
  EffectControlsHandlerTest() {
    Weaklink();
    SelfRegistrationSymbol();
    Handler::RegisterFactory(kOtherPanelID, [](std::string_view id) -> std::unique_ptr<Handler> {
      return std::make_unique<OtherPanelHandler>(id);
    });
    app->LoadModules();
  }
  ~EffectControlsHandlerTest() override {
    app.reset();
    Handler::UnregisterFactory(kOtherPanelID);
    ColorManager::ResetForTesting();
  }

  EffectControlsHandler* MakeHandler() {
    return dynamic_cast<EffectControlsHandler*>(app->CreateHandler(kEffectControlsHandlerID));
  }

  // A project whose active sequence holds a clip and, after it, a transition.
  void OpenProject() {
    project->AddSequence(sequence);
    sequence->AddTrack(track);
    track->AddItem(clip);
    TransitionData data;
    data.matchName = "XO.Test CrossDissolve";
    data.displayName = "Cross Dissolve";
    transition = TrackItem::CreateTransition(MediaType::Video, 9 * kSecond, 11 * kSecond, data);
    track->AddItem(transition);
    app->OpenProject(project);
  }

  MessagingTestScope messaging;
  std::unique_ptr<Application> app = std::make_unique<Application>(Size{800, 500});
  ProjectRef project = Project::Create("Handler");
  SequenceRef sequence = Sequence::Create("Sequence");
  TrackRef track = Track::Create(MediaType::Video, "V1");
  TrackItemRef clip = TrackItem::CreateClip(MediaType::Video, 0, 10 * kSecond, nullptr, 0);
  TrackItemRef transition;
};

// --- Module ---

TEST(EffectControlsModule, CreateModuleMakesANamedModuleAndDeclaresTheContext) {
  std::unique_ptr<Module> module = CreateModule(L"EffectControls");
  ASSERT_NE(module, nullptr);
  EXPECT_NE(dynamic_cast<EffectControlsModule*>(module.get()), nullptr);
  EXPECT_EQ(module->GetName(), L"EffectControls");
  EXPECT_NE(ShortcutManager::Instance().FindContext("effectcontrols"), nullptr);
}

TEST(EffectControlsModule, BothFactoriesAreRegisteredAtLoad) {
  Weaklink();
  EXPECT_TRUE(Module::FindFactory(kEffectControlsModuleID));
  EXPECT_TRUE(Handler::FindFactory(kEffectControlsHandlerID));
}

// --- Commands ---

TEST(EffectControlsCommands, AreDeclaredInTheirOrderWithKindAndShortcutLabel) {
  ShortcutManager shortcuts;
  EffectControlsHandler::SetUpCommandContext(shortcuts);
  const CommandContext* context = shortcuts.FindContext("effectcontrols");
  ASSERT_NE(context, nullptr);
  EXPECT_EQ(context->GetLabel(),
            "$$$/Vantile/Handlers/EffectControls/EffectControlsPanel=Effect Controls Panel");

  const std::vector<CommandID> expectedOrder = {
      18001, 18002, 18003, 57632, 11541, 18006, 18007, 18008, 18009, 18010, 18011,
      18012, 18013, 18052, 18054, 18051, 18053, 18401, 18402, 18403, 18404, 18405,
      18406, 18407, 18408, 18409, 18410, 18411, 18461, 18462, 18463, 18464, 18471,
      18472, 18473, 18474, 18420, 18500, 18499, 18498, 19000, 19050, 18055};
  std::vector<CommandID> order;
  for (const CommandDeclaration& command : context->GetCommands()) {
    order.push_back(command.id);
    EXPECT_FALSE(command.immutableString.has_value()) << command.name;
    EXPECT_FALSE(command.flag) << command.name;
    const bool labelled =
        (command.id >= 18401 && command.id <= 18411) || command.id == 18499 || command.id == 18500;
    EXPECT_EQ(!command.shortcutLabel.empty(), labelled) << command.name;
    const int kind = labelled                                                              ? 2
                     : (command.id == 18498 || command.id == 19000 || command.id == 19050) ? 3
                                                                                           : 0;
    EXPECT_EQ(command.kind, kind) << command.name;
  }
  EXPECT_EQ(order, expectedOrder);

  const CommandDeclaration& bezier = context->GetCommands()[18];
  EXPECT_EQ(bezier.name, "cmd.effectcontrols.interpolation.bezier");
  EXPECT_EQ(bezier.shortcutLabel,
            "$$$/Vantile/Handlers/EffectControls/InterpolationEffectBezier=Keyframe Temporal "
            "Interpolation - Bezier");
  EXPECT_EQ(context->GetCommands()[3].name, "cmd.edit.clear");
  EXPECT_EQ(shortcuts.FindCommandID("cmd.effectcontrols.xoeditabletextexpander"), 19050);
}

TEST(EffectControlsCommands, KeyRepeatsAreDisabledFor12052Only) {
  ShortcutManager shortcuts;
  EffectControlsHandler::SetUpCommandContext(shortcuts);
  EXPECT_TRUE(shortcuts.AreKeyRepeatsDisabled(12052));
  EXPECT_FALSE(shortcuts.AreKeyRepeatsDisabled(18401));
}

TEST(EffectControlsCommands, DeclaringTwiceChangesNothing) {
  ShortcutManager shortcuts;
  EffectControlsHandler::SetUpCommandContext(shortcuts);
  EffectControlsHandler::SetUpCommandContext(shortcuts);
  EXPECT_EQ(shortcuts.FindContext("effectcontrols")->GetCommands().size(), 43u);
}

// --- Keyframe images ---

TEST(EffectControlsKeyframeImages, FollowKindTimesSixPlusVariantThenTimeRemapping) {
  const auto& decals = EffectControlsHandler::GetKeyframeImageDecals();
  const char* kinds[] = {"Linear", "Bezier", "AutoBezier", "Hold", "EaseIn", "EaseOut"};
  const char* variants[] = {"Normal",   "FirstNormal",   "LastNormal",
                            "Selected", "FirstSelected", "LastSelected"};
  for (int kind = 0; kind < 6; ++kind) {
    for (int variant = 0; variant < 6; ++variant) {
      EXPECT_EQ(GetDecalName(decals[6 * kind + variant]),
                std::string("kEffectControlsKey") + kinds[kind] + variants[variant] + "Decal");
    }
  }
  EXPECT_EQ(decals[10], kEffectControlsKeyBezierFirstSelectedDecal);
  const char* timeRemapping[] = {"DualControlPoint", "LeftControlPoint", "RightControlPoint",
                                 "HoldControlPoint", "DualHoldRight",    "DualHoldLeft"};
  for (int i = 0; i < 6; ++i) {
    EXPECT_EQ(GetDecalName(decals[36 + 2 * i]),
              std::string("kEffectControlsKeyTR") + timeRemapping[i] + "NormalDecal");
    EXPECT_EQ(GetDecalName(decals[37 + 2 * i]),
              std::string("kEffectControlsKeyTR") + timeRemapping[i] + "SelectedDecal");
  }
}

TEST_F(EffectControlsHandlerTest, TheHandlerSharesItsFortyEightImagesWithEveryRow) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  const auto& images = handler->GetKeyframeImageList();
  ASSERT_NE(images, nullptr);
  ASSERT_EQ(images->GetCount(), 48);
  const auto& decals = EffectControlsHandler::GetKeyframeImageDecals();
  for (int i = 0; i < 48; ++i) {
    EXPECT_EQ(images->GetBitmap(i)->GetDecal(), decals[i]) << i;
  }
  EXPECT_EQ(images->GetBitmap(10)->GetDecal(), kEffectControlsKeyBezierFirstSelectedDecal);
  EXPECT_EQ(ParameterControl::GetKeyframeImageList(), images);
}

// --- Registration ---

TEST_F(EffectControlsHandlerTest, RegistersStationsColoursMenusWindowAndWindowMenu) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  EXPECT_EQ(EffectControlsHandler::GetInstance(), handler);
  EXPECT_EQ(handler->GetContextName(), "effectcontrols");
  EXPECT_TRUE(handler->IsSingleInstance());
  EXPECT_EQ(handler->GetToolMode(), ToolMode::kPointer);
  EXPECT_TRUE(StationExists("EffectControls.Reset"));
  EXPECT_TRUE(StationExists("ECW.audio.player.relay"));

  EXPECT_TRUE(ColorManager::IsColorSetRegistered("effectcontrolscolors"));
  EXPECT_TRUE(ColorManager::HasColor("colors.effectscontrols.panel.text"));
  for (const char* menu : {"HandlerEffectControls_Flyout_Menu", "HandlerEffectControls_Edit_Menu",
                           "HandlerEffectControls_TrackingMethod_Menu"}) {
    EXPECT_NE(MenuRegistry::Instance().Find(menu), nullptr) << menu;
  }

  const WindowClassEntry* windowClass = app->FindWindowClass(kEffectControlsWindowTypeID);
  ASSERT_NE(windowClass, nullptr);
  EXPECT_EQ(windowClass->handlerID, kEffectControlsHandlerID);
  EXPECT_EQ(windowClass->flags, 1);
  ASSERT_EQ(app->GetWindows().size(), 1u);
  EXPECT_EQ(app->GetWindows()[0].title,
            "$$$/Vantile/Handlers/EffectControls/EffectControls=Effect Controls");
  EXPECT_EQ(app->GetWindows()[0].id, kDefaultWindowID);

  const WindowMenuEntry* windowMenu = ShortcutManager::Instance().FindWindowMenu("effectcontrols");
  ASSERT_NE(windowMenu, nullptr);
  EXPECT_EQ(windowMenu->label, "Effect Controls Panel Menu");
  EXPECT_EQ(windowMenu->menuName, "HandlerEffectControls_Flyout_Menu");
}

TEST_F(EffectControlsHandlerTest, DestructionReleasesWhatTheHandlerRegistered) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  const std::weak_ptr<const ImageList> images = handler->GetKeyframeImageList();
  app.reset();
  EXPECT_TRUE(images.expired());
  EXPECT_EQ(EffectControlsHandler::GetInstance(), nullptr);
  EXPECT_FALSE(StationExists("EffectControls.Reset"));
  EXPECT_FALSE(StationExists("ECW.audio.player.relay"));
  EXPECT_EQ(ParameterControl::GetKeyframeImageList()->GetCount(), 48);  // the rows' own again
}

TEST_F(EffectControlsHandlerTest, AFailedStepUndoesTheStepsBeforeIt) {
  // Another panel holds the window type, so the handler cannot add its window class.
  ASSERT_TRUE(app->AddWindowClass(kEffectControlsWindowTypeID, "Someone", 0));
  ClearRecordedDebugAssertions();
  EXPECT_EQ(MakeHandler(), nullptr);
  EXPECT_EQ(EffectControlsHandler::GetInstance(), nullptr);
  EXPECT_FALSE(StationExists("EffectControls.Reset"));
  EXPECT_FALSE(StationExists("ECW.audio.player.relay"));
  EXPECT_FALSE(ColorManager::IsColorSetRegistered("effectcontrolscolors"));
  EXPECT_EQ(app->FindWindowClass(kEffectControlsWindowTypeID)->handlerID, "Someone");
  EXPECT_TRUE(app->GetWindows().empty());
  ASSERT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("window class"), std::string::npos);

  // Tool messages reach no half-made handler.
  app->SelectTool(HostTool::kPen);
}

TEST_F(EffectControlsHandlerTest, ASecondHandlerIsRefusedWhileOneLives) {
  ASSERT_NE(MakeHandler(), nullptr);
  EXPECT_THROW(EffectControlsHandler("EffectControls.Second"), std::runtime_error);
  EXPECT_TRUE(StationExists("EffectControls.Reset"));  // the first one's stay
  EXPECT_NE(EffectControlsHandler::GetInstance(), nullptr);
}

// --- Commands reaching the handler ---

TEST_F(EffectControlsHandlerTest, PanelNavigationGoesToTheHandlersHooks) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  app->CreateHandler(kOtherPanelID);
  EXPECT_FALSE(handler->ObeyCommand(kCommandSelectNextPanel));  // no tabs yet
  app->OpenTab(kEffectControlsHandlerID);
  app->OpenTab(kOtherPanelID);
  ASSERT_EQ(app->GetWorkspaceFrame().GetFrontTab()->GetHandlerID(), kOtherPanelID);
  EXPECT_TRUE(handler->ObeyCommand(kCommandSelectNextPanel));
  EXPECT_EQ(app->GetWorkspaceFrame().GetFrontTab()->GetHandlerID(), kEffectControlsHandlerID);
  EXPECT_FALSE(handler->ObeyCommand(kCommandSelectFindBox));
  EXPECT_FALSE(handler->ObeyCommand(18401));
}

// --- Tab view ---

TEST_F(EffectControlsHandlerTest, TheTabViewIsMadeUnderTheHandlersContext) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  EXPECT_EQ(handler->GetView(), nullptr);
  TabView* tab = app->OpenTab(kEffectControlsHandlerID);
  ASSERT_NE(tab, nullptr);
  EXPECT_EQ(tab, handler->GetView());
  EXPECT_EQ(tab->GetHandlerID(), kEffectControlsHandlerID);
  EXPECT_EQ(tab->GetTabName(), "Effect Controls");
  EXPECT_EQ(tab->GetParent(), &app->GetWorkspaceFrame());
}

TEST_F(EffectControlsHandlerTest, AskingForTheTabViewTwiceDestroysTheFirst) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  TabView* first = handler->CreateTabView(&app->GetWorkspaceFrame(), PropertyList());
  ASSERT_NE(first, nullptr);
  std::weak_ptr<ViewBase> firstAlive = first->weak_from_this();
  TabView* second = handler->CreateTabView(&app->GetWorkspaceFrame(), PropertyList());
  ASSERT_NE(second, nullptr);
  EXPECT_EQ(handler->GetView(), second);
  EXPECT_TRUE(firstAlive.expired());
  app->GetWorkspaceFrame().TabsChanged();
  EXPECT_EQ(app->GetWorkspaceFrame().GetTabs(), std::vector<TabView*>{second});
}

TEST_F(EffectControlsHandlerTest, ToolMessagesBeforeTheViewOnlyStoreTheMode) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  app->SelectTool(HostTool::kPen);
  EXPECT_EQ(handler->GetToolMode(), ToolMode::kPen);
  app->SelectTool(HostTool::kHand);
  EXPECT_EQ(handler->GetToolMode(), ToolMode::kHand);
  EXPECT_EQ(handler->GetView(), nullptr);
  app->OpenTab(kEffectControlsHandlerID);
  ASSERT_NE(handler->GetView(), nullptr);
  EXPECT_EQ(handler->GetView()->GetKeyframeView()->GetToolMode(), ToolMode::kHand);
}

TEST_F(EffectControlsHandlerTest, EveryTimelineToolMapsToAMode) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  app->OpenTab(kEffectControlsHandlerID);
  constexpr ToolMode kPointer = ToolMode::kPointer;
  const std::vector<std::pair<HostTool, ToolMode>> tools = {
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kTrackSelectForward, kPointer},
      {HostTool::kPen, ToolMode::kPen},   {HostTool::kRipple, kPointer},
      {HostTool::kHand, ToolMode::kHand}, {HostTool::kRoll, kPointer},
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kRateStretch, kPointer},
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kRazor, kPointer},
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kSlip, kPointer},
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kSlide, kPointer},
      {HostTool::kZoom, ToolMode::kZoom}, {HostTool::kPointer, kPointer},
  };
  for (const auto& [tool, mode] : tools) {
    app->SelectTool(tool);
    EXPECT_EQ(handler->GetToolMode(), mode) << static_cast<int>(tool);
    EXPECT_EQ(handler->GetView()->GetKeyframeView()->GetToolMode(), mode) << static_cast<int>(tool);
  }
}

// --- Opened selections ---

TEST_F(EffectControlsHandlerTest, OpeningATransitionBringsThePanelToTheFront) {
  OpenProject();
  ASSERT_NE(MakeHandler(), nullptr);
  app->CreateHandler(kOtherPanelID);
  app->OpenTab(kEffectControlsHandlerID);
  app->OpenTab(kOtherPanelID);
  WorkspaceFrame& frame = app->GetWorkspaceFrame();
  ASSERT_EQ(frame.GetFrontTab()->GetHandlerID(), kOtherPanelID);

  app->OpenTrackItemSelection({});
  EXPECT_EQ(frame.GetFrontTab()->GetHandlerID(), kOtherPanelID);
  app->OpenTrackItemSelection({clip});
  EXPECT_EQ(frame.GetFrontTab()->GetHandlerID(), kOtherPanelID);
  app->OpenTrackItemSelection({clip, transition});  // the first item decides
  EXPECT_EQ(frame.GetFrontTab()->GetHandlerID(), kOtherPanelID);

  app->OpenTrackItemSelection({transition});
  EXPECT_EQ(frame.GetFrontTab()->GetHandlerID(), kEffectControlsHandlerID);
}

TEST_F(EffectControlsHandlerTest, OpeningATransitionWithoutAViewChangesNothing) {
  OpenProject();
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  app->OpenTrackItemSelection({transition});
  EXPECT_EQ(handler->GetView(), nullptr);
  EXPECT_EQ(app->GetWorkspaceFrame().GetFrontTab(), nullptr);
}

TEST_F(EffectControlsHandlerTest, AClosedTabIsNoLongerTheHandlersView) {
  EffectControlsHandler* handler = MakeHandler();
  ASSERT_NE(handler, nullptr);
  app->OpenTab(kEffectControlsHandlerID);
  ASSERT_TRUE(app->CloseTab(kEffectControlsHandlerID));
  EXPECT_EQ(handler->GetView(), nullptr);
  app->SelectTool(HostTool::kZoom);  // reaches no destroyed view
  app->OpenTrackItemSelection({});
  EXPECT_EQ(handler->GetToolMode(), ToolMode::kZoom);
}

}  // namespace
