#include <gtest/gtest.h>

#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

constexpr std::string_view kResources = R"(# The panel's menus
menu HandlerEffectControls_Edit_Menu
  item 18001 "$$$/Vantile/Handlers/EffectControls/Rename=Rename..."
  item cmd.effectcontrols.save.preset "Save \"Preset\"..."
  separator
  submenu "Snapping"
    item 18006 "Snap"
    submenu "Targets"
      item 18010 "Current Time"
    end
  end
end

menu HandlerEffectControls_Softness_Menu
end
)";

std::string ParseError(std::string_view text) {
  std::string error;
  EXPECT_EQ(Menu::Parse(text, &error), std::nullopt);
  return error;
}

TEST(MenuResources, ParseIntoTheSameMenusAsBuiltInCode) {
  std::string error;
  const auto menus = Menu::Parse(kResources, &error);
  ASSERT_TRUE(menus) << error;
  ASSERT_EQ(menus->size(), 2u);

  Menu targets;
  targets.AddCommand(18010, "Current Time");
  Menu snapping;
  snapping.AddCommand(18006, "Snap").AddSubmenu("Targets", targets);
  Menu edit("HandlerEffectControls_Edit_Menu");
  edit.AddCommand(18001, "$$$/Vantile/Handlers/EffectControls/Rename=Rename...")
      .AddCommand(std::string("cmd.effectcontrols.save.preset"), "Save \"Preset\"...")
      .AddSeparator()
      .AddSubmenu("Snapping", snapping);
  EXPECT_EQ((*menus)[0], edit);
  EXPECT_EQ((*menus)[1].GetName(), "HandlerEffectControls_Softness_Menu");
  EXPECT_TRUE((*menus)[1].GetItems().empty());
}

TEST(MenuResources, NameTheLineOfEachMistake) {
  EXPECT_EQ(ParseError("item 1 \"x\""), "line 1: expected \"menu NAME\"");
  EXPECT_EQ(ParseError("menu A\n  item 1 \"unclosed\nend"),
            "line 2: the text is not closed with a quote");
  EXPECT_EQ(ParseError("menu A\n  item 1\nend"),
            "line 2: item needs a command id or name and a quoted text");
  EXPECT_EQ(ParseError("menu A\n  item 12x \"X\"\nend"),
            "line 2: \"12x\" is not a valid command id");
  EXPECT_EQ(ParseError("menu A\n  item 0 \"X\"\nend"), "line 2: \"0\" is not a valid command id");
  EXPECT_EQ(ParseError("menu A\n  item 99999999999 \"X\"\nend"),
            "line 2: \"99999999999\" is not a valid command id");
  EXPECT_EQ(ParseError("menu A\n  frobnicate\nend"), "line 2: unknown statement \"frobnicate\"");
  EXPECT_EQ(ParseError("menu A\nend\nmenu A\nend"), "line 3: menu \"A\" is defined twice");
  EXPECT_EQ(ParseError("\nmenu A\n  submenu \"S\"\n  end\n"),
            "line 2: menu \"A\" is not closed with \"end\"");
  EXPECT_EQ(ParseError("menu A\nmenu B\nend"), "line 2: menu inside a menu (missing \"end\"?)");
  EXPECT_EQ(ParseError("menu A B\nend"), "line 1: menu needs exactly one name");
  EXPECT_EQ(ParseError("menu A\n  separator \"x\"\nend"), "line 2: separator takes nothing");
  EXPECT_EQ(ParseError("menu A\n  item 1 \"a\"\"b\"\nend"),
            "line 2: a quoted text must be followed by a space");
}

TEST(MenuResources, ABadTextRegistersNothing) {
  ToolkitTestScope scope;
  MenuRegistry& registry = MenuRegistry::Instance();
  std::string error;
  EXPECT_FALSE(registry.RegisterFromText("menu Good\nend\nmenu Bad\n  oops\nend", &error));
  EXPECT_EQ(registry.Find("Good"), nullptr);
  EXPECT_TRUE(registry.RegisterFromText(kResources, &error));
  ASSERT_NE(registry.Find("HandlerEffectControls_Edit_Menu"), nullptr);
  EXPECT_EQ(registry.Find("HandlerEffectControls_Edit_Menu")->GetItems().size(), 4u);
}

TEST(MenuResources, RegisteringANameAgainReplacesTheMenu) {
  ToolkitTestScope scope;
  MenuRegistry& registry = MenuRegistry::Instance();
  ASSERT_TRUE(registry.RegisterFromText("menu M\n  item 1 \"One\"\nend"));
  ASSERT_TRUE(registry.Register(Menu("M").AddCommand(2, "Two")));
  EXPECT_EQ(registry.Find("M")->GetItems()[0].command, 2);
  EXPECT_FALSE(registry.Register(Menu()));
  EXPECT_TRUE(registry.Remove("M"));
  EXPECT_FALSE(registry.Remove("M"));
}

TEST(MenuResources, CommandNamesResolveThroughTheShortcutManager) {
  ToolkitTestScope scope;
  ShortcutManager shortcuts;
  MenuItem byName;
  byName.commandName = "cmd.edit.copy";
  EXPECT_EQ(Menu::ResolveCommand(byName, shortcuts), 57634);
  byName.commandName = "cmd.unknown";
  EXPECT_EQ(Menu::ResolveCommand(byName, shortcuts), std::nullopt);
  MenuItem separator;
  separator.kind = MenuItem::Kind::kSeparator;
  EXPECT_EQ(Menu::ResolveCommand(separator, shortcuts), std::nullopt);
}

}  // namespace
