#include "Host/Model/KeyframeHandleActor.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"

KeyframeHandleActor::KeyframeHandleActor(ComponentParamRef param, TickTime clipTime,
                                         KeyframeSide side, Graph graph)
    : mParam(std::move(param)), mTime(clipTime), mSide(side), mGraph(graph) {
  if (!mParam) {
    return;
  }
  mOrigin = mParam->GetState();
  const KeyframeCurve& curve = mOrigin.keyframes;
  const auto index = curve.FindAt(clipTime);
  const auto kind = curve.Kind();
  if (!index || !kind || !Interpolates(*kind)) {
    return;
  }
  const bool hasNeighbour = side == KeyframeSide::In ? *index > 0 : *index + 1 < curve.Size();
  mValid = hasNeighbour && (graph == Graph::Velocity || *kind == ParamValueKind::Double);
}

KeyframeHandleActor::~KeyframeHandleActor() {
  Rollback();
}

bool KeyframeHandleActor::MoveTo(TickTime timeDelta, double valueDelta) {
  const Project* project = mParam ? mParam->GetProject() : nullptr;
  if (!mValid || mCommitted || !std::isfinite(valueDelta) || mParam->IsReadOnly() ||
      (project && project->IsReadOnly())) {
    return false;
  }
  ComponentParam::State state = mOrigin;
  KeyframeCurve& curve = state.keyframes;
  const std::size_t index = *curve.FindAt(mTime);
  const Keyframe& key = curve.At(index);
  const bool out = mSide == KeyframeSide::Out;
  const TickTime neighbour = curve.At(out ? index + 1 : index - 1).time;
  const double span = static_cast<double>(out ? neighbour - mTime : mTime - neighbour);
  const double influence = out ? key.outInfluence : key.inInfluence;
  const double speed = out ? key.outSpeed : key.inSpeed;

  // The handle's distance from the keyframe in ticks, moved and kept inside its half segment.
  const double reach = span * influence / 2.0;
  const double moved = reach + static_cast<double>(out ? timeDelta : -timeDelta);
  const double newReach =
      std::clamp(moved, span * kMinimumInfluence / 2.0, span * kMaximumInfluence / 2.0);
  const double newInfluence = newReach * 2.0 / span;

  double newSpeed = speed;
  if (mGraph == Graph::Velocity) {
    newSpeed = speed + valueDelta;
    if (curve.Kind() != ParamValueKind::Double) {
      newSpeed = std::max(0.0, newSpeed);
    }
  } else {
    // The handle's height above the keyframe's value, moved; the slope gives the speed.
    const double seconds = reach / static_cast<double>(kTicksPerSecond);
    const double rise = (out ? speed : -speed) * seconds + valueDelta;
    const double newSeconds = newReach / static_cast<double>(kTicksPerSecond);
    newSpeed = out ? rise / newSeconds : -rise / newSeconds;
  }
  if (!std::isfinite(newSpeed) ||
      curve.SetEase(index, mSide, newSpeed, newInfluence) != CurveStatus::Ok) {
    return false;
  }
  mParam->ApplyState(std::move(state));
  return true;
}

EditStatus KeyframeHandleActor::Commit(std::string undoText) {
  if (!mParam || mCommitted || mParam->GetState() == mOrigin) {
    return EditStatus::NoChange;
  }
  auto action = std::make_unique<ParamStatesAction>(kKeyframeActionMoveHandle, std::move(undoText));
  action->Add(mParam, mOrigin, mParam->GetState());
  const EditStatus status = ExecuteModelAction(mParam->GetProject(), std::move(action));
  if (status != EditStatus::Done) {
    Rollback();
    return status;
  }
  mCommitted = true;
  return status;
}

void KeyframeHandleActor::Rollback() {
  if (mParam && !mCommitted) {
    mParam->ApplyState(mOrigin);
  }
}
