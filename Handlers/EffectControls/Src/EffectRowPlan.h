#pragma once

#include <cstddef>
#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// What a row of the effect list presents.
enum class PlannedRowKind {
  Effect,       // an effect, or a mask of the effect above it
  MaskShape,    // the mask-shape buttons heading an effect that takes masks
  CustomAudio,  // one of the two rows of an audio effect that brings its own window
  Group,        // a group-begin parameter; its children are the group's rows
  Parameter,    // any other parameter; the row factory decides how many rows it makes
};

// One row of the effect list and the rows under it, in display order. Plain data: it holds
// references to the model objects it presents and decides nothing about views.
struct PlannedRow {
  PlannedRowKind kind = PlannedRowKind::Effect;
  // The effect the row presents (Effect) or belongs to (the other kinds).
  ComponentRef component;
  // Group and Parameter: the parameter, and its position among the component's parameters.
  ComponentParamRef param;
  std::size_t paramIndex = 0;
  // Effect: the media the row shows the effect as (masks are always video).
  MediaType mediaType = MediaType::Video;
  // Effect: shown in master-clip mode (its masks are not).
  bool masterClipEffect = false;
  // Effect: a mask (by its match name) under another effect.
  bool isMask = false;
  // CustomAudio: 0 for the first of the two rows, 1 for the second.
  int customAudioIndex = 0;
  // How deeply the row is nested in groups and masks below its top-level effect.
  int groupLevel = 0;
  std::vector<PlannedRow> children;
};

// One audio part: a clip item of the selection and its effects in chain order.
struct PlannedAudioPart {
  TrackItemRef item;
  std::vector<PlannedRow> rows;
};

// The effect rows of the list by section, each in display order (top first). The sections are
// shown graphics, video, then the audio parts.
struct EffectRowPlan {
  std::vector<PlannedRow> graphics;
  std::vector<PlannedRow> video;
  std::vector<PlannedAudioPart> audioParts;
  // The video chain holds a graphics layer: its applied effects are in the graphics section,
  // which starts open.
  bool graphicsLayers = false;
  // A video limiter is among the planned effects (not counting offline ones).
  bool videoLimiterPresent = false;
};

// Whose effects the list shows.
enum class EffectRowMode {
  Clip,               // a sequence clip's own video and audio effects
  MasterClip,         // the master clip's video effects: no mask shapes and no audio parts
  TransitionEffects,  // a transition with its own chain: the effect behind the transition
};

// The parts of the list's style that change which rows exist.
struct EffectRowRules {
  bool hideTimeRemapping = false;
  bool noMaskControls = false;
  bool noAudio = false;
  // At most this many audio parts, the first ones by part key.
  std::size_t maxAudioParts = 0;
};

// The chains of the target the rows are planned for.
struct EffectRowSource {
  EffectRowMode mode = EffectRowMode::Clip;
  // The video and graphics sections' chain (in MasterClip mode the master clip's; in
  // TransitionEffects mode the transition's own); null: no video rows.
  ComponentChainRef videoChain;
  // A master graphic's own chain, when it is not `videoChain`: its layers follow the clip's.
  ComponentChainRef masterGraphicChain;
  // The clip's master clip is a template: its capsules get rows.
  bool showCapsules = false;
  // The selection's audio items in selection order; each clip item below the part-key limit is
  // a part. Ignored outside Clip mode.
  std::vector<TrackItemRef> audioItems;
};

// The rows the list makes for `source` under `rules`:
// - video: the intrinsics in reverse chain order (without time remapping when the rules hide
//   it, without capsules unless shown), then the applied effects in reverse chain order, the
//   last applied on top;
// - graphics: intrinsic graphic groups (in the same reverse order), and for a chain holding a
//   graphics layer, every applied effect in chain order followed by the master graphic's, in
//   place of the video section's applied effects;
// - audio parts by part key, items with equal keys in selection order, each part's effects in
//   chain order;
// - TransitionEffects: only the chain's second component, the settings of the transition whose
//   own row (not planned here) heads the section; it gets no mask-shape row.
// Under each effect: the custom audio rows, the mask-shape row, the masks one level deeper,
// then the parameters with groups nested (a counted group spans the parameters its value
// counts). Offline effects have no rows under them; an audio effect's hidden parameters none.
// Throws NullInterfaceException for a missing component where the list would show it.
EffectRowPlan PlanEffectRows(const EffectRowSource& source, const EffectRowRules& rules);
