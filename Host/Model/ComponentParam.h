#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "Host/Model/KeyframeCurve.h"
#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// One parameter of a component. Its value is either constant, or, while it varies over time
// ("time-varying", the stopwatch), given by its keyframes (a KeyframeCurve in clip time; before
// the first keyframe and after the last the value holds). A time-varying parameter without
// keyframes keeps its constant value.
//
// Description (fixed when the effect is made): name, type code, group kind, default value and
// so its value kind, valid range [minimum, maximum] and the slider's range, precision (digits
// after the decimal point), exponent of the slider's power curve (1: linear), units, step of the
// numeric field, menu entries, whether it can vary over time.
//
// Messages: ParamChangedMessage on the parameter's station, then ComponentChainChangedMessage on
// its component's chain. State setters (ApplyState, SetValueAt, ...) are not undoable: they are
// for building, loading, live edits (ComponentParamActor) and the actions
// (ComponentParamActions), which record the state before and after.
class ComponentParam : public ModelObject {
 public:
  // The part of a parameter that edits change; actions record it before and after.
  struct State {
    ParamValue value;  // the constant value
    bool timeVarying = false;
    KeyframeCurve keyframes;
    friend bool operator==(const State&, const State&) = default;
  };

  static ComponentParamRef Create(std::string name, ParamType type, ParamValue defaultValue);
  ~ComponentParam() override;

  // Copy with a new id, description and state; not in a component.
  ComponentParamRef Clone() const;

  // Description.
  const std::string& GetName() const { return mName; }
  const std::string& GetDisplayName() const { return mName; }
  ParamType GetType() const { return mType; }
  int GetTypeCode() const { return static_cast<int>(mType); }
  GroupKind GetGroupKind() const { return mGroupKind; }
  int GetGroupKindCode() const { return static_cast<int>(mGroupKind); }
  ParamValueKind GetValueKind() const { return KindOf(mDefault); }
  int GetValueKindCode() const;
  const ParamValue& GetDefaultValue() const { return mDefault; }
  double GetMinimum() const { return mMinimum; }
  double GetMaximum() const { return mMaximum; }
  double GetSliderMinimum() const { return mSliderMinimum; }
  double GetSliderMaximum() const { return mSliderMaximum; }
  int GetPrecision() const { return mPrecision; }
  double GetExponent() const { return mExponent; }
  bool IsExponential() const { return mExponent != 1.0; }
  ParamUnits GetUnits() const { return mUnits; }
  int GetUnitsCode() const { return static_cast<int>(mUnits); }
  double GetStep() const { return mStep; }
  const std::vector<std::string>& GetMenuEntries() const { return mMenuEntries; }
  bool CanVaryOverTime() const { return mCanVary; }
  // The frame rate a timecode parameter counts whole frames in; nullopt: any tick.
  const std::optional<FrameRate>& GetParameterTimebase() const { return mTimebase; }
  // The label of a button parameter's button; the display name when none was given.
  const std::string& GetCheckboxDisplayName() const {
    return mCheckboxName.empty() ? mName : mCheckboxName;
  }
  bool HasCheckboxDisplayName() const { return !mCheckboxName.empty(); }

  // Building (before the parameter is used). The range also sets the slider range when that was
  // not set; the default value is limited to the range.
  ComponentParamRef SetRange(double minimum, double maximum);
  ComponentParamRef SetSliderRange(double minimum, double maximum);
  ComponentParamRef SetPrecision(int digits);
  ComponentParamRef SetExponent(double exponent);
  ComponentParamRef SetUnits(ParamUnits units);
  ComponentParamRef SetStep(double step);
  ComponentParamRef SetGroupKind(GroupKind kind);
  ComponentParamRef SetMenuEntries(std::vector<std::string> entries);
  ComponentParamRef SetCanVaryOverTime(bool can);
  // An invalid or audio rate is ignored.
  ComponentParamRef SetParameterTimebase(FrameRate timebase);
  ComponentParamRef SetCheckboxDisplayName(std::string name);
  // A gain: the value is linear (1.0 leaves the level as it is, 0 silences) and is presented and
  // dragged in decibels. Only number parameters can be gains; others keep false. Parameters
  // made with the old gain type code (17) are gains.
  ComponentParamRef SetAudioGain(bool gain);
  bool IsAudioGain() const { return mAudioGain; }
  // A check box that, while on, disables the named parameters of its component (and enables
  // them while off); kept up on every change, undo and redo included.
  ComponentParamRef SetDisablesWhenOn(std::vector<std::string> names);
  const std::vector<std::string>& GetDisablesWhenOn() const { return mDisablesWhenOn; }

  // Presentation state; changing it sends ParamChangedMessage (not undoable: it follows other
  // values, e.g. a check box that disables a slider).
  bool IsVisible() const { return mVisible; }
  bool IsEnabled() const { return mEnabled; }
  bool IsReadOnly() const { return mReadOnly; }
  void SetVisible(bool visible);
  void SetEnabled(bool enabled);
  void SetReadOnly(bool readOnly);

  // Values. Times are clip times.
  bool IsTimeVarying() const { return mState.timeVarying; }
  const ParamValue& GetConstantValue() const { return mState.value; }
  ParamValue GetValueAt(TickTime clipTime) const;
  // The scalar reading (AsScalar) of GetValueAt; nullopt for non-scalar kinds.
  std::optional<double> GetScalarAt(TickTime clipTime) const;
  // The number of parameters a counted group spans: the semicolons in its value at time zero,
  // read as text (a string, or binary data holding UTF-16 text, low byte first).
  std::size_t CountGroupEntries() const;
  const KeyframeCurve& GetKeyframes() const { return mState.keyframes; }
  bool HasKeyframes() const { return !mState.keyframes.IsEmpty(); }
  // Keyframe times in [first, last].
  std::vector<TickTime> GetKeyframeTimes(TickTime first = kTime_Min,
                                         TickTime last = kTime_Max) const;
  std::optional<TickTime> NextKeyframeTime(TickTime clipTime) const;
  std::optional<TickTime> PreviousKeyframeTime(TickTime clipTime) const;

  // `value` made acceptable for this parameter: of the default's kind (a double also fits a bool
  // or choice parameter), finite, numbers limited to the range, choices to the menu; nullopt when
  // it cannot be.
  std::optional<ParamValue> Coerce(const ParamValue& value) const;

  const State& GetState() const { return mState; }
  // Replaces the state as it is (actions and loaders); sends the messages when it changed.
  void ApplyState(State state);
  // The live edit: time-varying -> sets or adds the keyframe at `clipTime` (a new one Linear),
  // else the constant value. False when the value is refused (Coerce) or the keyframe cannot be
  // stored there.
  bool SetValueAt(TickTime clipTime, const ParamValue& value);
  // The state with every keyframe and time variation gone and the given constant value.
  State MakeConstantState(ParamValue value) const;

  Component* GetComponent() const { return mComponent; }
  Project* GetProject() const override;
  // Component only.
  void SetComponent(Component* component) { mComponent = component; }

  void NotifyChanged();

 private:
  ComponentParam(std::string name, ParamType type, ParamValue defaultValue);

  std::string mName;
  ParamType mType;
  GroupKind mGroupKind = GroupKind::None;
  ParamValue mDefault;
  double mMinimum = -1.0e9;
  double mMaximum = 1.0e9;
  double mSliderMinimum = 0.0;
  double mSliderMaximum = 100.0;
  bool mSliderRangeSet = false;
  int mPrecision = 1;
  double mExponent = 1.0;
  ParamUnits mUnits = ParamUnits::None;
  double mStep = 1.0;
  std::vector<std::string> mMenuEntries;
  std::vector<std::string> mDisablesWhenOn;
  bool mCanVary = true;
  std::optional<FrameRate> mTimebase;
  std::string mCheckboxName;
  bool mAudioGain = false;
  bool mVisible = true;
  bool mEnabled = true;
  bool mReadOnly = false;
  State mState;
  Component* mComponent = nullptr;  // owner; cleared when the component lets go
};
