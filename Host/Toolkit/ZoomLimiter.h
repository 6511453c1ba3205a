#pragma once

#include <limits>

#include "Host/Time/TickTime.h"

// Limits of a time view's zoom: how far out (the whole duration across the scroll width) and how
// far in (a frame, or an audio sample in audio time units, at most kMaxPixelsPerFrame or
// kMaxPixelsPerAudioSample pixels wide) it may go. Owners derive from it to say what the
// duration and frame are; the base holds the view's scroll width and the audio-units flag and
// carries the generic time-per-pixel rule. Times in ticks, zoom in seconds per pixel.
class ZoomLimiter {
 public:
  // The finest zoom: pixels one video frame, or one audio sample, may cover.
  static constexpr double kMaxPixelsPerFrame = 64.0;
  static constexpr double kMaxPixelsPerAudioSample = 16.0;
  // A frame duration that says "no frame rate known yet".
  static constexpr TickTime kUnsetFrameDuration = std::numeric_limits<TickTime>::max();
  // The default curve of the zoom position (see TimePerPixelFromZoomPosition).
  static constexpr double kDefaultPowerExponent = 3.0;

  ZoomLimiter() = default;
  ZoomLimiter(const ZoomLimiter&) = default;
  ZoomLimiter& operator=(const ZoomLimiter&) = default;
  virtual ~ZoomLimiter();

  // Length of the time that may be shown, in ticks (never negative).
  virtual TickTime GetDuration() const = 0;
  // The time that scroll position 0 stands for, relative to the start of the limited range.
  virtual TickTime GetBaseOffset() const { return 0; }
  // Ticks of one frame (one audio sample in audio time units); kUnsetFrameDuration when unknown.
  virtual TickTime GetFrameDuration() const = 0;
  // Exponent of the zoom position's curve: > 1 gives finer steps at the zoomed-in end.
  virtual double GetPowerExponent() const { return kDefaultPowerExponent; }
  // The nearest time the view may start at.
  virtual TickTime ClampTime(TickTime time) const = 0;
  // `secondsPerPixel` raised to the finest zoom (1 / (max pixels per frame x frames per
  // second); 1.0 while the frame duration is unset), then lowered to the widest (the duration in
  // seconds over max(1, scroll width), or 1.0 for an empty duration). The widest wins when the
  // two cross. NaN counts as the finest zoom.
  virtual double ClampTimePerPixel(double secondsPerPixel) const;

  // Width of the view the zoom applies to, in pixels (negative counts as 0).
  void SetScrollWidth(int pixels);
  int GetScrollWidth() const { return mScrollWidth; }
  void SetAudioTimeUnits(bool audioTimeUnits) { mAudioTimeUnits = audioTimeUnits; }
  bool IsAudioTimeUnits() const { return mAudioTimeUnits; }

  // Both bounds of ClampTimePerPixel, in seconds per pixel (finest <= widest not guaranteed).
  double GetFinestTimePerPixel() const;
  double GetWidestTimePerPixel() const;

  // A zoom slider's position p in [0, 1] (0 the finest zoom, 1 the widest) as seconds per pixel:
  // finest + (widest - finest) x p^exponent. Positions outside [0, 1] are clamped.
  double TimePerPixelFromZoomPosition(double position) const;
  // The inverse; clamped to [0, 1].
  double ZoomPositionFromTimePerPixel(double secondsPerPixel) const;

 private:
  int mScrollWidth = 0;
  bool mAudioTimeUnits = false;
};
