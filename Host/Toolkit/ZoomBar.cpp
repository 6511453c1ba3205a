#include "Host/Toolkit/ZoomBar.h"

#include <algorithm>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/TimeBarControl.h"

namespace {
__extension__ typedef __int128 Int128;
}  // namespace

ZoomBar::ZoomBar(const Rect& bounds, Commander* commander) : SubView(commander) {
  SetBounds(bounds);
}

ZoomBar::~ZoomBar() {
  if (mTimeBar != nullptr) {
    mTimeBar->mZoomBar = nullptr;
  }
}

void ZoomBar::AttachTo(TimeBarControl* timeBar) {
  if (timeBar == mTimeBar) {
    return;
  }
  if (mTimeBar != nullptr) {
    mTimeBar->mZoomBar = nullptr;
  }
  mTimeBar = timeBar;
  if (mTimeBar != nullptr) {
    if (mTimeBar->mZoomBar != nullptr) {
      mTimeBar->mZoomBar->mTimeBar = nullptr;
      mTimeBar->mZoomBar->Invalidate();
    }
    mTimeBar->mZoomBar = this;
  }
  mDrag = Drag::kNone;
  Invalidate();
}

int ZoomBar::TimeToPixel(TickTime time) const {
  if (mTimeBar == nullptr) {
    return 0;
  }
  const Int128 range =
      std::max<Int128>(1, static_cast<Int128>(mTimeBar->GetEndTime()) - mTimeBar->GetStartTime());
  const Int128 x = (static_cast<Int128>(time) - mTimeBar->GetStartTime()) *
                   std::max(1, GetBounds().Width()) / range;
  return static_cast<int>(std::clamp<Int128>(x, -1000000, 1000000));
}

TickTime ZoomBar::PixelToTime(int x) const {
  if (mTimeBar == nullptr) {
    return kTime_Zero;
  }
  const Int128 range = static_cast<Int128>(mTimeBar->GetEndTime()) - mTimeBar->GetStartTime();
  return static_cast<TickTime>(mTimeBar->GetStartTime() +
                               static_cast<Int128>(x) * range / std::max(1, GetBounds().Width()));
}

Rect ZoomBar::GetThumbRect() const {
  if (mTimeBar == nullptr) {
    return {};
  }
  const int width = GetBounds().Width();
  int x0 = std::clamp(TimeToPixel(mTimeBar->GetZoomInTime()), 0, width);
  int x1 = std::clamp(TimeToPixel(mTimeBar->GetZoomOutTime()), 0, width);
  // Never thinner than its two handles, centred on the visible part.
  if (x1 - x0 < kMinThumbWidth) {
    const int centre = (x0 + x1) / 2;
    x0 = std::clamp(centre - kMinThumbWidth / 2, 0, std::max(0, width - kMinThumbWidth));
    x1 = std::min(width, x0 + kMinThumbWidth);
  }
  return Rect{x0, 0, x1, GetBounds().Height()};
}

ZoomBar::Drag ZoomBar::HitTest(Point point) const {
  const Rect thumb = GetThumbRect();
  if (thumb.IsEmpty()) {
    return Drag::kNone;
  }
  if (point.x >= thumb.left - 1 && point.x < thumb.left + kHandleWidth) {
    return Drag::kStart;
  }
  if (point.x >= thumb.right - kHandleWidth && point.x <= thumb.right) {
    return Drag::kEnd;
  }
  if (point.x >= thumb.left && point.x < thumb.right) {
    return Drag::kMiddle;
  }
  return Drag::kNone;
}

void ZoomBar::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mTimeBar == nullptr) {
    return;
  }
  mDrag = HitTest(point);
  mDragChanged = false;
  mPressX = point.x;
  mStartIn = mTimeBar->GetZoomInTime();
  mStartOut = mTimeBar->GetZoomOutTime();
  if (mDrag == Drag::kNone) {
    // Beside the thumb: centre the view on the pressed time, then drag it from there.
    const TickTime span = SubtractTimes(mStartOut, mStartIn);
    const TickTime centre = PixelToTime(point.x);
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    if (mTimeBar->SetZoomFromUser(SubtractTimes(centre, span / 2),
                                  AddTimes(SubtractTimes(centre, span / 2), span), true)) {
      mTimeBar->Broadcast(SlideZoomMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
    }
    if (mTimeBar == nullptr) {
      return;
    }
    mStartIn = mTimeBar->GetZoomInTime();
    mStartOut = mTimeBar->GetZoomOutTime();
    mDrag = Drag::kMiddle;
  }
  CaptureMouse();
  Invalidate();
}

void ZoomBar::LeftButtonMultiClickSelf(Point /*point*/, KeyModifiers /*modifiers*/,
                                       int /*clickCount*/) {
  if (mTimeBar == nullptr) {
    return;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (mTimeBar->SetZoomFromUser(mTimeBar->GetStartTime(), mTimeBar->GetEndTime(), false)) {
    mTimeBar->Broadcast(
        ZoomInOutTimeChangedMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
  }
}

void ZoomBar::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDrag == Drag::kNone || mTimeBar == nullptr) {
    return;
  }
  const TickTime delta = SubtractTimes(PixelToTime(point.x), PixelToTime(mPressX));
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  switch (mDrag) {
    case Drag::kStart: {
      const TickTime limit = SubtractTimes(mStartOut, mTimeBar->GetMinimumZoomSpan());
      const TickTime in = std::min(AddTimes(mStartIn, delta), limit);
      if (mTimeBar->SetZoomFromUser(std::max(in, mTimeBar->GetStartTime()), mStartOut, false)) {
        mDragChanged = true;
        mTimeBar->Broadcast(
            ZoomInOutTimeChangingMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
      }
      break;
    }
    case Drag::kEnd: {
      const TickTime limit = AddTimes(mStartIn, mTimeBar->GetMinimumZoomSpan());
      const TickTime out = std::max(AddTimes(mStartOut, delta), limit);
      if (mTimeBar->SetZoomFromUser(mStartIn, std::min(out, mTimeBar->GetEndTime()), false)) {
        mDragChanged = true;
        mTimeBar->Broadcast(
            ZoomInOutTimeChangingMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
      }
      break;
    }
    case Drag::kMiddle:
      if (mTimeBar->SetZoomFromUser(AddTimes(mStartIn, delta), AddTimes(mStartOut, delta), true)) {
        mTimeBar->Broadcast(
            SlideZoomMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
      }
      break;
    case Drag::kNone:
      break;
  }
}

void ZoomBar::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (mDrag == Drag::kNone) {
    return;
  }
  const Drag drag = mDrag;
  mDrag = Drag::kNone;
  ReleaseMouse();
  Invalidate();
  if (mTimeBar != nullptr && mDragChanged && (drag == Drag::kStart || drag == Drag::kEnd)) {
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    mTimeBar->Broadcast(
        ZoomInOutTimeChangedMessage(mTimeBar->GetZoomInTime(), mTimeBar->GetZoomOutTime()));
  }
}

bool ZoomBar::SetCursorSelf(Point point, KeyModifiers /*modifiers*/) {
  const Drag part = HitTest(point);
  if (part == Drag::kStart || part == Drag::kEnd) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return true;
  }
  return false;
}

void ZoomBar::HideSelf() {
  mDrag = Drag::kNone;
}

void ZoomBar::DestroySelf() {
  AttachTo(nullptr);
}

void ZoomBar::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_ScrollBarTrack));
  const Rect thumb = GetThumbRect();
  if (thumb.IsEmpty()) {
    return;
  }
  const bool enabled = IsEnabledInTree();
  const Color body =
      ColorManager::GetColor(enabled ? kColor_ScrollBarThumb : kColor_ControlTextDisabled);
  const Rect inner = thumb.Inset(0, 2);
  dc.FillRect(inner, mDrag == Drag::kMiddle
                         ? body.Mix(ColorManager::GetColor(kColor_ControlText), 0.3)
                         : body);
  if (enabled) {
    const Color handle = ColorManager::GetColor(kColor_InteractiveControl);
    dc.FillRect(Rect{inner.left, inner.top, inner.left + kHandleWidth - 2, inner.bottom}, handle);
    dc.FillRect(Rect{inner.right - kHandleWidth + 2, inner.top, inner.right, inner.bottom}, handle);
  }
}
