#include "Host/Messaging/MessageLoop.h"

#include <iterator>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Message.h"

MessageLoop& MessageLoop::Instance() {
  static MessageLoop loop;
  return loop;
}

std::size_t MessageLoop::RunPending() {
  if (mRunning) {
    return 0;
  }
  mRunning = true;
  struct RunningGuard {
    bool& running;
    ~RunningGuard() { running = false; }
  } guard{mRunning};

  std::vector<std::function<void()>> tasks;
  {
    const std::lock_guard lock(mMutex);
    tasks.swap(mIdleTasks);
  }

  std::size_t delivered = 0;
  while (delivered < kMaxDeliveriesPerRun) {
    QueuedPost post;
    {
      const std::lock_guard lock(mMutex);
      if (mPosts.empty()) {
        break;
      }
      post = std::move(mPosts.front());
      mPosts.pop_front();
    }
    BroadcastMessage(post.station, *post.message);
    ++delivered;
  }

  // A task that throws leaves the ones after it queued for the next run.
  std::size_t next = 0;
  struct RequeueGuard {
    MessageLoop& loop;
    std::vector<std::function<void()>>& tasks;
    std::size_t& next;
    ~RequeueGuard() {
      if (next < tasks.size()) {
        const std::lock_guard lock(loop.mMutex);
        loop.mIdleTasks.insert(
            loop.mIdleTasks.begin(),
            std::make_move_iterator(tasks.begin() + static_cast<std::ptrdiff_t>(next)),
            std::make_move_iterator(tasks.end()));
      }
    }
  } requeue{*this, tasks, next};
  while (next < tasks.size()) {
    auto task = std::move(tasks[next++]);
    try {
      task();
    } catch (const NullInterfaceException& exception) {
      ReportNullInterface(exception, "MessageLoop idle task");
    }
  }
  return delivered;
}

bool MessageLoop::HasPending() const {
  const std::lock_guard lock(mMutex);
  return !mPosts.empty() || !mIdleTasks.empty();
}

std::size_t MessageLoop::PendingCount() const {
  const std::lock_guard lock(mMutex);
  return mPosts.size();
}

void MessageLoop::AddIdleTask(std::function<void()> task) {
  if (!task) {
    return;
  }
  std::function<void()> wakeUp;
  {
    const std::lock_guard lock(mMutex);
    mIdleTasks.push_back(std::move(task));
    wakeUp = mWakeUp;
  }
  if (wakeUp) {
    wakeUp();
  }
}

void MessageLoop::Post(const StationName& station, std::shared_ptr<const Message> message) {
  if (!HOST_VERIFY(message != nullptr, "Posting a null message")) {
    return;
  }
  std::function<void()> wakeUp;
  {
    const std::lock_guard lock(mMutex);
    mPosts.push_back({station, std::move(message)});
    wakeUp = mWakeUp;
  }
  if (wakeUp) {
    wakeUp();
  }
}

void MessageLoop::SetWakeUpHandler(std::function<void()> handler) {
  const std::lock_guard lock(mMutex);
  mWakeUp = std::move(handler);
}

void MessageLoop::DiscardPending() {
  std::deque<QueuedPost> posts;
  std::vector<std::function<void()>> tasks;
  {
    const std::lock_guard lock(mMutex);
    posts.swap(mPosts);
    tasks.swap(mIdleTasks);
    mWakeUp = nullptr;
  }
  // Destroyed outside the lock: a message's or task's destructor may post.
}
