#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "Host/Time/TickTime.h"

// What a tab view reports of its state for the automation dump (`dump FILE.json`). Plain data:
// the view fills it, the shell writes it out as JSON. Coordinates are the view's own pixels.

// One list row, in display order.
struct StateDumpRow {
  std::vector<std::string> path;  // titles from the top-level row down to this one
  std::string className;          // the row's class, e.g. "FilterItem"
  int top = 0;
  int height = 0;
  int groupLevel = 0;
  bool expanded = false;
  bool selected = false;
  bool setAside = false;
  bool shown = false;
};

// One selected keyframe: the parameter's row path and the keyframe's time.
struct StateDumpKeyframe {
  std::vector<std::string> path;
  TickTime time = 0;  // as the model stores it (clip time)
};

struct StateDumpKeyframeArea {
  TickTime visibleStartTime = 0;
  double secondsPerPixel = 0.0;
  std::vector<StateDumpKeyframe> selectedKeyframes;
};

// Facts beyond the fixed fields, written under "extra" in the order given.
using StateDumpScalar = std::variant<bool, std::int64_t, double, std::string>;

struct PanelStateDump {
  std::string headerText;
  int targetMode = 0;
  std::vector<StateDumpRow> rows;
  std::optional<StateDumpKeyframeArea> keyframeArea;  // absent while the area is hidden
  std::vector<std::pair<std::string, StateDumpScalar>> extra;
};
