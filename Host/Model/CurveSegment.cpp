#include "Host/Model/CurveSegment.h"

void CurveSegment::SetSpan(TickTime start, TickTime end) {
  mStart = start;
  mEnd = end;
  mInvSpan = 1.0 / static_cast<double>(end - start);
}

void CurveSegment::MakeHold(TickTime start, TickTime end, double y0, double y3) {
  SetSpan(start, end);
  mShape = CurveSegmentShape::Hold;
  mXa = mXb = 0.0;
  mXc = 1.0;
  mHalfMaxCurvature = 0.0;
  mYa = mYb = mYc = 0.0;
  mY0 = y0;
  mY3 = y3;
}

void CurveSegment::MakeLinear(TickTime start, TickTime end, double y0, double y3) {
  MakeHold(start, end, y0, y3);
  mShape = CurveSegmentShape::Linear;
  mYc = y3 - y0;
}

void CurveSegment::MakeBezier(TickTime start, TickTime end, double y0, double y1, double y2,
                              double y3, double x1, double x2) {
  SetSpan(start, end);
  mShape = CurveSegmentShape::Bezier;
  mXc = 3.0 * x1;
  mXb = 3.0 * (x2 - 2.0 * x1);
  mXa = 1.0 + 3.0 * (x1 - x2);
  // s''(u) = 6 xa u + 2 xb is linear, so its largest magnitude is at an end.
  mHalfMaxCurvature = 0.5 * std::max(std::fabs(2.0 * mXb), std::fabs(6.0 * mXa + 2.0 * mXb));
  mYc = 3.0 * (y1 - y0);
  mYb = 3.0 * (y0 - 2.0 * y1 + y2);
  mYa = y3 - y0 + 3.0 * (y1 - y2);
  mY0 = y0;
  mY3 = y3;
  BuildInverse();
}

double CurveSegment::BezierVelocity(double u) const {
  return SlopeY(u) / SlopeX(u) * mInvSpan * static_cast<double>(kTicksPerSecond);
}

// Halley's method inside a shrinking bracket, bisecting whenever a step would leave it.
double CurveSegment::BracketedSolve(double s, double u) const {
  const double tolerance = Tolerance();
  double lo = 0.0;
  double hi = 1.0;
  for (int i = 0; i < 200; ++i) {
    const double x = PolyX(u) - s;
    if (std::fabs(x) <= tolerance) {
      return u;
    }
    if (x > 0.0) {
      hi = u;
    } else {
      lo = u;
    }
    const double d1 = SlopeX(u);
    const double d2 = 6.0 * mXa * u + 2.0 * mXb;
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
void CurveSegment::BuildInverse() {
  constexpr double kPiece = 1.0 / kInverseSteps;
  double u0 = 0.0;
  double m0 = kPiece / SlopeX(0.0);
  for (int i = 0; i < kInverseSteps; ++i) {
    const double s1 = static_cast<double>(i + 1) / kInverseSteps;
    const double u1 = i + 1 == kInverseSteps ? 1.0 : BracketedSolve(s1, s1);
    const double m1 = kPiece / SlopeX(u1);
    float* c = mInverse[i];
    c[0] = static_cast<float>(u0);
    c[1] = static_cast<float>(m0);
    c[2] = static_cast<float>(3.0 * (u1 - u0) - 2.0 * m0 - m1);
    c[3] = static_cast<float>(2.0 * (u0 - u1) + m0 + m1);
    u0 = u1;
    m0 = m1;
  }
}

void CurveSegment::VelocityRange(TickTime from, TickTime to, double* minimum,
                                 double* maximum) const {
  if (mShape != CurveSegmentShape::Bezier) {
    *minimum = *maximum = VelocityAt(mStart);
    return;
  }
  const double ua = SolveForU(NormalisedTime(std::max(from, mStart)));
  const double ub = SolveForU(NormalisedTime(std::min(to, mEnd)));
  *minimum = std::min(BezierVelocity(ua), BezierVelocity(ub));
  *maximum = std::max(BezierVelocity(ua), BezierVelocity(ub));
  // Turning points of y'(u) / x'(u): y''x' - y'x'' = 0 is a quadratic (the cubic terms cancel).
  const double qa = 6.0 * (mYa * mXb - mYb * mXa);
  const double qb = 6.0 * (mYa * mXc - mYc * mXa);
  const double qc = 2.0 * (mYb * mXc - mYc * mXb);
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
