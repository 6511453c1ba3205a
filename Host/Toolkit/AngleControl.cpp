#include "Host/Toolkit/AngleControl.h"

#include <algorithm>
#include <cmath>
#include <numbers>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"

AngleControl::AngleControl(const Rect& bounds, std::int32_t cookie, double degrees,
                           Commander* commander)
    : SubView(commander), mCookie(cookie) {
  SetBounds(bounds);
  SetValue(degrees, false);
}

void AngleControl::SetValue(double degrees, bool redraw) {
  if (!HOST_VERIFY(std::isfinite(degrees), "Invalid angle")) {
    return;
  }
  if (degrees != mDegrees) {
    mDegrees = degrees;
    if (redraw) {
      Invalidate();
    }
  }
}

int AngleControl::GetRevolutions() const {
  return static_cast<int>(std::trunc(mDegrees / 360.0));
}

double AngleControl::GetDegreesWithinRevolution() const {
  return std::fmod(mDegrees, 360.0);
}

bool AngleControl::PointerAngle(Point point, double& degrees) const {
  const Rect bounds = GetLocalBounds();
  const double cx = (bounds.Width() - 1) / 2.0;
  const double cy = (bounds.Height() - 1) / 2.0;
  const double dx = point.x - cx;
  const double dy = point.y - cy;
  if (std::hypot(dx, dy) < kDeadRadius) {
    return false;
  }
  // Screen y grows downwards: up is -y, clockwise is +x.
  degrees = std::atan2(dx, -dy) * 180.0 / std::numbers::pi;
  return true;
}

void AngleControl::Report(bool finished) const {
  if (finished) {
    mStation.Broadcast(AngleControlChangedMessage(mDegrees, mCookie));
  } else {
    mStation.Broadcast(AngleControlChangingMessage(mDegrees, mCookie));
  }
}

void AngleControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  mDragging = true;
  mSentChanging = false;
  mUnsnapped = mDegrees;
  mHaveAngle = PointerAngle(point, mLastPointerAngle);
  CaptureMouse();
  Invalidate();
}

void AngleControl::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  if (!mDragging) {
    return;
  }
  double angle = 0.0;
  if (!PointerAngle(point, angle)) {
    return;
  }
  if (!mHaveAngle) {
    mHaveAngle = true;
    mLastPointerAngle = angle;
    return;
  }
  // The shortest way round from the last angle: crossing "up" keeps counting turns.
  double delta = std::remainder(angle - mLastPointerAngle, 360.0);
  mLastPointerAngle = angle;
  mUnsnapped += delta;
  double value = mUnsnapped;
  if (IsShiftDown(modifiers)) {
    value = std::round(value / kSnapDegrees) * kSnapDegrees;
  }
  if (value != mDegrees) {
    mDegrees = value;
    mSentChanging = true;
    Invalidate();
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    Report(false);
  }
}

void AngleControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  mDragging = false;
  ReleaseMouse();
  Invalidate();
  if (mSentChanging) {
    mSentChanging = false;
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    Report(true);
  }
}

bool AngleControl::KeyDownSelf(const KeyEvent& event) {
  if (event.key != KeyCode::kLeft && event.key != KeyCode::kRight) {
    return SubView::KeyDownSelf(event);
  }
  const double step = IsShiftDown(event.modifiers) ? 10.0 : 1.0;
  mDegrees += event.key == KeyCode::kRight ? step : -step;
  Invalidate();
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  Report(true);
  return true;
}

void AngleControl::HideSelf() {
  mDragging = false;
  mSentChanging = false;
}

void AngleControl::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const int size = std::min(bounds.Width(), bounds.Height());
  const int radius = std::max(1, (size - 2) / 2);
  const Point center{(bounds.Width() - 1) / 2, (bounds.Height() - 1) / 2};
  const bool enabled = IsEnabledInTree();
  dc.DrawCircleFill(center, radius, ColorManager::GetColor(kColor_EditBackground));
  dc.DrawCircle(center, radius,
                ColorManager::GetColor(mDragging ? kColor_Focus : kColor_ControlBorder));
  const double radians = mDegrees * std::numbers::pi / 180.0;
  const Point tip{center.x + static_cast<int>(std::lround(std::sin(radians) * (radius - 1))),
                  center.y - static_cast<int>(std::lround(std::cos(radians) * (radius - 1)))};
  const Color hand = ColorManager::GetColor(enabled ? kColor_HotText : kColor_ControlTextDisabled);
  const Point hands[2] = {center, tip};
  dc.Polyline(hands, hand, 1.5);
  dc.DrawCircleFill(center, 1, hand);
}
