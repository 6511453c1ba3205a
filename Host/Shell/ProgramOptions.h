#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "Host/Toolkit/Geometry.h"

class PropertyList;

// The program's command line:
//   effectcontrols [--project FILE] [--size WxH] [--script FILE] [--out DIR] [--headless]
//                  [--layout editing|panel] [--pref KEY=VALUE]... [--monkey SEED [--events N]]
// Each option also takes the "--option=value" form. Parsing never touches the file system.
struct ProgramOptions {
  static constexpr Size kDefaultSize{960, 540};

  std::string projectPath;  // empty: the embedded demo project
  Size size = kDefaultSize;
  std::string scriptPath;  // empty: no script
  std::string outDir = ".";
  bool headless = false;
  bool help = false;
  // The workspace: a timeline and a program monitor beside the panel ("editing"), or the panel
  // alone ("panel"). Unset: editing in a window without a script, else the panel alone.
  enum class Layout { kDefault, kEditing, kPanel };
  Layout layout = Layout::kDefault;
  // A random session instead of a script: the seed of its input and how many events it makes.
  std::optional<std::uint64_t> monkeySeed;
  int monkeyEvents = kDefaultMonkeyEvents;
  static constexpr int kDefaultMonkeyEvents = 3000;
  // Application preferences set before the panels open, in the order given (a later one wins):
  // key and value text ("true"/"false" a flag, a whole number, else text; see PreferenceValue).
  std::vector<std::pair<std::string, std::string>> preferences;

  using ParseResult = std::variant<ProgramOptions, std::string>;
  // `arguments` without the program name. The error text names the offending argument.
  static ParseResult Parse(std::span<const std::string_view> arguments);
  static std::string Usage();

  // Writes `preferences` into `properties`: "true" and "false" as flags, whole numbers as
  // numbers, anything else as text. Read-only keys are left alone.
  void ApplyPreferences(PropertyList& properties) const;
};
