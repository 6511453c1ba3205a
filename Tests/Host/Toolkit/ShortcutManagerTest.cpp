#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

// A module's command-context set-up, the way a panel declares its commands.
void DeclarePanelCommands(ShortcutManager& manager) {
  CommandContext* context = manager.AddContext(
      "effectcontrols",
      "$$$/Vantile/Handlers/EffectControls/EffectControlsPanel=Effect Controls Panel");
  context->DeclareCommand("cmd.effectcontrols.rename", 18001, 0, "", std::nullopt, false);
  context->DeclareCommand("cmd.edit.clear", 57632, 0, "", std::nullopt, false);
  context->DeclareCommand(
      "cmd.effectcontrols.interpolation.linear", 18401, 2,
      "$$$/Vantile/Handlers/EffectControls/InterpolationEffectLinear=Keyframe Temporal "
      "Interpolation - Linear",
      std::nullopt, false);
  context->DeclareCommand("cmd.effectcontrols.masterclipvideoexpander", 18498, 3, "", std::nullopt,
                          false);
  manager.DeclareKeyRepeatsDisabledCommand(12052);
}

class ShortcutManagerTest : public ::testing::Test {
 protected:
  ToolkitTestScope scope;
  ShortcutManager manager;
};

TEST_F(ShortcutManagerTest, AModuleDeclaresItsCommandsThroughItsContextSetup) {
  manager.RegisterCommandContext(&DeclarePanelCommands);
  const CommandContext* context = manager.FindContext("effectcontrols");
  ASSERT_NE(context, nullptr);
  ASSERT_EQ(context->GetCommands().size(), 4u);
  EXPECT_EQ(context->GetCommands()[0].name, "cmd.effectcontrols.rename");
  EXPECT_EQ(context->GetCommands()[1].id, 57632);

  EXPECT_EQ(manager.FindCommandID("cmd.effectcontrols.interpolation.linear"), 18401);
  EXPECT_EQ(manager.FindCommandID("cmd.effectcontrols.nothing"), std::nullopt);
  const CommandDeclaration* linear = manager.FindCommand(18401);
  ASSERT_NE(linear, nullptr);
  EXPECT_EQ(linear->kind, 2);
  EXPECT_EQ(linear->context, "effectcontrols");
  EXPECT_NE(linear->shortcutLabel.find("Interpolation - Linear"), std::string::npos);
  EXPECT_FALSE(linear->immutableString.has_value());
  const CommandDeclaration* expander = manager.FindCommand(18498);
  ASSERT_NE(expander, nullptr);
  EXPECT_EQ(expander->kind, 3);
  EXPECT_TRUE(expander->shortcutLabel.empty());

  EXPECT_TRUE(manager.AreKeyRepeatsDisabled(12052));
  EXPECT_FALSE(manager.AreKeyRepeatsDisabled(18001));
}

TEST_F(ShortcutManagerTest, TheStandardEditCommandsAreDeclaredGlobally) {
  EXPECT_EQ(manager.FindCommandID("cmd.edit.clear"), kCommandClear);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.cut"), kCommandCut);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.copy"), kCommandCopy);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.paste"), kCommandPaste);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.selectall"), kCommandSelectAll);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.undo"), kCommandUndo);
  EXPECT_EQ(manager.FindCommandID("cmd.edit.redo"), kCommandRedo);
  EXPECT_EQ(manager.FindCommand(kCommandUndo)->context, ShortcutManager::kGlobalContext);
  // A panel may declare a standard command again in its own context.
  manager.RegisterCommandContext(&DeclarePanelCommands);
  EXPECT_TRUE(manager.FindContext("effectcontrols")->HasCommand(kCommandClear));
  EXPECT_EQ(manager.FindCommand(kCommandClear)->context, ShortcutManager::kGlobalContext);
}

TEST_F(ShortcutManagerTest, KeysOfTheStandardEditCommands) {
  const auto command = [&](KeyCode key, KeyModifiers modifiers = kKeyModifierNone) {
    return manager.FindCommandForKey(KeyStroke(key, modifiers));
  };
  EXPECT_EQ(command(KeyCode::kDelete), kCommandClear);
  EXPECT_EQ(command(KeyCode::kBackspace), kCommandClear);
  EXPECT_EQ(command(KeyCode::kX, kKeyModifierCtrl), kCommandCut);
  EXPECT_EQ(command(KeyCode::kC, kKeyModifierCtrl), kCommandCopy);
  EXPECT_EQ(command(KeyCode::kV, kKeyModifierCtrl), kCommandPaste);
  EXPECT_EQ(command(KeyCode::kA, kKeyModifierCtrl), kCommandSelectAll);
  EXPECT_EQ(command(KeyCode::kZ, kKeyModifierCtrl), kCommandUndo);
  EXPECT_EQ(command(KeyCode::kZ, kKeyModifierCtrl | kKeyModifierShift), kCommandRedo);
  EXPECT_EQ(command(KeyCode::kC), std::nullopt);
  EXPECT_EQ(command(KeyCode::kC, kKeyModifierCtrl | kKeyModifierAlt), std::nullopt);
  // Bits outside the modifier word's known ones do not matter.
  EXPECT_EQ(command(KeyCode::kC, kKeyModifierCtrl | 0x1000), kCommandCopy);
  EXPECT_EQ(manager.FindKeyForCommand(kCommandRedo)->ToString(), "Ctrl+Shift+Z");
}

TEST_F(ShortcutManagerTest, TheActiveContextsBindingsWinOverTheGlobalOnes) {
  manager.RegisterCommandContext(&DeclarePanelCommands);
  ASSERT_TRUE(manager.BindKey("effectcontrols", KeyStroke(KeyCode::kR, kKeyModifierCtrl), 18001));
  ASSERT_TRUE(manager.BindKey("effectcontrols", KeyStroke(KeyCode::kDelete), 18498));
  EXPECT_EQ(manager.FindCommandForKey(KeyStroke(KeyCode::kR, kKeyModifierCtrl)), std::nullopt);
  ASSERT_TRUE(manager.SetActiveContext("effectcontrols"));
  EXPECT_EQ(manager.FindCommandForKey(KeyStroke(KeyCode::kR, kKeyModifierCtrl)), 18001);
  EXPECT_EQ(manager.FindCommandForKey(KeyStroke(KeyCode::kDelete)), 18498);
  EXPECT_EQ(manager.FindCommandForKey(KeyStroke(KeyCode::kBackspace)), kCommandClear);
  // Delete no longer clears here; Backspace still does.
  EXPECT_EQ(manager.FindKeyForCommand(kCommandClear), KeyStroke(KeyCode::kBackspace));
  EXPECT_TRUE(manager.UnbindKey("effectcontrols", KeyStroke(KeyCode::kDelete)));
  EXPECT_EQ(manager.FindCommandForKey(KeyStroke(KeyCode::kDelete)), kCommandClear);
}

TEST_F(ShortcutManagerTest, ConflictingDeclarationsAreRefusedAndReported) {
  ClearRecordedDebugAssertions();
  CommandContext* context = manager.AddContext("panel", "Panel");
  EXPECT_TRUE(context->DeclareCommand("cmd.panel.a", 100, 0, "", std::nullopt, false));
  EXPECT_TRUE(context->DeclareCommand("cmd.panel.a", 100, 0, "", std::nullopt, false));
  EXPECT_FALSE(context->DeclareCommand("cmd.panel.a", 101, 0, "", std::nullopt, false));
  EXPECT_FALSE(context->DeclareCommand("cmd.panel.b", 100, 0, "", std::nullopt, false));
  EXPECT_FALSE(context->DeclareCommand("", 102, 0, "", std::nullopt, false));
  EXPECT_FALSE(context->DeclareCommand("cmd.panel.c", kNoCommand, 0, "", std::nullopt, false));
  EXPECT_EQ(context->GetCommands().size(), 1u);
  EXPECT_EQ(manager.FindCommandID("cmd.panel.b"), std::nullopt);
  EXPECT_EQ(RecordedDebugAssertions().size(), 3u);
}

TEST_F(ShortcutManagerTest, ContextsAreMadeOnceAndKeepTheirFirstLabel) {
  CommandContext* first = manager.AddContext("panel", "First");
  CommandContext* second = manager.AddContext("panel", "Second");
  EXPECT_EQ(first, second);
  EXPECT_EQ(first->GetLabel(), "First");
  EXPECT_EQ(manager.AddContext("", "Nameless"), nullptr);
  ASSERT_EQ(manager.GetContexts().size(), 2u);
  EXPECT_EQ(manager.GetContexts()[0]->GetName(), ShortcutManager::kGlobalContext);
}

TEST_F(ShortcutManagerTest, BadBindingsAndContextsAreRefused) {
  ClearRecordedDebugAssertions();
  EXPECT_FALSE(manager.BindKey("nowhere", KeyStroke(KeyCode::kK), kCommandCopy));
  EXPECT_FALSE(manager.BindKey(ShortcutManager::kGlobalContext, KeyStroke(KeyCode::kK), 4242));
  EXPECT_FALSE(manager.BindKey(ShortcutManager::kGlobalContext, KeyStroke(), kCommandCopy));
  EXPECT_FALSE(manager.SetActiveContext("nowhere"));
  EXPECT_EQ(manager.GetActiveContext(), ShortcutManager::kGlobalContext);
  EXPECT_EQ(RecordedDebugAssertions().size(), 4u);
}

TEST_F(ShortcutManagerTest, WindowMenusAreKeptByIdOnce) {
  EXPECT_TRUE(manager.AddWindowMenuID("effectcontrols", "Effect Controls Panel Menu",
                                      "HandlerEffectControls_Flyout_Menu"));
  EXPECT_FALSE(manager.AddWindowMenuID("effectcontrols", "Again", "Other"));
  const WindowMenuEntry* entry = manager.FindWindowMenu("effectcontrols");
  ASSERT_NE(entry, nullptr);
  EXPECT_EQ(entry->menuName, "HandlerEffectControls_Flyout_Menu");
  EXPECT_EQ(manager.GetWindowMenus().size(), 1u);
}

}  // namespace
