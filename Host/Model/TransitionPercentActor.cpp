#include "Host/Model/TransitionPercentActor.h"

#include <cmath>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TransitionActions.h"

namespace {

bool ValidPercent(float value) {
  return std::isfinite(value) && value >= 0.0f && value <= 1.0f;
}

}  // namespace

TransitionPercentActor::TransitionPercentActor(TrackItemRef transition, Which which)
    : mTransition(std::move(transition)), mWhich(which) {
  if (HOST_VERIFY(mTransition && mTransition->IsTransition(), "Invalid TrackItem")) {
    mOrigin = mTransition->GetTransitionData();
  }
}

TransitionPercentActor::~TransitionPercentActor() {
  Rollback();
}

bool TransitionPercentActor::SetPercents(float percent, std::optional<float> other) {
  if (!mTransition || mCommitted || !ValidPercent(percent) || (other && !ValidPercent(*other)) ||
      EditPermissions::IsReadOnly(*mTransition)) {
    return false;
  }
  TransitionData data = mTransition->GetTransitionData();
  float& mine = mWhich == Which::Start ? data.startPercent : data.endPercent;
  float& theirs = mWhich == Which::Start ? data.endPercent : data.startPercent;
  mine = percent;
  if (other) {
    theirs = *other;
  }
  mTransition->SetTransitionData(std::move(data));
  return true;
}

EditStatus TransitionPercentActor::Commit() {
  if (!mTransition || mCommitted) {
    return EditStatus::NoChange;
  }
  const TransitionData after = mTransition->GetTransitionData();
  if (after == mOrigin) {
    return EditStatus::NoChange;
  }
  const char* name = mWhich == Which::Start ? TransitionActions::kSetStartPercent
                                            : TransitionActions::kSetEndPercent;
  TrackItemRef transition = mTransition;
  const EditStatus status = ExecuteModelAction(
      transition->GetProject(),
      FunctionAction::MakeSetter(name, mOrigin, after, [transition](const TransitionData& data) {
        transition->SetTransitionData(data);
      }));
  if (status != EditStatus::Done) {
    Rollback();
    return status;
  }
  mCommitted = true;
  return status;
}

void TransitionPercentActor::Rollback() {
  if (mTransition && !mCommitted) {
    mTransition->SetTransitionData(mOrigin);
  }
}
