#include "Host/Toolkit/PopupControl.h"

#include <array>
#include <memory>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MenuTracker.h"

PopupControl::PopupControl(const Rect& bounds, std::int32_t id, Commander* commander)
    : SubView(commander), mID(id) {
  SetBounds(bounds);
  SetTakesFocusOnClick(true);
}

PopupControl::~PopupControl() = default;

// --- Items ---

int PopupControl::AddItem(std::string text, CommandID command) {
  if (!HOST_VERIFY(command < kPlainItemCommandBase, "Popup item command in the reserved range")) {
    return -1;
  }
  mItems.push_back(Item{std::move(text), command, false, true});
  Invalidate();
  return GetItemCount() - 1;
}

int PopupControl::AddSeparator() {
  mItems.push_back(Item{{}, kNoCommand, true, false});
  return GetItemCount() - 1;
}

void PopupControl::SetItems(const std::vector<std::string>& texts) {
  mItems.clear();
  for (const std::string& text : texts) {
    mItems.push_back(Item{text, kNoCommand, false, true});
  }
  mSelected = mItems.empty() ? -1 : 0;
  ++mSelectionCount;
  Invalidate();
}

void PopupControl::ClearItems() {
  mItems.clear();
  mSelected = -1;
  ++mSelectionCount;
  Invalidate();
}

bool PopupControl::LoadMenu(std::string_view registeredMenuName) {
  const Menu* menu = MenuRegistry::Instance().Find(registeredMenuName);
  if (!HOST_VERIFY(menu != nullptr, "Unknown menu resource")) {
    return false;
  }
  LoadMenu(*menu);
  return true;
}

void PopupControl::LoadMenu(const Menu& menu) {
  std::vector<Item> items;
  for (const MenuItem& entry : menu.GetItems()) {
    switch (entry.kind) {
      case MenuItem::Kind::kSeparator:
        items.push_back(Item{{}, kNoCommand, true, false});
        break;
      case MenuItem::Kind::kCommand:
        if (HOST_VERIFY(entry.command != kNoCommand && entry.command < kPlainItemCommandBase,
                        "A popup item needs a numeric command")) {
          items.push_back(Item{entry.text, entry.command, false, true});
        }
        break;
      case MenuItem::Kind::kSubmenu:
        HOST_ASSERT(false, "A popup cannot show a submenu");
        break;
    }
  }
  mItems = std::move(items);
  mSelected = -1;
  ++mSelectionCount;
  for (int i = 0; i < GetItemCount(); ++i) {
    if (!mItems[i].separator) {
      mSelected = i;
      break;
    }
  }
  Invalidate();
}

const PopupControl::Item& PopupControl::GetItem(int index) const {
  static const Item kNone{{}, kNoCommand, true, false};
  if (!HOST_VERIFY(index >= 0 && index < GetItemCount(), "Invalid popup item")) {
    return kNone;
  }
  return mItems[index];
}

void PopupControl::SetItemEnabled(int index, bool enabled) {
  if (!HOST_VERIFY(index >= 0 && index < GetItemCount(), "Invalid popup item")) {
    return;
  }
  if (!mItems[index].separator) {
    mItems[index].enabled = enabled;
  }
}

int PopupControl::FindItemByCommand(CommandID command) const {
  if (command == kNoCommand) {
    return -1;
  }
  for (int i = 0; i < GetItemCount(); ++i) {
    if (!mItems[i].separator && mItems[i].command == command) {
      return i;
    }
  }
  return -1;
}

// --- Selection ---

void PopupControl::SetSelectedIndex(int index) {
  if (!HOST_VERIFY(index >= -1 && index < GetItemCount(), "Invalid popup item") ||
      !HOST_VERIFY(index == -1 || !mItems[index].separator, "A separator cannot be selected")) {
    return;
  }
  ++mSelectionCount;
  if (index != mSelected) {
    mSelected = index;
    Invalidate();
  }
}

bool PopupControl::SelectCommand(CommandID command) {
  const int index = FindItemByCommand(command);
  if (index < 0) {
    return false;
  }
  SetSelectedIndex(index);
  return true;
}

std::string PopupControl::GetSelectedText() const {
  if (mSelected < 0 || mSelected >= GetItemCount()) {
    return {};
  }
  return LocalizeString(mItems[mSelected].text);
}

// --- User actions ---

std::optional<int> PopupControl::OpenMenu() {
  if (!IsEnabledInTree() || !IsVisible() || mItems.empty() || mMenuOpen) {
    return std::nullopt;
  }
  Menu menu(mTitle.empty() ? std::string(GetStation()) : LocalizeString(mTitle));
  for (int i = 0; i < GetItemCount(); ++i) {
    if (mItems[i].separator) {
      menu.AddSeparator();
    } else {
      menu.AddCommand(MenuCommandOf(i), mItems[i].text);
    }
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  mMenuOpen = true;
  mLastChoice.reset();
  Invalidate();
  RunPopupMenu(menu, *this, LocalToWindow(Point{0, GetBounds().Height()}));
  mMenuOpen = false;
  Invalidate();
  return std::exchange(mLastChoice, std::nullopt);
}

bool PopupControl::Step(int direction) {
  if (!IsEnabledInTree() || direction == 0) {
    return false;
  }
  const int step = direction > 0 ? 1 : -1;
  for (int i = mSelected + step; i >= 0 && i < GetItemCount(); i += step) {
    if (IsChoosable(i)) {
      return Choose(i);
    }
  }
  return false;
}

// --- Hooks ---

void PopupControl::LeftButtonDownSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  OpenMenu();
}

void PopupControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  const bool inside = GetLocalBounds().Contains(point);
  if (inside != mHovered) {
    mHovered = inside;
    Invalidate();
  }
}

void PopupControl::MouseLeaveSelf() {
  if (mHovered) {
    mHovered = false;
    Invalidate();
  }
}

bool PopupControl::KeyDownSelf(const KeyEvent& event) {
  switch (event.key) {
    case KeyCode::kSpace:
    case KeyCode::kReturn:
      if (!event.isRepeat) {
        OpenMenu();
      }
      return true;
    case KeyCode::kUp:
      Step(-1);
      return true;
    case KeyCode::kDown:
      Step(1);
      return true;
    default:
      return SubView::KeyDownSelf(event);
  }
}

bool PopupControl::FindCommandStatus(CommandID command, CommandStatus& status) {
  const int index = IndexOfMenuCommand(command);
  if (index < 0) {
    return SubView::FindCommandStatus(command, status);
  }
  const Item& item = mItems[index];
  if (item.command != kNoCommand && GetSuperCommander() != nullptr &&
      GetSuperCommander()->ProcessCommandStatus(command, status)) {
    status.enabled = status.enabled && item.enabled;
    return true;
  }
  status.enabled = item.enabled;
  status.checked = index == mSelected;
  return true;
}

bool PopupControl::ObeyCommand(CommandID command) {
  const int index = IndexOfMenuCommand(command);
  if (index < 0) {
    return SubView::ObeyCommand(command);
  }
  // Ours to dispatch either way: returning false would send an owner's command a second time.
  if (IsChoosable(index) && Choose(index) && mMenuOpen) {
    mLastChoice = index;
  }
  return true;
}

Color PopupControl::PaintFace(DC& dc, const Rect& rect) {
  const bool enabled = IsEnabledInTree();
  std::string_view face = kColor_ControlBackground;
  if (enabled && mMenuOpen) {
    face = kColor_ButtonFacePressed;
  } else if (enabled && mHovered) {
    face = kColor_ButtonFaceHover;
  }
  dc.FillRect(rect, ColorManager::GetColor(face));
  dc.FrameRect(rect,
               ColorManager::GetColor(enabled && IsTarget() ? kColor_Focus : kColor_ControlBorder));
  return ColorManager::GetColor(enabled ? kColor_ControlText : kColor_ControlTextDisabled);
}

void PopupControl::PaintChevron(DC& dc, const Rect& rect, Color color) const {
  const Point c = rect.Center();
  const std::array<Point, 3> chevron{Point{c.x - 3, c.y - 1}, Point{c.x + 4, c.y - 1},
                                     Point{c.x, c.y + 3}};
  dc.FillPolygon(chevron, color);
}

// --- Private ---

CommandID PopupControl::MenuCommandOf(int index) const {
  const CommandID own = mItems[index].command;
  return own != kNoCommand ? own : kPlainItemCommandBase + index;
}

int PopupControl::IndexOfMenuCommand(CommandID command) const {
  if (command >= kPlainItemCommandBase) {
    const int index = command - kPlainItemCommandBase;
    return index < GetItemCount() && !mItems[index].separator && mItems[index].command == kNoCommand
               ? index
               : -1;
  }
  return FindItemByCommand(command);
}

bool PopupControl::IsChoosable(int index) const {
  return index >= 0 && index < GetItemCount() && !mItems[index].separator && mItems[index].enabled;
}

bool PopupControl::Choose(int index) {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const Item item = mItems[index];
  if (item.command != kNoCommand) {
    const std::uint64_t selections = mSelectionCount;
    Commander* owner = GetSuperCommander();
    if (owner == nullptr || !owner->ProcessCommand(item.command)) {
      return false;
    }
    if (IsDestroyed()) {
      return true;
    }
    // The handler may have rebuilt the items or chosen the selection itself.
    if (mSelectionCount == selections && index < GetItemCount() &&
        mItems[index].command == item.command) {
      SetSelectedIndex(index);
    }
  } else {
    SetSelectedIndex(index);
  }
  mStation.Broadcast(PopupControlChangedMessage(index, item.command, mID));
  return true;
}
