#include <gtest/gtest.h>

#include <atomic>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Tests/Host/Messaging/TestMessages.h"

using Log = std::vector<std::string>;

class MessageLoopTest : public ::testing::Test {
 protected:
  MessageLoop& Loop() { return MessageLoop::Instance(); }

  MessagingTestScope mScope;
  Log mLog;
};

TEST_F(MessageLoopTest, PostingDeliversNothingUntilTheLoopRuns) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  EXPECT_TRUE(mLog.empty());
  EXPECT_TRUE(Loop().HasPending());
  EXPECT_EQ(Loop().RunPending(), 1u);
  EXPECT_EQ(mLog, (Log{"a:1"}));
  EXPECT_FALSE(Loop().HasPending());
  EXPECT_EQ(Loop().RunPending(), 0u);
}

TEST_F(MessageLoopTest, PostsAreDeliveredInPostingOrderAcrossStations) {
  LoggingListener a("a", mLog), b("b", mLog);
  AddListener("A", a);
  AddListener("B", b);
  PostMessageToUIThread("A", std::make_shared<PingMessage>(1));
  PostMessageToUIThread("B", std::make_shared<PingMessage>(2));
  PostMessageToUIThread("A", std::make_shared<PingMessage>(3));
  EXPECT_EQ(Loop().RunPending(), 3u);
  EXPECT_EQ(mLog, (Log{"a:1", "b:2", "a:3"}));
}

TEST_F(MessageLoopTest, PostsMadeWhileDeliveringComeAfterTheQueuedOnes) {
  LoggingListener a("a", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      PostMessageToUIThread("S", std::make_shared<PingMessage>(10));
    }
  });
  AddListener("S", a);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  PostMessageToUIThread("S", std::make_shared<PingMessage>(2));
  EXPECT_EQ(Loop().RunPending(), 3u);
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "a:10"}));
}

TEST_F(MessageLoopTest, EndlessRepostingIsBoundedPerRun) {
  int delivered = 0;
  LoggingListener echo("echo", mLog, [&](const Message&) {
    ++delivered;
    PostMessageToUIThread("S", std::make_shared<PongMessage>("again"));
  });
  AddListener("S", echo);
  PostMessageToUIThread("S", std::make_shared<PongMessage>("start"));
  EXPECT_EQ(Loop().RunPending(), MessageLoop::kMaxDeliveriesPerRun);
  EXPECT_EQ(delivered, static_cast<int>(MessageLoop::kMaxDeliveriesPerRun));
  EXPECT_TRUE(Loop().HasPending());
  EXPECT_EQ(Loop().PendingCount(), 1u);
}

TEST_F(MessageLoopTest, PostToADisposedStationIsDropped) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  DisposeStation("S");
  EXPECT_EQ(Loop().RunPending(), 1u);
  EXPECT_TRUE(mLog.empty());
}

TEST_F(MessageLoopTest, TheMessageStaysAliveUntilDeliveredEvenIfThePosterDropsIt) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  {
    auto message = std::make_shared<PongMessage>("kept");
    PostMessageToUIThread("S", message);
  }
  Loop().RunPending();
  EXPECT_EQ(mLog, (Log{"a:kept"}));
}

TEST_F(MessageLoopTest, NullPostIsReportedAndDropped) {
  PostMessageToUIThread("S", nullptr);
  EXPECT_FALSE(Loop().HasPending());
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "Posting a null message");
}

TEST_F(MessageLoopTest, IdleTasksRunOnceAfterThePosts) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  Loop().AddIdleTask([&] { mLog.push_back("idle"); });
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  Loop().RunPending();
  Loop().RunPending();
  EXPECT_EQ(mLog, (Log{"a:1", "idle"}));
}

TEST_F(MessageLoopTest, IdleTaskAddedByAnIdleTaskWaitsForTheNextRun) {
  Loop().AddIdleTask([&] {
    mLog.push_back("first");
    Loop().AddIdleTask([&] { mLog.push_back("second"); });
  });
  Loop().RunPending();
  EXPECT_EQ(mLog, (Log{"first"}));
  EXPECT_TRUE(Loop().HasPending());
  Loop().RunPending();
  EXPECT_EQ(mLog, (Log{"first", "second"}));
}

TEST_F(MessageLoopTest, RunPendingFromInsideADeliveryDoesNothing) {
  std::size_t nested = 99;
  LoggingListener a("a", mLog, [&](const Message&) { nested = Loop().RunPending(); });
  AddListener("S", a);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  PostMessageToUIThread("S", std::make_shared<PingMessage>(2));
  EXPECT_EQ(Loop().RunPending(), 2u);
  EXPECT_EQ(nested, 0u);
  EXPECT_EQ(mLog, (Log{"a:1", "a:2"}));
}

TEST_F(MessageLoopTest, AThrowingIdleTaskDoesNotLoseTheOthers) {
  Loop().AddIdleTask([] { throw std::runtime_error("task failed"); });
  Loop().AddIdleTask([&] { mLog.push_back("second"); });
  EXPECT_THROW(Loop().RunPending(), std::runtime_error);
  Loop().RunPending();
  EXPECT_EQ(mLog, (Log{"second"}));
}

TEST_F(MessageLoopTest, PostsFromOtherThreadsAllArriveInEachThreadsOrder) {
  constexpr int kThreads = 4;
  constexpr int kPerThread = 500;
  std::vector<std::vector<int>> seen(kThreads);
  FunctionListener listener([&](const Message& m) {
    const int value = m.As<PingMessage>()->value;
    seen[static_cast<std::size_t>(value / kPerThread)].push_back(value % kPerThread);
  });
  AddListener("S", listener);
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([t] {
      for (int i = 0; i < kPerThread; ++i) {
        PostMessageToUIThread("S", std::make_shared<PingMessage>(t * kPerThread + i));
      }
    });
  }
  for (auto& thread : threads) {
    thread.join();
  }
  EXPECT_EQ(Loop().RunPending(), static_cast<std::size_t>(kThreads * kPerThread));
  for (const auto& values : seen) {
    ASSERT_EQ(values.size(), static_cast<std::size_t>(kPerThread));
    for (int i = 0; i < kPerThread; ++i) {
      EXPECT_EQ(values[static_cast<std::size_t>(i)], i);
    }
  }
}

TEST_F(MessageLoopTest, EveryPostAndTaskWakesTheFrontEnd) {
  std::atomic<int> wakeUps = 0;
  Loop().SetWakeUpHandler([&] { ++wakeUps; });
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  std::thread([] { PostMessageToUIThread("S", std::make_shared<PingMessage>(2)); }).join();
  Loop().AddIdleTask([] {});
  EXPECT_EQ(wakeUps, 3);
  Loop().SetWakeUpHandler(nullptr);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(3));
  EXPECT_EQ(wakeUps, 3);
}

TEST_F(MessageLoopTest, DiscardPendingDropsPostsAndTasks) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  PostMessageToUIThread("S", std::make_shared<PingMessage>(1));
  Loop().AddIdleTask([&] { mLog.push_back("idle"); });
  Loop().DiscardPending();
  EXPECT_FALSE(Loop().HasPending());
  EXPECT_EQ(Loop().RunPending(), 0u);
  EXPECT_TRUE(mLog.empty());
}
