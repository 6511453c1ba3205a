#include "Host/Toolkit/TimeBarControl.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/ZoomBar.h"
#include "Host/Toolkit/ZoomLimiter.h"

namespace {

__extension__ typedef __int128 Int128;

// floor(a / b) for b > 0.
Int128 FloorDiv(Int128 a, Int128 b) {
  Int128 q = a / b;
  if ((a % b != 0) && (a < 0)) {
    --q;
  }
  return q;
}

// ceil(a / b) for b > 0.
Int128 CeilDiv(Int128 a, Int128 b) {
  return -FloorDiv(-a, b);
}

template <class T>
T Saturate(Int128 value) {
  constexpr Int128 kLow = std::numeric_limits<T>::min();
  constexpr Int128 kHigh = std::numeric_limits<T>::max();
  return static_cast<T>(std::clamp(value, kLow, kHigh));
}

// Marker colours by index: green, red, purple, orange, yellow, white, blue, cyan.
constexpr std::array<Color, 8> kMarkerColors{Color(0x5C, 0xB8, 0x5C), Color(0xD9, 0x53, 0x4F),
                                             Color(0x9B, 0x59, 0xB6), Color(0xF0, 0x8C, 0x2E),
                                             Color(0xF2, 0xD1, 0x3D), Color(0xEE, 0xEE, 0xEE),
                                             Color(0x42, 0x8B, 0xCA), Color(0x3F, 0xC8, 0xD4)};

constexpr int kMinorTickSpacing = 6;
constexpr int kNumberlessSpacing = 40;

TickTime LimitTime(TickTime time) {
  return std::clamp(time, kTime_Min, kTime_Max);
}

}  // namespace

TimeBarControl::TimeBarControl(const Rect& bounds, Commander* commander) : SubView(commander) {
  SetBounds(bounds);
}

TimeBarControl::~TimeBarControl() {
  if (mZoomBar != nullptr) {
    mZoomBar->mTimeBar = nullptr;
  }
}

// --- State ---

void TimeBarControl::SetTimeRange(TickTime start, TickTime end) {
  if (!HOST_VERIFY(end >= start, "Invalid Min/Max Time")) {
    return;
  }
  start = LimitTime(start);
  end = LimitTime(end);
  mStart = start;
  mEnd = end;
  Invalidate();
  InvalidateZoomBar();
}

void TimeBarControl::SetZoomInOutTime(TickTime zoomIn, TickTime zoomOut) {
  zoomIn = LimitTime(zoomIn);
  zoomOut = LimitTime(zoomOut);
  if (!HOST_VERIFY(zoomOut > zoomIn, "Invalid zoom range")) {
    return;
  }
  if (zoomIn != mZoomIn || zoomOut != mZoomOut) {
    mZoomIn = zoomIn;
    mZoomOut = zoomOut;
    Invalidate();
    InvalidateZoomBar();
  }
}

void TimeBarControl::SetCurrentTime(TickTime time) {
  if (time != mCurrent) {
    mCurrent = time;
    Invalidate();
  }
}

void TimeBarControl::SetInOutMarks(std::optional<TickTime> in, std::optional<TickTime> out) {
  mIn = in;
  mOut = out;
  Invalidate();
}

void TimeBarControl::SetMarkers(std::vector<TimeBarMarker> markers) {
  mMarkers = std::move(markers);
  Invalidate();
}

void TimeBarControl::SetMarkerSelectionFunctions(MarkerIsSelectedFunction isSelected,
                                                 MarkerSelectFunction select) {
  mIsMarkerSelected = std::move(isSelected);
  mSelectMarker = std::move(select);
  Invalidate();
}

void TimeBarControl::SetShowNumbers(bool show) {
  mShowNumbers = show;
  Invalidate();
}

void TimeBarControl::SetTimeDisplay(const FrameRate& video, const FrameRate& audio) {
  if (HOST_VERIFY(video.IsValid() && audio.IsValid(), "Invalid time display")) {
    mVideoRate = video;
    mAudioRate = audio;
    Invalidate();
  }
}

void TimeBarControl::SetAudioTimeUnits(bool audioTimeUnits) {
  mAudioUnits = audioTimeUnits;
  Invalidate();
}

void TimeBarControl::SetZeroPoint(TickTime zeroPoint) {
  mZeroPoint = zeroPoint;
  Invalidate();
}

void TimeBarControl::SetBoundsSelf(const Rect& /*bounds*/) {
  InvalidateZoomBar();
}

void TimeBarControl::InvalidateZoomBar() const {
  if (mZoomBar != nullptr) {
    mZoomBar->Invalidate();
  }
}

// --- Mapping ---

int TimeBarControl::Width() const {
  return std::max(1, GetBounds().Width());
}

double TimeBarControl::GetTicksPerPixel() const {
  return (static_cast<double>(mZoomOut) - static_cast<double>(mZoomIn)) / Width();
}

int TimeBarControl::TimeToPixel(TickTime time) const {
  const Int128 span = static_cast<Int128>(mZoomOut) - mZoomIn;
  const Int128 x = FloorDiv((static_cast<Int128>(time) - mZoomIn) * Width(), span);
  return static_cast<int>(std::clamp<Int128>(x, -kMaxPixel, kMaxPixel));
}

TickTime TimeBarControl::PixelToTime(int x) const {
  const Int128 span = static_cast<Int128>(mZoomOut) - mZoomIn;
  const Int128 time =
      static_cast<Int128>(mZoomIn) + CeilDiv(static_cast<Int128>(x) * span, Width());
  return Saturate<TickTime>(std::clamp<Int128>(time, kTime_Min, kTime_Max));
}

TickTime TimeBarControl::SnapToFrame(TickTime time) const {
  const FrameRate& rate = GetDisplayRate();
  return rate.IsValid() ? rate.AlignToNearestFrame(time) : time;
}

TickTime TimeBarControl::ClampToRange(TickTime time) const {
  return std::clamp(time, mStart, mEnd);
}

TickTime TimeBarControl::GetMinimumZoomSpan() const {
  TickTime span = Width();
  if (mLimiter != nullptr) {
    const double finest = mLimiter->GetFinestTimePerPixel() * Width();
    span = std::max(span, SecondsToTicks(finest));
  }
  return span;
}

TickTime TimeBarControl::GetMajorTickInterval() const {
  const FrameRate& rate = GetDisplayRate();
  const TickTime frame = rate.IsValid() ? rate.GetTicksPerFrame() : kTicksPerSecond / 30;
  std::vector<TickTime> candidates;
  const std::array<TickTime, 14> frameSteps{1,   2,   5,    10,   20,   50,    100,
                                            200, 500, 1000, 2000, 5000, 10000, 20000};
  for (const TickTime frames : frameSteps) {
    // frames * frame < one second, without the product: a slow rate's frame is near kTime_Max.
    if (frame <= (kTicksPerSecond - 1) / frames) {
      candidates.push_back(frames * frame);
    }
  }
  const std::array<TickTime, 16> secondSteps{1,   2,   5,   10,   15,   30,   60,    120,
                                             300, 600, 900, 1800, 3600, 7200, 21600, 43200};
  for (const TickTime seconds : secondSteps) {
    candidates.push_back(seconds * kTicksPerSecond);
  }
  const Font font(kFont_Small);
  const int needed =
      mShowNumbers ? font.StringWidth(rate.FormatTimecode(mZoomOut)) + 12 : kNumberlessSpacing;
  const double ticksPerPixel = GetTicksPerPixel();
  for (const TickTime candidate : candidates) {
    if (candidate / ticksPerPixel >= needed) {
      return candidate;
    }
  }
  // Zoomed out beyond the longest step: whole multiples of it, up to the largest that is a time.
  // Past that (a view of 2^62 ticks on a few pixels) the numbers may crowd; the ticks still
  // fall on whole multiples and the count of ticks drawn stays bounded.
  const TickTime longest = candidates.back();
  const double multiple = std::ceil(needed * ticksPerPixel / static_cast<double>(longest));
  const TickTime most = kTime_Max / longest;
  return longest * static_cast<TickTime>(std::clamp(multiple, 1.0, static_cast<double>(most)));
}

// --- Gestures ---

const TimeBarMarker* TimeBarControl::HitMarker(Point point) const {
  if (point.y < 0 || point.y > kMarkerBandHeight + 2) {
    return nullptr;
  }
  const TimeBarMarker* best = nullptr;
  int bestDistance = kHitTolerance + 1;
  for (const TimeBarMarker& marker : mMarkers) {
    const int x0 = TimeToPixel(marker.time);
    const int x1 = marker.duration > 0 ? TimeToPixel(AddTimes(marker.time, marker.duration)) : x0;
    const int distance = point.x < x0 ? x0 - point.x : (point.x > x1 ? point.x - x1 : 0);
    if (distance < bestDistance) {
      bestDistance = distance;
      best = &marker;
    }
  }
  return best;
}

TimeBarMarker* TimeBarControl::FindMarker(std::int64_t id) {
  const auto it = std::find_if(mMarkers.begin(), mMarkers.end(),
                               [id](const TimeBarMarker& marker) { return marker.id == id; });
  return it == mMarkers.end() ? nullptr : &*it;
}

TimeBarControl::Drag TimeBarControl::HitTest(Point point, std::int64_t* markerID) const {
  if (const TimeBarMarker* marker = HitMarker(point)) {
    *markerID = marker->id;
    return Drag::kMarker;
  }
  const int height = GetBounds().Height();
  if (point.y >= height - kMarkStripHeight - 6) {
    const int inDistance = mIn ? std::abs(point.x - TimeToPixel(*mIn)) : kHitTolerance + 1;
    const int outDistance = mOut ? std::abs(point.x - TimeToPixel(*mOut)) : kHitTolerance + 1;
    if (std::min(inDistance, outDistance) <= kHitTolerance) {
      return inDistance <= outDistance ? Drag::kInMark : Drag::kOutMark;
    }
    if (mIn && mOut && point.y >= height - kMarkStripHeight && point.x > TimeToPixel(*mIn) &&
        point.x < TimeToPixel(*mOut)) {
      return Drag::kMarkedRange;
    }
  }
  return Drag::kCurrentTime;
}

void TimeBarControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  mDrag = HitTest(point, &mDragMarker);
  mDragChanged = false;
  mDragAnchor = SnapToFrame(PixelToTime(std::clamp(point.x, 0, Width())));
  mDragStartIn = mIn;
  mDragStartOut = mOut;
  if (mDrag == Drag::kMarker) {
    mDragStartTime = FindMarker(mDragMarker)->time;
    mDragLastTime = mDragStartTime;
  }
  CaptureMouse();
  if (mDrag == Drag::kCurrentTime) {
    UpdateDrag(point, false);
  }
}

void TimeBarControl::LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) {
  if (const TimeBarMarker* marker = HitMarker(point)) {
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    Broadcast(EditSequenceMarkerMessage(marker->id));
    return;
  }
  SubView::LeftButtonMultiClickSelf(point, modifiers, clickCount);
}

void TimeBarControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDrag != Drag::kNone) {
    UpdateDrag(point, false);
  }
}

void TimeBarControl::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDrag == Drag::kNone) {
    return;
  }
  ReleaseMouse();
  UpdateDrag(point, true);
  mDrag = Drag::kNone;
}

void TimeBarControl::UpdateDrag(Point point, bool finished) {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const TickTime pointer = SnapToFrame(PixelToTime(std::clamp(point.x, 0, Width())));
  const TickTime delta = SubtractTimes(pointer, mDragAnchor);
  switch (mDrag) {
    case Drag::kCurrentTime: {
      const TickTime time = ClampToRange(pointer);
      if (time != mCurrent) {
        SetCurrentTime(time);
        mDragChanged = true;
        Broadcast(EditTimeChangingMessage(time));
      }
      if (finished && mDragChanged) {
        Broadcast(EditTimeChangedMessage(mCurrent));
      }
      break;
    }
    case Drag::kInMark: {
      const TickTime limit = mOut.value_or(mEnd);
      const TickTime time =
          std::clamp(AddTimes(*mDragStartIn, delta), mStart, std::max(mStart, limit));
      if (time != mIn) {
        mIn = time;
        Invalidate();
        mDragChanged = true;
        Broadcast(MarkInTimeChangingMessage(time));
      }
      if (finished && mDragChanged) {
        Broadcast(MarkInTimeChangedMessage(*mIn));
      }
      break;
    }
    case Drag::kOutMark: {
      const TickTime limit = mIn.value_or(mStart);
      const TickTime time =
          std::clamp(AddTimes(*mDragStartOut, delta), std::min(limit, mEnd), mEnd);
      if (time != mOut) {
        mOut = time;
        Invalidate();
        mDragChanged = true;
        Broadcast(MarkOutTimeChangingMessage(time));
      }
      if (finished && mDragChanged) {
        Broadcast(MarkOutTimeChangedMessage(*mOut));
      }
      break;
    }
    case Drag::kMarkedRange: {
      // The marked range moves as a whole and stays inside the time range.
      const TickTime lowest = SubtractTimes(mStart, *mDragStartIn);
      const TickTime highest = SubtractTimes(mEnd, *mDragStartOut);
      const TickTime shift =
          std::clamp(delta, std::min(lowest, highest), std::max(lowest, highest));
      const TickTime in = AddTimes(*mDragStartIn, shift);
      const TickTime out = AddTimes(*mDragStartOut, shift);
      if (in != mIn) {
        mIn = in;
        mOut = out;
        Invalidate();
        mDragChanged = true;
        Broadcast(MarkInOutTimeChangingMessage(in, out));
      }
      if (finished && mDragChanged) {
        Broadcast(MarkInOutTimeChangedMessage(*mIn, *mOut));
      }
      break;
    }
    case Drag::kMarker: {
      // The drag goes on even when the owner reloads the markers under it.
      const TickTime time = ClampToRange(AddTimes(mDragStartTime, delta));
      if (time != mDragLastTime) {
        mDragLastTime = time;
        if (TimeBarMarker* marker = FindMarker(mDragMarker)) {
          marker->time = time;
        }
        Invalidate();
        mDragChanged = true;
        Broadcast(MarkerTimeChangingMessage(mDragMarker, mDragStartTime, time));
      }
      if (finished) {
        if (mDragChanged) {
          Broadcast(MarkerTimeChangedMessage(mDragMarker, mDragStartTime, mDragLastTime));
        } else if (mSelectMarker) {
          mSelectMarker(mDragMarker);
          Invalidate();
        }
      }
      break;
    }
    case Drag::kNone:
      break;
  }
}

void TimeBarControl::RightButtonDownSelf(Point point, KeyModifiers modifiers) {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  Broadcast(TimebarRightButtonDownMessage(point, PixelToTime(point.x), modifiers));
}

bool TimeBarControl::MousePanSelf(const PanEvent& event) {
  if (event.deltaX == 0) {
    return false;
  }
  ScrollByPixels(event.deltaX);
  return true;
}

bool TimeBarControl::SetCursorSelf(Point point, KeyModifiers /*modifiers*/) {
  std::int64_t id = 0;
  const Drag part = HitTest(point, &id);
  if (part == Drag::kInMark || part == Drag::kOutMark) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return true;
  }
  return false;
}

void TimeBarControl::HideSelf() {
  mDrag = Drag::kNone;
}

bool TimeBarControl::SetZoomFromUser(TickTime zoomIn, TickTime zoomOut, bool keepSpan) {
  // In 128 bits: the range from kTime_Min to kTime_Max is wider than kTime_Max, and a span
  // saturated there would change the zoom of a view that is only slid.
  const Int128 range = static_cast<Int128>(mEnd) - mStart;
  Int128 span = static_cast<Int128>(zoomOut) - zoomIn;
  if (!keepSpan) {
    span = std::max(span, std::min<Int128>(GetMinimumZoomSpan(), std::max<Int128>(range, 1)));
  }
  span = std::max<Int128>(span, 1);
  const TickTime in = range >= span
                          ? static_cast<TickTime>(std::clamp<Int128>(zoomIn, mStart, mEnd - span))
                          : mStart;
  const auto out = static_cast<TickTime>(std::min<Int128>(in + span, kTime_Max));
  if (in == mZoomIn && out == mZoomOut) {
    return false;
  }
  SetZoomInOutTime(in, out);
  return true;
}

bool TimeBarControl::ScrollByPixels(int pixels) {
  // The slide is limited to the time range before it is added, so that neither end of the view
  // saturates (which would change its span); a far slide is a double beyond 64 bits.
  const Int128 lowest = std::min<Int128>(0, static_cast<Int128>(mStart) - mZoomIn);
  const Int128 highest = std::max<Int128>(0, static_cast<Int128>(mEnd) - mZoomOut);
  const double wanted = std::clamp(pixels * GetTicksPerPixel(), static_cast<double>(lowest),
                                   static_cast<double>(highest));
  const Int128 shift = std::clamp<Int128>(static_cast<Int128>(std::round(wanted)), lowest, highest);
  if (!SetZoomFromUser(static_cast<TickTime>(mZoomIn + shift),
                       static_cast<TickTime>(mZoomOut + shift), true)) {
    return false;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  Broadcast(SlideZoomMessage(mZoomIn, mZoomOut));
  return true;
}

// --- Painting ---

void TimeBarControl::PaintSelf(DC& dc) {
  dc.FillRect(GetLocalBounds(), ColorManager::GetColor(kColor_TimeRulerBackground));
  PaintTicks(dc);
  PaintMarks(dc);
  PaintMarkers(dc);
  PaintCurrentTime(dc);
}

void TimeBarControl::PaintTicks(DC& dc) const {
  const int height = GetBounds().Height();
  const int bottom = height - kMarkStripHeight;
  const bool enabled = IsEnabledInTree();
  const Color tickColor =
      ColorManager::GetColor(enabled ? kColor_TimeRulerTicks : kColor_ControlTextDisabled);
  const Color textColor =
      ColorManager::GetColor(enabled ? kColor_ControlText : kColor_ControlTextDisabled);
  const TickTime major = GetMajorTickInterval();
  const double ticksPerPixel = GetTicksPerPixel();
  TickTime minor = major;
  for (const TickTime parts : {10, 5, 2}) {
    if (major % parts == 0 && (major / parts) / ticksPerPixel >= kMinorTickSpacing) {
      minor = major / parts;
      break;
    }
  }
  // Ticks sit on multiples of the interval of the time as shown (with the zero point).
  const Int128 shownStart = static_cast<Int128>(mZoomIn) + mZeroPoint;
  const Int128 first = CeilDiv(shownStart, minor) * minor - mZeroPoint;
  const Font font(kFont_Small);
  const FrameRate& rate = GetDisplayRate();
  const std::int64_t maxTicks = 4 * std::int64_t{Width()} + 4;
  std::int64_t count = 0;
  for (Int128 t = first; t <= mZoomOut && count < maxTicks; t += minor, ++count) {
    const auto time = static_cast<TickTime>(t);
    const int x = TimeToPixel(time);
    const bool isMajor = ((t + mZeroPoint) % major) == 0;
    const int length = isMajor ? std::max(3, bottom / 2) : std::max(2, bottom / 4);
    dc.FillRect(Rect{x, bottom - length, x + 1, bottom}, tickColor);
    if (isMajor && mShowNumbers) {
      dc.DrawTextAt(rate.FormatTimecode(AddTimes(time, mZeroPoint)), {x + 3, 0}, font, textColor);
    }
  }
  dc.FillRect(Rect{0, bottom, Width(), bottom + 1}, tickColor);
}

void TimeBarControl::PaintMarks(DC& dc) const {
  if (!mIn && !mOut) {
    return;
  }
  const int height = GetBounds().Height();
  const Color color = ColorManager::GetColor(kColor_InteractiveControl);
  const int x0 = mIn ? TimeToPixel(*mIn) : 0;
  const int x1 = mOut ? TimeToPixel(*mOut) : Width();
  dc.FillRect(Rect{x0, height - kMarkStripHeight, std::max(x0 + 1, x1), height},
              color.WithAlpha(160));
  // Brackets: a post with feet pointing into the marked range.
  const auto bracket = [&](int x, int direction) {
    dc.FillRect(Rect{x, height - kMarkStripHeight - 6, x + 1, height}, color);
    const int foot = direction > 0 ? x : x - 3;
    dc.FillRect(Rect{foot, height - kMarkStripHeight - 6, foot + 4, height - kMarkStripHeight - 5},
                color);
  };
  if (mIn) {
    bracket(x0, 1);
  }
  if (mOut) {
    bracket(x1, -1);
  }
}

void TimeBarControl::PaintMarkers(DC& dc) const {
  for (const TimeBarMarker& marker : mMarkers) {
    const int x = TimeToPixel(marker.time);
    const Color color =
        kMarkerColors[static_cast<std::size_t>(std::clamp(marker.colorIndex, 0, 7))];
    if (marker.duration > 0) {
      const int x1 = TimeToPixel(AddTimes(marker.time, marker.duration));
      dc.FillRect(Rect{x, kMarkerBandHeight - 2, std::max(x + 1, x1), kMarkerBandHeight},
                  color.WithAlpha(180));
    }
    const std::array<Point, 5> shape{Point{x - 3, 0}, Point{x + 4, 0}, Point{x + 4, 4},
                                     Point{x, kMarkerBandHeight}, Point{x - 3, 4}};
    dc.FillPolygon(shape, color);
    if (mIsMarkerSelected && mIsMarkerSelected(marker.id)) {
      dc.FrameRect(Rect{x - 4, 0, x + 5, kMarkerBandHeight + 1},
                   ColorManager::GetColor(kColor_Focus));
    }
  }
}

void TimeBarControl::PaintCurrentTime(DC& dc) const {
  const int x = TimeToPixel(mCurrent);
  if (x < -5 || x > Width() + 5) {
    return;
  }
  const Color color = ColorManager::GetColor(IsEnabledInTree() ? kColor_CurrentTimeIndicator
                                                               : kColor_ControlTextDisabled);
  dc.FillRect(Rect{x, 0, x + 1, GetBounds().Height()}, color);
  const std::array<Point, 3> head{Point{x - 4, 0}, Point{x + 5, 0}, Point{x, 6}};
  dc.FillPolygon(head, color);
}
