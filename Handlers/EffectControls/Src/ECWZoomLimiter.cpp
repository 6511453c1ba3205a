#include "Handlers/EffectControls/Src/ECWZoomLimiter.h"

#include <algorithm>

#include "Host/Messaging/Diagnostics.h"

ECWZoomLimiter::~ECWZoomLimiter() = default;

TickTime ECWZoomLimiter::ClampTime(TickTime time) const {
  return std::clamp(time, mMinTime, std::max(mMinTime, mMaxTime));
}

bool ECWZoomLimiter::SetMinMaxTime(TickTime minTime, TickTime maxTime) {
  if (!HOST_VERIFY(maxTime >= minTime, "Invalid Min/Max Time")) {
    return false;
  }
  mMinTime = minTime;
  mMaxTime = maxTime;
  return true;
}

void ECWZoomLimiter::SetFrameDuration(TickTime duration) {
  mFrameDuration = duration > 0 ? duration : kUnsetFrameDuration;
}
