#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/MessageLoop.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Rows/CheckboxParameter.h"
#include "Host/Rows/DoubleSliderLimiter.h"
#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/InfoParameter.h"
#include "Host/Rows/SpreadsheetParameter.h"
#include "Host/Rows/TextParameter.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/Static.h"
#include "Host/Toolkit/TextButton.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

class SimpleRowsTest : public RowsTest {
 protected:
  SimpleRowsTest() { InputBox::SetResponder(answers); }
  ~SimpleRowsTest() override { InputBox::SetResponder(nullptr); }

  std::shared_ptr<ScriptedInputBox> answers = std::make_shared<ScriptedInputBox>();
};

// --- Check box ---

TEST_F(SimpleRowsTest, ACheckBoxClickSetsTheValueAsOneUndoableStep) {
  auto invert = AddParam(ComponentParam::Create("Invert", ParamType::Checkbox, false));
  auto row = MakeRow<CheckboxParameter>(invert, 30);
  CheckBoxControl* box = row->GetCheckBox();
  ASSERT_NE(box, nullptr);
  EXPECT_FALSE(box->IsChecked());
  Click(box->GetBounds().Center());
  EXPECT_EQ(invert->GetValueAt(0), ParamValue(true));
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_EQ(invert->GetValueAt(0), ParamValue(false));
  EXPECT_FALSE(box->IsChecked());  // follows the model
}

TEST_F(SimpleRowsTest, AClickOnAReadOnlyCheckBoxRowChangesNothing) {
  auto invert = AddParam(ComponentParam::Create("Invert", ParamType::Checkbox, false));
  ParameterControlInfo info = Info(invert);
  info.readOnly = true;
  auto row = std::make_shared<CheckboxParameter>(info);
  row->FinishCreateSelf();
  row->Show();
  row->PositionSelf(0, 0, kListWidth);
  EXPECT_FALSE(row->GetCheckBox()->IsEnabled());
  Click(row->GetCheckBox()->GetBounds().Center());
  EXPECT_EQ(invert->GetValueAt(0), ParamValue(false));
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(SimpleRowsTest, ACheckBoxShowsTheKeyframedValueAtTheEditTime) {
  auto invert = AddParam(ComponentParam::Create("Invert", ParamType::Checkbox, false));
  ComponentParamActions::AddKeyframe(invert, 6 * kSecond, true);   // sequence 11 s
  ComponentParamActions::AddKeyframe(invert, 9 * kSecond, false);  // sequence 14 s
  auto row = MakeRow<CheckboxParameter>(invert);
  EXPECT_TRUE(row->GetCheckBox()->IsChecked());  // 12 s
  SetEditTime(15 * kSecond, *row);
  EXPECT_FALSE(row->GetCheckBox()->IsChecked());
}

// --- Text and information ---

TEST_F(SimpleRowsTest, TypingANewTextSetsItAsOneUndoableStep) {
  auto title = AddParam(ComponentParam::Create("Title", ParamType::Text, std::string("Hello")));
  auto row = MakeRow<TextParameter>(title);
  ASSERT_EQ(row->GetButton()->GetLabel(), "Hello");
  answers->PushAnswer("World");
  Click(row->GetButton()->GetBounds().Center());
  EXPECT_EQ(title->GetValueAt(0), ParamValue(std::string("World")));
  EXPECT_EQ(row->GetButton()->GetLabel(), "World");
  ASSERT_EQ(answers->GetRequests().size(), 1u);
  EXPECT_EQ(answers->GetRequests()[0].initialText, "Hello");
  ASSERT_TRUE(Undo());
  EXPECT_EQ(row->GetButton()->GetLabel(), "Hello");
}

TEST_F(SimpleRowsTest, ACancelledOrUnchangedTextMakesNoUndoStep) {
  auto title = AddParam(ComponentParam::Create("Title", ParamType::Text, std::string("Hello")));
  auto row = MakeRow<TextParameter>(title);
  answers->PushAnswer(std::nullopt);
  Click(row->GetButton()->GetBounds().Center());
  answers->PushAnswer("Hello");
  Click(row->GetButton()->GetBounds().Center());
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(SimpleRowsTest, ALockedTextRowAsksNothing) {
  auto title = AddParam(ComponentParam::Create("Title", ParamType::Text, std::string("Hello")));
  auto row = std::make_shared<TextParameter>(Info(title), false);
  row->FinishCreateSelf();
  row->Show();
  answers->PushAnswer("World");
  EXPECT_TRUE(row->ObeyCommand(TextParameter::kEditTextCommand));
  EXPECT_TRUE(answers->GetRequests().empty());
  EXPECT_EQ(title->GetValueAt(0), ParamValue(std::string("Hello")));
}

TEST_F(SimpleRowsTest, AnInfoRowShowsItsValueAndHasNoStopwatch) {
  auto info = AddParam(ComponentParam::Create("Info", ParamType::Info, std::string("v1.2")));
  auto row = MakeRow<InfoParameter>(info);
  EXPECT_EQ(row->GetLabel()->GetText(), "v1.2");
  EXPECT_FALSE(row->CanTimeVary());
  info->ApplyState(info->MakeConstantState(std::string("v2")));
  EXPECT_EQ(row->GetLabel()->GetText(), "v2");
}

// --- Table ---

TEST_F(SimpleRowsTest, ATableRoundTripsThroughItsText) {
  const std::string text = "a\tb\nc\t\td";
  const auto table = SpreadsheetParameter::ParseTable(text);
  ASSERT_EQ(table.size(), 2u);
  EXPECT_EQ(table[1], (std::vector<std::string>{"c", "", "d"}));
  EXPECT_EQ(SpreadsheetParameter::FormatTable(table), text);
  EXPECT_TRUE(SpreadsheetParameter::ParseTable("").empty());
  EXPECT_EQ(SpreadsheetParameter::ParseRow(" x |y| "), (std::vector<std::string>{"x", "y", ""}));
}

TEST_F(SimpleRowsTest, ExpandingATableShowsItsRowsAndEditingOneIsUndoable) {
  auto grid =
      AddParam(ComponentParam::Create("Grid", ParamType::Spreadsheet, std::string("1\t2\n3\t4")));
  auto row = MakeRow<SpreadsheetParameter>(grid);
  EXPECT_EQ(row->GetSummary()->GetText(), "2 rows");
  ASSERT_EQ(row->GetRowButtons().size(), 2u);
  EXPECT_FALSE(row->GetRowButtons()[0]->IsVisible());
  EXPECT_EQ(row->Height(), 20);
  row->SetIsExpanded(true);
  row->PositionSelf(0, 0, kListWidth);
  EXPECT_TRUE(row->GetRowButtons()[1]->IsVisible());
  EXPECT_EQ(row->Height(), 20 + 2 * 18 + 4);
  EXPECT_EQ(row->GetRowButtons()[1]->GetLabel(), "3 | 4");

  answers->PushAnswer("5 | 6 | 7");
  Click(row->GetRowButtons()[1]->GetBounds().Center());
  EXPECT_EQ(grid->GetValueAt(0), ParamValue(std::string("1\t2\n5\t6\t7")));
  EXPECT_EQ(row->GetRowButtons()[1]->GetLabel(), "5 | 6 | 7");
  ASSERT_TRUE(Undo());
  EXPECT_EQ(row->GetRowButtons()[1]->GetLabel(), "3 | 4");
}

// --- Groups ---

TEST_F(SimpleRowsTest, AGroupRemembersItsExpansionInTheComponent) {
  auto begin = AddParam(ComponentParam::Create("Shadows", ParamType::GroupBegin, 0.0));
  auto member = AddParam(ComponentParam::Create("Amount", ParamType::FloatSlider, 1.0));
  auto group = MakeRow<GroupBeginParameter>(begin);
  auto child = std::make_shared<CheckboxParameter>(Info(member));
  group->AddItem(child);
  EXPECT_FALSE(group->IsExpanded());  // groups start closed
  EXPECT_FALSE(child->IsShown());
  EXPECT_FALSE(group->CanTimeVary());
  group->SetIsExpanded(true);
  EXPECT_TRUE(child->IsShown());
  EXPECT_TRUE(effect->GetExpansionProperties().GetBool(group->GetExpandedPropertyKey(), false));
  // A row made later for the same group opens as it was left.
  GroupBeginParameter again(Info(begin));
  EXPECT_TRUE(again.IsExpanded());
}

TEST_F(SimpleRowsTest, AReadOnlyExpansionPropertyIsNotOverwrittenAndAWarningIsPosted) {
  auto begin = AddParam(ComponentParam::Create("Shadows", ParamType::GroupBegin, 0.0));
  auto group = MakeRow<GroupBeginParameter>(begin);
  PropertyList& properties = effect->GetExpansionProperties();
  properties.SetStation("Test.Properties");
  properties.SetReadOnly(group->GetExpandedPropertyKey(), true);
  group->SetIsExpanded(true);
  EXPECT_TRUE(group->IsExpanded());
  EXPECT_FALSE(properties.GetBool(group->GetExpandedPropertyKey(), false));
  EXPECT_TRUE(MessageLoop::Instance().HasPending());
}

TEST_F(SimpleRowsTest, ACountedGroupSpansAsManyParametersAsItsTextHasSemicolons) {
  auto counted = ComponentParam::Create("Set", ParamType::GroupBegin, std::string("a;b;c;"));
  EXPECT_EQ(counted->CountGroupEntries(), 3u);
  // Wide text: ";" is the code unit 0x003B, low byte first.
  ParamBlob wide{{'x', 0, ';', 0, 0x3B, 0x01, ';', 0, ';'}};
  auto binary = ComponentParam::Create("Bin", ParamType::GroupBegin, wide);
  EXPECT_EQ(binary->CountGroupEntries(), 2u);
}

TEST_F(SimpleRowsTest, AGroupCollectsTheKeyframesOfItsChildren) {
  auto begin = AddParam(ComponentParam::Create("G", ParamType::GroupBegin, 0.0));
  auto member = AddParam(ComponentParam::Create("Flag", ParamType::Checkbox, false));
  ComponentParamActions::AddKeyframe(member, 6 * kSecond, true);
  auto group = MakeRow<GroupBeginParameter>(begin);
  group->AddItem(std::make_shared<CheckboxParameter>(Info(member)));
  std::set<TickTime> times;
  group->GetKeyframeTimes(times, TimeLine::kSequence);
  EXPECT_EQ(times, (std::set<TickTime>{11 * kSecond}));
}

// --- Limiters ---

class RangeLimiter : public DoubleSliderLimiter {
 public:
  std::optional<Bounds> GetBounds(int handleID) const override {
    if (handleID == 1) {
      return Bounds{10.0f, 20.0f};
    }
    if (handleID == 2) {
      return Bounds{30.0f, 25.0f};  // crossed bounds
    }
    return std::nullopt;
  }
};

TEST(DoubleSliderLimiter, ClampsToTheHandlesBoundsAndSaysSo) {
  RangeLimiter limiter;
  bool clamped = true;
  EXPECT_FLOAT_EQ(limiter.Limit(1, 15.0f, clamped), 15.0f);
  EXPECT_FALSE(clamped);
  EXPECT_FLOAT_EQ(limiter.Limit(1, 5.0f, clamped), 10.0f);
  EXPECT_TRUE(clamped);
  EXPECT_FLOAT_EQ(limiter.Limit(1, 25.0f, clamped), 20.0f);
  EXPECT_TRUE(clamped);
  EXPECT_FLOAT_EQ(limiter.Limit(1, 20.0f, clamped), 20.0f);  // a bound itself is inside
  EXPECT_FALSE(clamped);
  EXPECT_FLOAT_EQ(limiter.Limit(2, 27.0f, clamped), 30.0f);  // the lower bound wins
  EXPECT_TRUE(clamped);
  EXPECT_FLOAT_EQ(limiter.Limit(9, -1.0f, clamped), -1.0f);  // unknown handle
  EXPECT_FALSE(clamped);
}

// Crossed bounds (L 30 > U 25): the lower bound is tested first, so it wins only below it; at
// or above it the upper bound applies, and nothing passes unchanged.
TEST(DoubleSliderLimiter, WithCrossedBoundsAValueNotBelowTheLowerBecomesTheUpper) {
  RangeLimiter limiter;
  bool clamped = false;
  EXPECT_FLOAT_EQ(limiter.Limit(2, 30.0f, clamped), 25.0f);
  EXPECT_TRUE(clamped);
  clamped = false;
  EXPECT_FLOAT_EQ(limiter.Limit(2, 40.0f, clamped), 25.0f);
  EXPECT_TRUE(clamped);
  clamped = false;
  EXPECT_FLOAT_EQ(limiter.Limit(2, 29.0f, clamped), 30.0f);
  EXPECT_TRUE(clamped);
}

}  // namespace
