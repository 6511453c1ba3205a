#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>
#include <vector>

#include "Host/Toolkit/TonalRangeDefinitionControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class TonalRangeDefinitionControlTest : public ControlTest {
 protected:
  TonalRangeDefinitionControlTest() {
    // 101 pixels for 0..100: one pixel per percent.
    range = Add(
        std::make_shared<TonalRangeDefinitionControl>(Rect::FromSize(10, 10, 101, 33), 0.0, 100.0));
    range->SetValues({25.0, 10.0, 75.0, 10.0});
    recorder.ListenTo(range->GetStation());
  }
  static Point Handle(double percent) {
    return {10 + static_cast<int>(percent), 10 + TonalRangeDefinitionControl::kBarHeight + 4};
  }
  std::string Values() const {
    const TonalRangeDefinitionValues v = range->GetValues();
    return Format("%g %g %g %g", v.shadowThreshold, v.shadowSoftness, v.highlightThreshold,
                  v.highlightSoftness);
  }
  std::shared_ptr<TonalRangeDefinitionControl> range;
  MessageRecorder recorder;
};

TEST_F(TonalRangeDefinitionControlTest, SettingPutsTheValuesInOrderAndSendsNothing) {
  range->SetValues({80.0, 50.0, 20.0, 400.0});
  EXPECT_EQ(Values(), "80 20 80 80");
  range->SetValues({std::nan(""), -3.0, 200.0, 5.0});
  EXPECT_EQ(Values(), "0 0 100 5");
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(TonalRangeDefinitionControlTest, EachHandleReportsWhatItMoved) {
  Drag(Handle(35.0), Handle(45.0));
  EXPECT_EQ(Values(), "25 20 75 10");
  EXPECT_EQ(recorder.lines.back(), "TonalRangeDefinitionControlShadowSoftnessChangedMessage");
  Drag(Handle(65.0), Handle(55.0));  // the highlight softness handle sits at 75 - 10
  EXPECT_EQ(Values(), "25 20 75 20");
  EXPECT_EQ(recorder.lines.back(), "TonalRangeDefinitionControlHighlightSoftnessChangedMessage");
  Drag(Handle(75.0), Handle(80.0));
  EXPECT_EQ(Values(), "25 20 80 20");
  EXPECT_EQ(recorder.lines.back(), "TonalRangeDefinitionControlHighlightThresholdChangedMessage");
}

TEST_F(TonalRangeDefinitionControlTest, AThresholdPushesTheOtherAlong) {
  Drag(Handle(25.0), Handle(90.0));
  EXPECT_EQ(Values(), "90 10 90 10");
  EXPECT_EQ(recorder.lines.back(),
            "TonalRangeDefinitionControlShadowAndHighlightThresholdChangedMessage");
  recorder.lines.clear();
  range->SetValues({25.0, 10.0, 75.0, 10.0});
  Drag(Handle(75.0), Handle(5.0));
  EXPECT_EQ(Values(), "5 10 5 5") << "the highlight softness stays inside the range";
  EXPECT_EQ(recorder.lines.back(),
            "TonalRangeDefinitionControlShadowAndHighlightThresholdAndHighlightSoftnessChanged"
            "Message");
}

TEST_F(TonalRangeDefinitionControlTest, ShiftKeepsTheSoftEdgeWhereItWas) {
  Drag(Handle(25.0), Handle(30.0), 4, kKeyModifierShift);
  EXPECT_EQ(Values(), "30 5 75 10");
  EXPECT_EQ(recorder.lines.back(),
            "TonalRangeDefinitionControlShadowThresholdAndSoftnessChangedMessage");
}

TEST_F(TonalRangeDefinitionControlTest, TheBarBetweenTheThresholdsMovesBothInsideTheRange) {
  Drag({10 + 50, 15}, {10 + 90, 15});
  EXPECT_EQ(Values(), "50 10 100 10");
  EXPECT_EQ(recorder.lines.back(),
            "TonalRangeDefinitionControlShadowAndHighlightThresholdChangedMessage");
  EXPECT_EQ(std::count(recorder.lines.begin(), recorder.lines.end(),
                       "TonalRangeDefinitionControlShadowAndHighlightThresholdChangedMessage"),
            1);
}

TEST_F(TonalRangeDefinitionControlTest, ANarrowControlTakesNoDrag) {
  auto tiny = Add(
      std::make_shared<TonalRangeDefinitionControl>(Rect::FromSize(200, 60, 1, 33), 0.0, 100.0));
  Drag({200, 85}, {230, 85});
  EXPECT_FALSE(tiny->GetDraggedHandle().has_value());
  EXPECT_EQ(tiny->LocalToValue(0), 0.0);
}

TEST_F(TonalRangeDefinitionControlTest, KeysMoveTheLastPressedHandleAsFinishedChanges) {
  Click(Handle(75.0));
  Key(KeyCode::kRight, kKeyModifierShift);
  Key(KeyCode::kLeft);
  EXPECT_EQ(Values(), "25 10 84 10");
  EXPECT_EQ(recorder.lines, (std::vector<std::string>{
                                "TonalRangeDefinitionControlHighlightThresholdChangedMessage",
                                "TonalRangeDefinitionControlHighlightThresholdChangedMessage"}));
}

}  // namespace
