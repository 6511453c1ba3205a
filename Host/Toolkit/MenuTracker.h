#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/Menu.h"

class Commander;
class ShortcutManager;

// A menu entry as shown: text localised, command resolved, status asked of the commander
// chain. A command item whose command cannot be resolved is shown disabled.
struct PopupMenuEntry {
  MenuItem::Kind kind = MenuItem::Kind::kCommand;
  CommandID command = kNoCommand;
  std::string text;
  std::string shortcut;  // "Ctrl+C" when a key sends the command
  bool enabled = false;
  bool checked = false;
  CommandMark mark = CommandMark::kCheck;
  std::vector<PopupMenuEntry> submenu;
};

struct PopupMenuRequest {
  std::string menuName;
  Point windowPoint;  // where the menu opens, window coordinates
  std::vector<PopupMenuEntry> entries;
};

// Lets the user pick from a popup menu: the window front end draws and tracks it; headless
// runs answer from their script. Implementations return the chosen command or nullopt when the
// menu was dismissed. UI thread only.
class MenuTracker {
 public:
  MenuTracker() = default;
  MenuTracker(const MenuTracker&) = delete;
  MenuTracker& operator=(const MenuTracker&) = delete;
  virtual ~MenuTracker() = default;

  virtual std::optional<CommandID> TrackPopupMenu(const PopupMenuRequest& request) = 0;
};

// The process-wide tracker; with none installed every popup is dismissed. Returns the
// previous one.
std::shared_ptr<MenuTracker> SetMenuTracker(std::shared_ptr<MenuTracker> tracker);
std::shared_ptr<MenuTracker> GetMenuTracker();
// The same, named for tests that install a scripted tracker.
inline std::shared_ptr<MenuTracker> SetMenuTrackerForTesting(std::shared_ptr<MenuTracker> tracker) {
  return SetMenuTracker(std::move(tracker));
}

// The request for `menu` with each command's status as `commander`'s chain reports it.
// Command names and key labels come from `shortcuts` (null: ShortcutManager::Instance()).
PopupMenuRequest BuildPopupMenuRequest(const Menu& menu, Commander& commander, Point windowPoint,
                                       const ShortcutManager* shortcuts = nullptr);

// Shows the registered menu `menuName` through the tracker and sends the chosen command from
// `commander` up its chain. An answer that is not an enabled command of the menu is ignored
// with a debug assertion; an unknown menu is reported the same way. The chosen command (sent),
// or nullopt.
std::optional<CommandID> RunPopupMenu(std::string_view menuName, Commander& commander,
                                      Point windowPoint,
                                      const ShortcutManager* shortcuts = nullptr);
std::optional<CommandID> RunPopupMenu(const Menu& menu, Commander& commander, Point windowPoint,
                                      const ShortcutManager* shortcuts = nullptr);
