#include "Host/Toolkit/ShortcutManager.h"

#include <algorithm>
#include <array>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

struct StandardCommand {
  std::string_view name;
  CommandID id;
  std::array<KeyStroke, 2> keys;  // unused slots have no key
};

const std::array<StandardCommand, 19>& StandardCommands() {
  static const std::array<StandardCommand, 19> commands{{
      {"cmd.edit.clear",
       kCommandClear,
       {KeyStroke(KeyCode::kDelete), KeyStroke(KeyCode::kBackspace)}},
      {"cmd.edit.cut", kCommandCut, {KeyStroke(KeyCode::kX, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.edit.copy", kCommandCopy, {KeyStroke(KeyCode::kC, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.edit.paste", kCommandPaste, {KeyStroke(KeyCode::kV, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.edit.selectall",
       kCommandSelectAll,
       {KeyStroke(KeyCode::kA, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.edit.deselectall",
       kCommandDeselectAll,
       {KeyStroke(KeyCode::kA, kKeyModifierCtrl | kKeyModifierShift), KeyStroke()}},
      {"cmd.edit.undo", kCommandUndo, {KeyStroke(KeyCode::kZ, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.edit.redo",
       kCommandRedo,
       {KeyStroke(KeyCode::kZ, kKeyModifierCtrl | kKeyModifierShift), KeyStroke()}},
      {"cmd.file.open", kCommandOpen, {KeyStroke(KeyCode::kO, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.file.save", kCommandSave, {KeyStroke(KeyCode::kS, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.file.saveas",
       kCommandSaveAs,
       {KeyStroke(KeyCode::kS, kKeyModifierCtrl | kKeyModifierShift), KeyStroke()}},
      {"cmd.file.dontsave", kCommandDontSave, {KeyStroke(), KeyStroke()}},
      {"cmd.file.cancelclose", kCommandCancelClose, {KeyStroke(), KeyStroke()}},
      {"cmd.file.quit", kCommandQuit, {KeyStroke(KeyCode::kQ, kKeyModifierCtrl), KeyStroke()}},
      {"cmd.transport.playstop", kCommandPlayStop, {KeyStroke(KeyCode::kSpace), KeyStroke()}},
      {"cmd.transport.gotostart", kCommandGoToStart, {KeyStroke(KeyCode::kHome), KeyStroke()}},
      {"cmd.transport.gotoend", kCommandGoToEnd, {KeyStroke(KeyCode::kEnd), KeyStroke()}},
      {"cmd.transport.stepback", kCommandStepBack, {KeyStroke(KeyCode::kLeft), KeyStroke()}},
      {"cmd.transport.stepforward", kCommandStepForward, {KeyStroke(KeyCode::kRight), KeyStroke()}},
  }};
  return commands;
}

}  // namespace

ShortcutManager& ShortcutManager::Instance() {
  static ShortcutManager manager;
  return manager;
}

ShortcutManager::ShortcutManager() {
  CommandContext* global = AddContext(kGlobalContext, "$$$/Vantile/Shortcuts/Global=Application");
  for (const StandardCommand& command : StandardCommands()) {
    global->DeclareCommand(command.name, command.id, 0, "", std::nullopt, false);
    for (const KeyStroke& key : command.keys) {
      if (key.key != KeyCode::kNone) {
        BindKey(kGlobalContext, key, command.id);
      }
    }
  }
  mActiveContext = std::string(kGlobalContext);
}

ShortcutManager::~ShortcutManager() = default;

void ShortcutManager::RegisterCommandContext(ContextSetup setup) {
  if (HOST_VERIFY(setup != nullptr, "Invalid command context set-up")) {
    setup(*this);
  }
}

CommandContext* ShortcutManager::AddContext(std::string_view name, std::string_view label) {
  if (!HOST_VERIFY(!name.empty(), "Invalid command context name")) {
    return nullptr;
  }
  if (CommandContext* existing = FindContext(name)) {
    return existing;
  }
  mContexts.push_back(
      std::make_unique<CommandContext>(*this, std::string(name), std::string(label)));
  return mContexts.back().get();
}

CommandContext* ShortcutManager::FindContext(std::string_view name) const {
  for (const std::unique_ptr<CommandContext>& context : mContexts) {
    if (context->GetName() == name) {
      return context.get();
    }
  }
  return nullptr;
}

std::vector<const CommandContext*> ShortcutManager::GetContexts() const {
  std::vector<const CommandContext*> contexts;
  for (const std::unique_ptr<CommandContext>& context : mContexts) {
    contexts.push_back(context.get());
  }
  return contexts;
}

bool ShortcutManager::Declare(CommandContext& context, CommandDeclaration declaration) {
  if (!HOST_VERIFY(!declaration.name.empty() && declaration.id != kNoCommand,
                   "Invalid command declaration")) {
    return false;
  }
  const auto byName = mIDsByName.find(declaration.name);
  if (byName != mIDsByName.end() && !HOST_VERIFY(byName->second == declaration.id,
                                                 "Command name already declared with another id")) {
    return false;
  }
  const auto byID = mNamesByID.find(declaration.id);
  if (byID != mNamesByID.end() && !HOST_VERIFY(byID->second == declaration.name,
                                               "Command id already declared with another name")) {
    return false;
  }
  if (context.HasCommand(declaration.id)) {
    return true;
  }
  mIDsByName.emplace(declaration.name, declaration.id);
  mNamesByID.emplace(declaration.id, declaration.name);
  context.mCommands.push_back(std::move(declaration));
  return true;
}

bool ShortcutManager::DeclareKeyRepeatsDisabledCommand(CommandID id) {
  if (!HOST_VERIFY(id != kNoCommand, "Invalid command id")) {
    return false;
  }
  if (!AreKeyRepeatsDisabled(id)) {
    mKeyRepeatsDisabled.push_back(id);
  }
  return true;
}

bool ShortcutManager::AreKeyRepeatsDisabled(CommandID id) const {
  return std::find(mKeyRepeatsDisabled.begin(), mKeyRepeatsDisabled.end(), id) !=
         mKeyRepeatsDisabled.end();
}

bool ShortcutManager::AddWindowMenuID(std::string_view id, std::string_view label,
                                      std::string_view menuName) {
  if (!HOST_VERIFY(!id.empty(), "Invalid window menu id") ||
      !HOST_VERIFY(FindWindowMenu(id) == nullptr, "Window menu id already added")) {
    return false;
  }
  mWindowMenus.push_back({std::string(id), std::string(label), std::string(menuName)});
  return true;
}

const WindowMenuEntry* ShortcutManager::FindWindowMenu(std::string_view id) const {
  for (const WindowMenuEntry& entry : mWindowMenus) {
    if (entry.id == id) {
      return &entry;
    }
  }
  return nullptr;
}

std::optional<CommandID> ShortcutManager::FindCommandID(std::string_view name) const {
  const auto it = mIDsByName.find(name);
  if (it == mIDsByName.end()) {
    return std::nullopt;
  }
  return it->second;
}

const CommandDeclaration* ShortcutManager::FindCommand(CommandID id) const {
  for (const std::unique_ptr<CommandContext>& context : mContexts) {
    for (const CommandDeclaration& command : context->GetCommands()) {
      if (command.id == id) {
        return &command;
      }
    }
  }
  return nullptr;
}

bool ShortcutManager::BindKey(std::string_view context, KeyStroke stroke, CommandID id) {
  if (!HOST_VERIFY(FindContext(context) != nullptr, "Unknown command context") ||
      !HOST_VERIFY(mNamesByID.contains(id), "Binding a key to an undeclared command") ||
      !HOST_VERIFY(stroke.key != KeyCode::kNone, "Binding a stroke without a key")) {
    return false;
  }
  auto bindings = mBindings.find(context);
  if (bindings == mBindings.end()) {
    bindings = mBindings.emplace(std::string(context), std::map<KeyStroke, CommandID>{}).first;
  }
  bindings->second[stroke] = id;
  return true;
}

bool ShortcutManager::UnbindKey(std::string_view context, KeyStroke stroke) {
  const auto bindings = mBindings.find(context);
  return bindings != mBindings.end() && bindings->second.erase(stroke) > 0;
}

const std::map<KeyStroke, CommandID>* ShortcutManager::BindingsOf(std::string_view context) const {
  const auto bindings = mBindings.find(context);
  return bindings != mBindings.end() ? &bindings->second : nullptr;
}

std::optional<CommandID> ShortcutManager::FindCommandForKey(KeyStroke stroke) const {
  stroke = KeyStroke(stroke.key, stroke.modifiers);  // drop foreign modifier bits
  for (const std::string_view context : {std::string_view(mActiveContext), kGlobalContext}) {
    if (const auto* bindings = BindingsOf(context)) {
      if (const auto it = bindings->find(stroke); it != bindings->end()) {
        return it->second;
      }
    }
  }
  return std::nullopt;
}

std::optional<KeyStroke> ShortcutManager::FindKeyForCommand(CommandID id) const {
  for (const std::string_view context : {std::string_view(mActiveContext), kGlobalContext}) {
    if (const auto* bindings = BindingsOf(context)) {
      for (const auto& [stroke, command] : *bindings) {
        // A global stroke the active context took over no longer sends `id`.
        if (command == id && FindCommandForKey(stroke) == id) {
          return stroke;
        }
      }
    }
  }
  return std::nullopt;
}

bool ShortcutManager::SetActiveContext(std::string_view name) {
  if (!HOST_VERIFY(FindContext(name) != nullptr, "Unknown command context")) {
    return false;
  }
  mActiveContext = std::string(name);
  return true;
}
