#include <gtest/gtest.h>

#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class HotFloatControlTest : public ControlTest {
 protected:
  HotFloatControlTest() {
    field = Add(std::make_shared<HotFloatControl>(kBounds, 10.0));
    field->SetOwnerCookie(150);
    field->SetMinValue(0.0);
    field->SetMaxValue(100.0);
    field->SetValueIncrement(0.1);
    field->SetDigitsPastDecimal(1);
    recorder.ListenTo(field->GetStation());
  }

  void TypeAndPress(std::string_view text, KeyCode key) {
    Click({60, 30});
    ASSERT_TRUE(field->IsEditing());
    Type(text);
    Key(key);
  }

  static constexpr Rect kBounds{40, 20, 100, 38};
  std::shared_ptr<HotFloatControl> field;
};

// --- Scrubbing ---

TEST_F(HotFloatControlTest, DraggingReportsEachNewValueThenTheFinalOneWithTheCookie) {
  Drag({50, 30}, {70, 30}, 4);
  EXPECT_EQ(recorder.lines, (Lines{"HotFloatChanging 10.5 #150", "HotFloatChanging 11 #150",
                                   "HotFloatChanging 11.5 #150", "HotFloatChanging 12 #150",
                                   "HotFloatChanged 12 #150"}));
  EXPECT_DOUBLE_EQ(field->GetValue(), 12.0);
  EXPECT_FALSE(field->IsEditing()) << "a drag is no click";
}

TEST_F(HotFloatControlTest, MovesBelowTheThresholdDoNotScrub) {
  Press({50, 30});
  Move({52, 31});
  EXPECT_FALSE(field->IsScrubbing());
  Release({52, 31});
  EXPECT_TRUE(recorder.lines.empty());
  EXPECT_TRUE(field->IsEditing()) << "it was a click";
}

TEST_F(HotFloatControlTest, ShiftScrubsCoarselyAndCtrlFinely) {
  Drag({50, 30}, {60, 30}, 1, kKeyModifierShift);
  EXPECT_DOUBLE_EQ(field->GetValue(), 20.0);
  Drag({50, 30}, {60, 30}, 1, kKeyModifierCtrl);
  EXPECT_DOUBLE_EQ(field->GetValue(), 20.1);
}

TEST_F(HotFloatControlTest, ChangingTheModifierMidDragDoesNotJump) {
  Press({50, 30});
  Move({60, 30});  // +1.0
  EXPECT_DOUBLE_EQ(field->GetValue(), 11.0);
  Move({62, 30}, kKeyModifierShift);  // +2 px at x10: +2.0
  EXPECT_DOUBLE_EQ(field->GetValue(), 13.0);
  Release({62, 30});
}

TEST_F(HotFloatControlTest, ScrubbingStopsAtTheLimitsAndReportsNoRepeats) {
  Drag({50, 30}, {300, 30}, 5, kKeyModifierShift);
  EXPECT_DOUBLE_EQ(field->GetValue(), 100.0);
  EXPECT_EQ(recorder.lines.back(), "HotFloatChanged 100 #150");
  int atMaximum = 0;
  for (const std::string& line : recorder.lines) {
    atMaximum += line == "HotFloatChanging 100 #150" ? 1 : 0;
  }
  EXPECT_EQ(atMaximum, 1);
  recorder.Clear();
  Drag({50, 30}, {-250, 30}, 3, kKeyModifierShift);
  EXPECT_DOUBLE_EQ(field->GetValue(), 0.0);
}

TEST_F(HotFloatControlTest, ADragThatEndsWhereItBeganStillFinishesTheChange) {
  Press({50, 30});
  Move({60, 30});
  Move({50, 30});
  Release({50, 30});
  EXPECT_EQ(recorder.lines.back(), "HotFloatChanged 10 #150");
}

TEST_F(HotFloatControlTest, ExponentialScrubTakesFineStepsNearTheMinimum) {
  field->SetValue(0.0);
  field->SetValueIncrement(1.0);
  field->SetExponential(true, 2.0);
  Drag({50, 30}, {60, 30}, 1);  // position 0.1 of the range: 100 x 0.1^2
  EXPECT_DOUBLE_EQ(field->GetValue(), 1.0);
  Drag({50, 30}, {60, 30}, 1);  // position 0.2: 4
  EXPECT_DOUBLE_EQ(field->GetValue(), 4.0);
}

// --- Typing ---

TEST_F(HotFloatControlTest, TypingANumberAndEnterReportsOneChange) {
  TypeAndPress("42.5", KeyCode::kReturn);
  EXPECT_FALSE(field->IsEditing());
  EXPECT_DOUBLE_EQ(field->GetValue(), 42.5);
  EXPECT_EQ(recorder.lines, Lines{"HotFloatChanged 42.5 #150"});
}

TEST_F(HotFloatControlTest, EscapeLeavesTheValue) {
  TypeAndPress("42", KeyCode::kEscape);
  EXPECT_FALSE(field->IsEditing());
  EXPECT_DOUBLE_EQ(field->GetValue(), 10.0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, BadTextIsRejectedAndTheValueKept) {
  for (const char* bad : {"abc", "1.2.3", "--4", "1e3", "inf", "nan", "", "  ", "4 5", "0x10"}) {
    TypeAndPress(bad, KeyCode::kReturn);
    EXPECT_DOUBLE_EQ(field->GetValue(), 10.0) << bad;
  }
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, TypedValuesAreClampedAndRoundedToTheDigitsShown) {
  TypeAndPress("250", KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), 100.0);
  TypeAndPress("-3", KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), 0.0);
  TypeAndPress("12.345", KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), 12.3);
  EXPECT_EQ(recorder.lines, (Lines{"HotFloatChanged 100 #150", "HotFloatChanged 0 #150",
                                   "HotFloatChanged 12.3 #150"}));
}

TEST_F(HotFloatControlTest, TheSameValueTypedAgainReportsNothing) {
  TypeAndPress("10.0", KeyCode::kReturn);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, CommaSignAndSymbolAreUnderstood) {
  field->SetAppendedSymbol("%");
  EXPECT_EQ(field->ParseText(" 12,5 "), 12.5);
  EXPECT_EQ(field->ParseText("+12.5%"), 12.5);
  EXPECT_EQ(field->ParseText("12.5 %"), 12.5);
  EXPECT_EQ(field->ParseText("%"), std::nullopt);
  EXPECT_EQ(field->ParseText(".5"), 0.5);
  EXPECT_EQ(field->ParseText("."), std::nullopt);
}

TEST_F(HotFloatControlTest, EditingKeysWorkOnTheTypedText) {
  Click({60, 30});
  ASSERT_TRUE(field->IsEditing());
  EXPECT_EQ(field->GetEditBuffer().GetText(), "10.0");
  Type("123");  // replaces the selected text
  Key(KeyCode::kLeft);
  Key(KeyCode::kBackspace);  // "13"
  Key(KeyCode::kHome);
  Type("4");  // "413"
  Key(KeyCode::kEnd);
  Key(KeyCode::kBackspace);  // "41"
  EXPECT_EQ(field->GetEditBuffer().GetText(), "41");
  Key(KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), 41.0);
}

TEST_F(HotFloatControlTest, KeysWhileTypingDoNotReachShortcuts) {
  root->keys.insert(KeyCode::kDelete);
  Click({60, 30});
  log->Clear();
  Key(KeyCode::kDelete);
  EXPECT_TRUE(log->lines.empty());
}

TEST_F(HotFloatControlTest, LosingTheFocusAppliesTheTypedTextWhenIdle) {
  auto other = Add(std::make_shared<HotFloatControl>(Rect::FromSize(150, 20, 60, 18)));
  Click({60, 30});
  Type("55");
  Click({170, 30});  // typing starts in the other field
  EXPECT_TRUE(recorder.lines.empty());
  MessageLoop::Instance().RunPending();
  EXPECT_DOUBLE_EQ(field->GetValue(), 55.0);
  EXPECT_EQ(recorder.lines, Lines{"HotFloatChanged 55 #150"});
}

TEST_F(HotFloatControlTest, AFieldDestroyedWhileTypingAppliesTheTextAtOnce) {
  // Regression: the text waited for an idle turn that found the field destroyed, and was lost.
  Click({60, 30});
  Type("42");
  field->Destroy();
  EXPECT_EQ(recorder.lines, Lines{"HotFloatChanged 42 #150"});
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(recorder.lines.size(), 1u) << "the focus change applies nothing twice";
}

TEST_F(HotFloatControlTest, EscapeIsTheOnlyWayTypedTextIsDropped) {
  TypeAndPress("42", KeyCode::kEscape);
  field->CommitPendingInput();
  field->Destroy();
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, CommitPendingInputAppliesTypedTextOnce) {
  Click({60, 30});
  Type("7");
  field->CommitPendingInput();
  field->CommitPendingInput();
  EXPECT_FALSE(field->IsEditing());
  EXPECT_EQ(recorder.lines, Lines{"HotFloatChanged 7 #150"});
}

TEST_F(HotFloatControlTest, TypingIntoAFocusedFieldStartsEditing) {
  Click({60, 30});
  Key(KeyCode::kReturn);
  Type("7");
  EXPECT_TRUE(field->IsEditing());
  EXPECT_EQ(field->GetEditBuffer().GetText(), "7");
}

TEST_F(HotFloatControlTest, UpAndDownStepTheFocusedValue) {
  Click({60, 30});
  Key(KeyCode::kEscape);
  Key(KeyCode::kUp);
  Key(KeyCode::kDown, kKeyModifierShift);
  EXPECT_EQ(recorder.lines, (Lines{"HotFloatChanged 10.1 #150", "HotFloatChanged 9.1 #150"}));
}

// --- Display ---

TEST_F(HotFloatControlTest, TheMinimumStringShowsAtTheMinimumAndTypesAsIt) {
  field->SetMinValue(-96.0);
  field->SetMinimumValueString("-\u221E");
  field->SetAppendedSymbol(" dB");
  EXPECT_EQ(field->GetDisplayText(), "10.0 dB");
  field->SetValue(-200.0);
  EXPECT_EQ(field->GetDisplayText(), "-\u221E");
  field->SetValue(5.0);
  TypeAndPress("-\u221E", KeyCode::kReturn);
  EXPECT_DOUBLE_EQ(field->GetValue(), -96.0);
}

TEST_F(HotFloatControlTest, DigitsAndSymbolShapeTheText) {
  field->SetDigitsPastDecimal(0);
  field->SetAppendedSymbol("\u00B0");
  field->SetValue(-0.2);
  EXPECT_EQ(field->GetDisplayText(), "0\u00B0") << "no negative zero";
  field->SetValue(45.6);
  EXPECT_EQ(field->GetDisplayText(), "46\u00B0");
}

TEST_F(HotFloatControlTest, SettingTheValueFromCodeSendsNothingAndIsClamped) {
  field->SetValue(500.0);
  EXPECT_DOUBLE_EQ(field->GetValue(), 100.0);
  ClearRecordedDebugAssertions();
  field->SetValue(std::nan(""));
  EXPECT_DOUBLE_EQ(field->GetValue(), 100.0);
  EXPECT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, ADisabledFieldIgnoresDragsClicksAndTyping) {
  field->Disable();
  Drag({50, 30}, {90, 30});
  Click({60, 30});
  Type("5");
  EXPECT_FALSE(field->IsEditing());
  EXPECT_FALSE(field->BeginEditing());
  EXPECT_DOUBLE_EQ(field->GetValue(), 10.0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotFloatControlTest, PaintsInsideItsBoundsWhetherShownOrTyped) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  Click({60, 30});
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

TEST_F(HotFloatControlTest, TheHotTextUsesTheAccentColour) {
  host.InvalidateAll();
  host.Render();
  const Color accent = ColorManager::GetColor(kColor_HotText);
  int accentPixels = 0;
  for (int y = kBounds.top; y < kBounds.bottom; ++y) {
    for (int x = kBounds.left; x < kBounds.right; ++x) {
      accentPixels += host.GetImage().GetPixel(x, y) == accent ? 1 : 0;
    }
  }
  EXPECT_GT(accentPixels, 5);
}

}  // namespace
