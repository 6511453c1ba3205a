#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/ECWZoomLimiter.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TransitionData.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/ScrollBar.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Handlers/EffectControls/EffectControlsViewTestSupport.h"

namespace {

using namespace panel_view_test;

TEST(ECWZoomLimiter, RefusesAMaximumBelowTheMinimumAndKeepsTheRange) {
  MessagingTestScope scope;
  ECWZoomLimiter limiter;
  ASSERT_TRUE(limiter.SetMinMaxTime(2 * kSec, 10 * kSec));
  EXPECT_FALSE(limiter.SetMinMaxTime(9 * kSec, 3 * kSec));
  EXPECT_TRUE(HasAssertion("Invalid Min/Max Time"));
  EXPECT_EQ(limiter.GetMinTime(), 2 * kSec);
  EXPECT_EQ(limiter.GetMaxTime(), 10 * kSec);
  EXPECT_EQ(limiter.GetDuration(), 8 * kSec);
  EXPECT_EQ(limiter.ClampTime(0), 2 * kSec);
  EXPECT_EQ(limiter.ClampTime(20 * kSec), 10 * kSec);
}

TEST(ECWZoomLimiter, ZoomsNoFinerThanAFrameAndNoWiderThanTheDuration) {
  ECWZoomLimiter limiter;
  limiter.SetMinMaxTime(0, 100 * kSec);
  limiter.SetScrollWidth(500);
  // Unset frame: the finest is 1 s per pixel, the widest 100 s / 500 px wins when they cross.
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(5.0), 0.2);
  limiter.SetFrameDuration(kFrameRate_25.GetTicksPerFrame());
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(1e-9), 1.0 / (ZoomLimiter::kMaxPixelsPerFrame * 25));
  EXPECT_DOUBLE_EQ(limiter.ClampTimePerPixel(5.0), 0.2);
}

TEST_F(PanelViewTest, SeparatorDragsAreIgnoredInANarrowPanel) {
  Open({kS + 336, 400});
  view->OnSeparatorMoved(280);
  EXPECT_EQ(view->GetSeparatorRatio(), 0.0F);
  EXPECT_EQ(view->GetListView()->GetBounds().right, EffectControlsView::kMinListWidth);
}

TEST_F(PanelViewTest, SeparatorDragKeepsBothSidesAtTheirMinimum) {
  const int W = 800;
  Open({W, 400});
  view->OnSeparatorMoved(W - kS - 20);  // would leave 20 px to the keyframe area
  EXPECT_EQ(KeyframeLeft(), W - kS - EffectControlsView::kMinKeyframeWidth);
  view->OnSeparatorMoved(100);  // narrower than the list may be
  EXPECT_EQ(KeyframeLeft(), EffectControlsView::kMinListWidth);
  view->OnSeparatorMoved(500);
  EXPECT_EQ(KeyframeLeft(), 500);
  EXPECT_NEAR(view->GetSeparatorRatio(), 500.0F / W, 1e-6);
}

TEST_F(PanelViewTest, ShowingTheKeyframeAreaInANarrowPanelKeepsItsMinimumWidth) {
  const int W = 420;
  Open({W, 400});
  PropertyList state;
  state.SetFloat("HandlerEffectControls.SeparatorRatio", 0.98F);
  state.SetBool("HandlerEffectControls.AreKeyframesVisible", false);
  view->RestoreState(state);
  ASSERT_FALSE(view->AreKeyframesVisible());
  EXPECT_FALSE(view->GetKeyframeView()->IsVisible());
  view->ObeyCommand(EffectControlsView::kToggleKeyframesCommand);
  EXPECT_TRUE(view->AreKeyframesVisible());
  EXPECT_TRUE(view->GetKeyframeView()->IsVisible());
  EXPECT_EQ(KeyframeLeft(), W - kS - EffectControlsView::kMinKeyframeWidth);
  EXPECT_TRUE(view->GetHeader()->AreKeyframesVisible());
}

TEST_F(PanelViewTest, TabStateRoundTrips) {
  Open({800, 400});
  view->OnSeparatorMoved(480);
  view->ToggleKeyframesVisible();
  PropertyList state;
  view->SaveState(state);
  EXPECT_NEAR(state.GetFloat("HandlerEffectControls.SeparatorRatio", 0), 0.6F, 1e-6);
  EXPECT_FALSE(state.Has("HandlerEffectControls.SeparatorRatioWhenMaximized"));
  EXPECT_FALSE(state.GetBool("HandlerEffectControls.AreKeyframesVisible", true));

  auto other = std::make_shared<EffectControlsView>(nullptr, "effectcontrols");
  other->Create("effectcontrols", "Effect Controls", nullptr, true);
  other->SetBounds(Rect::FromSize(0, 0, 800, 400));
  other->RestoreState(state);
  EXPECT_FALSE(other->AreKeyframesVisible());
  EXPECT_NEAR(other->GetSeparatorRatio(), 0.6F, 1e-6);
  other->Destroy();
}

TEST_F(PanelViewTest, SelectingTheSameGroupsAgainDoesNothing) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  ASSERT_EQ(view->GetTargetMode(), EffectControlsView::kTargetClip);
  view->ZoomToTimePerPixel(0.001, false);
  const double zoomed = view->GetTimePerPixel();
  view->RefreshFromClipSelection();
  EXPECT_EQ(view->GetTimePerPixel(), zoomed);  // a refresh would have reset the zoom to the clip
  EXPECT_EQ(view->GetClipStart(), 2 * kSec);
}

TEST_F(PanelViewTest, LinkedVideoAndAudioSelectedAsTwoGroupsTargetTheClip) {
  const TrackItemRef video = AddClip(v1, 2 * kSec, 7 * kSec, 1);
  const TrackItemRef audio = AddClip(a1, 2 * kSec, 7 * kSec, 1);
  Open({800, 400});
  sequence->SetSelectedGroups({TrackItemGroup{{video}, {}}, TrackItemGroup{{}, {audio}}});
  EXPECT_EQ(view->GetTargetMode(), EffectControlsView::kTargetClip);
  EXPECT_EQ(view->GetHeader()->GetDisplayMode(), EffectControlsListHeader::kModeClip);
  EXPECT_TRUE(view->GetTimeRuler()->IsEnabled());
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 2 * kSec);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomOutTime(), 7 * kSec);
}

TEST_F(PanelViewTest, TwoUnrelatedClipsShowTheMultipleClipsTextAndDisableTheRuler) {
  const TrackItemRef first = AddClip(v1, 2 * kSec, 7 * kSec);
  const TrackItemRef second = AddClip(v1, 9 * kSec, 12 * kSec);
  Open({800, 400});
  sequence->SetSelectedGroups({TrackItemGroup{{first}, {}}, TrackItemGroup{{second}, {}}});
  EXPECT_EQ(view->GetTargetMode(), EffectControlsView::kTargetNone);
  EXPECT_EQ(view->GetHeader()->GetDisplayText(), "Multiple clips selected");
  EXPECT_FALSE(view->GetTimeRuler()->IsEnabled());
  EXPECT_EQ(view->GetZoomLimiter().GetDuration(), 0);
  sequence->ClearSelection();
  EXPECT_EQ(view->GetHeader()->GetDisplayText(), "(no clip selected)");
}

TEST_F(PanelViewTest, ATransitionNearTheStartShowsFromZeroToOneDurationPastItsEnd) {
  // d = 2 s at [1 s, 3 s]: s < d, so the view starts at 0 and ends at e + d.
  TransitionData data;
  data.displayName = "Cross Dissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 1 * kSec, 3 * kSec, data);
  v1->AddItem(transition);
  Open({800, 400});
  sequence->SetSelection({transition});
  ASSERT_EQ(view->GetTargetMode(), EffectControlsView::kTargetTransition);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 0);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomOutTime(), 5 * kSec);
  EXPECT_EQ(view->GetHeader()->GetDisplayMode(), EffectControlsListHeader::kModeTransition);
  EXPECT_EQ(view->GetHeader()->GetDisplayText(), "Sequence 01 * " + transition->GetName());
}

// The view shows [0, 100 s] of a long clip; zooming in by half keeps the edit line in place
// on screen by the 10 % / 90 % / 50 % rules.
class PanelZoomTest : public PanelViewTest {
 protected:
  void SetUpAt(double fraction) {
    const TrackItemRef clip = AddClip(v1, 0, 400 * kSec);
    Open({800, 400});
    sequence->SetSelection({clip});
    // Show [100 s, 200 s].
    view->ZoomToTimePerPixel(100.0 / view->GetZoomLimiter().GetScrollWidth(), false);
    view->GetTimeRuler()->SetZoomInOutTime(100 * kSec, 200 * kSec);
    view->ZoomToTimePerPixel(100.0 / view->GetZoomLimiter().GetScrollWidth(), false);
    ASSERT_EQ(view->GetTimeRuler()->GetZoomInTime(), 100 * kSec);
    time = 100 * kSec + static_cast<TickTime>(fraction * 100 * kSec);
    sequence->SetCurrentTime(time);
    view->ZoomToTimePerPixel(view->GetTimePerPixel() * 0.5, true);
  }
  TickTime time = 0;
};

TEST_F(PanelZoomTest, TheCurrentTimeNearTheLeftKeepsTheLeftEdge) {
  SetUpAt(0.10);
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 100 * kSec);
  EXPECT_NEAR(view->GetTimeRuler()->GetZoomOutTime(), 150 * kSec, kSec / 100);
}

TEST_F(PanelZoomTest, TheCurrentTimeNearTheRightKeepsTheRightEdge) {
  SetUpAt(0.90);
  EXPECT_NEAR(view->GetTimeRuler()->GetZoomInTime(), 150 * kSec, kSec / 100);
  EXPECT_NEAR(view->GetTimeRuler()->GetZoomOutTime(), 200 * kSec, kSec / 100);
}

TEST_F(PanelZoomTest, TheCurrentTimeInTheMiddleStaysInTheMiddle) {
  SetUpAt(0.50);
  const TickTime in = view->GetTimeRuler()->GetZoomInTime();
  const TickTime out = view->GetTimeRuler()->GetZoomOutTime();
  EXPECT_NEAR(static_cast<double>(time - in) / static_cast<double>(out - in), 0.5, 1e-6);
  EXPECT_EQ(view->GetListView()->GetVisibleKeyframeTime(), in);
}

TEST_F(PanelViewTest, ZoomStaysInsideTheLimiterRange) {
  const TrackItemRef clip = AddClip(v1, 10 * kSec, 20 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  view->ZoomToTimePerPixel(1000.0, true);  // far wider than the clip
  EXPECT_EQ(view->GetTimeRuler()->GetZoomInTime(), 10 * kSec);
  EXPECT_LE(view->GetTimeRuler()->GetZoomOutTime(), 20 * kSec + kSec / 100);
  view->ObeyCommand(EffectControlsView::kZoomInCommand);
  EXPECT_GE(view->GetTimeRuler()->GetZoomInTime(), 10 * kSec);
  EXPECT_LE(view->GetTimeRuler()->GetZoomOutTime(), 20 * kSec);
}

TEST_F(PanelViewTest, ScrollValuesOfAVeryLongClipAtFineZoomStayWithinRange) {
  const TrackItemRef clip = AddClip(v1, 0, 500LL * 3600 * kSec);  // 500 hours
  Open({800, 400});
  sequence->SetSelection({clip});
  view->ZoomToTimePerPixel(0.0, false);  // the finest: 1 / (64 x 25) s per pixel
  const double pixels = 500.0 * 3600 / view->GetTimePerPixel();
  ASSERT_GT(pixels, 2147483646.0);
  EXPECT_NEAR(view->GetScrollScale(), pixels / 2147483646.0, 1e-6);
  EXPECT_LE(view->GetScrollRange(), 2147483646);
  EXPECT_GE(view->GetScrollRange(), 2147483600);
  EXPECT_GE(view->GetScrollPosition(), 0);

  // A short clip needs no scaling.
  const TrackItemRef shortClip = AddClip(a1, 0, 10 * kSec);
  sequence->SetSelection({shortClip});
  view->ZoomToTimePerPixel(0.0, false);
  EXPECT_EQ(view->GetScrollScale(), 0.0);
}

TEST_F(PanelViewTest, HeaderTextsFollowTheTarget) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  EffectControlsListHeader& header = *view->GetHeader();
  EXPECT_EQ(header.GetDisplayText(), "(no clip selected)");
  sequence->SetSelection({clip});
  EXPECT_EQ(header.GetDisplayMode(), EffectControlsListHeader::kModeClip);
  EXPECT_EQ(header.GetMasterGroupText(), "Master * Beach.mov");
  EXPECT_EQ(header.GetSequenceGroupText(), "Sequence 01 * Beach.mov");
  header.SetNoTarget(3);
  EXPECT_EQ(header.GetDisplayText(), "Multiple clips selected");
  header.SetNoTarget(1);
  EXPECT_EQ(header.GetDisplayText(), "(no clip selected)");
}

TEST_F(PanelViewTest, HeaderRefusesANonTransitionAsTransition) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  EffectControlsListHeader& header = *view->GetHeader();
  header.SetTransition(sequence, clip, nullptr, nullptr);
  EXPECT_TRUE(HasAssertion("Invalid TrackItem"));
  EXPECT_EQ(header.GetDisplayMode(), EffectControlsListHeader::kModeNone);
  EXPECT_THROW(header.SetTransition(sequence, nullptr, nullptr, nullptr), NullInterfaceException);
}

TEST_F(PanelViewTest, TheExpanderStaysTwentyPixelsFromTheRightEdge) {
  Open({800, 400});
  EffectControlsListHeader& header = *view->GetHeader();
  for (int width : {500, 300, 120}) {
    header.SetBounds(Rect::FromSize(0, 0, width, 34));
    const Rect expander = header.GetExpander()->GetBounds();
    EXPECT_EQ(expander.left, width - 20);
    EXPECT_EQ(expander.top, 16);
    EXPECT_EQ(expander.Width(), 16);
    EXPECT_EQ(expander.Height(), 16);
  }
  EXPECT_EQ(header.GetExpander()->GetCommand(), EffectControlsView::kToggleKeyframesCommand);
}

TEST_F(PanelViewTest, TheExpanderClickTogglesTheKeyframeArea) {
  Open({800, 400});
  ASSERT_TRUE(view->AreKeyframesVisible());
  view->GetHeader()->GetExpander()->Click();
  EXPECT_FALSE(view->AreKeyframesVisible());
  EXPECT_FALSE(view->GetKeyframeView()->IsVisible());
  // The list takes the whole width but the scroll bar.
  EXPECT_EQ(view->GetListView()->GetBounds().right, 800 - 4 - kS);
}

TEST_F(PanelViewTest, TheDumpNamesTheTargetAndTheKeyframeTimeState) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 7 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  PanelStateDump dump;
  view->FillStateDump(dump);
  EXPECT_EQ(dump.targetMode, 1);
  EXPECT_EQ(dump.headerText, view->GetHeader()->GetDisplayText());
  ASSERT_TRUE(dump.keyframeArea.has_value());
  EXPECT_EQ(dump.keyframeArea->visibleStartTime, 2 * kSec);
  EXPECT_GT(dump.keyframeArea->secondsPerPixel, 0.0);
}

}  // namespace

namespace {

using namespace panel_view_test;

// The first parameter row under the list's video rows.
const ParameterControl* FirstParameterRow(const EffectControlsListView& list) {
  const ParameterControl* found = nullptr;
  list.GetVideoItems().ForEachRow([&found](const EffectItemList::Row& row) {
    found = dynamic_cast<const ParameterControl*>(row.get());
    return found == nullptr;
  });
  return found;
}

// The edit line used to be copied into the list when the sequence was first shown and never
// after: a value typed later landed at that old time.
TEST_F(PanelViewTest, TheRowsAndTheKeyframeAreaReadTheEditLineWhereverItMoves) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  clip->GetComponentChain()->Append(EffectCatalogue::Standard().Create(kMatchName_Opacity));
  Open({800, 400});
  sequence->SetSelection({clip});
  const ParameterControl* row = FirstParameterRow(*view->GetListView());
  ASSERT_NE(row, nullptr);

  sequence->SetCurrentTime(5 * kSec);
  EXPECT_EQ(view->GetTimeline().GetEditTime(), 5 * kSec);
  EXPECT_EQ(view->GetListView()->GetEditTime(), 5 * kSec);
  EXPECT_EQ(view->GetKeyframeView()->GetEditTime(), 5 * kSec);
  EXPECT_EQ(row->GetEditTime(), 5 * kSec);

  // Moved from the panel's own ruler: the sequence follows too.
  BroadcastMessage(view->GetTimeRuler()->GetStation(), EditTimeChangedMessage(9 * kSec));
  EXPECT_EQ(sequence->GetCurrentTime(), 9 * kSec);
  EXPECT_EQ(row->GetEditTime(), 9 * kSec);
  EXPECT_EQ(view->GetKeyframeView()->GetEditTime(), 9 * kSec);
}

TEST_F(PanelViewTest, TheKeyframeAreaDrawsTheSpanOfTheClipTheViewTargets) {
  const TrackItemRef clip = AddClip(v1, 2 * kSec, 12 * kSec);
  const TrackItemRef other = AddClip(v1, 20 * kSec, 26 * kSec);
  Open({800, 400});
  sequence->SetSelection({clip});
  EXPECT_EQ(view->GetTimeline().GetShownStart(), 2 * kSec);
  EXPECT_EQ(view->GetTimeline().GetShownEnd(), 12 * kSec);
  sequence->SetSelection({other});
  EXPECT_EQ(view->GetClipStart(), 20 * kSec);
  EXPECT_EQ(view->GetClipEnd(), 26 * kSec);
  // Nothing targeted: no band.
  sequence->SetSelection({});
  EXPECT_EQ(view->GetTimeline().GetShownStart(), 0);
  EXPECT_EQ(view->GetTimeline().GetShownEnd(), 0);
}

}  // namespace
