#pragma once

#include <string>

#include "Host/Model/ModelRefs.h"

// What a long random session checks between its steps: the project saves, the saved text loads
// back and saves to the same text, and the undo history leads back to where the previous check
// left the project and forward again to now. The history is then started afresh, so each check
// covers the steps since the one before and never meets the history's step limit.
//
// Undo does not restore what is view state rather than an edit (the edit line, the clip
// selection, which rows are expanded); those are left out of the comparison. UI thread only.
class HistoryCheck {
 public:
  // Takes the project as it is now as the starting point and forgets its history.
  void Start(ProjectRef project);
  // Whether Start was given this project (a project opened since needs a Start of its own).
  bool IsChecking(const ProjectRef& project) const {
    return project != nullptr && project == mProject;
  }

  // Empty when everything holds, else what did not. Undoes and redoes every step since the
  // last check (or Start); the project ends as it was, with a fresh history.
  std::string Check();

 private:
  ProjectRef mProject;
  std::string mBaseline;  // the saved text at the last check, view state left out
};
