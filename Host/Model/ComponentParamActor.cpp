#include "Host/Model/ComponentParamActor.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/Project.h"

ComponentParamActor::ComponentParamActor(ComponentParamRef param, TickTime clipTime)
    : mParam(std::move(param)), mTime(clipTime) {
  HOST_ASSERT(mParam != nullptr, "Invalid ComponentParam");
}

ComponentParamActor::~ComponentParamActor() {
  if (mValueSet && !mCommitted) {
    Commit();
  }
}

bool ComponentParamActor::SetValue(const ParamValue& value) {
  if (!HOST_VERIFY(mParam != nullptr, "Invalid ComponentParam") ||
      !HOST_VERIFY(!mCommitted, "The edit was committed")) {
    return false;
  }
  if (mParam->IsReadOnly()) {
    return false;
  }
  if (!mValueSet) {
    mBefore = mParam->GetState();
  }
  if (!mParam->SetValueAt(mTime, value)) {
    return false;
  }
  mValueSet = true;
  return true;
}

bool ComponentParamActor::Commit() {
  if (!HOST_VERIFY(!mCommitted && mValueSet, "!mCommitted && mValueSet")) {
    return false;
  }
  mCommitted = true;
  ComponentParam::State after = mParam->GetState();
  if (after == mBefore) {
    return true;
  }
  const EditStatus status =
      ExecuteModelAction(mParam->GetProject(),
                         ComponentParamActions::CreateSetStateAction(
                             mParam, ComponentParamActions::kSetValue, mBefore, std::move(after)));
  if (status != EditStatus::Done) {
    // A change the history does not know of must not stay in the model.
    mParam->ApplyState(mBefore);
    return false;
  }
  return true;
}

void ComponentParamActor::Rollback() {
  if (mValueSet && !mCommitted) {
    mParam->ApplyState(mBefore);
  }
  mValueSet = false;
}
