#pragma once

#include <functional>

#include "Host/Toolkit/SubView.h"

// The panel's vertical scroll bar beside the keyframe area: a track with a thumb sized by the
// page. Dragging the thumb or clicking the track reports the new position through the callback
// (positions in content pixels, [0, range - page]). Setting values never calls back.
// UI thread only.
class EffectControlsScrollBar : public SubView {
 public:
  using PositionCallback = std::function<void(int position)>;

  static constexpr int kWidth = 12;

  EffectControlsScrollBar();
  ~EffectControlsScrollBar() override;

  // `range`: the content height; `page`: the visible height. The position is kept within.
  void SetRange(int range, int page);
  void SetPosition(int position);
  int GetPosition() const { return mPosition; }
  int GetRange() const { return mRange; }
  int GetPage() const { return mPage; }
  int GetMaxPosition() const;
  void SetStep(int step) { mStep = step; }
  int GetStep() const { return mStep; }
  void SetPositionCallback(PositionCallback callback) { mCallback = std::move(callback); }
  // Moves by `delta` pixels and reports the change (wheel, gestures).
  void ScrollBy(int delta);

  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;

 private:
  Rect GetThumbRect() const;
  void MoveTo(int position);

  int mRange = 0;
  int mPage = 0;
  int mPosition = 0;
  int mStep = 20;
  bool mDragging = false;
  int mDragOffset = 0;
  PositionCallback mCallback;
};
