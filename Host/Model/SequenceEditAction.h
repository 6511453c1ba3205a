#pragma once

#include <functional>
#include <string>
#include <vector>

#include "Host/Model/Action.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/TransitionData.h"
#include "Host/Time/TickTime.h"

// Wraps a plain timeline edit (SequenceEditing) in an undoable action. The first Do records the
// sequence's tracks (which items each holds, their times and transition settings), runs the edit
// and records the result; Undo and redo put the recorded state back, touching only the items that
// differ, in one sequence change batch, so they send the same messages the edit sent.
class SequenceEditAction : public Action {
 public:
  using Edit = std::function<EditStatus()>;

  SequenceEditAction(std::string name, SequenceRef sequence, Edit edit);
  ~SequenceEditAction() override;

  // What the edit answered at the first Do (InvalidArgument before it ran).
  EditStatus GetEditStatus() const { return mStatus; }

  bool Do() override;
  void Undo() override;

  // Runs `edit` as action `name` on the sequence's project. The edit's own status when it did not
  // apply (NoChange, TimeOutOfRange, ...); ReadOnly for a read-only sequence.
  static EditStatus Execute(std::string name, const SequenceRef& sequence, Edit edit);

 private:
  struct ItemState {
    TrackItemRef item;
    TickTime start;
    TickTime end;
    TickTime mediaIn;
    TransitionData transition;
  };
  struct TrackState {
    TrackRef track;
    std::vector<ItemState> items;
  };
  std::vector<TrackState> Capture() const;
  void Restore(const std::vector<TrackState>& state);

  SequenceRef mSequence;
  Edit mEdit;
  EditStatus mStatus = EditStatus::InvalidArgument;
  bool mRecorded = false;
  std::vector<TrackState> mBefore;
  std::vector<TrackState> mAfter;
};
