#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Rows/MenuParameter.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/TextPopup.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

constexpr CommandID kItem = PopupControl::kPlainItemCommandBase;

class MenuParameterTest : public RowsTest {
 protected:
  MenuParameterTest() { SetMenuTracker(menus); }
  ~MenuParameterTest() override { SetMenuTracker(nullptr); }

  int ChoiceAt(TickTime sequenceTime) {
    return std::get<ParamChoice>(
               blend->GetValueAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks()))
        .index;
  }
  // Opens the row's popup with a click and answers with item `index` (nullopt: dismiss).
  void ChooseWithTheMouse(MenuParameter& row, std::optional<int> index) {
    menus->PushAnswer(index ? std::optional<CommandID>(kItem + *index) : std::nullopt);
    Click(row.GetPopup()->GetBounds().Center());
  }

  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  ComponentParamRef blend =
      AddParam(ComponentParam::Create("Blend Mode", ParamType::Menu, ParamChoice{0})
                   ->SetMenuEntries({"Normal", "Dissolve", "Darken", "Multiply"}));
};

TEST_F(MenuParameterTest, ThePopupListsTheParametersItemsAndShowsTheChoice) {
  blend->ApplyState(blend->MakeConstantState(ParamChoice{2}));
  auto row = MakeRow<MenuParameter>(blend, 40);
  TextPopup* popup = row->GetPopup();
  ASSERT_NE(popup, nullptr);
  ASSERT_EQ(popup->GetItemCount(), 4);
  EXPECT_EQ(popup->GetItem(3).text, "Multiply");
  EXPECT_EQ(popup->GetSelectedText(), "Darken");
  EXPECT_EQ(popup->GetBounds().top, 42);
  EXPECT_GE(popup->GetBounds().left, row->GetControlsLeft());
  EXPECT_LE(popup->GetBounds().right, kListWidth);
}

TEST_F(MenuParameterTest, ChoosingAnItemIsOneUndoableStep) {
  auto row = MakeRow<MenuParameter>(blend);
  ChooseWithTheMouse(*row, 2);
  EXPECT_EQ(ChoiceAt(12 * kSecond), 2);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_EQ(ChoiceAt(12 * kSecond), 0);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 0) << "the popup follows the undo";
  ASSERT_TRUE(Redo());
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 2);
}

TEST_F(MenuParameterTest, DismissingOrChoosingTheShownItemChangesNothing) {
  auto row = MakeRow<MenuParameter>(blend);
  ChooseWithTheMouse(*row, std::nullopt);
  ChooseWithTheMouse(*row, 0);
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_FALSE(row->ChooseItem(0));
}

TEST_F(MenuParameterTest, ArrowKeysStepTheChoiceOneUndoStepEach) {
  auto row = MakeRow<MenuParameter>(blend);
  ChooseWithTheMouse(*row, std::nullopt);  // focuses the popup
  host.KeyDown({KeyCode::kDown});
  host.KeyDown({KeyCode::kDown});
  EXPECT_EQ(ChoiceAt(12 * kSecond), 2);
  EXPECT_EQ(UndoNames().size(), 2u);
  host.KeyDown({KeyCode::kUp});
  EXPECT_EQ(ChoiceAt(12 * kSecond), 1);
}

TEST_F(MenuParameterTest, AReadOnlyRowRefusesEveryChoice) {
  ParameterControlInfo info = Info(blend);
  info.readOnly = true;
  auto row = std::make_shared<MenuParameter>(info);
  row->FinishCreateSelf();
  row->Show();
  row->PositionSelf(0, 0, kListWidth);
  EXPECT_FALSE(row->GetPopup()->IsEnabled());
  ChooseWithTheMouse(*row, 1);
  EXPECT_TRUE(menus->GetRequests().empty());
  EXPECT_FALSE(row->ChooseItem(1));
  EXPECT_EQ(ChoiceAt(12 * kSecond), 0);
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(MenuParameterTest, ALockedParameterRefusesAndThePopupShowsTheModel) {
  auto row = MakeRow<MenuParameter>(blend);
  blend->SetReadOnly(true);
  EXPECT_FALSE(row->GetPopup()->IsEnabled());
  // A choice that reaches the row all the same (sent before the lock) is refused.
  row->GetPopup()->SetSelectedIndex(3);
  row->ListenToMessage(PopupControlChangedMessage(3, kNoCommand, 0));
  EXPECT_EQ(ChoiceAt(12 * kSecond), 0);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 0);
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(MenuParameterTest, KeyframedChoicesHoldAndAChoiceAddsAKeyframeAtTheEditTime) {
  ComponentParamActions::AddKeyframe(blend, 6 * kSecond, ParamChoice{0});  // sequence 11 s
  ComponentParamActions::AddKeyframe(blend, 9 * kSecond, ParamChoice{3});  // sequence 14 s
  const std::size_t steps = UndoNames().size();
  auto row = MakeRow<MenuParameter>(blend);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 0) << "12 s: no blend towards item 3";
  SetEditTime(13 * kSecond + kSecond / 2, *row);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 0);
  SetEditTime(14 * kSecond, *row);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 3);

  SetEditTime(12 * kSecond, *row);
  ChooseWithTheMouse(*row, 0);
  EXPECT_EQ(blend->GetKeyframes().Size(), 2u) << "the shown item adds no keyframe";
  ChooseWithTheMouse(*row, 1);
  EXPECT_EQ(blend->GetKeyframes().Size(), 3u);
  EXPECT_EQ(ChoiceAt(12 * kSecond), 1);
  EXPECT_EQ(ChoiceAt(13 * kSecond + kSecond / 2), 1) << "holds until the next keyframe";
  EXPECT_EQ(ChoiceAt(11 * kSecond), 0);
  EXPECT_EQ(UndoNames().size(), steps + 1);
  ASSERT_TRUE(Undo());
  EXPECT_EQ(blend->GetKeyframes().Size(), 2u);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), 0);
}

TEST_F(MenuParameterTest, AChoiceOutsideTheMenuShowsNoItemAndIsNotWritten) {
  blend->ApplyState(
      blend->MakeConstantState(ParamChoice{9}));  // e.g. from a project of a newer effect version
  auto row = MakeRow<MenuParameter>(blend);
  EXPECT_EQ(row->GetPopup()->GetSelectedIndex(), -1);
  EXPECT_EQ(row->GetPopup()->GetSelectedText(), "");
  EXPECT_FALSE(row->ChooseItem(4));
  EXPECT_FALSE(row->ChooseItem(-1));
  ChooseWithTheMouse(*row, 1);
  EXPECT_EQ(ChoiceAt(12 * kSecond), 1) << "the user can still pick a valid item";
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(MenuParameterTest, TheStopwatchMakesTheChoiceVaryOverTime) {
  auto row = MakeRow<MenuParameter>(blend);
  ASSERT_TRUE(row->CanTimeVary());
  EXPECT_TRUE(row->ObeyCommand(ParameterControl::kToggleTimeVaryingCommand));
  EXPECT_TRUE(blend->IsTimeVarying());
  ChooseWithTheMouse(*row, 2);
  SetEditTime(18 * kSecond, *row);
  ChooseWithTheMouse(*row, 3);
  EXPECT_EQ(ChoiceAt(12 * kSecond), 2);
  EXPECT_EQ(ChoiceAt(17 * kSecond), 2);
  EXPECT_EQ(ChoiceAt(18 * kSecond), 3);
  auto fixed = AddParam(ComponentParam::Create("Mode", ParamType::Menu, ParamChoice{0})
                            ->SetMenuEntries({"A", "B"})
                            ->SetCanVaryOverTime(false));
  EXPECT_FALSE(MakeRow<MenuParameter>(fixed)->CanTimeVary());
}

}  // namespace
