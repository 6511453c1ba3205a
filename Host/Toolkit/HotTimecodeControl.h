#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/HotTextControl.h"

// A time shown as timecode in hot text (see HotTextControl for the gestures): the current-time
// field, a transition's duration, a timecode parameter. Scrubbing moves one frame per unit
// (Shift ten, Ctrl a tenth) and reports HotTimecodeValueChangingMessage for each new time and
// HotTimecodeValueChangedMessage at the release; typing, Up and Down report one changed message.
// Times are clamped to [minimum, maximum] and, with a quantize rate, start on its frames.
//
// Typed text: timecode as the display rate reads it ("01:00:10:00", "10:00", with ';' for drop
// frame), or digits alone filled from the right ("1000" is 00:00:10:00 at a video rate).
// The zero point is added for display and taken off what is typed. SetTime sends nothing.
class HotTimecodeControl : public HotTextControl {
 public:
  HotTimecodeControl(const Rect& bounds, const FrameRate& displayRate = kFrameRate_30,
                     TickTime time = kTime_Zero, Commander* commander = nullptr);

  void SetTime(TickTime time, bool redraw = true);
  TickTime GetTime() const { return mTime; }

  // The rate the timecode is written in; an invalid rate is refused with a debug assertion.
  void SetFrameRate(const FrameRate& rate);
  const FrameRate& GetFrameRate() const { return mRate; }
  // Times are whole frames of `rate` (a timecode parameter's timebase); nullopt: any tick.
  void SetQuantizeFrameRate(std::optional<FrameRate> rate);
  const std::optional<FrameRate>& GetQuantizeFrameRate() const { return mQuantize; }
  // The timecode shown at time zero (a sequence's starting timecode).
  void SetZeroPoint(TickTime zeroPoint);
  TickTime GetZeroPoint() const { return mZeroPoint; }
  void SetMinTime(TickTime minimum);
  void SetMaxTime(TickTime maximum);
  TickTime GetMinTime() const { return mMin; }
  TickTime GetMaxTime() const { return mMax; }

  std::string GetDisplayText() const override;
  // The time `text` stands for (clamped and quantized), or nullopt when it cannot be read.
  std::optional<TickTime> ParseText(std::string_view text) const;

 protected:
  bool CommitTextSelf(std::string_view text) override;
  void BeginScrubSelf() override;
  void ScrubSelf(double units) override;
  void EndScrubSelf() override;
  void StepSelf(double units) override;

 private:
  TickTime Normalize(TickTime time) const;
  TickTime StepDuration() const;
  bool ApplyUserTime(TickTime time);

  TickTime mTime = kTime_Zero;
  FrameRate mRate;
  std::optional<FrameRate> mQuantize;
  TickTime mZeroPoint = kTime_Zero;
  TickTime mMin = kTime_Min;
  TickTime mMax = kTime_Max;
  TickTime mScrubStart = kTime_Zero;
  bool mSentChanging = false;
};
