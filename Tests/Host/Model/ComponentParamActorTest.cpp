#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ComponentParamActor.h"
#include "ModelTestFixture.h"

namespace {

class ComponentParamActorTest : public ModelTest {
 protected:
  ComponentParamRef Blurriness() const { return Param(blur, "Blurriness"); }

  static bool ContractFailed() {
    for (const DebugAssertionRecord& record : RecordedDebugAssertions()) {
      if (record.message == "!mCommitted && mValueSet" &&
          record.condition == "!mCommitted && mValueSet") {
        return true;
      }
    }
    return false;
  }
};

TEST_F(ComponentParamActorTest, SetChangesTheModelAtOnceWithoutAnUndoStep) {
  ComponentParamActor actor(Blurriness(), 0);
  EXPECT_TRUE(actor.SetValue(12.0));
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(12.0));
  EXPECT_FALSE(Undo().CanUndo());
  actor.Rollback();
}

TEST_F(ComponentParamActorTest, ADragOfManySetsCommitsAsOneStep) {
  const std::string before = Dump();
  {
    ComponentParamActor actor(Blurriness(), 0);
    for (double v : {1.0, 5.0, 9.0, 30.0}) {
      actor.SetValue(v);
    }
    EXPECT_TRUE(actor.Commit());
  }
  EXPECT_EQ(Undo().GetUndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(30.0));
  const std::string after = Dump();
  Undo().Undo();
  EXPECT_EQ(Dump(), before);
  Undo().Redo();
  EXPECT_EQ(Dump(), after);
}

TEST_F(ComponentParamActorTest, CommittingWithoutAValueIsAContractFailure) {
  ComponentParamActor actor(Blurriness(), 0);
  EXPECT_FALSE(actor.Commit());
  EXPECT_TRUE(ContractFailed());
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ComponentParamActorTest, CommittingTwiceIsAContractFailureAndMakesOneStep) {
  ComponentParamActor actor(Blurriness(), 0);
  actor.SetValue(3.0);
  EXPECT_TRUE(actor.Commit());
  EXPECT_FALSE(ContractFailed());
  EXPECT_FALSE(actor.Commit());
  EXPECT_TRUE(ContractFailed());
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(ComponentParamActorTest, CommitAfterRollbackIsAContractFailure) {
  ComponentParamActor actor(Blurriness(), 0);
  actor.SetValue(3.0);
  actor.Rollback();
  EXPECT_FALSE(actor.Commit());
  EXPECT_TRUE(ContractFailed());
}

TEST_F(ComponentParamActorTest, DestroyingAnEditWithAValueCommitsIt) {
  {
    ComponentParamActor actor(Blurriness(), 0);
    actor.SetValue(44.0);
  }
  EXPECT_EQ(Undo().GetUndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  Undo().Undo();
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(0.0));
}

TEST_F(ComponentParamActorTest, DestroyingAnUntouchedOrRolledBackEditLeavesNoStep) {
  { ComponentParamActor untouched(Blurriness(), 0); }
  {
    ComponentParamActor rolledBack(Blurriness(), 0);
    rolledBack.SetValue(7.0);
    rolledBack.Rollback();
  }
  EXPECT_FALSE(Undo().CanUndo());
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(ComponentParamActorTest, RollbackRestoresKeyframesExactly) {
  const ComponentParamRef param = Blurriness();
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(param, true, kSecond), EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(param, 3 * kSecond, 20.0), EditStatus::Done);
  const std::string before = DescribeForTest(*param);
  ComponentParamActor actor(param, 2 * kSecond);
  actor.SetValue(50.0);  // adds a keyframe between the two
  EXPECT_EQ(param->GetKeyframes().Size(), 3u);
  actor.Rollback();
  EXPECT_EQ(DescribeForTest(*param), before);
}

TEST_F(ComponentParamActorTest, ATimeVaryingParameterGetsItsKeyframeAtTheEditTime) {
  const ComponentParamRef param = Blurriness();
  ComponentParamActions::SetTimeVarying(param, true, kSecond);
  {
    ComponentParamActor actor(param, 4 * kSecond);
    actor.SetValue(10.0);
    actor.SetValue(40.0);
  }
  ASSERT_EQ(param->GetKeyframes().Size(), 2u);
  EXPECT_EQ(param->GetKeyframes().At(1).time, 4 * kSecond);
  EXPECT_EQ(param->GetKeyframes().At(1).value, ParamValue(40.0));
  EXPECT_EQ(param->GetConstantValue(), ParamValue(0.0));
}

TEST_F(ComponentParamActorTest, ValuesAreLimitedToTheRangeAndWrongKindsRefused) {
  ComponentParamActor actor(Blurriness(), 0);
  EXPECT_TRUE(actor.SetValue(99999.0));
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(3000.0));
  EXPECT_FALSE(actor.SetValue(ParamPoint{1, 2}));
  EXPECT_FALSE(actor.SetValue(std::numeric_limits<double>::quiet_NaN()));
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(3000.0));
  actor.Rollback();
}

TEST_F(ComponentParamActorTest, AReadOnlyParameterTakesNoValue) {
  Blurriness()->SetReadOnly(true);
  ComponentParamActor actor(Blurriness(), 0);
  EXPECT_FALSE(actor.SetValue(5.0));
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(0.0));
}

TEST_F(ComponentParamActorTest, ACommitTheProjectRefusesLeavesNoUnrecordedChange) {
  ComponentParamActor actor(Blurriness(), 0);
  actor.SetValue(5.0);
  project->SetReadOnly(true);
  EXPECT_FALSE(actor.Commit());
  EXPECT_EQ(Blurriness()->GetConstantValue(), ParamValue(0.0));
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ComponentParamActorTest, APointEditWritesBothCoordinates) {
  const ComponentParamRef position = Param(Intrinsic(kMatchName_Motion), "Position");
  {
    PointComponentParamActor actor(position, 0);
    actor.SetValue(100.0, 540.0);
    actor.Finalize();
    actor.SetValue(120.0, 540.0);
  }
  EXPECT_EQ(position->GetConstantValue(), ParamValue(ParamPoint{120.0, 540.0}));
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(ComponentParamActorTest, ANullParameterFailsVisiblyAndChangesNothing) {
  ComponentParamActor actor(nullptr, 0);
  EXPECT_FALSE(actor.SetValue(1.0));
  EXPECT_FALSE(RecordedDebugAssertions().empty());
}

}  // namespace
