#include <gtest/gtest.h>

#include "Host/Model/ComponentParamActions.h"
#include "ModelTestFixture.h"

namespace {

class ComponentParamActionsTest : public ModelTest {
 protected:
  ComponentParamRef Opacity() const { return Param(Intrinsic(kMatchName_Opacity), "Opacity"); }
};

TEST_F(ComponentParamActionsTest, StopwatchOnAddsAKeyframeAtTheCurrentTimeWithTheCurrentValue) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::SetValue(opacity, 0, 80.0);
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(opacity, true, 3 * kSecond), EditStatus::Done);
  EXPECT_TRUE(opacity->IsTimeVarying());
  ASSERT_EQ(opacity->GetKeyframes().Size(), 1u);
  EXPECT_EQ(opacity->GetKeyframes().At(0).time, 3 * kSecond);
  EXPECT_EQ(opacity->GetKeyframes().At(0).value, ParamValue(80.0));
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentParam.SetTimeVarying");
}

TEST_F(ComponentParamActionsTest, StopwatchOffKeepsTheValueAtTheCurrentTimeAndDropsKeyframes) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, 2 * kSecond, 0.0);
  ComponentParamActions::AddKeyframe(opacity, 4 * kSecond, 100.0);
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(opacity, false, 3 * kSecond), EditStatus::Done);
  EXPECT_FALSE(opacity->IsTimeVarying());
  EXPECT_FALSE(opacity->HasKeyframes());
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(0), 50.0);
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(10 * kSecond), 50.0);
}

TEST_F(ComponentParamActionsTest, StopwatchUndoRestoresEveryKeyframe) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, 2 * kSecond, 10.0);
  ComponentParamActions::AddKeyframe(opacity, 4 * kSecond, 90.0);
  ComponentParamActions::SetTemporalInterpolation(opacity, 4 * kSecond,
                                                  TemporalInterpolation::Hold);
  MessageRecorder recorder;
  recorder.Listen(opacity->GetStation());
  UndoRoundTrip(
      *project, [&] { return DescribeForTest(*opacity); }, recorder)
      .Check({.name = "MZ.ComponentParam.SetTimeVarying",
              .edit = [&] { return ComponentParamActions::SetTimeVarying(opacity, false, 0); },
              .messages = {"ParamChangedMessage"}});
}

TEST_F(ComponentParamActionsTest, TurningAnAlreadyRunningStopwatchOnChangesNothing) {
  ComponentParamActions::SetTimeVarying(Opacity(), true, 0);
  EXPECT_EQ(ComponentParamActions::SetTimeVarying(Opacity(), true, kSecond), EditStatus::NoChange);
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(ComponentParamActionsTest, AParameterThatCannotVaryRefusesTheStopwatchAndKeyframes) {
  const ComponentParamRef blend = Param(Intrinsic(kMatchName_Opacity), "Blend Mode");
  EXPECT_EQ(ComponentParamActions::SetTimeVarying(blend, true, 0), EditStatus::CannotVary);
  EXPECT_EQ(ComponentParamActions::AddKeyframe(blend, 0), EditStatus::CannotVary);
  EXPECT_FALSE(blend->IsTimeVarying());
}

TEST_F(ComponentParamActionsTest, TheValueBetweenKeyframesFollowsTheCurve) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, 2 * kSecond, 0.0);
  ComponentParamActions::AddKeyframe(opacity, 6 * kSecond, 100.0);
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(0), 0.0);
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(3 * kSecond), 25.0);
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(9 * kSecond), 100.0);
  ComponentParamActions::SetTemporalInterpolation(opacity, 2 * kSecond,
                                                  TemporalInterpolation::Hold);
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(5 * kSecond), 0.0);
}

TEST_F(ComponentParamActionsTest, AddingAKeyframeWithoutAValueTakesTheValueThere) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, 0, 0.0);
  ComponentParamActions::AddKeyframe(opacity, 4 * kSecond, 100.0);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(opacity, kSecond), EditStatus::Done);
  EXPECT_EQ(opacity->GetKeyframes().At(1).value, ParamValue(25.0));
  EXPECT_EQ(ComponentParamActions::AddKeyframe(opacity, kSecond, 3.0), EditStatus::DuplicateTime);
}

TEST_F(ComponentParamActionsTest, RemovingTheLastKeyframeKeepsItsValue) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, kSecond, 33.0);
  ASSERT_EQ(ComponentParamActions::RemoveKeyframe(opacity, kSecond), EditStatus::Done);
  EXPECT_FALSE(opacity->HasKeyframes());
  EXPECT_DOUBLE_EQ(*opacity->GetScalarAt(0), 33.0);
  EXPECT_EQ(ComponentParamActions::RemoveKeyframe(opacity, kSecond), EditStatus::NotFound);
}

TEST_F(ComponentParamActionsTest, MovingOntoAnotherKeyframeIsRefused) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, kSecond, 10.0);
  ComponentParamActions::AddKeyframe(opacity, 2 * kSecond, 20.0);
  EXPECT_EQ(ComponentParamActions::MoveKeyframe(opacity, kSecond, 2 * kSecond),
            EditStatus::DuplicateTime);
  EXPECT_EQ(ComponentParamActions::MoveKeyframe(opacity, kSecond, 3 * kSecond), EditStatus::Done);
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{2 * kSecond, 3 * kSecond}));
  Undo().Undo();
  EXPECT_EQ(opacity->GetKeyframeTimes(), (std::vector<TickTime>{kSecond, 2 * kSecond}));
}

TEST_F(ComponentParamActionsTest, EaseAndInterpolationAreUndoable) {
  const ComponentParamRef opacity = Opacity();
  ComponentParamActions::AddKeyframe(opacity, kSecond, 10.0);
  ComponentParamActions::AddKeyframe(opacity, 3 * kSecond, 90.0);
  const std::string before = DescribeForTest(*opacity);
  ASSERT_EQ(ComponentParamActions::ApplyAutomaticEase(opacity, 3 * kSecond, KeyframeSide::In),
            EditStatus::Done);
  EXPECT_EQ(opacity->GetKeyframes().At(1).interpolation, TemporalInterpolation::Bezier);
  ASSERT_EQ(ComponentParamActions::SetEase(opacity, kSecond, KeyframeSide::Out, 5.0, 0.5),
            EditStatus::Done);
  Undo().Undo();
  Undo().Undo();
  EXPECT_EQ(DescribeForTest(*opacity), before);
}

TEST_F(ComponentParamActionsTest, KeyframeEditsOfAMissingKeyframeReportNotFound) {
  const ComponentParamRef opacity = Opacity();
  EXPECT_EQ(ComponentParamActions::SetKeyframeValue(opacity, kSecond, 1.0), EditStatus::NotFound);
  EXPECT_EQ(ComponentParamActions::SetTemporalInterpolation(opacity, kSecond,
                                                            TemporalInterpolation::Linear),
            EditStatus::NotFound);
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ComponentParamActionsTest, AValueThatChangesNothingMakesNoStep) {
  EXPECT_EQ(ComponentParamActions::SetValue(Opacity(), 0, 100.0), EditStatus::NoChange);
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ComponentParamActionsTest, AReadOnlyParameterRefusesEveryEdit) {
  Opacity()->SetReadOnly(true);
  EXPECT_EQ(ComponentParamActions::SetValue(Opacity(), 0, 5.0), EditStatus::ReadOnly);
  EXPECT_EQ(ComponentParamActions::SetTimeVarying(Opacity(), true, 0), EditStatus::ReadOnly);
  EXPECT_EQ(ComponentParamActions::AddKeyframe(Opacity(), 0, 5.0), EditStatus::ReadOnly);
}

TEST_F(ComponentParamActionsTest, ChoicesOutsideTheMenuAreRefused) {
  const ComponentParamRef dimensions = Param(blur, "Blur Dimensions");
  EXPECT_EQ(ComponentParamActions::SetValue(dimensions, 0, ParamChoice{2}), EditStatus::Done);
  EXPECT_EQ(ComponentParamActions::SetValue(dimensions, 0, ParamChoice{3}),
            EditStatus::InvalidArgument);
  EXPECT_EQ(ComponentParamActions::SetValue(dimensions, 0, ParamChoice{-1}),
            EditStatus::InvalidArgument);
  EXPECT_EQ(dimensions->GetConstantValue(), ParamValue(ParamChoice{2}));
}

TEST_F(ComponentParamActionsTest, AnIntegerSliderRoundsItsValue) {
  const ComponentParamRef feather = Param(crop, "Edge Feather");
  ComponentParamActions::SetValue(feather, 0, 12.6);
  EXPECT_EQ(feather->GetConstantValue(), ParamValue(13.0));
}

}  // namespace
