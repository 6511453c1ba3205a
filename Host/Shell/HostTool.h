#pragma once

// The timeline tools. Each has its message on the tool station (ShellMessages.h).
enum class HostTool {
  kPointer,
  kTrackSelectForward,
  kRipple,
  kRoll,
  kRateStretch,
  kRazor,
  kSlip,
  kSlide,
  kPen,
  kHand,
  kZoom,
};
