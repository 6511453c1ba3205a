#include "Host/Toolkit/FloatSliderControl.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"

FloatSliderControl::FloatSliderControl(const Rect& bounds, float minimum, float maximum,
                                       float value, Commander* commander)
    : SubView(commander), mMin(minimum), mMax(maximum) {
  SetBounds(bounds);
  SetValue(value, false);
}

float FloatSliderControl::Clamp(float value) const {
  return std::max(mMin, std::min(value, mMax));
}

void FloatSliderControl::SetValue(float value, bool redraw) {
  if (!HOST_VERIFY(!std::isnan(value), "Invalid value")) {
    return;
  }
  const float clamped = Clamp(value);
  if (clamped != mValue) {
    mValue = clamped;
    if (redraw) {
      Invalidate();
    }
  }
}

void FloatSliderControl::SetMinValue(float minimum) {
  if (HOST_VERIFY(!std::isnan(minimum), "Invalid minimum")) {
    mMin = minimum;
    SetValue(mValue);
    Invalidate();
  }
}

void FloatSliderControl::SetMaxValue(float maximum) {
  if (HOST_VERIFY(!std::isnan(maximum), "Invalid maximum")) {
    mMax = maximum;
    SetValue(mValue);
    Invalidate();
  }
}

void FloatSliderControl::SetExponential(bool exponential, double exponent) {
  if (!exponential) {
    mExponential = false;
  } else if (HOST_VERIFY(exponent > 0.0 && std::isfinite(exponent), "Invalid exponent")) {
    mExponential = true;
    mExponent = exponent;
  }
  Invalidate();
}

int FloatSliderControl::TrackLeft() const {
  return kThumbWidth / 2;
}

int FloatSliderControl::TrackRight() const {
  return std::max(TrackLeft(), GetBounds().Width() - 1 - kThumbWidth / 2);
}

double FloatSliderControl::PositionOf(float value) const {
  const double range = static_cast<double>(mMax) - mMin;
  if (!(range > 0.0)) {
    return 0.0;
  }
  const double linear = std::clamp((static_cast<double>(value) - mMin) / range, 0.0, 1.0);
  return mExponential ? std::pow(linear, 1.0 / mExponent) : linear;
}

float FloatSliderControl::ValueAtPosition(double position) const {
  const double p = std::clamp(position, 0.0, 1.0);
  const double linear = mExponential ? std::pow(p, mExponent) : p;
  return Clamp(static_cast<float>(mMin + (static_cast<double>(mMax) - mMin) * linear));
}

int FloatSliderControl::XForValue(float value) const {
  return TrackLeft() +
         static_cast<int>(std::lround(PositionOf(value) * (TrackRight() - TrackLeft())));
}

float FloatSliderControl::ValueAtX(double x) const {
  const int span = TrackRight() - TrackLeft();
  return span > 0 ? ValueAtPosition((x - TrackLeft()) / span) : mMin;
}

bool FloatSliderControl::ApplyUserValue(float value) {
  const float clamped = Clamp(value);
  if (clamped == mValue) {
    return false;
  }
  mValue = clamped;
  Invalidate();
  return true;
}

void FloatSliderControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  mDragging = true;
  mSentChanging = false;
  mLastX = point.x;
  const int thumb = XForValue(mValue);
  CaptureMouse();
  if (std::abs(point.x - thumb) <= kThumbWidth / 2) {
    mThumbX = thumb;  // grabbed: the thumb moves with the pointer from where it is
    return;
  }
  mThumbX = point.x;
  if (ApplyUserValue(ValueAtX(mThumbX))) {
    mSentChanging = true;
    mStation.Broadcast(FloatSliderControlChangingMessage(mValue, mCookie));
  }
}

void FloatSliderControl::LeftButtonMultiClickSelf(Point /*point*/, KeyModifiers /*modifiers*/,
                                                  int /*clickCount*/) {
  mStation.Broadcast(FloatSliderControlDoubleClickedMessage(mValue, mCookie));
}

void FloatSliderControl::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  if (!mDragging) {
    return;
  }
  mThumbX += (point.x - mLastX) * (IsCtrlDown(modifiers) ? kFineFactor : 1.0);
  mLastX = point.x;
  mThumbX =
      std::clamp(mThumbX, static_cast<double>(TrackLeft()), static_cast<double>(TrackRight()));
  if (ApplyUserValue(ValueAtX(mThumbX))) {
    mSentChanging = true;
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    mStation.Broadcast(FloatSliderControlChangingMessage(mValue, mCookie));
  }
}

void FloatSliderControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  mDragging = false;
  ReleaseMouse();
  if (mSentChanging) {
    mSentChanging = false;
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    mStation.Broadcast(FloatSliderControlChangedMessage(mValue, mCookie));
  }
}

bool FloatSliderControl::KeyDownSelf(const KeyEvent& event) {
  if (event.key != KeyCode::kLeft && event.key != KeyCode::kRight) {
    return SubView::KeyDownSelf(event);
  }
  const double step =
      (static_cast<double>(mMax) - mMin) / (IsShiftDown(event.modifiers) ? 10 : 100);
  const double direction = event.key == KeyCode::kRight ? 1.0 : -1.0;
  if (ApplyUserValue(static_cast<float>(mValue + direction * step))) {
    const std::shared_ptr<const void> alive = KeepAliveForDispatch();
    mStation.Broadcast(FloatSliderControlChangedMessage(mValue, mCookie));
  }
  return true;
}

void FloatSliderControl::HideSelf() {
  mDragging = false;
  mSentChanging = false;
}

void FloatSliderControl::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const bool enabled = IsEnabledInTree();
  const int middle = bounds.Height() / 2;
  const int left = TrackLeft();
  const int right = TrackRight() + 1;
  const int thumb = XForValue(mValue);
  const Rect track{left, middle - kTrackHeight / 2, right,
                   middle - kTrackHeight / 2 + kTrackHeight};
  dc.FillRect(track, ColorManager::GetColor(kColor_SliderTrack));
  if (enabled) {
    dc.FillRect(Rect{left, track.top, thumb, track.bottom},
                ColorManager::GetColor(kColor_SliderFill));
  }
  // The thumb: a small upward-pointing pentagon under and over the track.
  const int half = kThumbWidth / 2;
  const int top = std::max(0, middle - 6);
  const int bottom = std::min(bounds.Height() - 1, middle + 6);
  const std::array<Point, 5> shape{Point{thumb, top}, Point{thumb + half, top + half},
                                   Point{thumb + half, bottom}, Point{thumb - half, bottom},
                                   Point{thumb - half, top + half}};
  const Color thumbColor = ColorManager::GetColor(
      !enabled ? kColor_ControlTextDisabled
               : (mDragging ? kColor_InteractiveControlHover : kColor_InteractiveControl));
  dc.FillPolygon(shape, thumbColor);
}
