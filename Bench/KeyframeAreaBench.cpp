// The keyframe area's per-event work on large projects, each beside the baseline its goal is
// stated against, so both figures come from the same run:
//   - hit-testing one point over a row of 100,000 keyframes, beside one std::lower_bound over
//     100,000 times (goal: at most 3 times the lower_bound);
//   - a marquee's selection of a small rectangle over 100 rows of 1,000 keyframes, beside a
//     linear scan of all 100,000 keyframe times (goal: at most 0.05 times the scan);
//   - one mouse move of a snapping drag of 1,000 selected keyframes over 100,000 snap targets:
//     the snap lookup and the live move of the keyframes (goal: at most 50 microseconds).
#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <vector>

#include "Handlers/EffectControls/Src/KeyframeMarquee.h"
#include "Handlers/EffectControls/Src/KeyframeSnapSet.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Time/FrameRate.h"

namespace {

constexpr int kRowKeyframes = 100000;
constexpr int kQueries = 1024;
// One pixel lasts one frame at 25 fps; keyframes lie 2.5 pixels apart.
constexpr TickTime kPixel = kTicksPerSecond / 25;
constexpr TickTime kSpacing = kPixel * 5 / 2;

ComponentParamRef MakeParam(int keyframes, TickTime spacing, TickTime offset = 0) {
  ComponentParamRef param = ComponentParam::Create("Opacity", ParamType::FloatSlider, 100.0);
  ComponentParam::State state = param->GetState();
  state.timeVarying = true;
  for (int i = 0; i < keyframes; ++i) {
    Keyframe key;
    key.time = offset + static_cast<TickTime>(i) * spacing;
    key.value = static_cast<double>(i % 100);
    state.keyframes.Add(key);
  }
  param->ApplyState(std::move(state));
  return param;
}

// A parameter row as the keyframe area hit-tests it; it shows no controls.
class BenchRow : public ParameterControl {
 public:
  explicit BenchRow(const ParameterControlInfo& info) : ParameterControl(info) {}
  void SynchToCurrentTime() override {}
};

// Points spread over the visible part of the row, each near a keyframe or between two.
std::vector<int> QueryPixels() {
  std::vector<int> xs(kQueries);
  std::uint32_t state = 7;
  for (int& x : xs) {
    state = state * 1664525u + 1013904223u;
    x = static_cast<int>((state >> 8) % 2000);
  }
  return xs;
}

void BM_HitTestRowOf100000Keyframes(benchmark::State& state) {
  ParameterControlInfo info;
  info.param = MakeParam(kRowKeyframes, kSpacing);
  BenchRow row(info);
  const FrameRate rate = *FrameRate::FromTicksPerFrame(kPixel);
  // The view shows the middle of the row.
  const TickTime origin = static_cast<TickTime>(kRowKeyframes / 2) * kSpacing;
  const std::vector<int> xs = QueryPixels();
  std::size_t i = 0;
  for (auto _ : state) {
    TickTime hit = 0;
    benchmark::DoNotOptimize(row.HitKeyframe(Point{xs[i++ % kQueries], 10}, origin, rate, hit));
    benchmark::DoNotOptimize(hit);
  }
}
BENCHMARK(BM_HitTestRowOf100000Keyframes);

void BM_LowerBoundOver100000Times(benchmark::State& state) {
  std::vector<TickTime> times(kRowKeyframes);
  for (int i = 0; i < kRowKeyframes; ++i) {
    times[i] = static_cast<TickTime>(i) * kSpacing;
  }
  const TickTime origin = static_cast<TickTime>(kRowKeyframes / 2) * kSpacing;
  const std::vector<int> xs = QueryPixels();
  std::size_t i = 0;
  for (auto _ : state) {
    const TickTime time = origin + xs[i++ % kQueries] * kPixel;
    benchmark::DoNotOptimize(std::lower_bound(times.begin(), times.end(), time));
  }
}
BENCHMARK(BM_LowerBoundOver100000Times);

constexpr int kMarqueeRows = 100;
constexpr int kMarqueeKeyframes = 1000;
constexpr int kTrackHeight = 20;

struct MarqueeScene {
  MarqueeScene() {
    for (int row = 0; row < kMarqueeRows; ++row) {
      // Each row's keyframes start a little later, so a span catches different ones per row.
      tracks.push_back(KeyframeMarquee::Track{
          .top = row * kTrackHeight,
          .bottom = (row + 1) * kTrackHeight,
          .trackItem = nullptr,
          .component = nullptr,
          .param = MakeParam(kMarqueeKeyframes, kSpacing, row * kPixel),
      });
    }
  }
  std::vector<KeyframeMarquee::Track> tracks;
  // Two rows deep, 20 pixels wide, in the middle of the scene.
  static constexpr int kTop = 49 * kTrackHeight + 5;
  static constexpr int kBottom = 50 * kTrackHeight + 5;
  static constexpr TickTime kFirst = 500 * kSpacing;
  static constexpr TickTime kLast = kFirst + 20 * kPixel;
};

void BM_MarqueeSmallRectangleOver100Rows(benchmark::State& state) {
  const MarqueeScene scene;
  for (auto _ : state) {
    KeyframeMultiSelection found;
    KeyframeMarquee::Collect(scene.tracks, MarqueeScene::kTop, MarqueeScene::kBottom,
                             MarqueeScene::kFirst, MarqueeScene::kLast, found);
    benchmark::DoNotOptimize(found.GetAllSelections().size());
  }
  KeyframeMultiSelection found;
  KeyframeMarquee::Collect(scene.tracks, MarqueeScene::kTop, MarqueeScene::kBottom,
                           MarqueeScene::kFirst, MarqueeScene::kLast, found);
  state.counters["selected"] = static_cast<double>(found.GetKeyframeCount());
}
BENCHMARK(BM_MarqueeSmallRectangleOver100Rows);

void BM_LinearScanOf100000KeyframeTimes(benchmark::State& state) {
  const MarqueeScene scene;
  for (auto _ : state) {
    std::size_t inside = 0;
    for (const auto& track : scene.tracks) {
      for (const Keyframe& key : track.param->GetKeyframes().Keyframes()) {
        inside += (key.time >= MarqueeScene::kFirst && key.time <= MarqueeScene::kLast) ? 1 : 0;
      }
    }
    benchmark::DoNotOptimize(inside);
  }
}
BENCHMARK(BM_LinearScanOf100000KeyframeTimes);

void BM_SnappingDragMoveOf1000KeyframesOver100000Targets(benchmark::State& state) {
  // The dragged row: 1,000 keyframes, all selected. The snap targets: 100,000 other times.
  const ComponentParamRef dragged = MakeParam(1000, kSpacing * 100);
  auto selection = std::make_shared<KeyframeMultiSelection>();
  selection->AddAllItems(nullptr, nullptr, dragged);
  KeyframeSnapSet snaps;
  for (int i = 0; i < kRowKeyframes; ++i) {
    snaps.Add(static_cast<TickTime>(i) * kSpacing + kPixel / 3);
  }
  KeyframeMultiSelectionActor actor(nullptr, selection);
  const TickTime anchor = 500 * kSpacing * 100;
  const TickTime tolerance = 6 * kPixel;
  int step = 0;
  for (auto _ : state) {
    // Back and forth by a few pixels, as a hand does.
    const TickTime pointer = anchor + ((step++ % 8) - 4) * kPixel;
    const TickTime target = snaps.Snap(pointer, tolerance).value_or(pointer);
    benchmark::DoNotOptimize(actor.MoveSelectionTo(target - anchor));
  }
  actor.RollbackMoveSelection();
}
BENCHMARK(BM_SnappingDragMoveOf1000KeyframesOver100000Targets)->Unit(benchmark::kMicrosecond);

}  // namespace
