#include "Host/Toolkit/CommandContext.h"

#include <algorithm>
#include <utility>

#include "Host/Toolkit/ShortcutManager.h"

CommandContext::CommandContext(ShortcutManager& manager, std::string name, std::string label)
    : mManager(manager), mName(std::move(name)), mLabel(std::move(label)) {}

bool CommandContext::DeclareCommand(std::string_view name, CommandID id, int kind,
                                    std::string_view shortcutLabel,
                                    std::optional<std::string_view> immutableString, bool flag) {
  CommandDeclaration declaration;
  declaration.name = std::string(name);
  declaration.id = id;
  declaration.kind = kind;
  declaration.shortcutLabel = std::string(shortcutLabel);
  if (immutableString) {
    declaration.immutableString = std::string(*immutableString);
  }
  declaration.flag = flag;
  declaration.context = mName;
  return mManager.Declare(*this, std::move(declaration));
}

bool CommandContext::HasCommand(CommandID id) const {
  return std::any_of(mCommands.begin(), mCommands.end(),
                     [&](const CommandDeclaration& command) { return command.id == id; });
}
