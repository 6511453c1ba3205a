#pragma once

#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// A keyframe drag: moves the selected keyframes of a KeyframeMultiSelection live, without undo
// steps, while the mouse moves, then commits the whole gesture as one undoable action or rolls
// it back. The selection follows the keyframes (its times move with them).
//
// The state of the parameters at construction is the gesture's origin; every move is applied to
// it afresh, so a move that is limited or refused never leaves the keyframes in between. Limits,
// per selected keyframe, on its own parameter's curve:
//   - it stays at least one frame (of the track item's sequence, in clip time) away from the
//     nearest keyframe that is not selected, so keyframes never pass or land on one another;
//   - it stays inside the clip, from the clip time of the item's start to that of its end
//     (a master clip's media in master-clip mode); one that lies outside already may only move
//     back towards the clip.
// Value moves change scalar keyframes only, limited to each parameter's range.
//
// The actor keeps the selection alive (shared). Destroying an actor with an uncommitted move
// rolls it back. UI thread only; the model must not be edited otherwise during the gesture.
class KeyframeMultiSelectionActor {
 public:
  KeyframeMultiSelectionActor(SequenceRef sequence,
                              std::shared_ptr<KeyframeMultiSelection> selection);
  KeyframeMultiSelectionActor(const KeyframeMultiSelectionActor&) = delete;
  KeyframeMultiSelectionActor& operator=(const KeyframeMultiSelectionActor&) = delete;
  ~KeyframeMultiSelectionActor();

  // How far the keyframes may move in time from where they are now (clip ticks): `delta`
  // limited to the allowed range. 0 when nothing may move (read only, empty selection).
  TickTime LimitMoveDelta(TickTime delta) const;
  // The smallest and largest delta allowed from where the keyframes are now.
  TickTime GetMinimumMoveDelta() const;
  TickTime GetMaximumMoveDelta() const;
  // Limits `delta` (in place) and answers whether a move by it changes anything. `modifiers`
  // (the host's key modifier bits) are accepted for the callers' sake; no modifier changes the
  // limits in this host.
  bool QueryMoveSelection(TickTime& delta, int modifiers = 0) const;

  // Moves from where the keyframes are now by `delta` (limited as above); returns the delta
  // applied.
  TickTime MoveSelection(TickTime delta);
  // Moves to `timeDelta` (limited) and `valueDelta` from the origin of the gesture. False, with
  // nothing changed, on a read-only selection or project.
  bool MoveSelectionTo(TickTime timeDelta, double valueDelta = 0.0);
  // Value deltas of audio gain parameters in decibels (a linear gain g becomes g * 10^(dB / 20)),
  // as their graphs show them; off by default. Set it before moving.
  void SetScaleDB(bool scaleDB) { mScaleDB = scaleDB; }
  TickTime GetTimeDelta() const { return mTimeDelta; }
  double GetValueDelta() const { return mValueDelta; }
  bool HasMoved() const { return mTimeDelta != 0 || mValueDelta != 0.0; }

  // One undo step named kKeyframeActionMoveKeyframes from the origin to where the keyframes are.
  // NoChange when they did not move; when the project refuses the step, the move is rolled back.
  EditStatus CommitMoveSelection(std::string undoText = {});
  // Back to the origin, keyframes and selection; no undo step.
  void RollbackMoveSelection();
  bool IsCommitted() const { return mCommitted; }

 private:
  struct Entry {
    ComponentParamRef param;
    ComponentParam::State origin;
    std::vector<TickTime> times;  // the selected keyframes at the origin, ascending
    TickTime minDelta = 0;        // how far they may move, from the origin
    TickTime maxDelta = 0;
  };
  void Apply(TickTime timeDelta, double valueDelta);
  bool IsEditable() const;

  SequenceRef mSequence;
  std::shared_ptr<KeyframeMultiSelection> mSelection;
  std::vector<Entry> mEntries;
  TickTime mMinDelta = 0;  // over all entries
  TickTime mMaxDelta = 0;
  TickTime mTimeDelta = 0;
  double mValueDelta = 0.0;
  bool mCommitted = false;
  bool mScaleDB = false;
};
