#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

using std::chrono::milliseconds;
using Times = std::vector<long long>;

class RepeatTimerTest : public ::testing::Test {
 protected:
  ToolkitTestScope scope;
  RepeatTimer timer{"Test.Repeat", milliseconds{50}};
  Times repeats;
  FunctionListener listener{[this](const Message& message) {
    if (const auto* repeat = message.As<RepeatMessage>()) {
      EXPECT_EQ(repeat->now, timer.Now());
      repeats.push_back(repeat->now.count());
    }
  }};
};

TEST_F(RepeatTimerTest, RepeatsFallOnMultiplesOfThePeriodWhileSomeoneListens) {
  timer.AdvanceBy(milliseconds{120});  // nobody listens: nothing queued up
  AddListener(timer.GetStation(), listener);
  timer.AdvanceTo(milliseconds{149});
  timer.AdvanceTo(milliseconds{150});
  timer.AdvanceTo(milliseconds{260});
  RemoveListener(timer.GetStation(), listener);
  timer.AdvanceTo(milliseconds{400});
  EXPECT_EQ(repeats, (Times{150, 200, 250}));
  EXPECT_EQ(timer.Now(), milliseconds{400});
}

TEST_F(RepeatTimerTest, TasksRunInTimeOrderEachAtItsOwnTime) {
  Times ran;
  timer.Schedule(milliseconds{30}, [&] { ran.push_back(timer.Now().count() * 10 + 1); });
  timer.Schedule(milliseconds{10}, [&] { ran.push_back(timer.Now().count() * 10 + 2); });
  timer.Schedule(milliseconds{30}, [&] { ran.push_back(timer.Now().count() * 10 + 3); });
  timer.AdvanceBy(milliseconds{29});
  EXPECT_EQ(ran, (Times{102}));
  timer.AdvanceBy(milliseconds{1});
  EXPECT_EQ(ran, (Times{102, 301, 303}));  // same time: scheduling order
  EXPECT_EQ(timer.PendingTimers(), 0u);
}

TEST_F(RepeatTimerTest, ARepeatComesBeforeTasksDueAtTheSameTime) {
  AddListener(timer.GetStation(), listener);
  Times order;
  timer.Schedule(milliseconds{50},
                 [&] { order.push_back(static_cast<long long>(repeats.size())); });
  timer.AdvanceTo(milliseconds{50});
  EXPECT_EQ(order, (Times{1}));
}

TEST_F(RepeatTimerTest, PeriodicTasksRunUntilCancelledEvenFromInside) {
  Times ran;
  RepeatTimer::TimerID id = 0;
  id = timer.Schedule(
      milliseconds{100},
      [&] {
        ran.push_back(timer.Now().count());
        if (ran.size() == 3) {
          EXPECT_TRUE(timer.Cancel(id));
        }
      },
      milliseconds{40});
  timer.AdvanceTo(milliseconds{1000});
  EXPECT_EQ(ran, (Times{100, 140, 180}));
  EXPECT_FALSE(timer.Cancel(id));
}

TEST_F(RepeatTimerTest, ATaskMayScheduleAnotherThatFallsDueInTheSameAdvance) {
  Times ran;
  timer.Schedule(milliseconds{10}, [&] {
    ran.push_back(timer.Now().count());
    timer.Schedule(milliseconds{5}, [&] { ran.push_back(timer.Now().count()); });
    timer.Schedule(milliseconds{500}, [&] { ran.push_back(timer.Now().count()); });
  });
  timer.AdvanceTo(milliseconds{100});
  EXPECT_EQ(ran, (Times{10, 15}));
  EXPECT_EQ(timer.PendingTimers(), 1u);
}

TEST_F(RepeatTimerTest, TheClockNeverRunsBackwardsOrFromInsideATask) {
  ClearRecordedDebugAssertions();
  timer.AdvanceTo(milliseconds{100});
  EXPECT_FALSE(timer.AdvanceTo(milliseconds{99}));
  bool nested = true;
  timer.Schedule(milliseconds{0}, [&] { nested = timer.AdvanceBy(milliseconds{10}); });
  EXPECT_TRUE(timer.AdvanceBy(milliseconds{0}));
  EXPECT_FALSE(nested);
  EXPECT_EQ(timer.Now(), milliseconds{100});
  EXPECT_EQ(RecordedDebugAssertions().size(), 2u);
}

TEST_F(RepeatTimerTest, ATaskThatReschedulesItselfWithoutDelayCannotHangTheClock) {
  ClearRecordedDebugAssertions();
  int runs = 0;
  std::function<void()> again = [&] {
    ++runs;
    timer.Schedule(milliseconds{0}, again);
  };
  timer.Schedule(milliseconds{5}, again);
  EXPECT_TRUE(timer.AdvanceTo(milliseconds{10}));
  EXPECT_EQ(runs, RepeatTimer::kMaxEventsAtOneTime);
  EXPECT_EQ(timer.Now(), milliseconds{10});
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST_F(RepeatTimerTest, BadPeriodsAndEmptyTasksAreRefused) {
  ClearRecordedDebugAssertions();
  EXPECT_FALSE(timer.SetPeriod(milliseconds{0}));
  EXPECT_EQ(timer.GetPeriod(), milliseconds{50});
  EXPECT_EQ(timer.Schedule(milliseconds{1}, nullptr), 0u);
  EXPECT_EQ(timer.PendingTimers(), 0u);
}

TEST(RepeatTimerInstance, BroadcastsOnTheToolkitsRepeatStation) {
  ToolkitTestScope scope;
  int count = 0;
  FunctionListener listener([&](const Message& message) { count += message.Is<RepeatMessage>(); });
  AddListener(std::string(RepeatTimer::kStationName), listener);
  RepeatTimer::Instance().AdvanceBy(RepeatTimer::kDefaultPeriod * 3);
  EXPECT_EQ(count, 3);
}

}  // namespace
