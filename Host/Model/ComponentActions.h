#pragma once

#include <memory>
#include <string>

#include "Host/Model/Action.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// Undoable edits of one component (effect). Each executes one action on the component's project
// (ExecuteModelAction); the Create... forms return the action, for gathering several in one step.
// NoChange (and no step) when the edit would change nothing.
class ComponentActions {
 public:
  static constexpr const char* kSetBypass = "MZ.Component.SetBypass";
  static constexpr const char* kSetInstanceName = "MZ.Component.SetInstanceName";
  static constexpr const char* kSetCurrentPreset = "MZ.Component.SetCurrentPreset";
  static constexpr const char* kResetParameterValues = "MZ.Component.ResetParameterValues";
  static constexpr const char* kApplyPreset = "MZ.Component.ApplyPreset";
  static constexpr const char* kAddMask = "MZ.EffectControls.AddMask";
  static constexpr const char* kRemoveMask = "MZ.EffectControls.RemoveMask";

  static EditStatus SetBypass(const ComponentRef& component, bool bypass);
  // An empty name goes back to the effect's own name.
  static EditStatus SetInstanceName(const ComponentRef& component, std::string name);
  static EditStatus SetCurrentPreset(const ComponentRef& component, int presetIndex);
  // Every parameter takes the preset's value (its default where the preset has none) as a
  // constant value: keyframes and time variation go. Preset 0 holds the defaults.
  static EditStatus ResetParameterValues(const ComponentRef& component, int presetIndex = 0);
  // Chooses the preset and takes its values, as one step.
  static EditStatus ApplyPreset(const ComponentRef& component, int presetIndex);

  // Embeds `mask` (a component not in any chain) at the end of the effect's masks. The action
  // name may be given for effects whose masks have their own ("MZ.ChromilColor.AddMask").
  static EditStatus AddMask(const ComponentRef& component, const ComponentRef& mask,
                            std::string actionName = kAddMask);
  static EditStatus RemoveMask(const ComponentRef& component, const ComponentRef& mask,
                               std::string actionName = kRemoveMask);

  // Null when the edit is invalid or would change nothing.
  static std::unique_ptr<Action> CreateSetBypassAction(const ComponentRef& component, bool bypass);
  static std::unique_ptr<Action> CreateSetInstanceNameAction(const ComponentRef& component,
                                                             std::string name);
  static std::unique_ptr<Action> CreateResetParameterValuesAction(const ComponentRef& component,
                                                                  int presetIndex);
};
