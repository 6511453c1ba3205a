#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;
constexpr TickTime kFrame = 8467200000;  // 30 fps

class TimeBarControlTest : public ControlTest {
 protected:
  TimeBarControlTest() {
    // 200 px for 20 s: a tenth of a second (three frames) per pixel.
    bar = Add(std::make_shared<TimeBarControl>(kBounds));
    bar->SetTimeRange(0, 100 * kSecond);
    bar->SetZoomInOutTime(10 * kSecond, 30 * kSecond);
    recorder.ListenTo(bar->GetStation());
  }

  // Window point at time t on the bar's middle row.
  Point At(TickTime t, int y = 12) const {
    return {kBounds.left + bar->TimeToPixel(t), kBounds.top + y};
  }
  static std::string N(TickTime t) { return std::to_string(t); }

  static constexpr Rect kBounds{50, 40, 250, 64};  // 200 x 24
  std::shared_ptr<TimeBarControl> bar;
};

// --- Mapping ---

TEST_F(TimeBarControlTest, TimeAndPixelMapConsistentlyOverTheZoomRange) {
  EXPECT_DOUBLE_EQ(bar->GetTicksPerPixel(), kSecond / 10.0);
  EXPECT_EQ(bar->PixelToTime(0), 10 * kSecond);
  EXPECT_EQ(bar->PixelToTime(200), 30 * kSecond);
  EXPECT_EQ(bar->TimeToPixel(20 * kSecond), 100);
  EXPECT_EQ(bar->TimeToPixel(20 * kSecond - 1), 99) << "a pixel's times round down";
  EXPECT_EQ(bar->TimeToPixel(5 * kSecond), -50) << "times left of the view map left of 0";
  for (int x = -300; x <= 500; ++x) {
    ASSERT_EQ(bar->TimeToPixel(bar->PixelToTime(x)), x) << x;
  }
}

TEST_F(TimeBarControlTest, TheMappingHoldsForUnevenRangesAndHugeTimes) {
  bar->SetZoomInOutTime(7, 7 + 1234567891);
  for (int x = 0; x <= 200; ++x) {
    ASSERT_EQ(bar->TimeToPixel(bar->PixelToTime(x)), x) << x;
  }
  bar->SetZoomInOutTime(kTime_Max - 1000 * kSecond, kTime_Max);
  EXPECT_EQ(bar->TimeToPixel(kTime_Max), 200);
  EXPECT_EQ(bar->PixelToTime(0), kTime_Max - 1000 * kSecond);
  EXPECT_EQ(bar->PixelToTime(100000), kTime_Max) << "saturates instead of overflowing";
}

TEST_F(TimeBarControlTest, AnEmptyOrReversedRangeIsRefused) {
  ClearRecordedDebugAssertions();
  bar->SetTimeRange(10 * kSecond, 5 * kSecond);
  bar->SetZoomInOutTime(5 * kSecond, 5 * kSecond);
  EXPECT_EQ(bar->GetEndTime(), 100 * kSecond);
  EXPECT_EQ(bar->GetZoomInTime(), 10 * kSecond);
  ASSERT_EQ(RecordedDebugAssertions().size(), 2u);
  EXPECT_EQ(RecordedDebugAssertions()[0].message, "Invalid Min/Max Time");
}

// --- Current time ---

TEST_F(TimeBarControlTest, DraggingMovesTheCurrentTimeOnFrames) {
  Press({kBounds.left + 100, 52});
  Move({kBounds.left + 101, 52});
  Release({kBounds.left + 101, 52});
  const TickTime at101 = kFrameRate_30.AlignToNearestFrame(bar->PixelToTime(101));
  EXPECT_EQ(recorder.lines, (Lines{"EditTimeChanging " + N(20 * kSecond),
                                   "EditTimeChanging " + N(at101), "EditTimeChanged " + N(at101)}));
  EXPECT_EQ(bar->GetCurrentTime(), at101);
  EXPECT_TRUE(kFrameRate_30.IsFrameAligned(at101));
}

TEST_F(TimeBarControlTest, TheCurrentTimeStaysInsideTheTimeRange) {
  bar->SetTimeRange(0, 25 * kSecond);
  Drag({kBounds.left + 100, 52}, {kBounds.left + 400, 52});
  EXPECT_EQ(bar->GetCurrentTime(), 25 * kSecond);
  EXPECT_EQ(recorder.lines.back(), "EditTimeChanged " + N(25 * kSecond));
}

TEST_F(TimeBarControlTest, APressAtTheCurrentTimeReportsNothing) {
  bar->SetCurrentTime(20 * kSecond);
  Click({kBounds.left + 100, 52});
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(TimeBarControlTest, RightPressReportsThePointAndTime) {
  RightClick({kBounds.left + 100, 45});
  EXPECT_EQ(recorder.lines, Lines{"RightDown 100,5 " + N(20 * kSecond)});
}

// --- Marks ---

TEST_F(TimeBarControlTest, DraggingTheInMarkStopsAtTheOutMark) {
  bar->SetInOutMarks(15 * kSecond, 20 * kSecond);
  const Point in = At(15 * kSecond, 22);
  Drag(in, {in.x + 100, in.y}, 2);
  EXPECT_EQ(bar->GetInMark(), 20 * kSecond);
  EXPECT_EQ(recorder.lines.back(), "MarkInChanged " + N(20 * kSecond));
  EXPECT_EQ(bar->GetCurrentTime(), 0) << "a mark drag leaves the current time";
}

TEST_F(TimeBarControlTest, DraggingTheOutMarkReportsEachTimeThenTheEnd) {
  bar->SetInOutMarks(15 * kSecond, 20 * kSecond);
  const Point out = At(20 * kSecond, 22);
  Drag(out, {out.x + 10, out.y}, 2);
  EXPECT_EQ(recorder.lines,
            (Lines{"MarkOutChanging " + N(20 * kSecond + 15 * kFrame),
                   "MarkOutChanging " + N(21 * kSecond), "MarkOutChanged " + N(21 * kSecond)}));
}

TEST_F(TimeBarControlTest, DraggingTheMarkedStripMovesBothWithinTheRange) {
  bar->SetInOutMarks(15 * kSecond, 20 * kSecond);
  bar->SetTimeRange(0, 22 * kSecond);
  const Point middle = At(17 * kSecond, 22);
  Drag(middle, {middle.x + 60, middle.y}, 3);
  EXPECT_EQ(bar->GetInMark(), 17 * kSecond);
  EXPECT_EQ(bar->GetOutMark(), 22 * kSecond);
  EXPECT_EQ(recorder.lines.back(), "MarkInOutChanged " + N(17 * kSecond) + " " + N(22 * kSecond));
}

// --- Markers ---

class TimeBarMarkerTest : public TimeBarControlTest {
 protected:
  TimeBarMarkerTest() {
    bar->SetMarkers({TimeBarMarker{7, 25 * kSecond, 0, 1, "cut"}});
    bar->SetMarkerSelectionFunctions([this](std::int64_t id) { return id == selected; },
                                     [this](std::int64_t id) { selected = id; });
  }
  std::int64_t selected = 0;
};

TEST_F(TimeBarMarkerTest, DraggingAMarkerShowsItMovedAndReportsOldAndNewTimes) {
  const Point marker = At(25 * kSecond, 3);
  Drag(marker, {marker.x - 10, marker.y}, 1);
  EXPECT_EQ(bar->GetMarkers().front().time, 24 * kSecond);
  EXPECT_EQ(recorder.lines, (Lines{"MarkerChanging 7 " + N(25 * kSecond) + "->" + N(24 * kSecond),
                                   "MarkerChanged 7 " + N(25 * kSecond) + "->" + N(24 * kSecond)}));
  EXPECT_EQ(bar->GetCurrentTime(), 0);
}

TEST_F(TimeBarMarkerTest, TheOwnerMayReloadTheMarkersDuringTheDrag) {
  FunctionListener owner([this](const Message& message) {
    if (message.Is<MarkerTimeChangingMessage>()) {
      bar->SetMarkers({});  // e.g. the model refused and reloaded
    }
  });
  AddListener(bar->GetStation(), owner);
  const Point marker = At(25 * kSecond, 3);
  Drag(marker, {marker.x - 10, marker.y}, 2);
  EXPECT_EQ(recorder.lines.back(), "MarkerChanged 7 " + N(25 * kSecond) + "->" + N(24 * kSecond));
}

TEST_F(TimeBarMarkerTest, AClickSelectsAndADoubleClickAsksToEdit) {
  Click(At(25 * kSecond, 3));
  EXPECT_EQ(selected, 7);
  EXPECT_TRUE(recorder.lines.empty());
  DoubleClick(At(25 * kSecond, 3));
  EXPECT_EQ(recorder.lines.back(), "EditMarker 7");
}

TEST_F(TimeBarMarkerTest, BelowTheMarkerBandAPressMovesTheCurrentTime) {
  Click(At(25 * kSecond, 14));
  EXPECT_EQ(bar->GetCurrentTime(), 25 * kSecond);
  EXPECT_EQ(bar->GetMarkers().front().time, 25 * kSecond);
}

// --- Panning and display ---

TEST_F(TimeBarControlTest, PanningSlidesTheViewAndStopsAtTheEnds) {
  host.MousePan(PanEvent{{100, 50}, 50, 0, kKeyModifierNone});
  EXPECT_EQ(bar->GetZoomInTime(), 15 * kSecond);
  EXPECT_EQ(bar->GetZoomOutTime(), 35 * kSecond);
  EXPECT_EQ(recorder.lines, Lines{"SlideZoom " + N(15 * kSecond) + " " + N(35 * kSecond)});
  EXPECT_FALSE(bar->ScrollByPixels(-100000) && bar->ScrollByPixels(-1));
  EXPECT_EQ(bar->GetZoomInTime(), 0);
  EXPECT_EQ(bar->GetZoomOutTime(), 20 * kSecond);
}

TEST_F(TimeBarControlTest, TickIntervalsGrowAsTheViewZoomsOut) {
  const TickTime close = bar->GetMajorTickInterval();
  bar->SetZoomInOutTime(0, 3600 * kSecond);
  const TickTime far = bar->GetMajorTickInterval();
  EXPECT_GT(far, close);
  bar->SetShowNumbers(false);
  EXPECT_LE(bar->GetMajorTickInterval(), far) << "without numbers ticks may be closer";
  bar->SetZoomInOutTime(0, 2 * kFrame);
  EXPECT_EQ(bar->GetMajorTickInterval() % kFrame, 0) << "fine zoom: whole frames";
}

TEST_F(TimeBarControlTest, ADisabledBarTakesNoInput) {
  bar->Disable();
  Drag({kBounds.left + 100, 52}, {kBounds.left + 150, 52});
  RightClick({kBounds.left + 100, 52});
  EXPECT_EQ(bar->GetCurrentTime(), 0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(TimeBarControlTest, PaintsInsideItsBoundsWithEverythingShown) {
  bar->SetInOutMarks(12 * kSecond, 28 * kSecond);
  bar->SetMarkers({TimeBarMarker{1, 11 * kSecond, 2 * kSecond, 3, ""}});
  bar->SetCurrentTime(10 * kSecond);  // the head at the left edge
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  bar->SetAudioTimeUnits(true);
  bar->SetZeroPoint(3600 * kSecond);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

// A clip of about 2^62 ticks zoomed out on a narrow ruler: the tick spacing, a multiple of
// the longest step, overflowed 64 bits.
TEST_F(TimeBarControlTest, AHugeRangeZoomedOutOnANarrowBarHasTicksThatAreTimes) {
  constexpr TickTime kHuge = TickTime{1} << 62;
  constexpr TickTime kTwelveHours = 43200 * kSecond;
  const Rect narrow = Rect::FromSize(kBounds.left, kBounds.top, 30, kBounds.Height());
  bar->SetBounds(narrow);
  bar->SetTimeRange(0, kHuge);
  bar->SetZoomInOutTime(0, kHuge);
  for (const bool numbers : {true, false}) {
    bar->SetShowNumbers(numbers);
    const TickTime interval = bar->GetMajorTickInterval();
    EXPECT_GT(interval, 0);
    EXPECT_LE(interval, kTime_Max);
    EXPECT_EQ(interval % kTwelveHours, 0);
    EXPECT_TRUE(PaintsOnlyInside(narrow));
  }
}

// Times beyond the sentinels are limited to them; the whole range of times is wider than the
// largest time, which the pan's shift and the zoom's span must not saturate or wrap.
TEST_F(TimeBarControlTest, TheWholeRangeOfTimesCanBeViewedAndPanned) {
  constexpr TickTime kLowest = std::numeric_limits<TickTime>::min();
  constexpr TickTime kHighest = std::numeric_limits<TickTime>::max();
  bar->SetTimeRange(kLowest, kHighest);
  bar->SetZoomInOutTime(kLowest, kHighest);
  EXPECT_EQ(bar->GetStartTime(), kTime_Min);
  EXPECT_EQ(bar->GetEndTime(), kTime_Max);
  EXPECT_EQ(bar->GetZoomInTime(), kTime_Min);
  EXPECT_EQ(bar->GetZoomOutTime(), kTime_Max);
  EXPECT_GT(bar->GetMajorTickInterval(), 0);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  EXPECT_FALSE(bar->ScrollByPixels(1000)) << "the view is the whole range";

  bar->SetZoomInOutTime(kTime_Min, 0);
  recorder.lines.clear();
  EXPECT_TRUE(bar->ScrollByPixels(100000));
  EXPECT_EQ(bar->GetZoomInTime(), 0);
  EXPECT_EQ(bar->GetZoomOutTime(), kTime_Max);
  EXPECT_EQ(recorder.lines, Lines{"SlideZoom 0 " + N(kTime_Max)});
  EXPECT_TRUE(bar->ScrollByPixels(-100000));
  EXPECT_EQ(bar->GetZoomInTime(), kTime_Min);
  EXPECT_EQ(bar->GetZoomOutTime(), 0);
}

// One tick per pixel: times at the sentinels map billions of pixels away, and the marks' and
// markers' shapes around them overflowed an int.
TEST_F(TimeBarMarkerTest, MarksAndMarkersFarOutsideAFineViewPaintAndHitTest) {
  bar->SetTimeRange(kTime_Min, kTime_Max);
  bar->SetZoomInOutTime(0, 200);
  bar->SetInOutMarks(kTime_Min, kTime_Max);
  bar->SetMarkers({TimeBarMarker{1, kTime_Min, 2 * kTime_Max, 2, ""},
                   TimeBarMarker{2, kTime_Max, 0, 3, ""}, TimeBarMarker{3, kTime_Min, 0, 4, ""}});
  EXPECT_EQ(bar->TimeToPixel(kTime_Max), TimeBarControl::kMaxPixel);
  EXPECT_EQ(bar->TimeToPixel(kTime_Min), -TimeBarControl::kMaxPixel);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  Click({kBounds.left + 100, kBounds.top + 3});
  EXPECT_EQ(selected, 1) << "the long marker spans the view";
  // Near the marks' handles, but they are far off: the press moves the current time.
  Drag({kBounds.left + 100, kBounds.top + 16}, {kBounds.left + 150, kBounds.top + 16});
  EXPECT_EQ(bar->GetInMark(), kTime_Min);
  EXPECT_EQ(bar->GetOutMark(), kTime_Max);
  for (const std::string& line : recorder.lines) {
    EXPECT_EQ(line.rfind("Mark", 0), std::string::npos) << line;
  }
}

TEST_F(TimeBarControlTest, TheCurrentTimeIndicatorIsDrawnAtItsPixel) {
  bar->SetCurrentTime(20 * kSecond);
  host.InvalidateAll();
  host.Render();
  const Color indicator = ColorManager::GetColor(kColor_CurrentTimeIndicator);
  EXPECT_EQ(host.GetImage().GetPixel(kBounds.left + 100, kBounds.top + 15), indicator);
  EXPECT_NE(host.GetImage().GetPixel(kBounds.left + 102, kBounds.top + 15), indicator);
}

}  // namespace
