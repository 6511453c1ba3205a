#include "Host/Shell/ScriptRunner.h"

#include <unistd.h>

#include <algorithm>
#include <charconv>
#include <chrono>
#include <exception>
#include <filesystem>
#include <fstream>
#include <limits>
#include <thread>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/HostTool.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Shell/ScriptInputRoute.h"
#include "Host/Shell/StateDumpWriter.h"
#include "Host/Shell/WholeNumber.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

bool IsEnabledCommandOf(const std::vector<PopupMenuEntry>& entries, CommandID command) {
  for (const auto& entry : entries) {
    if (entry.kind == MenuItem::Kind::kCommand && entry.command == command && entry.enabled)
      return true;
    if (IsEnabledCommandOf(entry.submenu, command))
      return true;
  }
  return false;
}

std::string LineText(int line) {
  return "line " + std::to_string(line) + ": ";
}

}  // namespace

std::string ScriptRunResult::Describe() const {
  return line > 0 ? LineText(line) + message : message;
}

ScriptRunner::ScriptRunner(Application& application, ScriptInputRoute& input, std::string outDir)
    : mApplication(application),
      mInput(input),
      mOutDir(std::move(outDir)),
      mMenus(std::make_shared<ScriptedMenuTracker>()),
      mInputBoxes(std::make_shared<ScriptedInputBox>()) {
  mPreviousMenus = SetMenuTracker(mMenus);
  mPreviousInputBoxes = InputBox::SetResponder(mInputBoxes);
}

ScriptRunner::~ScriptRunner() {
  SetMenuTracker(std::move(mPreviousMenus));
  InputBox::SetResponder(std::move(mPreviousInputBoxes));
}

void ScriptRunner::SetProjectSaver(ProjectSaver saver) {
  mProjectSaver = std::move(saver);
}

void ScriptRunner::SetShotSource(std::function<Image()> source) {
  mShotSource = std::move(source);
}

std::string ScriptRunner::ResolvePath(const std::string& name) const {
  const std::filesystem::path path(name);
  if (path.is_absolute() || mOutDir.empty())
    return path.string();
  return (std::filesystem::path(mOutDir) / path).string();
}

ScriptRunResult ScriptRunner::Run(const AutomationScript& script) {
  ScriptRunResult result;
  const auto& commands = script.Commands();
  const bool checks = std::any_of(commands.begin(), commands.end(), [](const ScriptCommand& c) {
    return c.verb == ScriptVerb::kCheck;
  });
  if (checks && mApplication.GetProject() != nullptr)
    mHistoryCheck.Start(mApplication.GetProject());
  for (const ScriptCommand& command : script.Commands()) {
    std::string error;
    try {
      error = Execute(command, result);
      Settle();
    } catch (const std::exception& exception) {
      error = std::string("failed unexpectedly: ") + exception.what();
    }
    if (error.empty())
      error = CheckPopups(command.line, result);
    if (!error.empty()) {
      result.ok = false;
      result.line = command.line;
      result.message = std::move(error);
      return result;
    }
    if (result.closed) {
      if (&command != &script.Commands().back()) {
        result.warnings.push_back(LineText(command.line) +
                                  "the project was closed: the lines after it did not run");
      }
      break;
    }
  }
  if (!mPendingMenuAnswers.empty()) {
    result.warnings.push_back(std::to_string(mPendingMenuAnswers.size()) +
                              " menu answer(s) were never used: no popup menu asked");
  }
  if (mInputBoxes->PendingAnswers() > 0) {
    result.warnings.push_back(std::to_string(mInputBoxes->PendingAnswers()) +
                              " input answer(s) were never used: no input box asked");
  }
  return result;
}

std::string ScriptRunner::Execute(const ScriptCommand& command, ScriptRunResult& result) {
  switch (command.verb) {
    case ScriptVerb::kSelect:
      return RunSelect(command);
    case ScriptVerb::kSelectNone:
      if (mApplication.GetActiveSequence() == nullptr)
        return "there is no active sequence to select in";
      mApplication.ClearSelection();
      return {};
    case ScriptVerb::kTime:
      return RunTime(command);
    case ScriptVerb::kClick:
    case ScriptVerb::kRightClick:
    case ScriptVerb::kDoubleClick:
    case ScriptVerb::kDrag:
    case ScriptVerb::kMove:
    case ScriptVerb::kWheel:
    case ScriptVerb::kPress:
    case ScriptVerb::kRelease:
      return RunPointer(command);
    case ScriptVerb::kKey:
      return RunKey(command);
    case ScriptVerb::kType:
      if (command.text.empty())
        return "type needs some text";
      mInput.Text(command.text);
      return {};
    case ScriptVerb::kCommand:
      return RunCommand(command, result);
    case ScriptVerb::kMenuAnswer:
      return RunMenuAnswer(command);
    case ScriptVerb::kInputAnswer:
      mInputBoxes->PushAnswer(command.text);
      return {};
    case ScriptVerb::kResize:
      mInput.Resize({command.numbers.at(0), command.numbers.at(1)});
      return {};
    case ScriptVerb::kUndo:
      return RunUndoRedo(true);
    case ScriptVerb::kRedo:
      return RunUndoRedo(false);
    case ScriptVerb::kShot:
      return RunShot(command, result);
    case ScriptVerb::kDump:
      return RunDump(command, result);
    case ScriptVerb::kSave:
      return RunSave(command, result);
    case ScriptVerb::kClose:
      return RunClose(command, result);
    case ScriptVerb::kWait:
      RunWait(command.numbers.front());
      return {};
    case ScriptVerb::kMemory:
      return RunMemory(command, result);
    case ScriptVerb::kTool:
      mApplication.SelectTool(*HostToolFromName(command.text));
      return {};
    case ScriptVerb::kOpen:
      return RunOpen(command);
    case ScriptVerb::kReopenPanel:
      return RunReopenPanel();
    case ScriptVerb::kCheck:
      return RunCheck();
  }
  return "unknown verb";
}

std::string ScriptRunner::RunSelect(const ScriptCommand& command) {
  std::string error;
  if (!mApplication.SelectTrackItems(command.ids, &error))
    return error;
  return {};
}

std::string ScriptRunner::RunOpen(const ScriptCommand& command) {
  // A double-click in the timeline: the first click selects, the second opens.
  std::string error;
  if (!mApplication.SelectTrackItems(command.ids, &error))
    return error;
  const SequenceRef sequence = mApplication.GetActiveSequence();
  std::vector<TrackItemRef> items;
  for (const ObjectID id : command.ids)
    items.push_back(sequence->FindTrackItem(id));
  mApplication.OpenTrackItemSelection(std::move(items));
  return {};
}

std::string ScriptRunner::RunReopenPanel() {
  const TabView* front = mApplication.GetWorkspaceFrame().GetFrontTab();
  if (front == nullptr)
    return "there is no panel to close and reopen";
  const std::string handler = front->GetHandlerID();
  if (!mApplication.CloseTab(handler))
    return "the panel '" + handler + "' refused to close";
  if (mApplication.OpenTab(handler) == nullptr)
    return "the panel '" + handler + "' did not open again";
  return {};
}

std::string ScriptRunner::RunTime(const ScriptCommand& command) {
  const SequenceRef sequence = mApplication.GetActiveSequence();
  if (sequence == nullptr)
    return "there is no active sequence to move the edit line of";
  TickTime time = 0;
  if (const auto ticks = ParseWholeNumber<std::int64_t>(command.text)) {
    time = *ticks;
  } else {
    const FrameRate& display = sequence->GetVideoTimeDisplay();
    const TimecodeParseResult parsed = display.ParseTimecode(command.text);
    if (!parsed.Ok())
      return "'" + command.text + "' is not a timecode of this sequence: " + parsed.message;
    time = *parsed.time;
  }
  if (time < 0)
    return "time must not be negative";
  mApplication.SetEditTime(time);
  return {};
}

Point ScriptRunner::ToWindow(int x, int y) const {
  WorkspaceFrame& frame = mApplication.GetWorkspaceFrame();
  if (const TabView* tab = frame.GetFrontTab())
    return tab->LocalToWindow(Point{x, y});
  return frame.GetTabArea().TopLeft() + Point{x, y};
}

std::string ScriptRunner::RunPointer(const ScriptCommand& command) {
  const KeyModifiers modifiers = command.modifiers;
  const auto& n = command.numbers;
  switch (command.verb) {
    case ScriptVerb::kClick:
    case ScriptVerb::kRightClick: {
      const Point point = ToWindow(n.at(0), n.at(1));
      const MouseButton button =
          command.verb == ScriptVerb::kClick ? MouseButton::kLeft : MouseButton::kRight;
      mInput.MouseMove(point, modifiers);
      mInput.MouseDown(button, point, modifiers, 1);
      mInput.MouseUp(button, point, modifiers);
      return {};
    }
    case ScriptVerb::kDoubleClick: {
      const Point point = ToWindow(n.at(0), n.at(1));
      mInput.MouseMove(point, modifiers);
      mInput.MouseDown(MouseButton::kLeft, point, modifiers, 1);
      mInput.MouseUp(MouseButton::kLeft, point, modifiers);
      mInput.MouseDown(MouseButton::kLeft, point, modifiers, 2);
      mInput.MouseUp(MouseButton::kLeft, point, modifiers);
      return {};
    }
    case ScriptVerb::kDrag: {
      const Point from = ToWindow(n.at(0), n.at(1));
      const Point to = ToWindow(n.at(2), n.at(3));
      mInput.MouseMove(from, modifiers);
      mInput.MouseDown(MouseButton::kLeft, from, modifiers, 1);
      const int steps = std::max(1, command.steps);
      for (int i = 1; i <= steps; ++i) {
        const Point step{from.x + (to.x - from.x) * i / steps,
                         from.y + (to.y - from.y) * i / steps};
        mInput.MouseMove(step, modifiers);
      }
      mInput.MouseUp(MouseButton::kLeft, to, modifiers);
      return {};
    }
    case ScriptVerb::kMove:
      mInput.MouseMove(ToWindow(n.at(0), n.at(1)), modifiers);
      return {};
    case ScriptVerb::kPress: {
      // The button stays down: moves drag until a release (a shot can show the drag).
      const Point point = ToWindow(n.at(0), n.at(1));
      mInput.MouseMove(point, modifiers);
      mInput.MouseDown(MouseButton::kLeft, point, modifiers, 1);
      return {};
    }
    case ScriptVerb::kRelease: {
      const Point point = ToWindow(n.at(0), n.at(1));
      mInput.MouseMove(point, modifiers);
      mInput.MouseUp(MouseButton::kLeft, point, modifiers);
      return {};
    }
    case ScriptVerb::kWheel: {
      const std::optional<Point> point = mApplication.GetViewHost().GetMousePoint();
      if (!point)
        return "wheel turns under the pointer, which is not in the panel yet: move X Y first";
      mInput.Wheel(*point, n.at(0), modifiers);
      return {};
    }
    default:
      return "not a pointer verb";
  }
}

std::string ScriptRunner::RunKey(const ScriptCommand& command) {
  const std::optional<KeyCode> key = KeyCodeFromName(command.text);
  if (!key)
    return "unknown key name '" + command.text + "'";
  mInput.Key(*key, command.modifiers);
  return {};
}

std::optional<CommandID> ScriptRunner::LookUpCommand(const std::string& text,
                                                     std::string& error) const {
  if (const auto number = ParseWholeNumber<std::int64_t>(text)) {
    if (*number <= 0 || *number > std::numeric_limits<CommandID>::max()) {
      error = "'" + text + "' is not a command id";
      return std::nullopt;
    }
    return static_cast<CommandID>(*number);
  }
  const auto id = mApplication.GetViewHost().GetShortcutManager().FindCommandID(text);
  if (!id)
    error = "unknown command name '" + text + "'";
  return id;
}

std::string ScriptRunner::RunCommand(const ScriptCommand& command, ScriptRunResult& result) {
  std::string error;
  const std::optional<CommandID> id = LookUpCommand(command.text, error);
  if (!id)
    return error;
  // As from a menu or a shortcut: a disabled command is not sent.
  if (!mApplication.GetCommandStatus(*id).enabled) {
    result.warnings.push_back(LineText(command.line) + "command " + command.text +
                              " is disabled here; it was not sent");
    return {};
  }
  if (!mApplication.DoCommand(*id)) {
    result.warnings.push_back(LineText(command.line) + "command " + command.text +
                              " was not handled");
  }
  return {};
}

std::string ScriptRunner::RunMenuAnswer(const ScriptCommand& command) {
  if (command.text == "pick" && command.numbers.size() == 1) {
    mMenus->PushPick(command.numbers.front());
    mPendingMenuAnswers.push_back(std::nullopt);  // whatever it picks is enabled
    return {};
  }
  std::optional<CommandID> answer;
  if (command.text != "none") {
    std::string error;
    answer = LookUpCommand(command.text, error);
    if (!answer)
      return error;
  }
  mMenus->PushAnswer(answer);
  mPendingMenuAnswers.push_back(answer);
  return {};
}

std::string ScriptRunner::CheckPopups(int line, ScriptRunResult& result) {
  std::string error;
  for (const PopupMenuRequest& request : mMenus->GetRequests()) {
    if (mPendingMenuAnswers.empty()) {
      result.warnings.push_back(LineText(line) + "popup menu '" + request.menuName +
                                "' was dismissed: no menu-answer was given");
      continue;
    }
    const std::optional<CommandID> answer = mPendingMenuAnswers.front();
    mPendingMenuAnswers.pop_front();
    if (answer && !IsEnabledCommandOf(request.entries, *answer) && error.empty()) {
      error = "popup menu '" + request.menuName + "' has no enabled command " +
              std::to_string(*answer) + "; the menu was dismissed";
    }
  }
  // Every popup and input box is accounted for: a long script keeps no record of them.
  mMenus->ForgetRequests();
  mInputBoxes->ForgetRequests();
  return error;
}

std::string ScriptRunner::RunUndoRedo(bool undo) {
  UndoStack* stack = mApplication.GetUndoStack();
  if (stack == nullptr)
    return "no project is open";
  if (undo ? !stack->CanUndo() : !stack->CanRedo())
    return undo ? "nothing to undo" : "nothing to redo";
  if (!(undo ? stack->Undo() : stack->Redo()))
    return undo ? "the undo was refused" : "the redo was refused";
  return {};
}

std::string ScriptRunner::RunShot(const ScriptCommand& command, ScriptRunResult& result) {
  const std::filesystem::path name(command.text);
  if (name.extension() != ".png" && name.extension() != ".PNG")
    return "shot writes PNG files: '" + command.text + "' does not end in .png";
  const std::string path = ResolvePath(command.text);
  std::error_code ec;
  const auto parent = std::filesystem::path(path).parent_path();
  if (!parent.empty())
    std::filesystem::create_directories(parent, ec);
  Image image;
  if (mShotSource) {
    image = mShotSource();
  } else {
    ViewHost& host = mApplication.GetViewHost();
    host.InvalidateAll();
    host.Render();
    image = host.GetImage().Clone();
  }
  if (image.IsEmpty())
    return "there is nothing to take a shot of";
  std::string error;
  if (!image.SavePNG(path, &error))
    return "cannot write '" + path + "': " + error;
  result.written.push_back(path);
  return {};
}

std::string ScriptRunner::RunDump(const ScriptCommand& command, ScriptRunResult& result) {
  const std::string path = ResolvePath(command.text);
  if (auto error = WriteFile(path, StateDumpWriter::Write(mApplication)); !error.empty())
    return error;
  result.written.push_back(path);
  return {};
}

std::string ScriptRunner::RunSave(const ScriptCommand& command, ScriptRunResult& result) {
  if (!mProjectSaver) {
    return "saving is not available yet: this build cannot write project files ('" + command.text +
           "' was not written)";
  }
  const ProjectRef& project = mApplication.GetProject();
  if (project == nullptr)
    return "no project is open";
  const std::string path = ResolvePath(command.text);
  std::error_code ec;
  const auto parent = std::filesystem::path(path).parent_path();
  if (!parent.empty())
    std::filesystem::create_directories(parent, ec);
  std::string error;
  if (!mProjectSaver(*project, path, &error))
    return "cannot save '" + path + "': " + (error.empty() ? "unknown error" : error);
  result.written.push_back(path);
  return {};
}

std::string ScriptRunner::RunCheck() {
  if (const auto& assertions = RecordedDebugAssertions(); !assertions.empty()) {
    const DebugAssertionRecord& first = assertions.front();
    return "a debug assertion fired: " + first.message + " (" + first.condition + ") in " +
           first.function;
  }
  const ProjectRef& project = mApplication.GetProject();
  if (project == nullptr)
    return "no project is open";
  // A project opened since the last check is checked from here on.
  if (!mHistoryCheck.IsChecking(project)) {
    mHistoryCheck.Start(project);
    return {};
  }
  std::string error = mHistoryCheck.Check();
  Settle();
  return error;
}

std::string ScriptRunner::RunMemory(const ScriptCommand& command, ScriptRunResult& result) {
  // Resident pages from /proc (Linux); the undo history is what long editing keeps.
  std::ifstream statm("/proc/self/statm");
  long long pages = 0;
  long long resident = 0;
  if (!(statm >> pages >> resident))
    return "the program's memory cannot be read here (no /proc/self/statm)";
  const UndoStack* stack = mApplication.GetUndoStack();
  const std::string text =
      "{\"residentKiB\": " + std::to_string(resident * (::sysconf(_SC_PAGESIZE) / 1024)) +
      ", \"undoSteps\": " + std::to_string(stack != nullptr ? stack->GetUndoNames().size() : 0) +
      "}\n";
  const std::string path = ResolvePath(command.text);
  if (std::string error = WriteFile(path, text); !error.empty())
    return error;
  result.written.push_back(path);
  return {};
}

void ScriptRunner::RunWait(int milliseconds) {
  // Real time passes while posted work and playback run, as they would in the window; the
  // toolkit's timers (tool tips) move by exactly the time waited, so what they show after the
  // wait does not depend on the machine's speed.
  RepeatTimer& timers = RepeatTimer::Instance();
  const RepeatTimer::Milliseconds base = timers.Now();
  const RepeatTimer::Milliseconds length{milliseconds};
  const auto start = std::chrono::steady_clock::now();
  const auto until = start + length;
  while (std::chrono::steady_clock::now() < until) {
    Settle();
    const auto elapsed = std::chrono::duration_cast<RepeatTimer::Milliseconds>(
        std::chrono::steady_clock::now() - start);
    timers.AdvanceTo(base + std::min(elapsed, length));
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  timers.AdvanceTo(base + length);
  Settle();
}

std::string ScriptRunner::RunClose(const ScriptCommand& command, ScriptRunResult& result) {
  ProjectDocument* document = mApplication.GetDocument();
  if (document == nullptr)
    return "no project is open";
  if (document->ConfirmClose()) {
    result.closed = true;
  } else if (!document->GetLastError().empty()) {
    result.warnings.push_back(LineText(command.line) +
                              "the save before closing failed: " + document->GetLastError());
  }
  return {};
}

std::string ScriptRunner::WriteFile(const std::string& path, const std::string& content) {
  std::error_code ec;
  const auto parent = std::filesystem::path(path).parent_path();
  if (!parent.empty())
    std::filesystem::create_directories(parent, ec);
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  if (!out)
    return "cannot write '" + path + "'";
  out << content;
  out.close();
  if (!out)
    return "cannot write '" + path + "'";
  return {};
}

void ScriptRunner::Settle() {
  MessageLoop::Instance().RunPending();
  ViewHost& host = mApplication.GetViewHost();
  if (!host.GetDirtyRegion().IsEmpty())
    host.Render();
}
