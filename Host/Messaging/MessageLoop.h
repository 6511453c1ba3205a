#pragma once

#include <cstddef>
#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <vector>

#include "Host/Messaging/Station.h"

// The UI thread's queue of posted messages and idle tasks. Process-wide; any thread may post,
// only the UI thread runs it. Under test nothing runs on its own: a test calls RunPending.
class MessageLoop {
 public:
  // Most posts one RunPending delivers; posts made while delivering count too, so two listeners
  // that keep posting to each other cannot hang the UI thread.
  static constexpr std::size_t kMaxDeliveriesPerRun = 10000;

  static MessageLoop& Instance();

  // Delivers queued posts (and any posted while delivering, up to kMaxDeliveriesPerRun) in the
  // order they were posted, then runs the idle tasks that were queued when it started. Returns
  // how many posts were delivered. A call made from inside a delivery or task returns 0 at once.
  std::size_t RunPending();
  bool HasPending() const;
  std::size_t PendingCount() const;

  // Thread-safe. The task runs once, on the UI thread, at the end of the next RunPending.
  void AddIdleTask(std::function<void()> task);

  // Thread-safe; see PostMessageToUIThread.
  void Post(const StationName& station, std::shared_ptr<const Message> message);

  // Called after each post and idle task is queued, on the queuing thread and outside the lock,
  // so a front end can wake its event loop (an SDL user event, say). Empty: none.
  void SetWakeUpHandler(std::function<void()> handler);

  // Drops every queued post and task and the wake-up handler (tests; see MessagingTestScope).
  void DiscardPending();

 private:
  MessageLoop() = default;

  struct QueuedPost {
    StationName station;
    std::shared_ptr<const Message> message;
  };

  mutable std::mutex mMutex;
  std::deque<QueuedPost> mPosts;                  // guarded by mMutex
  std::vector<std::function<void()>> mIdleTasks;  // guarded by mMutex
  std::function<void()> mWakeUp;                  // guarded by mMutex
  bool mRunning = false;                          // UI thread only
};
