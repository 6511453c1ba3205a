// A series of edits of every kind, then undo of all of them, must give back the exact original
// model; redo of all must give back the exact edited one. The dump compares every value,
// keyframe field, order and id.

#include <gtest/gtest.h>

#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ComponentParamActor.h"
#include "ModelTestFixture.h"

namespace {

class ModelRoundTripTest : public ModelTest {};

TEST_F(ModelRoundTripTest, UndoingEverythingRestoresTheOriginalAndRedoTheEdited) {
  const std::string original = Dump();
  const ComponentRef motion = Intrinsic(kMatchName_Motion);
  const ComponentRef opacity = Intrinsic(kMatchName_Opacity);

  ComponentParamActions::SetTimeVarying(motion->FindParam("Position"), true, 2 * kSecond);
  {
    PointComponentParamActor drag(motion->FindParam("Position"), 4 * kSecond);
    drag.SetValue(100.0, 200.0);
    drag.SetValue(300.0, 400.0);
  }
  ComponentParamActions::SetSpatialInterpolation(motion->FindParam("Position"), 4 * kSecond,
                                                 SpatialInterpolation::Bezier);
  ComponentParamActions::AddKeyframe(opacity->FindParam("Opacity"), kSecond, 0.0);
  ComponentParamActions::AddKeyframe(opacity->FindParam("Opacity"), 3 * kSecond, 100.0);
  ComponentParamActions::SetTemporalInterpolation(opacity->FindParam("Opacity"), kSecond,
                                                  TemporalInterpolation::AutoBezier);
  ComponentParamActions::MoveKeyframe(opacity->FindParam("Opacity"), 3 * kSecond, 5 * kSecond);
  ComponentActions::SetInstanceName(blur, "Dreamy");
  ComponentActions::SetBypass(crop, true);
  ComponentChainActions::MoveFilters(videoChain, {crop}, nullptr);
  ComponentChainActions::AddFilter(videoChain, *Catalogue().FindTemplate(kMatchName_Tint));
  ComponentActions::AddMask(opacity, Catalogue().Create(kMatchName_Mask));
  {
    UndoStack::ScopedCompound both(Undo(), "Test.Both");
    ComponentParamActions::SetValue(blur->FindParam("Blurriness"), 0, 25.0);
    ComponentParamActions::SetValue(blur->FindParam("Repeat Edge Pixels"), 0, true);
  }
  ComponentChainActions::SetBypass({videoChain, audio1->GetComponentChain()}, true);
  ComponentChainActions::RemoveMultipleFilters(audio1->GetComponentChain(),
                                               audio1->GetComponentChain()->GetComponents());
  ComponentParamActions::SetTimeVarying(motion->FindParam("Position"), false, 3 * kSecond);
  ComponentChainActions::ResetComponent(blur);

  const std::string edited = Dump();
  ASSERT_NE(edited, original);
  const std::size_t steps = Undo().GetUndoNames().size();
  EXPECT_EQ(steps, 17u);

  while (Undo().Undo()) {
  }
  EXPECT_EQ(Dump(), original);
  while (Undo().Redo()) {
  }
  EXPECT_EQ(Dump(), edited);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps);
}

TEST_F(ModelRoundTripTest, UndoHalfwayAndRedoMatchesTheStateAtThatStep) {
  const ComponentParamRef level =
      audio1->GetComponentChain()->FindByMatchName(kMatchName_Volume)->FindParam("Level");
  std::vector<std::string> states{Dump()};
  for (double value : {0.5, 0.25, 2.0}) {
    ComponentParamActions::SetValue(level, 0, value);
    states.push_back(Dump());
  }
  Undo().Undo();
  Undo().Undo();
  EXPECT_EQ(Dump(), states[1]);
  Undo().Redo();
  EXPECT_EQ(Dump(), states[2]);
}

}  // namespace
