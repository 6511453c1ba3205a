#include "Host/Model/PresetActions.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/CompoundAction.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

void CollectInstances(const ComponentRef& component, std::string_view matchName,
                      std::vector<ComponentRef>& instances) {
  if (component->GetMatchName() == matchName &&
      std::find(instances.begin(), instances.end(), component) == instances.end()) {
    instances.push_back(component);
  }
  for (const ComponentRef& mask : component->GetMasks()) {
    CollectInstances(mask, matchName, instances);
  }
}

void CollectInstances(const ComponentChainRef& chain, std::string_view matchName,
                      std::vector<ComponentRef>& instances) {
  if (!chain) {
    return;
  }
  for (const ComponentRef& component : chain->GetComponents()) {
    CollectInstances(component, matchName, instances);
  }
}

// Every instance of the effect in the project; `source` alone when it belongs to none.
std::vector<ComponentRef> InstancesOf(const ComponentRef& source) {
  std::vector<ComponentRef> instances;
  const std::string& matchName = source->GetMatchName();
  if (Project* project = source->GetProject()) {
    for (const SequenceRef& sequence : project->GetSequences()) {
      for (const auto* tracks : {&sequence->GetVideoTracks(), &sequence->GetAudioTracks()}) {
        for (const TrackRef& track : *tracks) {
          for (const TrackItemRef& item : track->GetItems()) {
            CollectInstances(item->GetComponentChain(), matchName, instances);
          }
        }
      }
    }
    for (const MasterClipRef& clip : project->GetMasterClips()) {
      CollectInstances(clip->GetVideoChain(), matchName, instances);
    }
  }
  if (std::find(instances.begin(), instances.end(), source) == instances.end()) {
    instances.push_back(source);
  }
  return instances;
}

ComponentPreset MakePreset(const PresetActions::Source& source, const std::string& name) {
  ComponentPreset preset;
  preset.name = name;
  for (std::size_t i = 0; i < source.component->GetParamCount(); ++i) {
    preset.values.emplace_back(i, source.component->GetParam(i)->GetValueAt(source.clipTime));
  }
  return preset;
}

bool IsBlank(std::string_view name) {
  return std::all_of(name.begin(), name.end(), [](char c) { return c == ' ' || c == '\t'; });
}

}  // namespace

PresetActions::NameProblem PresetActions::CheckName(const ComponentRef& component,
                                                    std::string_view name) {
  if (IsBlank(name)) {
    return NameProblem::kEmpty;
  }
  if (component) {
    for (const ComponentPreset& preset : component->GetPresets()) {
      if (preset.name == name) {
        return NameProblem::kTaken;
      }
    }
  }
  return NameProblem::kNone;
}

EditStatus PresetActions::SavePresets(const std::vector<Source>& sources, const std::string& name) {
  if (sources.empty()) {
    return EditStatus::NoChange;
  }
  for (const Source& source : sources) {
    if (!HOST_VERIFY(source.component != nullptr, "Invalid Component") ||
        CheckName(source.component, name) != NameProblem::kNone) {
      return EditStatus::InvalidArgument;
    }
  }
  auto compound = std::make_unique<CompoundAction>(kSavePreset);
  std::vector<ComponentRef> done;
  for (const Source& source : sources) {
    const ComponentPreset preset = MakePreset(source, name);
    for (const ComponentRef& instance : InstancesOf(source.component)) {
      if (std::find(done.begin(), done.end(), instance) != done.end()) {
        continue;  // two selected instances of one effect save one preset
      }
      done.push_back(instance);
      std::vector<ComponentPreset> after = instance->GetPresets();
      after.push_back(preset);
      compound->Add(
          FunctionAction::MakeSetter(kSavePreset, instance->GetPresets(), std::move(after),
                                     [instance](const std::vector<ComponentPreset>& presets) {
                                       instance->SetPresets(presets);
                                     }));
    }
  }
  return ExecuteModelAction(sources.front().component->GetProject(), std::move(compound));
}
