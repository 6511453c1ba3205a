#include "Host/Model/FunctionAction.h"

#include <utility>

FunctionAction::FunctionAction(std::string name, std::function<bool()> doIt,
                               std::function<void()> undoIt)
    : Action(std::move(name)), mDo(std::move(doIt)), mUndo(std::move(undoIt)) {}
