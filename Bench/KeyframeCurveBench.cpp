// Sampling a Bezier parameter pixel by pixel, as a value graph does, beside the cost of evaluating
// one cubic polynomial the same number of times.
#include <benchmark/benchmark.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "Host/Model/KeyframeCurve.h"

namespace {

constexpr int kPixels = 4000;

// A curve of `count` keyframes one second apart mixing Bezier, continuous and auto keyframes with
// unequal speeds and influences, so that every segment needs a real solve.
KeyframeCurve MakeCurve(int count) {
  KeyframeCurve curve;
  std::uint32_t state = 12345;
  auto next = [&state] {
    state = state * 1664525u + 1013904223u;
    return static_cast<double>(state >> 8) / static_cast<double>(1u << 24);
  };
  for (int i = 0; i < count; ++i) {
    Keyframe key;
    key.time = static_cast<TickTime>(i) * kTicksPerSecond;
    key.value = 100.0 * next();
    switch (i % 3) {
      case 0:
        key.interpolation = TemporalInterpolation::Bezier;
        break;
      case 1:
        key.interpolation = TemporalInterpolation::ContinuousBezier;
        break;
      default:
        key.interpolation = TemporalInterpolation::AutoBezier;
        break;
    }
    key.inSpeed = 200.0 * next() - 100.0;
    key.outSpeed = key.interpolation == TemporalInterpolation::ContinuousBezier
                       ? key.inSpeed
                       : 200.0 * next() - 100.0;
    key.inInfluence = 0.1 + 0.9 * next();
    key.outInfluence = 0.1 + 0.9 * next();
    curve.Add(key);
  }
  return curve;
}

std::vector<TickTime> PixelTimes(const KeyframeCurve& curve) {
  const TickTime first = curve.At(0).time;
  const TickTime last = curve.At(curve.Size() - 1).time;
  std::vector<TickTime> times(kPixels);
  const double perPixel = static_cast<double>(last - first) / (kPixels - 1);
  for (int x = 0; x < kPixels; ++x) {
    times[x] = first + static_cast<TickTime>(std::floor(perPixel * x));
  }
  return times;
}

void BM_SampleBezierCurve(benchmark::State& state) {
  const KeyframeCurve curve = MakeCurve(static_cast<int>(state.range(0)));
  const std::vector<TickTime> times = PixelTimes(curve);
  for (auto _ : state) {
    KeyframeCurve::Sampler sampler(curve);
    for (const TickTime t : times) {
      double value = sampler.ScalarAt(t).value_or(0.0);
      benchmark::DoNotOptimize(value);
    }
  }
  state.SetItemsProcessed(state.iterations() * kPixels);
}
BENCHMARK(BM_SampleBezierCurve)->Arg(50)->Arg(5000);

// As a value graph samples: the whole row of pixels in one call.
void BM_SampleBezierCurveRow(benchmark::State& state) {
  const KeyframeCurve curve = MakeCurve(static_cast<int>(state.range(0)));
  const std::vector<TickTime> times = PixelTimes(curve);
  std::vector<double> values(times.size());
  for (auto _ : state) {
    KeyframeCurve::Sampler sampler(curve);
    sampler.ScalarsAt(times, values);
    benchmark::DoNotOptimize(values.data());
    benchmark::ClobberMemory();
  }
  state.SetItemsProcessed(state.iterations() * kPixels);
}
BENCHMARK(BM_SampleBezierCurveRow)->Arg(50)->Arg(5000);

// Without the cursor: every pixel searches the keyframes from scratch.
void BM_ValueAtWithoutSampler(benchmark::State& state) {
  const KeyframeCurve curve = MakeCurve(static_cast<int>(state.range(0)));
  const std::vector<TickTime> times = PixelTimes(curve);
  for (auto _ : state) {
    for (const TickTime t : times) {
      double value = curve.ScalarAt(t).value_or(0.0);
      benchmark::DoNotOptimize(value);
    }
  }
  state.SetItemsProcessed(state.iterations() * kPixels);
}
BENCHMARK(BM_ValueAtWithoutSampler)->Arg(50)->Arg(5000);

// The baseline: one cubic polynomial, evaluated by Horner's rule at the same number of points.
void BM_BaselineCubicPolynomial(benchmark::State& state) {
  std::vector<double> points(kPixels);
  for (int x = 0; x < kPixels; ++x) {
    points[x] = static_cast<double>(x) / (kPixels - 1);
  }
  // Coefficients read at run time, so the compiler cannot fold the polynomial.
  const std::vector<double> coefficients = {0.3 + points[1], -1.2, 2.0, 0.5};
  const double a = coefficients[0];
  const double b = coefficients[1];
  const double c = coefficients[2];
  const double d = coefficients[3];
  for (auto _ : state) {
    for (const double u : points) {
      double value = ((a * u + b) * u + c) * u + d;
      benchmark::DoNotOptimize(value);
    }
  }
  state.SetItemsProcessed(state.iterations() * kPixels);
}
BENCHMARK(BM_BaselineCubicPolynomial);

}  // namespace
