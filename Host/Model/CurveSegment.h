#pragma once

#include <algorithm>
#include <cmath>
#include <cstdint>

#include "Host/Time/TickTime.h"

enum class CurveSegmentShape : std::uint8_t { Hold, Linear, Bezier };

// The inverse u(s) of a Bezier segment as one cubic Hermite piece per 1/kSteps of s: the first
// guess of the solve, close enough that one Newton step nearly always reaches the tolerance.
// Floats, since a first guess needs no more. Kept apart from CurveSegment so that the records a
// graph walks through stay dense in the cache.
struct CurveInverse {
  static constexpr int kSteps = 32;
  float piece[kSteps][4] = {};  // u = ((c3 r + c2) r + c1) r + c0, r the position in the piece
};

// Private to KeyframeCurve: the evaluation form of the segment between two keyframes, rebuilt
// whenever a keyframe that shapes it changes. y is the value for scalars and the distance
// travelled along the path for points and colours. A Bezier segment runs in (s, y) with
// s = (t - start) / (end - start); its inner control points lie at s = x1 and s = x2 with
// 0 < x1 <= 1/2 <= x2 < 1, so s(u) rises strictly and every time has exactly one u.
// Exactly one cache line; a Bezier segment also reads one line of its CurveInverse, which the
// caller keeps beside it (same index) and hands in.
class alignas(64) CurveSegment {
 public:
  void MakeHold(TickTime start, TickTime end, double y0);
  void MakeLinear(TickTime start, TickTime end, double y0, double y3);
  // y1, y2: values of the inner control points. outReach = x1 and inReach = 1 - x2, each in
  // (0, 1/2]; floats so that the segment keeps them exactly. Fills `inverse`.
  void MakeBezier(TickTime start, TickTime end, double y0, double y1, double y2, double y3,
                  float outReach, float inReach, CurveInverse& inverse);

  TickTime Start() const { return mStart; }
  CurveSegmentShape Shape() const { return mShape; }
  double Y0() const { return mY0; }
  // Points only: the spatial path is curved (its CurvePath sits at the same index as the segment).
  bool IsCurvedPath() const { return mCurvedPath; }
  void SetCurvedPath(bool curved) { mCurvedPath = curved; }

  // y at `time`; times outside the segment are taken at its ends.
  double YAt(TickTime time, const CurveInverse& inverse) const;
  // As YAt for a time the caller knows to lie inside the segment (start <= time < end).
  double YInside(TickTime time, const CurveInverse& inverse) const;
  // dy/dt in y units per second at `time` (0 on a hold).
  double VelocityAt(TickTime time, const CurveInverse& inverse) const;
  // Extremes of the velocity over [from, to] within the segment, ends included.
  void VelocityRange(TickTime from, TickTime to, const CurveInverse& inverse, double* minimum,
                     double* maximum) const;

 private:
  static constexpr int kInverseSteps = CurveInverse::kSteps;

  // s(u) = ((a u + b) u + c) u, from the reaches.
  struct TimeCubic {
    double a, b, c;
    double At(double u) const { return ((a * u + b) * u + c) * u; }
    double Slope(double u) const { return (3.0 * a * u + 2.0 * b) * u + c; }
    double Curvature(double u) const { return 6.0 * a * u + 2.0 * b; }
  };
  TimeCubic Time() const {
    const double o = mOutReach;
    const double i = mInReach;
    return {3.0 * (o + i) - 2.0, 3.0 * (1.0 - i - 2.0 * o), 3.0 * o};
  }
  double NormalisedTime(TickTime time) const {
    return std::clamp(static_cast<double>(time - mStart) * mInvSpan, 0.0, 1.0);
  }
  double PolyY(double u) const { return ((mYa * u + mYb) * u + mYc) * u + mY0; }
  double SlopeY(double u) const { return (3.0 * mYa * u + 2.0 * mYb) * u + mYc; }
  double Tolerance() const { return std::max(0.5 * mInvSpan, 4e-16); }
  double Y(double s, const CurveInverse& inverse) const;
  // The u at which s(u) = s, s in [0, 1], within half a tick (within double precision for
  // segments longer than about 10^15 ticks).
  double SolveForU(double s, const CurveInverse& inverse) const;
  double BezierVelocity(double u) const;
  double BracketedSolve(double s, double u) const;
  void BuildInverse(CurveInverse& inverse) const;
  void SetSpan(TickTime start, TickTime end);

  TickTime mStart = 0;
  double mInvSpan = 1.0;  // 1 / (end - start), per tick
  double mYa = 0.0, mYb = 0.0, mYc = 0.0;
  double mY0 = 0.0;
  float mOutReach = 1.0f / 3.0f;
  float mInReach = 1.0f / 3.0f;
  // A Newton step no longer than sqrt(mStepLimit) lands within the tolerance: the tolerance over
  // half the largest |s''| on [0, 1], rounded down.
  float mStepLimit = 0.0f;
  CurveSegmentShape mShape = CurveSegmentShape::Hold;
  bool mCurvedPath = false;
};

// Newton steps from the guess. By Taylor, a step leaves |s(u) - s| <= M * step^2 with M half the
// largest |s''| on [0, 1], so that bound proves the tolerance without evaluating s(u) again.
[[gnu::always_inline]] inline double CurveSegment::SolveForU(double s,
                                                             const CurveInverse& inverse) const {
  const double scaled = s * kInverseSteps;
  const int piece = std::min(static_cast<int>(scaled), kInverseSteps - 1);
  const double r = scaled - piece;
  const float* c = inverse.piece[piece];
  double u = ((c[3] * r + c[2]) * r + c[1]) * r + c[0];
  const TimeCubic x = Time();
  for (int i = 0; i < 2; ++i) {
    const double step = (x.At(u) - s) / x.Slope(u);
    u -= step;
    if (!(u >= 0.0 && u <= 1.0)) {
      break;
    }
    if (step * step <= mStepLimit) {
      return u;
    }
  }
  return BracketedSolve(s, std::clamp(u, 0.0, 1.0));
}

[[gnu::always_inline]] inline double CurveSegment::Y(double s, const CurveInverse& inverse) const {
  if (mShape == CurveSegmentShape::Bezier) {  // the common case first
    return PolyY(SolveForU(s, inverse));
  }
  return mShape == CurveSegmentShape::Linear ? mY0 + mYc * s : mY0;
}

[[gnu::always_inline]] inline double CurveSegment::YInside(TickTime time,
                                                           const CurveInverse& inverse) const {
  return Y(static_cast<double>(time - mStart) * mInvSpan, inverse);
}

inline double CurveSegment::YAt(TickTime time, const CurveInverse& inverse) const {
  return Y(NormalisedTime(time), inverse);
}

inline double CurveSegment::VelocityAt(TickTime time, const CurveInverse& inverse) const {
  switch (mShape) {
    case CurveSegmentShape::Hold:
      return 0.0;
    case CurveSegmentShape::Linear:
      return mYc * mInvSpan * static_cast<double>(kTicksPerSecond);
    case CurveSegmentShape::Bezier:
      break;
  }
  return BezierVelocity(SolveForU(NormalisedTime(time), inverse));
}
