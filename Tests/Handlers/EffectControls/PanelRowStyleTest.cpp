#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Model/UndoStack.h"
#include "Host/Shell/PanelStateDump.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Tests/Handlers/EffectControls/EffectControlsViewTestSupport.h"

namespace panel_view_test {
namespace {

// The preference is the application's: each case puts back what it found.
class PanelRowStyleTest : public PanelViewTest {
 protected:
  PanelRowStyleTest() {
    auto& properties = Preferences::Application().Properties();
    mSaved = properties.GetValue(EffectControlsView::kOwnSliderRowsKey);
    properties.Remove(EffectControlsView::kOwnSliderRowsKey);
  }
  ~PanelRowStyleTest() override {
    auto& properties = Preferences::Application().Properties();
    properties.Remove(EffectControlsView::kOwnSliderRowsKey);
    if (mSaved) {
      properties.SetValue(EffectControlsView::kOwnSliderRowsKey, *mSaved);
    }
  }

  // Opens the panel on a clip with the intrinsic effects.
  void OpenOnClip() {
    Open({900, 600});
    const TrackItemRef clip = builder.AddClip(v1, master, {.start = 0, .end = 5 * kSec});
    sequence->SetSelection({clip});
  }

  // The classes of Motion's Rotation and Position rows, in display order.
  std::vector<std::string> MotionRows() const {
    std::vector<std::string> classes;
    for (const StateDumpRow& row : view->GetListView()->GetDumpRows()) {
      if (row.path.size() == 2 && row.path[0] == "Motion" &&
          (row.path[1] == "Rotation" || row.path[1] == "Position")) {
        classes.push_back(row.className);
      }
    }
    return classes;
  }

  bool Checked() const {
    CommandStatus status;
    EXPECT_TRUE(view->FindCommandStatus(EffectControlsView::kOwnSliderRowsCommand, status));
    EXPECT_TRUE(status.enabled);
    return status.checked;
  }

 private:
  std::optional<PropertyList::Value> mSaved;
};

TEST_F(PanelRowStyleTest, TheCommandSwitchesTheRowStyleRebuildsAndKeepsTheChoice) {
  OpenOnClip();
  EXPECT_FALSE(Checked());
  EXPECT_EQ(MotionRows(), (std::vector<std::string>{"PointPickerParameter", "AngleParameter"}));

  ASSERT_TRUE(view->ObeyCommand(EffectControlsView::kOwnSliderRowsCommand));
  EXPECT_TRUE(Checked());
  EXPECT_EQ(MotionRows(), (std::vector<std::string>{"PointSliderParameter", "PointSliderParameter",
                                                    "AngleSliderParameter"}));
  EXPECT_TRUE(Preferences::Application().Properties().GetBool(EffectControlsView::kOwnSliderRowsKey,
                                                              false));

  ASSERT_TRUE(view->ObeyCommand(EffectControlsView::kOwnSliderRowsCommand));
  EXPECT_FALSE(Checked());
  EXPECT_EQ(MotionRows(), (std::vector<std::string>{"PointPickerParameter", "AngleParameter"}));
  EXPECT_FALSE(
      Preferences::Application().Properties().GetBool(EffectControlsView::kOwnSliderRowsKey, true));
  EXPECT_TRUE(project->GetUndoStack().GetUndoNames().empty());
}

TEST_F(PanelRowStyleTest, APanelOpensInTheStyleThePreferenceKeeps) {
  Preferences::Application().Properties().SetBool(EffectControlsView::kOwnSliderRowsKey, true);
  OpenOnClip();
  EXPECT_TRUE(Checked());
  EXPECT_EQ(MotionRows(), (std::vector<std::string>{"PointSliderParameter", "PointSliderParameter",
                                                    "AngleSliderParameter"}));
}

}  // namespace
}  // namespace panel_view_test
