#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TransitionData.h"
#include "Host/Model/UndoStack.h"
#include "Host/Rows/FloatSliderParameter.h"
#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/LinkedPointPickerParameter.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

// The class a row is meant to be: "X" of "X (host Y)".
std::string Meant(const std::string& className) {
  return className.substr(0, className.find(" (host "));
}

class ParameterRowFactoryTest : public ::testing::Test {
 protected:
  ParameterRowFactoryTest() {
    builder.AddComponent(clip->GetComponentChain(), video);
    host.SetRootView(listView);
  }
  ~ParameterRowFactoryTest() override {
    for (const auto& row : made) {
      row->Destroy();
    }
  }

  ParameterRowRequest Request(const ComponentRef& component, ParamType type,
                              ParamValue value = 0.0) {
    ComponentParamRef param = ComponentParam::Create("P", type, std::move(value));
    component->AddParam(param);
    ParameterRowRequest request;
    request.info.parentView = listView.get();
    request.info.station = "Test.EffectList";
    request.info.sequence = sequence;
    request.info.component = component;
    request.info.param = param;
    request.info.trackItem = clip;
    request.info.editTime = editTime;
    return request;
  }

  // The class names of the rows made for the request, each finished and shown as the list does.
  std::vector<std::string> Rows(const ParameterRowRequest& request) {
    std::vector<std::string> names;
    for (const auto& row : ParameterRowFactory::CreateParameterRows(request)) {
      row->FinishCreateSelf();
      row->Show();
      row->PositionSelf(0, 0, 400);
      made.push_back(row);
      names.push_back(Meant(ParameterRowFactory::GetRowClassName(*row)));
    }
    return names;
  }

  std::string Group(ParameterRowRequest request, GroupKind kind) {
    request.info.param->SetGroupKind(kind);
    auto row = ParameterRowFactory::CreateGroupRow(request);
    EXPECT_NE(row, nullptr);
    if (!row) {
      return {};
    }
    row->FinishCreateSelf();
    made.push_back(row);
    return ParameterRowFactory::GetRowClassName(*row);
  }

  using Names = std::vector<std::string>;

  MessagingTestScope messaging;
  ProjectBuilder builder{"Factory"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
  TrackItemRef clip =
      builder.AddClip(track, nullptr, {.start = 0, .end = 10 * kSecond, .withIntrinsics = false});
  ComponentRef video = Component::Create("XO.Test Blur", "Blur", MediaType::Video, false);
  ComponentRef audio = Component::Create("XO.Test Delay", "Delay", MediaType::Audio, false);
  ComponentRef chromil =
      Component::Create(std::string(kMatchnameChromil), "Colour", MediaType::Video, false);
  std::shared_ptr<TickTime> editTime = std::make_shared<TickTime>(0);
  ViewHost host{{400, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
  std::vector<std::shared_ptr<EffectItem>> made;
};

TEST_F(ParameterRowFactoryTest, EachParameterTypeGetsTheRowOfItsTable) {
  EXPECT_EQ(Rows(Request(video, ParamType::Slider)), Names{"SliderParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Angle)), Names{"AngleParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Checkbox, false)), Names{"CheckboxParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Color, ParamColor{0.1f, 0.2f, 0.3f, 1.0f})),
            Names{"ColorPickerParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Point, ParamPoint{1, 2})),
            Names{"PointPickerParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Menu, ParamChoice{0})), Names{"MenuParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::DoubleSlider)), Names{"DoubleSliderParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::TimeRemapping)), Names{"DoubleSliderParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Custom)), Names{"CustomParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::TrackMenu)), Names{"TrackMenuParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Timecode)), Names{"TimecodeParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Button)), Names{"ButtonParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Opaque)), Names{"OpaqueParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Text, std::string("t"))), Names{"TextParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Info, std::string("i"))), Names{"InfoParameter"});
  EXPECT_EQ(Rows(Request(video, ParamType::Spreadsheet, std::string("a;b"))),
            Names{"SpreadsheetParameter"});
}

TEST_F(ParameterRowFactoryTest, GroupMarkersAndUnknownTypesGetNoRow) {
  EXPECT_TRUE(Rows(Request(video, ParamType::GroupBegin)).empty());
  EXPECT_TRUE(Rows(Request(video, ParamType::GroupEnd)).empty());
  EXPECT_TRUE(Rows(Request(video, ParamType::AudioGain)).empty());
  EXPECT_TRUE(Rows(Request(video, static_cast<ParamType>(10))).empty());
  EXPECT_TRUE(Rows(Request(video, static_cast<ParamType>(99))).empty());
}

TEST_F(ParameterRowFactoryTest, AScalarIsAVideoOrAnAudioSliderByTheEffectsMedia) {
  EXPECT_EQ(Rows(Request(video, ParamType::FloatSlider)), Names{"VideoFloatSliderParameter"});
  EXPECT_EQ(Rows(Request(audio, ParamType::FloatSlider)), Names{"AudioFloatSliderParameter"});
}

TEST_F(ParameterRowFactoryTest, TheOwnSliderStyleGivesAnglesAndPointsThePanelsRows) {
  ParameterRowRequest angle = Request(video, ParamType::Angle);
  angle.listStyle = ParameterRowFactory::kOwnSliderRowsStyle;
  EXPECT_EQ(Rows(angle), Names{"AngleSliderParameter"});
  ParameterRowRequest point = Request(video, ParamType::Point, ParamPoint{1, 2});
  point.listStyle = ParameterRowFactory::kOwnSliderRowsStyle | 0x1;
  EXPECT_EQ(Rows(point), (Names{"PointSliderParameter", "PointSliderParameter"}));
}

TEST_F(ParameterRowFactoryTest, TheColourGradingEffectPicksColoursOffscreen) {
  EXPECT_EQ(Rows(Request(chromil, ParamType::Color, ParamColor{0.1f, 0.2f, 0.3f, 1.0f})),
            Names{"OffscreenPickerParameter"});
}

TEST_F(ParameterRowFactoryTest, ACapsulesPointIsLinked) {
  video->SetRole(ComponentRole::Capsule);
  EXPECT_EQ(Rows(Request(video, ParamType::Point, ParamPoint{1, 2})),
            Names{"LinkedPointPickerParameter"});
}

TEST_F(ParameterRowFactoryTest, OnlyATemplatesScaleStartsLinked) {
  video->SetRole(ComponentRole::Capsule);
  ParameterRowRequest scale = Request(video, ParamType::Point, ParamPoint{100, 100});
  scale.info.param = ComponentParam::Create("Scale", ParamType::Point, ParamPoint{100, 100});
  video->AddParam(scale.info.param);
  const auto scaleRows = ParameterRowFactory::CreateParameterRows(scale);
  const auto positionRows =
      ParameterRowFactory::CreateParameterRows(Request(video, ParamType::Point, ParamPoint{1, 2}));
  ASSERT_EQ(scaleRows.size(), 1u);
  ASSERT_EQ(positionRows.size(), 1u);
  made.push_back(scaleRows[0]);
  made.push_back(positionRows[0]);
  const auto* linkedScale = dynamic_cast<LinkedPointPickerParameter*>(scaleRows[0].get());
  const auto* linkedPosition = dynamic_cast<LinkedPointPickerParameter*>(positionRows[0].get());
  ASSERT_NE(linkedScale, nullptr);
  ASSERT_NE(linkedPosition, nullptr);
  EXPECT_TRUE(linkedScale->IsTemplateScale());
  EXPECT_FALSE(linkedPosition->IsTemplateScale());
}

// A typed value is one undoable step.
TEST_F(ParameterRowFactoryTest, AScalarRowEditsItsParameterAsOneUndoableStep) {
  ParameterRowRequest request = Request(video, ParamType::FloatSlider, 10.0);
  request.info.param->SetRange(0, 100);
  const auto rows = ParameterRowFactory::CreateParameterRows(request);
  ASSERT_EQ(rows.size(), 1u);
  made.push_back(rows[0]);
  auto* slider = dynamic_cast<FloatSliderParameter*>(rows[0].get());
  ASSERT_NE(slider, nullptr);
  slider->FinishCreateSelf();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  slider->OnHotFloatControlChanged(42.0f, 0);
  EXPECT_DOUBLE_EQ(request.info.param->GetScalarAt(0).value_or(-1), 42.0);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps + 1);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_DOUBLE_EQ(request.info.param->GetScalarAt(0).value_or(-1), 10.0);
}

TEST_F(ParameterRowFactoryTest, AGraphicsLayersCustomParameterIsAGraphicsRow) {
  video->SetRole(ComponentRole::Graphics);
  EXPECT_EQ(Rows(Request(video, ParamType::Custom)), Names{"GraphicsParameter"});
}

TEST_F(ParameterRowFactoryTest, AStandInSaysWhichHostRowItIs) {
  const auto rows = ParameterRowFactory::CreateParameterRows(Request(video, ParamType::Custom));
  ASSERT_EQ(rows.size(), 1u);
  const std::string name = ParameterRowFactory::GetRowClassName(*rows[0]);
  EXPECT_EQ(name.rfind("CustomParameter (host ", 0), 0u) << name;
  EXPECT_EQ(name.back(), ')');
}

// The dump names these rows by their own classes: no host row stands in for them any more.
TEST_F(ParameterRowFactoryTest, ValueParametersGetThePanelsOwnRowsAndNoStandIn) {
  const auto exact = [this](ParameterRowRequest request) {
    std::vector<std::string> names;
    for (const auto& row : ParameterRowFactory::CreateParameterRows(request)) {
      row->FinishCreateSelf();
      made.push_back(row);
      names.push_back(ParameterRowFactory::GetRowClassName(*row));
    }
    return names;
  };
  ParameterRowRequest angle = Request(video, ParamType::Angle);
  angle.listStyle = ParameterRowFactory::kOwnSliderRowsStyle;
  ParameterRowRequest point = Request(video, ParamType::Point, ParamPoint{1.0, 2.0});
  point.listStyle = ParameterRowFactory::kOwnSliderRowsStyle;
  EXPECT_EQ(exact(Request(video, ParamType::FloatSlider)), Names{"VideoFloatSliderParameter"});
  EXPECT_EQ(exact(angle), Names{"AngleSliderParameter"});
  EXPECT_EQ(exact(point), (Names{"PointSliderParameter", "PointSliderParameter"}));
  EXPECT_EQ(exact(Request(video, ParamType::TrackMenu, ParamChoice{0})),
            Names{"TrackMenuParameter"});
  EXPECT_EQ(exact(Request(video, ParamType::Timecode)), Names{"TimecodeParameter"});
  EXPECT_EQ(exact(Request(video, ParamType::Button, false)), Names{"ButtonParameter"});
  EXPECT_EQ(exact(Request(video, ParamType::Opaque, ParamBlob{})), Names{"OpaqueParameter"});
}

TEST_F(ParameterRowFactoryTest, RowsKeepTheirBinding) {
  ParameterRowRequest request = Request(video, ParamType::Checkbox, true);
  request.info.readOnly = true;
  const auto rows = ParameterRowFactory::CreateParameterRows(request);
  ASSERT_EQ(rows.size(), 1u);
  EXPECT_EQ(rows[0]->GetParam(), request.info.param);
  EXPECT_EQ(rows[0]->GetComponent(), video);
  EXPECT_TRUE(rows[0]->IsReadOnly());
}

TEST_F(ParameterRowFactoryTest, EachGroupKindGetsTheRowOfItsTable) {
  const ParameterRowRequest request = Request(video, ParamType::GroupBegin);
  const std::vector<std::pair<GroupKind, std::string>> table = {
      {GroupKind::HueBalanceAndPhase, "GroupHueBalanceAndPhaseBeginParameter"},
      {GroupKind::ThreeWayHueBalance, "GroupThreeWayHueBalanceBeginParameter"},
      {GroupKind::TonalRangeDefinition, "GroupTonalRangeDefinitionBeginParameter"},
      {GroupKind::Levels, "GroupLevelsBeginParameter"},
      {GroupKind::RGBCurves, "GroupRGBCurvesBeginParameter"},
      {GroupKind::Buttons, "GroupButtonsBeginParameter"},
      {GroupKind::Curve, "GroupCurveBeginParameter"},
      {GroupKind::ColorPickerRange, "GroupColorPickerRangeBeginParameter"},
      {GroupKind::HueRangeDefinition, "GroupHueRangeDefinitionBeginParameter"},
      {GroupKind::SaturationRangeDefinition, "GroupSaturationRangeDefinitionBeginParameter"},
      {GroupKind::LumaRangeDefinition, "GroupLumaRangeDefinitionBeginParameter"},
      {GroupKind::SecondaryColorCorrection, "GroupSecondaryColorCorrectionBeginParameter"},
      {GroupKind::Counted, "GroupBeginParameter"},
      {GroupKind::None, "GroupBeginParameter"},
      {static_cast<GroupKind>(7), "GroupBeginParameter"},
  };
  for (const auto& [kind, expected] : table) {
    EXPECT_EQ(Meant(Group(request, kind)), expected) << static_cast<int>(kind);
  }
}

TEST_F(ParameterRowFactoryTest, AButtonsGroupOfAMaskIsTheTrackerButtons) {
  ParameterRowRequest request = Request(video, ParamType::GroupBegin);
  request.componentIsMask = true;
  EXPECT_EQ(Meant(Group(request, GroupKind::Buttons)), "GroupTrackerButtonsBeginParameter");
}

TEST_F(ParameterRowFactoryTest, GroupRowsAreFoldersThatRememberTheirState) {
  const ParameterRowRequest request = Request(video, ParamType::GroupBegin);
  request.info.param->SetGroupKind(GroupKind::Levels);
  auto row = ParameterRowFactory::CreateGroupRow(request);
  ASSERT_NE(row, nullptr);
  made.push_back(row);
  EXPECT_TRUE(row->IsFolder());
  row->SetIsExpanded(true);
  EXPECT_TRUE(video->GetExpansionProperties().GetBool(row->GetExpandedPropertyKey(), false));
}

TEST_F(ParameterRowFactoryTest, AMissingParameterIsRefusedWithAnAssertion) {
  ClearRecordedDebugAssertions();
  ParameterRowRequest request;
  request.info.component = video;
  EXPECT_TRUE(ParameterRowFactory::CreateParameterRows(request).empty());
  EXPECT_EQ(ParameterRowFactory::CreateGroupRow(request), nullptr);
  ASSERT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "Invalid ComponentParam");
}

TEST_F(ParameterRowFactoryTest, TheOtherRowsStandInForTheirClasses) {
  TransitionData data;
  data.matchName = "XO.Test CrossDissolve";
  data.displayName = "Cross Dissolve";
  TrackItemRef transition = TrackItem::CreateTransition(MediaType::Video, 0, kSecond, data);
  const StationName station = "Test.EffectList";
  EXPECT_EQ(Meant(ParameterRowFactory::GetRowClassName(
                *ParameterRowFactory::CreateMaskShapeRow(listView.get(), station, video))),
            "MaskShapeControl");
  EXPECT_EQ(
      Meant(ParameterRowFactory::GetRowClassName(
          *ParameterRowFactory::CreateCustomAudioFilterRow(listView.get(), station, audio, false))),
      "CustomAudioFilterItem");
  auto videoTransition =
      ParameterRowFactory::CreateVideoTransitionRow(listView.get(), station, transition);
  EXPECT_EQ(Meant(ParameterRowFactory::GetRowClassName(*videoTransition)), "VideoTransitionItem");
  EXPECT_EQ(videoTransition->GetName(), transition->GetName());
  EXPECT_EQ(
      Meant(ParameterRowFactory::GetRowClassName(
          *ParameterRowFactory::CreateAudioTransitionRow(listView.get(), station, transition))),
      "AudioTransitionItem");
}

TEST_F(ParameterRowFactoryTest, ControlsStillToComeTakeNoRoomInTheList) {
  auto maskShape =
      ParameterRowFactory::CreateMaskShapeRow(listView.get(), "Test.EffectList", video);
  auto custom = ParameterRowFactory::CreateCustomAudioFilterRow(listView.get(), "Test.EffectList",
                                                                audio, true);
  for (const auto& row : {maskShape, custom}) {
    row->FinishCreateSelf();
    row->Show();
    row->PositionSelf(40, 0, 400);
    EXPECT_EQ(row->Height(), 0);
    EXPECT_FALSE(row->IsSelectable());
    row->Destroy();
  }
}

TEST_F(ParameterRowFactoryTest, AnEffectRowIsAFilterItem) {
  auto row = std::make_shared<FilterItem>(MediaType::Video, video, clip, sequence, nullptr,
                                          FilterItemOptions{}, "Test.EffectList", listView.get());
  EXPECT_EQ(ParameterRowFactory::GetRowClassName(*row), "FilterItem");
}

}  // namespace
