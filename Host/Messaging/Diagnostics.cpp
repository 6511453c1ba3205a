#include "Host/Messaging/Diagnostics.h"

#include <cstdlib>
#include <iostream>
#include <mutex>
#include <set>
#include <string>
#include <tuple>

namespace {

struct AssertionStore {
  std::mutex mutex;
  std::vector<DebugAssertionRecord> records;
};

AssertionStore& GetAssertionStore() {
  static AssertionStore store;
  return store;
}

struct TraceState {
  std::mutex mutex;
  std::set<std::string, std::less<>> enabled;
  std::set<std::string, std::less<>> disabled;  // exceptions to allEnabled
  bool allEnabled = false;
  bool environmentRead = false;
  TraceSink sink;
};

TraceState& GetTraceState() {
  static TraceState state;
  return state;
}

// The caller holds the lock.
void SetEnabled(TraceState& state, std::string_view category, bool enabled) {
  if (category == "*") {
    state.allEnabled = enabled;
    state.disabled.clear();
    return;
  }
  auto& add = enabled ? state.enabled : state.disabled;
  auto& drop = enabled ? state.disabled : state.enabled;
  add.emplace(category);
  if (const auto it = drop.find(category); it != drop.end()) {
    drop.erase(it);
  }
}

// The caller holds the lock.
void EnableList(TraceState& state, std::string_view list) {
  while (!list.empty()) {
    const auto comma = list.find(',');
    std::string_view item = list.substr(0, comma);
    list = comma == std::string_view::npos ? std::string_view() : list.substr(comma + 1);
    while (!item.empty() && item.front() == ' ') {
      item.remove_prefix(1);
    }
    while (!item.empty() && item.back() == ' ') {
      item.remove_suffix(1);
    }
    if (!item.empty()) {
      SetEnabled(state, item, true);
    }
  }
}

// Reads EC_TRACE once; the caller holds the lock.
void ReadTraceEnvironment(TraceState& state) {
  if (state.environmentRead) {
    return;
  }
  state.environmentRead = true;
  if (const char* const variable = std::getenv("EC_TRACE")) {
    EnableList(state, variable);
  }
}

// The caller holds the lock.
bool IsEnabled(const TraceState& state, std::string_view category) {
  return state.allEnabled ? !state.disabled.contains(category) : state.enabled.contains(category);
}

// Index of the '(' matching the ')' at `close`, or npos.
std::size_t MatchingOpenParen(std::string_view text, std::size_t close) {
  int depth = 0;
  for (std::size_t i = close + 1; i-- > 0;) {
    if (text[i] == ')') {
      ++depth;
    } else if (text[i] == '(') {
      if (--depth == 0) {
        return i;
      }
    }
  }
  return std::string_view::npos;
}

}  // namespace

std::string QualifiedFunctionName(std::string_view pretty) {
  std::string_view text = pretty;
  // GCC appends " [with T = int]" to templates.
  if (const auto with = text.find(" [with "); with != std::string_view::npos) {
    text = text.substr(0, with);
  }
  // Trailing qualifiers after the parameter list.
  for (bool trimmed = true; trimmed;) {
    trimmed = false;
    for (const std::string_view suffix :
         {" const", " volatile", " &&", " &", " noexcept", "&&", "&"}) {
      if (text.ends_with(suffix)) {
        text.remove_suffix(suffix.size());
        trimmed = true;
      }
    }
  }
  if (text.empty() || text.back() != ')') {
    return std::string(pretty);
  }
  const auto open = MatchingOpenParen(text, text.size() - 1);
  if (open == std::string_view::npos || open == 0) {
    return std::string(pretty);
  }
  text = text.substr(0, open);
  // The name starts after the last space outside template brackets (the return type's end);
  // "operator<" and friends keep their brackets out of the count.
  int angle = 0;
  std::size_t start = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char c = text[i];
    if (text.substr(i).starts_with("operator")) {
      break;
    }
    if (c == '<') {
      ++angle;
    } else if (c == '>' && angle > 0) {
      --angle;
    } else if (c == ' ' && angle == 0) {
      start = i + 1;
    }
  }
  const std::string_view name = text.substr(start);
  // Parentheses left in the name mean a declarator this does not understand (a function
  // returning a function pointer); better the whole text than a wrong name.
  const auto operatorAt = name.find("operator");
  const std::string_view beforeOperator = name.substr(0, operatorAt);
  if (name.empty() || beforeOperator.find_first_of("()") != std::string_view::npos) {
    return std::string(pretty);
  }
  return std::string(name);
}

namespace {

void Record(DebugAssertionRecord record) {
  auto& store = GetAssertionStore();
  const std::lock_guard lock(store.mutex);
  for (auto& known : store.records) {
    if (known.line == record.line && known.message == record.message && known.file == record.file) {
      ++known.count;
      return;
    }
  }
  std::cerr << "Debug assertion: " << record.message << " (" << record.condition << ")";
  if (!record.file.empty()) {
    std::cerr << " at " << record.file << ':' << record.line;
  }
  std::cerr << " in " << record.function << std::endl;
  store.records.push_back(std::move(record));
}

}  // namespace

void ReportDebugAssertion(std::string_view message, std::string_view condition,
                          std::string_view file, int line, std::string_view function) {
  Record({std::string(message), std::string(condition), std::string(file), line,
          QualifiedFunctionName(function)});
}

const std::vector<DebugAssertionRecord>& RecordedDebugAssertions() {
  return GetAssertionStore().records;
}

void ClearRecordedDebugAssertions() {
  auto& store = GetAssertionStore();
  const std::lock_guard lock(store.mutex);
  store.records.clear();
}

NullInterfaceException::NullInterfaceException(std::string_view interfaceName)
    : std::logic_error("Required host interface is missing: " + std::string(interfaceName)),
      mInterfaceName(interfaceName) {}

void ReportNullInterface(const NullInterfaceException& exception, std::string_view where) {
  Record({exception.what(), "RequireInterface(" + exception.GetInterfaceName() + ")", "", 0,
          "dispatch of " + std::string(where)});
}

void Trace(std::string_view category, std::string_view text) {
  auto& state = GetTraceState();
  TraceSink sink;
  {
    const std::lock_guard lock(state.mutex);
    ReadTraceEnvironment(state);
    if (!IsEnabled(state, category)) {
      return;
    }
    sink = state.sink;
  }
  if (sink) {
    sink(category, text);
  } else {
    std::cerr << '[' << category << "] " << text << std::endl;
  }
}

void SetTraceCategoryEnabled(std::string_view category, bool enabled) {
  auto& state = GetTraceState();
  const std::lock_guard lock(state.mutex);
  ReadTraceEnvironment(state);
  SetEnabled(state, category, enabled);
}

void EnableTraceCategories(std::string_view list) {
  auto& state = GetTraceState();
  const std::lock_guard lock(state.mutex);
  ReadTraceEnvironment(state);
  EnableList(state, list);
}

bool IsTraceCategoryEnabled(std::string_view category) {
  auto& state = GetTraceState();
  const std::lock_guard lock(state.mutex);
  ReadTraceEnvironment(state);
  return IsEnabled(state, category);
}

void SetTraceSink(TraceSink sink) {
  auto& state = GetTraceState();
  const std::lock_guard lock(state.mutex);
  state.sink = std::move(sink);
}

void ResetTraceForTesting() {
  auto& state = GetTraceState();
  const std::lock_guard lock(state.mutex);
  state.enabled.clear();
  state.disabled.clear();
  state.allEnabled = false;
  state.environmentRead = true;
  state.sink = nullptr;
}
