#include "Host/Toolkit/LevelsControl.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/KeyModifiers.h"

namespace {

double ClampLevel(double level, double low, double high) {
  if (!std::isfinite(level)) {
    return low;
  }
  return std::clamp(level, low, std::max(low, high));
}

}  // namespace

LevelsControl::LevelsControl(const Rect& bounds, Options options, Commander* commander)
    : SubView(commander), mWithGray(options.withGray), mCookie(options.cookie) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
}

void LevelsControl::SetAllLevels(double black, double gray, double white) {
  if (mDragging) {
    return;
  }
  const double b = ClampLevel(black, 0.0, kMaxLevel);
  const double w = ClampLevel(white, b, kMaxLevel);
  const double g = mWithGray ? ClampLevel(gray, b, w) : (b + w) / 2;
  if (b != mBlack || g != mGray || w != mWhite) {
    mBlack = b;
    mGray = g;
    mWhite = w;
    Invalidate();
  }
}

void LevelsControl::SetBlackAndWhiteLevels(double black, double white) {
  SetAllLevels(black, mGray, white);
}

double LevelsControl::GetLevel(Handle handle) const {
  switch (handle) {
    case Handle::kBlack:
      return mBlack;
    case Handle::kGray:
      return mGray;
    case Handle::kWhite:
      return mWhite;
  }
  return mBlack;
}

int LevelsControl::LevelToLocal(double level) const {
  const int span = std::max(0, GetLocalBounds().Width() - 1);
  return static_cast<int>(std::lround(ClampLevel(level, 0.0, kMaxLevel) / kMaxLevel * span));
}

double LevelsControl::LocalToLevel(int x) const {
  const int span = GetLocalBounds().Width() - 1;
  if (span <= 0) {
    return 0.0;
  }
  return std::round(ClampLevel(kMaxLevel * x / span, 0.0, kMaxLevel));
}

std::optional<LevelsControl::Handle> LevelsControl::HitHandle(Point local) const {
  std::vector<Handle> handles{Handle::kBlack, Handle::kWhite};
  if (mWithGray) {
    handles.insert(handles.begin() + 1, Handle::kGray);
  }
  std::optional<Handle> best;
  int bestDistance = kHitRadius + 1;
  for (const Handle handle : handles) {
    const int distance = std::abs(LevelToLocal(GetLevel(handle)) - local.x);
    if (distance < bestDistance) {
      best = handle;
      bestDistance = distance;
    }
  }
  return best;
}

bool LevelsControl::MoveHandle(Handle handle, double level) {
  double& value = handle == Handle::kBlack ? mBlack : (handle == Handle::kGray ? mGray : mWhite);
  double low = 0.0;
  double high = kMaxLevel;
  switch (handle) {
    case Handle::kBlack:
      high = mWithGray ? mGray : mWhite;
      break;
    case Handle::kGray:
      low = mBlack;
      high = mWhite;
      break;
    case Handle::kWhite:
      low = mWithGray ? mGray : mBlack;
      break;
  }
  const double moved = ClampLevel(level, low, high);
  if (moved == value) {
    return false;
  }
  value = moved;
  if (!mWithGray) {
    mGray = (mBlack + mWhite) / 2;
  }
  Invalidate();
  return true;
}

void LevelsControl::Report(Handle handle, bool finished) const {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const double level = GetLevel(handle);
  switch (handle) {
    case Handle::kBlack:
      finished ? mStation.Broadcast(LevelsControlBlackLevelChangedMessage(level, mCookie))
               : mStation.Broadcast(LevelsControlBlackLevelChangingMessage(level, mCookie));
      break;
    case Handle::kGray:
      finished ? mStation.Broadcast(LevelsControlGrayLevelChangedMessage(level, mCookie))
               : mStation.Broadcast(LevelsControlGrayLevelChangingMessage(level, mCookie));
      break;
    case Handle::kWhite:
      finished ? mStation.Broadcast(LevelsControlWhiteLevelChangedMessage(level, mCookie))
               : mStation.Broadcast(LevelsControlWhiteLevelChangingMessage(level, mCookie));
      break;
  }
}

void LevelsControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!IsEnabledInTree() || GetLocalBounds().Width() < 2) {
    return;
  }
  mPicked = HitHandle(point);
  if (!mPicked) {
    return;
  }
  mDragging = true;
  mMoved = false;
  CaptureMouse();
  Invalidate();
}

void LevelsControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mDragging || !mPicked) {
    return;
  }
  if (MoveHandle(*mPicked, LocalToLevel(point.x))) {
    mMoved = true;
    Report(*mPicked, false);
  }
}

void LevelsControl::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  mDragging = false;
  ReleaseMouse();
  if (mMoved && mPicked) {
    Report(*mPicked, true);
  }
  mMoved = false;
}

bool LevelsControl::KeyDownSelf(const KeyEvent& event) {
  if (mDragging || !IsEnabledInTree()) {
    return SubView::KeyDownSelf(event);
  }
  const double step = IsShiftDown(event.modifiers) ? 10.0 : 1.0;
  double direction = 0.0;
  if (event.key == KeyCode::kLeft) {
    direction = -1.0;
  } else if (event.key == KeyCode::kRight) {
    direction = 1.0;
  } else {
    return SubView::KeyDownSelf(event);
  }
  const Handle handle = mPicked.value_or(Handle::kBlack);
  mPicked = handle;
  if (MoveHandle(handle, GetLevel(handle) + direction * step)) {
    Report(handle, true);
  }
  return true;
}

void LevelsControl::HideSelf() {
  mDragging = false;
  mMoved = false;
}

void LevelsControl::PaintSelf(DC& dc) {
  const Rect local = GetLocalBounds();
  if (local.Width() < 2 || local.Height() < 1) {
    return;
  }
  const int rampHeight = std::min(kRampHeight, local.Height());
  constexpr int kBands = 32;
  for (int i = 0; i < kBands; ++i) {
    const int left = local.Width() * i / kBands;
    const int right = local.Width() * (i + 1) / kBands;
    const auto shade = static_cast<std::uint8_t>(255 * i / (kBands - 1));
    dc.FillRect(Rect{left, 0, right, rampHeight}, Color(shade, shade, shade));
  }
  dc.FrameRect(Rect{0, 0, local.Width(), rampHeight}, ColorManager::GetColor(kColor_ControlBorder));
  const Color outline =
      ColorManager::GetColor(IsEnabledInTree() ? kColor_HotText : kColor_ControlTextDisabled);
  const auto handle = [&](Handle which, Color fill) {
    const int x = LevelToLocal(GetLevel(which));
    const std::vector<Point> triangle{
        {x, rampHeight}, {x - 4, rampHeight + 7}, {x + 4, rampHeight + 7}};
    dc.FillPolygon(triangle, mPicked == which ? outline : fill);
  };
  handle(Handle::kBlack, Color(0, 0, 0));
  if (mWithGray) {
    handle(Handle::kGray, Color(128, 128, 128));
  }
  handle(Handle::kWhite, Color(255, 255, 255));
}
