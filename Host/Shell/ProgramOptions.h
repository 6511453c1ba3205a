#pragma once

#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "Host/Toolkit/Geometry.h"

// The program's command line:
//   effectcontrols [--project FILE] [--size WxH] [--script FILE] [--out DIR] [--headless]
// Each option also takes the "--option=value" form. Parsing never touches the file system.
struct ProgramOptions {
  static constexpr Size kDefaultSize{960, 540};

  std::string projectPath;  // empty: the embedded demo project
  Size size = kDefaultSize;
  std::string scriptPath;  // empty: no script
  std::string outDir = ".";
  bool headless = false;
  bool help = false;

  using ParseResult = std::variant<ProgramOptions, std::string>;
  // `arguments` without the program name. The error text names the offending argument.
  static ParseResult Parse(std::span<const std::string_view> arguments);
  static std::string Usage();
};
