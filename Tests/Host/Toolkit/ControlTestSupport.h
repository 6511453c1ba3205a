#pragma once

#include <gtest/gtest.h>

#include <cstdarg>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Station.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

// One line per control message, short enough for an expectation: "HotFloatChanging 1.5 #7".
inline std::string Format(const char* format, ...) __attribute__((format(printf, 1, 2)));
inline std::string Format(const char* format, ...) {
  char buffer[200];
  va_list args;
  va_start(args, format);
  std::vsnprintf(buffer, sizeof buffer, format, args);
  va_end(args);
  return buffer;
}

inline std::string DescribeControlMessage(const Message& message) {
  if (const auto* m = message.As<HotFloatControlChangingMessage>()) {
    return Format("HotFloatChanging %g #%d", m->value, m->cookie);
  }
  if (const auto* m = message.As<HotFloatControlChangedMessage>()) {
    return Format("HotFloatChanged %g #%d", m->value, m->cookie);
  }
  if (const auto* m = message.As<FloatSliderControlChangingMessage>()) {
    return Format("SliderChanging %g #%d", m->value, m->cookie);
  }
  if (const auto* m = message.As<FloatSliderControlChangedMessage>()) {
    return Format("SliderChanged %g #%d", m->value, m->cookie);
  }
  if (const auto* m = message.As<FloatSliderControlDoubleClickedMessage>()) {
    return Format("SliderDoubleClicked %g #%d", m->value, m->cookie);
  }
  if (const auto* m = message.As<AngleControlChangingMessage>()) {
    return Format("AngleChanging %g #%d", m->degrees, m->cookie);
  }
  if (const auto* m = message.As<AngleControlChangedMessage>()) {
    return Format("AngleChanged %g #%d", m->degrees, m->cookie);
  }
  if (const auto* m = message.As<HotTimecodeValueChangingMessage>()) {
    return Format("TimecodeChanging %lld #%d", static_cast<long long>(m->time), m->cookie);
  }
  if (const auto* m = message.As<HotTimecodeValueChangedMessage>()) {
    return Format("TimecodeChanged %lld #%d", static_cast<long long>(m->time), m->cookie);
  }
  if (const auto* m = message.As<CheckBoxControlChangedMessage>()) {
    return Format("CheckBox #%d %s", m->id, m->checked ? "on" : "off");
  }
  if (const auto* m = message.As<DisclosureTriangleStateChangedMessage>()) {
    return Format("Disclosure #%d %s mods %u", m->id, m->open ? "open" : "closed", m->modifiers);
  }
  if (const auto* m = message.As<ColorPickerControlChangingMessage>()) {
    return Format("ColorChanging %s #%d", m->color.ToHex().c_str(), m->id);
  }
  if (const auto* m = message.As<ColorPickerControlChangedMessage>()) {
    return Format("ColorChanged %s #%d", m->color.ToHex().c_str(), m->id);
  }
  if (const auto* m = message.As<ColorPickerSwatchClickedMessage>()) {
    return Format("SwatchClicked %s #%d", m->color.ToHex().c_str(), m->id);
  }
  if (const auto* m = message.As<ScrollVerticalMessage>()) {
    return Format("VScroll %d %d", static_cast<int>(m->code), m->position);
  }
  if (const auto* m = message.As<ScrollHorizontalMessage>()) {
    return Format("HScroll %d %d", static_cast<int>(m->code), m->position);
  }
  if (const auto* m = message.As<EditTimeChangingMessage>()) {
    return Format("EditTimeChanging %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<EditTimeChangedMessage>()) {
    return Format("EditTimeChanged %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<ZoomInOutTimeChangingMessage>()) {
    return Format("ZoomChanging %lld %lld", static_cast<long long>(m->zoomIn),
                  static_cast<long long>(m->zoomOut));
  }
  if (const auto* m = message.As<ZoomInOutTimeChangedMessage>()) {
    return Format("ZoomChanged %lld %lld", static_cast<long long>(m->zoomIn),
                  static_cast<long long>(m->zoomOut));
  }
  if (const auto* m = message.As<SlideZoomMessage>()) {
    return Format("SlideZoom %lld %lld", static_cast<long long>(m->zoomIn),
                  static_cast<long long>(m->zoomOut));
  }
  if (const auto* m = message.As<MarkInTimeChangingMessage>()) {
    return Format("MarkInChanging %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<MarkInTimeChangedMessage>()) {
    return Format("MarkInChanged %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<MarkOutTimeChangingMessage>()) {
    return Format("MarkOutChanging %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<MarkOutTimeChangedMessage>()) {
    return Format("MarkOutChanged %lld", static_cast<long long>(m->time));
  }
  if (const auto* m = message.As<MarkInOutTimeChangingMessage>()) {
    return Format("MarkInOutChanging %lld %lld", static_cast<long long>(m->inTime),
                  static_cast<long long>(m->outTime));
  }
  if (const auto* m = message.As<MarkInOutTimeChangedMessage>()) {
    return Format("MarkInOutChanged %lld %lld", static_cast<long long>(m->inTime),
                  static_cast<long long>(m->outTime));
  }
  if (const auto* m = message.As<MarkerTimeChangingMessage>()) {
    return Format("MarkerChanging %lld %lld->%lld", static_cast<long long>(m->markerID),
                  static_cast<long long>(m->oldTime), static_cast<long long>(m->newTime));
  }
  if (const auto* m = message.As<MarkerTimeChangedMessage>()) {
    return Format("MarkerChanged %lld %lld->%lld", static_cast<long long>(m->markerID),
                  static_cast<long long>(m->oldTime), static_cast<long long>(m->newTime));
  }
  if (const auto* m = message.As<EditSequenceMarkerMessage>()) {
    return Format("EditMarker %lld", static_cast<long long>(m->markerID));
  }
  if (const auto* m = message.As<TimebarRightButtonDownMessage>()) {
    return Format("RightDown %d,%d %lld", m->point.x, m->point.y, static_cast<long long>(m->time));
  }
  return std::string(message.GetTypeName());
}

// Listens to one or more stations and keeps each message as a line.
class MessageRecorder : public Listener {
 public:
  void ListenTo(const StationName& station) { AddListener(station, *this); }
  void ListenToMessage(const Message& message) override {
    lines.push_back(DescribeControlMessage(message));
  }
  void Clear() { lines.clear(); }

  std::vector<std::string> lines;
};

// A window with a root view filled with kBackground, a log of the root's commands, and the
// gestures of a user in window coordinates.
class ControlTest : public ::testing::Test {
 protected:
  static constexpr Color kBackground{3, 5, 7};

  ControlTest() {
    root = RecordingView::Make("root", log, Rect{}, kBackground);
    host.SetRootView(root);
    SetMenuTracker(menus);
  }

  // Adds a control to the root and paints, so later invalidations are the control's own.
  template <class T>
  std::shared_ptr<T> Add(std::shared_ptr<T> control) {
    root->AddChild(control);
    host.Render();
    return control;
  }

  void Press(Point p, KeyModifiers m = kKeyModifierNone) {
    host.MouseDown(MouseButton::kLeft, p, m);
  }
  void DoubleClick(Point p, KeyModifiers m = kKeyModifierNone) {
    host.MouseDown(MouseButton::kLeft, p, m, 1);
    host.MouseUp(MouseButton::kLeft, p, m);
    host.MouseDown(MouseButton::kLeft, p, m, 2);
    host.MouseUp(MouseButton::kLeft, p, m);
  }
  void Move(Point p, KeyModifiers m = kKeyModifierNone) { host.MouseMove(p, m); }
  void Release(Point p, KeyModifiers m = kKeyModifierNone) {
    host.MouseUp(MouseButton::kLeft, p, m);
  }
  void Click(Point p, KeyModifiers m = kKeyModifierNone) {
    Press(p, m);
    Release(p, m);
  }
  void RightClick(Point p, KeyModifiers m = kKeyModifierNone) {
    host.MouseDown(MouseButton::kRight, p, m);
    host.MouseUp(MouseButton::kRight, p, m);
  }
  // Press at `from`, `steps` evenly spaced moves ending at `to`, release at `to`.
  void Drag(Point from, Point to, int steps = 4, KeyModifiers m = kKeyModifierNone) {
    Press(from, m);
    for (int i = 1; i <= steps; ++i) {
      Move({from.x + (to.x - from.x) * i / steps, from.y + (to.y - from.y) * i / steps}, m);
    }
    Release(to, m);
  }
  // The commands the recording views obeyed, from the log.
  std::vector<std::string> Commands() const {
    std::vector<std::string> commands;
    for (const std::string& line : log->lines) {
      if (line.find(" command ") != std::string::npos) {
        commands.push_back(line);
      }
    }
    return commands;
  }

  void Key(KeyCode key, KeyModifiers m = kKeyModifierNone) { host.KeyDown(KeyEvent{key, m}); }
  void Type(std::string_view text) { host.TextInput(text); }

  // Paints the whole window; true when something differs from the background inside `bounds`
  // (window coordinates) and nothing outside it does.
  ::testing::AssertionResult PaintsOnlyInside(const Rect& bounds) {
    host.InvalidateAll();
    host.Render();
    const Image& image = host.GetImage();
    const Size size = image.GetPixelSize();
    int inside = 0;
    for (int y = 0; y < size.height; ++y) {
      for (int x = 0; x < size.width; ++x) {
        if (image.GetPixel(x, y) == kBackground) {
          continue;
        }
        if (!bounds.Contains({x, y})) {
          return ::testing::AssertionFailure() << "painted outside at " << x << "," << y;
        }
        ++inside;
      }
    }
    if (inside == 0) {
      return ::testing::AssertionFailure() << "nothing painted inside";
    }
    return ::testing::AssertionSuccess() << inside << " pixels painted";
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  ViewHost host{Size{320, 200}};
  std::shared_ptr<RecordingView> root;
  MessageRecorder recorder;
};

using Lines = std::vector<std::string>;
