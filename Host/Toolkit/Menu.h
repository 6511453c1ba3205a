#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Toolkit/CommandStatus.h"

class ShortcutManager;

// One entry of a menu resource. A command item names its command by id or by name (a name is
// looked up in the shortcut manager when the menu is shown); its text may be a "$$$/" key.
struct MenuItem {
  enum class Kind { kCommand, kSeparator, kSubmenu };

  Kind kind = Kind::kCommand;
  CommandID command = kNoCommand;
  std::string commandName;
  std::string text;
  std::vector<MenuItem> submenu;  // kSubmenu only

  friend bool operator==(const MenuItem&, const MenuItem&) = default;
};

// A menu resource: a name and its items, built in code or parsed from text. A value type.
//
// Text form, one statement a line, '#' starts a comment line, indentation is free:
//   menu HandlerEffectControls_Edit_Menu
//     item 18001 "$$$/Vantile/Handlers/EffectControls/Rename=Rename..."
//     item cmd.effectcontrols.save.preset "Save Preset..."
//     separator
//     submenu "Snapping"
//       item 18006 "Snap"
//     end
//   end
// Texts are double-quoted; \" and \\ stand for " and \.
class Menu {
 public:
  Menu() = default;
  explicit Menu(std::string name) : mName(std::move(name)) {}

  const std::string& GetName() const { return mName; }
  const std::vector<MenuItem>& GetItems() const { return mItems; }

  Menu& AddCommand(CommandID command, std::string text);
  Menu& AddCommand(std::string commandName, std::string text);
  Menu& AddSeparator();
  Menu& AddSubmenu(std::string text, const Menu& submenu);

  // The id of a command item: its own, else its name looked up in `shortcuts`, else nullopt.
  static std::optional<CommandID> ResolveCommand(const MenuItem& item,
                                                 const ShortcutManager& shortcuts);

  // Every menu of `text`, in order; nullopt (and *error = "line N: ...") when a line is not
  // understood, a block is not closed, or a menu name repeats. Nothing is half-read.
  static std::optional<std::vector<Menu>> Parse(std::string_view text,
                                                std::string* error = nullptr);

  friend bool operator==(const Menu&, const Menu&) = default;

 private:
  std::string mName;
  std::vector<MenuItem> mItems;
};
