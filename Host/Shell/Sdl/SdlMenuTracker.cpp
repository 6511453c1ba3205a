#include "Host/Shell/Sdl/SdlMenuTracker.h"

#include <algorithm>
#include <vector>

#include "Host/Shell/Sdl/SdlModal.h"
#include "Host/Shell/Sdl/SdlWindow.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"

namespace {

constexpr Color kBackground(48, 48, 48);
constexpr Color kBorder(90, 90, 90);
constexpr Color kHighlight(60, 110, 200);
constexpr Color kText(225, 225, 225);
constexpr Color kDisabledText(120, 120, 120);
constexpr Color kSeparator(75, 75, 75);
constexpr int kCheckColumn = 18;
constexpr int kShortcutGap = 24;
constexpr int kArrowColumn = 14;
constexpr int kMinimumWidth = 120;

int ItemHeight(const PopupMenuEntry& entry) {
  return entry.kind == MenuItem::Kind::kSeparator ? SdlMenuTracker::kSeparatorHeight
                                                  : SdlMenuTracker::kItemHeight;
}

bool IsSelectable(const PopupMenuEntry& entry) {
  return entry.kind == MenuItem::Kind::kSubmenu ||
         (entry.kind == MenuItem::Kind::kCommand && entry.enabled);
}

// One open level of the menu: its entries and where it is (window coordinates).
struct Level {
  const std::vector<PopupMenuEntry>* entries = nullptr;
  Rect rect;
  int highlighted = -1;

  Rect ItemRect(int index) const {
    int top = rect.top + SdlMenuTracker::kPadding;
    for (int i = 0; i < index; ++i)
      top += ItemHeight((*entries)[static_cast<std::size_t>(i)]);
    return {rect.left, top, rect.right,
            top + ItemHeight((*entries)[static_cast<std::size_t>(index)])};
  }

  int ItemAt(Point point) const {
    if (!rect.Contains(point))
      return -1;
    for (int i = 0; i < static_cast<int>(entries->size()); ++i) {
      if (ItemRect(i).Contains(point))
        return i;
    }
    return -1;
  }
};

class MenuModal : public SdlModal {
 public:
  MenuModal(const PopupMenuRequest& request, Size windowSize)
      : mWindowSize(windowSize), mFont(kFont_Normal) {
    OpenLevel(request.entries, request.windowPoint);
  }

  std::optional<CommandID> GetResult() const { return mResult; }

  Rect GetBounds(Size /*windowSize*/) const override {
    Rect bounds;
    for (const Level& level : mLevels)
      bounds = bounds.Union(level.rect);
    return bounds;
  }

  void Paint(DC& dc) override {
    const Point origin = GetBounds(mWindowSize).TopLeft();
    for (const Level& level : mLevels) {
      const Rect rect = level.rect.Offset(-origin.x, -origin.y);
      dc.FillRect(rect, kBackground);
      dc.FrameRect(rect, kBorder);
      for (int i = 0; i < static_cast<int>(level.entries->size()); ++i) {
        const PopupMenuEntry& entry = (*level.entries)[static_cast<std::size_t>(i)];
        const Rect item = level.ItemRect(i).Offset(-origin.x, -origin.y);
        if (entry.kind == MenuItem::Kind::kSeparator) {
          dc.DrawLine({item.left + 4, item.Center().y}, {item.right - 5, item.Center().y},
                      kSeparator);
          continue;
        }
        if (i == level.highlighted && IsSelectable(entry))
          dc.FillRect(item.Inset(1, 0), kHighlight);
        const Color color = IsSelectable(entry) ? kText : kDisabledText;
        if (entry.checked) {
          const char* mark = entry.mark == CommandMark::kBullet ? "\xE2\x80\xA2"
                             : entry.mark == CommandMark::kDash ? "\xE2\x80\x93"
                                                                : "\xE2\x9C\x93";
          dc.DrawText(mark, {item.left, item.top, item.left + kCheckColumn, item.bottom}, mFont,
                      color, TextAlign::kCenter, TextVAlign::kCenter);
        }
        const Rect textRect{item.left + kCheckColumn, item.top, item.right - kArrowColumn,
                            item.bottom};
        dc.DrawText(entry.text, textRect, mFont, color, TextAlign::kLeft, TextVAlign::kCenter);
        if (!entry.shortcut.empty()) {
          dc.DrawText(entry.shortcut, textRect, mFont, color, TextAlign::kRight,
                      TextVAlign::kCenter);
        }
        if (entry.kind == MenuItem::Kind::kSubmenu) {
          dc.DrawText("\xE2\x96\xB8",
                      {item.right - kArrowColumn, item.top, item.right, item.bottom}, mFont, color,
                      TextAlign::kCenter, TextVAlign::kCenter);
        }
      }
    }
  }

  void MouseMove(Point point) override {
    for (std::size_t depth = mLevels.size(); depth-- > 0;) {
      const int index = mLevels[depth].ItemAt(point);
      if (index < 0)
        continue;
      Highlight(depth, index);
      const PopupMenuEntry& entry = Entry(depth, index);
      if (entry.kind == MenuItem::Kind::kSubmenu)
        OpenSubmenu(depth, index);
      return;
    }
  }

  void MouseUp(MouseButton button, Point point) override {
    // The release of the press that opened the menu lands on it: only a release over an entry
    // counts, and only one that was pressed inside the menu.
    if (!mPressedInside)
      return;
    mPressedInside = false;
    if (button == MouseButton::kMiddle)
      return;
    for (std::size_t depth = mLevels.size(); depth-- > 0;) {
      const int index = mLevels[depth].ItemAt(point);
      if (index < 0)
        continue;
      Choose(depth, index);
      return;
    }
  }

  void MouseDown(MouseButton /*button*/, Point point) override {
    mPressedInside = std::any_of(mLevels.begin(), mLevels.end(),
                                 [&](const Level& level) { return level.rect.Contains(point); });
    if (!mPressedInside)
      mDone = true;  // a click elsewhere dismisses
  }

  void KeyDown(const KeyEvent& event) override {
    const std::size_t depth = std::min(mKeyDepth, mLevels.size() - 1);
    Level& level = mLevels[depth];
    switch (event.key) {
      case KeyCode::kEscape:
      case KeyCode::kLeft:
        if (depth > 0) {
          mLevels.resize(depth);
          mKeyDepth = depth - 1;
        } else if (event.key == KeyCode::kEscape) {
          mDone = true;
        }
        break;
      case KeyCode::kUp:
      case KeyCode::kDown:
        mLevels.resize(depth + 1);
        Step(level, event.key == KeyCode::kDown ? 1 : -1);
        break;
      case KeyCode::kRight:
        if (level.highlighted >= 0 &&
            Entry(depth, level.highlighted).kind == MenuItem::Kind::kSubmenu) {
          OpenSubmenu(depth, level.highlighted);
          mKeyDepth = depth + 1;
          Step(mLevels.back(), 1);
        }
        break;
      case KeyCode::kReturn:
      case KeyCode::kSpace:
        if (level.highlighted >= 0) {
          const bool submenu = Entry(depth, level.highlighted).kind == MenuItem::Kind::kSubmenu;
          Choose(depth, level.highlighted);
          if (submenu) {
            mKeyDepth = depth + 1;
            Step(mLevels.back(), 1);
          }
        }
        break;
      default:
        break;
    }
  }

  bool IsDone() const override { return mDone; }

 private:
  const PopupMenuEntry& Entry(std::size_t depth, int index) const {
    return (*mLevels[depth].entries)[static_cast<std::size_t>(index)];
  }

  void OpenLevel(const std::vector<PopupMenuEntry>& entries, Point topLeft) {
    int width = kMinimumWidth;
    int height = 2 * SdlMenuTracker::kPadding;
    for (const auto& entry : entries) {
      height += ItemHeight(entry);
      int itemWidth = kCheckColumn + mFont.StringWidth(entry.text) + kArrowColumn + 8;
      if (!entry.shortcut.empty())
        itemWidth += kShortcutGap + mFont.StringWidth(entry.shortcut);
      width = std::max(width, itemWidth);
    }
    // Keep it inside the window where it fits: flip left or up at the edges.
    Point at = topLeft;
    if (at.x + width > mWindowSize.width)
      at.x = std::max(0, mWindowSize.width - width);
    if (at.y + height > mWindowSize.height)
      at.y = std::max(0, mWindowSize.height - height);
    mLevels.push_back({&entries, Rect::FromSize(at.x, at.y, width, height), -1});
  }

  void OpenSubmenu(std::size_t depth, int index) {
    mLevels.resize(depth + 1);
    const Rect item = mLevels[depth].ItemRect(index);
    OpenLevel(Entry(depth, index).submenu, {item.right - 2, item.top - SdlMenuTracker::kPadding});
  }

  void Highlight(std::size_t depth, int index) {
    mLevels[depth].highlighted = index;
    mKeyDepth = depth;
    if (mLevels.size() > depth + 1 && Entry(depth, index).kind != MenuItem::Kind::kSubmenu)
      mLevels.resize(depth + 1);
  }

  void Step(Level& level, int direction) {
    const int count = static_cast<int>(level.entries->size());
    for (int tries = 0, i = level.highlighted; tries < count; ++tries) {
      i = (i + direction + count) % count;
      if (IsSelectable((*level.entries)[static_cast<std::size_t>(i)])) {
        level.highlighted = i;
        return;
      }
    }
  }

  void Choose(std::size_t depth, int index) {
    const PopupMenuEntry& entry = Entry(depth, index);
    if (entry.kind == MenuItem::Kind::kSubmenu) {
      OpenSubmenu(depth, index);
      return;
    }
    if (entry.kind != MenuItem::Kind::kCommand || !entry.enabled)
      return;
    mResult = entry.command;
    mDone = true;
  }

  Size mWindowSize;
  Font mFont;
  std::vector<Level> mLevels;  // the top level first; entries point into the request
  std::optional<CommandID> mResult;
  std::size_t mKeyDepth = 0;  // the level the keys move in
  bool mPressedInside = false;
  bool mDone = false;
};

}  // namespace

std::optional<CommandID> SdlMenuTracker::TrackPopupMenu(const PopupMenuRequest& request) {
  if (request.entries.empty())
    return std::nullopt;
  MenuModal modal(request, mWindow.GetSize());
  if (!mWindow.RunModal(modal))
    return std::nullopt;
  return modal.GetResult();
}
