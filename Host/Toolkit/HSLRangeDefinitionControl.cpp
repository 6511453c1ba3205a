#include "Host/Toolkit/HSLRangeDefinitionControl.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/RangeBarScale.h"

HSLRangeDefinitionControl::HSLRangeDefinitionControl(const Rect& bounds, double minimum,
                                                     double maximum, Commander* commander)
    : SubView(commander), mMinimum(minimum), mMaximum(std::max(minimum, maximum)) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
  mValues = Ordered({minimum, minimum, mMaximum, 0.0});
}

HSLRangeDefinitionValues HSLRangeDefinitionControl::Ordered(HSLRangeDefinitionValues v) const {
  const auto finite = [](double value, double fallback) {
    return std::isfinite(value) ? value : fallback;
  };
  v.startSoftness = std::clamp(finite(v.startSoftness, mMinimum), mMinimum, mMaximum);
  v.startThreshold = std::clamp(finite(v.startThreshold, mMinimum), v.startSoftness, mMaximum);
  v.endThreshold = std::clamp(finite(v.endThreshold, mMaximum), v.startThreshold, mMaximum);
  v.endSoftness = std::clamp(finite(v.endSoftness, 0.0), 0.0, mMaximum - v.endThreshold);
  v.cookie = mCookie;
  return v;
}

void HSLRangeDefinitionControl::SetValues(const HSLRangeDefinitionValues& values) {
  if (mDragged) {
    return;
  }
  const HSLRangeDefinitionValues ordered = Ordered(values);
  if (ordered.startSoftness != mValues.startSoftness ||
      ordered.startThreshold != mValues.startThreshold ||
      ordered.endThreshold != mValues.endThreshold || ordered.endSoftness != mValues.endSoftness) {
    mValues = ordered;
    Invalidate();
  }
}

HSLRangeDefinitionValues HSLRangeDefinitionControl::GetValues() const {
  HSLRangeDefinitionValues values = mValues;
  values.cookie = mCookie;
  return values;
}

int HSLRangeDefinitionControl::ValueToLocal(double value) const {
  return RangeBarScale{mMinimum, mMaximum, GetLocalBounds().Width()}.ValueToX(value);
}

double HSLRangeDefinitionControl::LocalToValue(int x) const {
  return RangeBarScale{mMinimum, mMaximum, GetLocalBounds().Width()}.XToValue(x);
}

std::optional<HSLRangeDefinitionControl::Handle> HSLRangeDefinitionControl::HitHandle(
    Point point) const {
  if (point.y >= kBarHeight) {
    const std::pair<Handle, double> handles[] = {
        {Handle::kStartSoftness, mValues.startSoftness},
        {Handle::kStartThreshold, mValues.startThreshold},
        {Handle::kEndThreshold, mValues.endThreshold},
        {Handle::kEndSoftness, mMaximum - mValues.endSoftness}};
    std::optional<Handle> best;
    int bestDistance = kHandleHitRadius + 1;
    for (const auto& [handle, value] : handles) {
      const int distance = std::abs(ValueToLocal(value) - point.x);
      if (distance < bestDistance) {
        best = handle;
        bestDistance = distance;
      }
    }
    return best;
  }
  if (point.x >= ValueToLocal(mValues.startThreshold) &&
      point.x <= ValueToLocal(mValues.endThreshold)) {
    return Handle::kThresholds;
  }
  return std::nullopt;
}

void HSLRangeDefinitionControl::Report(bool finished) const {
  if (!mDragged) {
    return;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const HSLRangeDefinitionValues v = GetValues();
  switch (*mDragged) {
    case Handle::kStartSoftness:
      finished ? mStation.Broadcast(HSLRangeDefinitionControlStartSoftnessChangedQuickMessage(v))
               : mStation.Broadcast(HSLRangeDefinitionControlStartSoftnessChangingQuickMessage(v));
      break;
    case Handle::kStartThreshold:
      finished ? mStation.Broadcast(HSLRangeDefinitionControlStartThresholdChangedQuickMessage(v))
               : mStation.Broadcast(HSLRangeDefinitionControlStartThresholdChangingQuickMessage(v));
      break;
    case Handle::kEndThreshold:
      finished ? mStation.Broadcast(HSLRangeDefinitionControlEndThresholdChangedQuickMessage(v))
               : mStation.Broadcast(HSLRangeDefinitionControlEndThresholdChangingQuickMessage(v));
      break;
    case Handle::kEndSoftness:
      finished ? mStation.Broadcast(HSLRangeDefinitionControlEndSoftnessChangedQuickMessage(v))
               : mStation.Broadcast(HSLRangeDefinitionControlEndSoftnessChangingQuickMessage(v));
      break;
    case Handle::kThresholds:
      finished
          ? mStation.Broadcast(HSLRangeDefinitionControlStartEndThresholdChangedQuickMessage(v))
          : mStation.Broadcast(HSLRangeDefinitionControlStartEndThresholdChangingQuickMessage(v));
      break;
  }
}

void HSLRangeDefinitionControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
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

HSLRangeDefinitionValues HSLRangeDefinitionControl::Dragged(double delta) const {
  HSLRangeDefinitionValues v = mGrabValues;
  const double endSoftnessAt = mMaximum - v.endSoftness;
  switch (*mDragged) {
    case Handle::kStartSoftness:
      v.startSoftness = std::clamp(v.startSoftness + delta, mMinimum, v.startThreshold);
      break;
    case Handle::kStartThreshold:
      v.startThreshold = std::clamp(v.startThreshold + delta, v.startSoftness, v.endThreshold);
      break;
    case Handle::kEndThreshold:
      v.endThreshold = std::clamp(v.endThreshold + delta, v.startThreshold, endSoftnessAt);
      break;
    case Handle::kEndSoftness:
      v.endSoftness = mMaximum - std::clamp(endSoftnessAt + delta, v.endThreshold, mMaximum);
      break;
    case Handle::kThresholds: {
      const double shift =
          std::clamp(delta, v.startSoftness - v.startThreshold, endSoftnessAt - v.endThreshold);
      v.startThreshold += shift;
      v.endThreshold += shift;
      break;
    }
  }
  return v;
}

bool HSLRangeDefinitionControl::Take(const HSLRangeDefinitionValues& v) {
  if (v.startSoftness == mValues.startSoftness && v.startThreshold == mValues.startThreshold &&
      v.endThreshold == mValues.endThreshold && v.endSoftness == mValues.endSoftness) {
    return false;
  }
  mValues = v;
  Invalidate();
  return true;
}

void HSLRangeDefinitionControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mDragged) {
    return;
  }
  if (Take(Dragged(LocalToValue(point.x) - mGrabValue))) {
    mMoved = true;
    Report(false);
  }
}

void HSLRangeDefinitionControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
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

bool HSLRangeDefinitionControl::KeyDownSelf(const KeyEvent& event) {
  if (mDragged || !IsEnabledInTree() ||
      (event.key != KeyCode::kLeft && event.key != KeyCode::kRight)) {
    return SubView::KeyDownSelf(event);
  }
  const double step =
      (IsShiftDown(event.modifiers) ? 10.0 : 1.0) * (event.key == KeyCode::kLeft ? -1.0 : 1.0);
  mDragged = mKeyHandle.value_or(Handle::kStartThreshold);
  mGrabValues = mValues;
  if (Take(Dragged(step))) {
    Report(true);
  }
  mDragged.reset();
  return true;
}

void HSLRangeDefinitionControl::HideSelf() {
  mDragged.reset();
  mMoved = false;
}

void HSLRangeDefinitionControl::PaintSelf(DC& dc) {
  const Rect local = GetLocalBounds();
  if (local.Width() < 2) {
    return;
  }
  const Rect bar = Rect::FromSize(0, 0, local.Width(), std::min(kBarHeight, local.Height()));
  dc.FillRect(bar, ColorManager::GetColor(kColor_EditBackground));
  const int inLeft = ValueToLocal(mValues.startThreshold);
  const int inRight = ValueToLocal(mValues.endThreshold);
  const int softLeft = ValueToLocal(mValues.startSoftness);
  const int softRight = ValueToLocal(mMaximum - mValues.endSoftness);
  const Color selected = ColorManager::GetColor(kColor_SliderFill);
  const std::vector<Point> band{{softLeft, bar.bottom - 1},
                                {inLeft, bar.top + 2},
                                {inRight, bar.top + 2},
                                {softRight, bar.bottom - 1}};
  dc.FillPolygon(band, selected.WithAlpha(160));
  dc.FrameRect(bar, ColorManager::GetColor(kColor_ControlBorder));
  const Color handle =
      ColorManager::GetColor(IsEnabledInTree() ? kColor_HotText : kColor_ControlTextDisabled);
  for (const int x : {softLeft, inLeft, inRight, softRight}) {
    const std::vector<Point> triangle{
        {x, kBarHeight}, {x - 4, kBarHeight + 8}, {x + 4, kBarHeight + 8}};
    dc.FillPolygon(triangle, handle);
  }
}
