#include "Host/Model/ComponentParamActions.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"

EditStatus ComponentParamActions::FromCurveStatus(CurveStatus status) {
  if (status == CurveStatus::Ok) {
    return EditStatus::Done;
  }
  if (status == CurveStatus::DuplicateTime) {
    return EditStatus::DuplicateTime;
  }
  if (status == CurveStatus::TimeOutOfRange) {
    return EditStatus::TimeOutOfRange;
  }
  if (status == CurveStatus::NoSuchKeyframe) {
    return EditStatus::NotFound;
  }
  // A value, speed, tangent or mode the curve cannot take.
  return EditStatus::InvalidArgument;
}

std::unique_ptr<Action> ComponentParamActions::CreateSetStateAction(const ComponentParamRef& param,
                                                                    std::string name,
                                                                    ComponentParam::State before,
                                                                    ComponentParam::State after) {
  return FunctionAction::MakeSetter(
      std::move(name), std::move(before), std::move(after),
      [param](const ComponentParam::State& state) { param->ApplyState(state); });
}

EditStatus ComponentParamActions::Edit(const ComponentParamRef& param, std::string name,
                                       const StateEdit& edit) {
  if (!HOST_VERIFY(param != nullptr, "Invalid ComponentParam")) {
    return EditStatus::InvalidArgument;
  }
  if (param->IsReadOnly()) {
    return EditStatus::ReadOnly;
  }
  ComponentParam::State after = param->GetState();
  const EditStatus status = edit(after);
  if (status != EditStatus::Done) {
    return status;
  }
  if (after == param->GetState()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      param->GetProject(),
      CreateSetStateAction(param, std::move(name), param->GetState(), std::move(after)));
}

namespace {

// Index of the keyframe at `time`, or NotFound.
EditStatus FindKeyframe(const ComponentParam::State& state, TickTime time, std::size_t* index) {
  const auto found = state.keyframes.FindAt(time);
  if (!found) {
    return EditStatus::NotFound;
  }
  *index = *found;
  return EditStatus::Done;
}

}  // namespace

EditStatus ComponentParamActions::SetValue(const ComponentParamRef& param, TickTime clipTime,
                                           const ParamValue& value) {
  if (!param) {
    return Edit(param, kSetValue, nullptr);
  }
  const std::optional<ParamValue> accepted = param->Coerce(value);
  return Edit(param, kSetValue, [&](ComponentParam::State& state) {
    if (!accepted) {
      return EditStatus::InvalidArgument;
    }
    if (!state.timeVarying) {
      state.value = *accepted;
      return EditStatus::Done;
    }
    if (auto index = state.keyframes.FindAt(clipTime)) {
      return FromCurveStatus(state.keyframes.SetValue(*index, *accepted));
    }
    Keyframe keyframe;
    keyframe.time = clipTime;
    keyframe.value = *accepted;
    return FromCurveStatus(state.keyframes.Add(keyframe));
  });
}

EditStatus ComponentParamActions::SetTimeVarying(const ComponentParamRef& param, bool timeVarying,
                                                 TickTime clipTime) {
  if (param && timeVarying && !param->CanVaryOverTime()) {
    return EditStatus::CannotVary;
  }
  const ComponentParam* target = param.get();
  return Edit(param, kSetTimeVarying, [&](ComponentParam::State& state) {
    if (state.timeVarying == timeVarying) {
      return EditStatus::NoChange;
    }
    const ParamValue current = target->GetValueAt(clipTime);
    state.keyframes.Clear();
    state.timeVarying = timeVarying;
    state.value = current;
    if (timeVarying) {
      Keyframe keyframe;
      keyframe.time = clipTime;
      keyframe.value = current;
      return FromCurveStatus(state.keyframes.Add(keyframe));
    }
    return EditStatus::Done;
  });
}

EditStatus ComponentParamActions::AddKeyframe(const ComponentParamRef& param, TickTime clipTime,
                                              std::optional<ParamValue> value) {
  if (param && !param->CanVaryOverTime()) {
    return EditStatus::CannotVary;
  }
  const ComponentParam* target = param.get();
  return Edit(param, kAddKeyframe, [&](ComponentParam::State& state) {
    std::optional<ParamValue> accepted =
        value ? target->Coerce(*value) : std::optional(target->GetValueAt(clipTime));
    if (!accepted) {
      return EditStatus::InvalidArgument;
    }
    if (!state.timeVarying) {
      state.timeVarying = true;
      state.keyframes.Clear();
    }
    Keyframe keyframe;
    keyframe.time = clipTime;
    keyframe.value = *accepted;
    return FromCurveStatus(state.keyframes.Add(keyframe));
  });
}

EditStatus ComponentParamActions::RemoveKeyframe(const ComponentParamRef& param,
                                                 TickTime clipTime) {
  return Edit(param, kRemoveKeyframe, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    if (state.keyframes.Size() == 1) {
      state.value = state.keyframes.At(0).value;
    }
    return FromCurveStatus(state.keyframes.Remove(index));
  });
}

EditStatus ComponentParamActions::MoveKeyframe(const ComponentParamRef& param,
                                               TickTime fromClipTime, TickTime toClipTime) {
  return Edit(param, kMoveKeyframe, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, fromClipTime, &index); found != EditStatus::Done) {
      return found;
    }
    if (fromClipTime == toClipTime) {
      return EditStatus::NoChange;
    }
    return FromCurveStatus(state.keyframes.Move(index, toClipTime));
  });
}

EditStatus ComponentParamActions::SetKeyframeValue(const ComponentParamRef& param,
                                                   TickTime clipTime, const ParamValue& value) {
  const ComponentParam* target = param.get();
  return Edit(param, kSetKeyframeValue, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    const std::optional<ParamValue> accepted = target->Coerce(value);
    if (!accepted) {
      return EditStatus::InvalidArgument;
    }
    return FromCurveStatus(state.keyframes.SetValue(index, *accepted));
  });
}

EditStatus ComponentParamActions::SetTemporalInterpolation(const ComponentParamRef& param,
                                                           TickTime clipTime,
                                                           TemporalInterpolation mode) {
  return Edit(param, kSetTemporalInterpolation, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    return FromCurveStatus(state.keyframes.SetTemporalInterpolation(index, mode));
  });
}

EditStatus ComponentParamActions::SetSpatialInterpolation(const ComponentParamRef& param,
                                                          TickTime clipTime,
                                                          SpatialInterpolation mode) {
  return Edit(param, kSetSpatialInterpolation, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    return FromCurveStatus(state.keyframes.SetSpatialInterpolation(index, mode));
  });
}

EditStatus ComponentParamActions::SetEase(const ComponentParamRef& param, TickTime clipTime,
                                          KeyframeSide side, double speed, double influence) {
  return Edit(param, kSetEase, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    return FromCurveStatus(state.keyframes.SetEase(index, side, speed, influence));
  });
}

EditStatus ComponentParamActions::ApplyAutomaticEase(const ComponentParamRef& param,
                                                     TickTime clipTime, KeyframeSide side) {
  return Edit(param, kApplyAutomaticEase, [&](ComponentParam::State& state) {
    std::size_t index = 0;
    if (EditStatus found = FindKeyframe(state, clipTime, &index); found != EditStatus::Done) {
      return found;
    }
    return FromCurveStatus(state.keyframes.ApplyAutomaticEase(index, side));
  });
}
