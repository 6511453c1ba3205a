#include "Host/Shell/HistoryCheck.h"

#include <array>
#include <nlohmann/json.hpp>
#include <string_view>

#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/UndoStack.h"

namespace {

using json = nlohmann::ordered_json;

// Members the project file keeps that no undo step restores.
constexpr std::array<std::string_view, 3> kViewState = {"currentTime", "selection", "expansion"};

void DropViewState(json& value) {
  if (value.is_object()) {
    for (const auto key : kViewState)
      value.erase(std::string(key));
    for (auto& [key, member] : value.items())
      DropViewState(member);
  } else if (value.is_array()) {
    for (auto& element : value)
      DropViewState(element);
  }
}

std::string EditState(const Project& project) {
  json document = json::parse(ProjectFile::SaveToString(project));
  DropViewState(document);
  return document.dump(1);
}

// "at line N: <then> / <now>" for the first line that differs.
std::string FirstDifference(const std::string& then, const std::string& now) {
  std::size_t line = 1;
  std::size_t start = 0;
  for (std::size_t i = 0; i < then.size() && i < now.size(); ++i) {
    if (then[i] != now[i]) {
      const auto lineOf = [start](const std::string& text) {
        return text.substr(start, text.find('\n', start) - start);
      };
      return "line " + std::to_string(line) + " was '" + lineOf(then) + "', is '" + lineOf(now) +
             "'";
    }
    if (then[i] == '\n') {
      ++line;
      start = i + 1;
    }
  }
  return "one is longer (" + std::to_string(then.size()) + " and " + std::to_string(now.size()) +
         " characters)";
}

std::string CheckReload(const Project& project) {
  const std::string saved = ProjectFile::SaveToString(project);
  const ProjectLoadResult reloaded = ProjectFile::LoadFromString(saved);
  if (!reloaded)
    return "the saved project does not load again: " + reloaded.error;
  const std::string again = ProjectFile::SaveToString(*reloaded.project);
  if (again != saved)
    return "the saved project loads back different: " + FirstDifference(saved, again);
  return {};
}

}  // namespace

void HistoryCheck::Start(ProjectRef project) {
  mProject = std::move(project);
  mProject->GetUndoStack().Clear();
  mBaseline = EditState(*mProject);
}

std::string HistoryCheck::Check() {
  if (mProject == nullptr)
    return "nothing to check: no project was given";
  const Project& project = *mProject;
  UndoStack& history = mProject->GetUndoStack();
  if (std::string error = CheckReload(project); !error.empty())
    return error;
  if (history.IsCompoundOpen())
    return "an undo step is still open between two user actions";
  const std::string now = EditState(project);
  int steps = 0;
  for (; history.CanUndo(); ++steps) {
    if (!history.Undo())
      return "undo " + std::to_string(steps + 1) + " was refused";
  }
  if (const std::string back = EditState(project); back != mBaseline) {
    return "undoing all " + std::to_string(steps) +
           " steps does not return to the last check: " + FirstDifference(mBaseline, back);
  }
  for (int redone = 0; redone < steps; ++redone) {
    if (!history.Redo())
      return "redo " + std::to_string(redone + 1) + " of " + std::to_string(steps) + " was refused";
  }
  if (const std::string forward = EditState(project); forward != now)
    return "redoing all " + std::to_string(steps) +
           " steps does not return to now: " + FirstDifference(now, forward);
  Start(mProject);
  return {};
}
