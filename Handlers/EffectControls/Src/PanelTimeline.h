#pragma once

#include <memory>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// The panel's one record of time: the edit line, the keyframe area's visible start and zoom
// (seconds per pixel, with the frame rate whose frame lasts one pixel), and the span of the
// shown clip or transition. The panel view writes it from its ruler, zoom and the sequence's
// player; the list, its rows and the keyframe area read it and never keep copies.
//
// Every change that takes is announced with PanelTimelineChangedMessage on GetStation(), after
// the new value is in place; a setter given the stored value (or a value it refuses) changes
// nothing and announces nothing. Delivery is the host's station delivery: listeners added,
// removed or destroyed while it runs, and the timeline's own destruction, are safe.
//
// Owned by the panel view through a std::shared_ptr: the rows hold the edit time by an
// aliasing pointer into it (ShareEditTime), so it outlives the last of them. Times are
// sequence ticks. UI thread only.
class PanelTimeline {
 public:
  // What a PanelTimelineChangedMessage reports; several may come in one message.
  enum Change : unsigned {
    kEditTimeChanged = 0x1,
    kVisibleStartChanged = 0x2,
    kZoomChanged = 0x4,
    kShownRangeChanged = 0x8,
  };

  // The keyframe area's zoom before anyone sets one.
  static constexpr double kInitialSecondsPerPixel = 1.0 / 25.0;

  PanelTimeline();
  ~PanelTimeline();
  PanelTimeline(const PanelTimeline&) = delete;
  PanelTimeline& operator=(const PanelTimeline&) = delete;

  // A unique station, disposed with the timeline.
  const StationName& GetStation() const { return mStation; }

  TickTime GetEditTime() const { return mEditTime; }
  bool SetEditTime(TickTime time);

  // The sequence time at the keyframe area's left edge.
  TickTime GetVisibleStart() const { return mVisibleStart; }
  bool SetVisibleStart(TickTime time);

  // Zero, negative and NaN are refused: a pixel must last some time.
  double GetSecondsPerPixel() const { return mSecondsPerPixel; }
  bool SetSecondsPerPixel(double secondsPerPixel);
  // One frame of this rate lasts one pixel, in whole ticks: at least one tick, and saturated
  // for spans too long to count.
  const FrameRate& GetPixelFrameRate() const { return mPixelFrameRate; }
  // Where `time` lies in the keyframe area, in pixels from its left edge (fractional), and the
  // time at `x` (to the nearest tick, limited to [kTime_Min, kTime_Max]).
  double TimeToX(TickTime time) const;
  TickTime XToTime(double x) const;

  // The targeted clip's or transition's span; an end before the start is taken as the start.
  TickTime GetShownStart() const { return mShownStart; }
  TickTime GetShownEnd() const { return mShownEnd; }
  bool SetShownRange(TickTime start, TickTime end);

  // The edit time for a row to read; keeps `timeline` alive as long as the row holds it.
  static std::shared_ptr<const TickTime> ShareEditTime(
      const std::shared_ptr<const PanelTimeline>& timeline);

 private:
  void Announce(unsigned changes) const;

  StationName mStation;
  TickTime mEditTime = 0;
  TickTime mVisibleStart = 0;
  double mSecondsPerPixel = kInitialSecondsPerPixel;
  FrameRate mPixelFrameRate;
  TickTime mShownStart = 0;
  TickTime mShownEnd = 0;
};

// Sent on PanelTimeline::GetStation() after a change; `changes` holds PanelTimeline::Change bits.
struct PanelTimelineChangedMessage : MessageOf<PanelTimelineChangedMessage> {
  static constexpr std::string_view kTypeName = "PanelTimelineChangedMessage";
  explicit PanelTimelineChangedMessage(unsigned c) : changes(c) {}
  bool Has(PanelTimeline::Change change) const { return (changes & change) != 0; }
  unsigned changes;
};
