// Any bytes as an automation script: parsing never crashes, and a refused script names a line
// of it.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <variant>

#include "Fuzz/FuzzHarness.h"
#include "Host/Shell/AutomationScript.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  const AutomationScript::ParseResult parsed = AutomationScript::Parse(text);
  if (const auto* error = std::get_if<ScriptError>(&parsed)) {
    const auto lines = std::count(text.begin(), text.end(), '\n') + 1;
    FUZZ_CHECK(error->line >= 1 && error->line <= lines);
    FUZZ_CHECK(!error->message.empty());
  }
  return 0;
}
