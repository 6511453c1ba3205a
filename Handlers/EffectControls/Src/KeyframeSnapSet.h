#pragma once

#include <optional>
#include <set>

#include "Host/Time/TickTime.h"

// The times a keyframe drag snaps to (sequence ticks, unique, ascending). A time snaps to the
// first snap time at or after it when that lies less than the tolerance away, else to the one
// before it under the same rule: the later time wins when both are in range.
//
// Costs: Add is O(log n); Snap is one ordered lookup, O(log n).
class KeyframeSnapSet {
 public:
  void Clear() { mTimes.clear(); }
  void Add(TickTime time) { mTimes.insert(time); }
  bool Contains(TickTime time) const { return mTimes.contains(time); }
  std::size_t Size() const { return mTimes.size(); }
  const std::set<TickTime>& GetTimes() const { return mTimes; }

  // The snap time for `time`, or nullopt when none lies within `tolerance` (exclusive).
  std::optional<TickTime> Snap(TickTime time, TickTime tolerance) const;

 private:
  std::set<TickTime> mTimes;
};
