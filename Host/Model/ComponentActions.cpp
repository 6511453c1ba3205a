#include "Host/Model/ComponentActions.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/CompoundAction.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"

namespace {

EditStatus Execute(const ComponentRef& component, std::unique_ptr<Action> action) {
  if (!action) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(component->GetProject(), std::move(action));
}

std::unique_ptr<Action> CreateSetMasksAction(const ComponentRef& component, std::string name,
                                             std::vector<ComponentRef> after) {
  return FunctionAction::MakeSetter(
      std::move(name), component->GetMasks(), std::move(after),
      [component](const std::vector<ComponentRef>& masks) { component->SetMasks(masks); });
}

}  // namespace

std::unique_ptr<Action> ComponentActions::CreateSetBypassAction(const ComponentRef& component,
                                                                bool bypass) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component") ||
      component->IsBypassed() == bypass) {
    return nullptr;
  }
  return FunctionAction::MakeSetter(kSetBypass, component->IsBypassed(), bypass,
                                    [component](bool value) { component->SetBypass(value); });
}

std::unique_ptr<Action> ComponentActions::CreateSetInstanceNameAction(const ComponentRef& component,
                                                                      std::string name) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component") ||
      component->GetInstanceName() == name) {
    return nullptr;
  }
  return FunctionAction::MakeSetter(
      kSetInstanceName, component->GetInstanceName(), std::move(name),
      [component](const std::string& value) { component->SetInstanceName(value); });
}

std::unique_ptr<Action> ComponentActions::CreateResetParameterValuesAction(
    const ComponentRef& component, int presetIndex) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return nullptr;
  }
  const ComponentPreset* preset = nullptr;
  if (presetIndex >= 0 && presetIndex < static_cast<int>(component->GetPresetCount())) {
    preset = &component->GetPresets()[static_cast<std::size_t>(presetIndex)];
  } else if (presetIndex != 0) {
    return nullptr;  // an effect without presets resets to its defaults through preset 0
  }
  auto compound = std::make_unique<CompoundAction>(kResetParameterValues);
  for (std::size_t i = 0; i < component->GetParamCount(); ++i) {
    const ComponentParamRef param = component->GetParam(i);
    ParamValue value = param->GetDefaultValue();
    if (preset) {
      auto it = std::find_if(preset->values.begin(), preset->values.end(),
                             [i](const auto& entry) { return entry.first == i; });
      if (it != preset->values.end()) {
        if (auto accepted = param->Coerce(it->second)) {
          value = *accepted;
        }
      }
    }
    ComponentParam::State after = param->MakeConstantState(std::move(value));
    if (after != param->GetState()) {
      compound->Add(ComponentParamActions::CreateSetStateAction(
          param, kResetParameterValues, param->GetState(), std::move(after)));
    }
  }
  if (compound->IsEmpty()) {
    return nullptr;
  }
  return compound;
}

EditStatus ComponentActions::SetBypass(const ComponentRef& component, bool bypass) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  return Execute(component, CreateSetBypassAction(component, bypass));
}

EditStatus ComponentActions::SetInstanceName(const ComponentRef& component, std::string name) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  return Execute(component, CreateSetInstanceNameAction(component, std::move(name)));
}

EditStatus ComponentActions::SetCurrentPreset(const ComponentRef& component, int presetIndex) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (presetIndex < -1 || presetIndex >= static_cast<int>(component->GetPresetCount())) {
    return EditStatus::InvalidArgument;
  }
  if (presetIndex == component->GetCurrentPreset()) {
    return EditStatus::NoChange;
  }
  return Execute(component, FunctionAction::MakeSetter(
                                kSetCurrentPreset, component->GetCurrentPreset(), presetIndex,
                                [component](int index) { component->SetCurrentPreset(index); }));
}

EditStatus ComponentActions::ResetParameterValues(const ComponentRef& component, int presetIndex) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (presetIndex != 0 &&
      (presetIndex < 0 || presetIndex >= static_cast<int>(component->GetPresetCount()))) {
    return EditStatus::InvalidArgument;
  }
  return Execute(component, CreateResetParameterValuesAction(component, presetIndex));
}

EditStatus ComponentActions::ApplyPreset(const ComponentRef& component, int presetIndex) {
  if (!HOST_VERIFY(component != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (presetIndex < 0 || presetIndex >= static_cast<int>(component->GetPresetCount())) {
    return EditStatus::InvalidArgument;
  }
  auto compound = std::make_unique<CompoundAction>(kApplyPreset);
  if (presetIndex != component->GetCurrentPreset()) {
    compound->Add(
        FunctionAction::MakeSetter(kSetCurrentPreset, component->GetCurrentPreset(), presetIndex,
                                   [component](int index) { component->SetCurrentPreset(index); }));
  }
  compound->Add(CreateResetParameterValuesAction(component, presetIndex));
  if (compound->IsEmpty()) {
    return EditStatus::NoChange;
  }
  return Execute(component, std::move(compound));
}

EditStatus ComponentActions::AddMask(const ComponentRef& component, const ComponentRef& mask,
                                     std::string actionName) {
  if (!HOST_VERIFY(component != nullptr && mask != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  if (!component->CanTakeMasks() || mask->GetChain() != nullptr ||
      mask->GetMaskOwner() != nullptr || mask == component) {
    return EditStatus::InvalidArgument;
  }
  std::vector<ComponentRef> masks = component->GetMasks();
  masks.push_back(mask);
  return Execute(component, CreateSetMasksAction(component, std::move(actionName), masks));
}

EditStatus ComponentActions::RemoveMask(const ComponentRef& component, const ComponentRef& mask,
                                        std::string actionName) {
  if (!HOST_VERIFY(component != nullptr && mask != nullptr, "Invalid Component")) {
    return EditStatus::InvalidArgument;
  }
  std::vector<ComponentRef> masks = component->GetMasks();
  if (std::erase(masks, mask) == 0) {
    return EditStatus::NotFound;
  }
  return Execute(component, CreateSetMasksAction(component, std::move(actionName), masks));
}
