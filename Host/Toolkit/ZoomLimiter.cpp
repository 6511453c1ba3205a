#include "Host/Toolkit/ZoomLimiter.h"

#include <algorithm>
#include <cmath>

ZoomLimiter::~ZoomLimiter() = default;

void ZoomLimiter::SetScrollWidth(int pixels) {
  mScrollWidth = std::max(0, pixels);
}

double ZoomLimiter::GetFinestTimePerPixel() const {
  const TickTime frame = GetFrameDuration();
  if (frame == kUnsetFrameDuration || frame <= 0) {
    return 1.0;
  }
  const double framesPerSecond = static_cast<double>(kTicksPerSecond) / static_cast<double>(frame);
  const double pixelsPerFrame = IsAudioTimeUnits() ? kMaxPixelsPerAudioSample : kMaxPixelsPerFrame;
  return 1.0 / (pixelsPerFrame * framesPerSecond);
}

double ZoomLimiter::GetWidestTimePerPixel() const {
  const TickTime duration = GetDuration();
  if (duration <= 0) {
    return 1.0;
  }
  return TicksToSeconds(duration) / std::max(1, mScrollWidth);
}

double ZoomLimiter::ClampTimePerPixel(double secondsPerPixel) const {
  double s = std::isnan(secondsPerPixel) ? GetFinestTimePerPixel() : secondsPerPixel;
  s = std::max(s, GetFinestTimePerPixel());
  return std::min(s, GetWidestTimePerPixel());
}

double ZoomLimiter::TimePerPixelFromZoomPosition(double position) const {
  const double p = std::isnan(position) ? 0.0 : std::clamp(position, 0.0, 1.0);
  const double finest = GetFinestTimePerPixel();
  const double widest = std::max(finest, GetWidestTimePerPixel());
  return finest + (widest - finest) * std::pow(p, std::max(GetPowerExponent(), 1e-6));
}

double ZoomLimiter::ZoomPositionFromTimePerPixel(double secondsPerPixel) const {
  const double finest = GetFinestTimePerPixel();
  const double widest = std::max(finest, GetWidestTimePerPixel());
  if (!(widest > finest) || std::isnan(secondsPerPixel)) {
    return 0.0;
  }
  const double t = std::clamp((secondsPerPixel - finest) / (widest - finest), 0.0, 1.0);
  return std::pow(t, 1.0 / std::max(GetPowerExponent(), 1e-6));
}
