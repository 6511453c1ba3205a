#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/SequenceEditing.h"
#include "Host/Time/TickTime.h"

// The undoable sequence edits: each runs one SequenceEditing function (or an effect edit) as one
// undo step on the sequence's project. The Query functions answer how far an edit may go: the
// delta limited to what the sequence allows (rounded to frames; 0 when the edit cannot be made).
// The edits themselves refuse a delta beyond that (TimeOutOfRange) rather than doing part of it,
// so callers query first. A read-only sequence gives ReadOnly; an item outside a sequence,
// InvalidArgument.
class SequenceActions {
 public:
  static constexpr const char* kTrimTransitions = "MZ.SequenceActions.TrimTransitions";
  static constexpr const char* kSlideTransition = "MZ.SequenceActions.SlideTransition";
  static constexpr const char* kRollItems = "MZ.SequenceActions.RollItems";
  static constexpr const char* kTrimItems = "MZ.SequenceActions.TrimItems";
  static constexpr const char* kRippleTrimItems = "MZ.SequenceActions.RippleTrimItems";
  static constexpr const char* kRemoveItems = "MZ.SequenceActions.RemoveItems";
  static constexpr const char* kApplyTrackItemEffects = "MZ.SequenceActions.ApplyTrackItemEffects";
  static constexpr const char* kInsertTrackItemEffects =
      "MZ.SequenceActions.InsertTrackItemEffects";
  static constexpr const char* kRemoveAttributes = "MZ.SequenceActions.RemoveAttributes";

  using Edge = SequenceEditing::Edge;

  static TickTime QueryTrimTransition(const TrackItemRef& transition, Edge edge, TickTime delta);
  static EditStatus TrimTransitions(const TrackItemRef& transition, Edge edge, TickTime delta);

  static TickTime QuerySlideTransition(const TrackItemRef& transition, TickTime delta);
  static EditStatus SlideTransition(const TrackItemRef& transition, TickTime delta);

  // Clip A ends where clip B starts, on one track.
  static TickTime QueryRollItems(const TrackItemRef& clipA, const TrackItemRef& clipB,
                                 TickTime delta);
  static EditStatus RollItems(const TrackItemRef& clipA, const TrackItemRef& clipB, TickTime delta);

  // One edge of each item; with `ripple` what follows on their tracks moves along (the items are
  // usually a clip and, unless the user asked for the clip alone, its linked items).
  static TickTime QueryTrimItems(const std::vector<TrackItemRef>& items, Edge edge, TickTime delta,
                                 bool ripple);
  static EditStatus TrimItems(const std::vector<TrackItemRef>& items, Edge edge, TickTime delta,
                              bool ripple);

  static EditStatus RemoveItems(const std::vector<TrackItemRef>& items);

  // Effects dropped or applied onto a clip: whether at least one of `effects` (templates or any
  // components; they are copied, not used) can be applied: an applied (not intrinsic) effect that
  // is no mask, of the clip's media type, on an editable clip.
  static bool QueryApplyTrackItemEffects(const TrackItemRef& item,
                                         const std::vector<ComponentRef>& effects);
  // Appends copies of the applicable effects, one undo step.
  static EditStatus ApplyTrackItemEffects(const TrackItemRef& item,
                                          const std::vector<ComponentRef>& effects);
  // Inserts them at `index` of the clip's chain (limited to [0, count]).
  static EditStatus InsertTrackItemEffects(const TrackItemRef& item,
                                           const std::vector<ComponentRef>& effects, int index);
  // "Remove attributes": every applied effect of the items goes, and their intrinsic effects go
  // back to their default values (keyframes and time variation too). One undo step.
  static EditStatus RemoveAttributes(const std::vector<TrackItemRef>& items);
};
