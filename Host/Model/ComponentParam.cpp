#include "Host/Model/ComponentParam.h"

#include <algorithm>
#include <cmath>
#include <utility>
#include <variant>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ModelMessages.h"

namespace {

bool VariesByDefault(ParamType type) {
  switch (type) {
    case ParamType::GroupBegin:
    case ParamType::GroupEnd:
    case ParamType::Button:
    case ParamType::Info:
    case ParamType::TrackMenu:
    case ParamType::Text:
    case ParamType::Spreadsheet:
      return false;
    default:
      return true;
  }
}

}  // namespace

ComponentParamRef ComponentParam::Create(std::string name, ParamType type,
                                         ParamValue defaultValue) {
  return ComponentParamRef(new ComponentParam(std::move(name), type, std::move(defaultValue)));
}

ComponentParam::ComponentParam(std::string name, ParamType type, ParamValue defaultValue)
    : ModelObject("ComponentParam"),
      mName(std::move(name)),
      mType(type),
      mDefault(std::move(defaultValue)),
      mCanVary(VariesByDefault(type)),
      mAudioGain(type == ParamType::AudioGain && KindOf(mDefault) == ParamValueKind::Double) {
  mState.value = mDefault;
}

ComponentParam::~ComponentParam() = default;

ComponentParamRef ComponentParam::Clone() const {
  ComponentParamRef copy(new ComponentParam(mName, mType, mDefault));
  copy->mGroupKind = mGroupKind;
  copy->mMinimum = mMinimum;
  copy->mMaximum = mMaximum;
  copy->mSliderMinimum = mSliderMinimum;
  copy->mSliderMaximum = mSliderMaximum;
  copy->mSliderRangeSet = mSliderRangeSet;
  copy->mPrecision = mPrecision;
  copy->mExponent = mExponent;
  copy->mUnits = mUnits;
  copy->mStep = mStep;
  copy->mMenuEntries = mMenuEntries;
  copy->mDisablesWhenOn = mDisablesWhenOn;
  copy->mCanVary = mCanVary;
  copy->mTimebase = mTimebase;
  copy->mCheckboxName = mCheckboxName;
  copy->mAudioGain = mAudioGain;
  copy->mVisible = mVisible;
  copy->mEnabled = mEnabled;
  copy->mReadOnly = mReadOnly;
  copy->mState = mState;
  return copy;
}

int ComponentParam::GetValueKindCode() const {
  switch (GetValueKind()) {
    case ParamValueKind::Double:
      return kValueKindDouble;
    case ParamValueKind::Point:
      return kValueKindPoint;
    case ParamValueKind::Color:
      return kValueKindColor;
    case ParamValueKind::Bool:
      return kValueKindBool;
    case ParamValueKind::Choice:
      return kValueKindChoice;
    case ParamValueKind::String:
      return kValueKindString;
    case ParamValueKind::Blob:
      return kValueKindBinary;
  }
  return 0;
}

ComponentParamRef ComponentParam::SetRange(double minimum, double maximum) {
  if (std::isfinite(minimum) && std::isfinite(maximum) && minimum <= maximum) {
    mMinimum = minimum;
    mMaximum = maximum;
    if (!mSliderRangeSet) {
      mSliderMinimum = minimum;
      mSliderMaximum = maximum;
    }
    if (auto limited = Coerce(mDefault)) {
      mDefault = *limited;
    }
    if (auto limited = Coerce(mState.value)) {
      mState.value = *limited;
    }
  }
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetSliderRange(double minimum, double maximum) {
  if (std::isfinite(minimum) && std::isfinite(maximum) && minimum <= maximum) {
    mSliderMinimum = minimum;
    mSliderMaximum = maximum;
    mSliderRangeSet = true;
  }
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetPrecision(int digits) {
  mPrecision = std::clamp(digits, 0, 10);
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetExponent(double exponent) {
  if (std::isfinite(exponent) && exponent > 0.0) {
    mExponent = exponent;
  }
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetUnits(ParamUnits units) {
  mUnits = units;
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetStep(double step) {
  if (std::isfinite(step) && step > 0.0) {
    mStep = step;
  }
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetGroupKind(GroupKind kind) {
  mGroupKind = kind;
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetMenuEntries(std::vector<std::string> entries) {
  mMenuEntries = std::move(entries);
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetDisablesWhenOn(std::vector<std::string> names) {
  mDisablesWhenOn = std::move(names);
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetCanVaryOverTime(bool can) {
  mCanVary = can;
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetParameterTimebase(FrameRate timebase) {
  if (timebase.IsValid() && !timebase.IsAudio()) {
    mTimebase = timebase;
  }
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetCheckboxDisplayName(std::string name) {
  mCheckboxName = std::move(name);
  return ComponentParamRef(this);
}

ComponentParamRef ComponentParam::SetAudioGain(bool gain) {
  if (!gain || HOST_VERIFY(GetValueKind() == ParamValueKind::Double, "A gain must be a number")) {
    mAudioGain = gain;
  }
  return ComponentParamRef(this);
}

void ComponentParam::SetVisible(bool visible) {
  if (visible != mVisible) {
    mVisible = visible;
    NotifyChanged();
  }
}

void ComponentParam::SetEnabled(bool enabled) {
  if (enabled != mEnabled) {
    mEnabled = enabled;
    NotifyChanged();
  }
}

void ComponentParam::SetReadOnly(bool readOnly) {
  if (readOnly != mReadOnly) {
    mReadOnly = readOnly;
    NotifyChanged();
  }
}

ParamValue ComponentParam::GetValueAt(TickTime clipTime) const {
  if (mState.timeVarying && !mState.keyframes.IsEmpty()) {
    if (auto value = mState.keyframes.ValueAt(clipTime)) {
      return *value;
    }
  }
  return mState.value;
}

std::optional<double> ComponentParam::GetScalarAt(TickTime clipTime) const {
  return AsScalar(GetValueAt(clipTime));
}

std::vector<TickTime> ComponentParam::GetKeyframeTimes(TickTime first, TickTime last) const {
  std::vector<TickTime> times;
  for (std::size_t index : mState.keyframes.FindInRange(first, last)) {
    times.push_back(mState.keyframes.At(index).time);
  }
  return times;
}

std::optional<TickTime> ComponentParam::NextKeyframeTime(TickTime clipTime) const {
  return mState.keyframes.NextKeyframeTime(clipTime);
}

std::optional<TickTime> ComponentParam::PreviousKeyframeTime(TickTime clipTime) const {
  return mState.keyframes.PreviousKeyframeTime(clipTime);
}

std::optional<ParamValue> ComponentParam::Coerce(const ParamValue& value) const {
  if (!IsFinite(value)) {
    return std::nullopt;
  }
  auto limit = [this](double v) { return std::clamp(v, mMinimum, mMaximum); };
  switch (GetValueKind()) {
    case ParamValueKind::Double: {
      const auto* number = std::get_if<double>(&value);
      if (!number) {
        return std::nullopt;
      }
      const double limited = limit(*number);
      return mType == ParamType::Slider ? std::round(limited) : limited;
    }
    case ParamValueKind::Point: {
      const auto* point = std::get_if<ParamPoint>(&value);
      if (!point) {
        return std::nullopt;
      }
      return ParamPoint{limit(point->x), limit(point->y)};
    }
    case ParamValueKind::Bool:
      if (const auto* number = std::get_if<double>(&value)) {
        return *number != 0.0;
      }
      if (!std::holds_alternative<bool>(value)) {
        return std::nullopt;
      }
      return value;
    case ParamValueKind::Choice: {
      std::int32_t index = 0;
      if (const auto* number = std::get_if<double>(&value)) {
        index = static_cast<std::int32_t>(std::lround(std::clamp(*number, -1.0e9, 1.0e9)));
      } else if (const auto* choice = std::get_if<ParamChoice>(&value)) {
        index = choice->index;
      } else {
        return std::nullopt;
      }
      if (index < 0 || (!mMenuEntries.empty() && index >= static_cast<int>(mMenuEntries.size()))) {
        return std::nullopt;
      }
      return ParamChoice{index};
    }
    case ParamValueKind::Color:
    case ParamValueKind::String:
    case ParamValueKind::Blob:
      if (KindOf(value) != GetValueKind()) {
        return std::nullopt;
      }
      return value;
  }
  return std::nullopt;
}

void ComponentParam::ApplyState(State state) {
  if (state == mState) {
    return;
  }
  mState = std::move(state);
  NotifyChanged();
}

bool ComponentParam::SetValueAt(TickTime clipTime, const ParamValue& value) {
  const std::optional<ParamValue> accepted = Coerce(value);
  if (!accepted) {
    return false;
  }
  // In place: a drag sets many values in a row, and copying the curve for each would make every
  // step cost as much as the parameter has keyframes.
  KeyframeCurve& keyframes = mState.keyframes;
  if (!mState.timeVarying) {
    if (mState.value == *accepted) {
      return true;
    }
    mState.value = *accepted;
  } else if (auto index = keyframes.FindAt(clipTime)) {
    if (keyframes.At(*index).value == *accepted) {
      return true;
    }
    if (keyframes.SetValue(*index, *accepted) != CurveStatus::Ok) {
      return false;
    }
  } else {
    Keyframe keyframe;
    keyframe.time = clipTime;
    keyframe.value = *accepted;
    keyframe.interpolation = TemporalInterpolation::Linear;
    if (keyframes.Add(keyframe) != CurveStatus::Ok) {
      return false;
    }
  }
  NotifyChanged();
  return true;
}

ComponentParam::State ComponentParam::MakeConstantState(ParamValue value) const {
  State state;
  state.value = std::move(value);
  return state;
}

Project* ComponentParam::GetProject() const {
  return mComponent ? mComponent->GetProject() : nullptr;
}

void ComponentParam::NotifyChanged() {
  BroadcastMessage(GetStation(),
                   ParamChangedMessage(ComponentRef(mComponent), ComponentParamRef(this)));
  if (mComponent) {
    mComponent->FollowParamChange(*this);
    if (ComponentChain* chain = mComponent->GetChain()) {
      chain->NotifyValuesChanged();
    }
  }
}

std::size_t ComponentParam::CountGroupEntries() const {
  const ParamValue value = GetValueAt(kTime_Zero);
  if (const auto* text = std::get_if<std::string>(&value)) {
    return static_cast<std::size_t>(std::count(text->begin(), text->end(), ';'));
  }
  if (const auto* blob = std::get_if<ParamBlob>(&value)) {
    // A trailing odd byte is no code unit.
    std::size_t count = 0;
    for (std::size_t i = 0; i + 1 < blob->bytes.size(); i += 2) {
      count += blob->bytes[i] == ';' && blob->bytes[i + 1] == 0 ? 1 : 0;
    }
    return count;
  }
  return 0;
}
