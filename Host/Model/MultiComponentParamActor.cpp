#include "Host/Model/MultiComponentParamActor.h"

#include <memory>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ParamStatesAction.h"
#include "Host/Model/Project.h"

MultiComponentParamActor::MultiComponentParamActor(std::vector<ComponentParamRef> params,
                                                   TickTime clipTime)
    : mParams(std::move(params)), mTime(clipTime) {
  bool valid = HOST_VERIFY(!mParams.empty(), "Parameters of one component");
  for (const ComponentParamRef& param : mParams) {
    valid = valid && HOST_VERIFY(param != nullptr, "Invalid ComponentParam") &&
            HOST_VERIFY(param->GetComponent() == mParams.front()->GetComponent(),
                        "Parameters of one component");
  }
  mValid = valid;
}

MultiComponentParamActor::~MultiComponentParamActor() {
  if (mValueSet && !mCommitted) {
    Commit();
  }
}

bool MultiComponentParamActor::IsUsable() const {
  return mValid && HOST_VERIFY(!mCommitted, "The edit was committed");
}

void MultiComponentParamActor::RememberBefore() {
  if (!mValueSet) {
    mBefore = CurrentStates();
  }
}

std::vector<ComponentParam::State> MultiComponentParamActor::CurrentStates() const {
  std::vector<ComponentParam::State> states;
  states.reserve(mParams.size());
  for (const ComponentParamRef& param : mParams) {
    states.push_back(param->GetState());
  }
  return states;
}

void MultiComponentParamActor::Restore(const std::vector<ComponentParam::State>& states) {
  for (std::size_t i = 0; i < mParams.size() && i < states.size(); ++i) {
    if (mParams[i]->GetState() != states[i]) {
      mParams[i]->ApplyState(states[i]);
    }
  }
}

bool MultiComponentParamActor::SetValue(std::size_t index, const ParamValue& value) {
  if (!IsUsable() || index >= mParams.size() || mParams[index]->IsReadOnly()) {
    return false;
  }
  RememberBefore();
  if (!mParams[index]->SetValueAt(mTime, value)) {
    return false;
  }
  mValueSet = true;
  return true;
}

bool MultiComponentParamActor::SetValues(const std::vector<ParamValue>& values) {
  if (!IsUsable() || values.size() != mParams.size()) {
    return false;
  }
  for (const ComponentParamRef& param : mParams) {
    if (param->IsReadOnly()) {
      return false;
    }
  }
  RememberBefore();
  const std::vector<ComponentParam::State> beforeCall = CurrentStates();
  for (std::size_t i = 0; i < mParams.size(); ++i) {
    if (!mParams[i]->SetValueAt(mTime, values[i])) {
      // Half a gesture in the model would show a curve or a range no user made.
      Restore(beforeCall);
      return false;
    }
  }
  mValueSet = true;
  return true;
}

bool MultiComponentParamActor::Commit() {
  if (!HOST_VERIFY(!mCommitted && mValueSet, "!mCommitted && mValueSet")) {
    return false;
  }
  mCommitted = true;
  auto action = std::make_unique<ParamStatesAction>(ComponentParamActions::kSetValue);
  for (std::size_t i = 0; i < mParams.size(); ++i) {
    ComponentParam::State after = mParams[i]->GetState();
    if (after != mBefore[i]) {
      action->Add(mParams[i], mBefore[i], std::move(after));
    }
  }
  if (action->IsEmpty()) {
    return true;
  }
  const EditStatus status = ExecuteModelAction(mParams.front()->GetProject(), std::move(action));
  if (status != EditStatus::Done) {
    // A change the history does not know of must not stay in the model.
    Restore(mBefore);
    return false;
  }
  return true;
}

void MultiComponentParamActor::Rollback() {
  if (mValueSet && !mCommitted) {
    Restore(mBefore);
  }
  mValueSet = false;
}
