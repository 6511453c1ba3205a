#include "Handlers/EffectControls/Src/KeyframeMarquee.h"

#include <algorithm>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/TimePoint.h"

namespace {

TickTime ToClipTime(const TrackItemRef& trackItem, TickTime sequenceTime) {
  return trackItem ? trackItem->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks()
                   : sequenceTime;
}

}  // namespace

void KeyframeMarquee::Collect(const std::vector<Track>& tracks, int top, int bottom, TickTime first,
                              TickTime last, KeyframeMultiSelection& found) {
  if (last < first) {
    return;
  }
  // The first track that reaches the marquee's top row.
  auto it = std::partition_point(tracks.begin(), tracks.end(),
                                 [top](const Track& track) { return track.bottom <= top; });
  for (; it != tracks.end() && it->top <= bottom; ++it) {
    if (std::min(it->bottom, bottom + 1) - std::max(it->top, top) < 1 || !it->param) {
      continue;
    }
    const KeyframeCurve& curve = it->param->GetKeyframes();
    const TickTime from = ToClipTime(it->trackItem, first);
    const TickTime to = ToClipTime(it->trackItem, last);
    for (const std::size_t index : curve.FindInRange(from, to)) {
      found.AddItem(it->trackItem, it->component, it->param, curve.At(index).time);
    }
  }
}
