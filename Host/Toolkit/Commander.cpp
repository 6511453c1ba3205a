#include "Host/Toolkit/Commander.h"

#include <algorithm>

#include "Host/Messaging/Diagnostics.h"

namespace {

// Walks from `start` up the super commanders, asking each; keeps each one alive while it is
// asked, and re-reads its super commander afterwards (the answer may have moved it).
template <class Ask>
bool WalkChain(Commander& start, Ask ask, std::shared_ptr<const void> (*keepAlive)(Commander&)) {
  Commander* commander = &start;
  while (commander != nullptr) {
    const std::shared_ptr<const void> alive = keepAlive(*commander);
    if (ask(*commander)) {
      return true;
    }
    commander = commander->GetSuperCommander();
  }
  return false;
}

}  // namespace

class CommanderAccess {
 public:
  static std::shared_ptr<const void> KeepAlive(Commander& commander) {
    return commander.KeepAliveForDispatch();
  }
};

Commander::Commander(Commander* superCommander) {
  SetSuperCommander(superCommander);
}

Commander::~Commander() {
  DetachFromSuperCommander(true);
  for (Commander* sub : mSubCommanders) {
    sub->mSuperCommander = nullptr;
  }
  mSubCommanders.clear();
}

void Commander::DetachFromSuperCommander(bool dying) {
  if (mSuperCommander == nullptr) {
    mTarget = nullptr;
    return;
  }
  Commander& root = GetRootCommander();
  if (root.mTarget != nullptr && IsSuperCommanderOf(*root.mTarget)) {
    // The target is in this branch: the duty chain shrinks to our super commander.
    if (!dying) {
      for (Commander* commander = root.mTarget; commander != nullptr;
           commander = commander->mSuperCommander) {
        commander->NowOffDuty();
        if (commander == this) {
          break;
        }
      }
    }
    root.mTarget = mSuperCommander == &root ? nullptr : mSuperCommander;
  }
  std::erase(mSuperCommander->mSubCommanders, this);
  mSuperCommander = nullptr;
  mTarget = nullptr;
}

void Commander::SetSuperCommander(Commander* superCommander) {
  if (superCommander == mSuperCommander) {
    return;
  }
  if (!HOST_VERIFY(superCommander == nullptr || !IsSuperCommanderOf(*superCommander),
                   "A commander cannot be its own super commander")) {
    return;
  }
  DetachFromSuperCommander(false);
  if (superCommander != nullptr) {
    mTarget = nullptr;  // a branch keeps no target of its own
    mSuperCommander = superCommander;
    superCommander->mSubCommanders.push_back(this);
  }
}

Commander& Commander::GetRootCommander() {
  Commander* commander = this;
  while (commander->mSuperCommander != nullptr) {
    commander = commander->mSuperCommander;
  }
  return *commander;
}

bool Commander::IsSuperCommanderOf(const Commander& other) const {
  for (const Commander* commander = &other; commander != nullptr;
       commander = commander->mSuperCommander) {
    if (commander == this) {
      return true;
    }
  }
  return false;
}

Commander& Commander::GetTarget() {
  Commander& root = GetRootCommander();
  return root.mTarget != nullptr ? *root.mTarget : root;
}

bool Commander::IsTarget() {
  return &GetTarget() == this;
}

bool Commander::IsOnDuty() {
  return IsSuperCommanderOf(GetTarget());
}

std::vector<Commander*> Commander::ChainFrom(Commander& target) {
  std::vector<Commander*> chain;
  for (Commander* commander = &target; commander != nullptr;
       commander = commander->mSuperCommander) {
    chain.push_back(commander);
  }
  return chain;
}

void Commander::BecomeTarget() {
  Commander& root = GetRootCommander();
  Commander& oldTarget = GetTarget();
  if (&oldTarget == this) {
    return;
  }
  const std::vector<Commander*> oldChain = ChainFrom(oldTarget);
  const std::vector<Commander*> newChain = ChainFrom(*this);
  root.mTarget = this == &root ? nullptr : this;

  const auto inChain = [](const std::vector<Commander*>& chain, Commander* commander) {
    return std::find(chain.begin(), chain.end(), commander) != chain.end();
  };
  const auto switchedAgain = [&] { return &root.GetTarget() != this; };
  for (Commander* commander : oldChain) {
    if (!inChain(newChain, commander)) {
      commander->NowOffDuty();
      if (switchedAgain()) {
        return;
      }
    }
  }
  for (auto it = newChain.rbegin(); it != newChain.rend(); ++it) {
    if (!inChain(oldChain, *it)) {
      (*it)->NowOnDuty();
      if (switchedAgain()) {
        return;
      }
    }
  }
}

bool Commander::ProcessCommand(CommandID command) {
  try {
    if (WalkChain(
            *this, [&](Commander& commander) { return commander.ObeyCommand(command); },
            &CommanderAccess::KeepAlive)) {
      return true;
    }
    return CommandHandler::ObeyFallbackCommand(command);
  } catch (const NullInterfaceException& exception) {
    ReportNullInterface(exception, "Commander::ProcessCommand");
    return true;
  }
}

bool Commander::ProcessCommandStatus(CommandID command, CommandStatus& status) {
  status = CommandStatus{};
  try {
    if (WalkChain(
            *this,
            [&](Commander& commander) { return commander.FindCommandStatus(command, status); },
            &CommanderAccess::KeepAlive)) {
      return true;
    }
    return CommandHandler::FindFallbackCommandStatus(command, status);
  } catch (const NullInterfaceException& exception) {
    ReportNullInterface(exception, "Commander::ProcessCommandStatus");
    status = CommandStatus{};
    return false;
  }
}

bool Commander::ProcessKeyDown(const KeyEvent& event) {
  try {
    return WalkChain(
        *this, [&](Commander& commander) { return commander.KeyDownSelf(event); },
        &CommanderAccess::KeepAlive);
  } catch (const NullInterfaceException& exception) {
    ReportNullInterface(exception, "Commander::ProcessKeyDown");
    return true;
  }
}

bool Commander::ProcessTextInput(std::string_view utf8) {
  try {
    return WalkChain(
        *this, [&](Commander& commander) { return commander.TextInputSelf(utf8); },
        &CommanderAccess::KeepAlive);
  } catch (const NullInterfaceException& exception) {
    ReportNullInterface(exception, "Commander::ProcessTextInput");
    return true;
  }
}

bool Commander::KeyDownSelf(const KeyEvent&) {
  return false;
}

bool Commander::TextInputSelf(std::string_view) {
  return false;
}
