#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// Undoable edits of a master clip's own effects (its video chain, shown in master-clip mode).
// The same rules as SequenceActions' track-item effects: applied video effects only, copied, one
// undo step; a read-only master clip (or one from an inactive project) refuses.
class MasterClipEffects {
 public:
  static constexpr const char* kApplyEffects = "MZ.MasterClipEffects.ApplyEffects";
  static constexpr const char* kInsertEffects = "MZ.MasterClipEffects.InsertEffects";

  static bool QueryApplyEffects(const MasterClipRef& clip,
                                const std::vector<ComponentRef>& effects);
  static EditStatus ApplyEffects(const MasterClipRef& clip,
                                 const std::vector<ComponentRef>& effects);
  // At `index` of the chain (limited to [0, count]).
  static EditStatus InsertEffects(const MasterClipRef& clip,
                                  const std::vector<ComponentRef>& effects, int index);
};
