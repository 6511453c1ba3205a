// The workspace's timeline: what a click, a double-click, the ruler and the wheel do to the
// host's selection, edit line and view.
#include <gtest/gtest.h>

#include <memory>
#include <vector>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Shell/TimelineView.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/KeyModifiers.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

class TimelineViewTest : public ::testing::Test {
 protected:
  TimelineViewTest() {
    sequence = builder.AddSequence("Sequence");
    const TrackRef v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    const TrackRef a1 = builder.AddTrack(sequence, MediaType::Audio, "A1");
    const MasterClipRef clip = builder.AddMasterClip(
        "Clip", builder.AddMedia("clip.mov", 20 * kSecond, ProjectBuilder::Streams::VideoAndAudio));
    video = builder.AddClip(v1, clip, {.start = 0, .end = 4 * kSecond, .linkGroup = 1});
    audio = builder.AddClip(a1, clip, {.start = 0, .end = 4 * kSecond, .linkGroup = 1});
    other = builder.AddClip(v1, clip, {.start = 4 * kSecond, .end = 8 * kSecond});
    application.OpenProject(builder.GetProject());
    application.SetEditingLayout(true);
    timeline = dynamic_cast<TimelineView*>(application.GetWorkspaceFrame().GetTimelineView());
  }

  Point CentreOf(const TrackItemRef& item) const {
    for (const auto& place : timeline->GetItemPlaces()) {
      if (place.item == item)
        return {(place.rect.left + place.rect.right) / 2, (place.rect.top + place.rect.bottom) / 2};
    }
    ADD_FAILURE() << "the item is not drawn";
    return {};
  }

  std::vector<TrackItemRef> Selected() const {
    std::vector<TrackItemRef> items;
    for (const TrackItemGroup& group : sequence->GetSelection()) {
      items.insert(items.end(), group.videoItems.begin(), group.videoItems.end());
      items.insert(items.end(), group.audioItems.begin(), group.audioItems.end());
    }
    return items;
  }

  void Click(const TrackItemRef& item, KeyModifiers modifiers = kKeyModifierNone) {
    const Point point = CentreOf(item);
    timeline->LeftButtonDownSelf(point, modifiers);
    timeline->LeftButtonUpSelf(point, modifiers);
  }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Timeline"};
  SequenceRef sequence;
  TrackItemRef video, audio, other;
  Application application{Size{900, 600}};
  TimelineView* timeline = nullptr;
};

}  // namespace

TEST_F(TimelineViewTest, AClickSelectsTheClipWithItsLinkedPartsAndAltTheClipAlone) {
  ASSERT_NE(timeline, nullptr);
  Click(video);
  EXPECT_EQ(Selected(), (std::vector<TrackItemRef>{video, audio}));
  Click(other);
  EXPECT_EQ(Selected(), std::vector<TrackItemRef>{other});
  Click(audio, kKeyModifierAlt);
  EXPECT_EQ(Selected(), std::vector<TrackItemRef>{audio});
}

TEST_F(TimelineViewTest, ShiftOrCtrlAddsAndRemovesAndAnEmptyClickClears) {
  Click(video);
  Click(other, kKeyModifierCtrl);
  EXPECT_EQ(sequence->GetSelection().size(), 2u);
  Click(audio, kKeyModifierShift);  // part of the first group: the group goes
  EXPECT_EQ(Selected(), std::vector<TrackItemRef>{other});
  const Point empty{timeline->GetSize().width - 2, timeline->GetSize().height - 2};
  timeline->LeftButtonDownSelf(empty, kKeyModifierShift);
  EXPECT_EQ(Selected(), std::vector<TrackItemRef>{other});  // Shift keeps it
  timeline->LeftButtonDownSelf(empty, kKeyModifierNone);
  EXPECT_TRUE(sequence->GetSelection().empty());
}

TEST_F(TimelineViewTest, ADoubleClickOpensTheItemAsTheHostAnnouncesIt) {
  std::vector<TrackItemRef> opened;
  FunctionListener listener([&](const Message& message) {
    if (const auto* open = message.As<TrackItemSelectionOpenedMessage>())
      opened = open->items;
  });
  AddListener(kTrackItemActivationStation, listener);
  timeline->LeftButtonMultiClickSelf(CentreOf(other), kKeyModifierNone, 2);
  EXPECT_EQ(opened, std::vector<TrackItemRef>{other});
  EXPECT_EQ(Selected(), std::vector<TrackItemRef>{other});
}

TEST_F(TimelineViewTest, TheRulerScrubsTheEditLineOnWholeFramesWithinTheSequence) {
  const int x = static_cast<int>(timeline->TimeToX(2 * kSecond + 1000));
  timeline->LeftButtonDownSelf({x, 5}, kKeyModifierNone);
  const TickTime frame = sequence->GetVideoFrameRate().GetTicksPerFrame();
  EXPECT_EQ(sequence->GetCurrentTime() % frame, 0);
  EXPECT_NEAR(static_cast<double>(sequence->GetCurrentTime()), 2.0 * kSecond,
              timeline->GetTicksPerPixel() + frame);
  timeline->MouseMoveSelf({timeline->GetSize().width + 500, 5}, kKeyModifierNone);
  timeline->LeftButtonUpSelf({timeline->GetSize().width + 500, 5}, kKeyModifierNone);
  EXPECT_LE(sequence->GetCurrentTime(), sequence->GetEnd());
  timeline->LeftButtonDownSelf({-300, 5}, kKeyModifierNone);
  timeline->LeftButtonUpSelf({-300, 5}, kKeyModifierNone);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  EXPECT_TRUE(sequence->GetSelection().empty());  // the ruler selects nothing
}

TEST_F(TimelineViewTest, CtrlWheelZoomsAboutThePointerAndTheWheelScrolls) {
  const Point pointer{400, 50};
  const TickTime under = timeline->XToTime(pointer.x);
  const double before = timeline->GetTicksPerPixel();
  EXPECT_TRUE(timeline->MouseWheelSelf({pointer, 0, 2, kKeyModifierCtrl}));
  EXPECT_LT(timeline->GetTicksPerPixel(), before);
  EXPECT_NEAR(static_cast<double>(timeline->XToTime(pointer.x)), static_cast<double>(under),
              timeline->GetTicksPerPixel());
  const TickTime start = timeline->GetVisibleStart();
  EXPECT_TRUE(timeline->MouseWheelSelf({pointer, 0, -3, kKeyModifierNone}));
  EXPECT_GT(timeline->GetVisibleStart(), start);
  // Never before the sequence's start.
  EXPECT_TRUE(timeline->MouseWheelSelf({pointer, 0, 1000, kKeyModifierNone}));
  EXPECT_EQ(timeline->GetVisibleStart(), 0);
}
