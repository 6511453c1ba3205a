#include <gtest/gtest.h>

#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

// What each announcement said, as "edit", "start", "zoom", "range" joined by '+'.
std::string Describe(const PanelTimelineChangedMessage& change) {
  std::string text;
  const auto add = [&](PanelTimeline::Change bit, const char* name) {
    if (change.Has(bit)) {
      text += (text.empty() ? "" : "+") + std::string(name);
    }
  };
  add(PanelTimeline::kEditTimeChanged, "edit");
  add(PanelTimeline::kVisibleStartChanged, "start");
  add(PanelTimeline::kZoomChanged, "zoom");
  add(PanelTimeline::kShownRangeChanged, "range");
  return text;
}

class PanelTimelineTest : public ::testing::Test {
 protected:
  PanelTimelineTest() { AddListener(timeline->GetStation(), recorder); }

  MessagingTestScope messaging;
  std::shared_ptr<PanelTimeline> timeline = std::make_shared<PanelTimeline>();
  std::vector<std::string> log;
  FunctionListener recorder{[this](const Message& message) {
    if (const auto* change = message.As<PanelTimelineChangedMessage>()) {
      log.push_back(Describe(*change));
    }
  }};
};

}  // namespace

TEST_F(PanelTimelineTest, EachChangeIsAnnouncedOnceAndTheSameValueIsNot) {
  EXPECT_TRUE(timeline->SetEditTime(3 * kSecond));
  EXPECT_FALSE(timeline->SetEditTime(3 * kSecond));
  EXPECT_TRUE(timeline->SetVisibleStart(kSecond));
  EXPECT_FALSE(timeline->SetVisibleStart(kSecond));
  EXPECT_TRUE(timeline->SetSecondsPerPixel(0.5));
  EXPECT_FALSE(timeline->SetSecondsPerPixel(0.5));
  EXPECT_TRUE(timeline->SetShownRange(2 * kSecond, 8 * kSecond));
  EXPECT_FALSE(timeline->SetShownRange(2 * kSecond, 8 * kSecond));
  EXPECT_EQ(log, (std::vector<std::string>{"edit", "start", "zoom", "range"}));
  EXPECT_EQ(timeline->GetEditTime(), 3 * kSecond);
  EXPECT_EQ(timeline->GetVisibleStart(), kSecond);
  EXPECT_EQ(timeline->GetShownStart(), 2 * kSecond);
  EXPECT_EQ(timeline->GetShownEnd(), 8 * kSecond);
}

TEST_F(PanelTimelineTest, ListenersReadTheNewValueWhenTheyAreTold) {
  std::optional<TickTime> seen;
  FunctionListener reader([&](const Message&) { seen = timeline->GetEditTime(); });
  AddListener(timeline->GetStation(), reader);
  timeline->SetEditTime(7 * kSecond);
  EXPECT_EQ(seen, 7 * kSecond);
}

TEST_F(PanelTimelineTest, AZoomThatIsNoDurationIsRefusedAndKeepsTheState) {
  timeline->SetSecondsPerPixel(1.0 / 30.0);
  log.clear();
  EXPECT_FALSE(timeline->SetSecondsPerPixel(0.0));
  EXPECT_FALSE(timeline->SetSecondsPerPixel(-1.0));
  EXPECT_FALSE(timeline->SetSecondsPerPixel(std::numeric_limits<double>::quiet_NaN()));
  EXPECT_DOUBLE_EQ(timeline->GetSecondsPerPixel(), 1.0 / 30.0);
  EXPECT_EQ(timeline->GetPixelFrameRate().GetTicksPerFrame(), 8467200000);
  EXPECT_TRUE(log.empty());
}

TEST_F(PanelTimelineTest, ThePixelFrameRateFollowsTheZoomAndSaturatesAtTheEnds) {
  EXPECT_EQ(timeline->GetPixelFrameRate().GetTicksPerFrame(), kSecond / 25);
  timeline->SetSecondsPerPixel(0.5);
  EXPECT_EQ(timeline->GetPixelFrameRate().GetTicksPerFrame(), kSecond / 2);
  // A pixel of no time at all in 1 / time per pixel saturates instead of overflowing.
  timeline->SetSecondsPerPixel(std::numeric_limits<double>::infinity());
  EXPECT_EQ(timeline->GetPixelFrameRate().GetTicksPerFrame(), std::numeric_limits<TickTime>::max());
  // Finer than one tick a pixel still counts one tick.
  timeline->SetSecondsPerPixel(1e-15);
  EXPECT_EQ(timeline->GetPixelFrameRate().GetTicksPerFrame(), 1);
}

TEST_F(PanelTimelineTest, PixelsAndTimesConvertBothWaysAndSaturateFarOff) {
  timeline->SetVisibleStart(2 * kSecond);
  timeline->SetSecondsPerPixel(0.01);
  EXPECT_DOUBLE_EQ(timeline->TimeToX(3 * kSecond), 100.0);
  EXPECT_DOUBLE_EQ(timeline->TimeToX(kSecond), -100.0);
  EXPECT_EQ(timeline->XToTime(100.0), 3 * kSecond);
  EXPECT_EQ(timeline->XToTime(0.5), 2 * kSecond + kSecond / 200);
  EXPECT_EQ(timeline->XToTime(1e300), kTime_Max);
  timeline->SetVisibleStart(0);
  timeline->SetSecondsPerPixel(std::numeric_limits<double>::infinity());
  EXPECT_EQ(timeline->XToTime(-1.0), kTime_Min);
}

TEST_F(PanelTimelineTest, AShownRangeEndingBeforeItStartsIsEmptyAtItsStart) {
  EXPECT_TRUE(timeline->SetShownRange(5 * kSecond, 2 * kSecond));
  EXPECT_EQ(timeline->GetShownStart(), 5 * kSecond);
  EXPECT_EQ(timeline->GetShownEnd(), 5 * kSecond);
  // The same empty range again is no change.
  EXPECT_FALSE(timeline->SetShownRange(5 * kSecond, 0));
  EXPECT_EQ(log, (std::vector<std::string>{"range"}));
}

TEST_F(PanelTimelineTest, AListenerRemovedByAnEarlierOneDuringDeliveryIsNotTold) {
  std::vector<std::string> order;
  auto later = std::make_unique<FunctionListener>([&](const Message&) { order.push_back("late"); });
  FunctionListener earlier([&](const Message&) {
    order.push_back("early");
    later.reset();
  });
  AddListener(timeline->GetStation(), earlier);
  AddListener(timeline->GetStation(), *later);
  timeline->SetEditTime(kSecond);
  EXPECT_EQ(order, (std::vector<std::string>{"early"}));
  // The next change reaches the listeners that are left.
  timeline->SetEditTime(2 * kSecond);
  EXPECT_EQ(order, (std::vector<std::string>{"early", "early"}));
}

TEST_F(PanelTimelineTest, ATimelineDestroyedDuringItsOwnAnnouncementStopsDelivering) {
  std::vector<std::string> order;
  auto owned = std::make_unique<PanelTimeline>();
  const StationName station = owned->GetStation();
  FunctionListener destroyer([&](const Message&) {
    order.push_back("destroy");
    owned.reset();
  });
  FunctionListener after([&](const Message&) { order.push_back("after"); });
  AddListener(station, destroyer);
  AddListener(station, after);
  owned->SetEditTime(kSecond);
  EXPECT_EQ(owned, nullptr);
  EXPECT_FALSE(StationExists(station));
  EXPECT_EQ(order, (std::vector<std::string>{"destroy"}));
}

TEST_F(PanelTimelineTest, ARowsEditTimeFollowsTheTimelineAndKeepsItAlive) {
  std::shared_ptr<const TickTime> rowTime = PanelTimeline::ShareEditTime(timeline);
  timeline->SetEditTime(4 * kSecond);
  EXPECT_EQ(*rowTime, 4 * kSecond);
  std::weak_ptr<PanelTimeline> watch = timeline;
  timeline.reset();
  EXPECT_FALSE(watch.expired());
  EXPECT_EQ(*rowTime, 4 * kSecond);
  rowTime.reset();
  EXPECT_TRUE(watch.expired());
  EXPECT_EQ(PanelTimeline::ShareEditTime(nullptr), nullptr);
}
