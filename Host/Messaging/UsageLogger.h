#pragma once

#include <concepts>
#include <cstddef>
#include <initializer_list>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

// One key/value pair of a usage event; numbers and flags are written as text.
struct UsageField {
  UsageField(std::string_view k, std::string_view v) : key(k), value(v) {}
  UsageField(std::string_view k, const char* v) : key(k), value(v) {}
  UsageField(std::string_view k, const std::string& v) : key(k), value(v) {}
  UsageField(std::string_view k, bool v) : key(k), value(v ? "true" : "false") {}
  template <std::integral I>
  UsageField(std::string_view k, I v) : key(k), value(std::to_string(v)) {}
  template <std::floating_point F>
  UsageField(std::string_view k, F v)
      : key(k), value(FormatNumber(static_cast<double>(v), sizeof(F) == sizeof(float))) {}

  std::string key;
  std::string value;

 private:
  // Shortest text that reads back as the same number (as a float when `asFloat`).
  static std::string FormatNumber(double value, bool asFloat);
};

struct UsageEvent {
  std::string name;
  std::vector<std::pair<std::string, std::string>> fields;  // in the order logged

  // The value of `key`, or empty when absent.
  std::string Get(std::string_view key) const;
};

// Where usage events go. Called on the thread that logs, outside the logger's lock (a sink may
// log again); a sink used from several threads guards itself.
class UsageLogSink {
 public:
  virtual ~UsageLogSink() = default;
  virtual void Record(const UsageEvent& event) = 0;
};

// Keeps every event in memory (tests and the state dump).
class InMemoryUsageLogSink : public UsageLogSink {
 public:
  void Record(const UsageEvent& event) override;
  std::vector<UsageEvent> Events() const;
  std::size_t Count(std::string_view name) const;
  void Clear();

 private:
  mutable std::mutex mMutex;
  std::vector<UsageEvent> mEvents;  // guarded by mMutex
};

// The host's usage logger, process-wide. Without a sink, events are dropped. Thread-safe.
class UsageLogger {
 public:
  static UsageLogger& Instance();

  // Shares ownership of the sink; nullptr drops later events.
  void SetSink(std::shared_ptr<UsageLogSink> sink);
  std::shared_ptr<UsageLogSink> GetSink() const;

  // e.g. LogEvent("mask_tracker_performance", {{"milliseconds", 812}, {"frames", 48}})
  void LogEvent(std::string_view name, std::initializer_list<UsageField> fields = {});

 private:
  UsageLogger() = default;

  mutable std::mutex mMutex;
  std::shared_ptr<UsageLogSink> mSink;  // guarded by mMutex
};
