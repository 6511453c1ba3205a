#include "Host/Messaging/MessageLoop.h"

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

  for (auto& task : tasks) {
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
  const std::lock_guard lock(mMutex);
  mIdleTasks.push_back(std::move(task));
}

void MessageLoop::Post(const StationName& station, std::shared_ptr<const Message> message) {
  if (!HOST_VERIFY(message != nullptr, "Posting a null message")) {
    return;
  }
  const std::lock_guard lock(mMutex);
  mPosts.push_back({station, std::move(message)});
}

void MessageLoop::DiscardPending() {
  std::deque<QueuedPost> posts;
  std::vector<std::function<void()>> tasks;
  {
    const std::lock_guard lock(mMutex);
    posts.swap(mPosts);
    tasks.swap(mIdleTasks);
  }
  // Destroyed outside the lock: a message's or task's destructor may post.
}
