#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/GroupLevelsBeginParameter.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/LevelsControl.h"
#include "Host/Toolkit/Static.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

using Level = GroupLevelsBeginParameter::Level;

class LevelsGroupTest : public ListViewTest {
 protected:
  struct Setup {
    int width = 455;
    bool inputRowsVisible = false;
  };
  void Show(Setup setup) {
    levels = Make(kMatchName_Levels);
    if (setup.inputRowsVisible) {
      for (const char* name : {"Input Black Level", "Input Gray Level", "Input White Level"}) {
        levels->FindParam(name)->SetVisible(true);
      }
    }
    clip = AddClip(v1, {levels});
    Open({setup.width, 1200});
    Select({clip});
    for (const auto& effect : list->GetVideoItems()) {
      for (const auto& child : effect->GetItems()) {
        if (auto found = std::dynamic_pointer_cast<GroupLevelsBeginParameter>(child)) {
          group = found;
        }
      }
    }
    ASSERT_NE(group, nullptr);
  }
  void Expand() {
    group->SetIsExpanded(true);
    list->PositionItems();
    host->Render();
  }
  double Value(const char* name) const { return *levels->FindParam(name)->GetScalarAt(0); }
  UndoStack& Undo() const { return project->GetUndoStack(); }
  static Point At(const LevelsControl& control, double level) {
    return {control.GetBounds().left + control.LevelToLocal(level),
            control.GetBounds().top + LevelsControl::kRampHeight + 3};
  }
  void Drag(Point from, Point to) {
    host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
    host->MouseMove({(from.x + to.x) / 2, from.y}, kKeyModifierNone);
    host->MouseMove(to, kKeyModifierNone);
    host->MouseUp(MouseButton::kLeft, to, kKeyModifierNone);
  }
  void TypeInto(HotFloatControl& field, const std::string& text) {
    const Point at = field.GetBounds().Center();
    host->MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
    host->MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
    ASSERT_TRUE(field.IsEditing());
    host->TextInput(text);
    host->KeyDown({KeyCode::kReturn});
  }

  ComponentRef levels;
  TrackItemRef clip;
  std::shared_ptr<GroupLevelsBeginParameter> group;
};

TEST_F(LevelsGroupTest, WithoutVisibleChildrenTheGroupIs81HighWithItsControlsFromTheTop) {
  Show({});
  EXPECT_FALSE(group->IsExpanded()) << "groups start collapsed";
  EXPECT_EQ(group->Height(), group->OwnHeight());
  EXPECT_FALSE(group->GetInputLevelsControl()->IsVisible());

  group->SetIsExpanded(true);
  group->PositionSelf(100, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  EXPECT_EQ(group->Height(), 81);
  EXPECT_EQ(group->GetInputLabel()->GetBounds(), Rect::FromSize(i + 20, 103, 120, 16));
  EXPECT_EQ(group->GetField(Level::kInputBlack)->GetBounds(),
            Rect::FromSize(455 / 2 - 10 + i, 103, 35, 15));
  EXPECT_EQ(group->GetField(Level::kInputWhite)->GetBounds().left, 455 / 2 - 10 + i + 80);
  EXPECT_EQ(group->GetInputLevelsControl()->GetBounds(),
            Rect::FromSize(i + 15, 122, 455 - 20 - i, 18));
  EXPECT_EQ(group->GetOutputLabel()->GetBounds().top, 143);
  EXPECT_EQ(group->GetField(Level::kOutputWhite)->GetBounds(),
            Rect::FromSize(455 / 2 - 10 + i + 40, 143, 35, 15));
  EXPECT_LE(group->GetOutputLevelsControl()->GetBounds().bottom, 100 + 81);
  EXPECT_TRUE(group->GetInputLevelsControl()->IsVisible());
  EXPECT_EQ(group->GetInputLabel()->GetText(), "Input Levels:");
}

TEST_F(LevelsGroupTest, VisibleInputRowsComeFirstAndTheControlsBelowThem) {
  Show({.inputRowsVisible = true});
  group->SetIsExpanded(true);
  group->PositionSelf(40, 1, 455);
  const auto& children = group->GetItems();
  const int rows = children[0]->Height() + children[1]->Height() + children[2]->Height();
  EXPECT_EQ(children[0]->GetTop(), 40);
  EXPECT_EQ(children[1]->GetTop(), 40 + children[0]->Height());
  EXPECT_EQ(group->GetInputLabel()->GetBounds().top, 40 + rows + 3);
  EXPECT_EQ(group->GetInputLevelsControl()->GetBounds().top, 40 + rows + 22);
  EXPECT_EQ(group->Height(), 81 + rows);
}

TEST_F(LevelsGroupTest, DivergingChildrenAreHiddenAndNotCounted) {
  Show({.inputRowsVisible = true});
  Expand();
  ASSERT_FALSE(group->HasDivergentGroupChildren());
  EXPECT_TRUE(group->GetItems()[0]->IsShown());
  // A black input level above the gray one is something the control cannot show.
  ASSERT_TRUE(levels->FindParam("Input Black Level")->SetValueAt(0, ParamValue(200.0)));
  EXPECT_TRUE(group->HasDivergentGroupChildren());
  EXPECT_EQ(group->Height(), 81);
  EXPECT_FALSE(group->GetItems()[0]->IsShown());
  EXPECT_EQ(group->GetField(Level::kInputBlack)->GetValue(), 200.0) << "the field tells the truth";
  group->PositionSelf(40, 1, 455);
  EXPECT_EQ(group->GetInputLabel()->GetBounds().top, 43);

  ASSERT_TRUE(levels->FindParam("Input Black Level")->SetValueAt(0, ParamValue(10.0)));
  EXPECT_FALSE(group->HasDivergentGroupChildren());
  EXPECT_TRUE(group->GetItems()[0]->IsShown());
  EXPECT_GT(group->Height(), 81);
}

TEST_F(LevelsGroupTest, AHandleDragIsOneStepAndUndoRestoresIt) {
  Show({});
  Expand();
  const LevelsControl& input = *group->GetInputLevelsControl();
  ASSERT_GT(input.GetBounds().Width(), 100);
  const std::size_t steps = Undo().GetUndoNames().size();
  Drag(At(input, 255), At(input, 180));
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  EXPECT_LT(Value("Input White Level"), 200.0);
  EXPECT_DOUBLE_EQ(Value("Input Gray Level"), 128.0) << "only the dragged level changes";
  EXPECT_EQ(group->GetField(Level::kInputWhite)->GetValue(), Value("Input White Level"));
  ASSERT_TRUE(Undo().Undo());
  EXPECT_DOUBLE_EQ(Value("Input White Level"), 255.0);
  EXPECT_DOUBLE_EQ(input.GetWhiteLevel(), 255.0) << "the control follows the undo";
}

TEST_F(LevelsGroupTest, AnOutputDragWritesTheOutputLevel) {
  Show({});
  Expand();
  const LevelsControl& output = *group->GetOutputLevelsControl();
  Drag(At(output, 0), At(output, 60));
  EXPECT_GT(Value("Output Black Level"), 0.0);
  EXPECT_DOUBLE_EQ(Value("Input Black Level"), 0.0);
}

TEST_F(LevelsGroupTest, AValueTypedPastTheRangeIsClampedAndIsOneStep) {
  Show({});
  Expand();
  const std::size_t steps = Undo().GetUndoNames().size();
  TypeInto(*group->GetField(Level::kOutputWhite), "300");
  EXPECT_DOUBLE_EQ(Value("Output White Level"), 255.0);
  TypeInto(*group->GetField(Level::kOutputWhite), "90");
  EXPECT_DOUBLE_EQ(Value("Output White Level"), 90.0);
  EXPECT_DOUBLE_EQ(group->GetOutputLevelsControl()->GetWhiteLevel(), 90.0);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1) << "the clamped value changed nothing";
  ASSERT_TRUE(Undo().Undo());
  EXPECT_DOUBLE_EQ(Value("Output White Level"), 255.0);
}

TEST_F(LevelsGroupTest, AFieldMessageWithoutItsLevelsControlIsAContractFailure) {
  Show({});
  group->Destroy();
  ClearRecordedDebugAssertions();
  group->ListenToMessage(HotFloatControlChangedMessage(12.0f, 1));
  group->ListenToMessage(HotFloatControlChangedMessage(12.0f, 4));
  ASSERT_EQ(RecordedDebugAssertions().size(), 2u);
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "InputLevelsControl has not been initialized");
  EXPECT_EQ(RecordedDebugAssertions()[1].message, "OutputLevelsControl has not been initialized");
  EXPECT_DOUBLE_EQ(Value("Input Gray Level"), 128.0);
  ClearRecordedDebugAssertions();
}

TEST_F(LevelsGroupTest, OnANarrowListNoSizeGoesBelowZero) {
  Show({});
  group->SetIsExpanded(true);
  group->PositionSelf(0, 1, 12);
  EXPECT_GE(group->GetInputLevelsControl()->GetBounds().Width(), 0);
  EXPECT_GE(group->GetOutputLevelsControl()->GetBounds().Width(), 0);
  EXPECT_GE(group->Height(), 0);
}

// Rows and their controls, recursively: nothing of the colour groups may go below zero in a
// small panel.
void ExpectNoNegativeSize(const EffectItem& row) {
  EXPECT_GE(row.Height(), 0) << row.GetName();
  for (const auto& control : row.GetControls()) {
    EXPECT_GE(control->GetBounds().Width(), 0) << row.GetName();
    EXPECT_GE(control->GetBounds().Height(), 0) << row.GetName();
  }
  for (const auto& child : row.GetItems()) {
    ExpectNoNegativeSize(*child);
  }
}

TEST_F(ListViewTest, APanel200By300LaysOutTheColourGroupsWithNoNegativeSize) {
  const TrackItemRef clip = AddClip(
      v1, {Make(kMatchName_Levels), Make(kMatchName_TonalRange), Make(kMatchName_SaturationRange),
           Make(kMatchName_LumaRange), Make(kMatchName_HueRange), Make(kMatchName_LumaCurve),
           Make(kMatchName_RGBCurves), Make(kMatchName_ThreeWayColor)});
  Open({200, 300});
  Select({clip});
  ASSERT_FALSE(list->GetVideoItems().IsEmpty());
  for (const auto& effect : list->GetVideoItems()) {
    effect->SetAllExpanded(true);
  }
  list->PositionItems();
  host->Render();
  for (const auto& effect : list->GetVideoItems()) {
    ExpectNoNegativeSize(*effect);
  }
}

}  // namespace
