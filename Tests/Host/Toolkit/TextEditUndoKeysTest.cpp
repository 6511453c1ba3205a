// Undo and redo keys pressed while a field is being typed in.
#include <gtest/gtest.h>

#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/TextEditBuffer.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class TextEditUndoKeysTest : public ControlTest {
 protected:
  TextEditUndoKeysTest() {
    field = Add(std::make_shared<HotFloatControl>(kBounds, 10.0));
    field->SetMinValue(0.0);
    field->SetMaxValue(100.0);
    field->SetDigitsPastDecimal(1);
    recorder.ListenTo(field->GetStation());
    // The root takes these keys: they stand for the application's undo and redo shortcuts.
    root->keys.insert({KeyCode::kZ, KeyCode::kY});
  }

  static constexpr Rect kBounds{40, 20, 100, 38};
  std::shared_ptr<HotFloatControl> field;
};

}  // namespace

TEST_F(TextEditUndoKeysTest, CtrlZWhileTypingBringsBackTheFieldsTextAndNotAnEarlierEdit) {
  Click({60, 30});
  ASSERT_TRUE(field->IsEditing());
  Type("55");
  log->Clear();
  Key(KeyCode::kZ, kKeyModifierCtrl);
  EXPECT_TRUE(log->lines.empty()) << "the undo shortcut must not run while the field is typed in";
  EXPECT_TRUE(field->IsEditing());
  EXPECT_EQ(field->GetEditBuffer().GetText(), "10.0");
  Type("42");  // the restored text is selected: typing replaces it
  Key(KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), 42.0);
}

TEST_F(TextEditUndoKeysTest, RedoKeysWhileTypingChangeNothing) {
  Click({60, 30});
  Type("55");
  log->Clear();
  Key(KeyCode::kZ, kKeyModifierCtrl | kKeyModifierShift);
  Key(KeyCode::kY, kKeyModifierCtrl);
  EXPECT_TRUE(log->lines.empty());
  EXPECT_EQ(field->GetEditBuffer().GetText(), "55");
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(TextEditUndoKeysTest, PlainZAndYAreTypedAsText) {
  TextEditBuffer buffer;
  buffer.Reset("ab");
  EXPECT_FALSE(buffer.HandleKey(KeyEvent{KeyCode::kZ, kKeyModifierNone, false}));
  EXPECT_FALSE(buffer.HandleKey(KeyEvent{KeyCode::kY, kKeyModifierShift, false}));
  EXPECT_EQ(buffer.GetText(), "ab");
}

TEST_F(TextEditUndoKeysTest, OutsideTypingTheUndoShortcutGoesOn) {
  Click({60, 30});
  Key(KeyCode::kEscape);
  ASSERT_FALSE(field->IsEditing());
  log->Clear();
  Key(KeyCode::kZ, kKeyModifierCtrl);
  EXPECT_FALSE(log->lines.empty()) << "a field that is not typed in leaves undo to the application";
}
