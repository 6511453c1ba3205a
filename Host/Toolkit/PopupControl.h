#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

class DC;
class Menu;

// The user chose an item of a popup (menu, Up/Down key); on the popup's station. `index`
// counts every item, separators included; `command` is the item's own command (kNoCommand for
// a plain item); `id` is the owner's number for the popup.
struct PopupControlChangedMessage : MessageOf<PopupControlChangedMessage> {
  static constexpr std::string_view kTypeName = "PopupControlChangedMessage";
  PopupControlChangedMessage(std::int32_t i, CommandID c, std::int32_t d)
      : index(i), command(c), id(d) {}
  std::int32_t index;
  CommandID command;
  std::int32_t id;
};

// What the text and picture popups share: a list of items of which one is selected, a press
// (or Space/Return while focused) that opens the items as a menu through the menu tracker, and
// Up/Down that step to the neighbouring enabled item.
//
// Plain items belong to the popup: choosing one selects it and broadcasts
// PopupControlChangedMessage. Command items (a menu resource's, or added with a command) belong
// to the owner: choosing one sends the command from the popup's super commander up the chain;
// only when someone handles it is the item selected (unless the handler selected another) and
// the message sent, so the popup never shows a choice that did not happen. Their menu status
// (enabled, check mark) is asked of the chain; where nobody answers, the popup answers itself
// (enabled unless disabled here, checked when selected). SetSelectedIndex and the other setters
// send nothing. A handler may destroy the popup. UI thread only.
class PopupControl : public SubView {
 public:
  struct Item {
    std::string text;  // may be a "$$$/" key
    CommandID command = kNoCommand;
    bool separator = false;
    bool enabled = true;
  };

  // The menu command of a plain item is this base plus the item's index (what a script's
  // menu answer names: 1000002 picks the third item). Owner commands stay below it.
  static constexpr CommandID kPlainItemCommandBase = 1000000;

  ~PopupControl() override;

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetControlID(std::int32_t id) { mID = id; }
  std::int32_t GetControlID() const { return mID; }
  // Shown as the menu's name; may be a "$$$/" key.
  void SetTitle(std::string title) { mTitle = std::move(title); }
  const std::string& GetTitle() const { return mTitle; }

  // --- Items ---
  // Each returns the new item's index. An owner command at or above kPlainItemCommandBase is
  // refused (-1) with a debug assertion.
  int AddItem(std::string text, CommandID command = kNoCommand);
  int AddSeparator();
  // Replaces the items by plain items with these texts; the selection goes to the first item
  // (none when empty).
  void SetItems(const std::vector<std::string>& texts);
  void ClearItems();
  // Replaces the items by the menu's command items and separators, keeping their commands
  // (submenus have no place in a popup and are skipped with a debug assertion). The selection
  // goes to the first command item. False (nothing changed) for an unknown registered menu.
  bool LoadMenu(std::string_view registeredMenuName);
  void LoadMenu(const Menu& menu);
  int GetItemCount() const { return static_cast<int>(mItems.size()); }
  // Out-of-range indices give a debug assertion and an empty separator.
  const Item& GetItem(int index) const;
  void SetItemEnabled(int index, bool enabled);
  // The first item with this command, or -1.
  int FindItemByCommand(CommandID command) const;

  // --- Selection ---
  // -1 clears the selection; a separator or an index out of range is refused with a debug
  // assertion. Sends nothing.
  void SetSelectedIndex(int index);
  int GetSelectedIndex() const { return mSelected; }
  // Selects the item with `command`; false when there is none.
  bool SelectCommand(CommandID command);
  // The selected item's text, localised; empty when none is selected.
  std::string GetSelectedText() const;

  // --- User actions ---
  // Opens the items as a menu below the popup, as a press does. The chosen index, or nullopt
  // when dismissed, disabled, empty or the owner refused the command.
  std::optional<int> OpenMenu();
  // Chooses the next (+1) or previous (-1) enabled item, as the arrow keys do; false at the
  // end of the list or when disabled.
  bool Step(int direction);
  bool IsMenuOpen() const { return mMenuOpen; }
  bool IsHovered() const { return mHovered; }

  // --- Hooks ---
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void MouseLeaveSelf() override;
  bool KeyDownSelf(const KeyEvent& event) override;
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

 protected:
  PopupControl(const Rect& bounds, std::int32_t id, Commander* commander);

  // The face every popup draws under its content: background (hover and open shades), a
  // 1-pixel frame (the focus colour while focused). Returns the content colour to draw with.
  Color PaintFace(DC& dc, const Rect& rect);
  // A small downward chevron centred in `rect`.
  void PaintChevron(DC& dc, const Rect& rect, Color color) const;

 private:
  CommandID MenuCommandOf(int index) const;
  int IndexOfMenuCommand(CommandID command) const;
  bool IsChoosable(int index) const;
  // The user chose `index`; true when the choice took effect.
  bool Choose(int index);

  ControlStation mStation{"PopupControl"};
  std::int32_t mID;
  std::string mTitle;
  std::vector<Item> mItems;
  int mSelected = -1;
  std::uint64_t mSelectionCount = 0;  // SetSelectedIndex calls, so Choose sees an owner's pick
  bool mHovered = false;
  bool mMenuOpen = false;
  std::optional<int> mLastChoice;  // set by Choose while a menu is open
};
