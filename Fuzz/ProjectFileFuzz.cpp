// Any bytes as a project file: loading never crashes, and a project that loads saves to a file
// that loads again and saves to the same bytes.

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "Fuzz/FuzzHarness.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const MessagingTestScope messaging;  // each input starts from fresh stations
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  const ProjectLoadResult loaded = ProjectFile::LoadFromString(text);
  if (!loaded) {
    FUZZ_CHECK(!loaded.error.empty());
    return 0;
  }
  const std::string saved = ProjectFile::SaveToString(*loaded.project);
  const ProjectLoadResult reloaded = ProjectFile::LoadFromString(saved);
  FUZZ_CHECK(reloaded);
  FUZZ_CHECK(ProjectFile::SaveToString(*reloaded.project) == saved);
  return 0;
}
