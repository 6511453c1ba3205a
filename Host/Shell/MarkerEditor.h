#pragma once

#include <optional>

#include "Host/Model/Marker.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// What the marker editor may accept for one marker.
struct MarkerEditorLimits {
  // The marker's time plus its duration may not pass this (the end of the owner's timeline, in
  // the same time as Marker::time).
  TickTime latestEnd = kTime_Max;
  // How durations are typed and shown ("hh:mm:ss:ff").
  FrameRate display = kFrameRate_25;
};

// The host's marker editor: asks for a marker's name, comment, colour (0 to 7) and duration in
// turn, one input box each. A colour or a duration it cannot take is refused with the reason in
// the prompt and asked again; cancelling any box cancels the whole edit. It changes no model:
// the caller applies the result as one undo step (MarkerActions::ChangeMarker). UI thread only.
class MarkerEditor {
 public:
  // The edited marker (time unchanged), or nullopt when cancelled.
  static std::optional<Marker> Edit(const Marker& marker, const MarkerEditorLimits& limits);
};
