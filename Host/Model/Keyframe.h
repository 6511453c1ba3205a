#pragma once

#include <cstdint>
#include <optional>

#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// How the value travels in time, with the host's codes. A keyframe has one temporal mode that
// governs both of its sides: the segment after a Hold keyframe keeps its value until the next
// keyframe; the other modes shape the segment through the speeds and influences below.
enum class TemporalInterpolation : std::uint8_t {
  Hold = 0,
  Linear = 1,
  Bezier = 2,            // incoming and outgoing speeds independent
  ContinuousBezier = 3,  // incoming speed == outgoing speed (smooth through the keyframe)
  AutoBezier = 4,        // speeds derived from the neighbours, kept up to date on every edit
};

// How a point value travels in space between keyframes (point parameters only).
enum class SpatialInterpolation : std::uint8_t {
  Linear = 1,            // straight path; tangents zero
  Bezier = 2,            // tangents independent
  ContinuousBezier = 3,  // tangents opposite in direction, lengths independent
  AutoBezier = 4,        // tangents derived from the neighbours
};

// Which side of a keyframe: In (0) faces the previous keyframe, Out (1) the next.
enum class KeyframeSide : std::uint8_t { In = 0, Out = 1 };

std::optional<TemporalInterpolation> TemporalInterpolationFromCode(int code);
std::optional<SpatialInterpolation> SpatialInterpolationFromCode(int code);
const char* ToString(TemporalInterpolation mode);
const char* ToString(SpatialInterpolation mode);
// Bezier, ContinuousBezier or AutoBezier.
bool IsCurved(TemporalInterpolation mode);

// Influence is the fraction of the half of a segment that a handle reaches: the control point of
// the outgoing side lies at p + (r - p) * influence / 2. So the two handles of a segment never
// cross and time always advances along the curve. The default puts the control point a third of
// the way along the segment, where a straight line would have it. KeyframeCurve keeps influences
// to float precision (ample for a handle), so these constants are floats too.
inline constexpr double kDefaultInfluence = 2.0f / 3.0f;
inline constexpr double kMinimumInfluence = 0.002f;  // 0.1 % of a segment
inline constexpr double kMaximumInfluence = 1.0;

// One keyframe of one parameter; a plain value. KeyframeCurve keeps a list of them ordered by time
// and keeps the derived fields (the speeds of Linear, Hold and AutoBezier keyframes, the tangents
// of spatial AutoBezier and Linear keyframes) up to date, so the fields always describe the curve
// that is drawn.
struct Keyframe {
  TickTime time = kTime_Zero;  // clip time
  ParamValue value = 0.0;
  TemporalInterpolation interpolation = TemporalInterpolation::Linear;
  SpatialInterpolation spatial = SpatialInterpolation::Linear;  // point values only

  // Speeds are in value units per second: the slope of the value curve at the keyframe for
  // scalars; for points and colours the speed along the path (never negative).
  double inSpeed = 0.0;
  double inInfluence = kDefaultInfluence;
  double outSpeed = 0.0;
  double outInfluence = kDefaultInfluence;

  // Spatial control points of a point value, relative to the value: the path towards the previous
  // keyframe leaves along inTangent, the one towards the next along outTangent.
  ParamPoint inTangent;
  ParamPoint outTangent;

  // Time of the incoming handle given the previous keyframe's time: p - (p - q) * inInfluence / 2.
  // nullopt unless previousTime < time.
  std::optional<TickTime> GetEaseInTime(TickTime previousTime) const;
  // Time of the outgoing handle given the next keyframe's time: p + (r - p) * outInfluence / 2.
  // nullopt unless nextTime > time.
  std::optional<TickTime> GetEaseOutTime(TickTime nextTime) const;
  // Value of the incoming handle at a handle time: v - (p - handleTime in seconds) * inSpeed.
  // nullopt unless the value is a scalar (AsScalar).
  std::optional<double> GetEaseInValue(TickTime handleTime) const;
  // Value of the outgoing handle: v + (handleTime - p in seconds) * outSpeed.
  std::optional<double> GetEaseOutValue(TickTime handleTime) const;

  friend bool operator==(const Keyframe&, const Keyframe&) = default;
};
