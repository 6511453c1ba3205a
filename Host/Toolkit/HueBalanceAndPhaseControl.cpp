#include "Host/Toolkit/HueBalanceAndPhaseControl.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <numbers>
#include <vector>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

namespace {

constexpr double kToRadians = std::numbers::pi / 180.0;

double NormalizeDegrees(double degrees) {
  const double wrapped = std::fmod(degrees, 360.0);
  return wrapped < 0.0 ? wrapped + 360.0 : wrapped;
}

// The fully saturated colour of a hue.
Color HueColor(double degrees) {
  const double h = NormalizeDegrees(degrees) / 60.0;
  const double x = 1.0 - std::abs(std::fmod(h, 2.0) - 1.0);
  double r = 0, g = 0, b = 0;
  switch (static_cast<int>(h)) {
    case 0:
      r = 1, g = x;
      break;
    case 1:
      r = x, g = 1;
      break;
    case 2:
      g = 1, b = x;
      break;
    case 3:
      g = x, b = 1;
      break;
    case 4:
      r = x, b = 1;
      break;
    default:
      r = 1, b = x;
      break;
  }
  const auto byte = [](double v) { return static_cast<std::uint8_t>(std::lround(v * 255.0)); };
  return Color(byte(r), byte(g), byte(b));
}

}  // namespace

HueBalanceAndPhaseControl::HueBalanceAndPhaseControl(const Rect& bounds, std::int32_t cookie,
                                                     Commander* commander)
    : SubView(commander), mCookie(cookie) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
}

void HueBalanceAndPhaseControl::SetValue(double degrees, double magnitude) {
  if (mDragging || !std::isfinite(degrees) || !std::isfinite(magnitude)) {
    return;
  }
  degrees = NormalizeDegrees(degrees);
  magnitude = std::clamp(magnitude, 0.0, mMaxMagnitude);
  if (degrees != mDegrees || magnitude != mMagnitude) {
    mDegrees = degrees;
    mMagnitude = magnitude;
    Invalidate();
  }
}

void HueBalanceAndPhaseControl::SetMaxMagnitude(double maximum) {
  if (std::isfinite(maximum) && maximum > 0.0) {
    mMaxMagnitude = maximum;
    mMagnitude = std::min(mMagnitude, maximum);
    Invalidate();
  }
}

int HueBalanceAndPhaseControl::GetRadius() const {
  const Rect local = GetLocalBounds();
  return std::max(0, (std::min(local.Width(), local.Height()) - 1) / 2 - 2);
}

Point HueBalanceAndPhaseControl::GetCenter() const {
  const Rect local = GetLocalBounds();
  return {(local.Width() - 1) / 2, (local.Height() - 1) / 2};
}

Point HueBalanceAndPhaseControl::GetPuckPosition() const {
  const Point center = GetCenter();
  const double distance = GetRadius() * mMagnitude / mMaxMagnitude;
  const double radians = mDegrees * kToRadians;
  return {center.x + static_cast<int>(std::lround(std::cos(radians) * distance)),
          center.y - static_cast<int>(std::lround(std::sin(radians) * distance))};
}

void HueBalanceAndPhaseControl::FollowPointer(Point point) {
  const int radius = GetRadius();
  if (radius <= 0) {
    return;
  }
  const Point center = GetCenter();
  const double dx = point.x - center.x;
  const double dy = center.y - point.y;
  const double distance = std::hypot(dx, dy);
  double degrees = mDegrees;
  double magnitude = mMagnitude;
  if (mGesture != Gesture::kMagnitude && distance > 0.0) {
    degrees = NormalizeDegrees(std::atan2(dy, dx) / kToRadians);
  }
  if (mGesture != Gesture::kPhase) {
    magnitude = std::clamp(distance / radius * mMaxMagnitude, 0.0, mMaxMagnitude);
  }
  if (degrees != mDegrees || magnitude != mMagnitude) {
    mDegrees = degrees;
    mMagnitude = magnitude;
    mMoved = true;
    Invalidate();
    Report(mGesture, false);
  }
}

void HueBalanceAndPhaseControl::Report(Gesture gesture, bool finished) const {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const HueBalanceAndPhaseValue value{mDegrees, mMagnitude, mCookie};
  switch (gesture) {
    case Gesture::kPhase:
      finished ? mStation.Broadcast(HueBalanceAndPhasePhaseChangedMessage(value))
               : mStation.Broadcast(HueBalanceAndPhasePhaseChangingMessage(value));
      break;
    case Gesture::kMagnitude:
      finished ? mStation.Broadcast(HueBalanceAndPhaseMagnitudeGainChangedMessage(value))
               : mStation.Broadcast(HueBalanceAndPhaseMagnitudeGainChangingMessage(value));
      break;
    case Gesture::kAngleAndMagnitude:
      finished ? mStation.Broadcast(HueBalanceAndPhaseAngleAndMagnitudeChangedMessage(value))
               : mStation.Broadcast(HueBalanceAndPhaseAngleAndMagnitudeChangingMessage(value));
      break;
  }
}

void HueBalanceAndPhaseControl::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (!IsEnabledInTree() || GetRadius() <= 0) {
    return;
  }
  mGesture = IsCtrlDown(modifiers)    ? Gesture::kPhase
             : IsShiftDown(modifiers) ? Gesture::kMagnitude
                                      : Gesture::kAngleAndMagnitude;
  mDragging = true;
  mMoved = false;
  CaptureMouse();
  FollowPointer(point);
}

void HueBalanceAndPhaseControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDragging) {
    FollowPointer(point);
  }
}

void HueBalanceAndPhaseControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  mDragging = false;
  ReleaseMouse();
  if (mMoved) {
    mMoved = false;
    Report(mGesture, true);
  }
}

bool HueBalanceAndPhaseControl::KeyDownSelf(const KeyEvent& event) {
  if (mDragging) {
    return SubView::KeyDownSelf(event);
  }
  const double step = IsShiftDown(event.modifiers) ? 10.0 : 1.0;
  Gesture gesture = Gesture::kPhase;
  double degrees = mDegrees;
  double magnitude = mMagnitude;
  switch (event.key) {
    case KeyCode::kLeft:
      degrees += step;
      break;
    case KeyCode::kRight:
      degrees -= step;
      break;
    case KeyCode::kUp:
      magnitude += step, gesture = Gesture::kMagnitude;
      break;
    case KeyCode::kDown:
      magnitude -= step, gesture = Gesture::kMagnitude;
      break;
    default:
      return SubView::KeyDownSelf(event);
  }
  degrees = NormalizeDegrees(degrees);
  magnitude = std::clamp(magnitude, 0.0, mMaxMagnitude);
  if (degrees != mDegrees || magnitude != mMagnitude) {
    mDegrees = degrees;
    mMagnitude = magnitude;
    Invalidate();
    Report(gesture, true);
  }
  return true;
}

void HueBalanceAndPhaseControl::HideSelf() {
  mDragging = false;
  mMoved = false;
}

void HueBalanceAndPhaseControl::PaintSelf(DC& dc) {
  const int radius = GetRadius();
  if (radius <= 0) {
    return;
  }
  const Point center = GetCenter();
  constexpr int kWedges = 72;
  for (int i = 0; i < kWedges; ++i) {
    const double from = 360.0 * i / kWedges;
    const double to = 360.0 * (i + 1) / kWedges;
    const auto rim = [&](double degrees) {
      return Point{
          center.x + static_cast<int>(std::lround(std::cos(degrees * kToRadians) * radius)),
          center.y - static_cast<int>(std::lround(std::sin(degrees * kToRadians) * radius))};
    };
    const std::vector<Point> wedge{center, rim(from), rim(to)};
    dc.FillPolygon(wedge, HueColor((from + to) / 2.0));
  }
  // Towards the centre the colours fade to grey, as a balance of zero has no hue.
  const Color grey = ColorManager::GetColor(kColor_EditBackground);
  dc.DrawCircleFill(center, radius * 2 / 3, grey.WithAlpha(200));
  dc.DrawCircleFill(center, radius / 3, grey);
  dc.DrawCircle(center, radius, ColorManager::GetColor(kColor_ControlBorder));
  const Point puck = GetPuckPosition();
  const Color hand =
      ColorManager::GetColor(IsEnabledInTree() ? kColor_HotText : kColor_ControlTextDisabled);
  const Point hands[2] = {center, puck};
  dc.Polyline(hands, hand, 1.0);
  dc.DrawCircle(puck, 4, hand, 1.5);
}
