#pragma once

#include <memory>
#include <optional>

#include "Host/Rows/ParameterControl.h"
#include "Host/Time/FrameRate.h"

class HotTimecodeControl;

// The row of a timecode parameter: a 90 x 15 timecode field written in the sequence's time
// display. The parameter holds ticks; with a timebase, the row writes whole frames of it (the
// time counted in frames, times the frame duration) and the field steps and shows on them.
// Scrubbing writes live and its release commits one undoable "MZ.ComponentParam.SetValue";
// typing is one step too. A value the model refuses puts the field back to the model's.
class TimecodeParameter : public ParameterControl {
 public:
  static constexpr int kFieldWidth = 90;
  static constexpr int kFieldHeight = 15;

  explicit TimecodeParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;

  // The parameter's value at the edit time, in ticks.
  TickTime GetTime() const;
  // `time` as the row writes it: the start of its frame of the timebase; unchanged without one.
  TickTime Quantize(TickTime time) const;
  // The bound parameter's timebase; nullopt for none.
  std::optional<FrameRate> GetTimebase() const;
  HotTimecodeControl* GetField() const { return mField.get(); }

  // A step of a scrub and the end of a gesture.
  void OnTimecodeChanging(TickTime time);
  void OnTimecodeChanged(TickTime time);

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  std::shared_ptr<HotTimecodeControl> mField;
};
