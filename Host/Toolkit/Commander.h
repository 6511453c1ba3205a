#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "Host/Toolkit/CommandHandler.h"
#include "Host/Toolkit/Events.h"

// A command handler in a tree of commanders. Each tree (its root has no super commander) has
// one target: the commander that has the keyboard focus and is asked first for commands and
// keys. The target and its super commanders up to the root are "on duty". Commands travel from
// where they start up the super commanders; each commander answers what it knows and returns
// false to pass the rest on; after the root, the fallback handlers are asked.
//
// Super commanders are not owned; a commander that is destroyed detaches its sub commanders
// (they become roots of their own) and, when it was on duty, hands the target to its super
// commander. Views are commanders whose super commander defaults to their parent view.
// UI thread only.
class Commander : public CommandHandler {
 public:
  explicit Commander(Commander* superCommander = nullptr);
  ~Commander() override;

  Commander* GetSuperCommander() const { return mSuperCommander; }
  // Moves this commander (with its sub commanders) under `superCommander` (null: a root).
  // When the target was in the moved branch, the old tree's target falls back to the old super
  // commander; the branch keeps no target of its own.
  void SetSuperCommander(Commander* superCommander);
  const std::vector<Commander*>& GetSubCommanders() const { return mSubCommanders; }
  Commander& GetRootCommander();
  // True when `other` is this commander or lies below it.
  bool IsSuperCommanderOf(const Commander& other) const;

  // The target of this commander's tree (the root itself when none was chosen).
  Commander& GetTarget();
  bool IsTarget();
  bool IsOnDuty();
  // Makes `this` its tree's target: commanders that leave the duty chain get NowOffDuty (from
  // the old target upwards), those that join it get NowOnDuty (from the top down). A hook that
  // switches the target again ends this switch (its own switch has run in full).
  void BecomeTarget();

  // Sends `command` from this commander up the chain, then to the fallback handlers; true when
  // someone handled it. A view in the chain is kept alive while it handles the command, so it
  // may destroy itself. A NullInterfaceException from a handler is recorded as a debug
  // assertion and the command counts as handled (it was meant for that handler).
  bool ProcessCommand(CommandID command);
  // Asks the same chain for the status; false (status disabled) when nobody answers.
  bool ProcessCommandStatus(CommandID command, CommandStatus& status);
  // Offers the key to this commander and up the chain (not to the fallbacks).
  bool ProcessKeyDown(const KeyEvent& event);
  bool ProcessTextInput(std::string_view utf8);

  // Hooks. The duty hooks must not destroy commanders of the chain.
  virtual void NowOnDuty() {}
  virtual void NowOffDuty() {}
  // True when handled; false passes the key on (the view host then tries the shortcuts).
  virtual bool KeyDownSelf(const KeyEvent& event);
  // Typed text (UTF-8); true when handled.
  virtual bool TextInputSelf(std::string_view utf8);

 protected:
  // An owning reference that keeps this commander alive during a dispatch to it; empty for
  // commanders not held by a shared_ptr (they must not be destroyed from their own handlers).
  virtual std::shared_ptr<const void> KeepAliveForDispatch() const { return nullptr; }

  // Leaves the tree: hands on the target (without duty hooks on this one when `dying`) and
  // detaches from the super commander. Sub commanders stay.
  void DetachFromSuperCommander(bool dying);

 private:
  friend class CommanderAccess;

  // The chain from `target` to its root, target first.
  static std::vector<Commander*> ChainFrom(Commander& target);

  Commander* mSuperCommander = nullptr;    // not owned; clears itself out of us when destroyed
  std::vector<Commander*> mSubCommanders;  // not owned; each removes itself when destroyed
  Commander* mTarget = nullptr;            // roots only: the chosen target, null = the root
};
