#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "Host/Toolkit/LevelsControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

// "Black changing 40 #3": the handle, the message kind, the level and the cookie.
class LevelsRecorder : public Listener {
 public:
  void ListenToMessage(const Message& message) override {
    Record<LevelsControlBlackLevelChangingMessage>(message, "Black changing");
    Record<LevelsControlBlackLevelChangedMessage>(message, "Black changed");
    Record<LevelsControlGrayLevelChangingMessage>(message, "Gray changing");
    Record<LevelsControlGrayLevelChangedMessage>(message, "Gray changed");
    Record<LevelsControlWhiteLevelChangingMessage>(message, "White changing");
    Record<LevelsControlWhiteLevelChangedMessage>(message, "White changed");
  }
  std::vector<std::string> lines;

 private:
  template <class M>
  void Record(const Message& message, const char* what) {
    if (const auto* m = message.As<M>()) {
      lines.push_back(Format("%s %d #%d", what, static_cast<int>(m->level), m->cookie));
    }
  }
};

class LevelsControlTest : public ControlTest {
 protected:
  LevelsControlTest() {
    // 256 pixels wide: one pixel per level.
    levels =
        Add(std::make_shared<LevelsControl>(Rect::FromSize(kLeft, kTop, 256, 18),
                                            LevelsControl::Options{.withGray = true, .cookie = 3}));
    AddListener(levels->GetStation(), recorder);
    levels->SetAllLevels(20, 100, 200);
  }
  static Point At(int level) { return {kLeft + level, kTop + 12}; }

  static constexpr int kLeft = 10;
  static constexpr int kTop = 10;
  std::shared_ptr<LevelsControl> levels;
  LevelsRecorder recorder;
};

TEST_F(LevelsControlTest, SettingPutsTheLevelsInOrderAndSendsNothing) {
  levels->SetAllLevels(300, 10, -4);
  EXPECT_EQ(levels->GetBlackLevel(), 255);
  EXPECT_EQ(levels->GetGrayLevel(), 255);
  EXPECT_EQ(levels->GetWhiteLevel(), 255);
  levels->SetAllLevels(std::nan(""), 50, 90);
  EXPECT_EQ(levels->GetBlackLevel(), 0) << "not a number is the bottom";
  EXPECT_EQ(levels->GetGrayLevel(), 50);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(LevelsControlTest, ADragMovesTheNearestHandleBetweenItsNeighbours) {
  Drag(At(100), At(230));
  EXPECT_EQ(levels->GetGrayLevel(), 200) << "held below the white handle";
  ASSERT_FALSE(recorder.lines.empty());
  EXPECT_EQ(recorder.lines.front().rfind("Gray changing", 0), 0u);
  EXPECT_EQ(recorder.lines.back(), "Gray changed 200 #3");
  recorder.lines.clear();
  Drag(At(20), At(5));
  EXPECT_EQ(levels->GetBlackLevel(), 5);
  EXPECT_EQ(recorder.lines.back(), "Black changed 5 #3");
}

TEST_F(LevelsControlTest, APressAwayFromTheHandlesOrWithoutAMoveSendsNothing) {
  Drag(At(60), At(90));
  Click(At(200));
  EXPECT_TRUE(recorder.lines.empty());
  EXPECT_EQ(levels->GetBlackLevel(), 20);
  EXPECT_EQ(levels->GetWhiteLevel(), 200);
}

TEST_F(LevelsControlTest, KeysMoveThePickedHandleAsFinishedChanges) {
  Click(At(200));
  Key(KeyCode::kRight, kKeyModifierShift);
  Key(KeyCode::kLeft);
  EXPECT_EQ(levels->GetWhiteLevel(), 209);
  EXPECT_EQ(recorder.lines,
            (std::vector<std::string>{"White changed 210 #3", "White changed 209 #3"}));
}

TEST_F(LevelsControlTest, WithoutGrayTheBlackAndWhiteHandlesMeet) {
  auto output = Add(std::make_shared<LevelsControl>(Rect::FromSize(kLeft, 40, 256, 18),
                                                    LevelsControl::Options{}));
  output->SetBlackAndWhiteLevels(50, 60);
  Drag({kLeft + 50, 52}, {kLeft + 120, 52});
  EXPECT_EQ(output->GetBlackLevel(), 60);
  EXPECT_FALSE(output->HasGrayHandle());
}

TEST_F(LevelsControlTest, ANarrowControlTakesNoDragAndPaintsInside) {
  auto tiny = Add(std::make_shared<LevelsControl>(Rect::FromSize(300, 10, 1, 18),
                                                  LevelsControl::Options{.withGray = true}));
  EXPECT_EQ(tiny->LocalToLevel(0), 0);
  Drag({300, 20}, {340, 20});
  EXPECT_FALSE(tiny->IsDragging());
  EXPECT_TRUE(PaintsOnlyInside(levels->GetBounds()));
}

}  // namespace
