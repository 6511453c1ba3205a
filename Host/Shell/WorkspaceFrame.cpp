#include "Host/Shell/WorkspaceFrame.h"

#include <algorithm>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"

namespace {

constexpr Color kStripColor(38, 38, 38);
constexpr Color kFrontLabelColor(58, 58, 58);
constexpr Color kBackLabelColor(45, 45, 45);
constexpr Color kFrontTextColor(230, 230, 230);
constexpr Color kBackTextColor(150, 150, 150);
constexpr Color kAccentColor(70, 130, 220);
constexpr int kLabelPadding = 12;
constexpr int kMaxLabelWidth = 220;
constexpr int kFlyoutButtonWidth = 22;
constexpr Color kFlyoutGlyphColor(190, 190, 190);
constexpr int kFileMenuButtonWidth = 44;
// The editing layout's split: the panel's share of the width, the timeline's of the height.
constexpr int kPanelWidthPercent = 50;
constexpr int kTimelineHeightPercent = 38;
constexpr int kGap = 2;

constexpr std::string_view kFileMenuText = R"(
menu Workspace_File_Menu
  item 57601 "$$$/Vantile/Shell/Menu/Open=Open Project..."
  item 57603 "$$$/Vantile/Shell/Menu/Save=Save"
  item 57604 "$$$/Vantile/Shell/Menu/SaveAs=Save As..."
  separator
  item 57643 "$$$/Vantile/Shell/Menu/Undo=Undo"
  item 57644 "$$$/Vantile/Shell/Menu/Redo=Redo"
  separator
  item 57665 "$$$/Vantile/Shell/Menu/Quit=Quit"
end
)";

}  // namespace

WorkspaceFrame::WorkspaceFrame() = default;

void WorkspaceFrame::AddTab(const std::shared_ptr<TabView>& tab, bool show) {
  if (tab == nullptr)
    return;
  Prune();
  const bool known = std::any_of(mTabs.begin(), mTabs.end(),
                                 [&](const std::weak_ptr<TabView>& t) { return t.lock() == tab; });
  if (!known)
    mTabs.push_back(tab);
  AddChild(tab);
  LayOutTabs();
  if (show || GetFrontTab() == nullptr) {
    BringTabToFront(*tab, true, false);
  } else {
    tab->Hide();
  }
  InvalidateRect({0, 0, GetBounds().Width(), kTabStripHeight});
}

void WorkspaceFrame::BringTabToFront(TabView& tab, bool select, bool focus) {
  if (tab.GetParent() != this)
    return;
  if (select) {
    mFront = std::static_pointer_cast<TabView>(tab.shared_from_this());
    for (TabView* other : GetTabs()) {
      if (other != &tab)
        other->Hide();
    }
    tab.Show();
    InvalidateRect({0, 0, GetBounds().Width(), kTabStripHeight});
  }
  if (focus && tab.IsVisible())
    tab.BecomeTarget();
}

void WorkspaceFrame::SetMaximized(bool maximized) {
  if (maximized == mMaximized)
    return;
  mMaximized = maximized;
  // Panels keep separate layouts for a maximised frame: let them lay out again at the same size.
  for (TabView* tab : GetTabs()) {
    tab->SetBoundsSelf(tab->GetBounds());
    tab->Invalidate();
  }
}

std::vector<TabView*> WorkspaceFrame::GetTabs() const {
  std::vector<TabView*> tabs;
  for (const auto& weak : mTabs) {
    if (const auto tab = weak.lock(); tab != nullptr && tab->GetParent() == this)
      tabs.push_back(tab.get());
  }
  return tabs;
}

TabView* WorkspaceFrame::GetFrontTab() const {
  const auto front = mFront.lock();
  return front != nullptr && front->GetParent() == this ? front.get() : nullptr;
}

TabView* WorkspaceFrame::FindTab(std::string_view handlerID) const {
  for (TabView* tab : GetTabs()) {
    if (tab->GetHandlerID() == handlerID)
      return tab;
  }
  return nullptr;
}

Rect WorkspaceFrame::GetTabLabelRect(std::size_t index) const {
  const Font font(kFont_Normal);
  int left = 0;
  const auto tabs = GetTabs();
  for (std::size_t i = 0; i < tabs.size(); ++i) {
    const int width =
        std::min(kMaxLabelWidth,
                 font.StringWidth(LocalizeString(tabs[i]->GetTabName())) + 2 * kLabelPadding);
    if (i == index)
      return {left, 0, left + width, kTabStripHeight};
    left += width + 1;
  }
  return {};
}

Rect WorkspaceFrame::GetTabArea() const {
  const Size size = GetSize();
  const int top = std::min(kTabStripHeight, size.height);
  if (!HasEditingViews())
    return {0, top, size.width, size.height};
  return {0, top, size.width * kPanelWidthPercent / 100, GetTimelineArea().top};
}

Rect WorkspaceFrame::GetMonitorArea() const {
  if (!HasEditingViews())
    return {};
  const Rect tabs = GetTabArea();
  return {std::min(tabs.right + kGap, GetSize().width), tabs.top, GetSize().width, tabs.bottom};
}

Rect WorkspaceFrame::GetTimelineArea() const {
  if (!HasEditingViews())
    return {};
  const Size size = GetSize();
  const int top = std::min(kTabStripHeight, size.height);
  const int height = std::max(0, size.height - top) * kTimelineHeightPercent / 100;
  return {0, std::max(top, size.height - height), size.width, size.height};
}

void WorkspaceFrame::SetEditingViews(std::shared_ptr<ViewBase> monitor,
                                     std::shared_ptr<ViewBase> timeline) {
  for (const auto& view : {mMonitor, mTimeline}) {
    if (view != nullptr)
      view->Destroy();
  }
  mMonitor = monitor != nullptr && timeline != nullptr ? std::move(monitor) : nullptr;
  mTimeline = mMonitor != nullptr ? std::move(timeline) : nullptr;
  if (mMonitor != nullptr) {
    AddChild(mMonitor);
    AddChild(mTimeline);
  }
  LayOutTabs();
  Invalidate();
}

Rect WorkspaceFrame::GetFlyoutButtonRect() const {
  const TabView* front = GetFrontTab();
  if (front == nullptr || front->GetFlyoutMenuName().empty())
    return {};
  const int width = GetBounds().Width();
  return {std::max(0, width - kFlyoutButtonWidth), 0, width, kTabStripHeight};
}

Rect WorkspaceFrame::GetFileMenuButtonRect() const {
  const Rect flyout = GetFlyoutButtonRect();
  const int right = flyout.IsEmpty() ? GetBounds().Width() : flyout.left;
  return {std::max(0, right - kFileMenuButtonWidth), 0, std::max(0, right), kTabStripHeight};
}

const Menu& WorkspaceFrame::GetFileMenu() {
  static const Menu menu = [] {
    const std::optional<std::vector<Menu>> menus = Menu::Parse(kFileMenuText);
    return menus && !menus->empty() ? menus->front() : Menu("Workspace_File_Menu");
  }();
  return menu;
}

void WorkspaceFrame::TabsChanged() {
  Prune();
  if (GetFrontTab() == nullptr) {
    const auto tabs = GetTabs();
    if (!tabs.empty())
      BringTabToFront(*tabs.back(), true, true);
  }
  Invalidate();
}

void WorkspaceFrame::SetBoundsSelf(const Rect& /*bounds*/) {
  LayOutTabs();
}

void WorkspaceFrame::PaintSelf(DC& dc) {
  const Rect strip{0, 0, GetBounds().Width(), kTabStripHeight};
  dc.FillRect(strip, kStripColor);
  const Font font(kFont_Normal);
  const TabView* front = GetFrontTab();
  const auto tabs = GetTabs();
  if (tabs.empty()) {
    dc.DrawText(LocalizeString("$$$/Vantile/Host/Workspace/NoPanel=No panel is open"), GetTabArea(),
                font, kBackTextColor, TextAlign::kCenter, TextVAlign::kCenter);
  }
  for (std::size_t i = 0; i < tabs.size(); ++i) {
    const Rect label = GetTabLabelRect(i);
    const bool isFront = tabs[i] == front;
    dc.FillRect(label, isFront ? kFrontLabelColor : kBackLabelColor);
    if (isFront)
      dc.FillRect({label.left, 0, label.right, 2}, kAccentColor);
    dc.DrawText(LocalizeString(tabs[i]->GetTabName()), label.Inset(kLabelPadding, 0), font,
                isFront ? kFrontTextColor : kBackTextColor, TextAlign::kLeft, TextVAlign::kCenter);
  }
  dc.DrawText(LocalizeString("$$$/Vantile/Shell/Menu/File=File"), GetFileMenuButtonRect(), font,
              kFrontTextColor, TextAlign::kCenter, TextVAlign::kCenter);
  // Three short bars: the flyout menu button.
  const Rect button = GetFlyoutButtonRect();
  if (!button.IsEmpty()) {
    const int left = button.left + (button.Width() - 10) / 2;
    const int top = button.top + (button.Height() - 7) / 2;
    for (int bar = 0; bar < 3; ++bar)
      dc.FillRect({left, top + 3 * bar, left + 10, top + 3 * bar + 1}, kFlyoutGlyphColor);
  }
}

void WorkspaceFrame::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (const Rect button = GetFileMenuButtonRect(); button.Contains(point)) {
    // From the front tab, so its chain answers first, as the keys do; the tab may go meanwhile.
    TabView* front = GetFrontTab();
    const std::shared_ptr<ViewBase> keep =
        front != nullptr ? front->shared_from_this() : shared_from_this();
    Commander& commander = front != nullptr ? static_cast<Commander&>(*front) : *this;
    const ViewHost* host = GetHost();
    RunPopupMenu(GetFileMenu(), commander, LocalToWindow(Point{button.left, button.bottom}),
                 host != nullptr ? &host->GetShortcutManager() : nullptr);
    return;
  }
  if (const Rect button = GetFlyoutButtonRect(); button.Contains(point)) {
    TabView* front = GetFrontTab();
    // The menu opens under the button, in the tab's coordinates; the tab may go while it runs.
    const std::shared_ptr<ViewBase> keep = front->shared_from_this();
    const Point below = LocalToWindow(Point{button.left, button.bottom});
    front->TrackPopupMenu(front->GetFlyoutMenuName(), front->WindowToLocal(below));
    return;
  }
  const auto tabs = GetTabs();
  for (std::size_t i = 0; i < tabs.size(); ++i) {
    if (GetTabLabelRect(i).Contains(point)) {
      BringTabToFront(*tabs[i], true, true);
      return;
    }
  }
}

void WorkspaceFrame::Prune() {
  std::erase_if(mTabs, [this](const std::weak_ptr<TabView>& weak) {
    const auto tab = weak.lock();
    return tab == nullptr || tab->GetParent() != this;
  });
}

void WorkspaceFrame::LayOutTabs() {
  const Rect area = GetTabArea();
  for (TabView* tab : GetTabs())
    tab->SetBounds(area);
  if (HasEditingViews()) {
    mMonitor->SetBounds(GetMonitorArea());
    mTimeline->SetBounds(GetTimelineArea());
  }
}
