#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "Host/Model/Action.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// Undoable edits of one parameter's value and keyframes. Each builds one action that records the
// parameter's state before and after (so undo restores it exactly) and executes it on the
// parameter's project (ExecuteModelAction). Times are clip times. A read-only parameter gives
// ReadOnly; an edit that would change nothing gives NoChange and makes no undo step; nothing
// changes unless the result is Done.
class ComponentParamActions {
 public:
  static constexpr const char* kSetValue = "MZ.ComponentParam.SetValue";
  static constexpr const char* kSetTimeVarying = "MZ.ComponentParam.SetTimeVarying";
  static constexpr const char* kAddKeyframe = "MZ.ComponentParam.AddKeyframe";
  static constexpr const char* kRemoveKeyframe = "MZ.ComponentParam.RemoveKeyframe";
  static constexpr const char* kMoveKeyframe = "MZ.ComponentParam.MoveKeyframe";
  static constexpr const char* kSetKeyframeValue = "MZ.ComponentParam.SetKeyframeValue";
  static constexpr const char* kSetTemporalInterpolation =
      "MZ.ComponentParam.SetTemporalInterpolation";
  static constexpr const char* kSetSpatialInterpolation =
      "MZ.ComponentParam.SetSpatialInterpolation";
  static constexpr const char* kSetEase = "MZ.ComponentParam.SetEase";
  static constexpr const char* kApplyAutomaticEase = "MZ.ComponentParam.ApplyAutomaticEase";

  // The value at `clipTime`: the keyframe there (added when the parameter varies over time and
  // has none there), else the constant value.
  static EditStatus SetValue(const ComponentParamRef& param, TickTime clipTime,
                             const ParamValue& value);

  // The stopwatch. On: the parameter varies over time, starting with one keyframe at `clipTime`
  // holding the value it has there. Off: every keyframe goes and the value at `clipTime` becomes
  // the constant value.
  static EditStatus SetTimeVarying(const ComponentParamRef& param, bool timeVarying,
                                   TickTime clipTime);

  // Adds a keyframe (value: the given one, else the value the parameter has there), turning time
  // variation on when it was off. DuplicateTime when one is there already.
  static EditStatus AddKeyframe(const ComponentParamRef& param, TickTime clipTime,
                                std::optional<ParamValue> value = std::nullopt);
  // Removing the last keyframe keeps its value as the constant value, so nothing jumps.
  static EditStatus RemoveKeyframe(const ComponentParamRef& param, TickTime clipTime);
  static EditStatus MoveKeyframe(const ComponentParamRef& param, TickTime fromClipTime,
                                 TickTime toClipTime);
  static EditStatus SetKeyframeValue(const ComponentParamRef& param, TickTime clipTime,
                                     const ParamValue& value);
  static EditStatus SetTemporalInterpolation(const ComponentParamRef& param, TickTime clipTime,
                                             TemporalInterpolation mode);
  static EditStatus SetSpatialInterpolation(const ComponentParamRef& param, TickTime clipTime,
                                            SpatialInterpolation mode);
  static EditStatus SetEase(const ComponentParamRef& param, TickTime clipTime, KeyframeSide side,
                            double speed, double influence);
  static EditStatus ApplyAutomaticEase(const ComponentParamRef& param, TickTime clipTime,
                                       KeyframeSide side);

  // The building blocks, for edits of many parameters gathered in one step (selections).
  using StateEdit = std::function<EditStatus(ComponentParam::State&)>;
  // Runs `edit` on a copy of the state and executes the change as action `name`.
  static EditStatus Edit(const ComponentParamRef& param, std::string name, const StateEdit& edit);
  // An action that moves the parameter from `before` to `after` (and back on undo).
  static std::unique_ptr<Action> CreateSetStateAction(const ComponentParamRef& param,
                                                      std::string name,
                                                      ComponentParam::State before,
                                                      ComponentParam::State after);
  static EditStatus FromCurveStatus(CurveStatus status);
};
