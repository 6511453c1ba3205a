#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"

// Selected track items that belong together: a clip's linked video item and its audio parts,
// or a single transition. Order within each list is the sequence's track order.
struct TrackItemGroup {
  std::vector<TrackItemRef> videoItems;
  std::vector<TrackItemRef> audioItems;

  bool IsEmpty() const { return videoItems.empty() && audioItems.empty(); }
  friend bool operator==(const TrackItemGroup&, const TrackItemGroup&) = default;
};
