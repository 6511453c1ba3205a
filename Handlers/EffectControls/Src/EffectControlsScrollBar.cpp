#include "Handlers/EffectControls/Src/EffectControlsScrollBar.h"

#include <algorithm>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

EffectControlsScrollBar::EffectControlsScrollBar() = default;

EffectControlsScrollBar::~EffectControlsScrollBar() = default;

int EffectControlsScrollBar::GetMaxPosition() const {
  return std::max(0, mRange - mPage);
}

void EffectControlsScrollBar::SetRange(int range, int page) {
  mRange = std::max(0, range);
  mPage = std::max(0, page);
  mPosition = std::clamp(mPosition, 0, GetMaxPosition());
  Invalidate();
}

void EffectControlsScrollBar::SetPosition(int position) {
  const int clamped = std::clamp(position, 0, GetMaxPosition());
  if (clamped != mPosition) {
    mPosition = clamped;
    Invalidate();
  }
}

void EffectControlsScrollBar::MoveTo(int position) {
  const int old = mPosition;
  SetPosition(position);
  if (mPosition != old && mCallback) {
    mCallback(mPosition);
  }
}

void EffectControlsScrollBar::ScrollBy(int delta) {
  MoveTo(mPosition + delta);
}

Rect EffectControlsScrollBar::GetThumbRect() const {
  const Rect bounds = GetLocalBounds();
  if (mRange <= mPage || mRange <= 0) {
    return {};
  }
  const int track = bounds.Height();
  const int thumb = std::max(16, static_cast<int>(static_cast<long long>(track) * mPage / mRange));
  const int travel = std::max(0, track - thumb);
  const int top =
      GetMaxPosition() > 0
          ? static_cast<int>(static_cast<long long>(travel) * mPosition / GetMaxPosition())
          : 0;
  return Rect{2, top + 1, bounds.Width() - 2, top + thumb - 1};
}

void EffectControlsScrollBar::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_ScrollBarTrack));
  const Rect thumb = GetThumbRect();
  if (!thumb.IsEmpty()) {
    dc.FillRect(thumb, ColorManager::GetColor(kColor_ScrollBarThumb));
  }
}

void EffectControlsScrollBar::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  const Rect thumb = GetThumbRect();
  if (thumb.IsEmpty()) {
    return;
  }
  if (thumb.Contains(point)) {
    mDragging = true;
    mDragOffset = point.y - thumb.top;
    CaptureMouse();
    return;
  }
  MoveTo(mPosition + (point.y < thumb.top ? -mPage : mPage));
}

void EffectControlsScrollBar::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  const Rect thumb = GetThumbRect();
  const int travel = GetLocalBounds().Height() - (thumb.Height() + 2);
  if (travel <= 0) {
    return;
  }
  const int top = point.y - mDragOffset - 1;
  MoveTo(static_cast<int>(static_cast<long long>(top) * GetMaxPosition() / travel));
}

void EffectControlsScrollBar::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (mDragging) {
    mDragging = false;
    ReleaseMouse();
  }
}
