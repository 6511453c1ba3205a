#include <gtest/gtest.h>

#include "Host/Toolkit/Events.h"

namespace {

TEST(KeyNames, NamesAndCodesRoundTrip) {
  for (KeyCode key : {KeyCode::kA, KeyCode::kZ, KeyCode::k0, KeyCode::k9, KeyCode::kDelete,
                      KeyCode::kBackspace, KeyCode::kReturn, KeyCode::kEscape, KeyCode::kPageDown,
                      KeyCode::kF12, KeyCode::kMinus, KeyCode::kBracketRight, KeyCode::kSpace}) {
    const std::string_view name = KeyCodeName(key);
    ASSERT_FALSE(name.empty());
    EXPECT_EQ(KeyCodeFromName(name), key) << name;
  }
}

TEST(KeyNames, AreReadIgnoringCaseAndWithTheirShortForms) {
  EXPECT_EQ(KeyCodeFromName("a"), KeyCode::kA);
  EXPECT_EQ(KeyCodeFromName("DEL"), KeyCode::kDelete);
  EXPECT_EQ(KeyCodeFromName("enter"), KeyCode::kReturn);
  EXPECT_EQ(KeyCodeFromName("esc"), KeyCode::kEscape);
  EXPECT_EQ(KeyCodeFromName("pageup"), KeyCode::kPageUp);
  EXPECT_EQ(KeyCodeFromName(""), std::nullopt);
  EXPECT_EQ(KeyCodeFromName("ctrl"), std::nullopt);
  EXPECT_EQ(KeyCodeFromName("F13"), std::nullopt);
  EXPECT_EQ(KeyCodeFromName("\xC3\xA9"), std::nullopt);
  EXPECT_TRUE(KeyCodeName(static_cast<KeyCode>(0x7fff)).empty());
}

TEST(KeyStrokes, PrintModifiersInAFixedOrderAndParseInAnyOrder) {
  const KeyStroke redo(KeyCode::kZ, kKeyModifierShift | kKeyModifierCtrl);
  EXPECT_EQ(redo.ToString(), "Ctrl+Shift+Z");
  EXPECT_EQ(KeyStroke::Parse("shift+ctrl+z"), redo);
  EXPECT_EQ(KeyStroke::Parse("Ctrl+Alt+Shift+F5")->modifiers,
            kKeyModifierCtrl | kKeyModifierAlt | kKeyModifierShift);
  EXPECT_EQ(KeyStroke::Parse("Ctrl+="), KeyStroke(KeyCode::kEquals, kKeyModifierCtrl));
  EXPECT_EQ(KeyStroke::Parse("Delete"), KeyStroke(KeyCode::kDelete));
  EXPECT_EQ(KeyStroke::Parse("Hyper+A"), std::nullopt);
  EXPECT_EQ(KeyStroke::Parse("Ctrl+"), std::nullopt);
  EXPECT_EQ(KeyStroke::Parse("Ctrl+Nope"), std::nullopt);
}

TEST(KeyStrokes, KeepOnlyTheKnownModifierBits) {
  EXPECT_EQ(KeyStroke(KeyCode::kA, 0xffffffffu).modifiers, kKeyModifierMask);
}

}  // namespace
