#include <gtest/gtest.h>

#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/ButtonParameter.h"
#include "Handlers/EffectControls/Src/OpaqueParameter.h"
#include "Handlers/EffectControls/Src/TimecodeParameter.h"
#include "Handlers/EffectControls/Src/TrackMenuParameter.h"
#include "Host/Messaging/Diagnostics.h"
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
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/TextButton.h"
#include "Host/Toolkit/TextPopup.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr TickTime kSec = kTicksPerSecond;
const TickTime kFrame25 = kFrameRate_25.GetTicksPerFrame();

// A video clip on [0, 10 s) of a sequence with tracks V1 and V2, carrying the catalogue's
// Timecode, Grid Distortion and Matte From Track, and a window whose root view stands in for the
// list; the edit line at 1 s.
class ValueRowTest : public ::testing::Test {
 protected:
  ValueRowTest() {
    for (const char* matchName :
         {kMatchName_Timecode, kMatchName_GridDistortion, kMatchName_MatteFromTrack}) {
      builder.AddEffect(clip, matchName);
    }
    host.SetRootView(listView);
    *editTime = kSec;
  }
  ~ValueRowTest() override {
    for (const auto& row : rows) {
      row->Destroy();
    }
  }

  ComponentParamRef Param(const char* matchName, const char* name) const {
    return clip->GetComponentChain()->FindByMatchName(matchName)->FindParam(name);
  }

  template <class Row>
  std::shared_ptr<Row> Make(const char* matchName, const char* paramName, int groupLevel = 0,
                            int width = 400) {
    ParameterControlInfo info;
    info.parentView = listView.get();
    info.station = "Test.ValueRows";
    info.sequence = sequence;
    info.component = clip->GetComponentChain()->FindByMatchName(matchName);
    info.param = info.component->FindParam(paramName);
    info.trackItem = clip;
    info.editTime = editTime;
    auto row = std::make_shared<Row>(info);
    row->SetGroupLevel(groupLevel);
    row->FinishCreateSelf();
    row->Show();
    row->PositionSelf(0, 0, width);
    rows.push_back(row);
    return row;
  }

  std::vector<std::string> UndoNames() const { return project->GetUndoStack().GetUndoNames(); }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Value rows"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence = builder.AddSequence("Sequence");
  TrackRef v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
  TrackRef v2 = builder.AddTrack(sequence, MediaType::Video, "V2");
  TrackItemRef clip = builder.AddClip(v1, nullptr, {.start = 0, .end = 10 * kSec});
  std::shared_ptr<TickTime> editTime = std::make_shared<TickTime>(0);
  ViewHost host{{400, 300}};
  std::shared_ptr<SubView> listView = std::make_shared<SubView>();
  std::vector<std::shared_ptr<ParameterControl>> rows;
};

// --- Buttons ---

TEST_F(ValueRowTest, AButtonInAGroupIsTallerAndMayBeNarrower) {
  auto inGroup = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid", 1);
  auto alone = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid", 0);
  EXPECT_EQ(inGroup->OwnHeight(), 31);
  EXPECT_EQ(inGroup->GetButton()->GetBounds().Height(), 26);
  EXPECT_EQ(inGroup->GetButton()->GetBounds().Width(), 80);
  EXPECT_EQ(alone->OwnHeight(), 20);
  EXPECT_EQ(alone->GetButton()->GetBounds().Height(), 17);
  EXPECT_EQ(alone->GetButton()->GetBounds().Width(), 140);
  // The button starts at the parameter indent + half the width - 20.
  EXPECT_EQ(alone->GetButton()->GetBounds().left, alone->GetParameterIndentInPixels() + 180);
  EXPECT_EQ(alone->GetButton()->GetBounds().top, 2);
}

TEST_F(ValueRowTest, AButtonIsNeverWiderThanTheRowLeavesRoomFor) {
  auto narrow = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid", 0, 200);
  const Rect bounds = narrow->GetButton()->GetBounds();
  EXPECT_EQ(bounds.right, 200);
  EXPECT_LT(bounds.Width(), 140);
}

TEST_F(ValueRowTest, AButtonIsLabelledWithItsCheckboxNameAndGrowsForALongOne) {
  auto row = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid");
  EXPECT_EQ(row->GetName(), "Reset Grid");
  EXPECT_EQ(row->GetButton()->GetLabel(), "Reset");
  Param(kMatchName_GridDistortion, "Reset Grid")
      ->SetCheckboxDisplayName("Reset every point of the grid to where it started");
  row->SynchToCurrentTime();
  row->PositionSelf(0, 0, 1000);
  EXPECT_EQ(row->GetButton()->GetBounds().Width(), row->GetButton()->GetLabelWidth() + 15);
  EXPECT_GT(row->GetButton()->GetBounds().Width(), 140);
}

TEST_F(ValueRowTest, AClickSetsTheButtonTrueAsOneStepAndShowsNoKeyframes) {
  auto row = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid");
  ASSERT_TRUE(row->GetButton()->Click());
  EXPECT_EQ(Param(kMatchName_GridDistortion, "Reset Grid")->GetConstantValue(), ParamValue(true));
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  // Pressed already: nothing changes, so no step.
  row->GetButton()->Click();
  EXPECT_EQ(UndoNames().size(), 1u);
  std::set<TickTime> times;
  row->GetKeyframeTimes(times, TimeLine::kSequence);
  EXPECT_TRUE(times.empty());
  // No stopwatch: the button is the row's only view.
  EXPECT_FALSE(row->CanTimeVary());
  EXPECT_EQ(listView->GetChildren().size(), 1u);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(Param(kMatchName_GridDistortion, "Reset Grid")->GetConstantValue(), ParamValue(false));
}

TEST_F(ValueRowTest, AClickOnAReadOnlyButtonCommitsNothingAndAssertsNothing) {
  ClearRecordedDebugAssertions();
  Param(kMatchName_GridDistortion, "Reset Grid")->SetReadOnly(true);
  auto row = Make<ButtonParameter>(kMatchName_GridDistortion, "Reset Grid");
  EXPECT_FALSE(row->CanClick());
  EXPECT_TRUE(row->ObeyCommand(ButtonParameter::kButtonCommand));
  EXPECT_EQ(Param(kMatchName_GridDistortion, "Reset Grid")->GetConstantValue(), ParamValue(false));
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

// --- Timecode ---

TEST_F(ValueRowTest, ATimecodeIsStoredInTicksOnWholeFramesOfItsTimebase) {
  auto row = Make<TimecodeParameter>(kMatchName_Timecode, "Starting Timecode");
  ASSERT_NE(row->GetField(), nullptr);
  ASSERT_TRUE(row->GetField()->GetQuantizeFrameRate().has_value());
  EXPECT_EQ(row->GetField()->GetBounds().Width(), 90);
  EXPECT_EQ(row->GetField()->GetBounds().Height(), 15);
  // Ten and a half frames: the start of the tenth is written, in ticks.
  row->OnTimecodeChanged(10 * kFrame25 + kFrame25 / 2);
  EXPECT_EQ(Param(kMatchName_Timecode, "Starting Timecode")->GetConstantValue(),
            ParamValue(static_cast<double>(10 * kFrame25)));
  EXPECT_EQ(row->GetField()->GetTime(), 10 * kFrame25);
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
}

TEST_F(ValueRowTest, TypingATimecodeIsOneStepAndUndoRestoresTheField) {
  auto row = Make<TimecodeParameter>(kMatchName_Timecode, "Starting Timecode");
  HotTimecodeControl& field = *row->GetField();
  const Point at = field.GetBounds().Center();
  host.MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  ASSERT_TRUE(field.IsEditing());
  host.TextInput("00:00:01:10");
  host.KeyDown({KeyCode::kReturn});
  EXPECT_EQ(Param(kMatchName_Timecode, "Starting Timecode")->GetConstantValue(),
            ParamValue(static_cast<double>(35 * kFrame25)));
  EXPECT_EQ(UndoNames().size(), 1u);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(field.GetTime(), 0);
}

TEST_F(ValueRowTest, ScrubbingATimecodeWritesLiveAndCommitsOnceAtTheRelease) {
  auto row = Make<TimecodeParameter>(kMatchName_Timecode, "Starting Timecode");
  row->OnTimecodeChanging(kFrame25);
  row->OnTimecodeChanging(3 * kFrame25);
  EXPECT_EQ(Param(kMatchName_Timecode, "Starting Timecode")->GetConstantValue(),
            ParamValue(static_cast<double>(3 * kFrame25)));
  EXPECT_TRUE(UndoNames().empty());
  row->OnTimecodeChanged(4 * kFrame25);
  EXPECT_EQ(UndoNames().size(), 1u);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(Param(kMatchName_Timecode, "Starting Timecode")->GetConstantValue(), ParamValue(0.0));
}

TEST_F(ValueRowTest, ATimecodeWithoutATimebaseIsNotQuantized) {
  const ComponentRef effect = Component::Create("XO.Test Hold", "Hold", MediaType::Video, false);
  effect->AddParam(
      ComponentParam::Create("Hold At", ParamType::Timecode, 0.0)->SetRange(0.0, 1.0e15));
  builder.AddComponent(clip->GetComponentChain(), effect);
  auto row = Make<TimecodeParameter>("XO.Test Hold", "Hold At");
  EXPECT_FALSE(row->GetTimebase().has_value());
  EXPECT_FALSE(row->GetField()->GetQuantizeFrameRate().has_value());
  row->OnTimecodeChanged(kFrame25 + 7);
  EXPECT_EQ(effect->FindParam("Hold At")->GetConstantValue(),
            ParamValue(static_cast<double>(kFrame25 + 7)));
}

// --- Track menus ---

TEST_F(ValueRowTest, ATrackMenuListsTheSequencesTracksByCommand) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  TextPopup& popup = *row->GetPopup();
  ASSERT_EQ(popup.GetItemCount(), 4);  // None, separator, V1, V2
  EXPECT_EQ(popup.GetItem(0).command, 18600);
  EXPECT_TRUE(popup.GetItem(1).separator);
  EXPECT_EQ(popup.GetItem(2).text, "V1");
  EXPECT_EQ(popup.GetItem(3).command, 18603);
  EXPECT_EQ(popup.GetSelectedIndex(), 0);
  EXPECT_EQ(popup.GetBounds().Width(), 85);
  EXPECT_EQ(popup.GetBounds().Height(), 17);
}

TEST_F(ValueRowTest, SkippedEntriesKeepTheirCommandsSoValuesMapToTheRightItems) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  row->RebuildMenu({"None", "(-", "V1", "~V2", "", "V4"});
  TextPopup& popup = *row->GetPopup();
  ASSERT_EQ(popup.GetItemCount(), 4);
  EXPECT_EQ(popup.GetItem(3).text, "V4");
  EXPECT_EQ(popup.GetItem(3).command, 18605);

  const ComponentParamRef matte = Param(kMatchName_MatteFromTrack, "Matte");
  ASSERT_EQ(ComponentParamActions::SetValue(matte, kSec, ParamChoice{5}), EditStatus::Done);
  EXPECT_EQ(popup.GetSelectedText(), "V4");
  // A value whose entry was skipped, or is the separator, selects nothing.
  ASSERT_EQ(ComponentParamActions::SetValue(matte, kSec, ParamChoice{3}), EditStatus::Done);
  EXPECT_EQ(popup.GetSelectedIndex(), -1);
  ASSERT_EQ(ComponentParamActions::SetValue(matte, kSec, ParamChoice{1}), EditStatus::Done);
  EXPECT_EQ(popup.GetSelectedIndex(), -1);
  EXPECT_EQ(matte->GetConstantValue(), ParamValue(ParamChoice{1}));

  CommandStatus status;
  ASSERT_TRUE(row->FindCommandStatus(18605, status));
  EXPECT_TRUE(status.enabled);
  EXPECT_FALSE(status.checked);
  ASSERT_TRUE(row->FindCommandStatus(18601, status));
  EXPECT_TRUE(status.checked);
}

TEST_F(ValueRowTest, ChoosingATrackIsOneStepThatUndoes) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  EXPECT_TRUE(row->ObeyCommand(18603));
  const ComponentParamRef matte = Param(kMatchName_MatteFromTrack, "Matte");
  EXPECT_EQ(matte->GetConstantValue(), ParamValue(ParamChoice{3}));
  EXPECT_EQ(row->GetPopup()->GetSelectedText(), "V2");
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetValue"});
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(row->GetPopup()->GetSelectedText(), "None");
  // Commands beyond the menu's range are not the row's.
  EXPECT_FALSE(row->ObeyCommand(19000));
}

TEST_F(ValueRowTest, ATrackMenuReadsAtMostFourHundredEntries) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  std::vector<std::string> strings;
  for (int i = 0; i < 450; ++i) {
    strings.push_back("Track " + std::to_string(i));
  }
  row->RebuildMenu(strings);
  TextPopup& popup = *row->GetPopup();
  ASSERT_EQ(popup.GetItemCount(), 400);
  EXPECT_EQ(popup.GetItem(399).command, 18999);
  EXPECT_EQ(popup.GetItem(399).text, "Track 399");
  // No entries: the menu stays as it was.
  row->RebuildMenu({});
  EXPECT_EQ(popup.GetItemCount(), 400);
}

TEST_F(ValueRowTest, ATrackMenuFollowsTracksAddedToTheSequence) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  builder.AddTrack(sequence, MediaType::Video, "V3");
  TextPopup& popup = *row->GetPopup();
  ASSERT_EQ(popup.GetItemCount(), 5);
  EXPECT_EQ(popup.GetItem(4).text, "V3");
  EXPECT_EQ(popup.GetItem(4).command, 18604);
}

TEST_F(ValueRowTest, AReboundTrackMenuFollowsItsNewSequence) {
  auto row = Make<TrackMenuParameter>(kMatchName_MatteFromTrack, "Matte");
  const SequenceRef other = builder.AddSequence("Other");
  const TrackRef only = builder.AddTrack(other, MediaType::Video, "Only");
  const TrackItemRef otherClip = builder.AddClip(only, nullptr, {.start = 0, .end = kSec});
  const ComponentRef matte = builder.AddEffect(otherClip, kMatchName_MatteFromTrack);
  row->UpdateParamBinding(other, matte, matte->FindParam("Matte"), otherClip);
  TextPopup& popup = *row->GetPopup();
  ASSERT_EQ(popup.GetItemCount(), 3);
  EXPECT_EQ(popup.GetItem(2).text, "Only");
  // The first sequence no longer reaches the row; the new one does.
  builder.AddTrack(sequence, MediaType::Video, "V3");
  EXPECT_EQ(popup.GetItemCount(), 3);
  builder.AddTrack(other, MediaType::Video, "Second");
  ASSERT_EQ(popup.GetItemCount(), 4);
  EXPECT_EQ(popup.GetItem(3).text, "Second");
}

// --- Opaque ---

TEST_F(ValueRowTest, AnOpaqueRowHasAStopwatchAndNoControl) {
  auto row = Make<OpaqueParameter>(kMatchName_GridDistortion, "Settings");
  EXPECT_EQ(row->OwnHeight(), 20);
  EXPECT_FALSE(row->CanExpand());
  row->SetIsExpanded(true);
  EXPECT_FALSE(row->IsExpanded());
  ASSERT_TRUE(row->CanTimeVary());
  // The stopwatch is the only view the row put into the list.
  EXPECT_EQ(listView->GetChildren().size(), 1u);
  EXPECT_FALSE(row->SynchParamActor());

  ASSERT_TRUE(row->ObeyCommand(ParameterControl::kToggleTimeVaryingCommand));
  const ComponentParamRef settings = Param(kMatchName_GridDistortion, "Settings");
  EXPECT_TRUE(settings->IsTimeVarying());
  EXPECT_EQ(UndoNames(), std::vector<std::string>{"MZ.ComponentParam.SetTimeVarying"});
  TickTime hit = 0;
  // One pixel a frame from time 0: the keyframe at 1 s sits at x 25.
  EXPECT_TRUE(row->HitKeyframe({27, 5}, 0, kFrameRate_25, hit));
  EXPECT_EQ(hit, kSec);
  EXPECT_FALSE(row->HitKeyframe({40, 5}, 0, kFrameRate_25, hit));
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_FALSE(settings->IsTimeVarying());
}

}  // namespace
