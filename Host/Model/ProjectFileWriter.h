#pragma once

#include <string>

class Project;

// Writes a project as the text of its file (docs/project-format.md); ProjectFile is the way in.
class ProjectFileWriter {
 public:
  static std::string Write(const Project& project);
};
