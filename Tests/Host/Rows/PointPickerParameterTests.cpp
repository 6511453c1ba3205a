#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Model/ComponentParamActions.h"
#include "Host/Rows/LinkedPointPickerParameter.h"
#include "Host/Rows/ParameterCache.h"
#include "Host/Rows/PointPickerParameter.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

class PointPickerTest : public RowsTest {
 protected:
  ComponentParamRef position =
      AddParam(ComponentParam::Create("Position", ParamType::Point, ParamPoint{960.0, 540.0})
                   ->SetRange(-10000.0, 10000.0)
                   ->SetPrecision(1));

  ParamPoint PointAt(TickTime sequenceTime) {
    return std::get<ParamPoint>(
        position->GetValueAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks()));
  }

  void TypeInto(HotFloatControl& field, const std::string& text) {
    Click(field.GetBounds().Center());
    ASSERT_TRUE(field.IsEditing());
    host.TextInput(text);
    host.KeyDown({KeyCode::kReturn});
  }
};

TEST_F(PointPickerTest, TheFieldsShowTheCoordinatesAtTheEditTime) {
  auto row = MakeRow<PointPickerParameter>(position, 20);
  EXPECT_DOUBLE_EQ(row->GetXField()->GetValue(), 960.0);
  EXPECT_DOUBLE_EQ(row->GetYField()->GetValue(), 540.0);
  EXPECT_EQ(row->GetXField()->GetDigitsPastDecimal(), 1);
  EXPECT_LT(row->GetXField()->GetBounds().right, row->GetYField()->GetBounds().left);
  EXPECT_EQ(row->GetTitleRightEdge(), row->GetXField()->GetBounds().left - 10);
}

TEST_F(PointPickerTest, ScrubbingXIsOneUndoStepAndLeavesYAsItWas) {
  auto row = MakeRow<PointPickerParameter>(position, 20);
  const Point start = row->GetXField()->GetBounds().Center();
  Drag(start, {start.x + 30, start.y}, 6);
  EXPECT_DOUBLE_EQ(PointAt(12 * kSecond).x, 990.0);
  EXPECT_DOUBLE_EQ(PointAt(12 * kSecond).y, 540.0);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_EQ(PointAt(12 * kSecond), (ParamPoint{960.0, 540.0}));
  EXPECT_DOUBLE_EQ(row->GetXField()->GetValue(), 960.0);
}

TEST_F(PointPickerTest, TypingYKeepsXAtItsKeyframedValue) {
  ComponentParamActions::AddKeyframe(position, 6 * kSecond, ParamPoint{0.0, 0.0});
  ComponentParamActions::AddKeyframe(position, 8 * kSecond, ParamPoint{100.0, 100.0});
  auto row = MakeRow<PointPickerParameter>(position, 20);  // clip 7 s: (50, 50)
  const std::size_t steps = UndoNames().size();
  TypeInto(*row->GetYField(), "75");
  EXPECT_EQ(PointAt(12 * kSecond), (ParamPoint{50.0, 75.0}));
  // A new keyframe at the edit time; the others are untouched.
  EXPECT_EQ(position->GetKeyframeTimes(),
            (std::vector<TickTime>{6 * kSecond, 7 * kSecond, 8 * kSecond}));
  EXPECT_EQ(UndoNames().size(), steps + 1);
}

TEST_F(PointPickerTest, ALinkedPointScalesTheOtherCoordinateByTheSameFactor) {
  auto scale = AddParam(ComponentParam::Create("Scale", ParamType::Point, ParamPoint{100.0, 50.0})
                            ->SetRange(0, 1000));
  auto row = std::make_shared<LinkedPointPickerParameter>(Info(scale), true);
  row->FinishCreateSelf();
  row->Show();
  row->PositionSelf(0, 0, kListWidth);
  EXPECT_TRUE(row->IsLinked());
  EXPECT_TRUE(row->GetLinkSwitch()->IsChecked());
  TypeInto(*row->GetXField(), "200");
  EXPECT_EQ(scale->GetValueAt(0), ParamValue(ParamPoint{200.0, 100.0}));

  Click(row->GetLinkSwitch()->GetBounds().Center());  // unlink
  EXPECT_FALSE(row->IsLinked());
  TypeInto(*row->GetXField(), "50");
  EXPECT_EQ(scale->GetValueAt(0), ParamValue(ParamPoint{50.0, 100.0}));
  EXPECT_EQ(UndoNames().size(), 2u);  // the switch itself is no model edit
}

TEST_F(PointPickerTest, ALinkedPointFromZeroGivesTheOtherCoordinateTheSameValue) {
  auto scale = AddParam(
      ComponentParam::Create("Scale", ParamType::Point, ParamPoint{0.0, 40.0})->SetRange(0, 1000));
  auto row = std::make_shared<LinkedPointPickerParameter>(Info(scale), true);
  row->FinishCreateSelf();
  row->Show();
  row->PositionSelf(0, 0, kListWidth);
  TypeInto(*row->GetXField(), "10");
  EXPECT_EQ(scale->GetValueAt(0), ParamValue(ParamPoint{10.0, 10.0}));
}

TEST_F(PointPickerTest, AnOrdinaryPointStartsUnlinked) {
  LinkedPointPickerParameter row(Info(position), false);
  EXPECT_FALSE(row.IsLinked());
}

TEST_F(PointPickerTest, DestroyedRowsGiveTheirFieldsBackForTheNextRowsOfTheView) {
  ParameterCache& cache = ParameterControl::GetParameterCache();
  auto first = MakeRow<PointPickerParameter>(position, 0);
  HotFloatControl* xField = first->GetXField();
  const std::size_t views = listView->GetChildren().size();
  first->Destroy();
  EXPECT_GE(cache.GetIdleCount(), 2u);
  EXPECT_FALSE(xField->IsVisible());
  auto second = MakeRow<PointPickerParameter>(position, 0);
  EXPECT_EQ(listView->GetChildren().size(), views);  // reused, not made anew
  EXPECT_TRUE(second->GetXField() == xField || second->GetYField() == xField);
  EXPECT_EQ(second->GetXField()->GetOwnerCookie(), PointPickerParameter::kXCookie);
  // The old row no longer hears the field.
  TypeInto(*second->GetXField(), "5");
  EXPECT_DOUBLE_EQ(PointAt(12 * kSecond).x, 5.0);
  EXPECT_EQ(UndoNames().size(), 1u);
}

TEST_F(PointPickerTest, TheCacheForgetsTheFieldsOfAViewThatIsGone) {
  ParameterCache& cache = ParameterControl::GetParameterCache();
  {
    auto other = std::make_shared<SubView>();
    auto field = cache.CreateHotFloat(*other);
    EXPECT_EQ(field->GetParent(), other.get());
    cache.ReturnHotFloat(field);
  }
  EXPECT_EQ(cache.GetIdleCount(), 0u);
}

}  // namespace
