#include <gtest/gtest.h>

#include "Host/Toolkit/Static.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class StaticTest : public ControlTest {};

TEST_F(StaticTest, ShowsItsLocalisedTextInsideItsBounds) {
  auto label = Add(std::make_shared<Static>(Rect::FromSize(30, 30, 120, 16),
                                            "$$$/Vantile/Handlers/EffectControls/Duration=Duration",
                                            TextAlign::kRight));
  EXPECT_EQ(label->GetText(), "Duration");
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(30, 30, 120, 16)));
}

TEST_F(StaticTest, ClicksGoThroughToTheViewBelow) {
  auto label = Add(std::make_shared<Static>(Rect::FromSize(30, 30, 120, 16), "Label"));
  log->Clear();
  Press({40, 35});
  EXPECT_EQ(log->lines, Lines{"root down 40,35"});
}

TEST_F(StaticTest, RightAlignedTextEndsAtTheRightEdge) {
  auto label = Add(
      std::make_shared<Static>(Rect::FromSize(30, 30, 200, 16), "Alignment:", TextAlign::kRight));
  host.InvalidateAll();
  host.Render();
  int leftmost = 1000;
  for (int y = 30; y < 46; ++y) {
    for (int x = 30; x < 230; ++x) {
      if (host.GetImage().GetPixel(x, y) != kBackground) {
        leftmost = std::min(leftmost, x);
      }
    }
  }
  EXPECT_GT(leftmost, 230 - Font(kFont_Normal).StringWidth("Alignment:") - 3);
}

}  // namespace
