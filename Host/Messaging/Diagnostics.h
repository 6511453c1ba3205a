#pragma once

#include <functional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/UsageLogger.h"

// Host debug assertion: on a violated precondition, records (message, condition text, file, line,
// qualified function), shows it once on stderr and returns; it never aborts. The caller then
// returns without change:
//   if (!HOST_VERIFY(trackItem, "Invalid TrackItem")) return;
// HOST_ASSERT is the statement form; both evaluate the condition exactly once.
#define HOST_ASSERT(cond, message) \
  ((cond) ? static_cast<void>(0)   \
          : ::ReportDebugAssertion((message), #cond, __FILE__, __LINE__, __PRETTY_FUNCTION__))
#define HOST_VERIFY(cond, message) \
  (static_cast<bool>(cond) ||      \
   (::ReportDebugAssertion((message), #cond, __FILE__, __LINE__, __PRETTY_FUNCTION__), false))

struct DebugAssertionRecord {
  std::string message;
  std::string condition;
  std::string file;
  int line = 0;
  std::string function;  // qualified name, without return type or parameters
  int count = 1;         // how often it fired since it was recorded
};

// An assertion is identified by its message and site (file, line): the first firing is shown on
// stderr and recorded, later ones only raise the record's count. `function` may be the compiler's
// pretty function text; it is reduced to the qualified name. Thread-safe.
void ReportDebugAssertion(std::string_view message, std::string_view condition,
                          std::string_view file, int line, std::string_view function);
// In the order first fired. UI thread: the reference is invalidated by the next report.
const std::vector<DebugAssertionRecord>& RecordedDebugAssertions();
// Forgets every record, so each assertion is shown again (tests).
void ClearRecordedDebugAssertions();

// "void Foo::Bar(int) const" -> "Foo::Bar"; text it cannot take apart is returned as it is.
std::string QualifiedFunctionName(std::string_view prettyFunction);

// A required host interface is missing. Thrown by RequireInterface; caught and recorded at message
// dispatch (BroadcastMessage, MessageLoop) and command dispatch.
class NullInterfaceException : public std::logic_error {
 public:
  explicit NullInterfaceException(std::string_view interfaceName);
  const std::string& GetInterfaceName() const { return mInterfaceName; }

 private:
  std::string mInterfaceName;
};

// *p, or throws NullInterfaceException naming `name` when p is null.
template <class P>
P& RequireInterface(P* p, std::string_view name) {
  if (p == nullptr) {
    throw NullInterfaceException(name);
  }
  return *p;
}

// Records a caught NullInterfaceException as a debug assertion of the dispatching site.
void ReportNullInterface(const NullInterfaceException& exception, std::string_view where);

// Trace lines by category (e.g. Trace("Tracker", ...)). A category is off until enabled, either
// here or by the environment variable EC_TRACE (a list as for EnableTraceCategories), read on
// first use. The category "*" stands for all; with it on, single categories can still be off. Lines
// go to stderr as "[category] text", or to the sink when one is set. Thread-safe; the sink is
// called outside any lock and may trace again.
using TraceSink = std::function<void(std::string_view category, std::string_view text)>;
void Trace(std::string_view category, std::string_view text);
void SetTraceCategoryEnabled(std::string_view category, bool enabled);
bool IsTraceCategoryEnabled(std::string_view category);
// Enables each category of a comma-separated list such as "Tracker, Layout" or "*".
void EnableTraceCategories(std::string_view list);
// An empty sink restores stderr.
void SetTraceSink(TraceSink sink);
// Disables every category, ignores EC_TRACE, restores stderr (tests).
void ResetTraceForTesting();
