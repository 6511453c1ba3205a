#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Toolkit/TabFrame.h"
#include "Host/Toolkit/TabView.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

class RecordingFrame : public TabFrame {
 public:
  void AddTab(const std::shared_ptr<TabView>& tab, bool show) override {
    tabs.push_back(tab);
    lines.push_back("add " + tab->GetTabName() + (show ? " shown" : " hidden"));
  }
  void BringTabToFront(TabView& tab, bool select, bool focus) override {
    lines.push_back("front " + tab.GetTabName() + (select ? " select" : "") +
                    (focus ? " focus" : ""));
  }
  bool IsMaximized() const override { return maximized; }

  std::vector<std::shared_ptr<TabView>> tabs;
  std::vector<std::string> lines;
  bool maximized = false;
};

// A panel that keeps a split ratio and a flag in its tab state.
class SplitPanel : public TabView {
 public:
  float ratio = 0.0f;
  bool keyframesVisible = true;
  int children = 0;
  std::vector<bool> stackedCalls;

  void SaveStateSelf(PropertyList& state) const override {
    if (ratio != 0.0f) {
      state.SetFloat("Panel.SeparatorRatio", ratio);
    }
    state.SetBool("Panel.AreKeyframesVisible", keyframesVisible);
  }
  void RestoreStateSelf(const PropertyList& state) override {
    ratio = state.GetFloat("Panel.SeparatorRatio", ratio);
    keyframesVisible = state.GetBool("Panel.AreKeyframesVisible", keyframesVisible);
  }
  void CreateChildrenSelf() override { ++children; }
  void SetStackedSelf(bool stacked) override { stackedCalls.push_back(stacked); }
  std::string GetFlyoutMenuName() const override { return "Panel_Flyout_Menu"; }
};

TEST(TabView, CreateHandsTheTabToItsFrameOnceAndMakesItsChildren) {
  ToolkitTestScope scope;
  RecordingFrame frame;
  auto panel = std::make_shared<SplitPanel>();
  ASSERT_TRUE(panel->Create("EffectControls", "Effect Controls", &frame, true));
  EXPECT_FALSE(panel->Create("EffectControls", "Again", &frame, true));
  EXPECT_EQ(frame.lines, (std::vector<std::string>{"add Effect Controls shown"}));
  EXPECT_EQ(frame.tabs.at(0), panel);
  EXPECT_EQ(panel->children, 1);
  EXPECT_EQ(panel->GetHandlerID(), "EffectControls");
  EXPECT_EQ(panel->GetFlyoutMenuName(), "Panel_Flyout_Menu");
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST(TabView, ATabNotHeldByASharedPointerCannotBeCreated) {
  ToolkitTestScope scope;
  SplitPanel panel;
  EXPECT_FALSE(panel.Create("id", "name", nullptr, true));
  EXPECT_FALSE(panel.IsTabCreated());
  EXPECT_EQ(panel.children, 0);
}

TEST(TabView, BringToFrontGoesThroughTheFrame) {
  ToolkitTestScope scope;
  RecordingFrame frame;
  auto panel = std::make_shared<SplitPanel>();
  panel->Create("id", "Panel", &frame, false);
  panel->BringToFront(true, false);
  EXPECT_EQ(frame.lines.back(), "front Panel select");
  frame.maximized = true;
  EXPECT_TRUE(panel->IsFrameMaximized());
}

TEST(TabView, WithoutAFrameBringToFrontShowsAndFocusesItself) {
  ToolkitTestScope scope;
  ViewHost host(Size{100, 100});
  auto panel = std::make_shared<SplitPanel>();
  host.SetRootView(panel);
  panel->Create("id", "Panel", nullptr, false);
  EXPECT_FALSE(panel->IsVisible());
  panel->BringToFront(true, true);
  EXPECT_TRUE(panel->IsShown());
  EXPECT_TRUE(panel->IsTarget());
  EXPECT_FALSE(panel->IsFrameMaximized());
}

TEST(TabView, StateRoundTripsThroughAPropertyList) {
  ToolkitTestScope scope;
  auto panel = std::make_shared<SplitPanel>();
  panel->ratio = 0.375f;
  panel->keyframesVisible = false;
  PropertyList state;
  panel->SaveState(state);
  const std::optional<PropertyList> reread = PropertyList::FromJSON(state.ToJSON());
  ASSERT_TRUE(reread);

  auto restored = std::make_shared<SplitPanel>();
  restored->RestoreState(*reread);
  EXPECT_EQ(restored->ratio, 0.375f);
  EXPECT_FALSE(restored->keyframesVisible);

  // An unset ratio is not written, so restoring keeps what the panel has.
  auto fresh = std::make_shared<SplitPanel>();
  PropertyList freshState;
  fresh->SaveState(freshState);
  EXPECT_FALSE(freshState.Has("Panel.SeparatorRatio"));
  restored->RestoreState(freshState);
  EXPECT_EQ(restored->ratio, 0.375f);
  EXPECT_TRUE(restored->keyframesVisible);
}

TEST(TabView, StackingIsReportedOnlyWhenItChanges) {
  ToolkitTestScope scope;
  auto panel = std::make_shared<SplitPanel>();
  panel->SetStacked(true);
  panel->SetStacked(true);
  panel->SetStacked(false);
  EXPECT_EQ(panel->stackedCalls, (std::vector<bool>{true, false}));
  EXPECT_FALSE(panel->IsStacked());
}

}  // namespace
