#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Tests/Host/Messaging/TestMessages.h"

using Log = std::vector<std::string>;

class StationTest : public ::testing::Test {
 protected:
  MessagingTestScope mScope;
  Log mLog;
};

TEST_F(StationTest, RegisterRefusesAnExistingName) {
  EXPECT_TRUE(RegisterStation("Sequence"));
  EXPECT_TRUE(StationExists("Sequence"));
  LoggingListener a("a", mLog);
  AddListener("Sequence", a);
  EXPECT_FALSE(RegisterStation("Sequence"));
  // Still the same station: its listener was not dropped.
  EXPECT_TRUE(IsListening("Sequence", a));
}

TEST_F(StationTest, UniqueNamesNeverRepeatEvenAfterDisposal) {
  EXPECT_EQ(RegisterUniqueStation("View"), "View");
  EXPECT_EQ(RegisterUniqueStation("View"), "View#1");
  EXPECT_EQ(RegisterUniqueStation("View"), "View#2");
  DisposeStation("View#2");
  // A post still queued for the disposed "View#2" must not reach a newer station.
  EXPECT_EQ(RegisterUniqueStation("View"), "View#3");
}

TEST_F(StationTest, UniqueNamesSkipNamesRegisteredByHand) {
  RegisterStation("Panel");
  RegisterStation("Panel#1");
  EXPECT_EQ(RegisterUniqueStation("Panel"), "Panel#2");
}

TEST_F(StationTest, BroadcastDeliversInTheOrderListenersWereAdded) {
  LoggingListener a("a", mLog), b("b", mLog), c("c", mLog);
  AddListener("S", b);
  AddListener("S", a);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"b:1", "a:1", "c:1"}));
}

TEST_F(StationTest, AddingTwiceDeliversOnce) {
  LoggingListener a("a", mLog);
  AddListener("S", a);
  AddListener("S", a);
  EXPECT_EQ(ListenerCount("S"), 1u);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1"}));
}

TEST_F(StationTest, AddingToAMissingStationRegistersIt) {
  LoggingListener a("a", mLog);
  EXPECT_FALSE(StationExists("Clip.7"));
  AddListener("Clip.7", a);
  EXPECT_TRUE(StationExists("Clip.7"));
  BroadcastMessage("Clip.7", PingMessage(7));
  EXPECT_EQ(mLog, (Log{"a:7"}));
}

TEST_F(StationTest, StationsAreIndependent) {
  LoggingListener a("a", mLog), b("b", mLog);
  AddListener("S1", a);
  AddListener("S2", b);
  BroadcastMessage("S2", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"b:2"}));
}

TEST_F(StationTest, RemovedListenerGetsNothingAndRemovingTwiceIsHarmless) {
  LoggingListener a("a", mLog), b("b", mLog);
  AddListener("S", a);
  AddListener("S", b);
  RemoveListener("S", a);
  RemoveListener("S", a);
  RemoveListener("Nowhere", a);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"b:1"}));
  EXPECT_FALSE(IsListening("S", a));
}

TEST_F(StationTest, BroadcastToAMissingStationDoesNothing) {
  BroadcastMessage("Nowhere", PingMessage(1));
  EXPECT_FALSE(StationExists("Nowhere"));
}

TEST_F(StationTest, DestroyedListenerStopsListeningEverywhere) {
  LoggingListener keep("keep", mLog);
  {
    LoggingListener gone("gone", mLog);
    AddListener("S1", gone);
    AddListener("S2", gone);
    AddListener("S1", keep);
  }
  EXPECT_EQ(ListenerCount("S1"), 1u);
  EXPECT_EQ(ListenerCount("S2"), 0u);
  BroadcastMessage("S1", PingMessage(1));
  BroadcastMessage("S2", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"keep:1"}));
}

TEST_F(StationTest, DisposedStationForgetsItsListenersWhichCanBeDestroyedLater) {
  auto a = std::make_unique<LoggingListener>("a", mLog);
  AddListener("S", *a);
  DisposeStation("S");
  EXPECT_FALSE(StationExists("S"));
  BroadcastMessage("S", PingMessage(1));
  // Registering the name again gives a fresh station without the old listener.
  RegisterStation("S");
  BroadcastMessage("S", PingMessage(2));
  a.reset();
  EXPECT_TRUE(mLog.empty());
  DisposeStation("S");
  DisposeStation("S");
}

TEST_F(StationTest, RemoveFromAllStationsKeepsTheListenerUsable) {
  LoggingListener a("a", mLog);
  AddListener("S1", a);
  AddListener("S2", a);
  RemoveListenerFromAllStations(a);
  BroadcastMessage("S1", PingMessage(1));
  AddListener("S2", a);
  BroadcastMessage("S2", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:2"}));
}

// Re-entrancy: what a listener may do to the station while it is being called.

TEST_F(StationTest, ListenerRemovingItselfDuringBroadcastLetsTheOthersRun) {
  LoggingListener a("a", mLog), c("c", mLog);
  LoggingListener b("b", mLog);
  b.SetAction([&](const Message&) { RemoveListener("S", b); });
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "b:1", "c:1", "a:2", "c:2"}));
}

TEST_F(StationTest, ListenerRemovingOneNotYetCalledStopsItsDelivery) {
  LoggingListener a("a", mLog), b("b", mLog), c("c", mLog);
  a.SetAction([&](const Message&) { RemoveListener("S", b); });
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1", "c:1"}));
  EXPECT_EQ(ListenerCount("S"), 2u);
}

TEST_F(StationTest, ListenerRemovingOneAlreadyCalledLosesNoOtherListener) {
  LoggingListener a("a", mLog), b("b", mLog), c("c", mLog), d("d", mLog);
  c.SetAction([&](const Message&) { RemoveListener("S", a); });
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  AddListener("S", d);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "b:1", "c:1", "d:1", "b:2", "c:2", "d:2"}));
}

TEST_F(StationTest, ListenerAddedDuringBroadcastWaitsForTheNextMessage) {
  LoggingListener late("late", mLog);
  LoggingListener a("a", mLog);
  a.SetAction([&](const Message&) { AddListener("S", late); });
  LoggingListener b("b", mLog);
  AddListener("S", a);
  AddListener("S", b);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "b:1", "a:2", "b:2", "late:2"}));
}

TEST_F(StationTest, ListenerRemovedAndAddedAgainDuringBroadcastIsNotCalledTwice) {
  LoggingListener b("b", mLog);
  LoggingListener a("a", mLog);
  a.SetAction([&](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      RemoveListener("S", b);
      AddListener("S", b);
    }
  });
  AddListener("S", a);
  AddListener("S", b);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1"}));
  EXPECT_EQ(ListenerCount("S"), 2u);
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "b:2"}));
}

namespace {

class SelfDestroyingListener : public Listener {
 public:
  explicit SelfDestroyingListener(Log& log) : mLog(log) {}
  void ListenToMessage(const Message& message) override {
    mLog.push_back("self:" + std::to_string(message.As<PingMessage>()->value));
    delete this;
  }

 private:
  Log& mLog;  // owned by the test
};

}  // namespace

TEST_F(StationTest, ListenerDestroyingItselfDuringBroadcast) {
  LoggingListener a("a", mLog), c("c", mLog);
  auto* self = new SelfDestroyingListener(mLog);
  AddListener("S", a);
  AddListener("S", *self);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "self:1", "c:1", "a:2", "c:2"}));
  EXPECT_EQ(ListenerCount("S"), 2u);
}

TEST_F(StationTest, ListenerDestroyingAnotherNotYetCalledDuringBroadcast) {
  auto victim = std::make_unique<LoggingListener>("victim", mLog);
  LoggingListener killer("killer", mLog, [&](const Message&) { victim.reset(); });
  LoggingListener after("after", mLog);
  AddListener("S", killer);
  AddListener("S", *victim);
  AddListener("Other", *victim);
  AddListener("S", after);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"killer:1", "after:1"}));
  EXPECT_EQ(ListenerCount("Other"), 0u);
}

TEST_F(StationTest, ListenerDestroyingAnotherAlreadyCalledDuringBroadcast) {
  auto early = std::make_unique<LoggingListener>("early", mLog);
  LoggingListener killer("killer", mLog, [&](const Message&) { early.reset(); });
  LoggingListener after("after", mLog);
  AddListener("S", *early);
  AddListener("S", killer);
  AddListener("S", after);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"early:1", "killer:1", "after:1", "killer:2", "after:2"}));
}

TEST_F(StationTest, StationDisposedDuringBroadcastStopsDelivering) {
  LoggingListener a("a", mLog, [](const Message&) { DisposeStation("S"); });
  LoggingListener b("b", mLog);
  AddListener("S", a);
  AddListener("S", b);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1"}));
  EXPECT_FALSE(StationExists("S"));
  EXPECT_FALSE(IsListening("S", b));
}

TEST_F(StationTest, StationDisposedAndRegisteredAgainDuringBroadcast) {
  LoggingListener fresh("fresh", mLog);
  LoggingListener a("a", mLog, [&](const Message&) {
    DisposeStation("S");
    AddListener("S", fresh);
  });
  LoggingListener b("b", mLog);
  AddListener("S", a);
  AddListener("S", b);
  BroadcastMessage("S", PingMessage(1));
  BroadcastMessage("S", PingMessage(2));
  // The old station's message reaches neither the old nor the new station's listeners.
  EXPECT_EQ(mLog, (Log{"a:1", "fresh:2"}));
}

TEST_F(StationTest, NestedBroadcastOnTheSameStation) {
  LoggingListener a("a", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      BroadcastMessage("S", PingMessage(2));
    }
  });
  LoggingListener b("b", mLog);
  AddListener("S", a);
  AddListener("S", b);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "b:2", "b:1"}));
}

TEST_F(StationTest, RemovalInsideANestedBroadcastHoldsForTheOuterOne) {
  LoggingListener c("c", mLog);
  LoggingListener b("b", mLog, [&](const Message& m) {
    if (m.As<PingMessage>()->value == 2) {
      RemoveListener("S", c);
    }
  });
  LoggingListener a("a", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      BroadcastMessage("S", PingMessage(2));
    }
  });
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "b:2", "b:1"}));
  EXPECT_EQ(ListenerCount("S"), 2u);
}

TEST_F(StationTest, DestroyingAListenerInsideANestedBroadcast) {
  auto victim = std::make_unique<LoggingListener>("victim", mLog);
  LoggingListener b("b", mLog, [&](const Message& m) {
    if (m.As<PingMessage>()->value == 2) {
      victim.reset();
    }
  });
  LoggingListener a("a", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      BroadcastMessage("S", PingMessage(2));
    }
  });
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", *victim);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "b:2", "b:1"}));
}

TEST_F(StationTest, DisposingInsideANestedBroadcastEndsTheOuterOneToo) {
  LoggingListener b("b", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 2) {
      DisposeStation("S");
    }
  });
  LoggingListener a("a", mLog, [](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      BroadcastMessage("S", PingMessage(2));
    }
  });
  LoggingListener c("c", mLog);
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "b:2"}));
}

TEST_F(StationTest, BroadcastOnAnotherStationFromAListener) {
  LoggingListener relay("relay", mLog, [](const Message& m) {
    BroadcastMessage("Out", PongMessage("from " + std::to_string(m.As<PingMessage>()->value)));
  });
  LoggingListener out("out", mLog);
  AddListener("In", relay);
  AddListener("Out", out);
  BroadcastMessage("In", PingMessage(5));
  EXPECT_EQ(mLog, (Log{"relay:5", "out:from 5"}));
}

TEST_F(StationTest, NullInterfaceFromAListenerIsRecordedAndDeliveryGoesOn) {
  LoggingListener thrower("thrower", mLog, [](const Message&) {
    RequireInterface(static_cast<int*>(nullptr), "ISequence");
  });
  LoggingListener after("after", mLog);
  AddListener("S", thrower);
  AddListener("S", after);
  BroadcastMessage("S", PingMessage(1));
  EXPECT_EQ(mLog, (Log{"thrower:1", "after:1"}));
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("ISequence"), std::string::npos);
}

TEST_F(StationTest, OtherExceptionsPropagateAndLeaveTheStationUsable) {
  LoggingListener b("b", mLog);
  LoggingListener a("a", mLog, [&](const Message& m) {
    if (m.As<PingMessage>()->value == 1) {
      RemoveListener("S", b);
      throw std::runtime_error("listener failed");
    }
  });
  LoggingListener c("c", mLog);
  AddListener("S", a);
  AddListener("S", b);
  AddListener("S", c);
  EXPECT_THROW(BroadcastMessage("S", PingMessage(1)), std::runtime_error);
  BroadcastMessage("S", PingMessage(2));
  EXPECT_EQ(mLog, (Log{"a:1", "a:2", "c:2"}));
  EXPECT_EQ(ListenerCount("S"), 2u);
}

TEST_F(StationTest, FunctionListenerReceivesTypedMessages) {
  int total = 0;
  {
    FunctionListener listener([&](const Message& m) {
      if (const auto* ping = m.As<PingMessage>()) {
        total += ping->value;
      }
    });
    AddListener("S", listener);
    BroadcastMessage("S", PingMessage(2));
    BroadcastMessage("S", PongMessage("ignored"));
    BroadcastMessage("S", PingMessage(3));
  }
  BroadcastMessage("S", PingMessage(100));
  EXPECT_EQ(total, 5);
}

TEST(MessagingTestScope, LeavesNoStationsBehind) {
  std::vector<std::string> log;
  LoggingListener outlives("outlives", log);
  {
    MessagingTestScope scope;
    AddListener("Leaky", outlives);
  }
  EXPECT_FALSE(StationExists("Leaky"));
  BroadcastMessage("Leaky", PingMessage(1));
  EXPECT_TRUE(log.empty());
}
