#pragma once

// Small helpers shared by the keyframe curve tests.

#include <cmath>
#include <cstdint>
#include <optional>
#include <string>

#include "Host/Model/KeyframeCurve.h"

namespace curvetest {

constexpr TickTime kSecond = kTicksPerSecond;

inline Keyframe Key(TickTime time, ParamValue value,
                    TemporalInterpolation mode = TemporalInterpolation::Linear) {
  Keyframe key;
  key.time = time;
  key.value = std::move(value);
  key.interpolation = mode;
  return key;
}

inline Keyframe Eased(TickTime time, double value, double inSpeed, double outSpeed,
                      double inInfluence = kDefaultInfluence,
                      double outInfluence = kDefaultInfluence) {
  Keyframe key = Key(time, value, TemporalInterpolation::Bezier);
  key.inSpeed = inSpeed;
  key.outSpeed = outSpeed;
  key.inInfluence = inInfluence;
  key.outInfluence = outInfluence;
  return key;
}

inline double Scalar(const KeyframeCurve& curve, TickTime time) {
  return curve.ScalarAt(time).value_or(std::nan(""));
}

// Deterministic pseudo-random numbers for randomised cases.
class Random {
 public:
  explicit Random(std::uint32_t seed) : mState(seed) {}
  double Uniform(double lo, double hi) {
    mState = mState * 1664525u + 1013904223u;
    return lo + (hi - lo) * static_cast<double>(mState >> 8) / static_cast<double>(1u << 24);
  }
  int Below(int n) { return static_cast<int>(Uniform(0.0, n)) % n; }

 private:
  std::uint32_t mState;
};

// The value of a scalar curve computed from the keyframes alone, independently of the curve's own
// segment code: the segment's control points from the keyframes' speeds and influences (straight
// sides on the line at a third), time solved by plain bisection.
inline double ReferenceValue(const KeyframeCurve& curve, TickTime time) {
  const auto& keys = curve.Keyframes();
  if (time <= keys.front().time) {
    return *AsScalar(keys.front().value);
  }
  if (time >= keys.back().time) {
    return *AsScalar(keys.back().value);
  }
  std::size_t k = 0;
  while (keys[k + 1].time <= time) {
    ++k;
  }
  const Keyframe& a = keys[k];
  const Keyframe& b = keys[k + 1];
  const double v0 = *AsScalar(a.value);
  const double v3 = *AsScalar(b.value);
  if (a.interpolation == TemporalInterpolation::Hold || !Interpolates(KindOf(a.value))) {
    return v0;
  }
  const double span = static_cast<double>(b.time - a.time);
  const double s = static_cast<double>(time - a.time) / span;
  const bool straightOut = a.interpolation == TemporalInterpolation::Linear;
  const bool straightIn = b.interpolation == TemporalInterpolation::Linear ||
                          b.interpolation == TemporalInterpolation::Hold;
  if (straightOut && straightIn) {
    return v0 + (v3 - v0) * s;
  }
  const double seconds = span / static_cast<double>(kTicksPerSecond);
  const double slope = (v3 - v0) / seconds;
  const double x1 = (straightOut ? kDefaultInfluence : a.outInfluence) / 2.0;
  const double x2 = 1.0 - (straightIn ? kDefaultInfluence : b.inInfluence) / 2.0;
  const double y1 = v0 + x1 * seconds * (straightOut ? slope : a.outSpeed);
  const double y2 = v3 - (1.0 - x2) * seconds * (straightIn ? slope : b.inSpeed);
  auto bezier = [](double p0, double p1, double p2, double p3, double u) {
    const double w = 1.0 - u;
    return w * w * w * p0 + 3 * w * w * u * p1 + 3 * w * u * u * p2 + u * u * u * p3;
  };
  double lo = 0.0;
  double hi = 1.0;
  for (int i = 0; i < 200; ++i) {
    const double mid = 0.5 * (lo + hi);
    (bezier(0.0, x1, x2, 1.0, mid) < s ? lo : hi) = mid;
  }
  return bezier(v0, y1, y2, v3, 0.5 * (lo + hi));
}

// A scalar curve of `count` keyframes one second apart with every temporal mode, random values,
// speeds and influences.
inline KeyframeCurve RandomCurve(Random& random, int count) {
  KeyframeCurve curve;
  for (int i = 0; i < count; ++i) {
    Keyframe key = Eased(i * kSecond + static_cast<TickTime>(random.Uniform(0, 0.5) * kSecond),
                         random.Uniform(-100, 100), random.Uniform(-300, 300),
                         random.Uniform(-300, 300), random.Uniform(0, 1), random.Uniform(0, 1));
    key.interpolation = *TemporalInterpolationFromCode(random.Below(5));
    curve.Add(key);
  }
  return curve;
}

}  // namespace curvetest
