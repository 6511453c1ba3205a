#pragma once

#include <memory>

class InMemoryUsageLogSink;

// Gives a test fresh process-wide messaging state and leaves none behind: on entry and on exit it
// disposes every station, drops queued posts and idle tasks, forgets recorded debug assertions,
// trace settings and translations, and installs in-memory application preferences (never the
// user's file) and an in-memory usage sink. Use one per test, e.g. as a fixture member.
class MessagingTestScope {
 public:
  MessagingTestScope();
  MessagingTestScope(const MessagingTestScope&) = delete;
  MessagingTestScope& operator=(const MessagingTestScope&) = delete;
  ~MessagingTestScope();

  // The usage events logged while the scope is alive.
  InMemoryUsageLogSink& UsageEvents() { return *mUsage; }

 private:
  static void ResetAll();

  std::shared_ptr<InMemoryUsageLogSink> mUsage;
};
