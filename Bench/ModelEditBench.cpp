// Costs of the model's edit paths that a user feels: one live step of a slider drag on a
// parameter with many keyframes (the panel repaints after each), committing it, and undoing and
// redoing a structural chain edit.

#include <benchmark/benchmark.h>

#include <utility>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ComponentParamActor.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

struct Fixture {
  Fixture() {
    project = Project::Create("Bench");
    SequenceRef sequence = Sequence::Create("S");
    project->AddSequence(sequence);
    TrackRef track = Track::Create(MediaType::Video);
    sequence->AddTrack(track);
    item = TrackItem::CreateClip(MediaType::Video, 0, 600 * kTicksPerSecond, nullptr);
    track->AddItem(item);
    for (const ComponentRef& c : EffectCatalogue::Standard().CreateIntrinsics(MediaType::Video)) {
      item->GetComponentChain()->Append(c);
    }
    for (int i = 0; i < 10; ++i) {
      ComponentChainActions::AddFilter(
          item->GetComponentChain(),
          *EffectCatalogue::Standard().FindTemplate(kMatchName_GaussianBlur));
    }
    param = item->GetComponentChain()->GetAt(3)->FindParam("Blurriness");
    project->GetUndoStack().Clear();
  }
  void AddKeyframes(int count) {
    ComponentParam::State state = param->GetState();
    state.timeVarying = true;
    for (int i = 0; i < count; ++i) {
      Keyframe keyframe;
      keyframe.time = i * kTicksPerSecond / 10;
      keyframe.value = i % 100 * 1.0;
      state.keyframes.Add(keyframe);
    }
    param->ApplyState(std::move(state));
  }

  MessagingTestScope messaging;
  ProjectRef project;
  TrackItemRef item;
  ComponentParamRef param;
};

void BM_LiveDragStep(benchmark::State& state) {
  Fixture f;
  f.AddKeyframes(static_cast<int>(state.range(0)));
  ComponentParamActor actor(f.param, kTicksPerSecond / 20);
  double value = 0.0;
  for (auto _ : state) {
    actor.SetValue(value);
    value = value > 90.0 ? 0.0 : value + 1.0;
  }
  actor.Rollback();
  state.SetComplexityN(state.range(0));
}
BENCHMARK(BM_LiveDragStep)->RangeMultiplier(10)->Range(10, 1000)->Complexity();

void BM_DragCommitAndUndo(benchmark::State& state) {
  Fixture f;
  f.AddKeyframes(static_cast<int>(state.range(0)));
  for (auto _ : state) {
    {
      ComponentParamActor actor(f.param, kTicksPerSecond / 20);
      actor.SetValue(42.0);
    }
    f.project->GetUndoStack().Undo();
  }
}
BENCHMARK(BM_DragCommitAndUndo)->Arg(10)->Arg(1000);

void BM_MoveFilterUndoRedo(benchmark::State& state) {
  Fixture f;
  const ComponentChainRef chain = f.item->GetComponentChain();
  for (auto _ : state) {
    ComponentChainActions::MoveFilters(chain, {chain->GetAt(chain->GetCount() - 1)}, nullptr);
    f.project->GetUndoStack().Undo();
    f.project->GetUndoStack().Redo();
  }
}
BENCHMARK(BM_MoveFilterUndoRedo);

}  // namespace
