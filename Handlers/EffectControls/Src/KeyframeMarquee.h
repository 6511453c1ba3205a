#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"

class KeyframeMultiSelection;

// What a marquee in the keyframe area selects: the keyframes of every track whose rows overlap
// the marquee's rows by at least one pixel and whose times lie in the marquee's time span.
class KeyframeMarquee {
 public:
  // One time-varying parameter's track, in the area's coordinates.
  struct Track {
    int top = 0;
    int bottom = 0;          // exclusive
    TrackItemRef trackItem;  // null: clip time is sequence time
    ComponentRef component;
    ComponentParamRef param;
  };

  // Adds to `found` the keyframes of the tracks overlapping rows [top, bottom] whose sequence
  // times lie in [first, last] (both included). `tracks` in ascending order of top, without
  // overlaps (the list's display order).
  //
  // Costs: O(log tracks) to find the first track, then O(log keyframes + hits) per track the
  // marquee overlaps; tracks outside it are never read.
  static void Collect(const std::vector<Track>& tracks, int top, int bottom, TickTime first,
                      TickTime last, KeyframeMultiSelection& found);
};
