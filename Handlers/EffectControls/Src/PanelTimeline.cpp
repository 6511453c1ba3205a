#include "Handlers/EffectControls/Src/PanelTimeline.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace {

// The frame rate whose frame lasts one pixel of `secondsPerPixel` (a positive number).
FrameRate PixelFrameRateFor(double secondsPerPixel) {
  constexpr TickTime kLongest = std::numeric_limits<TickTime>::max();
  const double pixelsPerSecond = 1.0 / secondsPerPixel;
  TickTime ticks = kLongest;
  if (pixelsPerSecond != 0.0) {
    const double exact = std::trunc(static_cast<double>(kTicksPerSecond) / pixelsPerSecond);
    ticks = exact < 1.0                              ? 1
            : exact >= static_cast<double>(kLongest) ? kLongest
                                                     : static_cast<TickTime>(exact);
  }
  return FrameRate::FromTicksPerFrame(ticks).value_or(FrameRate());
}

}  // namespace

PanelTimeline::PanelTimeline()
    : mStation(RegisterUniqueStation("PanelTimeline")),
      mPixelFrameRate(PixelFrameRateFor(kInitialSecondsPerPixel)) {}

PanelTimeline::~PanelTimeline() {
  DisposeStation(mStation);
}

bool PanelTimeline::SetEditTime(TickTime time) {
  if (time == mEditTime) {
    return false;
  }
  mEditTime = time;
  Announce(kEditTimeChanged);
  return true;
}

bool PanelTimeline::SetVisibleStart(TickTime time) {
  if (time == mVisibleStart) {
    return false;
  }
  mVisibleStart = time;
  Announce(kVisibleStartChanged);
  return true;
}

bool PanelTimeline::SetSecondsPerPixel(double secondsPerPixel) {
  if (!(secondsPerPixel > 0.0) || secondsPerPixel == mSecondsPerPixel) {
    return false;
  }
  mSecondsPerPixel = secondsPerPixel;
  mPixelFrameRate = PixelFrameRateFor(secondsPerPixel);
  Announce(kZoomChanged);
  return true;
}

bool PanelTimeline::SetShownRange(TickTime start, TickTime end) {
  end = std::max(start, end);
  if (start == mShownStart && end == mShownEnd) {
    return false;
  }
  mShownStart = start;
  mShownEnd = end;
  Announce(kShownRangeChanged);
  return true;
}

std::shared_ptr<const TickTime> PanelTimeline::ShareEditTime(
    const std::shared_ptr<const PanelTimeline>& timeline) {
  if (!timeline) {
    return nullptr;
  }
  return std::shared_ptr<const TickTime>(timeline, &timeline->mEditTime);
}

void PanelTimeline::Announce(unsigned changes) const {
  BroadcastMessage(mStation, PanelTimelineChangedMessage(changes));
}

double PanelTimeline::TimeToX(TickTime time) const {
  return static_cast<double>(time - mVisibleStart) /
         (mSecondsPerPixel * static_cast<double>(kTicksPerSecond));
}

TickTime PanelTimeline::XToTime(double x) const {
  // Saturates: a huge zoom or a pixel far off the area must not overflow.
  return AddTimes(mVisibleStart, SecondsToTicks(x * mSecondsPerPixel));
}
