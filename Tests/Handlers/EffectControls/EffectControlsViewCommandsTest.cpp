#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Tests/Handlers/EffectControls/EffectControlsViewTestSupport.h"

namespace {

using namespace panel_view_test;
using View = EffectControlsView;

constexpr TickTime kFrame = kSec / 25;

CommandStatus StatusOf(EffectControlsView& view, CommandID command) {
  CommandStatus status;
  EXPECT_TRUE(view.FindCommandStatus(command, status)) << command;
  return status;
}

// A 25 fps clip at [2 s, 12 s] selected in an 800 x 400 panel.
class PanelCommandTest : public PanelViewTest {
 protected:
  void SetUp() override {
    clip = AddClip(v1, 2 * kSec, 12 * kSec);
    Open({800, 400});
    sequence->SetSelection({clip});
    ASSERT_EQ(view->GetTargetMode(), View::kTargetClip);
  }

  UndoStack& Undo() { return project->GetUndoStack(); }
  void Broadcast(const Message& message) {
    BroadcastMessage(view->GetTimeRuler()->GetStation(), message);
  }

  TrackItemRef clip;
};

TEST_F(PanelCommandTest, TogglesAnswerTheirCheckedStateAndFlipIt) {
  EXPECT_TRUE(StatusOf(*view, View::kToggleKeyframesCommand).checked);
  EXPECT_TRUE(StatusOf(*view, View::kPinToClipCommand).enabled);
  EXPECT_TRUE(StatusOf(*view, View::kPinToClipCommand).checked);
  EXPECT_FALSE(StatusOf(*view, View::kAudioTimeUnitsCommand).checked);
  EXPECT_TRUE(StatusOf(*view, View::kRulerNumbersCommand).checked);

  view->ObeyCommand(View::kRulerNumbersCommand);
  EXPECT_FALSE(view->GetTimeRuler()->AreNumbersShown());
  EXPECT_FALSE(StatusOf(*view, View::kRulerNumbersCommand).checked);

  view->ObeyCommand(View::kToggleKeyframesCommand);
  EXPECT_FALSE(StatusOf(*view, View::kToggleKeyframesCommand).checked);
  EXPECT_FALSE(StatusOf(*view, View::kZoomInCommand).enabled);  // nothing to zoom while hidden
}

TEST_F(PanelCommandTest, PinToClipIsOffWithoutAClipAndUnpinningShowsTheSequence) {
  AddClip(v1, 20 * kSec, 30 * kSec);  // the sequence now ends at 30 s
  view->ObeyCommand(View::kPinToClipCommand);
  EXPECT_FALSE(view->IsPinned());
  EXPECT_FALSE(view->GetKeyframeView()->IsPinnedToClip());
  EXPECT_EQ(view->GetZoomLimiter().GetMinTime(), 0);
  EXPECT_EQ(view->GetZoomLimiter().GetMaxTime(), 30 * kSec);
  view->ObeyCommand(View::kPinToClipCommand);
  EXPECT_EQ(view->GetZoomLimiter().GetMinTime(), 2 * kSec);
  EXPECT_EQ(view->GetZoomLimiter().GetMaxTime(), 12 * kSec);

  sequence->ClearSelection();
  EXPECT_FALSE(StatusOf(*view, View::kPinToClipCommand).enabled);
  view->ObeyCommand(View::kPinToClipCommand);
  EXPECT_TRUE(view->IsPinned());  // not flipped without a clip
}

TEST_F(PanelCommandTest, SnappingCommandsFlipTheKeyframeAreaAndThePreferences) {
  const PropertyList& properties = Preferences::Application().Properties();
  EffectControlsKeyframeView& area = *view->GetKeyframeView();
  ASSERT_TRUE(area.IsSnapFlagSet(EffectControlsKeyframeView::kSnapKeyframes));
  view->ObeyCommand(View::kToggleSnappingCommand);
  EXPECT_FALSE(area.IsSnapFlagSet(EffectControlsKeyframeView::kSnapKeyframes));
  EXPECT_FALSE(properties.GetBool("effect.controls.is.keyframe.snapping", true));
  EXPECT_FALSE(StatusOf(*view, View::kToggleSnappingCommand).checked);

  view->ObeyCommand(View::kSnapToMarkersCommand);
  EXPECT_FALSE(properties.GetBool("effect.controls.is.snapping.to.sequence.markers", true));
  view->ObeyCommand(View::kSnapToNoneCommand);
  EXPECT_EQ(area.GetSnapFlags() & EffectControlsKeyframeView::kSnapTargets, 0U);
  EXPECT_FALSE(properties.GetBool("effect.controls.issnapping.to.video", true));
  EXPECT_FALSE(properties.GetBool("effect.controls.is.snapping.to.clip", true));
  view->ObeyCommand(View::kSnapToAllCommand);
  EXPECT_EQ(area.GetSnapFlags(), EffectControlsKeyframeView::kSnapTargets);  // master still off
  EXPECT_TRUE(StatusOf(*view, View::kSnapToCurrentTimeCommand).checked);

  // A new keyframe area starts from the stored flags.
  EffectControlsKeyframeView fresh;
  EXPECT_EQ(fresh.GetSnapFlags(), area.GetSnapFlags());
}

TEST_F(PanelCommandTest, AReadOnlySnappingPreferenceKeepsItsFlag) {
  Preferences::Application().Properties().SetReadOnly("effect.controls.issnapping.to.audio", true);
  view->ObeyCommand(View::kSnapToAudioCommand);
  EXPECT_TRUE(view->GetKeyframeView()->IsSnapFlagSet(EffectControlsKeyframeView::kSnapAudio));
  Preferences::Application().Properties().SetReadOnly("effect.controls.issnapping.to.audio", false);
}

TEST_F(PanelCommandTest, MarkInAndOutAtTheCurrentTimeAreFrameAlignedAndUndoable) {
  sequence->SetCurrentTime(3 * kSec + kFrame / 2);  // half way into a frame
  view->ObeyCommand(View::kMarkInCommand);
  EXPECT_EQ(sequence->GetInPoint(), 3 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetInMark(), 3 * kSec);
  sequence->SetCurrentTime(8 * kSec);
  view->ObeyCommand(View::kMarkOutCommand);
  EXPECT_EQ(sequence->GetOutPoint(), 8 * kSec);

  view->ObeyCommand(View::kGoToInCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 3 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetCurrentTime(), 3 * kSec);
  view->ObeyCommand(View::kGoToOutCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 8 * kSec);

  view->ObeyCommand(View::kClearInOutCommand);
  EXPECT_FALSE(sequence->GetInPoint().has_value());
  EXPECT_FALSE(view->GetTimeRuler()->GetOutMark().has_value());
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(sequence->GetInPoint(), 3 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetOutMark(), 8 * kSec);
}

TEST_F(PanelCommandTest, GoToInWithoutAnInPointGoesToZero) {
  sequence->SetCurrentTime(5 * kSec);
  view->ObeyCommand(View::kGoToInCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
}

TEST_F(PanelCommandTest, ARulerMarkDragSetsThePointOnceAtTheRelease) {
  const std::size_t steps = Undo().GetUndoNames().size();
  Broadcast(MarkInTimeChangingMessage(4 * kSec));
  Broadcast(MarkInTimeChangingMessage(5 * kSec));
  EXPECT_FALSE(sequence->GetInPoint().has_value());
  Broadcast(MarkInTimeChangedMessage(5 * kSec + 3));
  EXPECT_EQ(sequence->GetInPoint(), 5 * kSec);  // snapped to its frame
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);

  // Out before in is refused by the model; the ruler shows the points as they are.
  Broadcast(MarkOutTimeChangedMessage(4 * kSec));
  EXPECT_FALSE(sequence->GetOutPoint().has_value());
  EXPECT_FALSE(view->GetTimeRuler()->GetOutMark().has_value());

  Broadcast(MarkInOutTimeChangedMessage(6 * kSec, 9 * kSec));
  EXPECT_EQ(sequence->GetInPoint(), 6 * kSec);
  EXPECT_EQ(sequence->GetOutPoint(), 9 * kSec);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(sequence->GetInPoint(), 5 * kSec);
  EXPECT_FALSE(view->GetTimeRuler()->GetOutMark().has_value());
}

TEST_F(PanelCommandTest, MarkersAreAddedNavigatedSelectedAndRemoved) {
  sequence->SetCurrentTime(4 * kSec);
  view->ObeyCommand(View::kAddMarkerCommand);
  sequence->SetCurrentTime(9 * kSec);
  view->ObeyCommand(View::kFirstColoredMarkerCommand + 3);
  ASSERT_EQ(sequence->GetMarkers().Size(), 2U);
  EXPECT_EQ(sequence->GetMarkers().At(1).colorIndex, 3);
  MessageLoop::Instance().RunPending();  // marker reloads are posted
  ASSERT_EQ(view->GetTimeRuler()->GetMarkers().size(), 2U);

  view->ObeyCommand(View::kPreviousMarkerCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSec);
  EXPECT_TRUE(view->GetMarkers().IsSelected(1));
  EXPECT_FALSE(view->GetMarkers().IsSelected(2));
  view->ObeyCommand(View::kNextMarkerCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 9 * kSec);
  EXPECT_TRUE(view->GetMarkers().IsSelected(2));
  view->ObeyCommand(View::kNextMarkerCommand);  // none after: stays
  EXPECT_EQ(sequence->GetCurrentTime(), 9 * kSec);

  view->ObeyCommand(View::kClearMarkerCommand);
  EXPECT_EQ(sequence->GetMarkers().Size(), 1U);
  sequence->SetCurrentTime(4 * kSec);
  view->ObeyCommand(View::kClearMarkerCommand);  // at 4 s, but not selected
  EXPECT_EQ(sequence->GetMarkers().Size(), 1U);

  view->ObeyCommand(View::kClearAllMarkersCommand);
  EXPECT_TRUE(sequence->GetMarkers().IsEmpty());
  EXPECT_TRUE(view->GetTimeRuler()->GetMarkers().empty());
  ASSERT_TRUE(Undo().Undo());
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().size(), 1U);
}

TEST_F(PanelCommandTest, ADraggedMarkerMovesOnceLaterOnTheUIThread) {
  Marker marker;
  marker.time = 5 * kSec;
  ASSERT_EQ(MarkerActions::AddMarker(sequence, marker), EditStatus::Done);
  MessageLoop::Instance().RunPending();
  Broadcast(MarkerTimeChangingMessage(1, 5 * kSec, 6 * kSec));
  Broadcast(MarkerTimeChangedMessage(1, 5 * kSec, 7 * kSec + 5));
  EXPECT_EQ(sequence->GetMarkers().At(0).time, 5 * kSec);  // not yet
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(sequence->GetMarkers().At(0).time, 7 * kSec);
  ASSERT_EQ(view->GetTimeRuler()->GetMarkers().size(), 1U);
  EXPECT_EQ(view->GetTimeRuler()->GetMarkers().front().time, 7 * kSec);
  // A marker id that no longer exists is ignored.
  Broadcast(MarkerTimeChangedMessage(9, 5 * kSec, 8 * kSec));
  MessageLoop::Instance().RunPending();
  EXPECT_EQ(sequence->GetMarkers().At(0).time, 7 * kSec);
}

TEST_F(PanelCommandTest, TheRulersRightButtonMenuRoutesItsCommandToTheView) {
  Menu menu{View::kSequenceMarkerMenu};
  menu.AddCommand(View::kAddMarkerCommand, "Add Marker");
  MenuRegistry::Instance().Register(menu);
  auto tracker = std::make_shared<ScriptedMenuTracker>();
  tracker->PushAnswer(View::kAddMarkerCommand);
  const auto previous = SetMenuTrackerForTesting(tracker);
  sequence->SetCurrentTime(6 * kSec);
  Broadcast(TimebarRightButtonDownMessage(Point{40, 8}, 6 * kSec, kKeyModifierNone));
  SetMenuTrackerForTesting(previous);
  MenuRegistry::Instance().Remove(View::kSequenceMarkerMenu);
  ASSERT_EQ(tracker->GetRequests().size(), 1U);
  EXPECT_EQ(tracker->GetRequests().front().menuName, View::kSequenceMarkerMenu);
  ASSERT_EQ(sequence->GetMarkers().Size(), 1U);
  EXPECT_EQ(sequence->GetMarkers().At(0).time, 6 * kSec);
}

TEST_F(PanelCommandTest, AReadOnlySequenceTakesEditingCommandsAndDoesNothing) {
  sequence->SetReadOnly(true);
  EXPECT_FALSE(StatusOf(*view, View::kMarkInCommand).enabled);
  EXPECT_FALSE(StatusOf(*view, View::kAddMarkerCommand).enabled);
  EXPECT_TRUE(StatusOf(*view, View::kGoToInCommand).enabled);  // navigation is no edit
  EXPECT_TRUE(view->ObeyCommand(View::kMarkInCommand));
  EXPECT_TRUE(view->ObeyCommand(View::kAddMarkerCommand));
  EXPECT_FALSE(sequence->GetInPoint().has_value());
  EXPECT_TRUE(sequence->GetMarkers().IsEmpty());
}

TEST_F(PanelCommandTest, CommandsWithNothingToActOnAreOff) {
  EXPECT_FALSE(StatusOf(*view, View::kBlendModeNextCommand).enabled);
  EXPECT_FALSE(StatusOf(*view, View::kFirstCapsuleResetCommand + 4).enabled);
  EXPECT_FALSE(StatusOf(*view, View::kPlayAudioCommand).enabled);  // no audio part
  EXPECT_FALSE(StatusOf(*view, View::kLoopAudioCommand).enabled);
}

TEST_F(PanelCommandTest, TheRulersTimeDragScrubsTheSequence) {
  Broadcast(EditTimeChangingMessage(5 * kSec));
  EXPECT_EQ(sequence->GetCurrentTime(), 5 * kSec);
  EXPECT_EQ(sequence->GetPlayerState(), PlayerState::Scrubbing);
  EXPECT_EQ(view->GetKeyframeView()->GetEditTime(), 5 * kSec);
  Broadcast(EditTimeChangedMessage(6 * kSec));
  EXPECT_EQ(sequence->GetCurrentTime(), 6 * kSec);
  EXPECT_EQ(sequence->GetPlayerState(), PlayerState::Stopped);
  EXPECT_EQ(view->GetTimecodeControl()->GetTime(), 6 * kSec);
}

TEST_F(PanelCommandTest, TheZoomBarsRangeReachesTheListAndTheKeyframeArea) {
  TimeBarControl& ruler = *view->GetTimeRuler();
  const int K = view->GetZoomLimiter().GetScrollWidth();
  ruler.SetZoomInOutTime(4 * kSec, 8 * kSec);
  Broadcast(ZoomInOutTimeChangedMessage(4 * kSec, 8 * kSec));
  EXPECT_EQ(view->GetListView()->GetVisibleKeyframeTime(), 4 * kSec);
  EXPECT_DOUBLE_EQ(view->GetTimePerPixel(), 4.0 / K);
  EXPECT_DOUBLE_EQ(view->GetListView()->GetTimePerPixel(), 4.0 / K);
  ruler.SetZoomInOutTime(6 * kSec, 10 * kSec);
  Broadcast(SlideZoomMessage(6 * kSec, 10 * kSec));
  EXPECT_EQ(view->GetVisibleBaseTime(), 6 * kSec);
  EXPECT_EQ(view->GetKeyframeView()->GetVisibleStartTime(), 6 * kSec);
}

TEST_F(PanelCommandTest, AutoScrollStaysInsideTheClip) {
  view->GetTimeRuler()->SetZoomInOutTime(4 * kSec, 8 * kSec);
  view->ScrollVisibleTime(kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 5 * kSec);
  BroadcastMessage(view->GetListView()->GetKeyframeViewStation(),
                   EffectControlsAutoScrollMessage(100 * kSec));
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 8 * kSec);  // 12 s - 4 s span
  EXPECT_EQ(view->GetTimeRuler()->GetZoomOutTime(), 12 * kSec);
  view->ScrollVisibleTime(-100 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 2 * kSec);
  EXPECT_EQ(view->GetListView()->GetVisibleKeyframeTime(), 2 * kSec);
}

TEST_F(PanelCommandTest, AudioTimeUnitsFollowTheSequenceBothWays) {
  view->ObeyCommand(View::kAudioTimeUnitsCommand);
  EXPECT_TRUE(view->IsAudioTimeUnits());
  EXPECT_TRUE(sequence->IsAudioFrameAligned());
  EXPECT_TRUE(view->GetTimeRuler()->IsAudioTimeUnits());
  EXPECT_TRUE(view->GetZoomLimiter().IsAudioTimeUnits());
  EXPECT_EQ(view->GetZoomLimiter().GetFrameDuration(),
            sequence->GetAudioFrameRate().GetTicksPerFrame());
  // Undoing the alignment brings the view back through the property message.
  ASSERT_TRUE(Undo().Undo());
  EXPECT_FALSE(sequence->IsAudioFrameAligned());
  EXPECT_FALSE(view->IsAudioTimeUnits());
  EXPECT_EQ(view->GetZoomLimiter().GetFrameDuration(), kFrame);
}

TEST_F(PanelCommandTest, TheVerticalScrollBarScrollsTheList) {
  ScrollBar& bar = *view->GetScrollBar();
  bar.SetScrollInfo(0, 1000, 100, 0);
  BroadcastMessage(bar.GetStation(),
                   ScrollVerticalMessage(ScrollCode::kThumbPosition, 60, kKeyModifierNone));
  // The list clamps to its own content; either way it was told, and it never goes below 0.
  EXPECT_GE(view->GetListView()->GetScrollOffset(), 0);
  view->SizeListScrollBar(50, 300);  // everything fits: back to the top
  EXPECT_EQ(bar.GetPosition(), 0);
  EXPECT_FALSE(bar.CanScroll());
}

TEST_F(PanelCommandTest, TheKeyframeAreasLeftEdgeDragsTheSeparator) {
  const Rect area = view->GetKeyframeView()->GetBounds();
  const int y = area.top + 30;
  host->MouseMove(Point{area.left + 1, y}, kKeyModifierNone);
  host->MouseDown(MouseButton::kLeft, Point{area.left + 1, y}, kKeyModifierNone);
  ASSERT_TRUE(view->GetKeyframeView()->IsDraggingSeparator());
  host->MouseMove(Point{450, y}, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, Point{500, y}, kKeyModifierNone);
  EXPECT_FALSE(view->GetKeyframeView()->IsDraggingSeparator());
  EXPECT_EQ(view->GetKeyframeView()->GetBounds().left, 500);
  EXPECT_NEAR(view->GetSeparatorRatio(), 500.0F / 800.0F, 1e-6);
}

// A master clip shown from the header: navigation acts on the master clip, in media time.
TEST_F(PanelCommandTest, NavigationActsOnATargetedMasterClipInItsMediaTime) {
  ASSERT_TRUE(clip->SetTimes(2 * kSec, 12 * kSec, 10 * kSec));  // media 10 s at sequence 2 s
  view->TargetMasterClip(master);
  ASSERT_EQ(view->GetMasterClip(), master);
  sequence->SetCurrentTime(3 * kSec);
  view->ObeyCommand(View::kMarkInCommand);
  EXPECT_EQ(master->GetInPoint(), 11 * kSec);
  EXPECT_FALSE(sequence->GetInPoint().has_value());
  EXPECT_EQ(view->GetTimeRuler()->GetInMark(), 3 * kSec);  // shown where the clip plays it

  sequence->SetCurrentTime(7 * kSec);
  view->ObeyCommand(View::kGoToInCommand);
  EXPECT_EQ(sequence->GetCurrentTime(), 3 * kSec);
  view->ObeyCommand(View::kClearInCommand);
  EXPECT_FALSE(master->GetInPoint().has_value());
  EXPECT_FALSE(view->NavigateMasterClip(View::kNavGoToOut));  // no out point: nothing to do

  // Selecting in the sequence again leaves master-clip mode.
  sequence->ClearSelection();
  sequence->SetSelection({clip});
  EXPECT_EQ(view->GetMasterClip(), nullptr);
  view->ObeyCommand(View::kMarkInCommand);
  EXPECT_TRUE(sequence->GetInPoint().has_value());
}

}  // namespace

namespace {

using namespace panel_view_test;

TEST_F(PanelViewTest, TrimmingAPinnedClipFitsTheViewToItsNewSpan) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  ASSERT_TRUE(clip->SetTimes(2 * kSec, 8 * kSec, 0));
  EXPECT_EQ(view->GetClipStart(), 2 * kSec);
  EXPECT_EQ(view->GetClipEnd(), 8 * kSec);
  EXPECT_EQ(view->GetZoomLimiter().GetMaxTime(), 8 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 2 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomOutTime(), 8 * kSec);
}

TEST_F(PanelViewTest, TrimmingAnUnpinnedClipMovesItsBandAndKeepsTheZoom) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  AddClip(v1, 20 * kSec, 30 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  view->ObeyCommand(EffectControlsView::kPinToClipCommand);
  ASSERT_FALSE(view->IsPinned());
  const double zoom = view->GetTimePerPixel();
  ASSERT_TRUE(clip->SetTimes(4 * kSec, 12 * kSec, 2 * kSec));
  EXPECT_EQ(view->GetClipStart(), 4 * kSec);
  EXPECT_DOUBLE_EQ(view->GetTimePerPixel(), zoom);
  EXPECT_EQ(view->GetZoomLimiter().GetMaxTime(), 30 * kSec);
}

TEST_F(PanelViewTest, ZoomingOutPastTheRangeShowsTheWholeRange) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  view->ObeyCommand(EffectControlsView::kZoomOutCommand);
  view->ObeyCommand(EffectControlsView::kZoomOutCommand);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 2 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomOutTime(), 12 * kSec);
  EXPECT_EQ(view->GetVisibleBaseTime(), 2 * kSec);
}

TEST_F(PanelViewTest, ALinkedClipsVideoAndTwoAudioItemsAsThreeGroupsAreSeveralClips) {
  // Only one video and one audio item of one clip make a linked pair, as the list builds it.
  const TrackItemRef video = AddClip(v1, 2 * kSec, 7 * kSec, 1);
  const TrackItemRef left = AddClip(a1, 2 * kSec, 7 * kSec, 1);
  const TrackRef a2 = Track::Create(MediaType::Audio, "A2");
  sequence->AddTrack(a2);
  const TrackItemRef right = AddClip(a2, 2 * kSec, 7 * kSec, 1);
  Open({800, 400});
  sequence->SetSelectedGroups(
      {TrackItemGroup{{video}, {}}, TrackItemGroup{{}, {left}}, TrackItemGroup{{}, {right}}});
  EXPECT_EQ(view->GetTargetMode(), EffectControlsView::kTargetNone);
  EXPECT_EQ(view->GetHeader()->GetDisplayText(), "Multiple clips selected");
}

TEST_F(PanelViewTest, AnEmptyGroupIsReportedAndGivesNoCandidate) {
  // The sequence never hands out an empty group; the view still refuses one.
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  TrackItemRef video;
  TrackItemRef audio;
  EXPECT_EQ(view->SequenceClipSelectionChangedForOneTrackItem(TrackItemGroup{}, video, audio), 0);
  EXPECT_TRUE(HasAssertion("Invalid TrackItemGroup"));
  EXPECT_EQ(view->SequenceClipSelectionChangedForMultipleTrackItems(
                {TrackItemGroup{{clip}, {}}, TrackItemGroup{}}, video, audio),
            0);
  EXPECT_EQ(video, nullptr);
  EXPECT_EQ(audio, nullptr);
}

TEST_F(PanelViewTest, AStackedPanelHasNoScrollBarAndTheListTakesItsPlace) {
  Open({800, 400});
  view->ObeyCommand(EffectControlsView::kToggleKeyframesCommand);  // list across the panel
  view->SetStacked(true);
  EXPECT_FALSE(view->GetScrollBar()->IsVisible());
  EXPECT_EQ(view->GetListView()->GetBounds().right, 800 - 4);
  view->SetStacked(false);
  EXPECT_TRUE(view->GetScrollBar()->IsVisible());
  EXPECT_EQ(view->GetListView()->GetBounds().right, 800 - 4 - kS);
  EXPECT_EQ(view->GetMaxStackedHeight(), view->GetListView()->GetMaxHeight() + 60);
}

TEST_F(PanelViewTest, WhileAnAudioPartPlaysThePlayerIsRelayedAndTheEditLineComesBack) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  sequence->SetCurrentTime(3 * kSec);
  const std::string relay = "ECW.audio.player.relay";
  RegisterStation(relay);
  std::vector<TickTime> positions;
  int stops = 0;
  FunctionListener listener([&](const Message& message) {
    if (const auto* position = message.As<AudioPlayerPositionChangedMessage>()) {
      positions.push_back(position->time);
    } else if (message.Is<AudioPlayerIsStoppedMessage>()) {
      ++stops;
    }
  });
  AddListener(relay, listener);

  sequence->SetCurrentTime(4 * kSec);  // not playing a part: nothing relayed
  EXPECT_TRUE(positions.empty());
  BroadcastMessage(view->GetListView()->GetOwnStation(),
                   EffectControlsAudioPartPlayStartedMessage(0));
  sequence->SetCurrentTime(5 * kSec);
  sequence->SetCurrentTime(6 * kSec);
  EXPECT_EQ(positions, (std::vector<TickTime>{5 * kSec, 6 * kSec}));
  EXPECT_EQ(view->GetTimeRuler()->GetCurrentTime(), 6 * kSec);
  sequence->SetPlayerState(PlayerState::Playing);
  sequence->SetPlayerState(PlayerState::Stopped);
  EXPECT_EQ(stops, 1);
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSec);  // where it was before the part played
  // A second stop without playback is not relayed.
  sequence->SetPlayerState(PlayerState::Playing);
  sequence->SetPlayerState(PlayerState::Stopped);
  EXPECT_EQ(stops, 1);
}

TEST_F(PanelViewTest, RenameAsksForTheNameOfTheOneSelectedEffectAndIsUndoable) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  const ComponentRef blur = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
  clip->GetComponentChain()->Append(blur);
  Open({800, 400});
  sequence->SetSelection({clip});
  CommandStatus status;
  view->FindCommandStatus(EffectControlsView::kRenameCommand, status);
  EXPECT_FALSE(status.enabled);  // nothing selected

  std::shared_ptr<EffectItem> row;
  for (const auto& top : view->GetListView()->GetVideoItems()) {
    const auto* filter = dynamic_cast<const FilterItem*>(top.get());
    if (filter != nullptr && filter->Component() == blur) {
      row = top;
    }
  }
  ASSERT_NE(row, nullptr);
  view->GetListView()->SelectItem(row, true);
  view->FindCommandStatus(EffectControlsView::kRenameCommand, status);
  EXPECT_TRUE(status.enabled);

  auto answers = std::make_shared<ScriptedInputBox>();
  answers->PushAnswer(std::string("Soft Focus"));
  answers->PushAnswer(std::nullopt);  // the second box is cancelled
  const auto previous = InputBox::SetResponder(answers);
  view->ObeyCommand(EffectControlsView::kRenameCommand);
  ASSERT_EQ(answers->GetRequests().size(), 1U);
  EXPECT_EQ(answers->GetRequests().front().title, "Rename Item");
  EXPECT_EQ(answers->GetRequests().front().prompt, "New Name");
  EXPECT_EQ(blur->GetInstanceName(), "Soft Focus");
  view->ObeyCommand(EffectControlsView::kRenameCommand);
  EXPECT_EQ(answers->GetRequests().back().initialText, "Soft Focus");
  EXPECT_EQ(blur->GetInstanceName(), "Soft Focus");
  InputBox::SetResponder(previous);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_NE(blur->GetInstanceName(), "Soft Focus");
}

}  // namespace
