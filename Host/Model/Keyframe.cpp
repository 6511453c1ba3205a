#include "Host/Model/Keyframe.h"

#include <algorithm>
#include <cmath>

namespace {

double SafeInfluence(double influence) {
  if (std::isnan(influence)) {
    return kDefaultInfluence;
  }
  return std::clamp(influence, 0.0, kMaximumInfluence);
}

// Seconds from one time to another, without overflowing when they lie far apart.
double SecondsBetween(TickTime from, TickTime to) {
  return (static_cast<double>(to) - static_cast<double>(from)) /
         static_cast<double>(kTicksPerSecond);
}

}  // namespace

std::optional<TemporalInterpolation> TemporalInterpolationFromCode(int code) {
  if (code < 0 || code > 4) {
    return std::nullopt;
  }
  return static_cast<TemporalInterpolation>(code);
}

std::optional<SpatialInterpolation> SpatialInterpolationFromCode(int code) {
  if (code < 1 || code > 4) {
    return std::nullopt;
  }
  return static_cast<SpatialInterpolation>(code);
}

const char* ToString(TemporalInterpolation mode) {
  switch (mode) {
    case TemporalInterpolation::Hold:
      return "hold";
    case TemporalInterpolation::Linear:
      return "linear";
    case TemporalInterpolation::Bezier:
      return "bezier";
    case TemporalInterpolation::ContinuousBezier:
      return "continuous bezier";
    case TemporalInterpolation::AutoBezier:
      return "auto bezier";
  }
  return "unknown";
}

const char* ToString(SpatialInterpolation mode) {
  switch (mode) {
    case SpatialInterpolation::Linear:
      return "linear";
    case SpatialInterpolation::Bezier:
      return "bezier";
    case SpatialInterpolation::ContinuousBezier:
      return "continuous bezier";
    case SpatialInterpolation::AutoBezier:
      return "auto bezier";
  }
  return "unknown";
}

bool IsCurved(TemporalInterpolation mode) {
  return mode == TemporalInterpolation::Bezier || mode == TemporalInterpolation::ContinuousBezier ||
         mode == TemporalInterpolation::AutoBezier;
}

std::optional<TickTime> Keyframe::GetEaseInTime(TickTime previousTime) const {
  if (!(previousTime < time)) {
    return std::nullopt;
  }
  // The difference of two 64-bit times may not fit; the handle lies within it, so work in
  // unsigned arithmetic where wrap-around is defined and the result is in range.
  const auto span = static_cast<std::uint64_t>(time) - static_cast<std::uint64_t>(previousTime);
  const auto offset = static_cast<std::uint64_t>(
      std::llround(static_cast<double>(span) * SafeInfluence(inInfluence) * 0.5));
  return static_cast<TickTime>(static_cast<std::uint64_t>(time) - std::min(offset, span));
}

std::optional<TickTime> Keyframe::GetEaseOutTime(TickTime nextTime) const {
  if (!(nextTime > time)) {
    return std::nullopt;
  }
  const auto span = static_cast<std::uint64_t>(nextTime) - static_cast<std::uint64_t>(time);
  const auto offset = static_cast<std::uint64_t>(
      std::llround(static_cast<double>(span) * SafeInfluence(outInfluence) * 0.5));
  return static_cast<TickTime>(static_cast<std::uint64_t>(time) + std::min(offset, span));
}

std::optional<double> Keyframe::GetEaseInValue(TickTime handleTime) const {
  const std::optional<double> v = AsScalar(value);
  if (!v) {
    return std::nullopt;
  }
  return *v - SecondsBetween(handleTime, time) * inSpeed;
}

std::optional<double> Keyframe::GetEaseOutValue(TickTime handleTime) const {
  const std::optional<double> v = AsScalar(value);
  if (!v) {
    return std::nullopt;
  }
  return *v + SecondsBetween(time, handleTime) * outSpeed;
}
