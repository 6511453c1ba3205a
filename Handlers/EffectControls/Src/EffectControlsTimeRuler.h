#pragma once

#include <functional>
#include <optional>

#include "Host/Model/FrameRate.h"
#include "Host/Model/TickTime.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/SubView.h"

// The time ruler above the keyframe area: the limited range [minimum, maximum], the visible
// (zoom) range drawn across its width with timecode labels and ticks, the in and out marks, a
// thin zoom bar along the top that shows where the visible range lies in the whole range, and
// the current-time head. Dragging on the ruler moves the current time (reported through the
// time callback, not set by the ruler itself). Times in sequence ticks. UI thread only.
class EffectControlsTimeRuler : public SubView {
 public:
  static constexpr int kZoomBarHeight = 6;
  static constexpr int kRulerHeight = 30;  // zoom bar + ticks and numbers

  using TimeCallback = std::function<void(TickTime time, bool final)>;

  EffectControlsTimeRuler();
  ~EffectControlsTimeRuler() override;

  // The range that may be shown; a range with max < min is ignored.
  void SetTimeRange(TickTime minimum, TickTime maximum);
  TickTime GetMinTime() const { return mMin; }
  TickTime GetMaxTime() const { return mMax; }
  // The visible range (zoom in at `zoomIn`, zoom out at `zoomOut`).
  void SetZoom(TickTime zoomIn, TickTime zoomOut);
  TickTime GetZoomIn() const { return mZoomIn; }
  TickTime GetZoomOut() const { return mZoomOut; }
  void SetCurrentTime(TickTime time);
  TickTime GetCurrentTime() const { return mCurrentTime; }
  void SetInOut(std::optional<TickTime> in, std::optional<TickTime> out);
  void SetFrameRate(const FrameRate& rate);
  void SetZeroPoint(TickTime zeroPoint);
  void SetShowNumbers(bool show);
  bool GetShowNumbers() const { return mShowNumbers; }
  void SetZoomBarVisible(bool visible);
  bool IsZoomBarVisible() const { return mZoomBarVisible; }
  void SetTimeCallback(TimeCallback callback) { mTimeCallback = std::move(callback); }

  double TimeToX(TickTime time) const;
  TickTime XToTime(double x) const;

  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;

 private:
  void ReportTime(Point point, bool final);

  TickTime mMin = 0;
  TickTime mMax = 0;
  TickTime mZoomIn = 0;
  TickTime mZoomOut = 0;
  TickTime mCurrentTime = 0;
  TickTime mZeroPoint = 0;
  std::optional<TickTime> mIn;
  std::optional<TickTime> mOut;
  FrameRate mRate = kFrameRate_25;
  bool mShowNumbers = true;
  bool mZoomBarVisible = true;
  bool mDragging = false;
  TimeCallback mTimeCallback;
  Font mFont;
};
