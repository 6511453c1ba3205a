#include "Host/Model/ParamStatesAction.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Project.h"

void ParamStatesAction::Add(const ComponentParamRef& param, ComponentParam::State before,
                            ComponentParam::State after) {
  if (!HOST_VERIFY(param != nullptr, "Invalid ComponentParam")) {
    return;
  }
  for (Entry& entry : mEntries) {
    if (entry.param == param) {
      entry.after = std::move(after);
      return;
    }
  }
  mEntries.push_back({param, std::move(before), std::move(after)});
}

bool ParamStatesAction::Do() {
  for (const Entry& entry : mEntries) {
    entry.param->ApplyState(entry.after);
  }
  return true;
}

void ParamStatesAction::Undo() {
  for (auto it = mEntries.rbegin(); it != mEntries.rend(); ++it) {
    it->param->ApplyState(it->before);
  }
}

EditStatus ParamStatesAction::Execute(std::string name, std::string undoText,
                                      std::vector<Change> changes) {
  auto action = std::make_unique<ParamStatesAction>(std::move(name), std::move(undoText));
  Project* project = nullptr;
  for (Change& change : changes) {
    if (!HOST_VERIFY(change.param != nullptr, "Invalid ComponentParam")) {
      return EditStatus::InvalidArgument;
    }
    if (change.after == change.param->GetState()) {
      continue;
    }
    if (change.param->IsReadOnly()) {
      return EditStatus::ReadOnly;
    }
    if (Project* owner = change.param->GetProject()) {
      project = owner;
    }
    action->Add(change.param, change.param->GetState(), std::move(change.after));
  }
  if (action->IsEmpty()) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(project, std::move(action));
}
