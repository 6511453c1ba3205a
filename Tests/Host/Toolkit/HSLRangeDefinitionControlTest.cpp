#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Toolkit/HSLRangeDefinitionControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class HSLRangeDefinitionControlTest : public ControlTest {
 protected:
  HSLRangeDefinitionControlTest() {
    // 361 pixels for 0..360: one pixel per degree.
    range = Add(
        std::make_shared<HSLRangeDefinitionControl>(Rect::FromSize(10, 10, 361, 33), 0.0, 360.0));
    range->SetValues({30.0, 60.0, 180.0, 150.0});
    recorder.ListenTo(range->GetStation());
  }
  static Point Handle(double degrees) {
    return {10 + static_cast<int>(degrees), 10 + HSLRangeDefinitionControl::kBarHeight + 4};
  }
  std::string Values() const {
    const HSLRangeDefinitionValues v = range->GetValues();
    return Format("%g %g %g %g", v.startSoftness, v.startThreshold, v.endThreshold, v.endSoftness);
  }
  std::shared_ptr<HSLRangeDefinitionControl> range;
  MessageRecorder recorder;
};

TEST_F(HSLRangeDefinitionControlTest, SettingPutsTheHandlesInOrder) {
  range->SetValues({100.0, 50.0, 20.0, 400.0});
  EXPECT_EQ(Values(), "100 100 100 260");
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HSLRangeDefinitionControlTest, AHandleStopsAtItsNeighbours) {
  Drag(Handle(60.0), Handle(300.0));
  EXPECT_EQ(Values(), "30 180 180 150");
  EXPECT_EQ(recorder.lines.back(), "HSLRangeDefinitionControlStartThresholdChangedQuickMessage");
  Drag(Handle(210.0), Handle(100.0));  // the end softness handle sits at 360 - 150
  EXPECT_EQ(Values(), "30 180 180 180");
}

TEST_F(HSLRangeDefinitionControlTest, TheBarBetweenTheThresholdsMovesBothWithinTheSoftness) {
  Drag({10 + 100, 15}, {10 + 200, 15});
  EXPECT_EQ(Values(), "30 90 210 150");
  EXPECT_EQ(recorder.lines.back(), "HSLRangeDefinitionControlStartEndThresholdChangedQuickMessage");
}

TEST_F(HSLRangeDefinitionControlTest, KeysMoveTheLastPressedHandleWithinItsNeighbours) {
  Click(Handle(60.0));
  Key(KeyCode::kRight, kKeyModifierShift);
  Key(KeyCode::kLeft);
  EXPECT_EQ(Values(), "30 69 180 150");
  EXPECT_EQ(recorder.lines, (std::vector<std::string>{
                                "HSLRangeDefinitionControlStartThresholdChangedQuickMessage",
                                "HSLRangeDefinitionControlStartThresholdChangedQuickMessage"}));
  Click(Handle(30.0));
  for (int i = 0; i < 5; ++i) {
    Key(KeyCode::kRight, kKeyModifierShift);
  }
  EXPECT_EQ(Values(), "69 69 180 150") << "the start softness stops at the start threshold";
}

}  // namespace
