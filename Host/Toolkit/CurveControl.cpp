#include "Host/Toolkit/CurveControl.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <utility>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"

namespace {

CurvePointList Diagonal() {
  return {{0, 0}, {CurveControl::kMaxLevel, CurveControl::kMaxLevel}};
}

int ClampLevel(int level) {
  return std::clamp(level, 0, CurveControl::kMaxLevel);
}

// Catmull-Rom through the points, as the curve is drawn; clamped to the levels.
double SampleSegment(const CurvePointList& p, std::size_t i, double t) {
  const auto at = [&](std::ptrdiff_t k) {
    return static_cast<double>(
        p[static_cast<std::size_t>(std::clamp<std::ptrdiff_t>(k, 0, std::ssize(p) - 1))].y);
  };
  const auto k = static_cast<std::ptrdiff_t>(i);
  const double p0 = at(k - 1), p1 = at(k), p2 = at(k + 1), p3 = at(k + 2);
  const double t2 = t * t, t3 = t2 * t;
  const double y = 0.5 * (2 * p1 + (-p0 + p2) * t + (2 * p0 - 5 * p1 + 4 * p2 - p3) * t2 +
                          (-p0 + 3 * p1 - 3 * p2 + p3) * t3);
  return std::clamp(y, 0.0, static_cast<double>(CurveControl::kMaxLevel));
}

}  // namespace

CurveControl::CurveControl(const Rect& bounds, Options options, Commander* commander)
    : SubView(commander),
      mLabel(LocalizeString(options.label)),
      mCurveColor(options.curveColor),
      mCookie(options.cookie),
      mPoints(Diagonal()) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
}

void CurveControl::SetCurvePointList(const CurvePointList& points) {
  if (mDragging) {
    return;
  }
  CurvePointList clean;
  for (CurvePoint point : points) {
    point = {ClampLevel(point.x), ClampLevel(point.y)};
    const bool taken = std::any_of(clean.begin(), clean.end(),
                                   [&](const CurvePoint& kept) { return kept.x == point.x; });
    if (!taken && clean.size() < kMaxPoints) {
      clean.push_back(point);
    }
  }
  std::sort(clean.begin(), clean.end(),
            [](const CurvePoint& a, const CurvePoint& b) { return a.x < b.x; });
  if (clean.size() < kMinPoints) {
    clean = Diagonal();
  }
  if (clean != mPoints) {
    mPoints = std::move(clean);
    if (mPicked && *mPicked >= mPoints.size()) {
      mPicked.reset();
    }
    Invalidate();
  }
}

Rect CurveControl::GetPlotRect() const {
  const Rect local = GetLocalBounds();
  const int side = std::max(0, std::min(local.Width(), local.Height() - kLabelHeight));
  return Rect::FromSize(0, kLabelHeight, side, side);
}

Point CurveControl::LevelToLocal(const CurvePoint& point) const {
  const Rect plot = GetPlotRect();
  const double span = std::max(0, plot.Width() - 1);
  return {plot.left + static_cast<int>(std::lround(point.x * span / kMaxLevel)),
          plot.bottom - 1 - static_cast<int>(std::lround(point.y * span / kMaxLevel))};
}

CurvePoint CurveControl::LocalToLevel(Point local) const {
  const Rect plot = GetPlotRect();
  const int span = plot.Width() - 1;
  if (span <= 0) {
    return {};
  }
  const auto level = [&](int pixels) {
    return ClampLevel(static_cast<int>(std::lround(pixels * double{kMaxLevel} / span)));
  };
  return {level(local.x - plot.left), level(plot.bottom - 1 - local.y)};
}

std::optional<std::size_t> CurveControl::HitPoint(Point local) const {
  std::optional<std::size_t> best;
  int bestDistance = kHitRadius + 1;
  for (std::size_t i = 0; i < mPoints.size(); ++i) {
    const Point at = LevelToLocal(mPoints[i]);
    const int distance = std::max(std::abs(at.x - local.x), std::abs(at.y - local.y));
    if (distance < bestDistance) {
      bestDistance = distance;
      best = i;
    }
  }
  return best;
}

std::optional<std::size_t> CurveControl::InsertionIndex(int x) const {
  if (mPoints.size() >= kMaxPoints) {
    return std::nullopt;
  }
  const auto it = std::lower_bound(mPoints.begin(), mPoints.end(), x,
                                   [](const CurvePoint& p, int level) { return p.x < level; });
  if (it != mPoints.end() && it->x == x) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mPoints.begin());
}

void CurveControl::MovePicked(CurvePoint to) {
  const std::size_t i = *mPicked;
  const int low = i == 0 ? 0 : mPoints[i - 1].x + 1;
  const int high = i + 1 == mPoints.size() ? kMaxLevel : mPoints[i + 1].x - 1;
  to = {std::clamp(ClampLevel(to.x), low, std::max(low, high)), ClampLevel(to.y)};
  if (to != mPoints[i]) {
    mPoints[i] = to;
    mMoved = true;
    Invalidate();
  }
}

bool CurveControl::RemovePicked() {
  if (!mPicked || mPoints.size() <= kMinPoints) {
    return false;
  }
  mPoints.erase(mPoints.begin() + static_cast<std::ptrdiff_t>(*mPicked));
  mPicked.reset();
  Invalidate();
  return true;
}

bool CurveControl::IsFarOutside(Point local) const {
  const Rect plot = GetPlotRect();
  return !plot.Inset(-kRemoveDistance, -kRemoveDistance).Contains(local);
}

void CurveControl::Report(bool finished, CurveChangeCode code) const {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (finished) {
    mStation.Broadcast(CurveChangedMessage(code, mCookie));
  } else {
    mStation.Broadcast(CurveChangingMessage(code, mCookie));
  }
}

void CurveControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!IsEnabledInTree() || !GetPlotRect().Contains(point)) {
    return;
  }
  mMoved = false;
  mListChanged = false;
  mPicked = HitPoint(point);
  if (!mPicked) {
    const CurvePoint level = LocalToLevel(point);
    const std::optional<std::size_t> at = InsertionIndex(level.x);
    if (!at) {
      return;
    }
    mPoints.insert(mPoints.begin() + static_cast<std::ptrdiff_t>(*at), level);
    mPicked = at;
    mListChanged = true;
  }
  mDragging = true;
  CaptureMouse();
  Invalidate();
  if (mListChanged) {
    Report(false, CurveChangeCode::kPointListChanged);
  }
}

void CurveControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mDragging || !mPicked) {
    return;
  }
  const CurvePoint before = mPoints[*mPicked];
  MovePicked(LocalToLevel(point));
  if (mPoints[*mPicked] != before) {
    Report(false, mListChanged ? CurveChangeCode::kPointListChanged : CurveChangeCode::kPointMoved);
  }
}

void CurveControl::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mDragging) {
    return;
  }
  mDragging = false;
  ReleaseMouse();
  if (IsFarOutside(point) && RemovePicked()) {
    mListChanged = true;
  }
  Invalidate();
  if (mListChanged) {
    Report(true, CurveChangeCode::kPointListChanged);
  } else if (mMoved) {
    Report(true, CurveChangeCode::kPointMoved);
  }
  mMoved = false;
  mListChanged = false;
}

bool CurveControl::KeyDownSelf(const KeyEvent& event) {
  if (!mPicked || mDragging) {
    return SubView::KeyDownSelf(event);
  }
  if (event.key == KeyCode::kDelete || event.key == KeyCode::kBackspace) {
    if (RemovePicked()) {
      Report(true, CurveChangeCode::kPointListChanged);
    }
    return true;
  }
  const int step = IsShiftDown(event.modifiers) ? 10 : 1;
  CurvePoint to = mPoints[*mPicked];
  switch (event.key) {
    case KeyCode::kLeft:
      to.x -= step;
      break;
    case KeyCode::kRight:
      to.x += step;
      break;
    case KeyCode::kUp:
      to.y += step;
      break;
    case KeyCode::kDown:
      to.y -= step;
      break;
    default:
      return SubView::KeyDownSelf(event);
  }
  mMoved = false;
  MovePicked(to);
  if (mMoved) {
    mMoved = false;
    Report(true, CurveChangeCode::kPointMoved);
  }
  return true;
}

void CurveControl::HideSelf() {
  mDragging = false;
  mMoved = false;
  mListChanged = false;
}

void CurveControl::PaintGrid(DC& dc, const Rect& plot) const {
  dc.FillRect(plot, ColorManager::GetColor(kColor_EditBackground));
  const Color grid = ColorManager::GetColor(kColor_Divider);
  for (int quarter = 1; quarter < 4; ++quarter) {
    const int x = plot.left + plot.Width() * quarter / 4;
    const int y = plot.top + plot.Height() * quarter / 4;
    dc.DrawLine({x, plot.top}, {x, plot.bottom - 1}, grid);
    dc.DrawLine({plot.left, y}, {plot.right - 1, y}, grid);
  }
  dc.DrawLine({plot.left, plot.bottom - 1}, {plot.right - 1, plot.top}, grid);
  dc.FrameRect(plot, ColorManager::GetColor(kColor_ControlBorder));
}

void CurveControl::PaintCurve(DC& dc) const {
  constexpr int kSteps = 12;
  std::vector<Point> line;
  line.push_back(LevelToLocal({0, mPoints.front().y}));
  for (std::size_t i = 0; i + 1 < mPoints.size(); ++i) {
    for (int s = 0; s <= kSteps; ++s) {
      const double t = static_cast<double>(s) / kSteps;
      const double x = mPoints[i].x + (mPoints[i + 1].x - mPoints[i].x) * t;
      line.push_back(LevelToLocal({static_cast<int>(std::lround(x)),
                                   static_cast<int>(std::lround(SampleSegment(mPoints, i, t)))}));
    }
  }
  line.push_back(LevelToLocal({kMaxLevel, mPoints.back().y}));
  const bool enabled = IsEnabledInTree();
  dc.Polyline(line, enabled ? mCurveColor : ColorManager::GetColor(kColor_ControlTextDisabled),
              1.5);
  for (std::size_t i = 0; i < mPoints.size(); ++i) {
    const Point at = LevelToLocal(mPoints[i]);
    const Rect box = Rect::FromSize(at.x - 2, at.y - 2, 5, 5);
    if (mPicked == i) {
      dc.FillRect(box, mCurveColor);
    } else {
      dc.FrameRect(box, mCurveColor);
    }
  }
}

void CurveControl::PaintSelf(DC& dc) {
  const Rect local = GetLocalBounds();
  dc.DrawText(mLabel, Rect::FromSize(0, 0, local.Width(), kLabelHeight), Font(),
              ColorManager::GetColor(kColor_ControlText), TextAlign::kLeft, TextVAlign::kCenter);
  const Rect plot = GetPlotRect();
  if (plot.IsEmpty()) {
    return;
  }
  dc.PushClip(plot);
  PaintGrid(dc, plot);
  PaintCurve(dc);
  dc.PopClip();
}
