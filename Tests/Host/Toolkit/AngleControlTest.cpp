#include <gtest/gtest.h>

#include "Host/Toolkit/AngleControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class AngleControlTest : public ControlTest {
 protected:
  AngleControlTest() {
    dial = Add(std::make_shared<AngleControl>(kBounds, 102));
    recorder.ListenTo(dial->GetStation());
  }

  // Points 10 px from the dial's centre (window 60, 60): up, right, down, left.
  static constexpr Point kUp{60, 50};
  static constexpr Point kRight{70, 60};
  static constexpr Point kDown{60, 70};
  static constexpr Point kLeft{50, 60};
  static constexpr Rect kBounds{48, 48, 73, 73};  // 25 x 25: centre at local 12, 12
  std::shared_ptr<AngleControl> dial;
};

TEST_F(AngleControlTest, DraggingAQuarterTurnClockwiseAddsNinetyDegrees) {
  Press(kUp);
  Move(kRight);
  Release(kRight);
  EXPECT_DOUBLE_EQ(dial->GetValue(), 90.0);
  EXPECT_EQ(recorder.lines, (Lines{"AngleChanging 90 #102", "AngleChanged 90 #102"}));
}

TEST_F(AngleControlTest, CirclingCountsRevolutions) {
  Press(kUp);
  for (int turn = 0; turn < 2; ++turn) {
    Move(kRight);
    Move(kDown);
    Move(kLeft);
    Move(kUp);
  }
  Move(kRight);
  Release(kRight);
  EXPECT_DOUBLE_EQ(dial->GetValue(), 810.0);
  EXPECT_EQ(dial->GetRevolutions(), 2);
  EXPECT_DOUBLE_EQ(dial->GetDegreesWithinRevolution(), 90.0);
}

TEST_F(AngleControlTest, AnticlockwiseGoesNegative) {
  Press(kUp);
  Move(kLeft);
  Move(kDown);
  Move(kRight);
  Move(kUp);
  Move(kLeft);
  Release(kLeft);
  EXPECT_DOUBLE_EQ(dial->GetValue(), -450.0);
  EXPECT_EQ(dial->GetRevolutions(), -1);
  EXPECT_DOUBLE_EQ(dial->GetDegreesWithinRevolution(), -90.0);
}

TEST_F(AngleControlTest, ShiftSnapsToFortyFiveDegrees) {
  Press(kUp);
  Move({68, 51}, kKeyModifierShift);  // about 41.6 degrees
  Release({68, 51}, kKeyModifierShift);
  EXPECT_DOUBLE_EQ(dial->GetValue(), 45.0);
}

TEST_F(AngleControlTest, APressAtTheCentreWaitsForThePointerToLeaveIt) {
  Press({60, 60});
  Move({60, 50});  // first sensible angle: up, taken as the start
  EXPECT_TRUE(recorder.lines.empty());
  Move({70, 60});
  Release({70, 60});
  EXPECT_DOUBLE_EQ(dial->GetValue(), 90.0);
}

TEST_F(AngleControlTest, AClickWithoutMovementReportsNothing) {
  Click(kRight);
  EXPECT_TRUE(recorder.lines.empty());
  EXPECT_DOUBLE_EQ(dial->GetValue(), 0.0);
}

TEST_F(AngleControlTest, ArrowKeysTurnTheFocusedDial) {
  dial->SetValue(359.0);
  dial->BecomeTarget();
  Key(KeyCode::kRight);
  Key(KeyCode::kRight, kKeyModifierShift);
  EXPECT_EQ(recorder.lines, (Lines{"AngleChanged 360 #102", "AngleChanged 370 #102"}));
  EXPECT_EQ(dial->GetRevolutions(), 1);
}

TEST_F(AngleControlTest, ADisabledDialDoesNotTurn) {
  dial->Disable();
  Press(kUp);
  Move(kRight);
  Release(kRight);
  EXPECT_DOUBLE_EQ(dial->GetValue(), 0.0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(AngleControlTest, NonFiniteValuesAreRefused) {
  dial->SetValue(30.0);
  dial->SetValue(std::numeric_limits<double>::infinity());
  EXPECT_DOUBLE_EQ(dial->GetValue(), 30.0);
}

TEST_F(AngleControlTest, TheHandPointsAtTheAngle) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  const Color hand = ColorManager::GetColor(kColor_HotText);
  const auto near = [&](Color c) {
    return std::abs(c.r - hand.r) < 40 && std::abs(c.g - hand.g) < 40 &&
           std::abs(c.b - hand.b) < 40;
  };
  EXPECT_TRUE(near(host.GetImage().GetPixel(60, 53))) << "up";
  dial->SetValue(90.0);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  EXPECT_TRUE(near(host.GetImage().GetPixel(67, 60))) << "right";
  EXPECT_FALSE(near(host.GetImage().GetPixel(60, 53)));
}

}  // namespace
