#include "Handlers/EffectControls/Src/EffectControlsTimeRuler.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string>

#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

namespace {

constexpr double kTicksPerSecondD = 254016000000.0;
// Minimum distance between two labelled ticks, in pixels.
constexpr int kLabelSpacing = 90;

}  // namespace

EffectControlsTimeRuler::EffectControlsTimeRuler() : mFont(kFont_Label) {}

EffectControlsTimeRuler::~EffectControlsTimeRuler() = default;

void EffectControlsTimeRuler::SetTimeRange(TickTime minimum, TickTime maximum) {
  if (maximum < minimum) {
    return;
  }
  mMin = minimum;
  mMax = maximum;
  Invalidate();
}

void EffectControlsTimeRuler::SetZoom(TickTime zoomIn, TickTime zoomOut) {
  mZoomIn = zoomIn;
  mZoomOut = std::max(zoomIn, zoomOut);
  Invalidate();
}

void EffectControlsTimeRuler::SetCurrentTime(TickTime time) {
  if (time != mCurrentTime) {
    mCurrentTime = time;
    Invalidate();
  }
}

void EffectControlsTimeRuler::SetInOut(std::optional<TickTime> in, std::optional<TickTime> out) {
  mIn = in;
  mOut = out;
  Invalidate();
}

void EffectControlsTimeRuler::SetFrameRate(const FrameRate& rate) {
  if (rate.IsValid()) {
    mRate = rate;
    Invalidate();
  }
}

void EffectControlsTimeRuler::SetZeroPoint(TickTime zeroPoint) {
  mZeroPoint = zeroPoint;
  Invalidate();
}

void EffectControlsTimeRuler::SetShowNumbers(bool show) {
  mShowNumbers = show;
  Invalidate();
}

void EffectControlsTimeRuler::SetZoomBarVisible(bool visible) {
  mZoomBarVisible = visible;
  Invalidate();
}

double EffectControlsTimeRuler::TimeToX(TickTime time) const {
  const TickTime span = mZoomOut - mZoomIn;
  if (span <= 0) {
    return 0.0;
  }
  return static_cast<double>(time - mZoomIn) * GetBounds().Width() / static_cast<double>(span);
}

TickTime EffectControlsTimeRuler::XToTime(double x) const {
  const int width = std::max(1, GetBounds().Width());
  return mZoomIn +
         static_cast<TickTime>(std::llround(x * static_cast<double>(mZoomOut - mZoomIn) / width));
}

void EffectControlsTimeRuler::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const bool enabled = IsEnabledInTree();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_TimeRulerBackground));
  const Color ticks =
      ColorManager::GetColor(enabled ? kColor_TimeRulerTicks : kColor_ControlTextDisabled);
  const int zoomBarBottom = mZoomBarVisible ? kZoomBarHeight : 0;

  // The zoom bar: where the visible range lies within the whole range.
  if (mZoomBarVisible && mMax > mMin) {
    const double scale = static_cast<double>(bounds.Width()) / static_cast<double>(mMax - mMin);
    const int left = static_cast<int>(std::floor((mZoomIn - mMin) * scale));
    const int right = static_cast<int>(std::ceil((mZoomOut - mMin) * scale));
    dc.FillRect(Rect{0, 0, bounds.Width(), kZoomBarHeight - 1},
                ColorManager::GetColor(kColor_ScrollBarTrack));
    const Rect thumb{std::max(0, left), 1, std::min(bounds.Width(), std::max(left + 4, right)),
                     kZoomBarHeight - 2};
    dc.FillRect(thumb,
                ColorManager::GetColor(enabled ? kColor_ScrollBarThumb : kColor_ScrollBarTrack));
  }

  const TickTime span = mZoomOut - mZoomIn;
  if (span > 0 && bounds.Width() > 0) {
    // Label step: the smallest "nice" number of frames (or seconds) whose width is at least
    // kLabelSpacing pixels.
    const double pixelsPerTick = bounds.Width() / static_cast<double>(span);
    const TickTime frame = mRate.GetTicksPerFrame();
    static constexpr std::array<double, 14> kSteps = {1,   2,   5,   10,   15,   30,   60,
                                                      150, 300, 600, 1500, 3000, 9000, 18000};
    TickTime step = frame;
    for (double frames : kSteps) {
      step = static_cast<TickTime>(frames * static_cast<double>(frame));
      if (step * pixelsPerTick >= kLabelSpacing) {
        break;
      }
    }
    if (step * pixelsPerTick < kLabelSpacing) {
      step = static_cast<TickTime>(std::ceil(kLabelSpacing / pixelsPerTick / kTicksPerSecondD) *
                                   kTicksPerSecondD);
    }
    const int minorCount = 10;
    const TickTime minor = std::max<TickTime>(1, step / minorCount);
    TickTime t = (mZoomIn / step) * step;
    if (t > mZoomIn) {
      t -= step;
    }
    const int bottom = bounds.Height() - 1;
    for (; t <= mZoomOut; t += minor) {
      const int x = static_cast<int>(std::lround(TimeToX(t)));
      if (x < 0 || x >= bounds.Width()) {
        continue;
      }
      const bool major = (t % step) == 0;
      const int height = major ? 9 : ((t % (step / 2 == 0 ? 1 : step / 2)) == 0 ? 6 : 3);
      dc.FillRect(Rect{x, bottom - height, x + 1, bottom}, ticks);
      if (major && mShowNumbers) {
        dc.DrawTextAt(mRate.FormatTimecode(t - mZeroPoint), Point{x + 3, zoomBarBottom + 2}, mFont,
                      ticks);
      }
    }
  }

  // In and out marks: brackets at the bottom edge.
  const Color markColor = ColorManager::GetColor(kColor_InteractiveControl);
  const int bottom = bounds.Height() - 1;
  if (mIn) {
    const int x = static_cast<int>(std::lround(TimeToX(*mIn)));
    dc.FillRect(Rect{x, bottom - 8, x + 1, bottom}, markColor);
    dc.FillRect(Rect{x, bottom - 1, x + 4, bottom}, markColor);
  }
  if (mOut) {
    const int x = static_cast<int>(std::lround(TimeToX(*mOut)));
    dc.FillRect(Rect{x - 1, bottom - 8, x, bottom}, markColor);
    dc.FillRect(Rect{x - 4, bottom - 1, x, bottom}, markColor);
  }

  // Current-time head: a small downward pointer with a line to the bottom.
  if (enabled && span > 0) {
    const int x = static_cast<int>(std::lround(TimeToX(mCurrentTime)));
    if (x >= -6 && x <= bounds.Width() + 6) {
      const Color cti = ColorManager::GetColor(kColor_CurrentTimeIndicator);
      const int top = bounds.Height() - 12;
      const std::array<Point, 5> head = {Point{x - 5, top}, Point{x + 6, top},
                                         Point{x + 6, top + 5}, Point{x, top + 10},
                                         Point{x - 5, top + 5}};
      dc.FillPolygon(head, cti);
      dc.FillRect(Rect{x, top, x + 1, bounds.Height()}, cti);
    }
  }
  dc.FillRect(Rect{0, bounds.Height() - 1, bounds.Width(), bounds.Height()},
              ColorManager::GetColor(kColor_Divider));
}

void EffectControlsTimeRuler::ReportTime(Point point, bool final) {
  if (!mTimeCallback) {
    return;
  }
  const TickTime time = std::clamp(XToTime(point.x), mMin, std::max(mMin, mMax));
  mTimeCallback(mRate.AlignToNearestFrame(time), final);
}

void EffectControlsTimeRuler::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  mDragging = true;
  CaptureMouse();
  ReportTime(point, false);
}

void EffectControlsTimeRuler::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDragging) {
    ReportTime(point, false);
  }
}

void EffectControlsTimeRuler::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDragging) {
    mDragging = false;
    ReleaseMouse();
    ReportTime(point, true);
  }
}
