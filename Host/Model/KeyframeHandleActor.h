#pragma once

#include <optional>
#include <string>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

inline constexpr const char* kKeyframeActionMoveHandle = "MZ.KeyframeSelection.MoveHandle";

// A drag of one handle (one side's ease) of one keyframe in a graph, live while the mouse moves
// and committed as one undo step, or rolled back (also when destroyed uncommitted).
//
// Value graph (scalar parameters): the handle is the point (handle time, handle value) of
// Keyframe::GetEaseInTime/GetEaseOutTime and GetEaseInValue/GetEaseOutValue; dragging it by
// (time, value) sets the side's influence from the handle's time and its speed from the slope
// between the keyframe and the handle. Velocity graph (any interpolating parameter): the handle's
// height is the side's speed, so the value delta adds to the speed (points and colours never
// below 0) and the time delta changes the influence. The handle's time stays inside its half of
// the segment (influence between kMinimumInfluence and kMaximumInfluence). The keyframe becomes
// Bezier as KeyframeCurve::SetEase makes it; a continuous one keeps both sides equal.
class KeyframeHandleActor {
 public:
  enum class Graph { Value, Velocity };

  KeyframeHandleActor(ComponentParamRef param, TickTime clipTime, KeyframeSide side, Graph graph);
  KeyframeHandleActor(const KeyframeHandleActor&) = delete;
  KeyframeHandleActor& operator=(const KeyframeHandleActor&) = delete;
  ~KeyframeHandleActor();

  // The keyframe exists, has a neighbour on that side and the graph applies to its kind.
  bool IsValid() const { return mValid; }
  // From where the handle was at construction: clip ticks and value units (speed units per
  // second on the velocity graph). False, with nothing changed, when invalid, read only or
  // committed, or for a delta that is not finite.
  bool MoveTo(TickTime timeDelta, double valueDelta);
  EditStatus Commit(std::string undoText = {});
  void Rollback();

 private:
  ComponentParamRef mParam;
  TickTime mTime;
  KeyframeSide mSide;
  Graph mGraph;
  ComponentParam::State mOrigin;
  bool mValid = false;
  bool mCommitted = false;
};
