#include <gtest/gtest.h>

#include "Host/Toolkit/DisclosureTriangle.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class DisclosureTriangleTest : public ControlTest {
 protected:
  DisclosureTriangleTest() {
    triangle = Add(std::make_shared<DisclosureTriangle>(Rect::FromSize(4, 4, 12, 12), 7));
    recorder.ListenTo(triangle->GetStation());
  }

  std::shared_ptr<DisclosureTriangle> triangle;
};

TEST_F(DisclosureTriangleTest, AClickOpensAndTheNextClosesWithTheModifiers) {
  Click({8, 8});
  EXPECT_TRUE(triangle->IsOpen());
  Click({8, 8}, kKeyModifierAlt);
  EXPECT_FALSE(triangle->IsOpen());
  EXPECT_EQ(recorder.lines, (Lines{"Disclosure #7 open mods 0", "Disclosure #7 closed mods 16"}));
}

TEST_F(DisclosureTriangleTest, ItTakesNoFocus) {
  Click({8, 8});
  EXPECT_FALSE(triangle->IsTarget());
}

TEST_F(DisclosureTriangleTest, DisabledItStaysAsItIs) {
  triangle->Disable();
  Click({8, 8});
  EXPECT_FALSE(triangle->IsOpen());
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(DisclosureTriangleTest, OpenAndClosedLookDifferent) {
  const Rect bounds = Rect::FromSize(4, 4, 12, 12);
  EXPECT_TRUE(PaintsOnlyInside(bounds));
  const Image closed = host.GetImage().Clone();
  triangle->SetOpen(true);
  EXPECT_TRUE(PaintsOnlyInside(bounds));
  int differing = 0;
  for (int y = bounds.top; y < bounds.bottom; ++y) {
    for (int x = bounds.left; x < bounds.right; ++x) {
      differing += closed.GetPixel(x, y) != host.GetImage().GetPixel(x, y) ? 1 : 0;
    }
  }
  EXPECT_GT(differing, 0);
}

}  // namespace
