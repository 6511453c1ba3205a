#pragma once

#include "Host/Time/TickTime.h"
#include "Host/Toolkit/SubView.h"

class TimeBarControl;

// The bar above a time ruler that shows which part of the whole time range is visible: its
// width is the ruler's time range and its thumb the ruler's zoom range. Dragging an end of the
// thumb zooms (the other end stays; ZoomInOutTimeChangingMessage on moves,
// ZoomInOutTimeChangedMessage at the release), dragging its middle slides the view
// (SlideZoomMessage), a press beside the thumb centres the view there (SlideZoomMessage) and a
// double click shows the whole range (ZoomInOutTimeChangedMessage). The ruler's zoom is set
// first and the messages go out on the ruler's station, so listeners read the new range from
// the ruler or the message. Zooming in stops at the ruler's minimum span. Without a ruler the
// bar is empty and inert. UI thread only.
class ZoomBar : public SubView {
 public:
  static constexpr int kDefaultHeight = 10;
  // Pixels at each end of the thumb that grab that end.
  static constexpr int kHandleWidth = 5;
  static constexpr int kMinThumbWidth = 2 * kHandleWidth + 2;

  explicit ZoomBar(const Rect& bounds, Commander* commander = nullptr);
  ~ZoomBar() override;

  // Attaches to `timeBar` (not owned; null detaches). A ruler that is destroyed first detaches
  // itself; one bar per ruler (attaching takes the ruler from another bar).
  void AttachTo(TimeBarControl* timeBar);
  TimeBarControl* GetTimeBar() const { return mTimeBar; }

  // The thumb (local coordinates); empty without a ruler.
  Rect GetThumbRect() const;
  int TimeToPixel(TickTime time) const;
  TickTime PixelToTime(int x) const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;
  void HideSelf() override;
  void DestroySelf() override;
  void PaintSelf(DC& dc) override;

 private:
  friend class TimeBarControl;
  enum class Drag { kNone, kStart, kEnd, kMiddle };

  Drag HitTest(Point point) const;

  TimeBarControl* mTimeBar = nullptr;  // not owned; cleared by the ruler's destructor
  Drag mDrag = Drag::kNone;
  bool mDragChanged = false;
  int mPressX = 0;
  TickTime mStartIn = kTime_Zero;
  TickTime mStartOut = kTime_Zero;
};
