#include "Handlers/EffectControls/Src/KeyframeSnapSet.h"

std::optional<TickTime> KeyframeSnapSet::Snap(TickTime time, TickTime tolerance) const {
  const auto after = mTimes.lower_bound(time);
  if (after != mTimes.end() && SubtractTimes(*after, time) < tolerance) {
    return *after;
  }
  // With nothing at or after the time, the last snap time is still its neighbour.
  if (after != mTimes.begin()) {
    const TickTime before = *std::prev(after);
    if (SubtractTimes(time, before) < tolerance) {
      return before;
    }
  }
  return std::nullopt;
}
