#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

constexpr CommandID kExpand = 18015;

class MultiPictureButtonTest : public ControlTest {
 protected:
  MultiPictureButtonTest() {
    button = Add(std::make_shared<MultiPictureButton>(
        Rect::FromSize(20, 10, 16, 16), kExpand,
        std::initializer_list<Decal>{kChevronRightNormalDecal, kChevronLeftNormalDecal}));
    root->obeys.insert(kExpand);
    log->Clear();
  }

  std::shared_ptr<MultiPictureButton> button;
};

TEST_F(MultiPictureButtonTest, AClickAdvancesTheValueAndSendsTheCommandUpTheChain) {
  Click({25, 15});
  EXPECT_EQ(button->GetValue(), 1);
  EXPECT_EQ(Commands(), Lines{"root command 18015"});
  Click({25, 15});
  EXPECT_EQ(button->GetValue(), 0) << "the last value wraps to the first";
}

TEST_F(MultiPictureButtonTest, ReleasingOutsideTheButtonCancelsTheClick) {
  Press({25, 15});
  EXPECT_TRUE(button->IsPressed());
  Move({60, 60});
  EXPECT_FALSE(button->IsPressed());
  Release({60, 60});
  EXPECT_EQ(button->GetValue(), 0);
  EXPECT_TRUE(Commands().empty());
}

TEST_F(MultiPictureButtonTest, AnUnhandledCommandLeavesTheValueAsItWas) {
  root->obeys.clear();
  Click({25, 15});
  EXPECT_EQ(button->GetValue(), 0);
}

TEST_F(MultiPictureButtonTest, TheCommandHandlerMaySetTheValueItself) {
  root->onCommand = [this](RecordingView&, CommandID command) {
    button->SetValue(0);  // the owner decides: still collapsed
    return command == kExpand;
  };
  Click({25, 15});
  EXPECT_EQ(button->GetValue(), 0);
}

TEST_F(MultiPictureButtonTest, ADisabledButtonIgnoresClicksAndKeys) {
  button->Disable();
  Click({25, 15});
  EXPECT_FALSE(button->Click());
  EXPECT_EQ(button->GetValue(), 0);
  EXPECT_TRUE(Commands().empty());
}

TEST_F(MultiPictureButtonTest, SpaceClicksTheFocusedButton) {
  Click({25, 15});  // takes the focus
  log->Clear();
  Key(KeyCode::kSpace);
  EXPECT_EQ(button->GetValue(), 0);
  EXPECT_EQ(Commands(), Lines{"root command 18015"});
}

TEST_F(MultiPictureButtonTest, ANoFocusButtonLeavesTheFocusWhereItWas) {
  button->SetTakesFocusOnClick(false);
  Click({25, 15});
  EXPECT_FALSE(button->IsTarget());
}

TEST_F(MultiPictureButtonTest, CommandsGoToTheCommanderGivenAtConstruction) {
  auto row = std::make_shared<RecordingView>("row", log);  // a commander outside the view tree
  row->obeys.insert(18305);
  auto toggle = Add(std::make_shared<MultiPictureButton>(
      Rect::FromSize(50, 10, 16, 16), 18305,
      std::initializer_list<Decal>{kEffectControlsOffToggleNormalDecal,
                                   kEffectControlsOnToggleNormalDecal},
      row.get()));
  Click({55, 15});
  EXPECT_EQ(Commands(), Lines{"row command 18305"});
}

TEST_F(MultiPictureButtonTest, AValueOutsideThePicturesIsRefused) {
  ClearRecordedDebugAssertions();
  button->SetValue(2);
  button->SetValue(-1);
  EXPECT_EQ(button->GetValue(), 0);
  ASSERT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_EQ(RecordedDebugAssertions().front().message, "Invalid button value");
}

TEST_F(MultiPictureButtonTest, TheToolTipShowsAfterResting) {
  button->SetToolTip(
      "$$$/Vantile/Handlers/EffectControls/KeyframeExpander=Show/Hide Timeline View");
  Move({25, 15});
  EXPECT_EQ(host.GetShownToolTip(), nullptr);
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(ViewHost::kToolTipDelayMilliseconds));
  ASSERT_NE(host.GetShownToolTip(), nullptr);
  EXPECT_EQ(host.GetShownToolTip()->GetText(), "Show/Hide Timeline View");
  EXPECT_TRUE(host.GetShownToolTip()->IsShown());
  Move({200, 150});
  EXPECT_EQ(host.GetShownToolTip(), nullptr);
}

TEST_F(MultiPictureButtonTest, AButtonPressTakesTheTipDownAndStopsOneOnItsWay) {
  button->SetToolTip("tip");
  Move({25, 15});
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(ViewHost::kToolTipDelayMilliseconds));
  ASSERT_NE(host.GetShownToolTip(), nullptr);
  Press({25, 15});
  EXPECT_EQ(host.GetShownToolTip(), nullptr);
  Release({25, 15});
  Move({26, 15});
  Press({26, 15});
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(1000));
  EXPECT_EQ(host.GetShownToolTip(), nullptr) << "a tip due while the button is down stays away";
  Release({26, 15});
}

TEST_F(MultiPictureButtonTest, AViewWithoutATipShowsItsParentsTipAndNoneWhenNeitherHasOne) {
  Move({200, 150});
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(1000));
  EXPECT_EQ(host.GetShownToolTip(), nullptr);
  root->SetToolTip("the panel");
  Move({25, 15});
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(1000));
  ASSERT_NE(host.GetShownToolTip(), nullptr);
  EXPECT_EQ(host.GetShownToolTip()->GetText(), "the panel");
  button->SetToolTip("the button");
  Move({26, 15});
  EXPECT_EQ(host.GetShownToolTip(), nullptr) << "another tip takes the shown one down";
  RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(1000));
  ASSERT_NE(host.GetShownToolTip(), nullptr);
  EXPECT_EQ(host.GetShownToolTip()->GetText(), "the button");
}

TEST_F(MultiPictureButtonTest, ATipDueAfterTheButtonIsGoneDoesNothing) {
  button->SetToolTip("tip");
  Move({25, 15});
  button->Destroy();
  button.reset();
  EXPECT_TRUE(RepeatTimer::Instance().AdvanceBy(std::chrono::milliseconds(1000)));
  EXPECT_EQ(root->GetChildren().size(), 0u);
}

TEST_F(MultiPictureButtonTest, PaintsItsPictureInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(20, 10, 16, 16)));
  button->SetValue(1);
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(20, 10, 16, 16)));
}

}  // namespace
