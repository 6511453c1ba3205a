#include "Host/Toolkit/ScrollBar.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cmath>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/RepeatTimer.h"

ScrollBar::ScrollBar(const Rect& bounds, Orientation orientation, Commander* commander)
    : SubView(commander), mOrientation(orientation) {
  SetBounds(bounds);
}

ScrollBar::~ScrollBar() {
  StopRepeat();
}

// --- State ---

int ScrollBar::GetMaxPosition() const {
  return std::max(mMin, mMax - mPage);
}

void ScrollBar::SetScrollInfo(int minimum, int maximum, int page, int position) {
  mMin = minimum;
  mMax = std::max(minimum, maximum);
  mPage = std::max(0, page);
  mPosition = std::clamp(position, mMin, GetMaxPosition());
  Invalidate();
}

void ScrollBar::SetRange(int minimum, int maximum) {
  SetScrollInfo(minimum, maximum, mPage, mPosition);
}

void ScrollBar::SetPageSize(int page) {
  SetScrollInfo(mMin, mMax, page, mPosition);
}

void ScrollBar::SetStep(int step) {
  mStep = std::max(1, step);
}

void ScrollBar::SetPosition(int position) {
  const int clamped = std::clamp(position, mMin, GetMaxPosition());
  if (clamped != mPosition) {
    mPosition = clamped;
    Invalidate();
  }
}

int ScrollBar::ScrollBy(int delta, KeyModifiers modifiers) {
  const int before = mPosition;
  const long long target = static_cast<long long>(mPosition) + delta;
  const int clamped = static_cast<int>(
      std::clamp<long long>(target, mMin, static_cast<long long>(GetMaxPosition())));
  MoveTo(clamped, ScrollCode::kThumbPosition, modifiers);
  return mPosition - before;
}

bool ScrollBar::MoveTo(int position, ScrollCode code, KeyModifiers modifiers) {
  const int clamped = std::clamp(position, mMin, GetMaxPosition());
  if (clamped == mPosition) {
    return false;
  }
  mPosition = clamped;
  Invalidate();
  Report(code, modifiers);
  return true;
}

void ScrollBar::Report(ScrollCode code, KeyModifiers modifiers) const {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (mOrientation == Orientation::kVertical) {
    mStation.Broadcast(ScrollVerticalMessage(code, mPosition, modifiers));
  } else {
    mStation.Broadcast(ScrollHorizontalMessage(code, mPosition, modifiers));
  }
}

// --- Geometry ---

int ScrollBar::Along(Point point) const {
  return mOrientation == Orientation::kVertical ? point.y : point.x;
}

int ScrollBar::Length() const {
  return mOrientation == Orientation::kVertical ? GetBounds().Height() : GetBounds().Width();
}

int ScrollBar::Thickness() const {
  return mOrientation == Orientation::kVertical ? GetBounds().Width() : GetBounds().Height();
}

int ScrollBar::ArrowLength() const {
  return std::max(0, std::min(Thickness(), Length() / 2));
}

int ScrollBar::TrackStart() const {
  return ArrowLength();
}

int ScrollBar::TrackEnd() const {
  return std::max(TrackStart(), Length() - ArrowLength());
}

int ScrollBar::ThumbLength() const {
  const int track = TrackEnd() - TrackStart();
  if (!CanScroll()) {
    return track;
  }
  const double content = static_cast<double>(mMax) - mMin;
  const int proportional = static_cast<int>(std::lround(track * (mPage / content)));
  return std::min(track, std::max(kMinThumbLength, proportional));
}

int ScrollBar::ThumbStart() const {
  const int room = TrackEnd() - TrackStart() - ThumbLength();
  if (!CanScroll() || room <= 0) {
    return TrackStart();
  }
  const double fraction =
      static_cast<double>(mPosition - mMin) / static_cast<double>(GetMaxPosition() - mMin);
  return TrackStart() + static_cast<int>(std::lround(room * fraction));
}

namespace {
Rect Span(ScrollBar::Orientation orientation, int start, int end, int thickness) {
  return orientation == ScrollBar::Orientation::kVertical ? Rect{0, start, thickness, end}
                                                          : Rect{start, 0, end, thickness};
}
}  // namespace

Rect ScrollBar::GetDecrementArrowRect() const {
  return Span(mOrientation, 0, ArrowLength(), Thickness());
}

Rect ScrollBar::GetIncrementArrowRect() const {
  return Span(mOrientation, Length() - ArrowLength(), Length(), Thickness());
}

Rect ScrollBar::GetThumbRect() const {
  return Span(mOrientation, ThumbStart(), ThumbStart() + ThumbLength(), Thickness());
}

ScrollBar::Part ScrollBar::HitPart(Point point) const {
  if (!GetLocalBounds().Contains(point)) {
    return Part::kNone;
  }
  const int along = Along(point);
  if (along < TrackStart()) {
    return Part::kDecrementArrow;
  }
  if (along >= TrackEnd()) {
    return Part::kIncrementArrow;
  }
  if (along < ThumbStart()) {
    return Part::kPageBefore;
  }
  if (along >= ThumbStart() + ThumbLength()) {
    return Part::kPageAfter;
  }
  return Part::kThumb;
}

// --- Gestures ---

bool ScrollBar::StepHeldPart() {
  if (!mPointerOverHeld) {
    return true;  // paused while the pointer is off the part; it may come back
  }
  const int along = Along(mLastPoint);
  switch (mHeld) {
    case Part::kDecrementArrow:
      return MoveTo(mPosition - mStep, ScrollCode::kLineUp, mHeldModifiers);
    case Part::kIncrementArrow:
      return MoveTo(mPosition + mStep, ScrollCode::kLineDown, mHeldModifiers);
    case Part::kPageBefore:
      // Paging stops once the thumb has reached the pointer.
      return along < ThumbStart() &&
             MoveTo(mPosition - std::max(1, mPage), ScrollCode::kPageUp, mHeldModifiers);
    case Part::kPageAfter:
      return along >= ThumbStart() + ThumbLength() &&
             MoveTo(mPosition + std::max(1, mPage), ScrollCode::kPageDown, mHeldModifiers);
    default:
      return false;
  }
}

void ScrollBar::StartRepeat() {
  StopRepeat();
  std::weak_ptr<ViewBase> weak = weak_from_this();
  mRepeatTimer = RepeatTimer::Instance().Schedule(
      std::chrono::milliseconds(kRepeatDelayMilliseconds),
      [weak] {
        const std::shared_ptr<ViewBase> view = weak.lock();
        auto* bar = static_cast<ScrollBar*>(view.get());
        if (bar != nullptr && bar->mHeld != Part::kNone && bar->mHeld != Part::kThumb) {
          bar->StepHeldPart();
        }
      },
      std::chrono::milliseconds(kRepeatIntervalMilliseconds));
}

void ScrollBar::StopRepeat() {
  if (mRepeatTimer != 0) {
    RepeatTimer::Instance().Cancel(mRepeatTimer);
    mRepeatTimer = 0;
  }
}

void ScrollBar::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (!CanScroll()) {
    return;
  }
  mHeld = HitPart(point);
  if (mHeld == Part::kNone) {
    return;
  }
  mLastPoint = point;
  mHeldModifiers = modifiers;
  mPointerOverHeld = true;
  CaptureMouse();
  if (mHeld == Part::kThumb) {
    mThumbGrab = Along(point) - ThumbStart();
    mMovedThumb = false;
    Invalidate();
    return;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  StepHeldPart();
  if (mHeld != Part::kNone) {
    StartRepeat();
  }
}

void ScrollBar::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  if (mHeld == Part::kNone) {
    return;
  }
  mLastPoint = point;
  mHeldModifiers = modifiers;
  if (mHeld != Part::kThumb) {
    const Part under = HitPart(point);
    const bool track = mHeld == Part::kPageBefore || mHeld == Part::kPageAfter;
    mPointerOverHeld =
        track ? (under == Part::kPageBefore || under == Part::kPageAfter || under == Part::kThumb)
              : under == mHeld;
    return;
  }
  const int room = TrackEnd() - TrackStart() - ThumbLength();
  if (room <= 0) {
    return;
  }
  const double fraction = static_cast<double>(Along(point) - mThumbGrab - TrackStart()) / room;
  const int position =
      mMin + static_cast<int>(std::lround(std::clamp(fraction, 0.0, 1.0) *
                                          static_cast<double>(GetMaxPosition() - mMin)));
  if (MoveTo(position, ScrollCode::kThumbTrack, modifiers)) {
    mMovedThumb = true;
  }
}

void ScrollBar::LeftButtonUpSelf(Point /*point*/, KeyModifiers modifiers) {
  if (mHeld == Part::kNone) {
    return;
  }
  const Part held = mHeld;
  mHeld = Part::kNone;
  StopRepeat();
  ReleaseMouse();
  Invalidate();
  if (held == Part::kThumb && mMovedThumb) {
    Report(ScrollCode::kThumbPosition, modifiers);
  }
  Report(ScrollCode::kEndScroll, modifiers);
}

bool ScrollBar::MouseWheelSelf(const WheelEvent& event) {
  const int notches =
      mOrientation == Orientation::kVertical || event.deltaX == 0 ? event.deltaY : event.deltaX;
  if (notches == 0) {
    return false;
  }
  // Turning the wheel away from the user goes towards the start.
  ScrollBy(-notches * mStep * 3, event.modifiers);
  return true;
}

void ScrollBar::HideSelf() {
  mHeld = Part::kNone;
  StopRepeat();
}

void ScrollBar::DestroySelf() {
  mHeld = Part::kNone;
  StopRepeat();
}

// --- Painting ---

void ScrollBar::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_ScrollBarTrack));
  const bool active = CanScroll() && IsEnabledInTree();
  const Color arrowColor =
      ColorManager::GetColor(active ? kColor_ControlText : kColor_ControlTextDisabled);
  const auto arrow = [&](const Rect& box, bool towardsStart) {
    const Point c = box.Center();
    const int s = std::max(2, std::min(box.Width(), box.Height()) / 4);
    std::array<Point, 3> points{};
    if (mOrientation == Orientation::kVertical) {
      const int tipY = towardsStart ? c.y - s : c.y + s;
      const int baseY = towardsStart ? c.y + s / 2 : c.y - s / 2;
      points = {Point{c.x, tipY}, Point{c.x + s, baseY}, Point{c.x - s, baseY}};
    } else {
      const int tipX = towardsStart ? c.x - s : c.x + s;
      const int baseX = towardsStart ? c.x + s / 2 : c.x - s / 2;
      points = {Point{tipX, c.y}, Point{baseX, c.y + s}, Point{baseX, c.y - s}};
    }
    dc.FillPolygon(points, arrowColor);
  };
  arrow(GetDecrementArrowRect(), true);
  arrow(GetIncrementArrowRect(), false);
  if (!active) {
    return;
  }
  const Rect thumb = mOrientation == Orientation::kVertical ? GetThumbRect().Inset(3, 1)
                                                            : GetThumbRect().Inset(1, 3);
  const Color thumbColor = ColorManager::GetColor(kColor_ScrollBarThumb);
  dc.FillRect(thumb, mHeld == Part::kThumb
                         ? thumbColor.Mix(ColorManager::GetColor(kColor_ControlText), 0.3)
                         : thumbColor);
}
