// Any bytes as a stored property list: reading never crashes, and a list that reads writes to
// text that reads back as the same list.

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Fuzz/FuzzHarness.h"
#include "Host/Messaging/PropertyList.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  std::string error;
  const std::optional<PropertyList> list = PropertyList::FromJSON(text, &error);
  if (!list) {
    FUZZ_CHECK(!error.empty());
    return 0;
  }
  const std::optional<PropertyList> again = PropertyList::FromJSON(list->ToJSON());
  FUZZ_CHECK(again && *again == *list);
  return 0;
}
