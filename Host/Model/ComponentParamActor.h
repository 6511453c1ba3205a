#pragma once

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// An edit of one parameter that spans a gesture (a slider drag): constructing it begins the
// edit at a clip time; SetValue changes the model at once, without an undo step (a time-varying
// parameter gets its keyframe at that time set or added, otherwise the constant value changes);
// Commit turns everything set since the beginning into one undoable action named
// "MZ.ComponentParam.SetValue"; Rollback restores the parameter as it was and leaves no step.
//
// Contract: Commit needs a value set and may happen once. Committing without a value, or
// twice, raises the debug assertion "!mCommitted && mValueSet" and changes nothing. An actor
// destroyed with a value set that was neither committed nor rolled back commits itself.
// Not copyable; UI thread only.
class ComponentParamActor {
 public:
  ComponentParamActor(ComponentParamRef param, TickTime clipTime);
  ComponentParamActor(const ComponentParamActor&) = delete;
  ComponentParamActor& operator=(const ComponentParamActor&) = delete;
  virtual ~ComponentParamActor();

  // False when the value is refused (wrong kind, not finite, read-only parameter, committed
  // edit); the model then keeps what it had.
  bool SetValue(const ParamValue& value);
  // False on a contract failure, or when the project refused the action (read only, undo
  // running); the parameter is then restored as it was before the edit.
  bool Commit();
  void Rollback();

  bool IsValueSet() const { return mValueSet; }
  bool IsCommitted() const { return mCommitted; }
  TickTime GetTime() const { return mTime; }
  const ComponentParamRef& GetParam() const { return mParam; }

 private:
  ComponentParamRef mParam;
  TickTime mTime;
  ComponentParam::State mBefore;  // the state before the first SetValue
  bool mValueSet = false;
  bool mCommitted = false;
};

// The typed forms the parameter rows use.
class FloatSliderComponentParamActor : public ComponentParamActor {
 public:
  using ComponentParamActor::ComponentParamActor;
  using ComponentParamActor::SetValue;
  bool SetValue(float value) { return SetValue(ParamValue(static_cast<double>(value))); }
};

class AngleComponentParamActor : public ComponentParamActor {
 public:
  using ComponentParamActor::ComponentParamActor;
  using ComponentParamActor::SetValue;
  // Degrees.
  bool SetValue(float degrees) { return SetValue(ParamValue(static_cast<double>(degrees))); }
};

class PointComponentParamActor : public ComponentParamActor {
 public:
  using ComponentParamActor::ComponentParamActor;
  using ComponentParamActor::SetValue;
  bool SetValue(double x, double y) { return SetValue(ParamValue(ParamPoint{x, y})); }
  // Marks the next SetValue as the last of the gesture; the value is taken as any other.
  void Finalize() {}
};
