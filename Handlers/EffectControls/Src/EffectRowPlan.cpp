#include "Handlers/EffectControls/Src/EffectRowPlan.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <variant>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/AudioFilterParamInfo.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/ParamValue.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/TickTime.h"

namespace {

// Effects the plan treats by their match name.
constexpr std::string_view kMatchNameVideoLimiter = "XO.KRVN VideoLimiter";
constexpr std::string_view kMatchNameDigitalVideoLimiter = "XO.KRVN DigitalVideoLimiter";
constexpr std::string_view kMatchNameWarpStabilizer = "XO.KRVN WarpStabilizer";
constexpr std::string_view kMatchNameAutoReframe = "XO.KRVN AutoReframe";
constexpr std::string_view kMatchNameGraphicGroup = "XO.KRVN GraphicGroup";

// Audio part order keys at or above this are not parts.
constexpr std::uint32_t kMaxPartOrderKey = 10000;

// Where one effect row goes and how it is shown.
struct EffectPlacement {
  MediaType mediaType = MediaType::Video;
  bool masterClipEffect = false;
  bool allowMaskShape = true;
  bool isMask = false;
  int groupLevel = 0;
};

bool TakesMaskShape(const Component& component, const EffectPlacement& placement) {
  const std::string& matchName = component.GetMatchName();
  return component.CanTakeMasks() &&
         (!component.IsIntrinsic() || matchName == kMatchName_Opacity) &&
         placement.allowMaskShape && !placement.masterClipEffect &&
         matchName != kMatchNameWarpStabilizer && matchName != kMatchNameAutoReframe;
}

// An audio effect whose plug-in brings its own window gets the custom-setup and channel-map
// rows.
bool HasCustomAudioUI(const Component& component) {
  return component.GetMediaType() == MediaType::Audio && component.HasSetupDialog();
}

// An audio effect says itself which of its parameters it shows; other effects show them all.
bool IsParamShown(const Component& component, const AudioFilterParamInfo* audioInfo,
                  const ComponentParam& param) {
  if (component.GetMediaType() != MediaType::Audio) {
    return true;
  }
  const std::size_t index = component.GetParamIndex(&param);
  return audioInfo != nullptr && index != 0 &&
         audioInfo->IsParamShown(static_cast<std::uint32_t>(index - 1));
}

PlannedRow MemberRow(PlannedRowKind kind, const ComponentRef& component, int groupLevel) {
  PlannedRow row;
  row.kind = kind;
  row.component = component;
  row.groupLevel = groupLevel;
  return row;
}

PlannedRow ParamRow(PlannedRowKind kind, const ComponentRef& component,
                    const ComponentParamRef& param, std::size_t index, int groupLevel) {
  PlannedRow row = MemberRow(kind, component, groupLevel);
  row.param = param;
  row.paramIndex = index;
  return row;
}

// One group open while a component's parameters are walked. `row` lives in the children of
// the group below it on the stack (or of the effect), which grow only once it is closed.
struct OpenGroup {
  PlannedRow* row = nullptr;
  // Parameters still to come for a counted group; -1 for a group closed by a group end.
  long long remaining = -1;
};

// Closes the innermost group that waits for an end, and the counted groups inside it.
void CloseAtGroupEnd(std::vector<OpenGroup>& stack) {
  const auto waiting = std::find_if(stack.rbegin(), stack.rend(),
                                    [](const OpenGroup& open) { return open.remaining < 0; });
  if (waiting != stack.rend()) {
    stack.resize(static_cast<std::size_t>(stack.rend() - waiting) - 1);
  }
}

void AppendParameters(PlannedRow& effect, int baseLevel) {
  const ComponentRef& component = effect.component;
  const std::shared_ptr<const AudioFilterParamInfo> audioInfo =
      component->GetMediaType() == MediaType::Audio ? AudioFilterParamInfo::ForComponent(*component)
                                                    : nullptr;
  std::vector<OpenGroup> stack;
  auto container = [&]() -> PlannedRow& { return stack.empty() ? effect : *stack.back().row; };
  auto level = [&] { return baseLevel + static_cast<int>(stack.size()); };
  const std::vector<ComponentParamRef>& params = component->GetParams();
  for (std::size_t position = 0; position < params.size(); ++position) {
    const ComponentParamRef& param = params[position];
    // A counted group spans the parameters that follow it, whatever they are.
    for (OpenGroup& open : stack) {
      if (open.remaining > 0) {
        --open.remaining;
      }
    }
    if (param->GetType() == ParamType::GroupBegin) {
      PlannedRow& parent = container();
      parent.children.push_back(
          ParamRow(PlannedRowKind::Group, component, param, position, level()));
      OpenGroup open{&parent.children.back(), -1};
      if (param->GetGroupKind() == GroupKind::Counted) {
        open.remaining = static_cast<long long>(param->CountGroupEntries());
      }
      stack.push_back(open);
    } else if (param->GetType() == ParamType::GroupEnd) {
      CloseAtGroupEnd(stack);
    } else if (IsParamShown(*component, audioInfo.get(), *param)) {
      container().children.push_back(
          ParamRow(PlannedRowKind::Parameter, component, param, position, level()));
    }
    while (!stack.empty() && stack.back().remaining == 0) {
      stack.pop_back();
    }
  }
}

PlannedRow PlanEffect(const ComponentRef& component, const EffectPlacement& placement,
                      const EffectRowRules& rules) {
  if (!component) {
    throw NullInterfaceException("IComponent");
  }
  PlannedRow row = MemberRow(PlannedRowKind::Effect, component, placement.groupLevel);
  row.mediaType = placement.mediaType;
  row.masterClipEffect = placement.masterClipEffect;
  row.isMask = placement.isMask && component->GetMatchName() == kMatchName_Mask;
  if (component->IsOffline()) {
    return row;
  }
  // Layers of a master graphic's chain nest no deeper here: the row's own group level says
  // how deep a layer sits.
  const int baseLevel = placement.groupLevel;
  if (placement.mediaType == MediaType::Audio && HasCustomAudioUI(*component)) {
    for (const int index : {0, 1}) {
      PlannedRow custom = MemberRow(PlannedRowKind::CustomAudio, component, baseLevel);
      custom.customAudioIndex = index;
      row.children.push_back(std::move(custom));
    }
  }
  if (placement.mediaType == MediaType::Video && !rules.noMaskControls) {
    if (TakesMaskShape(*component, placement)) {
      row.children.push_back(MemberRow(PlannedRowKind::MaskShape, component, baseLevel));
    }
    const EffectPlacement maskPlacement{MediaType::Video, false, false, true, baseLevel + 1};
    for (const ComponentRef& mask : component->GetMasks()) {
      row.children.push_back(PlanEffect(mask, maskPlacement, rules));
    }
  }
  AppendParameters(row, baseLevel);
  return row;
}

bool IsVideoLimiter(const PlannedRow& row) {
  const std::string& matchName = row.component->GetMatchName();
  return row.kind == PlannedRowKind::Effect && row.mediaType == MediaType::Video &&
         !row.component->IsOffline() &&
         (matchName == kMatchNameVideoLimiter || matchName == kMatchNameDigitalVideoLimiter);
}

bool ContainsVideoLimiter(const std::vector<PlannedRow>& rows) {
  return std::any_of(rows.begin(), rows.end(), [](const PlannedRow& row) {
    return IsVideoLimiter(row) || ContainsVideoLimiter(row.children);
  });
}

// Intrinsics, last in the chain first; graphic groups go to the graphics section.
void PlanIntrinsics(const EffectRowSource& source, const EffectRowRules& rules,
                    const EffectPlacement& placement, EffectRowPlan& plan) {
  const ComponentChain& chain = *source.videoChain;
  for (int position = chain.GetCount() - 1; position >= 0; --position) {
    const ComponentRef component = chain.GetAt(position);
    if (!component->IsIntrinsic() || (rules.hideTimeRemapping && component->IsTimeRemapping()) ||
        (component->IsCapsule() && !source.showCapsules)) {
      continue;
    }
    std::vector<PlannedRow>& section =
        component->GetMatchName() == kMatchNameGraphicGroup ? plan.graphics : plan.video;
    section.push_back(PlanEffect(component, placement, rules));
  }
}

bool HoldsGraphicsLayer(const ComponentChain& chain) {
  for (int position = 0; position < chain.GetCount(); ++position) {
    if (chain.GetAt(position)->IsGraphicsComponent()) {
      return true;
    }
  }
  return false;
}

// A graphics clip's applied effects are its layers, in chain order, then the master
// graphic's; any other clip's applied effects go to the video section, the last applied first.
void PlanAppliedEffects(const EffectRowSource& source, const EffectRowRules& rules,
                        const EffectPlacement& placement, EffectRowPlan& plan) {
  const ComponentChain& chain = *source.videoChain;
  if (plan.graphicsLayers) {
    for (const ComponentChainRef& layers : {source.videoChain, source.masterGraphicChain}) {
      if (!layers) {
        continue;
      }
      for (int position = 0; position < layers->GetCount(); ++position) {
        const ComponentRef component = layers->GetAt(position);
        if (!component->IsIntrinsic()) {
          plan.graphics.push_back(PlanEffect(component, placement, rules));
        }
      }
    }
    return;
  }
  for (int position = chain.GetCount() - 1; position >= 0; --position) {
    const ComponentRef component = chain.GetAt(position);
    if (!component->IsIntrinsic()) {
      plan.video.push_back(PlanEffect(component, placement, rules));
    }
  }
}

void PlanClipVideo(const EffectRowSource& source, const EffectRowRules& rules,
                   EffectRowPlan& plan) {
  EffectPlacement placement;
  placement.masterClipEffect = source.mode == EffectRowMode::MasterClip;
  PlanIntrinsics(source, rules, placement, plan);
  plan.graphicsLayers = HoldsGraphicsLayer(*source.videoChain);
  PlanAppliedEffects(source, rules, placement, plan);
}

// The first component of a transition's chain is the transition itself; the second carries
// the settings it exposes as an effect.
void PlanTransitionEffects(const EffectRowSource& source, const EffectRowRules& rules,
                           EffectRowPlan& plan) {
  if (source.videoChain->GetCount() > 1) {
    EffectPlacement placement;
    placement.allowMaskShape = false;
    plan.video.push_back(PlanEffect(source.videoChain->GetAt(1), placement, rules));
  }
}

// Parts in the order of their keys. Items that share a key keep the order they came in: each
// is a part of the clip and must not disappear from the list.
std::vector<TrackItemRef> OrderAudioParts(const std::vector<TrackItemRef>& items,
                                          std::size_t maxParts) {
  std::vector<TrackItemRef> ordered;
  for (const TrackItemRef& item : items) {
    if (item && item->IsClip() && item->GetPartOrderKey() < kMaxPartOrderKey) {
      ordered.push_back(item);
    }
  }
  std::stable_sort(ordered.begin(), ordered.end(),
                   [](const TrackItemRef& a, const TrackItemRef& b) {
                     return a->GetPartOrderKey() < b->GetPartOrderKey();
                   });
  if (ordered.size() > maxParts) {
    ordered.resize(maxParts);
  }
  return ordered;
}

void PlanAudioParts(const EffectRowSource& source, const EffectRowRules& rules,
                    EffectRowPlan& plan) {
  EffectPlacement placement;
  placement.mediaType = MediaType::Audio;
  for (const TrackItemRef& item : OrderAudioParts(source.audioItems, rules.maxAudioParts)) {
    PlannedAudioPart part{item, {}};
    if (const ComponentChainRef& chain = item->GetComponentChain()) {
      for (int position = 0; position < chain->GetCount(); ++position) {
        part.rows.push_back(PlanEffect(chain->GetAt(position), placement, rules));
      }
    }
    plan.audioParts.push_back(std::move(part));
  }
}

}  // namespace

EffectRowPlan PlanEffectRows(const EffectRowSource& source, const EffectRowRules& rules) {
  EffectRowPlan plan;
  if (source.videoChain) {
    if (source.mode == EffectRowMode::TransitionEffects) {
      PlanTransitionEffects(source, rules, plan);
    } else {
      PlanClipVideo(source, rules, plan);
    }
  }
  if (source.mode == EffectRowMode::Clip && !rules.noAudio) {
    PlanAudioParts(source, rules, plan);
  }
  plan.videoLimiterPresent =
      ContainsVideoLimiter(plan.graphics) || ContainsVideoLimiter(plan.video);
  return plan;
}
