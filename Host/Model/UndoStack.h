#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Host/Messaging/Station.h"
#include "Host/Model/Action.h"
#include "Host/Model/CompoundAction.h"

// The project's undo history. Every model edit is executed here as an Action; one Execute, or
// everything executed between BeginCompound and the matching EndCompound, makes one undo step.
// An action executed from inside another action's Do (a listener reacting to a change message)
// joins the step being executed, after it.
//
// No new action starts while an undo or redo runs: Execute is then refused with a debug
// assertion. UI thread only. After every change of the history, UndoHistoryChangedMessage goes
// out on the station given at construction (none when it is empty).
class UndoStack {
 public:
  explicit UndoStack(StationName station = {});
  UndoStack(const UndoStack&) = delete;
  UndoStack& operator=(const UndoStack&) = delete;
  ~UndoStack();

  // Does the action and records it. False when refused (undo running, null action) or when the
  // action's Do fails; the model is then unchanged by it. Clears the redo steps on success.
  bool Execute(std::unique_ptr<Action> action);

  // False when there is nothing to undo (redo), or while an undo, a redo or a compound step runs.
  bool Undo();
  bool Redo();
  bool CanUndo() const;
  bool CanRedo() const;
  // Name of the step Undo (Redo) would take back (do again); empty when none.
  std::string GetUndoName() const;
  std::string GetRedoName() const;
  // What the user reads for the step Undo would take back (its name unless it has a text).
  std::string GetUndoText() const;
  // Names of the done steps, oldest first; of the undone steps, the next redo first.
  std::vector<std::string> GetUndoNames() const;
  std::vector<std::string> GetRedoNames() const;

  // Gathers what is executed until the matching EndCompound into one step named `name`.
  // Compounds nest; only the outermost one names the step. An empty compound leaves no step.
  void BeginCompound(std::string name, std::string undoText = {});
  void EndCompound();
  bool IsCompoundOpen() const { return mCompoundDepth > 0; }

  // Begin/EndCompound for a scope.
  class ScopedCompound {
   public:
    ScopedCompound(UndoStack& stack, std::string name, std::string undoText = {});
    ScopedCompound(const ScopedCompound&) = delete;
    ScopedCompound& operator=(const ScopedCompound&) = delete;
    ~ScopedCompound();

   private:
    UndoStack& mStack;
  };

  bool IsPerformingUndoOrRedo() const { return mPerforming; }

  // The state last saved: MarkSaved records the current state (after the project was written);
  // IsAtSavedState holds while undo and redo lead back to it. A new step made after undoing past
  // it, or the steps that reach it dropped beyond the maximum, make it unreachable until the next
  // MarkSaved. A new history starts at its saved state. Both announce the history changed.
  void MarkSaved();
  bool IsAtSavedState() const;

  // Forgets every step (the model stays as it is, and so does whether it is saved).
  void Clear();
  // The oldest steps are dropped beyond this many (at least 1; 1000 unless set), which bounds the
  // memory the history holds.
  void SetMaximumSteps(std::size_t steps);
  std::size_t GetMaximumSteps() const { return mMaximumSteps; }

 private:
  void PushStep(std::unique_ptr<Action> step);
  // The `count` oldest done steps are gone: the saved state moves down with them, or out of reach.
  void DropOldestSteps(std::size_t count);
  // The undone steps are gone: a saved state among them is out of reach.
  void ForgetUndoneSteps();
  void NotifyHistoryChanged();

  StationName mStation;
  std::vector<std::unique_ptr<Action>> mDone;    // oldest first
  std::vector<std::unique_ptr<Action>> mUndone;  // next redo last
  std::unique_ptr<CompoundAction> mTransaction;  // the step being gathered, if any
  int mCompoundDepth = 0;
  int mNestedCompounds = 0;  // compounds opened from inside an action's Do
  bool mPerforming = false;
  std::size_t mMaximumSteps = 1000;
  // How many done steps lead to the saved state; none when it cannot be reached any more.
  std::optional<std::size_t> mSavedDepth = 0;
};
