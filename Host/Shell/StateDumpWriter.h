#pragma once

#include <string>

class Application;

// Writes the automation dump: the application's state as JSON text. Keys:
//   "workspace": size, maximised, front tab's handler id, the tabs' handler ids and names;
//   "sequence": the active sequence's id, name, edit line (ticks), end, selected track-item ids per
//               group, and its items (id, kind, media, name, start, end, link group), video
//               tracks first (null without a sequence);
//   "undo": {"done": [oldest first], "undone": [next redo first]} action names;
//   "document": the project's file ("" when none yet), whether it changed since it was saved, the
//               window title and why the last save failed ("" when it worked) (null without one);
//   "assertions": the recorded debug assertions (message, condition, file, line, function, count);
//   "panels": one entry per tab in tab order: handler id, tab name, and for views that implement
//             StateDumpSource their PanelStateDump ("dumped": false for the others).
class StateDumpWriter {
 public:
  static std::string Write(Application& application);
};
