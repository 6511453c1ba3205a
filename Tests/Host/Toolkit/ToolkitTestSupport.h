#pragma once

#include <functional>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/DataObject.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Host/Toolkit/SubView.h"

// Fresh process-wide toolkit state for one test, and none left behind.
class ToolkitTestScope {
 public:
  ToolkitTestScope() { Reset(); }
  ~ToolkitTestScope() { Reset(); }
  ToolkitTestScope(const ToolkitTestScope&) = delete;
  ToolkitTestScope& operator=(const ToolkitTestScope&) = delete;

 private:
  static void Reset() {
    ResetCursorForTesting();
    SetAsyncKeyModifiers(kKeyModifierNone);
    SetMenuTracker(nullptr);
    InputBox::SetResponder(nullptr);
    MenuRegistry::Instance().Clear();
    RepeatTimer::Instance().ResetForTesting();
  }

  MessagingTestScope mMessaging;
};

// What the recording views saw, one line per hook: "B down 5,5".
struct EventLog {
  std::vector<std::string> lines;

  void Add(std::string line) { lines.push_back(std::move(line)); }
  std::string Last() const { return lines.empty() ? std::string() : lines.back(); }
  void Clear() { lines.clear(); }
};

inline std::string PointText(Point p) {
  return std::to_string(p.x) + "," + std::to_string(p.y);
}

// A view that logs its hooks and fills itself with one colour.
class RecordingView : public SubView {
 public:
  RecordingView(std::string name, std::shared_ptr<EventLog> log, Color fill = Color(0, 0, 0, 0),
                Commander* superCommander = nullptr)
      : SubView(superCommander), mName(std::move(name)), mLog(std::move(log)), mFill(fill) {}

  static std::shared_ptr<RecordingView> Make(std::string name, std::shared_ptr<EventLog> log,
                                             Rect bounds, Color fill = Color(0, 0, 0, 0)) {
    auto view = std::make_shared<RecordingView>(std::move(name), std::move(log), fill);
    view->SetBounds(bounds);
    return view;
  }

  const std::string& Name() const { return mName; }
  void SetFill(Color fill) { mFill = fill; }

  // Extra behaviour on top of logging.
  std::function<void(RecordingView&, Point)> onLeftDown;
  std::function<void(RecordingView&, Point)> onMouseMove;
  std::function<bool(RecordingView&, Point)> onSetCursor;
  std::function<bool(RecordingView&, CommandID)> onCommand;
  std::map<CommandID, CommandStatus> statuses;  // what FindCommandStatus answers
  std::set<CommandID> obeys;                    // what ObeyCommand handles
  std::set<KeyCode> keys;                       // what KeyDownSelf takes
  bool takesWheel = false;
  bool takesMagnify = false;
  DropEffect dragAnswer = kDropEffectNone;
  bool takesDrop = true;
  int paintCount = 0;

  void FinishCreateSelf() override { Log("created"); }
  void DestroySelf() override { Log("destroyed"); }
  void SetBoundsSelf(const Rect& bounds) override {
    Log("bounds " + PointText(bounds.TopLeft()) + " " + std::to_string(bounds.Width()) + "x" +
        std::to_string(bounds.Height()));
  }
  void PaintSelf(DC& dc) override {
    ++paintCount;
    if (mFill.a != 0) {
      dc.FillRect(GetLocalBounds(), mFill);
    }
  }
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override {
    Log("down " + PointText(point) + Modifiers(modifiers));
    if (onLeftDown) {
      onLeftDown(*this, point);
    }
  }
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override {
    Log("multiclick " + std::to_string(clickCount) + " " + PointText(point));
    SubView::LeftButtonMultiClickSelf(point, modifiers, clickCount);
  }
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override {
    Log("up " + PointText(point) + Modifiers(modifiers));
  }
  void RightButtonDownSelf(Point point, KeyModifiers) override { Log("rdown " + PointText(point)); }
  void RightButtonUpSelf(Point point, KeyModifiers) override { Log("rup " + PointText(point)); }
  void MouseMoveSelf(Point point, KeyModifiers) override {
    Log("move " + PointText(point));
    if (onMouseMove) {
      onMouseMove(*this, point);
    }
  }
  void MouseLeaveSelf() override { Log("leave"); }
  bool SetCursorSelf(Point point, KeyModifiers) override {
    return onSetCursor ? onSetCursor(*this, point) : false;
  }
  bool MouseWheelSelf(const WheelEvent& event) override {
    Log("wheel " + std::to_string(event.deltaY) + " at " + PointText(event.point));
    return takesWheel;
  }
  bool MouseMagnifySelf(const MagnifyEvent& event) override {
    Log("magnify at " + PointText(event.point));
    return takesMagnify;
  }
  DropEffect DragEnterSelf(const DataObject&, KeyModifiers, Point point) override {
    Log("dragenter " + PointText(point));
    return dragAnswer;
  }
  DropEffect DragOverSelf(const DataObject&, KeyModifiers, Point point) override {
    Log("dragover " + PointText(point));
    return dragAnswer;
  }
  void DragLeaveSelf() override { Log("dragleave"); }
  bool DropSelf(const DataObject& data, DropEffect effect, Point point) override {
    Log("drop " + std::to_string(effect) + " " + PointText(point) + " " +
        data.GetString(kDataTypeName_Text).value_or("?"));
    return takesDrop;
  }
  void DragFinishedSelf(DropEffect effect) override {
    Log("dragfinished " + std::to_string(effect));
  }
  bool FindCommandStatus(CommandID command, CommandStatus& status) override {
    const auto it = statuses.find(command);
    if (it == statuses.end()) {
      return false;
    }
    status = it->second;
    return true;
  }
  bool ObeyCommand(CommandID command) override {
    if (onCommand && onCommand(*this, command)) {
      Log("command " + std::to_string(command));
      return true;
    }
    if (obeys.contains(command)) {
      Log("command " + std::to_string(command));
      return true;
    }
    return false;
  }
  bool KeyDownSelf(const KeyEvent& event) override {
    if (keys.contains(event.key)) {
      Log("key " + std::string(KeyCodeName(event.key)));
      return true;
    }
    return false;
  }
  void NowOnDuty() override { Log("on duty"); }
  void NowOffDuty() override { Log("off duty"); }

 private:
  static std::string Modifiers(KeyModifiers modifiers) {
    return modifiers == kKeyModifierNone ? std::string() : " mods " + std::to_string(modifiers);
  }
  void Log(const std::string& what) { mLog->Add(mName + " " + what); }

  std::string mName;
  std::shared_ptr<EventLog> mLog;
  Color mFill;
};
