#pragma once

#include <memory>

class TabView;

// The workspace frame that holds panel tabs; the application shell implements it.
class TabFrame {
 public:
  TabFrame() = default;
  TabFrame(const TabFrame&) = delete;
  TabFrame& operator=(const TabFrame&) = delete;
  virtual ~TabFrame() = default;

  // Takes `tab` into the frame (the frame shares its ownership). `show`: show it at once.
  virtual void AddTab(const std::shared_ptr<TabView>& tab, bool show) = 0;
  // Brings `tab` in front of the tabs it is stacked with; `focus`: it also takes the focus.
  virtual void BringTabToFront(TabView& tab, bool select, bool focus) = 0;
  virtual bool IsMaximized() const = 0;
};
