#pragma once

#include "Host/Time/TickTime.h"
#include "Host/Toolkit/ZoomLimiter.h"

// The panel's zoom limits: the keyframe area may show [minimum, maximum] (sequence ticks) and
// zoom in down to a frame (or an audio sample in audio time units) of the given duration.
class ECWZoomLimiter : public ZoomLimiter {
 public:
  ECWZoomLimiter() = default;
  ~ECWZoomLimiter() override;

  TickTime GetDuration() const override { return mMaxTime - mMinTime; }
  TickTime GetBaseOffset() const override { return 0; }
  TickTime GetFrameDuration() const override { return mFrameDuration; }
  TickTime ClampTime(TickTime time) const override;

  // A range with max < min is refused with the debug assertion "Invalid Min/Max Time" and the
  // stored range stays. Returns whether the range was taken.
  bool SetMinMaxTime(TickTime minTime, TickTime maxTime);
  TickTime GetMinTime() const { return mMinTime; }
  TickTime GetMaxTime() const { return mMaxTime; }

  // Ticks per frame (or per audio sample); kUnsetFrameDuration (or <= 0) when unknown.
  void SetFrameDuration(TickTime duration);

 private:
  TickTime mFrameDuration = kUnsetFrameDuration;
  TickTime mMinTime = 0;
  TickTime mMaxTime = 0;
};
