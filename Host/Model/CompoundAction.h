#pragma once

#include <cstddef>
#include <memory>
#include <vector>

#include "Host/Model/Action.h"

// Several actions made one undo step: done in order, undone in reverse order.
class CompoundAction : public Action {
 public:
  using Action::Action;

  void Add(std::unique_ptr<Action> action);
  // Takes an action whose Do already ran, at `index` (the undo stack gathering a step).
  void InsertDone(std::size_t index, std::unique_ptr<Action> action);
  std::size_t Size() const { return mActions.size(); }
  bool IsEmpty() const { return mActions.empty(); }
  const Action& At(std::size_t index) const { return *mActions.at(index); }

  // Stops at the first child that fails and undoes the ones before it.
  bool Do() override;
  void Undo() override;

 private:
  std::vector<std::unique_ptr<Action>> mActions;
};
