#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/KeyframeCurve.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Interpolation capabilities asked of a selection (SupportsInterpolationMode), host codes.
inline constexpr int kInterpolationCapabilityLinear = 0;
inline constexpr int kInterpolationCapabilityHold = 4;
inline constexpr int kInterpolationCapabilityBezier = 5;  // Bezier, continuous, auto, eases

// Undoable action names of keyframe selection edits.
inline constexpr const char* kKeyframeActionSetTemporalInterpolation =
    "MZ.KeyframeSelection.SetTemporalInterpolation";
inline constexpr const char* kKeyframeActionSetSpatialInterpolation =
    "MZ.KeyframeSelection.SetSpatialInterpolation";
inline constexpr const char* kKeyframeActionApplyAutomaticEase =
    "MZ.KeyframeSelection.ApplyAutomaticEase";
inline constexpr const char* kKeyframeActionRemoveKeyframes =
    "MZ.KeyframeSelection.RemoveKeyframes";
inline constexpr const char* kKeyframeActionMoveKeyframes = "MZ.KeyframeSelection.MoveKeyframes";
inline constexpr const char* kKeyframeActionAddKeyframe = "MZ.KeyframeSelection.AddKeyframe";
inline constexpr const char* kKeyframeActionCut = "MZ.KeyframeSelection.Cut";
inline constexpr const char* kKeyframeActionPaste = "MZ.KeyframeSelection.Paste";

// The selected keyframes of one parameter, identified by their clip times, with the effect and
// the track item (null in master-clip mode) that show it. A plain value: it refers to the model
// but does not listen to it, so a time whose keyframe went away (an undo moved it) stays in the
// selection and is ignored by every query and edit until Prune drops it.
//
// Edits run as one undoable action on the parameter's project; NoChange (no step) when nothing
// would change, ReadOnly for a read-only parameter.
class KeyframeSelection {
 public:
  KeyframeSelection() = default;
  KeyframeSelection(TrackItemRef trackItem, ComponentRef component, ComponentParamRef param);

  const TrackItemRef& GetTrackItem() const { return mTrackItem; }
  const ComponentRef& GetComponent() const { return mComponent; }
  const ComponentParamRef& GetParam() const { return mParam; }

  // Clip times, ascending, including stale ones.
  const std::set<TickTime>& GetTimes() const { return mTimes; }
  // The selected times at which the parameter has a keyframe.
  std::vector<TickTime> GetKeyframeTimes() const;
  bool IsEmpty() const { return GetKeyframeTimes().empty(); }
  std::size_t Size() const { return GetKeyframeTimes().size(); }
  bool Contains(TickTime clipTime) const { return mTimes.contains(clipTime); }

  // Only a time at which the parameter has a keyframe can be added; false otherwise (and when
  // it was selected already).
  bool Add(TickTime clipTime);
  bool Remove(TickTime clipTime);
  // Selects it when it is not selected, deselects it otherwise.
  void Toggle(TickTime clipTime);
  void Clear() { mTimes.clear(); }
  // Every keyframe of the parameter.
  void AddAll();
  // Drops times with no keyframe.
  void Prune();
  // Replaces the selected times (the move actor keeps the selection on the moving keyframes).
  void SetTimes(std::set<TickTime> times) { mTimes = std::move(times); }

  // Queries over the selected keyframes that exist; all false for an empty selection.
  // A spatial keyframe is one of a point parameter.
  bool IsSpatial() const;
  bool IsTimeRemapping() const;
  bool SupportsInterpolationMode(int capability) const;
  bool TemporalInterpolationModeMatches(int code) const;
  bool SpatialInterpolationModeMatches(int code) const;

  // Edits of the selected keyframes, one undo step each. Keyframes that cannot take a mode (a
  // check box cannot be Bezier; only points have spatial modes) are left as they are.
  // Temporal codes: Hold 0, Linear 1, Bezier 2, Continuous Bezier 3, Auto Bezier 4; spatial:
  // Linear 1 to Auto Bezier 4. An unknown code gives InvalidArgument. An empty `undoText` uses the
  // mode's default text.
  EditStatus SetKeyframeTemporalInterpolation(int code, std::string undoText = {}) const;
  EditStatus SetKeyframeSpatialInterpolation(int code, std::string undoText = {}) const;
  // Side 0 eases in, 1 eases out.
  EditStatus ApplyAutomaticEase(int side, std::string undoText = {}) const;
  EditStatus RemoveKeyframes() const;

  // Building blocks for multi-parameter steps. A per-keyframe edit of the curve; `time` is the
  // selected keyframe's clip time.
  using KeyframeEdit = std::function<CurveStatus(KeyframeCurve& curve, TickTime time)>;
  // The parameter's state with `edit` run on every selected keyframe; nullopt when the state
  // would not change (keyframes the edit refuses are skipped).
  std::optional<ComponentParam::State> StateAfter(const KeyframeEdit& edit) const;
  // The state with the selected keyframes removed (the constant value takes the first removed
  // keyframe's value when none is left); nullopt when nothing is selected.
  std::optional<ComponentParam::State> StateAfterRemoval() const;

  // The edits above for any mode code; nullopt when the code is unknown.
  static std::optional<KeyframeEdit> MakeTemporalEdit(int code);
  static std::optional<KeyframeEdit> MakeSpatialEdit(int code);
  static std::optional<KeyframeEdit> MakeEaseEdit(int side);
  // The undo texts of the interpolation commands (localisation keys with their default text).
  static std::string TemporalUndoText(int code);
  static std::string SpatialUndoText(int code);
  static std::string EaseUndoText(int side);

 private:
  bool AllSelected(const std::function<bool(const Keyframe&)>& test) const;

  TrackItemRef mTrackItem;
  ComponentRef mComponent;
  ComponentParamRef mParam;
  std::set<TickTime> mTimes;
};
