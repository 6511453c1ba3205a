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

// A rectangle in panel pixels (what `click X Y` takes): left, top, width, height.
struct StateDumpRect {
  int x = 0;
  int y = 0;
  int width = 0;
  int height = 0;
};

// One control of a row (expander, stopwatch, value field, button, popup).
struct StateDumpControl {
  std::string className;  // e.g. "DisclosureTriangle"
  StateDumpRect rect;
  bool visible = false;
  bool enabled = false;
};

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
  // The row's own band (where a click on its title or name lands); absent while not shown.
  std::optional<StateDumpRect> rect;
  std::vector<StateDumpControl> controls;  // the row's own controls, in creation order
};

// One selected keyframe: the parameter's row path and the keyframe's time.
struct StateDumpKeyframe {
  std::vector<std::string> path;
  TickTime time = 0;  // as the model stores it (clip time)
};

// One keyframe glyph drawn in the keyframe area: its centre in panel pixels.
struct StateDumpKeyframeGlyph {
  std::vector<std::string> path;
  TickTime time = 0;  // clip time
  int x = 0;
  int y = 0;
  bool selected = false;
};

struct StateDumpKeyframeArea {
  TickTime visibleStartTime = 0;
  double secondsPerPixel = 0.0;
  std::vector<StateDumpKeyframe> selectedKeyframes;
  std::vector<StateDumpKeyframeGlyph> glyphs;
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
