#include <gtest/gtest.h>

#include "Host/Toolkit/HotTimecodeControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

constexpr TickTime kFrame30 = 8467200000;  // one frame at 30 fps
constexpr TickTime kSecond = kTicksPerSecond;

class HotTimecodeControlTest : public ControlTest {
 protected:
  HotTimecodeControlTest() {
    field = Add(std::make_shared<HotTimecodeControl>(kBounds, kFrameRate_30, kSecond));
    field->SetOwnerCookie(3);
    field->SetMinTime(0);
    recorder.ListenTo(field->GetStationID());
  }

  static std::string Changed(TickTime t) { return "TimecodeChanged " + std::to_string(t) + " #3"; }
  static std::string Changing(TickTime t) {
    return "TimecodeChanging " + std::to_string(t) + " #3";
  }

  static constexpr Rect kBounds{5, 100, 110, 120};
  std::shared_ptr<HotTimecodeControl> field;
};

TEST_F(HotTimecodeControlTest, ShowsTheTimeAsTimecodeFromTheZeroPoint) {
  EXPECT_EQ(field->GetDisplayText(), "00:00:01:00");
  field->SetZeroPoint(3600 * kSecond);
  EXPECT_EQ(field->GetDisplayText(), "01:00:01:00");
  field->SetFrameRate(kFrameRate_2997_DF);
  field->SetZeroPoint(0);
  field->SetTime(60 * kSecond);
  EXPECT_EQ(field->GetDisplayText(), kFrameRate_2997_DF.FormatTimecode(60 * kSecond));
}

TEST_F(HotTimecodeControlTest, ScrubbingMovesOneFramePerPixel) {
  Drag({20, 110}, {23, 110}, 3);
  EXPECT_EQ(recorder.lines,
            (Lines{Changing(kSecond + 3 * kFrame30), Changed(kSecond + 3 * kFrame30)}));
  recorder.Clear();
  Drag({20, 110}, {30, 110}, 1, kKeyModifierCtrl);  // ten pixels make one frame
  EXPECT_EQ(field->GetTime(), kSecond + 4 * kFrame30);
  Drag({20, 110}, {10, 110}, 1, kKeyModifierShift);  // -100 frames, stopped at the minimum
  EXPECT_EQ(field->GetTime(), 0);
}

TEST_F(HotTimecodeControlTest, ScrubbingStopsAtTheMinimum) {
  Drag({50, 110}, {0, 110}, 2, kKeyModifierShift);
  EXPECT_EQ(field->GetTime(), 0);
  EXPECT_EQ(recorder.lines.back(), Changed(0));
}

TEST_F(HotTimecodeControlTest, TypedTimecodeAndDigitsAreRead) {
  EXPECT_EQ(field->ParseText("00:00:10:00"), 10 * kSecond);
  EXPECT_EQ(field->ParseText(" 10:05 "), 10 * kSecond + 5 * kFrame30);
  EXPECT_EQ(field->ParseText("1000"), 10 * kSecond);
  EXPECT_EQ(field->ParseText("1"), kFrame30);
  EXPECT_EQ(field->ParseText("1000000"), 3600 * kSecond);
  EXPECT_EQ(field->ParseText("100000000"), 100 * 3600 * kSecond) << "hours beyond two digits";
  field->SetZeroPoint(3600 * kSecond);
  EXPECT_EQ(field->ParseText("01:00:02:00"), 2 * kSecond);
}

TEST_F(HotTimecodeControlTest, UnreadableTimecodeIsRejected) {
  for (const char* bad : {"abc", "00:00:00:30", "1:2:3:4:5", "12::00", "99", ""}) {
    EXPECT_EQ(field->ParseText(bad), std::nullopt) << bad;
  }
  Click({20, 110});
  Type("00:61:00:00");
  Key(KeyCode::kReturn);
  EXPECT_EQ(field->GetTime(), kSecond);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotTimecodeControlTest, TypingATimeReportsOneChange) {
  Click({20, 110});
  Type("2:15");
  Key(KeyCode::kReturn);
  EXPECT_EQ(recorder.lines, Lines{Changed(2 * kSecond + 15 * kFrame30)});
}

TEST_F(HotTimecodeControlTest, ANegativeTimeBelowTheMinimumIsClamped) {
  EXPECT_EQ(field->ParseText("-00:00:01:00"), 0);
}

TEST_F(HotTimecodeControlTest, QuantizedTimesStartOnFramesOfTheTimebase) {
  field->SetQuantizeFrameRate(kFrameRate_25);
  field->SetTime(kSecond + kFrame30);  // between two 25 fps frames: the nearest wins
  EXPECT_TRUE(kFrameRate_25.IsFrameAligned(field->GetTime()));
  EXPECT_EQ(field->GetTime(), kSecond + kFrameRate_25.GetTicksPerFrame());
  Drag({20, 110}, {24, 110}, 1);  // one step is a frame of the timebase
  EXPECT_EQ(field->GetTime(), kSecond + 5 * kFrameRate_25.GetTicksPerFrame());
}

TEST_F(HotTimecodeControlTest, ADisabledFieldIgnoresInput) {
  field->Disable();
  Drag({20, 110}, {60, 110});
  Click({20, 110});
  Type("5");
  EXPECT_FALSE(field->IsEditing());
  EXPECT_EQ(field->GetTime(), kSecond);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(HotTimecodeControlTest, PaintsInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

}  // namespace
