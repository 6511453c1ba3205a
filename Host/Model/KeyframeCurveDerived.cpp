// The data a curve derives from its keyframes (search times, automatic tangents and speeds, path
// lengths, segments), rebuilt or refreshed around each edit.
#include <algorithm>
#include <cmath>

#include "Host/Model/KeyframeCurve.h"

namespace {

// An edit of keyframe k changes auto tangents at k +- 1, path lengths of segments k - 2 .. k + 1,
// auto speeds at k +- 2 and segments k - 3 .. k + 2; refreshing k +- 4 covers them all.
constexpr std::size_t kRefreshRadius = 4;

constexpr double kTicksPerSecondD = static_cast<double>(kTicksPerSecond);

double Seconds(double ticks) {
  return ticks / kTicksPerSecondD;
}

bool IsZero(ParamPoint p) {
  return p.x == 0.0 && p.y == 0.0;
}

ParamPoint Minus(ParamPoint a, ParamPoint b) {
  return {a.x - b.x, a.y - b.y};
}
ParamPoint Plus(ParamPoint a, ParamPoint b) {
  return {a.x + b.x, a.y + b.y};
}

double PathDistance(const ParamValue& a, const ParamValue& b) {
  if (const ParamPoint* p = std::get_if<ParamPoint>(&a)) {
    const ParamPoint d = Minus(std::get<ParamPoint>(b), *p);
    return std::hypot(d.x, d.y);
  }
  if (const ParamColor* c = std::get_if<ParamColor>(&a)) {
    const ParamColor& d = std::get<ParamColor>(b);
    const double dr = static_cast<double>(d.r) - c->r;
    const double dg = static_cast<double>(d.g) - c->g;
    const double db = static_cast<double>(d.b) - c->b;
    const double da = static_cast<double>(d.a) - c->a;
    return std::sqrt(dr * dr + dg * dg + db * db + da * da);
  }
  return 0.0;
}

double ScalarOf(const ParamValue& value) {
  return AsScalar(value).value_or(0.0);
}

}  // namespace

void KeyframeCurve::InsertKey(std::size_t index, const Keyframe& keyframe) {
  const std::size_t before = mKeys.size();
  mKeys.insert(mKeys.begin() + static_cast<std::ptrdiff_t>(index), keyframe);
  mTimes.insert(mTimes.begin() + static_cast<std::ptrdiff_t>(index), keyframe.time);
  if (before == 0) {
    // The first keyframe sets the kind; nothing derived is left from an earlier kind.
    mSegments.clear();
    mInverses.clear();
    mPathLengths.clear();
    mPaths.clear();
  } else {
    InsertSlot(std::min(index, before - 1));
  }
  Refresh(index, index);
}

void KeyframeCurve::EraseKey(std::size_t index) {
  const std::size_t before = mKeys.size();
  if (before >= 2) {
    EraseSlot(std::min(index, before - 2));
  }
  mKeys.erase(mKeys.begin() + static_cast<std::ptrdiff_t>(index));
  mTimes.erase(mTimes.begin() + static_cast<std::ptrdiff_t>(index));
  if (!mKeys.empty()) {
    Refresh(index > 0 ? index - 1 : 0, std::min(index, mKeys.size() - 1));
  }
}

void KeyframeCurve::InsertSlot(std::size_t segment) {
  const auto at = static_cast<std::ptrdiff_t>(segment);
  mSegments.insert(mSegments.begin() + at, CurveSegment{});
  mInverses.insert(mInverses.begin() + at, CurveInverse{});
  const ParamValueKind kind = *Kind();
  if (IsPathKind(kind)) {
    mPathLengths.insert(mPathLengths.begin() + at, 0.0);
  }
  if (kind == ParamValueKind::Point) {
    mPaths.insert(mPaths.begin() + at, CurvePath{});
  }
}

void KeyframeCurve::EraseSlot(std::size_t segment) {
  const auto at = static_cast<std::ptrdiff_t>(segment);
  mSegments.erase(mSegments.begin() + at);
  mInverses.erase(mInverses.begin() + at);
  if (!mPathLengths.empty()) {
    mPathLengths.erase(mPathLengths.begin() + at);
  }
  if (!mPaths.empty()) {
    mPaths.erase(mPaths.begin() + at);
  }
}

void KeyframeCurve::RebuildAll() {
  mTimes.resize(mKeys.size());
  std::transform(mKeys.begin(), mKeys.end(), mTimes.begin(),
                 [](const Keyframe& key) { return key.time; });
  const std::size_t segments = mKeys.size() < 2 ? 0 : mKeys.size() - 1;
  const std::optional<ParamValueKind> kind = Kind();
  mSegments.assign(segments, CurveSegment{});
  mInverses.assign(segments, CurveInverse{});
  mPathLengths.assign(kind && IsPathKind(*kind) ? segments : 0, 0.0);
  mPaths.assign(kind == ParamValueKind::Point ? segments : 0, CurvePath{});
  if (!mKeys.empty()) {
    Refresh(0, mKeys.size() - 1);
  }
}

void KeyframeCurve::Refresh(std::size_t first, std::size_t last) {
  const std::size_t n = mKeys.size();
  if (n == 0) {
    return;
  }
  const std::size_t lo = first > kRefreshRadius ? first - kRefreshRadius : 0;
  const std::size_t hi = std::min(n - 1, last + kRefreshRadius);
  const ParamValueKind kind = *Kind();
  if (kind == ParamValueKind::Point) {
    for (std::size_t k = lo; k <= hi; ++k) {
      RefreshTangents(k);
    }
  }
  if (n >= 2 && IsPathKind(kind)) {
    for (std::size_t s = lo; s <= std::min(hi, n - 2); ++s) {
      RefreshPathLength(s);
    }
  }
  for (std::size_t k = lo; k <= hi; ++k) {
    RefreshSpeeds(k);
  }
  if (n >= 2) {
    for (std::size_t s = lo; s <= std::min(hi, n - 2); ++s) {
      RefreshSegment(s);
    }
  }
}

void KeyframeCurve::RefreshTangents(std::size_t index) {
  Keyframe& key = mKeys[index];
  switch (key.spatial) {
    case SpatialInterpolation::Linear:
      key.inTangent = {};
      key.outTangent = {};
      break;
    case SpatialInterpolation::AutoBezier:
      if (index > 0 && index + 1 < mKeys.size()) {
        // Catmull-Rom: the tangent runs parallel to the chord of the neighbours.
        const ParamPoint chord = Minus(std::get<ParamPoint>(mKeys[index + 1].value),
                                       std::get<ParamPoint>(mKeys[index - 1].value));
        key.outTangent = {chord.x / 6.0, chord.y / 6.0};
        key.inTangent = {-chord.x / 6.0, -chord.y / 6.0};
      } else {
        key.inTangent = {};
        key.outTangent = {};
      }
      break;
    case SpatialInterpolation::Bezier:
    case SpatialInterpolation::ContinuousBezier:
      break;
  }
}

void KeyframeCurve::RefreshPathLength(std::size_t segment) {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  CurveSegment& g = mSegments[segment];
  g.SetCurvedPath(false);
  if (const ParamPoint* a = std::get_if<ParamPoint>(&from.value)) {
    const ParamPoint& b = std::get<ParamPoint>(to.value);
    if (!IsZero(from.outTangent) || !IsZero(to.inTangent)) {
      g.SetCurvedPath(true);
      mPathLengths[segment] =
          mPaths[segment].Build(*a, Plus(*a, from.outTangent), Plus(b, to.inTangent), b);
      return;
    }
  }
  mPathLengths[segment] = PathDistance(from.value, to.value);
}

double KeyframeCurve::SegmentSlope(std::size_t segment) const {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  const double seconds = Seconds(static_cast<double>(to.time - from.time));
  const ParamValueKind kind = KindOf(from.value);
  if (kind == ParamValueKind::Double) {
    return (ScalarOf(to.value) - ScalarOf(from.value)) / seconds;
  }
  if (IsPathKind(kind)) {
    return mPathLengths[segment] / seconds;
  }
  return 0.0;
}

void KeyframeCurve::RefreshSpeeds(std::size_t index) {
  Keyframe& key = mKeys[index];
  if (key.interpolation == TemporalInterpolation::Bezier ||
      key.interpolation == TemporalInterpolation::ContinuousBezier) {
    return;
  }
  const std::size_t n = mKeys.size();
  const bool heldBefore =
      index > 0 && mKeys[index - 1].interpolation == TemporalInterpolation::Hold;
  std::optional<double> slopeIn;
  std::optional<double> slopeOut;
  if (index > 0 && !heldBefore) {
    slopeIn = SegmentSlope(index - 1);
  }
  if (index + 1 < n) {
    slopeOut = SegmentSlope(index);
  }
  key.inInfluence = kDefaultInfluence;
  key.outInfluence = kDefaultInfluence;
  switch (key.interpolation) {
    case TemporalInterpolation::Hold:
      key.inSpeed = slopeIn.value_or(0.0);
      key.outSpeed = 0.0;
      break;
    case TemporalInterpolation::Linear:
      key.inSpeed = slopeIn.value_or(0.0);
      key.outSpeed = slopeOut.value_or(0.0);
      break;
    case TemporalInterpolation::AutoBezier: {
      double speed = 0.0;
      if (slopeIn && slopeOut) {
        const double a = *slopeIn;
        const double b = *slopeOut;
        if (IsPathKind(KindOf(key.value))) {
          speed = 0.5 * (a + b);
        } else if (a * b > 0.0) {
          // Parallel to the neighbours' chord, limited so the curve neither overshoots nor turns
          // back between them (Fritsch-Carlson); flat where the value turns.
          const double chord =
              (ScalarOf(mKeys[index + 1].value) - ScalarOf(mKeys[index - 1].value)) /
              Seconds(static_cast<double>(mKeys[index + 1].time - mKeys[index - 1].time));
          const double limit = 3.0 * std::min(std::fabs(a), std::fabs(b));
          speed = std::clamp(chord, -limit, limit);
        }
      } else {
        speed = slopeIn ? *slopeIn : slopeOut.value_or(0.0);
      }
      key.inSpeed = speed;
      key.outSpeed = speed;
      break;
    }
    case TemporalInterpolation::Bezier:
    case TemporalInterpolation::ContinuousBezier:
      break;
  }
}

void KeyframeCurve::RefreshSegment(std::size_t segment) {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  CurveSegment& g = mSegments[segment];
  const ParamValueKind kind = KindOf(from.value);
  const bool path = IsPathKind(kind);
  const double y0 = path ? 0.0 : ScalarOf(from.value);
  const double y3 = path ? mPathLengths[segment] : ScalarOf(to.value);
  if (from.interpolation == TemporalInterpolation::Hold || !Interpolates(kind)) {
    g.MakeHold(from.time, to.time, y0);
    return;
  }
  const bool straightOut = from.interpolation == TemporalInterpolation::Linear;
  const bool straightIn = to.interpolation == TemporalInterpolation::Linear ||
                          to.interpolation == TemporalInterpolation::Hold;
  if (straightOut && straightIn) {
    g.MakeLinear(from.time, to.time, y0, y3);
    return;
  }
  // The inner control points are the handles (ComputeHandle), in exact rather than whole ticks.
  const double span = static_cast<double>(to.time - from.time);
  const auto outReach = static_cast<float>(ClampInfluence(from.outInfluence) * 0.5);
  const auto inReach = static_cast<float>(ClampInfluence(to.inInfluence) * 0.5);
  double y1 = y0 + Seconds(span * outReach) * from.outSpeed;
  double y2 = y3 - Seconds(span * inReach) * to.inSpeed;
  if (path) {
    // Inside [0, length] the distance neither runs back along the path nor beyond its ends.
    y1 = std::clamp(y1, 0.0, y3);
    y2 = std::clamp(y2, 0.0, y3);
  }
  g.MakeBezier(from.time, to.time, y0, y1, y2, y3, outReach, inReach, mInverses[segment]);
}
