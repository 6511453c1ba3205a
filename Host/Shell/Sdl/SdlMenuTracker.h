#pragma once

#include <optional>

#include "Host/Toolkit/MenuTracker.h"

class SdlWindow;

// Popup menus drawn over an SDL window: the pointer highlights, a click on an enabled command
// chooses it, hovering (or clicking) a submenu opens it beside its entry; Up, Down, Right, Left,
// Return and Escape work as usual. A click outside every open level, Escape on the top level
// or closing the window dismisses the menu. Runs modally inside the window's loop.
class SdlMenuTracker : public MenuTracker {
 public:
  // The window must outlive the tracker.
  explicit SdlMenuTracker(SdlWindow& window) : mWindow(window) {}

  std::optional<CommandID> TrackPopupMenu(const PopupMenuRequest& request) override;

  // Row heights and widths, for tests that aim at entries.
  static constexpr int kItemHeight = 20;
  static constexpr int kSeparatorHeight = 7;
  static constexpr int kPadding = 4;

 private:
  SdlWindow& mWindow;  // not owned
};
