#pragma once

#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Geometry.h"

class ControlPointViewerHSLBase;
class DC;
class EffectControlsKeyframeViewHSLBase;
class ParameterControl;

// What lies under a point of a parameter graph.
struct ControlPointHit {
  ControlPointViewerHSLBase* viewer = nullptr;  // the graph that was hit; null for no hit
  bool onKeyframe = false;                      // a keyframe's point
  bool onHandle = false;                        // a keyframe's handle
  bool incomingHandle = false;                  // the handle is the keyframe's incoming one
  bool onCurve = false;                         // the curve between two keyframes
  bool canAddKeyframe = false;                  // the curve at a time where a keyframe may be added
  bool isVelocityGraph = false;
  TickTime keyframeTime = 0;  // clip time of the keyframe (or of the handle's keyframe)
  TickTime time = 0;          // sequence time under the point
  double value = 0.0;         // graph value under the point

  bool IsHit() const { return viewer != nullptr; }
};

// One graph (value or velocity) of one time-varying parameter, drawn in that parameter's row of
// the keyframe area. The panel implements it; a parameter row owns two (one of each kind), made
// through ParameterControl's graph viewer factory, and asks them to draw and to hit-test.
class ControlPointViewerHSLBase {
 public:
  ControlPointViewerHSLBase() = default;
  ControlPointViewerHSLBase(const ControlPointViewerHSLBase&) = delete;
  ControlPointViewerHSLBase& operator=(const ControlPointViewerHSLBase&) = delete;
  virtual ~ControlPointViewerHSLBase() = default;

  // The row that owns the viewer (not owned; the row outlives its viewers).
  virtual void SetOwner(ParameterControl* owner) = 0;
  virtual ParameterControl* GetOwner() const = 0;
  // Binds to the row's parameter (again after the row was rebound).
  virtual void BindToParameter(const SequenceRef& sequence, const TrackItemRef& trackItem,
                               const ComponentRef& component, const ComponentParamRef& param) = 0;
  virtual bool IsVelocityGraph() const = 0;

  // Before each paint: the keyframe area (not owned), the graph's rectangle in the keyframe
  // area's coordinates, whether the graph covers only the clip's span, the sequence time at the
  // area's left edge and the zoom.
  virtual void SetupForPaint(EffectControlsKeyframeViewHSLBase* view, const Rect& graphRect,
                             bool pinToClip, TickTime visibleStart, double secondsPerPixel) = 0;
  virtual void DrawGraph(DC& dc) = 0;
  // What lies under `point` (keyframe area coordinates) as of the last SetupForPaint.
  virtual ControlPointHit HitTest(Point point) = 0;
  virtual void SetHandlesHidden(bool hidden) = 0;
};
