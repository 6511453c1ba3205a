#include "Host/Toolkit/MenuTracker.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/Commander.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/ShortcutManager.h"

namespace {

std::shared_ptr<MenuTracker>& InstalledTracker() {
  static std::shared_ptr<MenuTracker> tracker;
  return tracker;
}

std::vector<PopupMenuEntry> BuildEntries(const std::vector<MenuItem>& items, Commander& commander,
                                         const ShortcutManager& shortcuts) {
  std::vector<PopupMenuEntry> entries;
  entries.reserve(items.size());
  for (const MenuItem& item : items) {
    PopupMenuEntry entry;
    entry.kind = item.kind;
    entry.text = LocalizeString(item.text);
    if (item.kind == MenuItem::Kind::kSubmenu) {
      entry.submenu = BuildEntries(item.submenu, commander, shortcuts);
      entry.enabled = true;
    } else if (item.kind == MenuItem::Kind::kCommand) {
      if (const std::optional<CommandID> command = Menu::ResolveCommand(item, shortcuts)) {
        entry.command = *command;
        CommandStatus status;
        commander.ProcessCommandStatus(*command, status);
        entry.enabled = status.enabled;
        entry.checked = status.checked;
        entry.mark = status.mark;
        if (!status.text.empty()) {
          entry.text = LocalizeString(status.text);
        }
        if (const std::optional<KeyStroke> key = shortcuts.FindKeyForCommand(*command)) {
          entry.shortcut = key->ToString();
        }
      }
    }
    entries.push_back(std::move(entry));
  }
  return entries;
}

bool IsEnabledCommandOf(const std::vector<PopupMenuEntry>& entries, CommandID command) {
  for (const PopupMenuEntry& entry : entries) {
    if (entry.kind == MenuItem::Kind::kCommand && entry.command == command && entry.enabled) {
      return true;
    }
    if (entry.kind == MenuItem::Kind::kSubmenu && IsEnabledCommandOf(entry.submenu, command)) {
      return true;
    }
  }
  return false;
}

}  // namespace

std::shared_ptr<MenuTracker> SetMenuTracker(std::shared_ptr<MenuTracker> tracker) {
  return std::exchange(InstalledTracker(), std::move(tracker));
}

std::shared_ptr<MenuTracker> GetMenuTracker() {
  return InstalledTracker();
}

PopupMenuRequest BuildPopupMenuRequest(const Menu& menu, Commander& commander, Point windowPoint,
                                       const ShortcutManager* shortcuts) {
  PopupMenuRequest request;
  request.menuName = menu.GetName();
  request.windowPoint = windowPoint;
  request.entries = BuildEntries(menu.GetItems(), commander,
                                 shortcuts != nullptr ? *shortcuts : ShortcutManager::Instance());
  return request;
}

std::optional<CommandID> RunPopupMenu(std::string_view menuName, Commander& commander,
                                      Point windowPoint, const ShortcutManager* shortcuts) {
  const Menu* menu = MenuRegistry::Instance().Find(menuName);
  if (!HOST_VERIFY(menu != nullptr, "Unknown menu resource")) {
    return std::nullopt;
  }
  // A copy: the command may register menus again while it runs.
  const Menu shown = *menu;
  return RunPopupMenu(shown, commander, windowPoint, shortcuts);
}

std::optional<CommandID> RunPopupMenu(const Menu& menu, Commander& commander, Point windowPoint,
                                      const ShortcutManager* shortcuts) {
  const std::shared_ptr<MenuTracker> tracker = InstalledTracker();
  if (tracker == nullptr) {
    return std::nullopt;
  }
  const PopupMenuRequest request = BuildPopupMenuRequest(menu, commander, windowPoint, shortcuts);
  const std::optional<CommandID> chosen = tracker->TrackPopupMenu(request);
  if (!chosen) {
    return std::nullopt;
  }
  if (!HOST_VERIFY(IsEnabledCommandOf(request.entries, *chosen),
                   "The chosen command is not an enabled item of the menu")) {
    return std::nullopt;
  }
  commander.ProcessCommand(*chosen);
  return chosen;
}
