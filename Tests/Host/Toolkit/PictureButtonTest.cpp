#include <gtest/gtest.h>

#include "Host/Toolkit/PictureButton.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class PictureButtonTest : public ControlTest {
 protected:
  PictureButtonTest() {
    button = Add(std::make_shared<PictureButton>(Rect::FromSize(40, 40, 22, 17), 18051,
                                                 kLoopNormalDecal, kLoopOnDecal));
    root->obeys.insert(18051);
    log->Clear();
  }

  std::shared_ptr<PictureButton> button;
};

TEST_F(PictureButtonTest, AClickSendsTheCommandWithoutChangingTheSelection) {
  Click({45, 45});
  EXPECT_EQ(Commands(), Lines{"root command 18051"});
  EXPECT_FALSE(button->IsSelected());
}

TEST_F(PictureButtonTest, TheSelectedPictureReplacesTheNormalOne) {
  const Rect bounds = Rect::FromSize(40, 40, 22, 17);
  EXPECT_TRUE(PaintsOnlyInside(bounds));
  const Image normal = host.GetImage().Clone();
  button->SetSelected(true);
  EXPECT_TRUE(PaintsOnlyInside(bounds));
  int differing = 0;
  for (int y = bounds.top; y < bounds.bottom; ++y) {
    for (int x = bounds.left; x < bounds.right; ++x) {
      differing += normal.GetPixel(x, y) != host.GetImage().GetPixel(x, y) ? 1 : 0;
    }
  }
  EXPECT_GT(differing, 0);
}

TEST_F(PictureButtonTest, ADisabledButtonSendsNothing) {
  button->Disable();
  Click({45, 45});
  EXPECT_TRUE(Commands().empty());
}

}  // namespace
