#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Toolkit/CurveControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

// "Changing 1 #7": the message, its code and its cookie.
class CurveRecorder : public Listener {
 public:
  void ListenToMessage(const Message& message) override {
    if (const auto* changing = message.As<CurveChangingMessage>()) {
      lines.push_back(
          Format("Changing %d #%d", static_cast<int>(changing->code), changing->cookie));
    }
    if (const auto* changed = message.As<CurveChangedMessage>()) {
      lines.push_back(Format("Changed %d #%d", static_cast<int>(changed->code), changed->cookie));
    }
  }
  std::vector<std::string> lines;
};

std::string Describe(const CurvePointList& points) {
  std::string text;
  for (const CurvePoint& p : points) {
    text += Format("(%d,%d)", p.x, p.y);
  }
  return text;
}

class CurveControlTest : public ControlTest {
 protected:
  CurveControlTest() {
    // A 256-pixel plot: one pixel per level.
    curve = Add(std::make_shared<CurveControl>(
        Rect::FromSize(kLeft, kTop, 256, 256 + CurveControl::kLabelHeight),
        CurveControl::Options{.label = "Master", .cookie = 7}));
    AddListener(curve->GetStation(), curves);
  }
  // The window position of a level.
  static Point At(int x, int y) {
    return {kLeft + x, kTop + CurveControl::kLabelHeight + CurveControl::kMaxLevel - y};
  }
  std::string Points() const { return Describe(curve->GetCurvePointList()); }

  static constexpr int kLeft = 10;
  static constexpr int kTop = 10;
  std::shared_ptr<CurveControl> curve;
  CurveRecorder curves;
};

TEST_F(CurveControlTest, StartsAsTheDiagonalAndSettingSendsNothing) {
  EXPECT_EQ(Points(), "(0,0)(255,255)");
  curve->SetCurvePointList({{0, 0}, {128, 150}, {255, 255}});
  EXPECT_EQ(Points(), "(0,0)(128,150)(255,255)");
  EXPECT_TRUE(curves.lines.empty());
}

TEST_F(CurveControlTest, SettingCleansTheListItIsGiven) {
  curve->SetCurvePointList({{300, -5}, {10, 20}, {10, 99}, {-4, 7}});
  EXPECT_EQ(Points(), "(0,7)(10,20)(255,0)");
  curve->SetCurvePointList({{5, 5}});
  EXPECT_EQ(Points(), "(0,0)(255,255)") << "one point is no curve";
  CurvePointList many;
  for (int i = 0; i < 20; ++i) {
    many.push_back({i * 10, i});
  }
  curve->SetCurvePointList(many);
  EXPECT_EQ(curve->GetCurvePointList().size(), CurveControl::kMaxPoints);
}

TEST_F(CurveControlTest, PressingOffTheCurveAddsAPointThatTheDragMoves) {
  Drag(At(100, 100), At(110, 160));
  EXPECT_EQ(Points(), "(0,0)(110,160)(255,255)");
  ASSERT_FALSE(curves.lines.empty());
  EXPECT_EQ(curves.lines.front(), "Changing 1 #7");
  EXPECT_EQ(curves.lines.back(), "Changed 1 #7");
}

TEST_F(CurveControlTest, DraggingAPointIsClampedToThePlotAndBetweenItsNeighbours) {
  curve->SetCurvePointList({{0, 0}, {100, 100}, {200, 200}, {255, 255}});
  Drag(At(100, 100), At(240, 270));  // past the top, but not far enough to remove it
  EXPECT_EQ(Points(), "(0,0)(199,255)(200,200)(255,255)");
  EXPECT_EQ(curves.lines.back(), "Changed 0 #7");
  curves.lines.clear();
  Drag(At(0, 0), At(-30, -10));
  EXPECT_EQ(Points(), "(0,0)(199,255)(200,200)(255,255)") << "the corner point cannot leave";
  EXPECT_TRUE(curves.lines.empty()) << "nothing moved, nothing reported";
}

TEST_F(CurveControlTest, ReleasingFarOutsideRemovesThePointButNeverTheLastTwo) {
  curve->SetCurvePointList({{0, 0}, {100, 100}, {255, 255}});
  Drag(At(100, 100), At(100, -60));
  EXPECT_EQ(Points(), "(0,0)(255,255)");
  EXPECT_EQ(curves.lines.back(), "Changed 1 #7");
  Drag(At(255, 255), At(255, 400));
  EXPECT_EQ(Points(), "(0,0)(255,255)");
}

TEST_F(CurveControlTest, AFullCurveTakesNoSeventeenthPoint) {
  CurvePointList full;
  for (int i = 0; i < 16; ++i) {
    full.push_back({i * 17, i * 17});
  }
  curve->SetCurvePointList(full);
  Click(At(8, 200));
  EXPECT_EQ(curve->GetCurvePointList().size(), 16u);
  EXPECT_TRUE(curves.lines.empty());
}

TEST_F(CurveControlTest, KeysMoveAndRemoveThePickedPointAsFinishedChanges) {
  curve->SetCurvePointList({{0, 0}, {100, 100}, {255, 255}});
  Click(At(100, 100));
  Key(KeyCode::kUp, kKeyModifierShift);
  Key(KeyCode::kLeft);
  EXPECT_EQ(Points(), "(0,0)(99,110)(255,255)");
  Key(KeyCode::kDelete);
  EXPECT_EQ(Points(), "(0,0)(255,255)");
  EXPECT_EQ(curves.lines,
            (std::vector<std::string>{"Changed 0 #7", "Changed 0 #7", "Changed 1 #7"}));
}

TEST_F(CurveControlTest, ATinyControlHasNoPlotAndTakesNoPoints) {
  auto tiny =
      Add(std::make_shared<CurveControl>(Rect::FromSize(300, 10, 0, 12), CurveControl::Options{}));
  EXPECT_TRUE(tiny->GetPlotRect().IsEmpty());
  EXPECT_EQ(tiny->LocalToLevel({5, 5}), (CurvePoint{0, 0}));
  Click({300, 15});
  EXPECT_EQ(Describe(tiny->GetCurvePointList()), "(0,0)(255,255)");
}

TEST_F(CurveControlTest, DrawsOnlyInsideItsBounds) {
  curve->SetCurvePointList({{0, 0}, {60, 200}, {255, 255}});
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(kLeft, kTop, 256, 276)));
}

}  // namespace
