#pragma once

#include <cstdint>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/KeyModifiers.h"

// The messages the toolkit's controls broadcast on their own stations (each control registers a
// unique station; listen with AddListener(control.GetStation(), listener)).
//
// Value controls report a "changing" message for every intermediate value of a gesture (drag,
// scrub) and one "changed" message when the gesture ends. Setting a value from code never sends
// anything, so a listener may push the model's value back into a control without a feedback
// loop. `cookie` is the owner's number for the control (SetOwnerCookie / SetControlID), so one
// listener can tell several controls apart.

// --- HotFloatControl: the number shown and scrubbed or typed ---
struct HotFloatControlChangingMessage : MessageOf<HotFloatControlChangingMessage> {
  static constexpr std::string_view kTypeName = "HotFloatControlChangingMessage";
  HotFloatControlChangingMessage(float v, std::int32_t c) : value(v), cookie(c) {}
  float value;
  std::int32_t cookie;
};
struct HotFloatControlChangedMessage : MessageOf<HotFloatControlChangedMessage> {
  static constexpr std::string_view kTypeName = "HotFloatControlChangedMessage";
  HotFloatControlChangedMessage(float v, std::int32_t c) : value(v), cookie(c) {}
  float value;
  std::int32_t cookie;
};

// --- FloatSliderControl ---
struct FloatSliderControlChangingMessage : MessageOf<FloatSliderControlChangingMessage> {
  static constexpr std::string_view kTypeName = "FloatSliderControlChangingMessage";
  FloatSliderControlChangingMessage(float v, std::int32_t c) : value(v), cookie(c) {}
  float value;
  std::int32_t cookie;
};
struct FloatSliderControlChangedMessage : MessageOf<FloatSliderControlChangedMessage> {
  static constexpr std::string_view kTypeName = "FloatSliderControlChangedMessage";
  FloatSliderControlChangedMessage(float v, std::int32_t c) : value(v), cookie(c) {}
  float value;
  std::int32_t cookie;
};
// A double click on the slider; `value` is the slider's value at the click (not changed by it).
struct FloatSliderControlDoubleClickedMessage : MessageOf<FloatSliderControlDoubleClickedMessage> {
  static constexpr std::string_view kTypeName = "FloatSliderControlDoubleClickedMessage";
  FloatSliderControlDoubleClickedMessage(float v, std::int32_t c) : value(v), cookie(c) {}
  float value;
  std::int32_t cookie;
};

// --- AngleControl: degrees, clockwise from straight up; 370 is one revolution and 10 degrees ---
struct AngleControlChangingMessage : MessageOf<AngleControlChangingMessage> {
  static constexpr std::string_view kTypeName = "AngleControlChangingMessage";
  AngleControlChangingMessage(double d, std::int32_t c) : degrees(d), cookie(c) {}
  double degrees;
  std::int32_t cookie;
};
struct AngleControlChangedMessage : MessageOf<AngleControlChangedMessage> {
  static constexpr std::string_view kTypeName = "AngleControlChangedMessage";
  AngleControlChangedMessage(double d, std::int32_t c) : degrees(d), cookie(c) {}
  double degrees;
  std::int32_t cookie;
};

// --- HotTimecodeControl: a time in ticks ---
struct HotTimecodeValueChangingMessage : MessageOf<HotTimecodeValueChangingMessage> {
  static constexpr std::string_view kTypeName = "HotTimecodeValueChangingMessage";
  HotTimecodeValueChangingMessage(TickTime t, std::int32_t c) : time(t), cookie(c) {}
  TickTime time;
  std::int32_t cookie;
};
struct HotTimecodeValueChangedMessage : MessageOf<HotTimecodeValueChangedMessage> {
  static constexpr std::string_view kTypeName = "HotTimecodeValueChangedMessage";
  HotTimecodeValueChangedMessage(TickTime t, std::int32_t c) : time(t), cookie(c) {}
  TickTime time;
  std::int32_t cookie;
};

// --- CheckBoxControl: the state after the user's click ---
struct CheckBoxControlChangedMessage : MessageOf<CheckBoxControlChangedMessage> {
  static constexpr std::string_view kTypeName = "CheckBoxControlChangedMessage";
  CheckBoxControlChangedMessage(std::int32_t i, bool c) : id(i), checked(c) {}
  std::int32_t id;
  bool checked;
};

// --- DisclosureTriangle: the state after the user's click, with the modifiers of the click
// (Alt asks owners that can to open or close all their siblings as well) ---
struct DisclosureTriangleStateChangedMessage : MessageOf<DisclosureTriangleStateChangedMessage> {
  static constexpr std::string_view kTypeName = "DisclosureTriangleStateChangedMessage";
  DisclosureTriangleStateChangedMessage(std::int32_t i, bool o, KeyModifiers m)
      : id(i), open(o), modifiers(m) {}
  std::int32_t id;
  bool open;
  KeyModifiers modifiers;
};

// --- ColorPickerControl ---
// Live previews while the picker is open; a cancelled pick ends with a changing message that
// carries the colour from before the pick.
struct ColorPickerControlChangingMessage : MessageOf<ColorPickerControlChangingMessage> {
  static constexpr std::string_view kTypeName = "ColorPickerControlChangingMessage";
  ColorPickerControlChangingMessage(Color c, std::int32_t i) : color(c), id(i) {}
  Color color;
  std::int32_t id;
};
// The colour the user settled on (only when it differs from the one before the pick).
struct ColorPickerControlChangedMessage : MessageOf<ColorPickerControlChangedMessage> {
  static constexpr std::string_view kTypeName = "ColorPickerControlChangedMessage";
  ColorPickerControlChangedMessage(Color c, std::int32_t i) : color(c), id(i) {}
  Color color;
  std::int32_t id;
};
// The swatch was clicked (before the picker opens); `color` is the colour shown.
struct ColorPickerSwatchClickedMessage : MessageOf<ColorPickerSwatchClickedMessage> {
  static constexpr std::string_view kTypeName = "ColorPickerSwatchClickedMessage";
  ColorPickerSwatchClickedMessage(Color c, std::int32_t i) : color(c), id(i) {}
  Color color;
  std::int32_t id;
};

// --- ScrollBar ---
enum class ScrollCode : std::int32_t {
  kLineUp = 0,         // arrow towards the start (left for a horizontal bar)
  kLineDown = 1,       // arrow towards the end
  kPageUp = 2,         // track before the thumb
  kPageDown = 3,       // track after the thumb
  kThumbPosition = 4,  // the position was set (thumb released, wheel, ScrollBy)
  kThumbTrack = 5,     // the thumb is being dragged
  kTop = 6,            // Home
  kBottom = 7,         // End
  kEndScroll = 8,      // the gesture ended
};
// `position` is the bar's position after the step (already clamped); `flags` the modifier keys.
struct ScrollVerticalMessage : MessageOf<ScrollVerticalMessage> {
  static constexpr std::string_view kTypeName = "ScrollVerticalMessage";
  ScrollVerticalMessage(ScrollCode c, int p, KeyModifiers f) : code(c), position(p), flags(f) {}
  ScrollCode code;
  int position;
  KeyModifiers flags;
};
struct ScrollHorizontalMessage : MessageOf<ScrollHorizontalMessage> {
  static constexpr std::string_view kTypeName = "ScrollHorizontalMessage";
  ScrollHorizontalMessage(ScrollCode c, int p, KeyModifiers f) : code(c), position(p), flags(f) {}
  ScrollCode code;
  int position;
  KeyModifiers flags;
};

// --- TimeBarControl and its ZoomBar (all on the time bar's station; times in ticks) ---
// The current-time indicator is being dragged / was released.
struct EditTimeChangingMessage : MessageOf<EditTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "EditTimeChangingMessage";
  explicit EditTimeChangingMessage(TickTime t) : time(t) {}
  TickTime time;
};
struct EditTimeChangedMessage : MessageOf<EditTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "EditTimeChangedMessage";
  explicit EditTimeChangedMessage(TickTime t) : time(t) {}
  TickTime time;
};
// The visible range [zoomIn, zoomOut] changed its length (an end of the zoom bar dragged).
struct ZoomInOutTimeChangingMessage : MessageOf<ZoomInOutTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "ZoomInOutTimeChangingMessage";
  ZoomInOutTimeChangingMessage(TickTime in, TickTime out) : zoomIn(in), zoomOut(out) {}
  TickTime zoomIn;
  TickTime zoomOut;
};
struct ZoomInOutTimeChangedMessage : MessageOf<ZoomInOutTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "ZoomInOutTimeChangedMessage";
  ZoomInOutTimeChangedMessage(TickTime in, TickTime out) : zoomIn(in), zoomOut(out) {}
  TickTime zoomIn;
  TickTime zoomOut;
};
// The visible range moved without changing its length (zoom bar's middle dragged, pan).
struct SlideZoomMessage : MessageOf<SlideZoomMessage> {
  static constexpr std::string_view kTypeName = "SlideZoomMessage";
  SlideZoomMessage(TickTime in, TickTime out) : zoomIn(in), zoomOut(out) {}
  TickTime zoomIn;
  TickTime zoomOut;
};
// In and out marks dragged (changing) and released (changed).
struct MarkInTimeChangingMessage : MessageOf<MarkInTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "MarkInTimeChangingMessage";
  explicit MarkInTimeChangingMessage(TickTime t) : time(t) {}
  TickTime time;
};
struct MarkInTimeChangedMessage : MessageOf<MarkInTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "MarkInTimeChangedMessage";
  explicit MarkInTimeChangedMessage(TickTime t) : time(t) {}
  TickTime time;
};
struct MarkOutTimeChangingMessage : MessageOf<MarkOutTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "MarkOutTimeChangingMessage";
  explicit MarkOutTimeChangingMessage(TickTime t) : time(t) {}
  TickTime time;
};
struct MarkOutTimeChangedMessage : MessageOf<MarkOutTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "MarkOutTimeChangedMessage";
  explicit MarkOutTimeChangedMessage(TickTime t) : time(t) {}
  TickTime time;
};
// The marked range moved as a whole.
struct MarkInOutTimeChangingMessage : MessageOf<MarkInOutTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "MarkInOutTimeChangingMessage";
  MarkInOutTimeChangingMessage(TickTime in, TickTime out) : inTime(in), outTime(out) {}
  TickTime inTime;
  TickTime outTime;
};
struct MarkInOutTimeChangedMessage : MessageOf<MarkInOutTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "MarkInOutTimeChangedMessage";
  MarkInOutTimeChangedMessage(TickTime in, TickTime out) : inTime(in), outTime(out) {}
  TickTime inTime;
  TickTime outTime;
};
// A marker dragged (changing) and released (changed); the time bar shows the new time at once
// but the markers' owner decides (it reloads the markers into the bar).
struct MarkerTimeChangingMessage : MessageOf<MarkerTimeChangingMessage> {
  static constexpr std::string_view kTypeName = "MarkerTimeChangingMessage";
  MarkerTimeChangingMessage(std::int64_t id, TickTime from, TickTime to)
      : markerID(id), oldTime(from), newTime(to) {}
  std::int64_t markerID;
  TickTime oldTime;  // where the marker was when the drag began
  TickTime newTime;
};
struct MarkerTimeChangedMessage : MessageOf<MarkerTimeChangedMessage> {
  static constexpr std::string_view kTypeName = "MarkerTimeChangedMessage";
  MarkerTimeChangedMessage(std::int64_t id, TickTime from, TickTime to)
      : markerID(id), oldTime(from), newTime(to) {}
  std::int64_t markerID;
  TickTime oldTime;
  TickTime newTime;
};
// A double click on a marker.
struct EditSequenceMarkerMessage : MessageOf<EditSequenceMarkerMessage> {
  static constexpr std::string_view kTypeName = "EditSequenceMarkerMessage";
  explicit EditSequenceMarkerMessage(std::int64_t id) : markerID(id) {}
  std::int64_t markerID;
};
// A right-button press on the bar; `point` in the bar's coordinates, `time` under it.
struct TimebarRightButtonDownMessage : MessageOf<TimebarRightButtonDownMessage> {
  static constexpr std::string_view kTypeName = "TimebarRightButtonDownMessage";
  TimebarRightButtonDownMessage(Point p, TickTime t, KeyModifiers m)
      : point(p), time(t), modifiers(m) {}
  Point point;
  TickTime time;
  KeyModifiers modifiers;
};
