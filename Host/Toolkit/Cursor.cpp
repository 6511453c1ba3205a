#include "Host/Toolkit/Cursor.h"

#include <array>
#include <utility>

namespace {

constexpr std::array<std::string_view, static_cast<std::size_t>(Cursor::kCount)> kCursorNames{
    "kOSArrow",
    "kIBeam",
    "kCrosshair",
    "kWait",
    "kHand",
    "kFist",
    "kFistNo",
    "kFistAdd",
    "kSplitterHorizontal",
    "kSplitterVertical",
    "kSplitterHorizontalBig",
    "kSplitterVerticalBig",
    "kTinyMarquee",
    "kPrecisePath",
    "kDirectControlPointSelect",
    "kDirectionHandleSelection",
    "kEditAnchor",
    "kDirectSelectAdd",
    "kSelectVerticalAdjust",
    "kTLZoomIn",
    "kTLZoomOut",
    "kPen",
    "kPenAdd",
    "kPenSelection",
    "kPenVerticalAdjust",
    "kTrimHead",
    "kTrimTail",
    "kRoll",
    "kSlideA",
    "kRippleHead",
    "kRippleTail",
    "kEyedropper",
    "kEyedropperArea",
};

struct CursorState {
  Cursor current = Cursor::kOSArrow;
  int hideCount = 0;
  std::function<void(Cursor)> observer;
};

CursorState& State() {
  static CursorState state;
  return state;
}

}  // namespace

std::string_view CursorName(Cursor cursor) {
  const auto index = static_cast<std::size_t>(cursor);
  return index < kCursorNames.size() ? kCursorNames[index] : std::string_view{};
}

void SetCurrentCursor(Cursor cursor) {
  CursorState& state = State();
  if (cursor == state.current || cursor == Cursor::kCount) {
    return;
  }
  state.current = cursor;
  if (state.observer) {
    // A copy, so that an observer replacing itself is not destroyed while it runs.
    const std::function<void(Cursor)> observer = state.observer;
    observer(cursor);
  }
}

Cursor GetCurrentCursor() {
  return State().current;
}

void HideCursor() {
  ++State().hideCount;
}

void ShowCursor() {
  CursorState& state = State();
  if (state.hideCount > 0) {
    --state.hideCount;
  }
}

bool IsCursorHidden() {
  return State().hideCount > 0;
}

void SetCursorObserver(std::function<void(Cursor)> observer) {
  CursorState& state = State();
  state.observer = std::move(observer);
  if (state.observer) {
    const std::function<void(Cursor)> copy = state.observer;
    copy(state.current);
  }
}

void ResetCursorForTesting() {
  CursorState& state = State();
  state.current = Cursor::kOSArrow;
  state.hideCount = 0;
  state.observer = nullptr;
}
