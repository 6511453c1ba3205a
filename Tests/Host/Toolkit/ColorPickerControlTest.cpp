#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ColorPickerControl.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"
#include "Tests/Host/Toolkit/PopupTestSupport.h"

namespace {

class ColorPickerControlTest : public ControlTest {
 protected:
  ColorPickerControlTest() {
    InputBox::SetResponder(answers);
    swatch = Add(std::make_shared<ColorPickerControl>(kBounds, Color(0x10, 0x20, 0x30), 7));
    recorder.ListenTo(swatch->GetStation());
  }

  const InputBoxRequest& Request(std::size_t i) const { return answers->GetRequests().at(i); }

  static constexpr Rect kBounds{30, 20, 70, 34};
  std::shared_ptr<ScriptedInputBox> answers = std::make_shared<ScriptedInputBox>();
  std::shared_ptr<ColorPickerControl> swatch;
};

TEST_F(ColorPickerControlTest, AClickAsksForTheColourAsHexAndReportsTheNewOne) {
  answers->PushAnswer("#ff8000");
  Click(kBounds.Center());
  EXPECT_EQ(swatch->GetColor(), Color(0xff, 0x80, 0x00));
  ASSERT_EQ(answers->GetRequests().size(), 1u);
  EXPECT_EQ(Request(0).initialText, "#102030");
  EXPECT_EQ(Request(0).title, "Color");
  EXPECT_NE(Request(0).prompt.find("#RRGGBB"), std::string::npos);
  EXPECT_EQ(recorder.lines, (Lines{"SwatchClicked #102030 #7", "ColorChanged #ff8000 #7"}));
}

TEST_F(ColorPickerControlTest, ABadTextIsRefusedWithTheReasonAndAskedAgain) {
  answers->PushAnswer("orange");
  answers->PushAnswer(std::nullopt);
  Click(kBounds.Center());
  EXPECT_EQ(swatch->GetColor(), Color(0x10, 0x20, 0x30)) << "nothing changes";
  ASSERT_EQ(answers->GetRequests().size(), 2u);
  EXPECT_NE(Request(1).prompt.find("\"orange\" is not a color"), std::string::npos);
  EXPECT_EQ(Request(1).initialText, "orange") << "the user corrects what they typed";
  EXPECT_EQ(recorder.lines, Lines{"SwatchClicked #102030 #7"});
}

TEST_F(ColorPickerControlTest, ACorrectedTextIsTaken) {
  answers->PushAnswer("#12345");
  answers->PushAnswer(" 0a0B0c ");
  EXPECT_EQ(swatch->Pick(), Color(0x0a, 0x0b, 0x0c));
  EXPECT_EQ(recorder.lines.back(), "ColorChanged #0a0b0c #7");
}

TEST_F(ColorPickerControlTest, AResponderThatNeverGivesAColourIsNotAskedForever) {
  for (int i = 0; i < 2 * ColorPickerControl::kMaxAttempts; ++i) {
    answers->PushAnswer("no");
  }
  EXPECT_EQ(swatch->Pick(), std::nullopt);
  EXPECT_EQ(answers->GetRequests().size(), std::size_t{ColorPickerControl::kMaxAttempts});
  EXPECT_EQ(swatch->GetColor(), Color(0x10, 0x20, 0x30));
}

TEST_F(ColorPickerControlTest, TheSameColourAgainSendsNoChange) {
  answers->PushAnswer("#102030");
  EXPECT_EQ(swatch->Pick(), std::nullopt);
  EXPECT_EQ(recorder.lines, Lines{"SwatchClicked #102030 #7"});
}

TEST_F(ColorPickerControlTest, ThePickKeepsTheAlpha) {
  swatch->SetColor(Color(1, 2, 3, 128));
  answers->PushAnswer("#00FF00");
  EXPECT_EQ(swatch->Pick(), Color(0, 255, 0, 128));
  EXPECT_EQ(Request(0).initialText, "#010203") << "the text has no alpha";
}

TEST_F(ColorPickerControlTest, ParseHexAcceptsExactlySixHexDigits) {
  EXPECT_EQ(ColorPickerControl::ParseHex("#a0B1c2"), Color(0xa0, 0xb1, 0xc2));
  EXPECT_EQ(ColorPickerControl::ParseHex("A0B1C2", 9), Color(0xa0, 0xb1, 0xc2, 9));
  EXPECT_EQ(ColorPickerControl::ParseHex("\t#000000\n"), Color(0, 0, 0));
  for (const char* bad : {"", "#", "#abc", "#12345g", "#1234567", "##123456", "+12345", "12 345",
                          "#-12345", "0x1234"}) {
    EXPECT_EQ(ColorPickerControl::ParseHex(bad), std::nullopt) << bad;
  }
  EXPECT_EQ(ColorPickerControl::FormatHex(Color(0xab, 0xcd, 0xef, 3)), "#ABCDEF");
}

TEST_F(ColorPickerControlTest, ADisabledSwatchAsksNothing) {
  swatch->Disable();
  answers->PushAnswer("#ffffff");
  Click(kBounds.Center());
  EXPECT_EQ(swatch->Pick(), std::nullopt);
  EXPECT_TRUE(answers->GetRequests().empty());
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(ColorPickerControlTest, AListenerMayDestroyTheSwatchWhenItIsClicked) {
  FunctionListener destroyer([this](const Message& message) {
    if (message.Is<ColorPickerSwatchClickedMessage>()) {
      swatch->Destroy();
    }
  });
  AddListener(swatch->GetStation(), destroyer);
  answers->PushAnswer("#ffffff");
  Click(kBounds.Center());
  EXPECT_TRUE(answers->GetRequests().empty()) << "a destroyed swatch asks nothing";
  EXPECT_EQ(answers->PendingAnswers(), 1u);
}

TEST_F(ColorPickerControlTest, PaintsTheColourInsideA1PixelFrame) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  SaveForInspection(host.GetImage(), "colorpicker.png");
  const Image& image = host.GetImage();
  EXPECT_EQ(image.GetPixel(kBounds.Center().x, kBounds.Center().y), Color(0x10, 0x20, 0x30));
  EXPECT_EQ(image.GetPixel(kBounds.left + 1, kBounds.top + 1), Color(0x10, 0x20, 0x30));
  EXPECT_EQ(image.GetPixel(kBounds.left, kBounds.Center().y),
            ColorManager::GetColor(kColor_ControlBorder));
  EXPECT_EQ(image.GetPixel(kBounds.right - 1, kBounds.top),
            ColorManager::GetColor(kColor_ControlBorder));
}

}  // namespace
