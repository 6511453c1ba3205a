#include "Host/Model/CurveSegment.h"

#include <limits>

static_assert(sizeof(CurveSegment) == 64, "a segment record is one cache line");

void CurveSegment::SetSpan(TickTime start, TickTime end) {
  mStart = start;
  mInvSpan = 1.0 / static_cast<double>(end - start);
}

void CurveSegment::MakeHold(TickTime start, TickTime end, double y0) {
  SetSpan(start, end);
  mShape = CurveSegmentShape::Hold;
  mOutReach = mInReach = 1.0f / 3.0f;
  mStepLimit = 0.0f;
  mYa = mYb = mYc = 0.0;
  mY0 = y0;
}

void CurveSegment::MakeLinear(TickTime start, TickTime end, double y0, double y3) {
  MakeHold(start, end, y0);
  mShape = CurveSegmentShape::Linear;
  mYc = y3 - y0;
}

void CurveSegment::MakeBezier(TickTime start, TickTime end, double y0, double y1, double y2,
                              double y3, float outReach, float inReach, CurveInverse& inverse) {
  SetSpan(start, end);
  mShape = CurveSegmentShape::Bezier;
  mOutReach = outReach;
  mInReach = inReach;
  mYc = 3.0 * (y1 - y0);
  mYb = 3.0 * (y0 - 2.0 * y1 + y2);
  mYa = y3 - y0 + 3.0 * (y1 - y2);
  mY0 = y0;
  const TimeCubic x = Time();
  const double halfMaxCurvature = std::max(std::fabs(x.b), std::fabs(3.0 * x.a + x.b));
  // Infinite when s(u) is a straight line; a limit beyond the floats is as good as infinite.
  const double limit = Tolerance() / halfMaxCurvature;
  if (limit >= static_cast<double>(std::numeric_limits<float>::max())) {
    mStepLimit = std::numeric_limits<float>::infinity();
  } else {
    mStepLimit = static_cast<float>(limit);
    if (static_cast<double>(mStepLimit) > limit) {
      mStepLimit = std::nextafter(mStepLimit, 0.0f);
    }
  }
  BuildInverse(inverse);
}

double CurveSegment::BezierVelocity(double u) const {
  return SlopeY(u) / Time().Slope(u) * mInvSpan * static_cast<double>(kTicksPerSecond);
}

// Halley's method inside a shrinking bracket, bisecting whenever a step would leave it.
double CurveSegment::BracketedSolve(double s, double u) const {
  const double tolerance = Tolerance();
  const TimeCubic cubic = Time();
  double lo = 0.0;
  double hi = 1.0;
  for (int i = 0; i < 200; ++i) {
    const double x = cubic.At(u) - s;
    if (std::fabs(x) <= tolerance) {
      return u;
    }
    if (x > 0.0) {
      hi = u;
    } else {
      lo = u;
    }
    const double d1 = cubic.Slope(u);
    const double d2 = cubic.Curvature(u);
    const double denominator = 2.0 * d1 * d1 - x * d2;
    double next = denominator != 0.0 ? u - 2.0 * x * d1 / denominator : 0.5 * (lo + hi);
    if (!(next > lo && next < hi)) {
      next = 0.5 * (lo + hi);
      if (next <= lo || next >= hi) {
        return u;  // the bracket cannot shrink any further
      }
    }
    u = next;
  }
  return u;
}

// Hermite pieces through the exact u and du/ds = 1 / s'(u) at the ends of each piece.
void CurveSegment::BuildInverse(CurveInverse& inverse) const {
  constexpr double kPiece = 1.0 / kInverseSteps;
  const TimeCubic cubic = Time();
  double u0 = 0.0;
  double m0 = kPiece / cubic.Slope(0.0);
  for (int i = 0; i < kInverseSteps; ++i) {
    const double s1 = static_cast<double>(i + 1) / kInverseSteps;
    const double u1 = i + 1 == kInverseSteps ? 1.0 : BracketedSolve(s1, s1);
    const double m1 = kPiece / cubic.Slope(u1);
    float* c = inverse.piece[i];
    c[0] = static_cast<float>(u0);
    c[1] = static_cast<float>(m0);
    c[2] = static_cast<float>(3.0 * (u1 - u0) - 2.0 * m0 - m1);
    c[3] = static_cast<float>(2.0 * (u0 - u1) + m0 + m1);
    u0 = u1;
    m0 = m1;
  }
}

void CurveSegment::VelocityRange(TickTime from, TickTime to, const CurveInverse& inverse,
                                 double* minimum, double* maximum) const {
  if (mShape != CurveSegmentShape::Bezier) {
    *minimum = *maximum = VelocityAt(mStart, inverse);
    return;
  }
  // Normalised times are limited to the segment.
  const double ua = SolveForU(NormalisedTime(from), inverse);
  const double ub = SolveForU(NormalisedTime(to), inverse);
  *minimum = std::min(BezierVelocity(ua), BezierVelocity(ub));
  *maximum = std::max(BezierVelocity(ua), BezierVelocity(ub));
  // Turning points of y'(u) / x'(u): y''x' - y'x'' = 0 is a quadratic (the cubic terms cancel).
  const TimeCubic x = Time();
  const double qa = 6.0 * (mYa * x.b - mYb * x.a);
  const double qb = 6.0 * (mYa * x.c - mYc * x.a);
  const double qc = 2.0 * (mYb * x.c - mYc * x.b);
  double roots[2];
  int count = 0;
  const double scale = std::max({std::fabs(qa), std::fabs(qb), std::fabs(qc)});
  if (scale == 0.0) {
    // The velocity is constant.
  } else if (std::fabs(qa) <= 1e-12 * scale) {
    if (qb != 0.0) {
      roots[count++] = -qc / qb;
    }
  } else {
    const double discriminant = qb * qb - 4.0 * qa * qc;
    if (discriminant >= 0.0) {
      const double q = -0.5 * (qb + std::copysign(std::sqrt(discriminant), qb));
      roots[count++] = q / qa;
      if (q != 0.0) {
        roots[count++] = qc / q;
      }
    }
  }
  for (int i = 0; i < count; ++i) {
    if (roots[i] > ua && roots[i] < ub) {
      const double v = BezierVelocity(roots[i]);
      *minimum = std::min(*minimum, v);
      *maximum = std::max(*maximum, v);
    }
  }
}
