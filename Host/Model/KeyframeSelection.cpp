#include "Host/Model/KeyframeSelection.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ParamStatesAction.h"

namespace {

bool InterpolatesValues(const ComponentParam& param) {
  return Interpolates(param.GetValueKind());
}

bool IsPointParam(const ComponentParam& param) {
  return param.GetValueKind() == ParamValueKind::Point;
}

}  // namespace

KeyframeSelection::KeyframeSelection(TrackItemRef trackItem, ComponentRef component,
                                     ComponentParamRef param)
    : mTrackItem(std::move(trackItem)), mComponent(std::move(component)), mParam(std::move(param)) {
  HOST_ASSERT(mParam != nullptr, "Invalid ComponentParam");
}

std::vector<TickTime> KeyframeSelection::GetKeyframeTimes() const {
  std::vector<TickTime> times;
  if (!mParam) {
    return times;
  }
  const KeyframeCurve& curve = mParam->GetKeyframes();
  for (TickTime time : mTimes) {
    if (curve.FindAt(time)) {
      times.push_back(time);
    }
  }
  return times;
}

bool KeyframeSelection::Add(TickTime clipTime) {
  if (!mParam || !mParam->GetKeyframes().FindAt(clipTime)) {
    return false;
  }
  return mTimes.insert(clipTime).second;
}

bool KeyframeSelection::Remove(TickTime clipTime) {
  return mTimes.erase(clipTime) > 0;
}

void KeyframeSelection::Toggle(TickTime clipTime) {
  if (!Remove(clipTime)) {
    Add(clipTime);
  }
}

void KeyframeSelection::AddAll() {
  if (!mParam) {
    return;
  }
  for (const Keyframe& keyframe : mParam->GetKeyframes().Keyframes()) {
    mTimes.insert(keyframe.time);
  }
}

void KeyframeSelection::Prune() {
  if (!mParam) {
    mTimes.clear();
    return;
  }
  std::erase_if(mTimes, [this](TickTime t) { return !mParam->GetKeyframes().FindAt(t); });
}

bool KeyframeSelection::AllSelected(const std::function<bool(const Keyframe&)>& test) const {
  const std::vector<TickTime> times = GetKeyframeTimes();
  if (times.empty()) {
    return false;
  }
  const KeyframeCurve& curve = mParam->GetKeyframes();
  for (TickTime time : times) {
    if (!test(curve.At(*curve.FindAt(time)))) {
      return false;
    }
  }
  return true;
}

bool KeyframeSelection::IsSpatial() const {
  return mParam && IsPointParam(*mParam) && !IsEmpty();
}

bool KeyframeSelection::IsTimeRemapping() const {
  return mParam && mParam->GetType() == ParamType::TimeRemapping && !IsEmpty();
}

bool KeyframeSelection::SupportsInterpolationMode(int capability) const {
  if (IsEmpty()) {
    return false;
  }
  switch (capability) {
    case kInterpolationCapabilityHold:
      return true;
    case kInterpolationCapabilityLinear:
    case kInterpolationCapabilityBezier:
      return InterpolatesValues(*mParam);
    default:
      return false;
  }
}

bool KeyframeSelection::TemporalInterpolationModeMatches(int code) const {
  const auto mode = TemporalInterpolationFromCode(code);
  return mode && AllSelected([&](const Keyframe& k) { return k.interpolation == *mode; });
}

bool KeyframeSelection::SpatialInterpolationModeMatches(int code) const {
  const auto mode = SpatialInterpolationFromCode(code);
  return mode && mParam && IsPointParam(*mParam) &&
         AllSelected([&](const Keyframe& k) { return k.spatial == *mode; });
}

std::optional<ComponentParam::State> KeyframeSelection::StateAfter(const KeyframeEdit& edit) const {
  if (!mParam) {
    return std::nullopt;
  }
  ComponentParam::State state = mParam->GetState();
  bool changed = false;
  for (TickTime time : GetKeyframeTimes()) {
    KeyframeCurve trial = state.keyframes;
    if (edit(trial, time) == CurveStatus::Ok && !(trial == state.keyframes)) {
      state.keyframes = std::move(trial);
      changed = true;
    }
  }
  if (!changed) {
    return std::nullopt;
  }
  return state;
}

std::optional<ComponentParam::State> KeyframeSelection::StateAfterRemoval() const {
  const std::vector<TickTime> times = GetKeyframeTimes();
  if (times.empty()) {
    return std::nullopt;
  }
  ComponentParam::State state = mParam->GetState();
  const ParamValue firstRemoved = state.keyframes.At(*state.keyframes.FindAt(times.front())).value;
  for (TickTime time : times) {
    state.keyframes.RemoveAt(time);
  }
  if (state.keyframes.IsEmpty()) {
    // Nothing jumps at the start of the clip: before the first keyframe the value was its value.
    state.value = firstRemoved;
  }
  return state;
}

std::optional<KeyframeSelection::KeyframeEdit> KeyframeSelection::MakeTemporalEdit(int code) {
  const auto mode = TemporalInterpolationFromCode(code);
  if (!mode) {
    return std::nullopt;
  }
  return KeyframeEdit([mode = *mode](KeyframeCurve& curve, TickTime time) {
    const auto index = curve.FindAt(time);
    if (!index) {
      return CurveStatus::NoSuchKeyframe;
    }
    const auto kind = curve.Kind();
    if (mode != TemporalInterpolation::Hold && kind && !Interpolates(*kind)) {
      return CurveStatus::InvalidMode;
    }
    return curve.SetTemporalInterpolation(*index, mode);
  });
}

std::optional<KeyframeSelection::KeyframeEdit> KeyframeSelection::MakeSpatialEdit(int code) {
  const auto mode = SpatialInterpolationFromCode(code);
  if (!mode) {
    return std::nullopt;
  }
  return KeyframeEdit([mode = *mode](KeyframeCurve& curve, TickTime time) {
    const auto index = curve.FindAt(time);
    if (!index) {
      return CurveStatus::NoSuchKeyframe;
    }
    if (curve.Kind() != ParamValueKind::Point) {
      return CurveStatus::InvalidMode;
    }
    return curve.SetSpatialInterpolation(*index, mode);
  });
}

std::optional<KeyframeSelection::KeyframeEdit> KeyframeSelection::MakeEaseEdit(int side) {
  if (side != 0 && side != 1) {
    return std::nullopt;
  }
  const KeyframeSide which = side == 0 ? KeyframeSide::In : KeyframeSide::Out;
  return KeyframeEdit([which](KeyframeCurve& curve, TickTime time) {
    const auto index = curve.FindAt(time);
    if (!index) {
      return CurveStatus::NoSuchKeyframe;
    }
    const auto kind = curve.Kind();
    if (kind && !Interpolates(*kind)) {
      return CurveStatus::InvalidMode;
    }
    return curve.ApplyAutomaticEase(*index, which);
  });
}

std::string KeyframeSelection::TemporalUndoText(int code) {
  switch (code) {
    case 0:
      return (
          "$$$/Vantile/Handlers/EffectControls/InterpolationEffectHold=Keyframe Temporal "
          "Interpolation - Hold");
    case 1:
      return (
          "$$$/Vantile/Handlers/EffectControls/InterpolationEffectLinear=Keyframe Temporal "
          "Interpolation - Linear");
    case 2:
      return (
          "$$$/Vantile/Handlers/EffectControls/InterpolationEffectBezier=Keyframe Temporal "
          "Interpolation - Bezier");
    case 3:
      return (
          "$$$/Vantile/Handlers/EffectControls/InterpolationEffectContinuousBezier=Keyframe "
          "Temporal Interpolation - Continuous Bezier");
    case 4:
      return (
          "$$$/Vantile/Handlers/EffectControls/InterpolationEffectAutoBezier=Keyframe Temporal "
          "Interpolation - Auto Bezier");
    default:
      return {};
  }
}

std::string KeyframeSelection::SpatialUndoText(int code) {
  switch (code) {
    case 1:
      return (
          "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectLinear=Keyframe Spatial "
          "Interpolation - Linear");
    case 2:
      return (
          "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectBezier=Keyframe Spatial "
          "Interpolation - Bezier");
    case 3:
      return (
          "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectContinuousBezier="
          "Keyframe Spatial Interpolation - Continuous Bezier");
    case 4:
      return (
          "$$$/Vantile/Handlers/EffectControls/SpatialInterpolationEffectAutoBezier=Keyframe "
          "Spatial Interpolation - Auto Bezier");
    default:
      return {};
  }
}

std::string KeyframeSelection::EaseUndoText(int side) {
  return side == 0 ? ("$$$/Vantile/Handlers/EffectControls/InterpolationEffectEaseIn=Keyframe "
                      "Temporal Interpolation - Ease In")
                   : ("$$$/Vantile/Handlers/EffectControls/InterpolationEffectEaseOut=Keyframe "
                      "Temporal Interpolation - Ease Out");
}

namespace {

EditStatus RunEdit(const KeyframeSelection& selection, const char* name, std::string undoText,
                   const std::optional<KeyframeSelection::KeyframeEdit>& edit) {
  if (!edit) {
    return EditStatus::InvalidArgument;
  }
  if (selection.GetParam() && selection.GetParam()->IsReadOnly()) {
    return EditStatus::ReadOnly;
  }
  auto after = selection.StateAfter(*edit);
  if (!after) {
    return EditStatus::NoChange;
  }
  return ParamStatesAction::Execute(name, std::move(undoText),
                                    {{selection.GetParam(), std::move(*after)}});
}

}  // namespace

EditStatus KeyframeSelection::SetKeyframeTemporalInterpolation(int code,
                                                               std::string undoText) const {
  return RunEdit(*this, kKeyframeActionSetTemporalInterpolation,
                 undoText.empty() ? TemporalUndoText(code) : std::move(undoText),
                 MakeTemporalEdit(code));
}

EditStatus KeyframeSelection::SetKeyframeSpatialInterpolation(int code,
                                                              std::string undoText) const {
  return RunEdit(*this, kKeyframeActionSetSpatialInterpolation,
                 undoText.empty() ? SpatialUndoText(code) : std::move(undoText),
                 MakeSpatialEdit(code));
}

EditStatus KeyframeSelection::ApplyAutomaticEase(int side, std::string undoText) const {
  return RunEdit(*this, kKeyframeActionApplyAutomaticEase,
                 undoText.empty() ? EaseUndoText(side) : std::move(undoText), MakeEaseEdit(side));
}

EditStatus KeyframeSelection::RemoveKeyframes() const {
  if (mParam && mParam->IsReadOnly()) {
    return EditStatus::ReadOnly;
  }
  auto after = StateAfterRemoval();
  if (!after) {
    return EditStatus::NoChange;
  }
  return ParamStatesAction::Execute(kKeyframeActionRemoveKeyframes, {},
                                    {{mParam, std::move(*after)}});
}
