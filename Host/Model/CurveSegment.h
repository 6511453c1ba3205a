#pragma once

#include <cstdint>

#include "Host/Model/TickTime.h"

// Private to KeyframeCurve: the evaluation form of the segment between keyframes k and k + 1,
// rebuilt whenever one of the keyframes that shape it changes.
enum class CurveSegmentShape : std::uint8_t { Hold, Linear, Bezier };

struct CurveSegment {
  TickTime start = 0;
  TickTime end = 0;
  double span = 1.0;     // end - start in ticks
  double invSpan = 1.0;  // 1 / span
  CurveSegmentShape shape = CurveSegmentShape::Linear;

  // Bezier in (s, y) with s = (t - start) / span: s(u) = ((xa u + xb) u + xc) u, strictly rising
  // because 0 < x1 <= 1/2 <= x2 < 1; y(u) = ((ya u + yb) u + yc) u + yd.
  double x1 = 1.0 / 3.0;
  double x2 = 2.0 / 3.0;
  double xa = 0.0, xb = 0.0, xc = 1.0;
  double ya = 0.0, yb = 0.0, yc = 0.0, yd = 0.0;
  // End values of y: the two scalar values, or for points and colours the distance along the path
  // (0 to its length).
  double y0 = 0.0;
  double y3 = 0.0;

  // A point segment whose spatial path is curved (KeyframeCurve keeps its CurvePath at the same
  // index); false for a straight path.
  bool curvedPath = false;
};
