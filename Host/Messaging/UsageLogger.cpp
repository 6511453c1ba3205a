#include "Host/Messaging/UsageLogger.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>

std::string UsageField::FormatNumber(double value, bool asFloat) {
  if (!std::isfinite(value)) {
    return std::isnan(value) ? "nan" : (value > 0 ? "inf" : "-inf");
  }
  char buffer[32];
  std::snprintf(buffer, sizeof buffer, "%.17g", value);
  for (int precision = 1; precision < 17; ++precision) {
    char shorter[32];
    std::snprintf(shorter, sizeof shorter, "%.*g", precision, value);
    const bool same = asFloat ? std::strtof(shorter, nullptr) == static_cast<float>(value)
                              : std::strtod(shorter, nullptr) == value;
    if (same) {
      return shorter;
    }
  }
  return buffer;
}

std::string UsageEvent::Get(std::string_view key) const {
  for (const auto& [k, v] : fields) {
    if (k == key) {
      return v;
    }
  }
  return {};
}

void InMemoryUsageLogSink::Record(const UsageEvent& event) {
  const std::lock_guard lock(mMutex);
  mEvents.push_back(event);
}

std::vector<UsageEvent> InMemoryUsageLogSink::Events() const {
  const std::lock_guard lock(mMutex);
  return mEvents;
}

std::size_t InMemoryUsageLogSink::Count(std::string_view name) const {
  const std::lock_guard lock(mMutex);
  return static_cast<std::size_t>(std::count_if(
      mEvents.begin(), mEvents.end(), [name](const UsageEvent& e) { return e.name == name; }));
}

void InMemoryUsageLogSink::Clear() {
  const std::lock_guard lock(mMutex);
  mEvents.clear();
}

UsageLogger& UsageLogger::Instance() {
  static UsageLogger logger;
  return logger;
}

void UsageLogger::SetSink(std::shared_ptr<UsageLogSink> sink) {
  const std::lock_guard lock(mMutex);
  mSink = std::move(sink);
}

std::shared_ptr<UsageLogSink> UsageLogger::GetSink() const {
  const std::lock_guard lock(mMutex);
  return mSink;
}

void UsageLogger::LogEvent(std::string_view name, std::initializer_list<UsageField> fields) {
  const auto sink = GetSink();
  if (sink == nullptr) {
    return;
  }
  UsageEvent event{std::string(name), {}};
  event.fields.reserve(fields.size());
  for (const auto& field : fields) {
    event.fields.emplace_back(field.key, field.value);
  }
  sink->Record(event);
}
