// Any bytes as a colour-definition resource: parsing never crashes, every definition and problem
// names a line of the text, and no key is defined twice.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <set>
#include <string>
#include <string_view>

#include "Fuzz/FuzzHarness.h"
#include "Host/Toolkit/ColorDefinitionParser.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  const ColorDefinitionParseResult result = ColorDefinitionParser::Parse(text);
  const auto lines = std::count(text.begin(), text.end(), '\n') + 1;
  std::set<std::string> keys;
  for (const ColorDefinition& definition : result.definitions) {
    FUZZ_CHECK(definition.line >= 1 && definition.line <= lines);
    FUZZ_CHECK(keys.insert(definition.key).second);
  }
  for (const ColorDefinitionProblem& problem : result.problems) {
    FUZZ_CHECK(problem.line >= 1 && problem.line <= lines);
  }
  return 0;
}
