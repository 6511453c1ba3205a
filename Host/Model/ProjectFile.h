#pragma once

#include <string>
#include <string_view>

#include "Host/Model/ModelRefs.h"

class Project;

// What a load gives: the project, or null and an error that names the place in the file and the
// fault, e.g. "sequences[0].tracks[2].items[1].start: expected an integer tick count".
struct ProjectLoadResult {
  ProjectRef project;
  std::string error;

  explicit operator bool() const { return static_cast<bool>(project); }
};

// The project file: JSON, described in docs/project-format.md. Saving writes everything a project
// holds except its undo history and clipboard; loading gives back an equal project (same ids,
// values, keyframes and selection), so load(save(p)) == p.
//
// Loading never throws and never half-builds: a file with any fault gives no project. Ids of the
// file are kept; later objects of the process get higher ones.
class ProjectFile {
 public:
  static constexpr const char* kFormatName = "effectcontrols-project";
  static constexpr int kFormatVersion = 1;

  static ProjectLoadResult LoadFromString(std::string_view json);
  // Also reports a file that cannot be opened or read ("<path>: cannot open").
  static ProjectLoadResult Load(const std::string& path);

  static std::string SaveToString(const Project& project);
  // Writes beside `path`, flushes, then renames over it: a failed save leaves the old file as
  // it was. False with `*error` set when it cannot.
  static bool Save(const Project& project, const std::string& path, std::string* error = nullptr);
};
