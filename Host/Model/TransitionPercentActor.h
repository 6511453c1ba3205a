#pragma once

#include <optional>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/TransitionData.h"

// A start- or end-percent change that spans a slider drag: SetPercents changes the transition at
// once, without an undo step; Commit makes everything set since construction one undo step
// (TransitionActions::kSetStartPercent or kSetEndPercent); Rollback, or destroying the actor
// without a commit, restores the transition as it was. UI thread only; not copyable.
class TransitionPercentActor {
 public:
  enum class Which { Start, End };

  TransitionPercentActor(TrackItemRef transition, Which which);
  TransitionPercentActor(const TransitionPercentActor&) = delete;
  TransitionPercentActor& operator=(const TransitionPercentActor&) = delete;
  ~TransitionPercentActor();

  // Fractions 0 to 1: the percent this actor is for, and optionally the other one (pushed along;
  // it keeps the last value given when left out).
  // False, with nothing changed, for values outside 0 to 1, a read-only transition or after a
  // commit.
  bool SetPercents(float percent, std::optional<float> other = std::nullopt);
  // NoChange (no step) when nothing changed; when the project refuses the step the transition
  // is restored.
  EditStatus Commit();
  void Rollback();

  bool IsCommitted() const { return mCommitted; }
  // The start and end percent when the actor was made.
  const TransitionData& GetOrigin() const { return mOrigin; }

 private:
  TrackItemRef mTransition;
  Which mWhich;
  TransitionData mOrigin;
  bool mCommitted = false;
};
