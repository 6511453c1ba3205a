#include <gtest/gtest.h>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/TextButton.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class TextButtonTest : public ControlTest {
 protected:
  TextButtonTest() {
    button = Add(std::make_shared<TextButton>(
        Rect::FromSize(10, 20, 100, 20), "$$$/Vantile/Handlers/EffectControls/Custom=Custom...",
        18301));
    root->obeys.insert(18301);
    log->Clear();
  }

  std::shared_ptr<TextButton> button;
};

TEST_F(TextButtonTest, TheLabelIsLocalised) {
  EXPECT_EQ(button->GetLabel(), "Custom...");
  SetLocalizedString("Vantile/Handlers/EffectControls/Edit", "Bearbeiten...");
  button->SetLabel("$$$/Vantile/Handlers/EffectControls/Edit=Edit...");
  EXPECT_EQ(button->GetLabel(), "Bearbeiten...");
  EXPECT_EQ(button->GetLabelWidth(), Font(kFont_Normal).StringWidth("Bearbeiten..."));
}

TEST_F(TextButtonTest, ClickAndReturnSendTheCommand) {
  Click({50, 30});
  Key(KeyCode::kReturn);
  EXPECT_EQ(Commands(), (Lines{"root command 18301", "root command 18301"}));
}

TEST_F(TextButtonTest, AHeldKeyDoesNotRepeatTheClick) {
  Click({50, 30});
  log->Clear();
  host.KeyDown(KeyEvent{KeyCode::kSpace, kKeyModifierNone, true});
  EXPECT_TRUE(Commands().empty());
}

TEST_F(TextButtonTest, ADisabledButtonIgnoresTheMouse) {
  button->Disable();
  Click({50, 30});
  EXPECT_TRUE(Commands().empty());
}

TEST_F(TextButtonTest, PaintsInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(Rect::FromSize(10, 20, 100, 20)));
}

}  // namespace
