#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Toolkit/CommandContext.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/Events.h"

// A panel's entry in the window menu: its id, label and flyout menu resource.
struct WindowMenuEntry {
  std::string id;
  std::string label;
  std::string menuName;
};

// Knows every command by name and id, grouped in contexts, and which key sends which command.
// The "global" context holds the standard edit commands (see StandardCommands.h) and their
// keys; it applies everywhere. Another context's bindings apply while it is the active one (a
// panel activates its context when it comes on duty) and win over the global ones.
// UI thread only.
class ShortcutManager {
 public:
  using ContextSetup = std::function<void(ShortcutManager&)>;

  static constexpr std::string_view kGlobalContext = "global";

  // The process-wide manager.
  static ShortcutManager& Instance();

  // Declares the standard edit commands and their keys.
  ShortcutManager();
  ShortcutManager(const ShortcutManager&) = delete;
  ShortcutManager& operator=(const ShortcutManager&) = delete;
  ~ShortcutManager();

  // Runs `setup` now with this manager (a module's command declarations); an empty function
  // is refused with a debug assertion.
  void RegisterCommandContext(ContextSetup setup);
  // The context `name`, made on first use; a later call returns the same context (the label of
  // the first call stays). An empty name is refused (null).
  CommandContext* AddContext(std::string_view name, std::string_view label);
  CommandContext* FindContext(std::string_view name) const;
  // In creation order ("global" first).
  std::vector<const CommandContext*> GetContexts() const;

  // Holding a key bound to `id` does not repeat the command. False for kNoCommand.
  bool DeclareKeyRepeatsDisabledCommand(CommandID id);
  bool AreKeyRepeatsDisabled(CommandID id) const;

  // A panel's window-menu entry; a second entry with the same id is refused (false).
  bool AddWindowMenuID(std::string_view id, std::string_view label, std::string_view menuName);
  const std::vector<WindowMenuEntry>& GetWindowMenus() const { return mWindowMenus; }
  const WindowMenuEntry* FindWindowMenu(std::string_view id) const;

  // Lookups across all contexts.
  std::optional<CommandID> FindCommandID(std::string_view name) const;
  // The first declaration of `id`, or null.
  const CommandDeclaration* FindCommand(CommandID id) const;

  // Binds `stroke` to the declared command `id` in `context`, replacing the stroke's previous
  // binding there. False (nothing bound) for an unknown context, an undeclared command or a
  // stroke without a key.
  bool BindKey(std::string_view context, KeyStroke stroke, CommandID id);
  bool UnbindKey(std::string_view context, KeyStroke stroke);
  // The active context's binding, else the global one.
  std::optional<CommandID> FindCommandForKey(KeyStroke stroke) const;
  // A stroke that sends `id` in the active or the global context (for menus), or nullopt.
  std::optional<KeyStroke> FindKeyForCommand(CommandID id) const;

  // Unknown names are refused (false) and leave the active context as it was.
  bool SetActiveContext(std::string_view name);
  const std::string& GetActiveContext() const { return mActiveContext; }

 private:
  friend class CommandContext;

  bool Declare(CommandContext& context, CommandDeclaration declaration);
  const std::map<KeyStroke, CommandID>* BindingsOf(std::string_view context) const;

  std::vector<std::unique_ptr<CommandContext>> mContexts;
  std::map<std::string, CommandID, std::less<>> mIDsByName;
  std::map<CommandID, std::string> mNamesByID;
  std::map<std::string, std::map<KeyStroke, CommandID>, std::less<>> mBindings;  // by context
  std::vector<CommandID> mKeyRepeatsDisabled;
  std::vector<WindowMenuEntry> mWindowMenus;
  std::string mActiveContext;
};
