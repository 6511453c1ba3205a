#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <string_view>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"

// Broadcast on the repeat station at every multiple of the period while someone listens:
// what views listen to for auto-scrolling and animation while a drag or playback lasts.
struct RepeatMessage : MessageOf<RepeatMessage> {
  static constexpr std::string_view kTypeName = "RepeatMessage";

  explicit RepeatMessage(std::chrono::milliseconds time) : now(time) {}

  std::chrono::milliseconds now;  // the timer clock at this repeat
};

// The UI thread's timers, driven by a clock that only moves when told to: the program advances
// it from real time, tests step it. Nothing runs on a thread of its own.
//
// Repeats: at every positive multiple of the period the repeat station gets a RepeatMessage,
// as long as it has listeners. Timers: a task runs once when its time comes, or every period.
// Events fire in time order, each seeing Now() at its own time; at one time the repeat comes
// first, then the timers in the order they were scheduled. UI thread only.
class RepeatTimer {
 public:
  using Milliseconds = std::chrono::milliseconds;
  using TimerID = std::uint64_t;

  static constexpr std::string_view kStationName = "Toolkit.Repeat";
  static constexpr Milliseconds kDefaultPeriod{50};
  // Most timer tasks one advance runs at a single clock time; past it the advance stops early.
  static constexpr int kMaxEventsAtOneTime = 10000;

  // The process-wide timer on kStationName.
  static RepeatTimer& Instance();

  explicit RepeatTimer(StationName station = StationName(kStationName),
                       Milliseconds period = kDefaultPeriod);
  RepeatTimer(const RepeatTimer&) = delete;
  RepeatTimer& operator=(const RepeatTimer&) = delete;
  ~RepeatTimer();

  const StationName& GetStation() const { return mStation; }
  Milliseconds Now() const { return mNow; }
  Milliseconds GetPeriod() const { return mPeriod; }
  // A period of zero or less is refused (false) with a debug assertion.
  bool SetPeriod(Milliseconds period);

  // Moves the clock to `time`, firing what falls due on the way (times up to and including
  // `time`). Going backwards, or calling it from a task or a repeat listener, is refused
  // (false) with a debug assertion.
  bool AdvanceTo(Milliseconds time);
  bool AdvanceBy(Milliseconds delta) { return AdvanceTo(mNow + delta); }

  // Runs `task` at Now() + delay (a negative delay counts as zero; a task due now runs at the
  // next advance), then, with a period above zero, every period after that until cancelled.
  // Returns the timer's id (never 0); 0 for an empty task.
  TimerID Schedule(Milliseconds delay, std::function<void()> task,
                   Milliseconds period = Milliseconds{0});
  // False when the id is unknown or its one-shot task already ran. Safe from inside a task.
  bool Cancel(TimerID id);
  std::size_t PendingTimers() const { return mTimers.size(); }

  // Clock back to zero, timers dropped (tests).
  void ResetForTesting();

 private:
  struct Timer {
    TimerID id = 0;
    Milliseconds due{0};
    Milliseconds period{0};
    std::uint64_t order = 0;  // scheduling order, for ties
    std::function<void()> task;
  };

  Milliseconds NextRepeatAfter(Milliseconds time) const;
  const Timer* EarliestTimer() const;

  StationName mStation;
  Milliseconds mPeriod;
  Milliseconds mNow{0};
  std::vector<Timer> mTimers;
  TimerID mNextID = 1;
  std::uint64_t mNextOrder = 0;
  bool mAdvancing = false;
};
