#pragma once

#include <functional>
#include <string>

#include "Host/Model/ModelRefs.h"
#include "Host/Toolkit/CommandHandler.h"

// The open project as a file a person saves: where it goes, whether it changed since it was last
// written (its undo history away from the saved state), and the questions of saving and closing.
// It answers "cmd.file.save" (Ctrl+S) and "cmd.file.saveas" (Ctrl+Shift+S) for every panel as
// a fallback command handler while it lives.
//
// A project with no file yet (the built-in demo) asks for a path through the input box on its
// first save. Saves are atomic (ProjectFile::Save): a failed one keeps the old file and the
// changes, and its reason is kept in GetLastError. Owned by the application; UI thread only.
class ProjectDocument : public CommandHandler {
 public:
  enum class SaveOutcome { kSaved, kCancelled, kFailed };

  // `path` is where the project was read from; empty when it has no file yet.
  ProjectDocument(ProjectRef project, std::string path);
  ~ProjectDocument() override;

  const ProjectRef& GetProject() const { return mProject; }
  const std::string& GetPath() const { return mPath; }
  bool IsModified() const;
  // The window title: the project's name, the file's, and "*" while modified.
  std::string GetTitle() const;
  // Why the last save failed; empty after a save that worked.
  const std::string& GetLastError() const { return mLastError; }
  // Told the reason of every failed save (the window front end shows it to the person).
  void SetFailureReporter(std::function<void(const std::string&)> reporter) {
    mReportFailure = std::move(reporter);
  }

  // Saves to the file, asking for one when there is none yet.
  SaveOutcome Save();
  // Asks for a file (the current one offered), then saves there; the project is that file's
  // from then on.
  SaveOutcome SaveAs();
  // Whether the project may close now: unmodified, or the person answered the popup "Save" (and
  // the save worked) or "Don't Save". "Cancel", a dismissed popup or a failed save keep it open.
  bool ConfirmClose();

  // --- CommandHandler ---
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

 private:
  SaveOutcome SaveTo(const std::string& path);

  ProjectRef mProject;
  std::string mPath;
  std::string mLastError;
  std::function<void(const std::string&)> mReportFailure;
};
