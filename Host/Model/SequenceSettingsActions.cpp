#include "Host/Model/SequenceSettingsActions.h"

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"

EditStatus SequenceSettingsActions::SetAudioFrameAligned(const SequenceRef& sequence,
                                                         bool aligned) {
  if (!HOST_VERIFY(sequence != nullptr, "Invalid Sequence")) {
    return EditStatus::InvalidArgument;
  }
  if (sequence->IsAudioFrameAligned() == aligned) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      sequence->GetProject(),
      FunctionAction::MakeSetter(kSetFrameAlignment, !aligned, aligned,
                                 [sequence](bool a) { sequence->SetAudioFrameAligned(a); }));
}

EditStatus SequenceSettingsActions::SetZeroPoint(const SequenceRef& sequence, TickTime time) {
  if (!HOST_VERIFY(sequence != nullptr, "Invalid Sequence") || !IsStorableTime(time)) {
    return EditStatus::InvalidArgument;
  }
  if (sequence->GetZeroPoint() == time) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      sequence->GetProject(),
      FunctionAction::MakeSetter(kSetZeroPoint, sequence->GetZeroPoint(), time,
                                 [sequence](TickTime t) { sequence->SetZeroPoint(t); }));
}
