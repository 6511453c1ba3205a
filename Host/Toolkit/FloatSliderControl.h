#pragma once

#include <cstdint>

#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// A horizontal slider: a track with a thumb between a minimum (left) and a maximum (right).
// Pressing the thumb drags it; pressing the track moves the thumb there first. Every new value
// during the drag is reported with FloatSliderControlChangingMessage, the release with
// FloatSliderControlChangedMessage; Ctrl held drags ten times finer. A double click reports
// FloatSliderControlDoubleClickedMessage with the value (owners reset to a default). While
// focused, Left and Right step by a hundredth of the range (Shift: a tenth) as one finished
// change. Messages carry the owner cookie. SetValue sends nothing. The slider takes no focus on
// click unless told to.
//
// Exponential sliders place the thumb at position p in [0, 1] for value
// min + (max - min) x p^exponent.
class FloatSliderControl : public SubView {
 public:
  static constexpr int kThumbWidth = 9;
  static constexpr int kTrackHeight = 3;
  static constexpr double kFineFactor = 0.1;

  FloatSliderControl(const Rect& bounds, float minimum = 0.0f, float maximum = 100.0f,
                     float value = 0.0f, Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }
  std::int32_t GetOwnerCookie() const { return mCookie; }

  // Clamped to the range; NaN is refused with a debug assertion. Sends nothing.
  void SetValue(float value, bool redraw = true);
  float GetValue() const { return mValue; }
  // The value is clamped into the new range; with minimum > maximum the minimum wins.
  void SetMinValue(float minimum);
  void SetMaxValue(float maximum);
  float GetMinValue() const { return mMin; }
  float GetMaxValue() const { return mMax; }
  void SetExponential(bool exponential, double exponent);
  bool IsExponential() const { return mExponential; }

  bool IsDragging() const { return mDragging; }
  // The track runs from TrackLeft() to TrackRight() (the thumb's centre at the ends).
  int TrackLeft() const;
  int TrackRight() const;
  // Local x of the thumb's centre for `value`, and the value at a thumb centre `x`.
  int XForValue(float value) const;
  float ValueAtX(double x) const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  double PositionOf(float value) const;
  float ValueAtPosition(double position) const;
  float Clamp(float value) const;
  bool ApplyUserValue(float value);

  ControlStation mStation{"FloatSliderControl"};
  std::int32_t mCookie = 0;
  float mMin;
  float mMax;
  float mValue = 0.0f;
  bool mExponential = false;
  double mExponent = 1.0;
  bool mDragging = false;
  bool mSentChanging = false;
  double mThumbX = 0.0;  // where the drag puts the thumb's centre (fractional with Ctrl)
  int mLastX = 0;
};
