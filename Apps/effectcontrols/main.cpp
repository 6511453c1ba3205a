// effectcontrols: opens a project in the workspace and runs its panels in a window, or headless
// from an automation script. Exit codes: 0 done, 1 the script stopped at a bad line, 2 the
// program could not start (options, script file, project, window).

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "Apps/effectcontrols/EmbeddedDemoProject.h"
#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/AutomationScript.h"
#include "Host/Shell/MonkeyScript.h"
#include "Host/Shell/ProgramOptions.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Shell/ScriptRunner.h"
#include "Host/Shell/Sdl/SdlInputBox.h"
#include "Host/Shell/Sdl/SdlMenuTracker.h"
#include "Host/Shell/Sdl/SdlWindow.h"
#include "Host/Shell/ViewHostInputRoute.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr int kExitScriptFailed = 1;
constexpr int kExitCannotStart = 2;

bool HasDisplay() {
  const char* x11 = std::getenv("DISPLAY");
  const char* wayland = std::getenv("WAYLAND_DISPLAY");
  return (x11 != nullptr && *x11 != '\0') || (wayland != nullptr && *wayland != '\0');
}

int Fail(int code, const std::string& message) {
  std::cerr << "effectcontrols: " << message << "\n";
  return code;
}

void Settle(Application& application) {
  MessageLoop::Instance().RunPending();
  application.GetViewHost().Render();
}

// The built-in demo: examples/demo.json as embedded at build time.
ProjectRef OpenDemoProject(std::string& error) {
  ProjectLoadResult loaded = ProjectFile::LoadFromString(EmbeddedDemoProjectJSON());
  if (!loaded)
    error = "the built-in demo project does not load: " + loaded.error;
  return loaded.project;
}

std::vector<std::int64_t> TrackItemIds(const Project& project) {
  std::vector<std::int64_t> ids;
  for (const auto& sequence : project.GetSequences()) {
    for (const auto* tracks : {&sequence->GetVideoTracks(), &sequence->GetAudioTracks()}) {
      for (const auto& track : *tracks) {
        for (const auto& item : track->GetItems())
          ids.push_back(item->GetID());
      }
    }
  }
  return ids;
}

// The monkey's script, kept under the output folder so that a failure can be run again with
// --script. Returns the script's path, or empty with `error` set.
std::string WriteMonkeyScript(const ProgramOptions& options, const Project& project,
                              std::string& error) {
  MonkeyOptions monkey;
  monkey.seed = *options.monkeySeed;
  monkey.events = options.monkeyEvents;
  monkey.panelSize = options.size;
  monkey.trackItemIds = TrackItemIds(project);
  const std::filesystem::path path = std::filesystem::path(options.outDir) / "monkey.ecs";
  std::error_code ec;
  std::filesystem::create_directories(path.parent_path(), ec);
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out << MonkeyScript::Generate(monkey);
  out.close();
  if (!out)
    error = "cannot write the monkey's script " + path.string();
  return out ? path.string() : std::string();
}

// A file that does not exist yet, in a folder that does, is a new, empty project that saves
// there.
ProjectRef OpenProjectFile(const std::string& path, std::string& error) {
  const std::filesystem::path file(path);
  const std::filesystem::path folder = file.has_parent_path() ? file.parent_path() : ".";
  std::error_code ec;
  if (!std::filesystem::exists(file, ec) && !ec && std::filesystem::is_directory(folder, ec))
    return Project::Create(file.stem().string());
  ProjectLoadResult loaded = ProjectFile::Load(path);
  if (!loaded)
    error = loaded.error.starts_with(path) ? loaded.error : path + ": " + loaded.error;
  return loaded.project;
}

void AllowSaving(ScriptRunner& runner) {
  runner.SetProjectSaver([](const Project& project, const std::string& path, std::string* error) {
    return ProjectFile::Save(project, path, error);
  });
}

std::string WindowTitle(const Application& application) {
  const ProjectDocument* document = application.GetDocument();
  return document != nullptr ? "Effect Controls - " + document->GetTitle() : "Effect Controls";
}

// `scriptPath` names the script in a failure (empty for the program's own one-shot frame).
int ReportRun(const ScriptRunResult& result, const std::string& scriptPath) {
  for (const auto& path : result.written)
    std::cout << "wrote " << path << "\n";
  for (const auto& warning : result.warnings)
    std::cerr << "effectcontrols: warning: " << warning << "\n";
  if (!result.ok)
    return Fail(kExitScriptFailed,
                scriptPath.empty() ? result.Describe() : scriptPath + ": " + result.Describe());
  return EXIT_SUCCESS;
}

int Run(const ProgramOptions& options) {
  // The project is read before anything opens; the file is never written except by `save`.
  std::string error;
  ProjectRef project = options.projectPath.empty() ? OpenDemoProject(error)
                                                   : OpenProjectFile(options.projectPath, error);
  if (project == nullptr)
    return Fail(kExitCannotStart, error);
  std::string scriptPath = options.scriptPath;
  if (options.monkeySeed) {
    scriptPath = WriteMonkeyScript(options, *project, error);
    if (scriptPath.empty())
      return Fail(kExitCannotStart, error);
  }
  std::optional<AutomationScript> script;
  if (!scriptPath.empty()) {
    auto parsed = AutomationScript::ParseFile(scriptPath);
    if (const auto* failure = std::get_if<ScriptError>(&parsed)) {
      // A script that does not parse changes nothing: report it before anything opens.
      return Fail(failure->line > 0 ? kExitScriptFailed : kExitCannotStart,
                  scriptPath + ": " + failure->Describe());
    }
    script = std::get<AutomationScript>(std::move(parsed));
  }

  options.ApplyPreferences(Preferences::Application().Properties());
  Application application(options.size);
  application.LoadModules();
  application.CreateHandlers();
  application.OpenProject(std::move(project), options.projectPath);
  application.SetFailureReporter(
      [](const std::string& message) { std::cerr << "effectcontrols: " << message << "\n"; });
  application.OpenAllWindows();
  const bool windowed = !options.headless && HasDisplay();
  application.SetEditingLayout(
      options.layout == ProgramOptions::Layout::kEditing ||
      (options.layout == ProgramOptions::Layout::kDefault && windowed && !script));
  Settle(application);

  if (windowed) {
    const auto window =
        SdlWindow::Open(application.GetViewHost(), WindowTitle(application), &error);
    if (window == nullptr)
      return Fail(kExitCannotStart, "cannot open a window (" + error + "); use --headless");
    if (!script) {
      // The title follows the project and its unsaved changes, a failed save or open is shown,
      // closing (and Ctrl+Q) asks to save the changes. Opening replaces the document: each use
      // asks the application for the current one.
      window->SetTitleSource([&application] { return WindowTitle(application); });
      application.SetFailureReporter([&window](const std::string& message) {
        window->ShowMessage("Effect Controls", message);
      });
      window->SetCloseGuard([&application] {
        ProjectDocument* document = application.GetDocument();
        return document == nullptr || document->ConfirmClose();
      });
      application.SetQuitHandler([&window] { window->RequestClose(); });
      // Popup menus and input boxes appear over the window.
      const auto previousMenus = SetMenuTracker(std::make_shared<SdlMenuTracker>(*window));
      const auto previousBoxes = InputBox::SetResponder(std::make_shared<SdlInputBox>(*window));
      window->Run();
      application.SetQuitHandler(nullptr);
      SetMenuTracker(previousMenus);
      InputBox::SetResponder(previousBoxes);
      return EXIT_SUCCESS;
    }
    int exitCode = EXIT_SUCCESS;
    {
      ScriptRunner runner(application, window->GetInputRoute(), options.outDir);
      AllowSaving(runner);
      // Shots show what the window shows.
      runner.SetShotSource([&window] { return window->ReadBack(); });
      exitCode = ReportRun(runner.Run(*script), scriptPath);
    }
    window->RequestClose();
    while (window->Pump(0)) {
    }
    return exitCode;
  }

  ViewHostInputRoute input(application.GetViewHost());
  ScriptRunner runner(application, input, options.outDir);
  AllowSaving(runner);
  if (script)
    return ReportRun(runner.Run(*script), scriptPath);
  // Headless without a script: one frame of the workspace.
  const auto frame = AutomationScript::Parse("shot effectcontrols.png");
  return ReportRun(runner.Run(std::get<AutomationScript>(frame)), {});
}

}  // namespace

int main(int argc, char** argv) {
  const std::vector<std::string_view> arguments(argv + (argc > 0 ? 1 : 0), argv + argc);
  auto parsed = ProgramOptions::Parse(arguments);
  if (const auto* error = std::get_if<std::string>(&parsed)) {
    std::cerr << "effectcontrols: " << *error << "\n" << ProgramOptions::Usage();
    return kExitCannotStart;
  }
  const auto& options = std::get<ProgramOptions>(parsed);
  if (options.help) {
    std::cout << ProgramOptions::Usage();
    return EXIT_SUCCESS;
  }
  try {
    return Run(options);
  } catch (const std::exception& exception) {
    return Fail(kExitCannotStart, std::string("stopped: ") + exception.what());
  }
}
