#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

// Undoable edits of a transition's settings. Each is one undo step that records the transition's
// settings before and after (TrackItemChangedMessage both ways). Bad values are refused with
// InvalidArgument and change nothing; a value equal to the current one gives NoChange and no
// step; a read-only sequence gives ReadOnly. `transition` must be a transition track item.
class TransitionActions {
 public:
  static constexpr const char* kSetStartPosition = "MZ.TransitionActions.SetStartPosition";
  static constexpr const char* kSetEndPosition = "MZ.TransitionActions.SetEndPosition";
  static constexpr const char* kSetStartPercent = "MZ.TransitionActions.SetStartPercent";
  static constexpr const char* kSetEndPercent = "MZ.TransitionActions.SetEndPercent";
  static constexpr const char* kSetBorderWidth = "MZ.TransitionActions.SetBorderWidth";
  static constexpr const char* kSetBorderColor = "MZ.TransitionActions.SetBorderColor";
  static constexpr const char* kSetSwitchSources = "MZ.TransitionActions.SetSwitchSources";
  static constexpr const char* kSetReverse = "MZ.TransitionActions.SetReverse";
  static constexpr const char* kSetOrientation = "MZ.TransitionActions.SetOrientation";
  static constexpr const char* kSetAntiAliasQuality = "MZ.TransitionActions.SetAntiAliasQuality";
  static constexpr const char* kSetPrivateData = "MZ.TransitionActions.SetPrivateData";
  static constexpr const char* kSetDuration = "MZ.TransitionActions.SetDuration";

  // Percentages are fractions 0 to 1. Setting the start may set the end in the same step (a start
  // dragged past the end pushes it along), and the other way round.
  static EditStatus SetStartPercent(const TrackItemRef& transition, float start,
                                    std::optional<float> end = std::nullopt);
  static EditStatus SetEndPercent(const TrackItemRef& transition, float end,
                                  std::optional<float> start = std::nullopt);
  // Only where the transition has a movable start (end) position; coordinates are finite.
  static EditStatus SetStartPosition(const TrackItemRef& transition, ParamPoint position);
  static EditStatus SetEndPosition(const TrackItemRef& transition, ParamPoint position);
  // Pixels, finite and not negative.
  static EditStatus SetBorderWidth(const TrackItemRef& transition, float width);
  static EditStatus SetBorderColor(const TrackItemRef& transition, ParamColor color);
  static EditStatus SetSwitchSources(const TrackItemRef& transition, bool switchSources);
  static EditStatus SetReverse(const TrackItemRef& transition, bool reverse);
  // One direction code, or a code and its pair when the transition takes pairs; every code a
  // single direction bit the transition allows.
  static EditStatus SetDirection(const TrackItemRef& transition,
                                 const std::vector<std::uint32_t>& directions);
  // 1 Off to 4 High.
  static EditStatus SetAntiAliasQuality(const TrackItemRef& transition, int quality);
  static EditStatus SetPrivateData(const TrackItemRef& transition, ParamBlob data);

  // A new duration keeping the alignment on the cut, limited to what the clips allow (see
  // SequenceEditing::SetTransitionDuration); a zero or negative duration is refused. Read the
  // duration back: it may be less than asked.
  static EditStatus SetDuration(const TrackItemRef& transition, TickTime duration);

  // Where the cut lies in the transition.
  enum class Alignment { CenterAtCut, StartAtCut, EndAtCut, Custom };
  static Alignment GetAlignment(const TrackItem& transition);
  // Whether SetAlignment can put the transition there (both clips, enough media, editable).
  static bool CanAlign(const TrackItemRef& transition, Alignment alignment);
  // Slides the transition (SequenceActions::SlideTransition) so that the cut lies at its middle,
  // start or end. Custom changes nothing.
  static EditStatus SetAlignment(const TrackItemRef& transition, Alignment alignment);
};
