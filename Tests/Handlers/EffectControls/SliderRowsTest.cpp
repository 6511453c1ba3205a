#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/AngleSliderParameter.h"
#include "Handlers/EffectControls/Src/PointSliderParameter.h"
#include "Handlers/EffectControls/Src/VideoFloatSliderParameter.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/AngleControl.h"
#include "Host/Toolkit/FloatSliderControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Model/MessageRecorder.h"

namespace {

constexpr TickTime kSec = kTicksPerSecond;
const StationName kStation = "Test.SliderRows";

// A video clip on [0, 10 s) of a 1920 x 1080 sequence with the catalogue's Motion and Opacity,
// and a window whose root view stands in for the list; the edit line at 2 s.
class SliderRowTest : public ::testing::Test {
 protected:
  SliderRowTest() {
    host.SetRootView(listView);
    *editTime = 2 * kSec;
  }
  ~SliderRowTest() override {
    for (const auto& row : rows) {
      row->Destroy();
    }
  }

  ParameterControlInfo Info(const char* matchName, const char* paramName) const {
    ParameterControlInfo info;
    info.parentView = listView.get();
    info.station = kStation;
    info.sequence = sequence;
    info.component = clip->GetComponentChain()->FindByMatchName(matchName);
    info.param = info.component->FindParam(paramName);
    info.trackItem = clip;
    info.editTime = editTime;
    return info;
  }

  template <class Row, class... Args>
  std::shared_ptr<Row> Make(const ParameterControlInfo& info, Args... args) {
    auto row = std::make_shared<Row>(info, args...);
    row->FinishCreateSelf();
    row->Show();
    row->SetIsExpanded(true);
    row->PositionSelf(0, 0, 400);
    rows.push_back(row);
    return row;
  }

  ComponentParamRef Param(const char* matchName, const char* name) const {
    return clip->GetComponentChain()->FindByMatchName(matchName)->FindParam(name);
  }
  ParamValue ValueAt(const ComponentParamRef& param) const {
    return param->GetValueAt(clip->SequenceTimeToClipTime(SequenceTime(*editTime)).Ticks());
  }
  std::vector<std::string> UndoNames() const { return project->GetUndoStack().GetUndoNames(); }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Slider rows"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
  TrackItemRef clip = builder.AddClip(track, nullptr, {.start = 0, .end = 10 * kSec});
  std::shared_ptr<TickTime> editTime = std::make_shared<TickTime>(0);
  ViewHost host{{400, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
  std::vector<std::shared_ptr<ParameterControl>> rows;
};

// --- Video number rows ---

TEST_F(SliderRowTest, AVideoRowAnnouncesEveryStepAlsoOneThatOnlyShowsTheValue) {
  auto row = Make<VideoFloatSliderParameter>(Info(kMatchName_Opacity, "Opacity"));
  MessageRecorder recorder;
  recorder.Listen(kStation);

  row->OnSliderValueChanging(40.0f, false);
  EXPECT_EQ(recorder.Count("ParameterControlValueChangingMessage"), 1);
  EXPECT_EQ(ValueAt(Param(kMatchName_Opacity, "Opacity")), ParamValue(100.0));

  row->OnSliderValueChanging(50.0f, true);
  EXPECT_EQ(recorder.Count("ParameterControlValueChangingMessage"), 2);
  // Live: the model has it, the history not yet.
  EXPECT_EQ(ValueAt(Param(kMatchName_Opacity, "Opacity")), ParamValue(50.0));
  EXPECT_TRUE(UndoNames().empty());

  row->OnSliderValueChanged(55.0f, true);
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(ValueAt(Param(kMatchName_Opacity, "Opacity")), ParamValue(100.0));
}

TEST_F(SliderRowTest, StoppingThePlayerCommitsAVideoRowsOpenEditAsOneStep) {
  auto row = Make<VideoFloatSliderParameter>(Info(kMatchName_Opacity, "Opacity"));
  row->OnSliderValueChanging(30.0f, true);
  row->OnSliderValueChanging(20.0f, true);
  ASSERT_TRUE(row->IsEditOpen());
  sequence->SetPlayerState(PlayerState::Playing);
  sequence->SetPlayerState(PlayerState::Stopped);
  EXPECT_FALSE(row->IsEditOpen());
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  EXPECT_EQ(ValueAt(Param(kMatchName_Opacity, "Opacity")), ParamValue(20.0));
}

TEST_F(SliderRowTest, TheTitleStopsTenPixelsBeforeTheField) {
  auto video = Make<VideoFloatSliderParameter>(Info(kMatchName_Opacity, "Opacity"));
  auto angle = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  auto point = Make<PointSliderParameter>(Info(kMatchName_Motion, "Position"),
                                          PointSliderParameter::Coordinate::X);
  for (const SliderParameter* row :
       {static_cast<SliderParameter*>(video.get()), static_cast<SliderParameter*>(angle.get()),
        static_cast<SliderParameter*>(point.get())}) {
    ASSERT_NE(row->GetHotText(), nullptr);
    EXPECT_EQ(row->GetTitleRightEdge(), row->GetHotText()->GetBounds().left - 10);
  }
}

// --- Angle rows ---

TEST(AngleTurns, SplitIntoWholeTurnsAndARestAboveMinusAHalfTurn) {
  const auto split = [](double angle) {
    const auto turns = AngleSliderParameter::SplitTurns(angle);
    return std::vector<double>{turns.turns, turns.degrees};
  };
  EXPECT_EQ(split(0.0), (std::vector<double>{0.0, 0.0}));
  EXPECT_EQ(split(720.0), (std::vector<double>{2.0, 0.0}));
  EXPECT_EQ(split(180.0), (std::vector<double>{0.0, 180.0}));
  EXPECT_EQ(split(181.0), (std::vector<double>{1.0, -179.0}));
  EXPECT_EQ(split(900.0), (std::vector<double>{2.0, 180.0}));
  EXPECT_EQ(split(-190.0), (std::vector<double>{-1.0, 170.0}));
  EXPECT_EQ(split(-180.0), (std::vector<double>{-1.0, 180.0}));
}

// Rotation keeps whole turns: a row that folded 720 into +-180 would write 181 or 180 for a
// nudge and lose two turns.
TEST_F(SliderRowTest, AnAngleKeepsItsTurnsAndANudgeWritesTheNextDegree) {
  ASSERT_EQ(ComponentParamActions::SetValue(Param(kMatchName_Motion, "Rotation"), 2 * kSec, 720.0),
            EditStatus::Done);
  project->GetUndoStack().Clear();
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 0.0);
  ASSERT_NE(row->GetTurnsField(), nullptr);
  EXPECT_DOUBLE_EQ(row->GetTurnsField()->GetValue(), 2.0);
  EXPECT_DOUBLE_EQ(row->GetDial()->GetValue(), 720.0);

  row->OnHotFloatControlChanged(1.0f, row->GetControlID());
  EXPECT_EQ(ValueAt(Param(kMatchName_Motion, "Rotation")), ParamValue(721.0));
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(ValueAt(Param(kMatchName_Motion, "Rotation")), ParamValue(720.0));
  EXPECT_DOUBLE_EQ(row->GetTurnsField()->GetValue(), 2.0);
}

TEST_F(SliderRowTest, ADragPastHalfATurnKeepsTheTurnsItBeganWith) {
  ASSERT_EQ(ComponentParamActions::SetValue(Param(kMatchName_Motion, "Rotation"), 2 * kSec, 720.0),
            EditStatus::Done);
  project->GetUndoStack().Clear();
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  row->OnFloatSliderControlChanging(-170.0f, 0);
  row->OnFloatSliderControlChanging(-180.0f, 0);
  EXPECT_EQ(ValueAt(Param(kMatchName_Motion, "Rotation")), ParamValue(540.0));
  row->OnFloatSliderControlChanging(-179.0f, 0);
  EXPECT_EQ(ValueAt(Param(kMatchName_Motion, "Rotation")), ParamValue(541.0));
  row->OnFloatSliderControlChanged(-179.0f, 0);
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  // Read afresh, 541 is two turns less 179.
  EXPECT_DOUBLE_EQ(row->GetTurnsField()->GetValue(), 2.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), -179.0);
}

TEST_F(SliderRowTest, TheTurnsFieldWritesWholeTurnsAndKeepsTheRest) {
  ASSERT_EQ(ComponentParamActions::SetValue(Param(kMatchName_Motion, "Rotation"), 2 * kSec, 30.0),
            EditStatus::Done);
  project->GetUndoStack().Clear();
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  row->OnHotFloatControlChanged(-2.0f, AngleSliderParameter::kTurnsFieldCookie);
  EXPECT_EQ(ValueAt(Param(kMatchName_Motion, "Rotation")), ParamValue(-690.0));
  EXPECT_EQ(UndoNames().size(), 1u);
}

// Feedback shows another parameter's angle without binding to it: no edit goes there, and the
// next refresh shows the row's own angle again.
TEST_F(SliderRowTest, FeedbackShowsAnotherAngleUntilTheNextRefresh) {
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  ComponentParamRef feedback = ComponentParam::Create("Feedback", ParamType::Angle, 400.0);
  feedback->SetRange(-1.0e6, 1.0e6);
  row->SynchToFeedback(feedback);
  EXPECT_DOUBLE_EQ(row->GetTurnsField()->GetValue(), 1.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 40.0);
  EXPECT_EQ(row->GetParam(), Param(kMatchName_Motion, "Rotation"));
  row->SynchToCurrentTime();
  EXPECT_DOUBLE_EQ(row->GetTurnsField()->GetValue(), 0.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), 0.0);
}

TEST_F(SliderRowTest, AnAngleRowAlwaysSpansAHalfTurnEachWayWhateverTheRange) {
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  EXPECT_FLOAT_EQ(row->GetSlider()->GetMinValue(), -180.0f);
  EXPECT_FLOAT_EQ(row->GetSlider()->GetMaxValue(), 180.0f);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetMinValue(), -180.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetMaxValue(), 180.0);
  EXPECT_EQ(row->GetMinLabel(), "-180");
  EXPECT_EQ(row->GetMaxLabel(), "180");
  EXPECT_EQ(row->GetValueGraphMinimumHeight(), 54);
  EXPECT_EQ(row->GetVelocityGraphMinimumHeight(), 54);
  // Rotation's range is two million degrees: a hundredth is far above 0.1.
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValueIncrement(), 1.0);
}

TEST_F(SliderRowTest, AnAngleRowWritesAKeyframeWhenTheAngleVaries) {
  const ComponentParamRef rotation = Param(kMatchName_Motion, "Rotation");
  ASSERT_EQ(ComponentParamActions::SetTimeVarying(rotation, true, 0), EditStatus::Done);
  project->GetUndoStack().Clear();
  auto row = Make<AngleSliderParameter>(Info(kMatchName_Motion, "Rotation"));
  row->OnHotFloatControlChanged(45.0f, 0);
  EXPECT_EQ(rotation->GetKeyframeTimes(), (std::vector<TickTime>{0, 2 * kSec}));
  EXPECT_EQ(UndoNames().size(), 1u);
  std::set<TickTime> times;
  row->GetKeyframeTimes(times, TimeLine::kSequence);
  EXPECT_EQ(times, (std::set<TickTime>{0, 2 * kSec}));
}

// The increment rule at its edges: r is a hundredth of the parameter's range.
TEST(AngleIncrement, IsOneAboveATenthAndATenthAtOrBelow) {
  const ComponentRef effect = Component::Create("XO.Test Spin", "Spin", MediaType::Video, false);
  const auto angle = [&](double maximum) {
    ComponentParamRef param = ComponentParam::Create("Angle", ParamType::Angle, 0.0);
    param->SetRange(0.0, maximum);
    return AngleSliderParameter::ComputeValueIncrement(*param, effect->GetMatchName(), 1);
  };
  EXPECT_DOUBLE_EQ(angle(10.01), 1.0);  // r = 0.1001
  EXPECT_DOUBLE_EQ(angle(10.0), 0.1);   // r = 0.1 exactly: not above
  EXPECT_DOUBLE_EQ(angle(9.99), 0.1);
  EXPECT_DOUBLE_EQ(angle(0.5), 0.1);
}

TEST(AngleIncrement, TheWriteOnEffectsThirdParameterTakesHundredthsOnATinyRange) {
  const auto increment = [](std::string_view matchName, std::size_t index, double maximum) {
    ComponentParamRef param = ComponentParam::Create("Angle", ParamType::Angle, 0.0);
    param->SetRange(0.0, maximum);
    return AngleSliderParameter::ComputeValueIncrement(*param, matchName, index);
  };
  const std::string_view writeOn = AngleSliderParameter::kWriteOnMatchName;
  EXPECT_DOUBLE_EQ(increment(writeOn, 2, 1.0), 0.01);    // r = 0.01
  EXPECT_DOUBLE_EQ(increment(writeOn, 2, 0.5), 0.01);    // r = 0.005
  EXPECT_DOUBLE_EQ(increment(writeOn, 2, 1.01), 0.1);    // r just above 0.01
  EXPECT_DOUBLE_EQ(increment(writeOn, 3, 1.0), 0.1);     // another parameter
  EXPECT_DOUBLE_EQ(increment("XO.Other", 2, 1.0), 0.1);  // another effect
  EXPECT_DOUBLE_EQ(increment(writeOn, 2, 100.0), 1.0);
}

TEST(AngleIncrement, AnExponentialAngleStepsByATenth) {
  ComponentParamRef param = ComponentParam::Create("Angle", ParamType::Angle, 0.0);
  param->SetRange(0.0, 1000.0)->SetExponent(2.0);
  EXPECT_DOUBLE_EQ(AngleSliderParameter::ComputeValueIncrement(*param, "XO.Any", 1),
                   static_cast<double>(0.1f));
}

// --- Point rows ---

TEST_F(SliderRowTest, APointRowsSliderSpansHalfAFrameBeyondEachEdge) {
  auto x = Make<PointSliderParameter>(Info(kMatchName_Motion, "Position"),
                                      PointSliderParameter::Coordinate::X);
  auto y = Make<PointSliderParameter>(Info(kMatchName_Motion, "Position"),
                                      PointSliderParameter::Coordinate::Y);
  EXPECT_FLOAT_EQ(x->GetSlider()->GetMinValue(), -960.0f);
  EXPECT_FLOAT_EQ(x->GetSlider()->GetMaxValue(), 2880.0f);
  EXPECT_FLOAT_EQ(y->GetSlider()->GetMinValue(), -540.0f);
  EXPECT_FLOAT_EQ(y->GetSlider()->GetMaxValue(), 1620.0f);
  EXPECT_EQ(x->GetMinLabel(), "-960");
  EXPECT_EQ(y->GetMaxLabel(), "1620");
  EXPECT_DOUBLE_EQ(x->GetHotText()->GetValue(), 960.0);
  EXPECT_DOUBLE_EQ(y->GetHotText()->GetValue(), 540.0);

  // An odd extent truncates toward zero.
  ASSERT_TRUE(sequence->SetFrameSize({721, 405}));
  x->RefreshSliderParameters();
  EXPECT_FLOAT_EQ(x->GetSlider()->GetMinValue(), -360.0f);
  EXPECT_FLOAT_EQ(x->GetSlider()->GetMaxValue(), 1081.0f);
  EXPECT_EQ(PointSliderParameter::SliderMinimumFor(405), -202);
  EXPECT_EQ(PointSliderParameter::SliderMaximumFor(405), 607);
}

TEST_F(SliderRowTest, DraggingOneCoordinateWritesTheOtherUnchanged) {
  const ComponentParamRef position = Param(kMatchName_Motion, "Position");
  ASSERT_EQ(ComponentParamActions::SetValue(position, 2 * kSec, ParamPoint{100.0, 200.0}),
            EditStatus::Done);
  project->GetUndoStack().Clear();
  auto x = Make<PointSliderParameter>(Info(kMatchName_Motion, "Position"),
                                      PointSliderParameter::Coordinate::X);
  auto y = Make<PointSliderParameter>(Info(kMatchName_Motion, "Position"),
                                      PointSliderParameter::Coordinate::Y);
  x->OnFloatSliderControlChanging(150.0f, 0);
  x->OnFloatSliderControlChanging(300.0f, 0);
  x->OnFloatSliderControlChanged(310.0f, 0);
  EXPECT_EQ(ValueAt(position), ParamValue(ParamPoint{310.0, 200.0}));
  y->OnHotFloatControlChanged(-20.0f, 0);
  EXPECT_EQ(ValueAt(position), ParamValue(ParamPoint{310.0, -20.0}));
  EXPECT_EQ(UndoNames().size(), 2u);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(ValueAt(position), ParamValue(ParamPoint{310.0, 200.0}));
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(ValueAt(position), ParamValue(ParamPoint{100.0, 200.0}));
  EXPECT_DOUBLE_EQ(x->GetHotText()->GetValue(), 100.0);
}

}  // namespace
