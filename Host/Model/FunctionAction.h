#pragma once

#include <functional>
#include <memory>
#include <string>

#include "Host/Model/Action.h"

// An action made of two functions, for small edits: the functions capture the objects they
// change (by reference, keeping them alive) and the old and new values.
class FunctionAction : public Action {
 public:
  // `doIt` returns false when the change cannot be applied (nothing changed).
  FunctionAction(std::string name, std::function<bool()> doIt, std::function<void()> undoIt);

  bool Do() override { return mDo(); }
  void Undo() override { mUndo(); }

  // Shorthand for an action that sets a value: `apply(newValue)` to do, `apply(oldValue)` to undo.
  template <class T, class Apply>
  static std::unique_ptr<Action> MakeSetter(std::string name, T oldValue, T newValue, Apply apply) {
    return std::make_unique<FunctionAction>(
        std::move(name),
        [apply, newValue] {
          apply(newValue);
          return true;
        },
        [apply, oldValue] { apply(oldValue); });
  }

 private:
  std::function<bool()> mDo;
  std::function<void()> mUndo;
};
