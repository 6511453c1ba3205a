#include <gtest/gtest.h>

#include <limits>
#include <memory>
#include <string>
#include <variant>
#include <vector>

#include "Host/Model/ComponentParamActions.h"
#include "Host/Rows/ColorPickerParameter.h"
#include "Host/Toolkit/ColorPickerControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

class ColorPickerParameterTest : public RowsTest {
 protected:
  ColorPickerParameterTest() { InputBox::SetResponder(answers); }
  ~ColorPickerParameterTest() override { InputBox::SetResponder(nullptr); }

  ParamColor ColorAt(TickTime sequenceTime) {
    return std::get<ParamColor>(
        tint->GetValueAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks()));
  }
  void Pick(ColorPickerParameter& row, std::string answer) {
    answers->PushAnswer(std::move(answer));
    Click(row.GetSwatch()->GetBounds().Center());
  }

  std::shared_ptr<ScriptedInputBox> answers = std::make_shared<ScriptedInputBox>();
  ComponentParamRef tint = AddParam(
      ComponentParam::Create("Tint", ParamType::Color, ParamColor{0.5f, 0.25f, 0.0f, 1.0f}));
};

TEST_F(ColorPickerParameterTest, TheSwatchShowsTheColourInTheValueColumn) {
  auto row = MakeRow<ColorPickerParameter>(tint, 60);
  ColorPickerControl* swatch = row->GetSwatch();
  ASSERT_NE(swatch, nullptr);
  EXPECT_EQ(swatch->GetColor(), Color(128, 64, 0));
  EXPECT_EQ(swatch->GetBounds().top, 63);
  EXPECT_GT(swatch->GetBounds().left, row->GetControlsLeft());
}

TEST_F(ColorPickerParameterTest, PickingAColourIsOneUndoableStep) {
  auto row = MakeRow<ColorPickerParameter>(tint);
  Pick(*row, "#FF0000");
  EXPECT_EQ(ColorAt(12 * kSecond), (ParamColor{1.0f, 0.0f, 0.0f, 1.0f}));
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_EQ(ColorAt(12 * kSecond), (ParamColor{0.5f, 0.25f, 0.0f, 1.0f})) << "exactly as before";
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(128, 64, 0));
  ASSERT_TRUE(Redo());
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(255, 0, 0));
}

TEST_F(ColorPickerParameterTest, APickKeepsAlphaAndAnUnchangedPickKeepsBrightValues) {
  tint->ApplyState(tint->MakeConstantState(ParamColor{2.0f, 0.5f, 0.5f, 0.25f}));
  auto row = MakeRow<ColorPickerParameter>(tint);
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(255, 128, 128, 64));
  Pick(*row, "#FF8080");  // what the swatch shows already
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_EQ(ColorAt(12 * kSecond).r, 2.0f) << "a bright red is not clipped by a no-op";
  Pick(*row, "#00ff00");
  EXPECT_EQ(ColorAt(12 * kSecond), (ParamColor{0.0f, 1.0f, 0.0f, 0.25f}));
}

TEST_F(ColorPickerParameterTest, ABadTextChangesNothing) {
  auto row = MakeRow<ColorPickerParameter>(tint);
  answers->PushAnswer("red");
  answers->PushAnswer(std::nullopt);
  Click(row->GetSwatch()->GetBounds().Center());
  EXPECT_EQ(answers->GetRequests().size(), 2u);
  EXPECT_TRUE(UndoNames().empty());
  EXPECT_EQ(ColorAt(12 * kSecond), (ParamColor{0.5f, 0.25f, 0.0f, 1.0f}));
}

TEST_F(ColorPickerParameterTest, AReadOnlyRowAsksNothingAndRefuses) {
  ParameterControlInfo info = Info(tint);
  info.readOnly = true;
  auto row = std::make_shared<ColorPickerParameter>(info);
  row->FinishCreateSelf();
  row->Show();
  row->PositionSelf(0, 0, kListWidth);
  EXPECT_FALSE(row->GetSwatch()->IsEnabled());
  Pick(*row, "#FFFFFF");
  EXPECT_TRUE(answers->GetRequests().empty());
  EXPECT_FALSE(row->SetColor(Color(255, 255, 255)));
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(ColorPickerParameterTest, ALockedParameterRefusesAndTheSwatchShowsTheModel) {
  auto row = MakeRow<ColorPickerParameter>(tint);
  tint->SetReadOnly(true);
  EXPECT_FALSE(row->GetSwatch()->IsEnabled());
  row->GetSwatch()->SetColor(Color(1, 2, 3));
  row->ListenToMessage(ColorPickerControlChangedMessage(Color(1, 2, 3), 0));
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(128, 64, 0));
  EXPECT_TRUE(UndoNames().empty());
}

TEST_F(ColorPickerParameterTest, KeyframedColoursFollowTheEditTimeAndAPickAddsAKeyframe) {
  ComponentParamActions::AddKeyframe(tint, 6 * kSecond, ParamColor{1.0f, 0.0f, 0.0f, 1.0f});
  ComponentParamActions::AddKeyframe(tint, 9 * kSecond, ParamColor{0.0f, 0.0f, 1.0f, 1.0f});
  const std::size_t steps = UndoNames().size();
  auto row = MakeRow<ColorPickerParameter>(tint);  // 12 s: a third of the way
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(170, 0, 85));
  SetEditTime(15 * kSecond, *row);
  EXPECT_EQ(row->GetSwatch()->GetColor(), Color(0, 0, 255));
  SetEditTime(13 * kSecond, *row);
  Pick(*row, "#00FF00");
  EXPECT_EQ(tint->GetKeyframes().Size(), 3u);
  EXPECT_EQ(ColorAt(13 * kSecond), (ParamColor{0.0f, 1.0f, 0.0f, 1.0f}));
  EXPECT_EQ(UndoNames().size(), steps + 1);
  ASSERT_TRUE(Undo());
  EXPECT_EQ(tint->GetKeyframes().Size(), 2u);
}

TEST(ColorPickerParameterConversion, ClampsRoundsAndIgnoresNonFiniteChannels) {
  EXPECT_EQ(ColorPickerParameter::ToColor(ParamColor{-1.0f, 0.5f, 7.0f, 1.0f}), Color(0, 128, 255));
  EXPECT_EQ(ColorPickerParameter::ToColor(ParamColor{0.002f, 0.998f, 0.0f, 0.0f}),
            Color(1, 254, 0, 0));
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const float inf = std::numeric_limits<float>::infinity();
  EXPECT_EQ(ColorPickerParameter::ToColor(ParamColor{nan, inf, -inf, nan}), Color(0, 0, 0, 0));
  EXPECT_EQ(ColorPickerParameter::ToParamColor(Color(255, 0, 51), 0.5f),
            (ParamColor{1.0f, 0.0f, 0.2f, 0.5f}));
}

}  // namespace
