#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Host/Shell/AutomationScript.h"
#include "Host/Shell/HistoryCheck.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/Geometry.h"

class Application;
class Project;
class Image;
class InputBoxResponder;
class MenuTracker;
class ScriptedInputBox;
class ScriptedMenuTracker;
class ScriptInputRoute;

// How a script run ended.
struct ScriptRunResult {
  bool ok = true;
  int line = 0;                       // the failing line (0: none, or the script as a whole)
  std::string message;                // why it failed; empty when ok
  std::vector<std::string> warnings;  // "line N: ..." for things that did not stop the run
  std::vector<std::string> written;   // files written (shots, dumps), in order
  bool closed = false;                // `close` was agreed to: the lines after it did not run

  // "line 3: unknown command name 'x'" (or just the message for line 0).
  std::string Describe() const;
};

// Runs automation scripts against the application: clip selection and edit line through the
// active sequence, pointer and keys through an input route at panel coordinates (relative to
// the front tab's top-left corner), commands through the focused view's chain and the handlers,
// popup menus and input boxes answered from the script, undo and redo through the project's
// history, shots of the workspace and JSON dumps of its state. Relative file names are taken
// inside the output folder (made when missing).
//
// While the runner lives it installs a scripted menu tracker and input box responder (the
// previous ones come back when it is destroyed). The first failing line stops the run. After
// every line the runner delivers posted messages and repaints what was invalidated. Nothing is
// ever written to the project file except by `save`. UI thread only.
class ScriptRunner {
 public:
  // Neither is owned; both outlive the runner.
  ScriptRunner(Application& application, ScriptInputRoute& input, std::string outDir);
  ~ScriptRunner();
  ScriptRunner(const ScriptRunner&) = delete;
  ScriptRunner& operator=(const ScriptRunner&) = delete;

  ScriptRunResult Run(const AutomationScript& script);

  // What `shot` writes; the default renders the workspace (the window front end shows its own
  // read-back). An empty image counts as a failure.
  void SetShotSource(std::function<Image()> source);

  // Writes the project for `save` (path resolved like every other file): true, or false with
  // `error` set. Without one, `save` fails with "saving is not available yet".
  using ProjectSaver =
      std::function<bool(const Project& project, const std::string& path, std::string* error)>;
  void SetProjectSaver(ProjectSaver saver);

  // Files and folders named in a script, resolved against the output folder.
  std::string ResolvePath(const std::string& name) const;

 private:
  // Empty on success, else why the command failed.
  std::string Execute(const ScriptCommand& command, ScriptRunResult& result);
  std::string RunSelect(const ScriptCommand& command);
  std::string RunTime(const ScriptCommand& command);
  std::string RunOpen(const ScriptCommand& command);
  std::string RunReopenPanel();
  std::string RunPointer(const ScriptCommand& command);
  std::string RunKey(const ScriptCommand& command);
  std::string RunCommand(const ScriptCommand& command, ScriptRunResult& result);
  std::string RunMenuAnswer(const ScriptCommand& command);
  std::string RunUndoRedo(bool undo);
  std::string RunShot(const ScriptCommand& command, ScriptRunResult& result);
  // Writes the program's resident memory and the undo history's length as JSON.
  std::string RunMemory(const ScriptCommand& command, ScriptRunResult& result);
  // Lets `milliseconds` of real time pass, delivering posted work (playback steps) meanwhile.
  void RunWait(int milliseconds);
  // Asks to close the project as the window's close button does (a popup when it changed).
  std::string RunClose(const ScriptCommand& command, ScriptRunResult& result);
  std::string RunDump(const ScriptCommand& command, ScriptRunResult& result);
  std::string RunSave(const ScriptCommand& command, ScriptRunResult& result);
  // Saves, reloads and walks the undo history back and forth (see HistoryCheck); also fails on
  // any debug assertion recorded so far.
  std::string RunCheck();
  std::string WriteFile(const std::string& path, const std::string& content);
  // The command named by an id or a "cmd...." name, or an error.
  std::optional<CommandID> LookUpCommand(const std::string& text, std::string& error) const;
  // Panel coordinates to window coordinates.
  Point ToWindow(int x, int y) const;
  // Checks the popups shown since the last call against the answers they took, then forgets
  // them and the input boxes shown.
  std::string CheckPopups(int line, ScriptRunResult& result);
  void Settle();

  Application& mApplication;  // not owned
  ScriptInputRoute& mInput;   // not owned
  std::string mOutDir;
  std::function<Image()> mShotSource;
  ProjectSaver mProjectSaver;
  std::shared_ptr<ScriptedMenuTracker> mMenus;
  std::shared_ptr<ScriptedInputBox> mInputBoxes;
  std::shared_ptr<MenuTracker> mPreviousMenus;
  std::shared_ptr<InputBoxResponder> mPreviousInputBoxes;
  std::deque<std::optional<CommandID>> mPendingMenuAnswers;  // mirrors the tracker's queue
  HistoryCheck mHistoryCheck;
};
