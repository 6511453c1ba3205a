#pragma once

#include <array>

#include "Host/Model/ParamValue.h"

// Private to KeyframeCurve: a curved spatial path between two point keyframes, a cubic Bezier
// p0..p3, with a table of arc length so that a distance along the path maps to a position.
struct CurvePath {
  static constexpr int kSteps = 32;

  ParamPoint p0, p1, p2, p3;
  std::array<double, kSteps + 1> arc{};  // arc[i]: length from p0 to the point at u = i / kSteps

  // Builds the table; returns the whole length.
  double Build(ParamPoint a, ParamPoint b, ParamPoint c, ParamPoint d);
  ParamPoint PointAt(double u) const;
  // Position at distance `distance` from p0 along the path, limited to the path's ends.
  ParamPoint PointAtDistance(double distance) const;
};
