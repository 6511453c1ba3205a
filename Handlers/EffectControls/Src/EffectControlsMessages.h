#pragma once

#include <string_view>
#include <utility>

#include "Host/Messaging/Message.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Toolkit/Geometry.h"

// The panel's own messages. Unless a message says otherwise it goes out on the list's own
// station (the station given to EffectControlsListView); the keyframe-refresh and become-target
// messages go out on the list's keyframe station (GetKeyframeViewStation). Payloads are values,
// so a message can be posted to the UI thread and read later.

// The list was rebuilt, or rows opened, closed, appeared or changed height: the panel view lays
// out the header and the keyframe area again and updates the scroll bar.
struct EffectControlsListChangedMessage : MessageOf<EffectControlsListChangedMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsListChangedMessage";
};

// Row positions or keyframes changed: the keyframe area repaints its tracks. Keyframe station.
struct EffectControlsRefreshKeyframesMessage : MessageOf<EffectControlsRefreshKeyframesMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsRefreshKeyframesMessage";
};

// The effect or parameter selection of the list changed (a click, or a selection emptied).
struct EffectControlsFilterSelectionChangedMessage
    : MessageOf<EffectControlsFilterSelectionChangedMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsFilterSelectionChangedMessage";
};

// The list/keyframe separator is being dragged; `point` is the mouse in list coordinates.
struct EffectControlsListSeparatorMoved : MessageOf<EffectControlsListSeparatorMoved> {
  static constexpr std::string_view kTypeName = "EffectControlsListSeparatorMoved";
  explicit EffectControlsListSeparatorMoved(Point p) : point(p) {}
  Point point;
};

// Playback of one audio part started; `partIndex` counts the parts in display order from 0.
struct EffectControlsAudioPartPlayStartedMessage
    : MessageOf<EffectControlsAudioPartPlayStartedMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsAudioPartPlayStartedMessage";
  explicit EffectControlsAudioPartPlayStartedMessage(int index) : partIndex(index) {}
  int partIndex;
};

// Effects were pasted; `component` is the added video effect, which the list selects once it
// has rebuilt.
struct EmbeddedEffectAdded : MessageOf<EmbeddedEffectAdded> {
  static constexpr std::string_view kTypeName = "EmbeddedEffectAdded";
  explicit EmbeddedEffectAdded(ComponentRef c) : component(std::move(c)) {}
  ComponentRef component;
};

// An effect row's title changed (the effect was renamed).
struct FilterItemNameChanged : MessageOf<FilterItemNameChanged> {
  static constexpr std::string_view kTypeName = "FilterItemNameChanged";
};

// The user asked to switch every effect of the target on or off at once; `enabled` is the new
// state for all of them.
struct FilterOnOffAllChanged : MessageOf<FilterOnOffAllChanged> {
  static constexpr std::string_view kTypeName = "FilterOnOffAllChanged";
  explicit FilterOnOffAllChanged(bool e) : enabled(e) {}
  bool enabled;
};

// Something in the list wants the keyframe area to take the command focus (an effect was reset,
// a parameter's keyframes were selected by clicking its name). With `recomputeZoomRange` the
// panel view also recomputes its ruler's zoom range. Keyframe station or the list's own station.
struct EffectControlsBecomeTargetMessage : MessageOf<EffectControlsBecomeTargetMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsBecomeTargetMessage";
  explicit EffectControlsBecomeTargetMessage(bool recompute = false)
      : recomputeZoomRange(recompute) {}
  bool recomputeZoomRange;
};
