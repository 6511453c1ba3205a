// The panel-level edits that open a host dialog or reach past the list: saving presets, the
// marker editor, blend modes of the selected clips and the graphics (capsule) resets.

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/PresetActions.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/MarkerEditor.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/TimeBarControl.h"

namespace {

constexpr std::string_view kSavePresetTitle =
    "$$$/Vantile/Handlers/EffectControls/SavePreset=Save Preset";
constexpr std::string_view kPresetNamePrompt =
    "$$$/Vantile/Handlers/EffectControls/PresetName=Name";
constexpr std::string_view kEmptyPresetName =
    "$$$/Vantile/Handlers/EffectControls/EmptyPresetName=A preset needs a name. Name";
constexpr std::string_view kPresetNameTaken =
    "$$$/Vantile/Handlers/EffectControls/PresetNameTaken=This effect already has a preset named "
    "\"@0\". Name";
constexpr std::string_view kBlendModeParam = "Blend Mode";

// The first reason `name` cannot name a preset of any of `sources`.
PresetActions::NameProblem CheckPresetName(const std::vector<PresetActions::Source>& sources,
                                           std::string_view name) {
  for (const PresetActions::Source& source : sources) {
    if (const auto problem = PresetActions::CheckName(source.component, name);
        problem != PresetActions::NameProblem::kNone) {
      return problem;
    }
  }
  return PresetActions::NameProblem::kNone;
}

// The opacity blend-mode parameter of a clip, or null.
ComponentParamRef BlendModeParam(const TrackItemRef& item) {
  if (!item || !item->IsClip() || !item->GetComponentChain()) {
    return nullptr;
  }
  const ComponentRef opacity = item->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  const ComponentParamRef param =
      opacity ? opacity->FindParam(std::string(kBlendModeParam)) : nullptr;
  if (!param || param->GetMenuEntries().empty() || param->IsReadOnly() ||
      !std::holds_alternative<ParamChoice>(param->GetConstantValue())) {
    return nullptr;
  }
  return param;
}

// The capsule (graphics template) component of a clip, or null.
ComponentRef CapsuleOf(const TrackItemRef& item) {
  if (!item || !item->GetComponentChain()) {
    return nullptr;
  }
  for (const ComponentRef& component : item->GetComponentChain()->GetComponents()) {
    if (component->IsCapsule()) {
      return component;
    }
  }
  return nullptr;
}

// The state a parameter has after a reset: its default, constant.
ComponentParam::State DefaultState(const ComponentParam& param) {
  ComponentParam::State state;
  state.value = param.GetDefaultValue();
  return state;
}

}  // namespace

void EffectControlsView::SavePreset() {
  if (!CanEdit() || !mListView->GetAllowSavePreset()) {
    return;
  }
  std::vector<PresetActions::Source> sources;
  const TickTime editLine = mTimeline->GetEditTime();
  for (const auto& entry : mListView->GetSelectedItems().GetEntries()) {
    if (!entry.component) {
      continue;
    }
    const TickTime clipTime =
        entry.trackItem ? entry.trackItem->SequenceTimeToClipTime(SequenceTime(editLine)).Ticks()
                        : 0;
    sources.push_back({entry.component, clipTime});
  }
  if (sources.empty()) {
    return;
  }
  std::string prompt = LocalizeString(kPresetNamePrompt);
  std::string text;
  for (;;) {
    const auto name = InputBox::Ask(kSavePresetTitle, prompt, text);
    if (!name) {
      return;
    }
    text = *name;
    switch (CheckPresetName(sources, *name)) {
      case PresetActions::NameProblem::kEmpty:
        prompt = LocalizeString(kEmptyPresetName);
        continue;
      case PresetActions::NameProblem::kTaken:
        prompt = LocalizeString(kPresetNameTaken, {*name});
        continue;
      case PresetActions::NameProblem::kNone:
        break;
    }
    Project* project = sources.front().component->GetProject();
    if (PresetActions::SavePresets(sources, *name) == EditStatus::Done && project != nullptr) {
      std::vector<std::string> effects;
      for (const PresetActions::Source& source : sources) {
        effects.push_back(source.component->GetMatchName());
      }
      BroadcastMessage(project->GetStation(), FilterPresetCreatedMessage(*name, effects));
    }
    return;
  }
}

void EffectControlsView::EditMarker(std::int64_t id) {
  const auto marker = mMarkers.GetMarker(id);
  if (!marker || !mSequence || !CanEdit()) {
    return;
  }
  mMarkers.Select(id);
  mRuler->Invalidate();
  MarkerEditorLimits limits;
  limits.latestEnd = std::max(mSequence->GetEnd(), marker->time);
  limits.display = mSequence->GetVideoTimeDisplay();
  if (const auto edited = MarkerEditor::Edit(*marker, limits)) {
    mMarkers.Change(id, *edited);
  }
}

bool EffectControlsView::StepBlendMode(int step, bool apply) {
  if (!mSequence) {
    return false;
  }
  auto action = std::make_unique<ParamStatesAction>(ComponentParamActions::kSetValue);
  for (const TrackItemGroup& group : mSequence->GetSelection()) {
    for (const TrackItemRef& item : group.videoItems) {
      const ComponentParamRef param = BlendModeParam(item);
      if (!param) {
        continue;
      }
      if (!apply) {
        return true;
      }
      const int count = static_cast<int>(param->GetMenuEntries().size());
      const int current = std::get<ParamChoice>(param->GetConstantValue()).index;
      ComponentParam::State after = param->GetState();
      after.value = ParamChoice{((current + step) % count + count) % count};
      action->Add(param, param->GetState(), std::move(after));
    }
  }
  if (!apply || action->IsEmpty()) {
    return false;
  }
  return ExecuteModelAction(mSequence->GetProject(), std::move(action)) == EditStatus::Done;
}

bool EffectControlsView::ResetCapsuleParameters(std::optional<std::size_t> index, bool apply) {
  const ComponentRef capsule = mTargetMode == kTargetClip ? CapsuleOf(mTargetItem) : nullptr;
  if (!capsule || (index && *index >= capsule->GetParamCount())) {
    return false;
  }
  if (!apply) {
    return true;
  }
  if (!index) {
    return ComponentActions::ResetParameterValues(capsule, 0) == EditStatus::Done;
  }
  const ComponentParamRef param = capsule->GetParam(*index);
  if (param->GetState() == DefaultState(*param)) {
    return false;
  }
  auto action = std::make_unique<ParamStatesAction>(ComponentActions::kResetParameterValues);
  action->Add(param, param->GetState(), DefaultState(*param));
  return ExecuteModelAction(capsule->GetProject(), std::move(action)) == EditStatus::Done;
}
