#pragma once

#include <cstdint>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// The wheel's values as its messages carry them: the hue angle in degrees (anticlockwise from
// red at the right) and the balance magnitude (0 at the centre, the maximum at the rim).
struct HueBalanceAndPhaseValue {
  double degrees = 0.0;
  double magnitude = 0.0;
  std::int32_t cookie = 0;
};

#define EC_HUE_BALANCE_MESSAGE(Name)                                         \
  struct Name : MessageOf<Name>, HueBalanceAndPhaseValue {                   \
    static constexpr std::string_view kTypeName = #Name;                     \
    explicit Name(HueBalanceAndPhaseValue v) : HueBalanceAndPhaseValue(v) {} \
  };
// Only the angle changed (Ctrl drag, Left and Right keys).
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhasePhaseChangingMessage)
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhasePhaseChangedMessage)
// Only the magnitude changed (Shift drag, Up and Down keys).
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhaseMagnitudeGainChangingMessage)
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhaseMagnitudeGainChangedMessage)
// Both follow the pointer (a plain drag).
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhaseAngleAndMagnitudeChangingMessage)
EC_HUE_BALANCE_MESSAGE(HueBalanceAndPhaseAngleAndMagnitudeChangedMessage)
#undef EC_HUE_BALANCE_MESSAGE

// A colour wheel that sets a hue angle and a balance magnitude: the puck sits at the angle, as
// far from the centre as the magnitude is of the maximum. Pressing and dragging in the wheel
// moves the puck (both values); with Ctrl only the angle follows, with Shift only the magnitude.
// Every step is reported with the changing message of its kind, the release with the changed
// one. While focused, Left and Right turn the angle by one degree, Up and Down change the
// magnitude by one (Shift: ten), each a finished change. Magnitudes are clamped to 0..maximum;
// angles are kept in [0, 360). SetValue sends nothing. UI thread only.
class HueBalanceAndPhaseControl : public SubView {
 public:
  enum class Gesture { kAngleAndMagnitude, kPhase, kMagnitude };

  HueBalanceAndPhaseControl(const Rect& bounds, std::int32_t cookie = 0,
                            Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }
  std::int32_t GetOwnerCookie() const { return mCookie; }

  // Non-finite values are ignored. Sends nothing; ignored while a drag is under way.
  void SetValue(double degrees, double magnitude);
  void SetMaxMagnitude(double maximum);
  double GetAngle() const { return mDegrees; }
  double GetMagnitude() const { return mMagnitude; }
  double GetMaxMagnitude() const { return mMaxMagnitude; }
  bool IsDragging() const { return mDragging; }

  // The wheel's radius and centre, local coordinates (radius 0 when too small to draw).
  int GetRadius() const;
  Point GetCenter() const;
  // Where the puck is drawn for the current values, local coordinates.
  Point GetPuckPosition() const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  void FollowPointer(Point point);
  void Report(Gesture gesture, bool finished) const;

  ControlStation mStation{"HueBalanceAndPhaseControl"};
  std::int32_t mCookie;
  double mDegrees = 0.0;
  double mMagnitude = 0.0;
  double mMaxMagnitude = 100.0;
  Gesture mGesture = Gesture::kAngleAndMagnitude;
  bool mDragging = false;
  bool mMoved = false;
};
