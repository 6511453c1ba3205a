#pragma once

#include <cstddef>
#include <vector>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// An edit of several parameters of one component that spans one gesture (a curve drag, a wheel
// drag, a range handle pair): setting values changes the model at once without an undo step;
// Commit turns everything set since the beginning into one undoable action named
// "MZ.ComponentParam.SetValue" over all the parameters that changed; Rollback restores them.
//
// Contract: the parameters belong to one component (a parameter of another component, or none,
// raises "Parameters of one component" and the actor edits nothing). Commit needs a value set and
// may happen once ("!mCommitted && mValueSet"). An actor destroyed with values set that were
// neither committed nor rolled back commits itself. Not copyable; UI thread only.
class MultiComponentParamActor {
 public:
  MultiComponentParamActor(std::vector<ComponentParamRef> params, TickTime clipTime);
  MultiComponentParamActor(const MultiComponentParamActor&) = delete;
  MultiComponentParamActor& operator=(const MultiComponentParamActor&) = delete;
  virtual ~MultiComponentParamActor();

  std::size_t GetSize() const { return mParams.size(); }
  const ComponentParamRef& GetParam(std::size_t index) const { return mParams[index]; }

  // Sets the parameter at `index`. False when refused (index out of range, wrong kind, not
  // finite, read-only parameter, committed edit); the model keeps what it had.
  bool SetValue(std::size_t index, const ParamValue& value);
  // Sets values[i] into parameter i, all or nothing: when any is refused, or the count differs
  // from the number of parameters, every parameter is left as it was before this call.
  bool SetValues(const std::vector<ParamValue>& values);
  // False on a contract failure, or when the project refused the action (read only, undo
  // running); the parameters are then restored as they were before the edit.
  bool Commit();
  void Rollback();

  bool IsValueSet() const { return mValueSet; }
  bool IsCommitted() const { return mCommitted; }
  TickTime GetTime() const { return mTime; }

 private:
  bool IsUsable() const;
  void RememberBefore();
  void Restore(const std::vector<ComponentParam::State>& states);
  std::vector<ComponentParam::State> CurrentStates() const;

  std::vector<ComponentParamRef> mParams;
  TickTime mTime;
  std::vector<ComponentParam::State> mBefore;  // the states before the first set
  bool mValid = false;
  bool mValueSet = false;
  bool mCommitted = false;
};

// The forms of fixed size that the group rows use; values are in parameter order.
class AngleAndDoubleFloatSliderComponentParamActor : public MultiComponentParamActor {
 public:
  AngleAndDoubleFloatSliderComponentParamActor(ComponentParamRef angle, ComponentParamRef magnitude,
                                               TickTime clipTime)
      : MultiComponentParamActor({std::move(angle), std::move(magnitude)}, clipTime) {}
  using MultiComponentParamActor::SetValue;
  // Degrees and magnitude.
  bool SetValue(double degrees, double magnitude) {
    return SetValues({ParamValue(degrees), ParamValue(magnitude)});
  }
};

class DualDoubleFloatSliderComponentParamActor : public MultiComponentParamActor {
 public:
  DualDoubleFloatSliderComponentParamActor(ComponentParamRef first, ComponentParamRef second,
                                           TickTime clipTime)
      : MultiComponentParamActor({std::move(first), std::move(second)}, clipTime) {}
  using MultiComponentParamActor::SetValue;
  bool SetValue(double first, double second) {
    return SetValues({ParamValue(first), ParamValue(second)});
  }
};

class QuadrupleDoubleFloatSliderComponentParamActor : public MultiComponentParamActor {
 public:
  struct Params {
    ComponentParamRef first, second, third, fourth;
  };
  struct Values {
    double first = 0, second = 0, third = 0, fourth = 0;
  };
  QuadrupleDoubleFloatSliderComponentParamActor(Params params, TickTime clipTime)
      : MultiComponentParamActor({std::move(params.first), std::move(params.second),
                                  std::move(params.third), std::move(params.fourth)},
                                 clipTime) {}
  using MultiComponentParamActor::SetValue;
  bool SetValue(const Values& v) {
    return SetValues(
        {ParamValue(v.first), ParamValue(v.second), ParamValue(v.third), ParamValue(v.fourth)});
  }
};
