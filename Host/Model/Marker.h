#pragma once

#include <string>

#include "Host/Time/TickTime.h"

// A marker of a sequence or a master clip, at a time of its owner (sequence time for sequence
// markers, media time for master-clip markers).
struct Marker {
  TickTime time = kTime_Zero;
  TickTime duration = kTime_Zero;  // 0 for a point marker
  std::string name;
  std::string comment;
  int colorIndex = 0;  // 0 to 7

  friend bool operator==(const Marker&, const Marker&) = default;
};
