#include "Host/Toolkit/RepeatTimer.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"

RepeatTimer& RepeatTimer::Instance() {
  static RepeatTimer timer;
  return timer;
}

RepeatTimer::RepeatTimer(StationName station, Milliseconds period)
    : mStation(std::move(station)), mPeriod(period > Milliseconds{0} ? period : kDefaultPeriod) {}

RepeatTimer::~RepeatTimer() = default;

bool RepeatTimer::SetPeriod(Milliseconds period) {
  if (!HOST_VERIFY(period > Milliseconds{0}, "Invalid repeat period")) {
    return false;
  }
  mPeriod = period;
  return true;
}

RepeatTimer::Milliseconds RepeatTimer::NextRepeatAfter(Milliseconds time) const {
  const auto periods = time.count() >= 0 ? time.count() / mPeriod.count() + 1 : 1;
  return mPeriod * periods;
}

const RepeatTimer::Timer* RepeatTimer::EarliestTimer() const {
  const auto it =
      std::min_element(mTimers.begin(), mTimers.end(), [](const Timer& a, const Timer& b) {
        return a.due != b.due ? a.due < b.due : a.order < b.order;
      });
  return it != mTimers.end() ? &*it : nullptr;
}

bool RepeatTimer::AdvanceTo(Milliseconds time) {
  if (!HOST_VERIFY(!mAdvancing, "The timer clock cannot move from inside a timer") ||
      !HOST_VERIFY(time >= mNow, "The timer clock cannot move backwards")) {
    return false;
  }
  mAdvancing = true;
  // The repeat of the current time already fired when the clock got here.
  Milliseconds nextRepeat = NextRepeatAfter(mNow);
  // Tasks that keep rescheduling themselves with no delay would never let the clock move.
  Milliseconds lastEventTime = mNow;
  int eventsAtLastTime = 0;
  while (true) {
    const Timer* timer = EarliestTimer();
    // Repeats with nobody listening are skipped, not queued.
    const bool repeatDue = nextRepeat <= time && ListenerCount(mStation) > 0;
    const bool timerDue = timer != nullptr && timer->due <= time;
    if (!repeatDue && !timerDue) {
      break;
    }
    if (repeatDue && (!timerDue || nextRepeat <= timer->due)) {
      mNow = nextRepeat;
      nextRepeat += mPeriod;
      BroadcastMessage(mStation, RepeatMessage(mNow));
      continue;
    }
    mNow = std::max(mNow, timer->due);
    if (nextRepeat <= mNow) {
      nextRepeat = NextRepeatAfter(mNow);
    }
    eventsAtLastTime = mNow == lastEventTime ? eventsAtLastTime + 1 : 1;
    lastEventTime = mNow;
    if (!HOST_VERIFY(eventsAtLastTime <= kMaxEventsAtOneTime,
                     "Timer tasks keep rescheduling themselves without delay")) {
      break;
    }
    std::function<void()> task = timer->task;
    const TimerID id = timer->id;
    if (timer->period > Milliseconds{0}) {
      const auto it =
          std::find_if(mTimers.begin(), mTimers.end(), [&](const Timer& t) { return t.id == id; });
      it->due += it->period;
      it->order = mNextOrder++;
    } else {
      Cancel(id);
    }
    task();
  }
  mNow = time;
  mAdvancing = false;
  return true;
}

RepeatTimer::TimerID RepeatTimer::Schedule(Milliseconds delay, std::function<void()> task,
                                           Milliseconds period) {
  if (!HOST_VERIFY(task != nullptr, "Invalid timer task")) {
    return 0;
  }
  Timer timer;
  timer.id = mNextID++;
  timer.due = mNow + std::max(delay, Milliseconds{0});
  timer.period = std::max(period, Milliseconds{0});
  timer.order = mNextOrder++;
  timer.task = std::move(task);
  mTimers.push_back(std::move(timer));
  return mTimers.back().id;
}

bool RepeatTimer::Cancel(TimerID id) {
  return std::erase_if(mTimers, [&](const Timer& timer) { return timer.id == id; }) > 0;
}

void RepeatTimer::ResetForTesting() {
  mNow = Milliseconds{0};
  mTimers.clear();
  mAdvancing = false;
}
