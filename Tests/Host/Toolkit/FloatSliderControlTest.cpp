#include <gtest/gtest.h>

#include "Host/Toolkit/FloatSliderControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

class FloatSliderControlTest : public ControlTest {
 protected:
  FloatSliderControlTest() {
    // 109 px wide: the thumb's centre runs from x 4 to 104 (local), one unit per pixel.
    slider = Add(std::make_shared<FloatSliderControl>(kBounds, 0.0f, 100.0f, 50.0f));
    slider->SetOwnerCookie(160);
    recorder.ListenTo(slider->GetStation());
  }

  // Window x of the thumb's centre for a value.
  int X(float value) const { return kBounds.left + slider->XForValue(value); }

  static constexpr Rect kBounds{20, 40, 129, 56};
  std::shared_ptr<FloatSliderControl> slider;
};

TEST_F(FloatSliderControlTest, TheTrackMapsTheRangeLinearly) {
  EXPECT_EQ(slider->TrackRight() - slider->TrackLeft(), 100);
  EXPECT_EQ(slider->XForValue(0.0f), slider->TrackLeft());
  EXPECT_EQ(slider->XForValue(100.0f), slider->TrackRight());
  EXPECT_FLOAT_EQ(slider->ValueAtX(slider->TrackLeft() + 25), 25.0f);
}

TEST_F(FloatSliderControlTest, DraggingTheThumbReportsChangingThenChangedWithTheCookie) {
  Drag({X(50), 48}, {X(50) + 20, 48}, 2);
  EXPECT_EQ(recorder.lines,
            (Lines{"SliderChanging 60 #160", "SliderChanging 70 #160", "SliderChanged 70 #160"}));
}

TEST_F(FloatSliderControlTest, PressingTheTrackJumpsThere) {
  Press({X(10), 48});
  EXPECT_FLOAT_EQ(slider->GetValue(), 10.0f);
  Release({X(10), 48});
  EXPECT_EQ(recorder.lines, (Lines{"SliderChanging 10 #160", "SliderChanged 10 #160"}));
}

TEST_F(FloatSliderControlTest, TheValueStopsAtTheEnds) {
  Drag({X(50), 48}, {X(50) + 400, 48}, 2);
  EXPECT_FLOAT_EQ(slider->GetValue(), 100.0f);
  Drag({X(100), 48}, {-300, 48}, 2);
  EXPECT_FLOAT_EQ(slider->GetValue(), 0.0f);
  slider->SetValue(250.0f);
  EXPECT_FLOAT_EQ(slider->GetValue(), 100.0f);
}

TEST_F(FloatSliderControlTest, CtrlDragsTenTimesFiner) {
  Drag({X(50), 48}, {X(50) + 20, 48}, 1, kKeyModifierCtrl);
  EXPECT_FLOAT_EQ(slider->GetValue(), 52.0f);
}

TEST_F(FloatSliderControlTest, ADragBackToTheStartStillEndsWithChanged) {
  Press({X(50), 48});
  Move({X(50) + 5, 48});
  Move({X(50), 48});
  Release({X(50), 48});
  EXPECT_EQ(recorder.lines.back(), "SliderChanged 50 #160");
}

TEST_F(FloatSliderControlTest, AClickOnTheThumbChangesNothing) {
  Click({X(50), 48});
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(FloatSliderControlTest, ADoubleClickIsReportedWithTheValue) {
  DoubleClick({X(50), 48});
  EXPECT_EQ(recorder.lines, Lines{"SliderDoubleClicked 50 #160"});
}

TEST_F(FloatSliderControlTest, ArrowKeysStepTheFocusedSlider) {
  slider->BecomeTarget();
  Key(KeyCode::kRight);
  Key(KeyCode::kLeft, kKeyModifierShift);
  EXPECT_EQ(recorder.lines, (Lines{"SliderChanged 51 #160", "SliderChanged 41 #160"}));
}

TEST_F(FloatSliderControlTest, ExponentialSlidersGiveTheLeftPartToSmallValues) {
  slider->SetExponential(true, 2.0);
  EXPECT_FLOAT_EQ(slider->ValueAtX(slider->TrackLeft() + 50), 25.0f);
  EXPECT_EQ(slider->XForValue(25.0f), slider->TrackLeft() + 50);
}

TEST_F(FloatSliderControlTest, AnEmptyRangeStaysAtTheMinimum) {
  slider->SetMinValue(5.0f);
  slider->SetMaxValue(5.0f);
  EXPECT_FLOAT_EQ(slider->GetValue(), 5.0f);
  Drag({X(5), 48}, {X(5) + 30, 48});
  EXPECT_FLOAT_EQ(slider->GetValue(), 5.0f);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(FloatSliderControlTest, ADisabledSliderIgnoresTheMouse) {
  slider->Disable();
  Drag({X(50), 48}, {X(90), 48});
  EXPECT_FLOAT_EQ(slider->GetValue(), 50.0f);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(FloatSliderControlTest, PaintsTrackAndThumbInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  slider->SetValue(0.0f);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  slider->SetValue(100.0f);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

}  // namespace
