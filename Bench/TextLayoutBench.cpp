// The panel's header naming a clip with a short name, a name just too long for the row, and a
// name of 10 MB: setting the clip, painting the header, and the elided layout it draws through.
// Beyond setting the clip (which copies the name), a name of 10 MB should cost what any name
// that fills the row does.
#include <benchmark/benchmark.h>

#include <memory>
#include <string>

#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Image.h"

namespace {

constexpr int kHeaderWidth = 600;
constexpr int kHeaderHeight = 34;

std::string ClipName(const benchmark::State& state) {
  switch (state.range(0)) {
    case 0:
      return "Beach.mov";
    case 1:
      return std::string(200, 'x');
    default:
      return std::string(10'000'000, 'x');
  }
}

void Label(benchmark::State& state) {
  static constexpr const char* kLabels[] = {"short name", "200-character name", "10 MB name"};
  state.SetLabel(kLabels[state.range(0)]);
}

// A clip in a sequence, named by the benchmark's argument, and a header showing it.
struct HeaderScene {
  explicit HeaderScene(const std::string& name) {
    project = Project::Create("Bench");
    sequence = Sequence::Create("Edit", kFrameRate_25);
    project->AddSequence(sequence);
    const TrackRef track = Track::Create(MediaType::Video, "V1");
    sequence->AddTrack(track);
    const MasterClipRef master =
        MasterClip::Create(name, Media::Create(name, 600 * kTicksPerSecond, true, true));
    project->AddMasterClip(master);
    clip = TrackItem::CreateClip(MediaType::Video, 0, 10 * kTicksPerSecond, master);
    clip->SetName(name);
    track->AddItem(clip);
    header = std::make_shared<EffectControlsListHeader>();
    header->FinishCreate();
    header->SetBounds(Rect::FromSize(0, 0, kHeaderWidth, kHeaderHeight));
  }
  ~HeaderScene() { header->Destroy(); }

  MessagingTestScope scope;
  ProjectRef project;
  SequenceRef sequence;
  TrackItemRef clip;
  std::shared_ptr<EffectControlsListHeader> header;
};

void BM_HeaderSetClip(benchmark::State& state) {
  HeaderScene scene(ClipName(state));
  for (auto _ : state) {
    scene.header->SetClip(scene.sequence, scene.clip);
    benchmark::ClobberMemory();
  }
  Label(state);
}
BENCHMARK(BM_HeaderSetClip)->DenseRange(0, 2)->Unit(benchmark::kMicrosecond);

void BM_HeaderPaint(benchmark::State& state) {
  HeaderScene scene(ClipName(state));
  scene.header->SetClip(scene.sequence, scene.clip);
  Image image(Size{kHeaderWidth, kHeaderHeight});
  for (auto _ : state) {
    DC dc(image);
    scene.header->PaintSelf(dc);
    benchmark::ClobberMemory();
  }
  Label(state);
}
BENCHMARK(BM_HeaderPaint)->DenseRange(0, 2)->Unit(benchmark::kMicrosecond);

// What one group's text costs per paint: a cached elided layout.
void BM_ElidedLayoutLookup(benchmark::State& state) {
  const std::string text = "Edit * " + ClipName(state);
  const Font font;
  for (auto _ : state) {
    benchmark::DoNotOptimize(font.GetLayout(text, 280));
  }
  Label(state);
}
BENCHMARK(BM_ElidedLayoutLookup)->DenseRange(0, 2)->Unit(benchmark::kMicrosecond);

// The first layout of a text, as when a clip is selected: built from an empty cache each time.
void BM_ElidedLayoutBuild(benchmark::State& state) {
  const std::string text = "Edit * " + ClipName(state);
  const Font font;
  for (auto _ : state) {
    Font::ClearLayoutCache();
    benchmark::DoNotOptimize(font.GetLayout(text, 280));
  }
  Label(state);
}
BENCHMARK(BM_ElidedLayoutBuild)->DenseRange(0, 2)->Unit(benchmark::kMicrosecond);

}  // namespace
