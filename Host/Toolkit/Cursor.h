#pragma once

#include <functional>
#include <string_view>

// The toolkit's cursors, by the names the views use; the window front end maps them to shapes.
enum class Cursor {
  kOSArrow,
  kIBeam,
  kCrosshair,
  kWait,
  kHand,
  kFist,
  kFistNo,
  kFistAdd,
  kSplitterHorizontal,
  kSplitterVertical,
  kSplitterHorizontalBig,
  kSplitterVerticalBig,
  kTinyMarquee,
  kPrecisePath,
  kDirectControlPointSelect,
  kDirectionHandleSelection,
  kEditAnchor,
  kDirectSelectAdd,
  kSelectVerticalAdjust,
  kTLZoomIn,
  kTLZoomOut,
  kPen,
  kPenAdd,
  kPenSelection,
  kPenVerticalAdjust,
  kTrimHead,
  kTrimTail,
  kRoll,
  kSlideA,
  kRippleHead,
  kRippleTail,
  kEyedropper,
  kEyedropperArea,
  kCount
};

// "kFistNo" for Cursor::kFistNo (state dumps, traces); empty for kCount and out-of-range values.
std::string_view CursorName(Cursor cursor);

// The application's current cursor. Setting it tells the observer (the window) when the cursor
// actually changes. UI thread only.
void SetCurrentCursor(Cursor cursor);
Cursor GetCurrentCursor();

// Hiding nests: each hide needs one show. Showing more often than hiding is ignored.
void HideCursor();
void ShowCursor();
bool IsCursorHidden();

// Called with the new cursor on each change, and with the current one when set. One observer
// (the window front end); an empty function removes it.
void SetCursorObserver(std::function<void(Cursor)> observer);

// Arrow, shown, no observer (tests).
void ResetCursorForTesting();
