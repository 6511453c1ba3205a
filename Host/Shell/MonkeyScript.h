#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "Host/Toolkit/Geometry.h"

// A seeded stream of random user input over the workspace, written as an automation script:
// clicks, drags, wheel, keys, typing, popup and input-box answers, commands, resizes,
// selections of every target, tools, undo and redo, with a `check` after every
// `checkInterval` events and one at the end. The first N events of a seed are the same
// whatever the count, so a failure can be cut down to the shortest prefix that shows it.
struct MonkeyOptions {
  std::uint64_t seed = 1;
  int events = 3000;
  int checkInterval = 100;
  Size panelSize{960, 540};                // where pointer events land at first
  std::vector<std::int64_t> trackItemIds;  // what `select` and `open` choose from
};

class MonkeyScript {
 public:
  static std::string Generate(const MonkeyOptions& options);
};
