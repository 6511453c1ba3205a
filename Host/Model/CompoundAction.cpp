#include "Host/Model/CompoundAction.h"

#include <algorithm>
#include <utility>

void CompoundAction::Add(std::unique_ptr<Action> action) {
  if (action) {
    mActions.push_back(std::move(action));
  }
}

void CompoundAction::InsertDone(std::size_t index, std::unique_ptr<Action> action) {
  if (action) {
    mActions.insert(
        mActions.begin() + static_cast<std::ptrdiff_t>(std::min(index, mActions.size())),
        std::move(action));
  }
}

bool CompoundAction::Do() {
  for (std::size_t i = 0; i < mActions.size(); ++i) {
    if (!mActions[i]->Do()) {
      while (i-- > 0) {
        mActions[i]->Undo();
      }
      return false;
    }
  }
  return true;
}

void CompoundAction::Undo() {
  for (auto it = mActions.rbegin(); it != mActions.rend(); ++it) {
    (*it)->Undo();
  }
}
