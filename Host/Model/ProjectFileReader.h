#pragma once

#include <string_view>

#include "Host/Model/ProjectFile.h"

// Reads the text of a project file (docs/project-format.md) into a project, or says which place
// of the file is at fault and why; ProjectFile is the way in. Never throws, never half-builds.
class ProjectFileReader {
 public:
  static ProjectLoadResult Read(std::string_view text);
};
