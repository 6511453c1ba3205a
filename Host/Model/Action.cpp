#include "Host/Model/Action.h"

#include <utility>

Action::Action(std::string name, std::string undoText)
    : mName(std::move(name)), mUndoText(std::move(undoText)) {}

Action::~Action() = default;
