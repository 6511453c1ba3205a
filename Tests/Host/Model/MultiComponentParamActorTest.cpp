#include <gtest/gtest.h>

#include <limits>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/MultiComponentParamActor.h"
#include "ModelTestFixture.h"

namespace {

class MultiComponentParamActorTest : public ModelTest {
 protected:
  ComponentParamRef Edge(const char* name) const { return Param(crop, name); }
  QuadrupleDoubleFloatSliderComponentParamActor::Params Edges() const {
    return {Edge("Left"), Edge("Top"), Edge("Right"), Edge("Bottom")};
  }
  std::string Crop() const { return DescribeForTest(*crop); }
  void ListenToEdges(MessageRecorder& recorder) const {
    for (const char* name : {"Left", "Top", "Right", "Bottom"}) {
      recorder.Listen(Edge(name)->GetStation());
    }
  }
  static bool Asserted(const std::string& message) {
    for (const DebugAssertionRecord& record : RecordedDebugAssertions()) {
      if (record.message == message) {
        return true;
      }
    }
    return false;
  }
};

TEST_F(MultiComponentParamActorTest, AFourValueEditIsOneStepThatUndoRestoresExactly) {
  MessageRecorder recorder;
  ListenToEdges(recorder);
  UndoRoundTrip(
      *project, [&] { return Crop(); }, recorder)
      .Check({.name = "MZ.ComponentParam.SetValue", .edit = [&] {
                QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
                actor.SetValue({10, 20, 30, 40});
                return actor.Commit() ? EditStatus::Done : EditStatus::InvalidArgument;
              }});
}

TEST_F(MultiComponentParamActorTest, ADragOfManySetsIsOneStep) {
  const std::string before = Dump();
  {
    QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
    for (double v : {1.0, 5.0, 9.0}) {
      actor.SetValue({v, v + 1, v + 2, v + 3});
    }
    EXPECT_FALSE(Undo().CanUndo()) << "live sets make no step";
    EXPECT_TRUE(actor.Commit());
  }
  EXPECT_EQ(Undo().GetUndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  EXPECT_EQ(Edge("Bottom")->GetConstantValue(), ParamValue(12.0));
  Undo().Undo();
  EXPECT_EQ(Dump(), before);
}

TEST_F(MultiComponentParamActorTest, ATwoValueEditLeavesTheOtherParametersAlone) {
  MessageRecorder recorder;
  ListenToEdges(recorder);
  UndoRoundTrip(
      *project, [&] { return Crop(); }, recorder)
      .Check({.name = "MZ.ComponentParam.SetValue",
              .edit =
                  [&] {
                    DualDoubleFloatSliderComponentParamActor actor(Edge("Right"), Edge("Left"), 0);
                    actor.SetValue(55.0, 5.0);
                    return actor.Commit() ? EditStatus::Done : EditStatus::InvalidArgument;
                  },
              .checkEdited =
                  [&] {
                    EXPECT_EQ(Edge("Left")->GetConstantValue(), ParamValue(5.0));
                    EXPECT_EQ(Edge("Right")->GetConstantValue(), ParamValue(55.0));
                    EXPECT_EQ(Edge("Top")->GetConstantValue(), ParamValue(0.0));
                  }});
}

TEST_F(MultiComponentParamActorTest, OneValueOfManyChangedMakesAStepOverThatOneOnly) {
  MessageRecorder recorder;
  ListenToEdges(recorder);
  UndoRoundTrip(
      *project, [&] { return Crop(); }, recorder)
      .Check({.name = "MZ.ComponentParam.SetValue",
              .edit =
                  [&] {
                    QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
                    actor.SetValue(2, ParamValue(12.5));
                    return actor.Commit() ? EditStatus::Done : EditStatus::InvalidArgument;
                  },
              .messages = {"ParamChangedMessage"}});
}

TEST_F(MultiComponentParamActorTest, TimeVaryingParametersGetKeyframesAndUndoRemovesThemAll) {
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(Edge("Left"), true, 0), EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(Edge("Top"), true, 0), EditStatus::Done);
  const std::string before = Dump();
  {
    DualDoubleFloatSliderComponentParamActor actor(Edge("Left"), Edge("Top"), 2 * kSecond);
    actor.SetValue(30.0, 40.0);
  }
  EXPECT_EQ(Edge("Left")->GetKeyframes().Size(), 2u);
  EXPECT_EQ(Edge("Top")->GetKeyframes().Size(), 2u);
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentParam.SetValue");
  Undo().Undo();
  EXPECT_EQ(Dump(), before);
}

TEST_F(MultiComponentParamActorTest, ARefusedValueLeavesEveryParameterOfTheCallAsItWas) {
  QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
  ASSERT_TRUE(actor.SetValue({1, 2, 3, 4}));
  const std::string afterFirst = Crop();
  EXPECT_FALSE(actor.SetValue({5, 6, std::numeric_limits<double>::quiet_NaN(), 8}));
  EXPECT_EQ(Crop(), afterFirst);
  EXPECT_FALSE(actor.SetValues({ParamValue(1.0)}));
  EXPECT_FALSE(actor.SetValue(4, ParamValue(1.0)));
  EXPECT_EQ(Crop(), afterFirst);
  actor.Rollback();
  EXPECT_EQ(Edge("Left")->GetConstantValue(), ParamValue(0.0));
}

TEST_F(MultiComponentParamActorTest, AReadOnlyParameterRefusesTheWholeSet) {
  Edge("Bottom")->SetReadOnly(true);
  const std::string before = Crop();
  QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
  EXPECT_FALSE(actor.SetValue({1, 2, 3, 4}));
  EXPECT_EQ(Crop(), before);
  EXPECT_FALSE(actor.IsValueSet());
}

TEST_F(MultiComponentParamActorTest, ParametersOfTwoComponentsAreRefused) {
  DualDoubleFloatSliderComponentParamActor actor(Edge("Left"), Param(blur, "Blurriness"), 0);
  EXPECT_TRUE(Asserted("Parameters of one component"));
  EXPECT_FALSE(actor.SetValue(1.0, 2.0));
  EXPECT_EQ(Edge("Left")->GetConstantValue(), ParamValue(0.0));
}

TEST_F(MultiComponentParamActorTest, CommittingTwiceOrWithoutAValueIsAContractFailure) {
  QuadrupleDoubleFloatSliderComponentParamActor actor(Edges(), 0);
  EXPECT_FALSE(actor.Commit());
  EXPECT_TRUE(Asserted("!mCommitted && mValueSet"));
  actor.SetValue({1, 1, 1, 1});
  EXPECT_TRUE(actor.Commit());
  EXPECT_FALSE(actor.Commit());
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
}

TEST_F(MultiComponentParamActorTest, ACommitTheProjectRefusesLeavesNoUnrecordedChange) {
  const std::string before = Crop();
  AngleAndDoubleFloatSliderComponentParamActor actor(Edge("Left"), Edge("Top"), 0);
  actor.SetValue(10.0, 20.0);
  project->SetReadOnly(true);
  EXPECT_FALSE(actor.Commit());
  EXPECT_EQ(Crop(), before);
  EXPECT_FALSE(Undo().CanUndo());
}

}  // namespace
