#include "Host/Model/KeyframeMultiSelectionActor.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/TimePoint.h"

namespace {

struct ClipBounds {
  TickTime first = kTime_Min + 1;
  TickTime last = kTime_Max - 1;
  TickTime frame = kFrameRate_25.GetTicksPerFrame();  // one frame in clip ticks
};

ClipBounds BoundsFor(const KeyframeSelection& selection, const Sequence* sequence) {
  ClipBounds bounds;
  if (sequence) {
    bounds.frame = sequence->GetVideoFrameRate().GetTicksPerFrame();
  }
  if (const TrackItem* item = selection.GetTrackItem().get()) {
    bounds.first = item->SequenceTimeToClipTime(SequenceTime(item->GetStart())).Ticks();
    bounds.last = item->SequenceTimeToClipTime(SequenceTime(item->GetEnd())).Ticks();
    const double frame =
        std::round(static_cast<double>(item->GetFrameRate().GetTicksPerFrame()) * item->GetSpeed());
    bounds.frame = std::max<TickTime>(1, static_cast<TickTime>(frame));
    return bounds;
  }
  const Component* component = selection.GetComponent().get();
  const ComponentChain* chain = component ? component->GetChain() : nullptr;
  const MasterClip* clip = chain ? chain->GetMasterClip() : nullptr;
  if (clip && clip->GetMedia() && !clip->GetMedia()->IsGenerated()) {
    bounds.first = 0;
    bounds.last = clip->GetMedia()->GetDuration();
    bounds.frame = clip->GetMedia()->GetFrameRate().GetTicksPerFrame();
  }
  return bounds;
}

}  // namespace

KeyframeMultiSelectionActor::KeyframeMultiSelectionActor(
    SequenceRef sequence, std::shared_ptr<KeyframeMultiSelection> selection)
    : mSequence(std::move(sequence)), mSelection(std::move(selection)) {
  if (!HOST_VERIFY(mSelection != nullptr, "Invalid KeyframeMultiSelection")) {
    return;
  }
  bool first = true;
  for (const KeyframeSelection* selected : mSelection->GetSelections()) {
    Entry entry;
    entry.param = selected->GetParam();
    entry.origin = entry.param->GetState();
    entry.times = selected->GetKeyframeTimes();
    const ClipBounds bounds = BoundsFor(*selected, mSequence.get());
    const KeyframeCurve& curve = entry.origin.keyframes;
    entry.minDelta = kTime_Min;
    entry.maxDelta = kTime_Max;
    const std::set<TickTime> chosen(entry.times.begin(), entry.times.end());
    for (TickTime time : entry.times) {
      // Nearest keyframes that stay where they are.
      TickTime lower = bounds.first;
      TickTime upper = bounds.last;
      for (auto before = curve.FindBefore(time); before;
           before = curve.FindBefore(curve.At(*before).time)) {
        if (!chosen.contains(curve.At(*before).time)) {
          lower = std::max(lower, AddTimes(curve.At(*before).time, bounds.frame));
          break;
        }
      }
      for (auto after = curve.FindAfter(time); after;
           after = curve.FindAfter(curve.At(*after).time)) {
        if (!chosen.contains(curve.At(*after).time)) {
          upper = std::min(upper, SubtractTimes(curve.At(*after).time, bounds.frame));
          break;
        }
      }
      entry.minDelta = std::max(entry.minDelta, std::min<TickTime>(0, lower - time));
      entry.maxDelta = std::min(entry.maxDelta, std::max<TickTime>(0, upper - time));
    }
    if (first) {
      mMinDelta = entry.minDelta;
      mMaxDelta = entry.maxDelta;
      first = false;
    } else {
      mMinDelta = std::max(mMinDelta, entry.minDelta);
      mMaxDelta = std::min(mMaxDelta, entry.maxDelta);
    }
    mEntries.push_back(std::move(entry));
  }
}

KeyframeMultiSelectionActor::~KeyframeMultiSelectionActor() {
  if (!mCommitted && HasMoved()) {
    RollbackMoveSelection();
  }
}

bool KeyframeMultiSelectionActor::IsEditable() const {
  if (mEntries.empty()) {
    return false;
  }
  for (const Entry& entry : mEntries) {
    const Project* project = entry.param->GetProject();
    if (entry.param->IsReadOnly() || (project && project->IsReadOnly())) {
      return false;
    }
  }
  return !mCommitted;
}

TickTime KeyframeMultiSelectionActor::GetMinimumMoveDelta() const {
  return IsEditable() ? mMinDelta - mTimeDelta : 0;
}

TickTime KeyframeMultiSelectionActor::GetMaximumMoveDelta() const {
  return IsEditable() ? mMaxDelta - mTimeDelta : 0;
}

TickTime KeyframeMultiSelectionActor::LimitMoveDelta(TickTime delta) const {
  return std::clamp(delta, GetMinimumMoveDelta(), GetMaximumMoveDelta());
}

bool KeyframeMultiSelectionActor::QueryMoveSelection(TickTime& delta, int /*modifiers*/) const {
  delta = LimitMoveDelta(delta);
  return delta != 0;
}

TickTime KeyframeMultiSelectionActor::MoveSelection(TickTime delta) {
  const TickTime limited = LimitMoveDelta(delta);
  if (limited != 0) {
    Apply(mTimeDelta + limited, mValueDelta);
  }
  return limited;
}

bool KeyframeMultiSelectionActor::MoveSelectionTo(TickTime timeDelta, double valueDelta) {
  if (!IsEditable() || !std::isfinite(valueDelta)) {
    return false;
  }
  Apply(std::clamp(timeDelta, mMinDelta, mMaxDelta), valueDelta);
  return true;
}

void KeyframeMultiSelectionActor::Apply(TickTime timeDelta, double valueDelta) {
  for (const Entry& entry : mEntries) {
    ComponentParam::State state = entry.origin;
    std::vector<std::size_t> indices;
    for (TickTime time : entry.times) {
      indices.push_back(*state.keyframes.FindAt(time));
    }
    if (timeDelta != 0 && state.keyframes.MoveKeyframes(indices, timeDelta) != CurveStatus::Ok) {
      // The limits keep every move valid; a curve that still refuses keeps its origin.
      HOST_ASSERT(false, "Keyframe move refused within its limits");
      continue;
    }
    std::set<TickTime> moved;
    for (TickTime time : entry.times) {
      moved.insert(time + timeDelta);
    }
    if (valueDelta != 0.0 && entry.param->GetValueKind() == ParamValueKind::Double) {
      for (TickTime time : moved) {
        const std::size_t index = *state.keyframes.FindAt(time);
        const double current = std::get<double>(state.keyframes.At(index).value);
        const double value = mScaleDB && entry.param->IsAudioGain()
                                 ? current * std::pow(10.0, valueDelta / 20.0)
                                 : current + valueDelta;
        if (auto accepted = entry.param->Coerce(ParamValue(value))) {
          state.keyframes.SetValue(index, *accepted);
        }
      }
    }
    entry.param->ApplyState(std::move(state));
    mSelection->SetTimes(entry.param.get(), std::move(moved));
  }
  mTimeDelta = timeDelta;
  mValueDelta = valueDelta;
}

EditStatus KeyframeMultiSelectionActor::CommitMoveSelection(std::string undoText) {
  if (mCommitted) {
    return EditStatus::NoChange;
  }
  auto action =
      std::make_unique<ParamStatesAction>(kKeyframeActionMoveKeyframes, std::move(undoText));
  Project* project = nullptr;
  for (const Entry& entry : mEntries) {
    if (entry.param->GetState() != entry.origin) {
      action->Add(entry.param, entry.origin, entry.param->GetState());
      project = project ? project : entry.param->GetProject();
    }
  }
  if (action->IsEmpty()) {
    return EditStatus::NoChange;
  }
  const EditStatus status = ExecuteModelAction(project, std::move(action));
  if (status != EditStatus::Done) {
    RollbackMoveSelection();
    return status;
  }
  mCommitted = true;
  return status;
}

void KeyframeMultiSelectionActor::RollbackMoveSelection() {
  if (mCommitted) {
    return;
  }
  for (const Entry& entry : mEntries) {
    entry.param->ApplyState(entry.origin);
    mSelection->SetTimes(entry.param.get(),
                         std::set<TickTime>(entry.times.begin(), entry.times.end()));
  }
  mTimeDelta = 0;
  mValueDelta = 0.0;
}
