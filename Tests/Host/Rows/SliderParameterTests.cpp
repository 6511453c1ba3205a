#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Model/ComponentParamActions.h"
#include "Host/Rows/DoubleSliderLimiter.h"
#include "Host/Rows/DoubleSliderParameter.h"
#include "Host/Rows/FloatSliderParameter.h"
#include "Host/Rows/SliderParameter.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/Static.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

class SliderRowsTest : public RowsTest {
 protected:
  ComponentParamRef opacity =
      AddParam(ComponentParam::Create("Opacity", ParamType::FloatSlider, 100.0)
                   ->SetRange(0.0, 100.0)
                   ->SetPrecision(1)
                   ->SetUnits(ParamUnits::Percent));

  double ValueAt(const ComponentParamRef& param, TickTime sequenceTime) {
    return *param->GetScalarAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks());
  }

  template <class Row>
  std::shared_ptr<Row> MakeExpandedRow(const ComponentParamRef& param) {
    auto row = MakeRow<Row>(param, 10);
    row->SetIsExpanded(true);
    row->PositionSelf(10, 0, kListWidth);
    return row;
  }

  void TypeInto(HotFloatControl& field, const std::string& text) {
    Click(field.GetBounds().Center());
    ASSERT_TRUE(field.IsEditing());
    host.TextInput(text);
    host.KeyDown({KeyCode::kReturn});
  }

  // A drag of the slider's thumb from its current value to `value`.
  void DragSliderTo(FloatSliderControl& slider, float value, int steps = 5) {
    const Rect bounds = slider.GetBounds();
    const int y = bounds.top + bounds.Height() / 2;
    Drag({bounds.left + slider.XForValue(slider.GetValue()), y},
         {bounds.left + slider.XForValue(value), y}, steps);
  }
};

TEST_F(SliderRowsTest, AScriptedSliderDragIsOneUndoStepAndUndoRestoresTheValue) {
  auto row = MakeExpandedRow<FloatSliderParameter>(opacity);
  FloatSliderControl* slider = row->GetSlider();
  ASSERT_NE(slider, nullptr);
  ASSERT_TRUE(slider->IsVisible());
  DragSliderTo(*slider, 0.0f, 8);
  EXPECT_NEAR(ValueAt(opacity, 12 * kSecond), 0.0, 0.5);
  EXPECT_NEAR(row->GetHotText()->GetValue(), ValueAt(opacity, 12 * kSecond), 1e-6);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 100.0);
  EXPECT_FLOAT_EQ(slider->GetValue(), 100.0f);
  ASSERT_TRUE(Redo());
  EXPECT_NEAR(ValueAt(opacity, 12 * kSecond), 0.0, 0.5);
}

TEST_F(SliderRowsTest, ValuesChangeLiveDuringTheDragWithoutUndoSteps) {
  auto row = MakeExpandedRow<FloatSliderParameter>(opacity);
  FloatSliderControl* slider = row->GetSlider();
  const Rect bounds = slider->GetBounds();
  const int y = bounds.top + bounds.Height() / 2;
  host.MouseDown(MouseButton::kLeft, {bounds.left + slider->XForValue(100.0f), y},
                 kKeyModifierNone);
  host.MouseMove({bounds.left + slider->XForValue(50.0f), y}, kKeyModifierNone);
  EXPECT_NEAR(ValueAt(opacity, 12 * kSecond), 50.0, 1.0);
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_TRUE(row->IsEditOpen());
  host.MouseUp(MouseButton::kLeft, {bounds.left + slider->XForValue(50.0f), y}, kKeyModifierNone);
  EXPECT_FALSE(row->IsEditOpen());
  EXPECT_EQ(UndoNames().size(), 1u);
}

TEST_F(SliderRowsTest, ScrubbingTheNumberIsOneUndoStep) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  const Point start = row->GetHotText()->GetBounds().Center();
  Drag(start, {start.x - 25, start.y}, 5);
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 75.0);
  EXPECT_EQ(UndoNames().size(), 1u);
  ASSERT_TRUE(Undo());
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
}

TEST_F(SliderRowsTest, TypingAValueSetsItAtTheEditTime) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  TypeInto(*row->GetHotText(), "42.5");
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 42.5);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  // Typed beyond the range: the field keeps it within.
  TypeInto(*row->GetHotText(), "250");
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  ASSERT_TRUE(Undo());
  ASSERT_TRUE(Undo());
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  EXPECT_FALSE(Undo());
}

TEST_F(SliderRowsTest, ADragOfATimeVaryingParameterAtANewTimeAddsAKeyframeThere) {
  auto row = MakeExpandedRow<FloatSliderParameter>(opacity);
  row->SetTimeVarying(true);  // a keyframe at clip 7 s
  SetEditTime(16 * kSecond, *row);
  DragSliderTo(*row->GetSlider(), 20.0f);
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{7 * kSecond, 11 * kSecond}));
  EXPECT_NEAR(ValueAt(opacity, 16 * kSecond), 20.0, 1.0);
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetTimeVarying",
                                                   "MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{7 * kSecond}));
}

TEST_F(SliderRowsTest, TheSliderAndItsLabelsShowOnlyWhileExpanded) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  EXPECT_TRUE(row->GetHotText()->IsVisible());
  EXPECT_FALSE(row->GetSlider()->IsVisible());
  EXPECT_EQ(row->Height(), 20);
  row->SetIsExpanded(true);
  EXPECT_TRUE(row->GetSlider()->IsVisible());
  // Room for the slider or the graphs (54 + 1 + 54), whichever is taller.
  EXPECT_EQ(row->Height(), 20 + 109);
  row->SetIsExpanded(false);
  EXPECT_FALSE(row->GetSlider()->IsVisible());
  row->Hide();
  EXPECT_FALSE(row->GetHotText()->IsVisible());
}

TEST_F(SliderRowsTest, RangeDigitsAndUnitsComeFromTheParameter) {
  opacity->SetSliderRange(0.0, 50.0);
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  EXPECT_EQ(row->GetHotText()->GetDigitsPastDecimal(), 1);
  EXPECT_EQ(row->GetHotText()->GetAppendedSymbol(), "%");
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetMaxValue(), 100.0);
  EXPECT_FLOAT_EQ(row->GetSlider()->GetMaxValue(), 50.0f);
  EXPECT_EQ(row->GetMinLabel(), "0.0");
  EXPECT_EQ(row->GetMaxLabel(), "50.0");
  EXPECT_EQ(row->GetTitleRightEdge(), row->GetHotText()->GetBounds().left - 10);
}

TEST_F(SliderRowsTest, AWholeNumberSliderRoundsWhatItWrites) {
  auto count = AddParam(
      ComponentParam::Create("Count", ParamType::Slider, 3.0)->SetRange(0, 10)->SetPrecision(0));
  auto row = MakeRow<SliderParameter>(count, 0);
  row->OnSliderValueChanged(6.6f, true);
  EXPECT_DOUBLE_EQ(ValueAt(count, 12 * kSecond), 7.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 7.0);
  EXPECT_EQ(row->GetMinLabel(), "0");
}

TEST_F(SliderRowsTest, AValueOnlyShownDoesNotReachTheModel) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  row->OnSliderValueChanging(10.0f, false);
  row->OnSliderValueChanged(10.0f, false);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 10.0);
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(SliderRowsTest, ADoubleClickOnTheSliderResetsToTheDefault) {
  ComponentParamActions::SetValue(opacity, 7 * kSecond, 30.0);
  auto row = MakeExpandedRow<FloatSliderParameter>(opacity);
  const Point at = row->GetSlider()->GetBounds().Center();
  host.MouseDown(MouseButton::kLeft, at, kKeyModifierNone, 1);
  host.MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  host.MouseDown(MouseButton::kLeft, at, kKeyModifierNone, 2);
  host.MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
  EXPECT_EQ(UndoNames().back(), "MZ.ComponentParam.SetValue");
}

TEST_F(SliderRowsTest, TheValueCanBeShownAsText) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  row->SetShowValueAsText(true);
  EXPECT_FALSE(row->GetHotText()->IsVisible());
  ASSERT_NE(row->GetValueLabel(), nullptr);
  EXPECT_TRUE(row->GetValueLabel()->IsVisible());
  EXPECT_EQ(row->GetValueLabel()->GetText(), "100.0%");
  ComponentParamActions::SetValue(opacity, 7 * kSecond, 12.25);
  EXPECT_EQ(row->GetValueLabel()->GetText(), "12.2%");
  EXPECT_FLOAT_EQ(row->GetCachedValue(), 12.25f);
  EXPECT_EQ(row->GetCachedTime(), 12 * kSecond);
  row->SetShowValueAsText(false);
  EXPECT_TRUE(row->GetHotText()->IsVisible());
}

TEST_F(SliderRowsTest, ARowOfADisabledParameterTakesNoInput) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  opacity->SetEnabled(false);
  EXPECT_FALSE(row->GetHotText()->IsEnabled());
  const Point start = row->GetHotText()->GetBounds().Center();
  Drag(start, {start.x - 25, start.y}, 5);
  EXPECT_DOUBLE_EQ(ValueAt(opacity, 12 * kSecond), 100.0);
}

TEST(SliderParameterFormat, NumbersAreFixedAndANegativeZeroLosesItsSign) {
  EXPECT_EQ(SliderParameter::FormatNumber(1.5, 0), "2");
  EXPECT_EQ(SliderParameter::FormatNumber(-0.04, 1), "0.0");
  EXPECT_EQ(SliderParameter::FormatNumber(-180.0, 0), "-180");
  EXPECT_EQ(SliderParameter::FormatNumber(3.14159, 3), "3.142");
}

// --- Limiters on double rows ---

// Keeps handle 5 between 20 and 60, like the handles of a range control.
class TestLimiter : public DoubleSliderLimiter {
 public:
  std::optional<Bounds> GetBounds(int handleID) const override {
    return handleID == 5 ? std::optional<Bounds>(Bounds{20.0f, 60.0f}) : std::nullopt;
  }
};

class DoubleSliderTest : public SliderRowsTest {
 protected:
  ComponentParamRef threshold = AddParam(
      ComponentParam::Create("Threshold", ParamType::DoubleSlider, 40.0)->SetRange(0, 100));
};

TEST_F(DoubleSliderTest, TheLimiterClampsTypedAndDraggedValues) {
  auto row = MakeExpandedRow<DoubleSliderParameter>(threshold);
  auto limiter = std::make_shared<TestLimiter>();
  ASSERT_TRUE(DoubleSliderParameter::RegisterLimiter(*row, 5, limiter));
  TypeInto(*row->GetHotText(), "90");
  EXPECT_DOUBLE_EQ(ValueAt(threshold, 12 * kSecond), 60.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 60.0);  // shows what was written
  DragSliderTo(*row->GetSlider(), 5.0f);
  EXPECT_DOUBLE_EQ(ValueAt(threshold, 12 * kSecond), 20.0);
  EXPECT_DOUBLE_EQ(row->GetValue(), 20.0);
  EXPECT_EQ(UndoNames().size(), 2u);
}

TEST_F(DoubleSliderTest, WithoutItsOwnerTheLimiterNoLongerApplies) {
  auto row = MakeRow<DoubleSliderParameter>(threshold, 0);
  {
    auto limiter = std::make_shared<TestLimiter>();
    DoubleSliderParameter::RegisterLimiter(*row, 5, limiter);
    EXPECT_TRUE(row->HasLimiter());
  }
  EXPECT_FALSE(row->HasLimiter());
  TypeInto(*row->GetHotText(), "90");
  EXPECT_DOUBLE_EQ(ValueAt(threshold, 12 * kSecond), 90.0);
}

TEST_F(DoubleSliderTest, ALimiterCannotBeRegisteredOnAnotherKindOfRow) {
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  EXPECT_FALSE(DoubleSliderParameter::RegisterLimiter(*row, 5, std::make_shared<TestLimiter>()));
}

TEST_F(DoubleSliderTest, AHandleTheLimiterDoesNotKnowIsNotClamped) {
  auto row = MakeRow<DoubleSliderParameter>(threshold, 0);
  auto limiter = std::make_shared<TestLimiter>();
  DoubleSliderParameter::RegisterLimiter(*row, 7, limiter);
  bool clamped = true;
  EXPECT_DOUBLE_EQ(row->Limit(95.0, clamped), 95.0);
  EXPECT_FALSE(clamped);
}

}  // namespace

namespace {

TEST_F(SliderRowsTest, FeedbackShowsAnotherParametersValueUntilTheNextRefresh) {
  auto other = ComponentParam::Create("Other", ParamType::FloatSlider, 25.0)->SetRange(0, 100);
  auto row = MakeRow<FloatSliderParameter>(opacity, 0);
  row->SynchToFeedback(other);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 25.0);
  EXPECT_EQ(row->GetParam(), opacity);
  row->SynchToCurrentTime();
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 100.0);
}

}  // namespace
