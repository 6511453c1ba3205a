#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

class Message;
class ZoomBar;
class ZoomLimiter;

// A marker as the time bar shows it; `id` is the owner's handle, sent back in messages.
struct TimeBarMarker {
  std::int64_t id = 0;
  TickTime time = kTime_Zero;
  TickTime duration = kTime_Zero;  // 0 for a point marker
  int colorIndex = 0;              // 0 to 7
  std::string name;

  friend bool operator==(const TimeBarMarker&, const TimeBarMarker&) = default;
};

// The time ruler above a time view. It shows the visible part [zoom in, zoom out] of a time
// range with ticks and timecode numbers (in video or audio time units, from a zero point), the
// in and out marks, markers and the current-time indicator, and an attached ZoomBar shows the
// visible part within the whole range.
//
// Mapping: the bar's width covers [zoom in, zoom out]; TimeToPixel rounds down and PixelToTime
// gives the first tick of a pixel, so TimeToPixel(PixelToTime(x)) == x for every |x| <=
// kMaxPixel while a pixel spans at least one tick. Coordinates are the bar's own.
//
// Gestures, reported on the bar's station (ControlMessages.h): dragging anywhere moves the
// current time (EditTimeChanging at the press and on moves, EditTimeChanged at the release;
// snapped to frames of the display rate, kept in the time range); dragging a mark's handle
// moves it (MarkIn/MarkOut...), dragging the strip between them moves both (MarkInOut...);
// dragging a marker moves it (MarkerTime..., the bar shows the new time at once, the owner
// reloads the markers); a click on a marker selects it through the selection functions; a double
// click on a marker sends EditSequenceMarkerMessage; a right press sends
// TimebarRightButtonDownMessage; a horizontal pan slides the view (SlideZoomMessage).
// Setting any state from code sends nothing. Disabled bars take no input. UI thread only.
class TimeBarControl : public SubView {
 public:
  // The toolkit's small ruler height (the panel adds 4).
  static constexpr int kDefaultSmallHeight = 20;
  // Pixels around a mark or marker that grab it.
  static constexpr int kHitTolerance = 4;
  // Height of the strip at the bottom that shows (and moves) the marked range.
  static constexpr int kMarkStripHeight = 4;
  // Height of the band at the top where markers sit.
  static constexpr int kMarkerBandHeight = 7;
  // TimeToPixel stays within +-kMaxPixel, so a shape a few pixels around any time can be drawn
  // without overflowing an int (the DC takes coordinates this far out).
  static constexpr int kMaxPixel = 1 << 30;

  static int GetDefaultSmallHeight() { return kDefaultSmallHeight; }

  explicit TimeBarControl(const Rect& bounds, Commander* commander = nullptr);
  ~TimeBarControl() override;

  const StationName& GetStation() const { return mStation.GetName(); }

  // --- Times (ticks) ---
  // The time range and the zoom are limited to [kTime_Min, kTime_Max], so that their spans and
  // the ticks between them fit 64 bits; other times (current, marks, markers) may be anything.
  // The times that exist; end < start is refused with the debug assertion "Invalid Min/Max Time".
  void SetTimeRange(TickTime start, TickTime end);
  TickTime GetStartTime() const { return mStart; }
  TickTime GetEndTime() const { return mEnd; }
  // The visible range; zoomOut <= zoomIn is refused with a debug assertion. Code may show times
  // outside the time range; the user's gestures stay inside it.
  void SetZoomInOutTime(TickTime zoomIn, TickTime zoomOut);
  TickTime GetZoomInTime() const { return mZoomIn; }
  TickTime GetZoomOutTime() const { return mZoomOut; }
  void SetCurrentTime(TickTime time);
  TickTime GetCurrentTime() const { return mCurrent; }
  // nullopt: no mark.
  void SetInOutMarks(std::optional<TickTime> in, std::optional<TickTime> out);
  std::optional<TickTime> GetInMark() const { return mIn; }
  std::optional<TickTime> GetOutMark() const { return mOut; }

  // --- Markers ---
  void SetMarkers(std::vector<TimeBarMarker> markers);
  const std::vector<TimeBarMarker>& GetMarkers() const { return mMarkers; }
  // How the owner's marker selection is read and changed; either may be empty (then nothing
  // shows selected, and clicks select nothing).
  using MarkerIsSelectedFunction = std::function<bool(std::int64_t id)>;
  using MarkerSelectFunction = std::function<void(std::int64_t id)>;
  void SetMarkerSelectionFunctions(MarkerIsSelectedFunction isSelected,
                                   MarkerSelectFunction select);

  // --- Display ---
  void SetShowNumbers(bool show);
  bool AreNumbersShown() const { return mShowNumbers; }
  // The rates of the video and the audio time display; invalid rates are refused.
  void SetTimeDisplay(const FrameRate& video, const FrameRate& audio);
  void SetAudioTimeUnits(bool audioTimeUnits);
  bool IsAudioTimeUnits() const { return mAudioUnits; }
  // The rate numbers are written in and times snap to.
  const FrameRate& GetDisplayRate() const { return mAudioUnits ? mAudioRate : mVideoRate; }
  // Added to every time shown (a sequence's starting timecode).
  void SetZeroPoint(TickTime zeroPoint);
  TickTime GetZeroPoint() const { return mZeroPoint; }
  // Limits the zoom bar's gestures; not owned, the owner keeps it alive or sets null.
  void SetZoomLimiter(const ZoomLimiter* limiter) { mLimiter = limiter; }
  const ZoomLimiter* GetZoomLimiter() const { return mLimiter; }

  // --- Mapping ---
  double GetTicksPerPixel() const;
  int TimeToPixel(TickTime time) const;
  TickTime PixelToTime(int x) const;
  // The major tick interval the bar draws now (ticks), for tests and the keyframe view's grid.
  TickTime GetMajorTickInterval() const;

  // Slides the visible range by `pixels` (positive: later), kept inside the time range, and
  // reports SlideZoomMessage when it moved. True when it moved.
  bool ScrollByPixels(int pixels);
  // The shortest visible range a user may zoom to: one tick per pixel, or what the zoom
  // limiter allows.
  TickTime GetMinimumZoomSpan() const;

  ZoomBar* GetZoomBar() const { return mZoomBar; }

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  void RightButtonDownSelf(Point point, KeyModifiers modifiers) override;
  bool MousePanSelf(const PanEvent& event) override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;
  void SetBoundsSelf(const Rect& bounds) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  friend class ZoomBar;
  enum class Drag { kNone, kCurrentTime, kInMark, kOutMark, kMarkedRange, kMarker };

  // A user's visible range (from the zoom bar or a pan), kept inside the time range and at
  // least the minimum span; the length is kept when only `keepSpan`. True when it changed.
  bool SetZoomFromUser(TickTime zoomIn, TickTime zoomOut, bool keepSpan);
  void Broadcast(const Message& message) const { mStation.Broadcast(message); }

  int Width() const;
  TickTime SnapToFrame(TickTime time) const;
  TickTime ClampToRange(TickTime time) const;
  // The marker under the point (in the marker band), or null.
  const TimeBarMarker* HitMarker(Point point) const;
  TimeBarMarker* FindMarker(std::int64_t id);
  Drag HitTest(Point point, std::int64_t* markerID) const;
  void UpdateDrag(Point point, bool finished);
  void InvalidateZoomBar() const;
  void PaintTicks(DC& dc) const;
  void PaintMarks(DC& dc) const;
  void PaintMarkers(DC& dc) const;
  void PaintCurrentTime(DC& dc) const;

  ControlStation mStation{"TimeBarControl"};
  TickTime mStart = kTime_Zero;
  TickTime mEnd = 100 * kTicksPerSecond;
  TickTime mZoomIn = kTime_Zero;
  TickTime mZoomOut = 100 * kTicksPerSecond;
  TickTime mCurrent = kTime_Zero;
  std::optional<TickTime> mIn;
  std::optional<TickTime> mOut;
  std::vector<TimeBarMarker> mMarkers;
  MarkerIsSelectedFunction mIsMarkerSelected;
  MarkerSelectFunction mSelectMarker;
  bool mShowNumbers = true;
  FrameRate mVideoRate = kFrameRate_30;
  FrameRate mAudioRate = kFrameRate_Audio48000;
  bool mAudioUnits = false;
  TickTime mZeroPoint = kTime_Zero;
  const ZoomLimiter* mLimiter = nullptr;  // not owned; see SetZoomLimiter
  ZoomBar* mZoomBar = nullptr;            // not owned; the zoom bar detaches itself when destroyed

  Drag mDrag = Drag::kNone;
  bool mDragChanged = false;
  std::int64_t mDragMarker = 0;          // the dragged marker's id
  TickTime mDragStartTime = kTime_Zero;  // marker or range start when the drag began
  TickTime mDragLastTime = kTime_Zero;   // the marker's time as last reported
  TickTime mDragAnchor = kTime_Zero;     // time under the pointer at the press
  std::optional<TickTime> mDragStartIn;
  std::optional<TickTime> mDragStartOut;
};
