#pragma once

class PropertyList;
class TabFrame;
class TabView;

// Makes a panel's tab view when the application opens the panel's window. The creator owns
// the view it makes (the frame shares that ownership while the tab is in it). UI thread only.
class TabViewCreator {
 public:
  TabViewCreator() = default;
  TabViewCreator(const TabViewCreator&) = delete;
  TabViewCreator& operator=(const TabViewCreator&) = delete;
  virtual ~TabViewCreator();

  // What the application calls: makes the view through CreateTabView, then restores `state`
  // (the tab's saved state; empty for a first opening) into it. The view, or null.
  virtual TabView* CreateTabViewSelf(TabFrame* frame, const PropertyList& state);
  // The factory: makes the view, hands it to `frame` as a tab (TabView::Create) and returns
  // it. Asked again, it replaces its previous view. `frame` may be null (no workspace).
  virtual TabView* CreateTabView(TabFrame* frame, const PropertyList& state) = 0;
  // Closing the tab only hides it (the view lives on).
  virtual bool ShouldHideWhenClosed() const { return false; }
  // The creator makes at most one view at a time.
  virtual bool IsSingleInstance() const { return false; }
  // The tab's state is saved when the view is destroyed, for the next opening.
  virtual bool ShouldSaveStateWhenDestroyed() const { return true; }
};
