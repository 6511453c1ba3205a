#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "Host/Toolkit/SubView.h"
#include "Host/Toolkit/TabFrame.h"

class Menu;
class TabView;

// The application's workspace: the window's root view, holding the panel tabs stacked in one
// group. A strip along the top shows each tab's name; the front tab fills the rest and the
// others are hidden. Clicking a name brings that tab to the front and focuses it. When the
// front tab names a flyout menu, a button at the strip's right end opens it and sends the
// chosen command from the front tab up its chain. Left of it, "File" opens the program's menu
// (open, save, save as, undo, redo, quit), whose commands take the same way.
//
// The frame shares ownership of its tabs through the view tree; a tab that is destroyed leaves
// it (call TabsChanged afterwards so that another tab comes to the front). UI thread only.
class WorkspaceFrame : public SubView, public TabFrame {
 public:
  static constexpr int kTabStripHeight = 22;

  WorkspaceFrame();

  // --- TabFrame ---
  void AddTab(const std::shared_ptr<TabView>& tab, bool show) override;
  void BringTabToFront(TabView& tab, bool select, bool focus) override;
  bool IsMaximized() const override { return mMaximized; }

  void SetMaximized(bool maximized);

  // The live tabs, in the order they were added.
  std::vector<TabView*> GetTabs() const;
  TabView* GetFrontTab() const;
  TabView* FindTab(std::string_view handlerID) const;
  // Tab i's name label in frame coordinates.
  Rect GetTabLabelRect(std::size_t index) const;
  // The area the tabs fill, in frame coordinates.
  Rect GetTabArea() const;
  // The flyout menu button in frame coordinates; empty when the front tab has no flyout menu.
  Rect GetFlyoutButtonRect() const;
  // The "File" menu button in frame coordinates.
  Rect GetFileMenuButtonRect() const;
  // The program's menu as the "File" button shows it.
  static const Menu& GetFileMenu();

  // The editing layout: the tabs at the top left, `monitor` at the top right and `timeline`
  // along the bottom, the frame owning both (children). Null for both: the tabs fill the frame.
  void SetEditingViews(std::shared_ptr<ViewBase> monitor, std::shared_ptr<ViewBase> timeline);
  bool HasEditingViews() const { return mMonitor != nullptr; }
  ViewBase* GetMonitorView() const { return mMonitor.get(); }
  ViewBase* GetTimelineView() const { return mTimeline.get(); }
  // Their areas in frame coordinates (empty without the editing layout).
  Rect GetMonitorArea() const;
  Rect GetTimelineArea() const;

  // Forgets tabs that left the frame and shows another one when the front tab went.
  void TabsChanged();

  void SetBoundsSelf(const Rect& bounds) override;
  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;

 private:
  void Prune();
  void LayOutTabs();

  std::shared_ptr<ViewBase> mMonitor;
  std::shared_ptr<ViewBase> mTimeline;
  std::vector<std::weak_ptr<TabView>> mTabs;
  std::weak_ptr<TabView> mFront;
  bool mMaximized = false;
};
