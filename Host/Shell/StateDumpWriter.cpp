#include "Host/Shell/StateDumpWriter.h"

#include <unistd.h>

#include <fstream>
#include <nlohmann/json.hpp>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/ProgramMonitorView.h"
#include "Host/Shell/ProjectDocument.h"
#include "Host/Shell/StateDumpSource.h"
#include "Host/Shell/TimelineView.h"
#include "Host/Shell/WorkspaceFrame.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

using nlohmann::ordered_json;

ordered_json RectJSON(const StateDumpRect& rect) {
  return {{"x", rect.x}, {"y", rect.y}, {"width", rect.width}, {"height", rect.height}};
}

// A rectangle of `view` in script coordinates: relative to the front tab, as clicks are given.
ordered_json ScriptRectJSON(const WorkspaceFrame& frame, const ViewBase& view, const Rect& rect) {
  const Point origin = frame.GetTabArea().TopLeft();
  const Point topLeft = view.LocalToWindow(rect.TopLeft());
  const TabView* front = frame.GetFrontTab();
  const Point panel = front != nullptr ? front->WindowToLocal(topLeft) : topLeft - origin;
  return RectJSON({panel.x, panel.y, rect.Width(), rect.Height()});
}

// A rectangle of `view` in window coordinates, as shots show it.
ordered_json WindowRectJSON(const ViewBase& view, const Rect& rect) {
  const Point topLeft = view.LocalToWindow(rect.TopLeft());
  return RectJSON({topLeft.x, topLeft.y, rect.Width(), rect.Height()});
}

// The timeline and the monitor, when the workspace shows them.
ordered_json EditingViewsJSON(const WorkspaceFrame& frame) {
  const auto* timeline = dynamic_cast<const TimelineView*>(frame.GetTimelineView());
  const auto* monitor = dynamic_cast<const ProgramMonitorView*>(frame.GetMonitorView());
  if (timeline == nullptr || monitor == nullptr)
    return ordered_json();
  ordered_json items = ordered_json::array();
  for (const TimelineView::ItemPlace& place : timeline->GetItemPlaces()) {
    items.push_back({{"id", place.item->GetID()},
                     {"name", place.item->GetName()},
                     {"rect", ScriptRectJSON(frame, *timeline, place.rect)}});
  }
  const Rect timelineBounds{0, 0, timeline->GetSize().width, timeline->GetSize().height};
  const Rect ruler{TimelineView::kHeaderWidth, 0, timelineBounds.right, TimelineView::kRulerHeight};
  const Rect monitorBounds{0, 0, monitor->GetSize().width, monitor->GetSize().height};
  return {{"timeline",
           {{"rect", ScriptRectJSON(frame, *timeline, timelineBounds)},
            {"ruler", ScriptRectJSON(frame, *timeline, ruler)},
            {"items", std::move(items)}}},
          {"monitor",
           {{"rect", ScriptRectJSON(frame, *monitor, monitorBounds)},
            {"frame", ScriptRectJSON(frame, *monitor, monitor->GetFrameRect())},
            {"frameInWindow", WindowRectJSON(*monitor, monitor->GetFrameRect())}}}};
}

ordered_json RowJSON(const StateDumpRow& row) {
  ordered_json j;
  j["path"] = row.path;
  j["class"] = row.className;
  j["top"] = row.top;
  j["height"] = row.height;
  j["groupLevel"] = row.groupLevel;
  j["expanded"] = row.expanded;
  j["selected"] = row.selected;
  j["setAside"] = row.setAside;
  j["shown"] = row.shown;
  j["rect"] = row.rect ? RectJSON(*row.rect) : ordered_json();
  ordered_json controls = ordered_json::array();
  for (const auto& control : row.controls) {
    controls.push_back({{"class", control.className},
                        {"rect", RectJSON(control.rect)},
                        {"visible", control.visible},
                        {"enabled", control.enabled}});
  }
  j["controls"] = std::move(controls);
  return j;
}

ordered_json KeyframeAreaJSON(const StateDumpKeyframeArea& area) {
  ordered_json j;
  j["visibleStartTime"] = area.visibleStartTime;
  j["secondsPerPixel"] = area.secondsPerPixel;
  ordered_json keys = ordered_json::array();
  for (const auto& key : area.selectedKeyframes)
    keys.push_back({{"path", key.path}, {"time", key.time}});
  j["selectedKeyframes"] = std::move(keys);
  ordered_json glyphs = ordered_json::array();
  for (const auto& glyph : area.glyphs) {
    glyphs.push_back({{"path", glyph.path},
                      {"time", glyph.time},
                      {"x", glyph.x},
                      {"y", glyph.y},
                      {"selected", glyph.selected}});
  }
  j["glyphs"] = std::move(glyphs);
  return j;
}

ordered_json PanelJSON(const TabView& tab) {
  ordered_json j;
  j["handler"] = tab.GetHandlerID();
  j["name"] = tab.GetTabName();
  const auto* source = dynamic_cast<const StateDumpSource*>(&tab);
  j["dumped"] = source != nullptr;
  if (source == nullptr)
    return j;
  PanelStateDump dump;
  source->FillStateDump(dump);
  j["header"] = dump.headerText;
  j["targetMode"] = dump.targetMode;
  ordered_json rows = ordered_json::array();
  for (const auto& row : dump.rows)
    rows.push_back(RowJSON(row));
  j["rows"] = std::move(rows);
  j["keyframeArea"] = dump.keyframeArea ? KeyframeAreaJSON(*dump.keyframeArea) : ordered_json();
  ordered_json extra = ordered_json::object();
  for (const auto& [key, value] : dump.extra)
    std::visit([&, &k = key](const auto& v) { extra[k] = v; }, value);
  j["extra"] = std::move(extra);
  return j;
}

ordered_json SequenceJSON(const Sequence& sequence) {
  ordered_json j;
  j["id"] = sequence.GetID();
  j["name"] = sequence.GetName();
  j["currentTime"] = sequence.GetCurrentTime();
  j["end"] = sequence.GetEnd();
  ordered_json groups = ordered_json::array();
  for (const auto& group : sequence.GetSelection()) {
    ordered_json ids = ordered_json::array();
    for (const auto& item : group.videoItems)
      ids.push_back(item->GetID());
    for (const auto& item : group.audioItems)
      ids.push_back(item->GetID());
    groups.push_back(std::move(ids));
  }
  j["selection"] = std::move(groups);
  // What a script can select: every item, video tracks first.
  ordered_json items = ordered_json::array();
  sequence.ForEachTrackItem([&items](const TrackItemRef& item) {
    items.push_back({{"id", item->GetID()},
                     {"kind", item->IsTransition() ? "transition" : "clip"},
                     {"media", item->GetMediaType() == MediaType::Video ? "video" : "audio"},
                     {"name", item->GetName()},
                     {"start", item->GetStart()},
                     {"end", item->GetEnd()},
                     {"linkGroup", item->GetLinkGroup()}});
  });
  j["items"] = std::move(items);
  return j;
}

}  // namespace

std::string StateDumpWriter::Write(Application& application) {
  ordered_json root;

  WorkspaceFrame& frame = application.GetWorkspaceFrame();
  ordered_json workspace;
  const Size size = application.GetViewHost().GetSize();
  workspace["width"] = size.width;
  workspace["height"] = size.height;
  workspace["maximized"] = frame.IsMaximized();
  const TabView* front = frame.GetFrontTab();
  workspace["frontTab"] = front != nullptr ? ordered_json(front->GetHandlerID()) : ordered_json();
  ordered_json tabs = ordered_json::array();
  for (const TabView* tab : frame.GetTabs())
    tabs.push_back({{"handler", tab->GetHandlerID()}, {"name", tab->GetTabName()}});
  workspace["tabs"] = std::move(tabs);
  workspace["cursor"] = std::string(CursorName(GetCurrentCursor()));
  const PersistentToolTip* tip = application.GetViewHost().GetShownToolTip();
  workspace["toolTip"] = tip != nullptr ? ordered_json(tip->GetText()) : ordered_json();
  // Only in the editing layout, so that dumps of the panel alone stay as they were.
  if (ordered_json editing = EditingViewsJSON(frame); !editing.is_null()) {
    workspace["timeline"] = std::move(editing["timeline"]);
    workspace["monitor"] = std::move(editing["monitor"]);
  }
  root["workspace"] = std::move(workspace);

  const SequenceRef sequence = application.GetActiveSequence();
  root["sequence"] = sequence != nullptr ? SequenceJSON(*sequence) : ordered_json();

  ordered_json undo;
  const UndoStack* stack = application.GetUndoStack();
  undo["done"] = stack != nullptr ? stack->GetUndoNames() : std::vector<std::string>();
  undo["undone"] = stack != nullptr ? stack->GetRedoNames() : std::vector<std::string>();
  root["undo"] = std::move(undo);

  const ProjectDocument* document = application.GetDocument();
  root["document"] = document != nullptr ? ordered_json{{"path", document->GetPath()},
                                                        {"modified", document->IsModified()},
                                                        {"title", document->GetTitle()},
                                                        {"lastError", document->GetLastError()}}
                                         : ordered_json();

  ordered_json assertions = ordered_json::array();
  for (const auto& record : RecordedDebugAssertions()) {
    assertions.push_back({{"message", record.message},
                          {"condition", record.condition},
                          {"file", record.file},
                          {"line", record.line},
                          {"function", record.function},
                          {"count", record.count}});
  }
  root["assertions"] = std::move(assertions);

  ordered_json panels = ordered_json::array();
  for (const TabView* tab : frame.GetTabs())
    panels.push_back(PanelJSON(*tab));
  root["panels"] = std::move(panels);

  // Text that is not valid UTF-8 (a panel's row title) is replaced rather than failing the dump.
  return root.dump(2, ' ', false, ordered_json::error_handler_t::replace) + "\n";
}
