#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Toolkit/CommandStatus.h"

class ShortcutManager;

// A command as declared to the shortcut manager. `kind` and `flag` are the declarer's values,
// kept and reported unchanged; `shortcutLabel` is what the keyboard-shortcut editor shows
// (a "$$$/" key or plain text; empty: the command's menu text).
struct CommandDeclaration {
  std::string name;  // "cmd.effectcontrols.rename"
  CommandID id = kNoCommand;
  int kind = 0;
  std::string shortcutLabel;
  std::optional<std::string> immutableString;
  bool flag = false;
  std::string context;  // the context it was declared in
};

// A named set of commands (and key bindings) that applies while a panel is on duty, e.g.
// "effectcontrols". Made and owned by the ShortcutManager (AddContext). UI thread only.
class CommandContext {
 public:
  CommandContext(ShortcutManager& manager, std::string name, std::string label);
  CommandContext(const CommandContext&) = delete;
  CommandContext& operator=(const CommandContext&) = delete;

  const std::string& GetName() const { return mName; }
  // The context's display label (a "$$$/" key or plain text).
  const std::string& GetLabel() const { return mLabel; }

  // Declares a command in this context. A name and an id belong together across all contexts:
  // declaring a known name with another id, or a known id with another name, is refused with a
  // debug assertion, as are an empty name and kNoCommand. Declaring the same command again in
  // the same context changes nothing. True when the command is (now) declared here.
  bool DeclareCommand(std::string_view name, CommandID id, int kind, std::string_view shortcutLabel,
                      std::optional<std::string_view> immutableString, bool flag);
  bool HasCommand(CommandID id) const;
  // In declaration order.
  const std::vector<CommandDeclaration>& GetCommands() const { return mCommands; }

 private:
  friend class ShortcutManager;

  ShortcutManager& mManager;  // owns this context
  std::string mName;
  std::string mLabel;
  std::vector<CommandDeclaration> mCommands;
};
