#pragma once

#include <string>
#include <string_view>

#include "Host/Toolkit/ViewBase.h"

class PropertyList;
class TabFrame;

// A panel tab: the root of one panel's views inside a workspace frame. It knows its handler,
// its name and its frame, whether it is stacked with other panels, and it saves and restores
// its state as a property list. A tab takes the focus when clicked.
class TabView : public ViewBase {
 public:
  explicit TabView(Commander* superCommander = nullptr);

  // Hands this tab to `frame` (not owned; the frame outlives its tabs) under the handler id and
  // name. Refused (false) with a debug assertion when the tab is not held by a shared_ptr or
  // was created already. A null frame leaves the tab frameless (headless tests).
  bool Create(std::string_view handlerID, std::string_view name, TabFrame* frame, bool show);
  bool IsTabCreated() const { return mTabCreated; }
  const std::string& GetHandlerID() const { return mHandlerID; }
  const std::string& GetTabName() const { return mTabName; }
  TabFrame* GetFrame() const { return mFrame; }
  bool IsFrameMaximized() const;

  // Through the frame; without one, `select` shows the tab and `focus` makes it the target.
  void BringToFront(bool select, bool focus);

  // Stacked tabs share a column with other panels and lay out more tightly.
  void SetStacked(bool stacked);
  bool IsStacked() const { return mStacked; }
  // The tallest this tab wants to be when stacked; the default is its current height.
  virtual int GetMaxStackedHeight() const { return GetBounds().Height(); }

  // The tab's state for the next session, and back.
  void SaveState(PropertyList& state) const;
  void RestoreState(const PropertyList& state);

  // The menu resource of the tab's flyout menu; empty: none.
  virtual std::string GetFlyoutMenuName() const { return {}; }

  // Hooks.
  virtual void SetStackedSelf(bool /*stacked*/) {}
  virtual void SaveStateSelf(PropertyList& /*state*/) const {}
  virtual void RestoreStateSelf(const PropertyList& /*state*/) {}
  // After Create handed the tab to its frame: the panel makes its child views.
  virtual void CreateChildrenSelf() {}

 private:
  std::string mHandlerID;
  std::string mTabName;
  TabFrame* mFrame = nullptr;  // not owned; the frame outlives the tabs it holds
  bool mTabCreated = false;
  bool mStacked = false;
};
