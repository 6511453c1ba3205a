#pragma once

#include <algorithm>
#include <cmath>
#include <cstdint>

#include "Host/Model/TickTime.h"

enum class CurveSegmentShape : std::uint8_t { Hold, Linear, Bezier };

// Private to KeyframeCurve: the evaluation form of the segment between two keyframes, rebuilt
// whenever a keyframe that shapes it changes. y is the value for scalars and the distance
// travelled along the path for points and colours. A Bezier segment runs in (s, y) with
// s = (t - start) / (end - start): s(u) = ((xa u + xb) u + xc) u rises strictly because its inner
// control points satisfy 0 < x1 <= 1/2 <= x2 < 1, so every time has exactly one u.
class alignas(64) CurveSegment {
 public:
  void MakeHold(TickTime start, TickTime end, double y0, double y3);
  void MakeLinear(TickTime start, TickTime end, double y0, double y3);
  // y1, y2: values of the inner control points, at normalised times x1 and x2.
  void MakeBezier(TickTime start, TickTime end, double y0, double y1, double y2, double y3,
                  double x1, double x2);

  TickTime Start() const { return mStart; }
  TickTime End() const { return mEnd; }
  CurveSegmentShape Shape() const { return mShape; }
  double Y0() const { return mY0; }
  double Y3() const { return mY3; }
  // Points only: the spatial path is curved (its CurvePath sits at the same index as the segment).
  bool IsCurvedPath() const { return mCurvedPath; }
  void SetCurvedPath(bool curved) { mCurvedPath = curved; }

  // y at `time`; times outside the segment are taken at its ends.
  double YAt(TickTime time) const;
  // dy/dt in y units per second at `time` (0 on a hold).
  double VelocityAt(TickTime time) const;
  // Extremes of the velocity over [from, to] within the segment, ends included.
  void VelocityRange(TickTime from, TickTime to, double* minimum, double* maximum) const;

  // The u at which s(u) = s, s in [0, 1], within half a tick (within double precision for
  // segments longer than about 10^15 ticks).
  double SolveForU(double s) const;

 private:
  // The inverse u(s) as one cubic Hermite piece per 1/kInverseSteps of s: the first guess of the
  // solve, close enough that one Newton step nearly always reaches the tolerance.
  static constexpr int kInverseSteps = 16;

  double NormalisedTime(TickTime time) const {
    return std::clamp(static_cast<double>(time - mStart) * mInvSpan, 0.0, 1.0);
  }
  double PolyX(double u) const { return ((mXa * u + mXb) * u + mXc) * u; }
  double SlopeX(double u) const { return (3.0 * mXa * u + 2.0 * mXb) * u + mXc; }
  double PolyY(double u) const { return ((mYa * u + mYb) * u + mYc) * u + mY0; }
  double SlopeY(double u) const { return (3.0 * mYa * u + 2.0 * mYb) * u + mYc; }
  double Tolerance() const { return std::max(0.5 * mInvSpan, 4e-16); }
  double BezierVelocity(double u) const;
  double BracketedSolve(double s, double u) const;
  void BuildInverse();
  void SetSpan(TickTime start, TickTime end);

  // What one sample reads fits two cache lines, plus one line of the inverse.
  TickTime mStart = 0;
  TickTime mEnd = 0;
  double mInvSpan = 1.0;  // 1 / (end - start), per tick
  double mXa = 0.0, mXb = 0.0, mXc = 1.0;
  double mHalfMaxCurvature = 0.0;  // max |s''(u)| / 2 on [0, 1]
  CurveSegmentShape mShape = CurveSegmentShape::Hold;
  bool mCurvedPath = false;
  double mYa = 0.0, mYb = 0.0, mYc = 0.0;
  double mY0 = 0.0;
  double mY3 = 0.0;
  // u = ((c3 r + c2) r + c1) r + c0 in a piece; floats, since a first guess needs no more.
  float mInverse[kInverseSteps][4] = {};
};

// Newton steps from the guess. By Taylor, a step leaves |s(u) - s| <= M * step^2 with M half the
// largest |s''| on [0, 1], so that bound proves the tolerance without evaluating s(u) again.
inline double CurveSegment::SolveForU(double s) const {
  const double scaled = s * kInverseSteps;
  const int piece = std::min(static_cast<int>(scaled), kInverseSteps - 1);
  const double r = scaled - piece;
  const float* c = mInverse[piece];
  double u = ((c[3] * r + c[2]) * r + c[1]) * r + c[0];
  const double tolerance = Tolerance();
  for (int i = 0; i < 2; ++i) {
    const double step = (PolyX(u) - s) / SlopeX(u);
    u -= step;
    if (!(u >= 0.0 && u <= 1.0)) {
      break;
    }
    if (step * step * mHalfMaxCurvature <= tolerance) {
      return u;
    }
  }
  return BracketedSolve(s, std::clamp(u, 0.0, 1.0));
}

inline double CurveSegment::YAt(TickTime time) const {
  switch (mShape) {
    case CurveSegmentShape::Hold:
      return mY0;
    case CurveSegmentShape::Linear:
      return mY0 + mYc * NormalisedTime(time);
    case CurveSegmentShape::Bezier:
      break;
  }
  return PolyY(SolveForU(NormalisedTime(time)));
}

inline double CurveSegment::VelocityAt(TickTime time) const {
  switch (mShape) {
    case CurveSegmentShape::Hold:
      return 0.0;
    case CurveSegmentShape::Linear:
      return mYc * mInvSpan * static_cast<double>(kTicksPerSecond);
    case CurveSegmentShape::Bezier:
      break;
  }
  return BezierVelocity(SolveForU(NormalisedTime(time)));
}
