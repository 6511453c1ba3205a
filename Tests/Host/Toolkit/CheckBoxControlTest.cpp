#include <gtest/gtest.h>

#include "Host/Toolkit/CheckBoxControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class CheckBoxControlTest : public ControlTest {
 protected:
  CheckBoxControlTest() {
    box = Add(std::make_shared<CheckBoxControl>(
        Rect::FromSize(10, 10, 150, 18), 140,
        "$$$/Vantile/Handlers/EffectControls/ShowActualSources=Show Actual Sources"));
    recorder.ListenTo(box->GetStation());
  }

  std::shared_ptr<CheckBoxControl> box;
};

TEST_F(CheckBoxControlTest, EachClickFlipsTheStateAndReportsItWithTheID) {
  EXPECT_EQ(box->GetLabel(), "Show Actual Sources");
  Click({15, 18});
  EXPECT_TRUE(box->IsChecked());
  Click({100, 18});  // the label is part of the box
  EXPECT_FALSE(box->IsChecked());
  EXPECT_EQ(recorder.lines, (Lines{"CheckBox #140 on", "CheckBox #140 off"}));
}

TEST_F(CheckBoxControlTest, SettingTheStateFromCodeSendsNothing) {
  box->SetChecked(true);
  EXPECT_TRUE(box->IsChecked());
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(CheckBoxControlTest, SpaceFlipsTheFocusedBox) {
  Click({15, 18});
  recorder.Clear();
  Key(KeyCode::kSpace);
  EXPECT_EQ(recorder.lines, Lines{"CheckBox #140 off"});
}

TEST_F(CheckBoxControlTest, ADisabledBoxIgnoresClicks) {
  box->Disable();
  Click({15, 18});
  EXPECT_FALSE(box->IsChecked());
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(CheckBoxControlTest, AListenerMayDestroyTheBoxWhileItReports) {
  FunctionListener destroyer([this](const Message&) {
    box->Destroy();
    box.reset();
  });
  AddListener(box->GetStation(), destroyer);
  Click({15, 18});
  EXPECT_EQ(box, nullptr);
  EXPECT_TRUE(root->GetChildren().empty());
}

TEST_F(CheckBoxControlTest, TheStationIsUniqueAndGoesWithTheBox) {
  auto other = std::make_shared<CheckBoxControl>(Rect::FromSize(0, 0, 10, 10), 142);
  EXPECT_NE(other->GetStation(), box->GetStation());
  const StationName station = other->GetStation();
  EXPECT_TRUE(StationExists(station));
  other.reset();
  EXPECT_FALSE(StationExists(station));
}

TEST_F(CheckBoxControlTest, PaintsTheBoxAndTheTickInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(10, 10, 150, 18)));
  const Image unchecked = host.GetImage().Clone();
  box->SetChecked(true);
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(10, 10, 150, 18)));
  int differing = 0;
  for (int y = 10; y < 28; ++y) {
    for (int x = 10; x < 10 + CheckBoxControl::kBoxSize; ++x) {
      differing += unchecked.GetPixel(x, y) != host.GetImage().GetPixel(x, y) ? 1 : 0;
    }
  }
  EXPECT_GT(differing, 4);
}

}  // namespace
