#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "Host/Toolkit/HueBalanceAndPhaseControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

// "AngleAndMagnitudeChanging 90 50 #3".
class WheelRecorder : public Listener {
 public:
  void ListenToMessage(const Message& message) override {
    const std::string_view type = message.GetTypeName();
    const auto* value = Value(message);
    if (value != nullptr) {
      std::string name(type.substr(std::string_view("HueBalanceAndPhase").size()));
      name.resize(name.size() - std::string_view("Message").size());
      lines.push_back(
          Format("%s %g %g #%d", name.c_str(), value->degrees, value->magnitude, value->cookie));
    }
  }
  static const HueBalanceAndPhaseValue* Value(const Message& m) {
    if (const auto* v = m.As<HueBalanceAndPhasePhaseChangingMessage>())
      return v;
    if (const auto* v = m.As<HueBalanceAndPhasePhaseChangedMessage>())
      return v;
    if (const auto* v = m.As<HueBalanceAndPhaseMagnitudeGainChangingMessage>())
      return v;
    if (const auto* v = m.As<HueBalanceAndPhaseMagnitudeGainChangedMessage>())
      return v;
    if (const auto* v = m.As<HueBalanceAndPhaseAngleAndMagnitudeChangingMessage>())
      return v;
    if (const auto* v = m.As<HueBalanceAndPhaseAngleAndMagnitudeChangedMessage>())
      return v;
    return nullptr;
  }
  std::vector<std::string> lines;
};

class HueBalanceAndPhaseControlTest : public ControlTest {
 protected:
  HueBalanceAndPhaseControlTest() {
    // 105 x 105: centre at local 52, 52, radius 50.
    wheel = Add(std::make_shared<HueBalanceAndPhaseControl>(Rect::FromSize(10, 10, 105, 105), 3));
    AddListener(wheel->GetStation(), wheels);
  }
  static constexpr Point kCenter{62, 62};
  std::shared_ptr<HueBalanceAndPhaseControl> wheel;
  WheelRecorder wheels;
};

TEST_F(HueBalanceAndPhaseControlTest, DraggingSetsTheAngleAndTheMagnitudeFromThePointer) {
  ASSERT_EQ(wheel->GetRadius(), 50);
  Press({kCenter.x + 10, kCenter.y});
  Move({kCenter.x, kCenter.y - 25});
  Release({kCenter.x, kCenter.y - 25});
  EXPECT_DOUBLE_EQ(wheel->GetAngle(), 90.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 50.0);
  EXPECT_EQ(wheels.lines.back(), "AngleAndMagnitudeChanged 90 50 #3");
  EXPECT_EQ(wheels.lines.front(), "AngleAndMagnitudeChanging 0 20 #3");
}

TEST_F(HueBalanceAndPhaseControlTest, TheMagnitudeStopsAtTheRim) {
  Press({kCenter.x - 10, kCenter.y});
  Move({kCenter.x - 200, kCenter.y});
  Release({kCenter.x - 200, kCenter.y});
  EXPECT_DOUBLE_EQ(wheel->GetAngle(), 180.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 100.0);
}

TEST_F(HueBalanceAndPhaseControlTest, CtrlTurnsOnlyTheAngleAndShiftChangesOnlyTheMagnitude) {
  wheel->SetValue(0.0, 40.0);
  Press({kCenter.x, kCenter.y + 10}, kKeyModifierCtrl);
  Release({kCenter.x, kCenter.y + 10}, kKeyModifierCtrl);
  EXPECT_DOUBLE_EQ(wheel->GetAngle(), 270.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 40.0);
  Press({kCenter.x + 5, kCenter.y}, kKeyModifierShift);
  Release({kCenter.x + 5, kCenter.y}, kKeyModifierShift);
  EXPECT_DOUBLE_EQ(wheel->GetAngle(), 270.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 10.0);
  EXPECT_EQ(wheels.lines,
            (std::vector<std::string>{"PhaseChanging 270 40 #3", "PhaseChanged 270 40 #3",
                                      "MagnitudeGainChanging 270 10 #3",
                                      "MagnitudeGainChanged 270 10 #3"}));
}

TEST_F(HueBalanceAndPhaseControlTest, SettingKeepsAnglesInOneTurnAndRefusesNonFiniteValues) {
  wheel->SetValue(-90.0, 500.0);
  EXPECT_DOUBLE_EQ(wheel->GetAngle(), 270.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 100.0);
  wheel->SetValue(std::nan(""), 5.0);
  EXPECT_DOUBLE_EQ(wheel->GetMagnitude(), 100.0);
  EXPECT_TRUE(wheels.lines.empty());
}

TEST_F(HueBalanceAndPhaseControlTest, ATinyWheelTakesNoGestureAndDrawsNothing) {
  auto tiny = Add(std::make_shared<HueBalanceAndPhaseControl>(Rect::FromSize(200, 10, 3, 3)));
  EXPECT_EQ(tiny->GetRadius(), 0);
  Click({201, 11});
  EXPECT_FALSE(tiny->IsDragging());
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(10, 10, 105, 105)));
}

}  // namespace
