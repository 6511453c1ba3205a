#pragma once

#include <cstdint>

#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// A vertical or horizontal scroll bar over content [minimum, maximum) of which a page is
// visible: the position (the first visible unit) runs from the minimum to
// max(minimum, maximum - page). Arrows at both ends step by the step size, the track before or
// after the thumb pages, the thumb drags; holding an arrow or the track repeats (RepeatTimer).
// Each change of position is reported on the bar's station with ScrollVerticalMessage or
// ScrollHorizontalMessage (code, the new position, the modifiers); a gesture ends with
// kEndScroll. Setting the position or the range from code sends nothing; ScrollBy is the
// programmatic scroll that reports. While all the content fits, the bar is inert.
class ScrollBar : public SubView {
 public:
  enum class Orientation { kVertical, kHorizontal };

  // The toolkit's scroll bar thickness, in pixels.
  static constexpr int kDefaultSize = 14;
  static constexpr int kMinThumbLength = 12;
  static constexpr int kRepeatDelayMilliseconds = 300;
  static constexpr int kRepeatIntervalMilliseconds = 50;

  static int GetDefaultScrollBarSize() { return kDefaultSize; }

  ScrollBar(const Rect& bounds, Orientation orientation, Commander* commander = nullptr);
  ~ScrollBar() override;

  const StationName& GetStation() const { return mStation.GetName(); }
  Orientation GetOrientation() const { return mOrientation; }

  // maximum < minimum counts as an empty range at the minimum; a negative page as 0. The
  // position is kept inside the new limits.
  void SetScrollInfo(int minimum, int maximum, int page, int position);
  void SetRange(int minimum, int maximum);
  void SetPageSize(int page);
  // At least 1.
  void SetStep(int step);
  // Clamped to [minimum, GetMaxPosition()]. Sends nothing.
  void SetPosition(int position);

  int GetMinimum() const { return mMin; }
  int GetMaximum() const { return mMax; }
  int GetPageSize() const { return mPage; }
  int GetStep() const { return mStep; }
  int GetPosition() const { return mPosition; }
  int GetMaxPosition() const;
  // Some content lies outside the page.
  bool CanScroll() const { return GetMaxPosition() > mMin; }

  // Moves by `delta` (clamped) and reports kThumbPosition when the position changed. Returns
  // how far it actually moved.
  int ScrollBy(int delta, KeyModifiers modifiers = kKeyModifierNone);

  // Parts, local coordinates.
  Rect GetDecrementArrowRect() const;
  Rect GetIncrementArrowRect() const;
  Rect GetThumbRect() const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool MouseWheelSelf(const WheelEvent& event) override;
  void HideSelf() override;
  void DestroySelf() override;
  void PaintSelf(DC& dc) override;

 private:
  enum class Part { kNone, kDecrementArrow, kIncrementArrow, kPageBefore, kPageAfter, kThumb };

  int Along(Point point) const;  // the coordinate along the bar
  int Length() const;            // the bar's length along its axis
  int Thickness() const;
  int ArrowLength() const;
  int TrackStart() const;
  int TrackEnd() const;
  int ThumbLength() const;
  int ThumbStart() const;
  Part HitPart(Point point) const;
  // Moves to `position` and reports it with `code`; true when it moved.
  bool MoveTo(int position, ScrollCode code, KeyModifiers modifiers);
  // One step of the part being held (arrow or page); false once it can go no further.
  bool StepHeldPart();
  void StartRepeat();
  void StopRepeat();
  void Report(ScrollCode code, KeyModifiers modifiers) const;

  ControlStation mStation{"ScrollBar"};
  Orientation mOrientation;
  int mMin = 0;
  int mMax = 0;
  int mPage = 0;
  int mStep = 1;
  int mPosition = 0;

  Part mHeld = Part::kNone;
  bool mPointerOverHeld = false;
  Point mLastPoint;
  KeyModifiers mHeldModifiers = kKeyModifierNone;
  int mThumbGrab = 0;  // the pointer's offset into the thumb at the press
  bool mMovedThumb = false;
  std::uint64_t mRepeatTimer = 0;
};
