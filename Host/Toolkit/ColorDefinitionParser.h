#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Host/Toolkit/Color.h"

// One line of a colour-definition resource: `key <spaces or tabs> = <value>`, where value is
//   $MAP(other.key)                      the colour of another key, looked up when asked for
//   $VOK(kColor_Name)                    a toolkit colour (one of the kColor_ names)
//   $RGB(r, g, b)                        a fixed opaque colour; decimal or 0x hex, 0..255
//   $REVERSIBLESCALED(lightKey, darkKey, light%, dark%)
//                                        lightKey in the light theme, darkKey in the dark one,
//                                        then softened that percentage (0..100) toward the
//                                        theme's content background
// Blank lines and lines starting with '#' or "//" are comments.
struct ColorDefinition {
  enum class Kind { kMap, kToolkit, kRGB, kReversibleScaled };

  std::string key;
  Kind kind = Kind::kRGB;
  int line = 0;           // 1-based line of the resource text
  std::string reference;  // kMap: the other key; kToolkit: the kColor_ name; kReversible: light key
  std::string darkReference;  // kReversibleScaled only
  Color rgb;                  // kRGB only
  double lightScale = 0.0;    // kReversibleScaled: 0..1
  double darkScale = 0.0;
};

struct ColorDefinitionProblem {
  int line = 0;  // 1-based
  std::string text;
  std::string reason;
};

struct ColorDefinitionParseResult {
  std::vector<ColorDefinition> definitions;  // in resource order; malformed lines left out
  std::vector<ColorDefinitionProblem> problems;
};

class ColorDefinitionParser {
 public:
  // Never throws; each malformed line is reported with its line number and skipped. A key
  // defined twice keeps its first definition and the later line is reported.
  static ColorDefinitionParseResult Parse(std::string_view resourceText);
};
