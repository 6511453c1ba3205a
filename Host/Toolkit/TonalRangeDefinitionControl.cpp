#include "Host/Toolkit/TonalRangeDefinitionControl.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/RangeBarScale.h"

namespace {

double Finite(double value, double fallback) {
  return std::isfinite(value) ? value : fallback;
}

}  // namespace

TonalRangeDefinitionControl::TonalRangeDefinitionControl(const Rect& bounds, double minimum,
                                                         double maximum, Commander* commander)
    : SubView(commander), mMinimum(minimum), mMaximum(std::max(minimum, maximum)) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
  mValues = Ordered({minimum, 0.0, mMaximum, 0.0});
}

TonalRangeDefinitionValues TonalRangeDefinitionControl::Ordered(
    TonalRangeDefinitionValues v) const {
  v.shadowThreshold = std::clamp(Finite(v.shadowThreshold, mMinimum), mMinimum, mMaximum);
  v.highlightThreshold =
      std::clamp(Finite(v.highlightThreshold, mMaximum), v.shadowThreshold, mMaximum);
  v.shadowSoftness = std::clamp(Finite(v.shadowSoftness, 0.0), 0.0, mMaximum - v.shadowThreshold);
  v.highlightSoftness =
      std::clamp(Finite(v.highlightSoftness, 0.0), 0.0, v.highlightThreshold - mMinimum);
  v.cookie = mCookie;
  return v;
}

void TonalRangeDefinitionControl::SetValues(const TonalRangeDefinitionValues& values) {
  if (mDragged) {
    return;
  }
  const TonalRangeDefinitionValues v = Ordered(values);
  if (v.shadowThreshold != mValues.shadowThreshold || v.shadowSoftness != mValues.shadowSoftness ||
      v.highlightThreshold != mValues.highlightThreshold ||
      v.highlightSoftness != mValues.highlightSoftness) {
    mValues = v;
    Invalidate();
  }
}

TonalRangeDefinitionValues TonalRangeDefinitionControl::GetValues() const {
  TonalRangeDefinitionValues values = mValues;
  values.cookie = mCookie;
  return values;
}

int TonalRangeDefinitionControl::ValueToLocal(double value) const {
  return RangeBarScale{mMinimum, mMaximum, GetLocalBounds().Width()}.ValueToX(value);
}

double TonalRangeDefinitionControl::LocalToValue(int x) const {
  return RangeBarScale{mMinimum, mMaximum, GetLocalBounds().Width()}.XToValue(x);
}

int TonalRangeDefinitionControl::HandleToLocal(Handle handle) const {
  const TonalRangeDefinitionValues& v = mValues;
  switch (handle) {
    case Handle::kShadowThreshold:
      return ValueToLocal(v.shadowThreshold);
    case Handle::kShadowSoftness:
      return ValueToLocal(v.shadowThreshold + v.shadowSoftness);
    case Handle::kHighlightThreshold:
      return ValueToLocal(v.highlightThreshold);
    case Handle::kHighlightSoftness:
      return ValueToLocal(v.highlightThreshold - v.highlightSoftness);
    case Handle::kThresholds:
      return (ValueToLocal(v.shadowThreshold) + ValueToLocal(v.highlightThreshold)) / 2;
  }
  return 0;
}

std::optional<TonalRangeDefinitionControl::Handle> TonalRangeDefinitionControl::HitHandle(
    Point point) const {
  if (point.y >= kBarHeight) {
    // Thresholds first: on a tie they win over their softness.
    const Handle order[] = {Handle::kShadowThreshold, Handle::kHighlightThreshold,
                            Handle::kShadowSoftness, Handle::kHighlightSoftness};
    std::optional<Handle> best;
    int bestDistance = kHandleHitRadius + 1;
    for (const Handle handle : order) {
      const int distance = std::abs(HandleToLocal(handle) - point.x);
      if (distance < bestDistance) {
        best = handle;
        bestDistance = distance;
      }
    }
    return best;
  }
  if (point.x >= ValueToLocal(mValues.shadowThreshold) &&
      point.x <= ValueToLocal(mValues.highlightThreshold)) {
    return Handle::kThresholds;
  }
  return std::nullopt;
}

TonalRangeDefinitionValues TonalRangeDefinitionControl::Dragged(double delta, bool keepEdge) const {
  TonalRangeDefinitionValues v = mGrabValues;
  const double shadowEdge = v.shadowThreshold + v.shadowSoftness;
  const double highlightEdge = v.highlightThreshold - v.highlightSoftness;
  switch (*mDragged) {
    case Handle::kShadowThreshold:
      v.shadowThreshold = std::clamp(v.shadowThreshold + delta, mMinimum, mMaximum);
      v.highlightThreshold = std::max(v.highlightThreshold, v.shadowThreshold);
      if (keepEdge) {
        v.shadowSoftness = std::max(0.0, shadowEdge - v.shadowThreshold);
      }
      break;
    case Handle::kShadowSoftness:
      v.shadowSoftness = v.shadowSoftness + delta;
      break;
    case Handle::kHighlightThreshold:
      v.highlightThreshold = std::clamp(v.highlightThreshold + delta, mMinimum, mMaximum);
      v.shadowThreshold = std::min(v.shadowThreshold, v.highlightThreshold);
      if (keepEdge) {
        v.highlightSoftness = std::max(0.0, v.highlightThreshold - highlightEdge);
      }
      break;
    case Handle::kHighlightSoftness:
      v.highlightSoftness = v.highlightSoftness - delta;
      break;
    case Handle::kThresholds: {
      const double shift =
          std::clamp(delta, mMinimum - v.shadowThreshold, mMaximum - v.highlightThreshold);
      v.shadowThreshold += shift;
      v.highlightThreshold += shift;
      break;
    }
  }
  return Ordered(v);
}

void TonalRangeDefinitionControl::Report(bool finished) const {
  if (!mDragged) {
    return;
  }
  const TonalRangeDefinitionValues v = GetValues();
  const TonalRangeDefinitionValues& g = mGrabValues;
  const bool st = v.shadowThreshold != g.shadowThreshold;
  const bool ss = v.shadowSoftness != g.shadowSoftness;
  const bool ht = v.highlightThreshold != g.highlightThreshold;
  const bool hs = v.highlightSoftness != g.highlightSoftness;
  const bool shadowLed = *mDragged == Handle::kShadowThreshold ||
                         *mDragged == Handle::kShadowSoftness || *mDragged == Handle::kThresholds;
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
#define EC_TONAL_SEND(What)                                                            \
  (finished ? mStation.Broadcast(TonalRangeDefinitionControl##What##ChangedMessage(v)) \
            : mStation.Broadcast(TonalRangeDefinitionControl##What##ChangingMessage(v)))
  if (st && ht && ss) {
    EC_TONAL_SEND(ShadowAndHighlightThresholdAndShadowSoftness);
  } else if (st && ht && hs) {
    EC_TONAL_SEND(ShadowAndHighlightThresholdAndHighlightSoftness);
  } else if (st && ht) {
    if (shadowLed) {
      EC_TONAL_SEND(ShadowAndHighlightThreshold);
    } else {
      EC_TONAL_SEND(HighlightAndShadowThreshold);
    }
  } else if (st && ss) {
    EC_TONAL_SEND(ShadowThresholdAndSoftness);
  } else if (ht && hs) {
    EC_TONAL_SEND(HighlightThresholdAndSoftness);
  } else if (st) {
    EC_TONAL_SEND(ShadowThreshold);
  } else if (ss) {
    EC_TONAL_SEND(ShadowSoftness);
  } else if (ht) {
    EC_TONAL_SEND(HighlightThreshold);
  } else if (hs) {
    EC_TONAL_SEND(HighlightSoftness);
  }
#undef EC_TONAL_SEND
}

void TonalRangeDefinitionControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!IsEnabledInTree() || GetLocalBounds().Width() < 2) {
    return;
  }
  mDragged = HitHandle(point);
  if (!mDragged) {
    return;
  }
  mKeyHandle = mDragged;
  mGrabValue = LocalToValue(point.x);
  mGrabValues = mValues;
  mMoved = false;
  CaptureMouse();
}

void TonalRangeDefinitionControl::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  if (!mDragged) {
    return;
  }
  const TonalRangeDefinitionValues v =
      Dragged(LocalToValue(point.x) - mGrabValue, IsShiftDown(modifiers));
  if (v.shadowThreshold != mValues.shadowThreshold || v.shadowSoftness != mValues.shadowSoftness ||
      v.highlightThreshold != mValues.highlightThreshold ||
      v.highlightSoftness != mValues.highlightSoftness) {
    mValues = v;
    mMoved = true;
    Invalidate();
    Report(false);
  }
}

void TonalRangeDefinitionControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (!mDragged) {
    return;
  }
  ReleaseMouse();
  if (mMoved) {
    Report(true);
  }
  mDragged.reset();
  mMoved = false;
}

bool TonalRangeDefinitionControl::KeyDownSelf(const KeyEvent& event) {
  if (mDragged || !IsEnabledInTree() ||
      (event.key != KeyCode::kLeft && event.key != KeyCode::kRight)) {
    return SubView::KeyDownSelf(event);
  }
  const double step =
      (IsShiftDown(event.modifiers) ? 10.0 : 1.0) * (event.key == KeyCode::kLeft ? -1.0 : 1.0);
  mDragged = mKeyHandle.value_or(Handle::kShadowThreshold);
  mGrabValues = mValues;
  const TonalRangeDefinitionValues v = Dragged(step, false);
  if (v.shadowThreshold != mValues.shadowThreshold || v.shadowSoftness != mValues.shadowSoftness ||
      v.highlightThreshold != mValues.highlightThreshold ||
      v.highlightSoftness != mValues.highlightSoftness) {
    mValues = v;
    Invalidate();
    Report(true);
  }
  mDragged.reset();
  return true;
}

void TonalRangeDefinitionControl::HideSelf() {
  mDragged.reset();
  mMoved = false;
}

void TonalRangeDefinitionControl::PaintSelf(DC& dc) {
  const Rect local = GetLocalBounds();
  if (local.Width() < 2) {
    return;
  }
  const Rect bar = Rect::FromSize(0, 0, local.Width(), std::min(kBarHeight, local.Height()));
  dc.FillRect(bar, ColorManager::GetColor(kColor_EditBackground));
  const int st = HandleToLocal(Handle::kShadowThreshold);
  const int ss = HandleToLocal(Handle::kShadowSoftness);
  const int ht = HandleToLocal(Handle::kHighlightThreshold);
  const int hs = HandleToLocal(Handle::kHighlightSoftness);
  const std::vector<Point> shadows{
      {0, bar.top + 2}, {st, bar.top + 2}, {ss, bar.bottom - 1}, {0, bar.bottom - 1}};
  const std::vector<Point> highlights{{ht, bar.top + 2},
                                      {bar.right - 1, bar.top + 2},
                                      {bar.right - 1, bar.bottom - 1},
                                      {hs, bar.bottom - 1}};
  dc.FillPolygon(shadows, Color(40, 40, 40, 200));
  dc.FillPolygon(highlights, Color(220, 220, 220, 200));
  dc.FrameRect(bar, ColorManager::GetColor(kColor_ControlBorder));
  const Color handle =
      ColorManager::GetColor(IsEnabledInTree() ? kColor_HotText : kColor_ControlTextDisabled);
  for (const int x : {st, ss, ht, hs}) {
    const std::vector<Point> triangle{
        {x, kBarHeight}, {x - 4, kBarHeight + 8}, {x + 4, kBarHeight + 8}};
    dc.FillPolygon(triangle, handle);
  }
}
