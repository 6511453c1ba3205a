#pragma once

// What the program tests that drive the panel through scripts share: running the program on
// the built-in demo, reading its dumps, finding a row and the list's place, turning them into
// panel coordinates. Each test program is one file; build it with EC_PROGRAM (the effectcontrols
// executable).

#include <fcntl.h>
#include <gtest/gtest.h>
#include <spawn.h>
#include <sys/wait.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <optional>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

extern char** environ;

namespace program_test {

namespace fs = std::filesystem;
using nlohmann::json;

// A row's indent grows this much with each group level.
inline constexpr int kIndentPerGroupLevel = 17;

inline std::string ReadText(const fs::path& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

inline json ReadJson(const fs::path& path) {
  std::ifstream in(path);
  return json::parse(in);
}

// Runs the program (EC_PROGRAM) with `arguments`, its output into `log`, and waits for it. True
// when it exited with 0; otherwise a failure that shows the output.
inline bool RunProgramWith(std::vector<std::string> arguments, const fs::path& log) {
  arguments.insert(arguments.begin(), EC_PROGRAM);
  std::vector<char*> argv;
  for (std::string& argument : arguments) {
    argv.push_back(argument.data());
  }
  argv.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, 1, log.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
  posix_spawn_file_actions_adddup2(&actions, 1, 2);
  pid_t pid = 0;
  const int spawned = posix_spawn(&pid, argv[0], &actions, nullptr, argv.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (spawned != 0) {
    ADD_FAILURE() << "cannot start " << EC_PROGRAM;
    return false;
  }
  int status = 0;
  waitpid(pid, &status, 0);
  if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) {
    ADD_FAILURE() << "the run writing " << log << " failed (status " << status << ")\n"
                  << ReadText(log);
    return false;
  }
  return true;
}

// Runs the program headless on the demo with `script` and `options` (such as --size); false
// (with a failure) when it does not end well, or warns that a click or an answer went nowhere.
inline bool RunProgram(const fs::path& out, const std::string& script,
                       const std::vector<std::string>& options) {
  const fs::path scriptPath = out / "script.ecs";
  std::ofstream(scriptPath) << script;
  const fs::path log = out / "run.log";
  std::vector<std::string> arguments{"--headless"};
  arguments.insert(arguments.end(), options.begin(), options.end());
  arguments.insert(arguments.end(), {"--script", scriptPath.string(), "--out", out.string()});
  if (!RunProgramWith(arguments, log)) {
    return false;
  }
  const std::string text = ReadText(log);
  EXPECT_EQ(text.find("warning:"), std::string::npos) << "a click went nowhere:\n" << text;
  return true;
}

// Runs `lines` as a script in EC_OUT/<test>/<name> (made afresh, returned in `dir`) at 1100x620;
// false (with a failure) when the program fails, warns (a click or an answer reached nothing) or
// a dump recorded a debug assertion.
inline bool RunScriptLines(const std::string& name, const std::vector<std::string>& lines,
                           fs::path& dir) {
  dir = fs::path(EC_OUT) / ::testing::UnitTest::GetInstance()->current_test_info()->name() / name;
  fs::remove_all(dir);
  fs::create_directories(dir);
  const fs::path script = dir / (name + ".ecs");
  {
    std::ofstream out(script);
    for (const std::string& line : lines) {
      out << line << "\n";
    }
  }
  const fs::path log = dir / "run.log";
  if (!RunProgramWith(
          {"--headless", "--size", "1100x620", "--script", script.string(), "--out", dir.string()},
          log)) {
    return false;
  }
  const std::string output = ReadText(log);
  if (output.find("warning:") != std::string::npos) {
    ADD_FAILURE() << name << ": a click or an answer went nowhere\n" << output;
    return false;
  }
  for (const auto& entry : fs::directory_iterator(dir)) {
    if (entry.path().string().ends_with(".dump.json") &&
        !ReadJson(entry.path())["assertions"].empty()) {
      ADD_FAILURE() << entry.path() << " recorded " << ReadJson(entry.path())["assertions"].dump();
      return false;
    }
  }
  return true;
}

inline const json& Panel(const json& dump) {
  for (const json& panel : dump.at("panels")) {
    if (panel.value("dumped", false)) {
      return panel;
    }
  }
  throw std::runtime_error("no panel dumped");
}

// A row of the dump by the last titles of its path; `nth` picks among rows of the same path.
struct Row {
  std::string className;
  int top = 0;
  int height = 0;
  int groupLevel = 0;
  bool shown = false;
};

inline std::optional<Row> FindRow(const json& panel, const std::vector<std::string>& pathEnd,
                                  int nth = 0) {
  for (const json& row : panel.at("rows")) {
    const auto path = row.at("path").get<std::vector<std::string>>();
    if (path.size() < pathEnd.size() ||
        !std::equal(pathEnd.rbegin(), pathEnd.rend(), path.rbegin())) {
      continue;
    }
    if (nth-- > 0) {
      continue;
    }
    return Row{row.at("class").get<std::string>(), row.at("top").get<int>(),
               row.at("height").get<int>(), row.at("groupLevel").get<int>(),
               row.at("shown").get<bool>()};
  }
  return std::nullopt;
}

// Where the list lies in the panel, from the view's facts.
struct ListPlace {
  int left = 0;
  int top = 0;
  int width = 0;
};

inline ListPlace PlaceOf(const json& panel) {
  const json& extra = panel.at("extra");
  return {extra.at("listLeft").get<int>(), extra.at("listTop").get<int>(),
          extra.at("listWidth").get<int>()};
}

// The disclosure triangle at the row's indent + 3.
inline std::string TrianglePoint(const ListPlace& list, const Row& row) {
  std::ostringstream text;
  text << list.left + row.groupLevel * kIndentPerGroupLevel + 3 + 5 << " "
       << list.top + row.top + 10;
  return text.str();
}

// A parameter of a saved project file: of the effect `matchName` on the track item `itemId`.
inline const json* FindProjectParam(const json& project, long long itemId,
                                    const std::string& matchName, const std::string& paramName) {
  for (const json& sequence : project.at("sequences")) {
    for (const json& track : sequence.at("tracks")) {
      for (const json& item : track.at("items")) {
        if (item.at("id").get<long long>() != itemId) {
          continue;
        }
        for (const json& component : item.at("chain").at("components")) {
          if (component.value("matchName", "") != matchName) {
            continue;
          }
          for (const json& param : component.at("params")) {
            if (param.value("name", "") == paramName) {
              return &param;
            }
          }
        }
      }
    }
  }
  return nullptr;
}

inline std::vector<std::string> UndoDone(const json& dump) {
  return dump.at("undo").at("done").get<std::vector<std::string>>();
}

}  // namespace program_test
