#pragma once

#include <cstdint>

#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// A dial for an angle in degrees, clockwise from straight up; the value keeps whole turns
// (370 is one revolution and 10 degrees, -90 a quarter turn anticlockwise). Dragging around the
// centre turns the dial: the value follows the pointer's angle continuously, so circling twice
// adds 720. Shift snaps to multiples of 45 degrees. Every new value is reported with
// AngleControlChangingMessage, the release with AngleControlChangedMessage (with the cookie).
// While focused, Left and Right turn by one degree (Shift: ten) as one finished change.
// SetValue sends nothing.
class AngleControl : public SubView {
 public:
  static constexpr double kSnapDegrees = 45.0;
  // Presses closer than this to the centre wait for the pointer to move out before turning.
  static constexpr int kDeadRadius = 3;

  AngleControl(const Rect& bounds, std::int32_t cookie = 0, double degrees = 0.0,
               Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }
  std::int32_t GetOwnerCookie() const { return mCookie; }

  // Non-finite values are refused with a debug assertion. Sends nothing.
  void SetValue(double degrees, bool redraw = true);
  double GetValue() const { return mDegrees; }
  // Whole turns (towards zero) and the rest: 370 gives 1 and 10, -370 gives -1 and -10.
  int GetRevolutions() const;
  double GetDegreesWithinRevolution() const;

  bool IsDragging() const { return mDragging; }

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  // The pointer's angle around the centre, degrees clockwise from up; false in the dead zone.
  bool PointerAngle(Point point, double& degrees) const;
  void Report(bool finished) const;

  ControlStation mStation{"AngleControl"};
  std::int32_t mCookie;
  double mDegrees = 0.0;
  bool mDragging = false;
  bool mHaveAngle = false;
  bool mSentChanging = false;
  double mLastPointerAngle = 0.0;
  double mUnsnapped = 0.0;  // the value the pointer gives before snapping
};
