#pragma once

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// Undoable settings of a sequence that the panel changes: frame alignment (whether times snap to
// audio samples or video frames) and the zero point of its timecode. One step each, recording the
// old and new value; NoChange (and no step) when it is already set.
class SequenceSettingsActions {
 public:
  static constexpr const char* kSetFrameAlignment = "MZ.SequenceSettingsActions.SetFrameAlignment";
  static constexpr const char* kSetZeroPoint = "MZ.SequenceSettingsActions.SetZeroPoint";

  // PropertiesChangedMessage "MZ.FrameAlignment".
  static EditStatus SetAudioFrameAligned(const SequenceRef& sequence, bool aligned);
  // SequenceZeroPointChangedMessage. InvalidArgument for a time that cannot be stored.
  static EditStatus SetZeroPoint(const SequenceRef& sequence, TickTime time);
};
