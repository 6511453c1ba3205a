#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Rows/AngleParameter.h"
#include "Host/Toolkit/AngleControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Tests/Host/Rows/RowsTestFixture.h"

namespace {

class AngleParameterTest : public RowsTest {
 protected:
  ComponentParamRef rotation = AddParam(ComponentParam::Create("Rotation", ParamType::Angle, 0.0)
                                            ->SetRange(-36000.0, 36000.0)
                                            ->SetPrecision(1));

  double AngleAt(TickTime sequenceTime) {
    return *rotation->GetScalarAt(clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks());
  }
};

TEST_F(AngleParameterTest, TurningTheDialIsOneUndoStepAndMovesTheField) {
  auto row = MakeRow<AngleParameter>(rotation, 0);
  row->SetIsExpanded(true);
  row->PositionSelf(0, 0, kListWidth);
  AngleControl* dial = row->GetDial();
  ASSERT_TRUE(dial->IsVisible());
  const Rect b = dial->GetBounds();
  const Point center = b.Center();
  // From three o'clock to six o'clock through half past four: a quarter turn clockwise.
  host.MouseDown(MouseButton::kLeft, {b.right - 2, center.y}, kKeyModifierNone);
  host.MouseMove({b.right - 6, b.bottom - 6}, kKeyModifierNone);
  host.MouseMove({center.x, b.bottom - 2}, kKeyModifierNone);
  host.MouseUp(MouseButton::kLeft, {center.x, b.bottom - 2}, kKeyModifierNone);
  const double turned = AngleAt(12 * kSecond);
  EXPECT_NE(turned, 0.0);
  EXPECT_DOUBLE_EQ(row->GetHotText()->GetValue(), turned);
  EXPECT_EQ(UndoNames(), (std::vector<std::string>{"MZ.ComponentParam.SetValue"}));
  ASSERT_TRUE(Undo());
  EXPECT_DOUBLE_EQ(AngleAt(12 * kSecond), 0.0);
  EXPECT_DOUBLE_EQ(dial->GetValue(), 0.0);
}

TEST_F(AngleParameterTest, ATypedAngleKeepsWholeTurns) {
  auto row = MakeRow<AngleParameter>(rotation, 0);
  Click(row->GetHotText()->GetBounds().Center());
  host.TextInput("370");
  host.KeyDown({KeyCode::kReturn});
  EXPECT_DOUBLE_EQ(AngleAt(12 * kSecond), 370.0);
  EXPECT_EQ(row->GetHotText()->GetAppendedSymbol(), "\xC2\xB0");
  EXPECT_DOUBLE_EQ(row->GetDial()->GetValue(), 370.0);
  EXPECT_EQ(row->GetDial()->GetRevolutions(), 1);
  EXPECT_EQ(UndoNames().size(), 1u);
}

TEST_F(AngleParameterTest, TheDialShowsOnlyWhileExpanded) {
  auto row = MakeRow<AngleParameter>(rotation, 0);
  EXPECT_FALSE(row->GetDial()->IsVisible());
  EXPECT_EQ(row->Height(), 20);
  row->SetIsExpanded(true);
  EXPECT_TRUE(row->GetDial()->IsVisible());
  EXPECT_EQ(row->Height(), 20 + 54 + 1 + 54);  // the graphs are taller than the dial
}

}  // namespace
