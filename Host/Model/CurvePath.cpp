#include "Host/Model/CurvePath.h"

#include <algorithm>
#include <cmath>

namespace {

ParamPoint Derivative(const CurvePath& path, double u) {
  const double v = 1.0 - u;
  const double a = 3.0 * v * v;
  const double b = 6.0 * v * u;
  const double c = 3.0 * u * u;
  return {a * (path.p1.x - path.p0.x) + b * (path.p2.x - path.p1.x) + c * (path.p3.x - path.p2.x),
          a * (path.p1.y - path.p0.y) + b * (path.p2.y - path.p1.y) + c * (path.p3.y - path.p2.y)};
}

double Speed(const CurvePath& path, double u) {
  const ParamPoint d = Derivative(path, u);
  return std::hypot(d.x, d.y);
}

}  // namespace

double CurvePath::Build(ParamPoint a, ParamPoint b, ParamPoint c, ParamPoint d) {
  p0 = a;
  p1 = b;
  p2 = c;
  p3 = d;
  // Three-point Gauss-Legendre per step: exact for the polynomial part of the speed, and far
  // below a pixel of error for the rest at 32 steps.
  static constexpr double kNode = 0.7745966692414834;  // sqrt(3/5)
  const double h = 1.0 / kSteps;
  arc[0] = 0.0;
  for (int i = 0; i < kSteps; ++i) {
    const double mid = (i + 0.5) * h;
    const double half = 0.5 * h;
    const double piece =
        half * (5.0 / 9.0 * Speed(*this, mid - kNode * half) + 8.0 / 9.0 * Speed(*this, mid) +
                5.0 / 9.0 * Speed(*this, mid + kNode * half));
    arc[i + 1] = arc[i] + piece;
  }
  return arc[kSteps];
}

ParamPoint CurvePath::PointAt(double u) const {
  const double v = 1.0 - u;
  const double a = v * v * v;
  const double b = 3.0 * v * v * u;
  const double c = 3.0 * v * u * u;
  const double d = u * u * u;
  return {a * p0.x + b * p1.x + c * p2.x + d * p3.x, a * p0.y + b * p1.y + c * p2.y + d * p3.y};
}

ParamPoint CurvePath::PointAtDistance(double distance) const {
  if (!(distance > 0.0)) {
    return p0;
  }
  if (distance >= arc[kSteps]) {
    return p3;
  }
  const auto it = std::upper_bound(arc.begin(), arc.end(), distance);
  const auto i = static_cast<int>(it - arc.begin()) - 1;
  const double width = arc[i + 1] - arc[i];
  const double f = width > 0.0 ? (distance - arc[i]) / width : 0.0;
  return PointAt((i + f) / kSteps);
}
