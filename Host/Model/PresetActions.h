#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// A preset was saved (sent by whoever saved it, on the project's station): an effect browser
// lists it. `name` is the preset's name; `matchNames` the effects it was saved for.
struct FilterPresetCreatedMessage : MessageOf<FilterPresetCreatedMessage> {
  static constexpr std::string_view kTypeName = "FilterPresetCreatedMessage";
  FilterPresetCreatedMessage(std::string presetName, std::vector<std::string> effects)
      : name(std::move(presetName)), matchNames(std::move(effects)) {}
  std::string name;
  std::vector<std::string> matchNames;
};

// Saving an effect instance's values as a named preset of its effect. A preset belongs to the
// effect (its match name), not to one instance: it is appended to the presets of every instance
// of that effect in the project, where each instance's presets popup lists it, and it is saved
// with the project as part of each instance's presets. Each instance whose presets change sends
// ComponentChangedMessage.
class PresetActions {
 public:
  static constexpr const char* kSavePreset = "MZ.Component.SavePreset";

  enum class NameProblem { kNone, kEmpty, kTaken };
  // Whether `name` may name a new preset of `component`'s effect: not empty (blanks alone count
  // as empty) and not already a preset name of that effect.
  static NameProblem CheckName(const ComponentRef& component, std::string_view name);

  // What one saved preset takes its values from: the instance and the clip time of the edit line
  // (a parameter that varies over time gives its value there).
  struct Source {
    ComponentRef component;
    TickTime clipTime = 0;
  };
  // Saves `name` as a preset of each source's effect, one undo step for all. InvalidArgument when
  // a name check fails for any of them (nothing is saved), NoChange for no sources.
  static EditStatus SavePresets(const std::vector<Source>& sources, const std::string& name);
};
