#include "Handlers/EffectControls/Src/GroupWheelSetBeginParameter.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MultiComponentParamActor.h"

namespace {

// The values a wheel message carries, and whether it ends the gesture; null for other messages.
const HueBalanceAndPhaseValue* WheelValue(const Message& message, bool& finished) {
  finished = true;
  if (const auto* v = message.As<HueBalanceAndPhasePhaseChangedMessage>())
    return v;
  if (const auto* v = message.As<HueBalanceAndPhaseMagnitudeGainChangedMessage>())
    return v;
  if (const auto* v = message.As<HueBalanceAndPhaseAngleAndMagnitudeChangedMessage>())
    return v;
  finished = false;
  if (const auto* v = message.As<HueBalanceAndPhasePhaseChangingMessage>())
    return v;
  if (const auto* v = message.As<HueBalanceAndPhaseMagnitudeGainChangingMessage>())
    return v;
  if (const auto* v = message.As<HueBalanceAndPhaseAngleAndMagnitudeChangingMessage>())
    return v;
  return nullptr;
}

}  // namespace

GroupWheelSetBeginParameter::GroupWheelSetBeginParameter(const ParameterControlInfo& info,
                                                         std::size_t wheels)
    : GroupBeginParameter(info), mWheelCount(wheels) {}

GroupWheelSetBeginParameter::~GroupWheelSetBeginParameter() = default;

ComponentParamRef GroupWheelSetBeginParameter::ChildParam(std::size_t child) const {
  const auto& children = GetItems();
  if (child >= children.size()) {
    return nullptr;
  }
  const auto* row = dynamic_cast<const ParameterControl*>(children[child].get());
  return row != nullptr ? row->GetParam() : nullptr;
}

ComponentParamRef GroupWheelSetBeginParameter::GetAngleParam(std::size_t index) const {
  return ChildParam(2 * index);
}

ComponentParamRef GroupWheelSetBeginParameter::GetMagnitudeParam(std::size_t index) const {
  return ChildParam(2 * index + 1);
}

std::vector<ComponentParamRef> GroupWheelSetBeginParameter::ParamsOf(
    const std::vector<std::size_t>& wheels) const {
  std::vector<ComponentParamRef> params;
  for (const std::size_t wheel : wheels) {
    ComponentParamRef angle = GetAngleParam(wheel);
    ComponentParamRef magnitude = GetMagnitudeParam(wheel);
    if (!angle || !magnitude) {
      return {};
    }
    params.push_back(std::move(angle));
    params.push_back(std::move(magnitude));
  }
  return params;
}

void GroupWheelSetBeginParameter::ListenToChildren(bool listen) {
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      listen ? AddListener(row->GetParam()->GetStation(), *this)
             : RemoveListener(row->GetParam()->GetStation(), *this);
    }
  }
}

void GroupWheelSetBeginParameter::CreateControlsSelf() {
  GroupBeginParameter::CreateControlsSelf();
  for (std::size_t i = 0; i < mWheelCount; ++i) {
    auto wheel = AdoptControl(
        std::make_shared<HueBalanceAndPhaseControl>(Rect{}, static_cast<std::int32_t>(i), this));
    if (!wheel) {
      continue;
    }
    if (const ComponentParamRef magnitude = GetMagnitudeParam(i)) {
      wheel->SetMaxMagnitude(magnitude->GetMaximum());
    }
    AddListener(wheel->GetStation(), *this);
    mWheels.push_back(std::move(wheel));
  }
  ListenToChildren(true);
}

void GroupWheelSetBeginParameter::DestroyControlsSelf() {
  mActor.reset();
  for (auto& wheel : mWheels) {
    RemoveListener(wheel->GetStation(), *this);
    DestroyControl(wheel);
  }
  mWheels.clear();
  ListenToChildren(false);
  GroupBeginParameter::DestroyControlsSelf();
}

void GroupWheelSetBeginParameter::Destroy() {
  // An open gesture ends with what it set, before the children it edits go.
  mActor.reset();
  GroupBeginParameter::Destroy();
}

void GroupWheelSetBeginParameter::ShowControls(bool show) {
  GroupBeginParameter::ShowControls(show);
  for (const auto& wheel : mWheels) {
    wheel->SetVisible(show && IsExpanded());
  }
  if (show && IsExpanded()) {
    SynchGroupToTime();
  }
}

void GroupWheelSetBeginParameter::SetIsExpanded(bool expanded) {
  GroupBeginParameter::SetIsExpanded(expanded);
  if (!IsShown()) {
    ShowControls(false);
  }
}

void GroupWheelSetBeginParameter::SynchGroupToTime() {
  if (mWriting) {
    return;
  }
  const TickTime time = GetClipEditTime();
  for (std::size_t i = 0; i < mWheels.size(); ++i) {
    const ComponentParamRef angle = GetAngleParam(i);
    const ComponentParamRef magnitude = GetMagnitudeParam(i);
    if (angle && magnitude) {
      mWheels[i]->SetValue(angle->GetScalarAt(time).value_or(0.0),
                           magnitude->GetScalarAt(time).value_or(0.0));
    }
  }
}

void GroupWheelSetBeginParameter::OnParamChanged(const ComponentParamRef& param) {
  GroupBeginParameter::OnParamChanged(param);
  SynchGroupToTime();
}

void GroupWheelSetBeginParameter::ListenToMessage(const Message& message) {
  bool finished = false;
  if (const HueBalanceAndPhaseValue* value = WheelValue(message, finished)) {
    OnWheelChange(*value, finished);
    return;
  }
  GroupBeginParameter::ListenToMessage(message);
}

void GroupWheelSetBeginParameter::OnWheelChange(const HueBalanceAndPhaseValue& value,
                                                bool finished) {
  if (value.cookie < 0 || static_cast<std::size_t>(value.cookie) >= mWheels.size() ||
      IsReadOnly()) {
    return;
  }
  const std::vector<std::size_t> wheels = LinkedWheels(static_cast<std::size_t>(value.cookie));
  if (!mActor) {
    std::vector<ComponentParamRef> params = ParamsOf(wheels);
    if (params.empty()) {
      return;
    }
    if (params.size() == 2) {
      mActor = std::make_unique<AngleAndDoubleFloatSliderComponentParamActor>(params[0], params[1],
                                                                              GetClipEditTime());
    } else {
      mActor = std::make_unique<MultiComponentParamActor>(std::move(params), GetClipEditTime());
    }
  }
  std::vector<ParamValue> values;
  for (std::size_t i = 0; i < mActor->GetSize() / 2; ++i) {
    values.emplace_back(value.degrees);
    values.emplace_back(value.magnitude);
  }
  mWriting = true;
  mActor->SetValues(values);
  if (finished) {
    if (mActor->IsValueSet()) {
      mActor->Commit();
    }
    mActor.reset();
  }
  mWriting = false;
  // Linked wheels show the moved one's values at once.
  SynchGroupToTime();
  if (finished) {
    RedrawKeyframeView();
  }
}

void GroupWheelSetBeginParameter::ResetWheels(const std::vector<std::size_t>& indexes) {
  if (IsReadOnly()) {
    return;
  }
  const TickTime time = GetClipEditTime();
  std::vector<ComponentParamRef> params = ParamsOf(indexes);
  if (params.empty()) {
    return;
  }
  MultiComponentParamActor actor(params, time);
  std::vector<ParamValue> defaults;
  for (const ComponentParamRef& param : params) {
    defaults.push_back(param->GetDefaultValue());
  }
  if (actor.SetValues(defaults)) {
    actor.Commit();
  }
  SynchGroupToTime();
}
