#include <gtest/gtest.h>

#include "Host/Toolkit/ScrollBar.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

using std::chrono::milliseconds;

class ScrollBarTest : public ControlTest {
 protected:
  ScrollBarTest() {
    // 114 px tall: arrows of 14 px at both ends, a track of 86 px between them.
    bar = Add(std::make_shared<ScrollBar>(kBounds, ScrollBar::Orientation::kVertical));
    bar->SetScrollInfo(0, 1000, 100, 0);
    bar->SetStep(20);
    recorder.ListenTo(bar->GetStation());
  }

  static std::string V(ScrollCode code, int position) {
    return "VScroll " + std::to_string(static_cast<int>(code)) + " " + std::to_string(position);
  }

  static constexpr Rect kBounds{300, 0, 314, 114};
  std::shared_ptr<ScrollBar> bar;
};

TEST_F(ScrollBarTest, ThePositionStaysBetweenTheMinimumAndTheLastPage) {
  bar->SetPosition(5000);
  EXPECT_EQ(bar->GetPosition(), 900);
  bar->SetPosition(-5);
  EXPECT_EQ(bar->GetPosition(), 0);
  bar->SetPageSize(2000);
  EXPECT_FALSE(bar->CanScroll());
  bar->SetScrollInfo(0, 1000, 100, 950);
  EXPECT_EQ(bar->GetPosition(), 900);
  bar->SetRange(0, 500);
  EXPECT_EQ(bar->GetPosition(), 400) << "a shrinking range pulls the position in";
  bar->SetScrollInfo(10, 5, -3, 7);
  EXPECT_EQ(bar->GetPosition(), 10);
  EXPECT_TRUE(recorder.lines.empty()) << "code never reports";
}

TEST_F(ScrollBarTest, ScrollByReportsWhatItActuallyMoved) {
  EXPECT_EQ(bar->ScrollBy(-40), 0);
  EXPECT_EQ(bar->ScrollBy(60), 60);
  EXPECT_EQ(bar->ScrollBy(5000), 840);
  EXPECT_EQ(bar->ScrollBy(std::numeric_limits<int>::max()), 0) << "no overflow";
  EXPECT_EQ(recorder.lines,
            (Lines{V(ScrollCode::kThumbPosition, 60), V(ScrollCode::kThumbPosition, 900)}));
}

TEST_F(ScrollBarTest, ArrowsStepAndTheReleaseEndsTheScroll) {
  Click({307, 105});
  EXPECT_EQ(bar->GetPosition(), 20);
  Click({307, 5});
  EXPECT_EQ(bar->GetPosition(), 0);
  EXPECT_EQ(recorder.lines, (Lines{V(ScrollCode::kLineDown, 20), V(ScrollCode::kEndScroll, 20),
                                   V(ScrollCode::kLineUp, 0), V(ScrollCode::kEndScroll, 0)}));
}

TEST_F(ScrollBarTest, HoldingAnArrowRepeatsUntilReleased) {
  Press({307, 105});
  RepeatTimer::Instance().AdvanceBy(milliseconds(ScrollBar::kRepeatDelayMilliseconds));
  RepeatTimer::Instance().AdvanceBy(milliseconds(2 * ScrollBar::kRepeatIntervalMilliseconds));
  EXPECT_EQ(bar->GetPosition(), 80);
  Release({307, 105});
  RepeatTimer::Instance().AdvanceBy(milliseconds(1000));
  EXPECT_EQ(bar->GetPosition(), 80);
}

TEST_F(ScrollBarTest, TheTrackPagesTowardsThePointerAndStopsThere) {
  const Rect thumb = bar->GetThumbRect();
  EXPECT_EQ(thumb.top, 14);
  EXPECT_GE(thumb.Height(), ScrollBar::kMinThumbLength);
  Press({307, 60});
  EXPECT_EQ(bar->GetPosition(), 100);
  RepeatTimer::Instance().AdvanceBy(milliseconds(2000));
  // The thumb now covers y 60: paging stopped.
  const Rect reached = bar->GetThumbRect();
  EXPECT_LE(reached.top, 60);
  EXPECT_GT(reached.bottom, 60);
  Release({307, 60});
  EXPECT_EQ(recorder.lines.back(), V(ScrollCode::kEndScroll, bar->GetPosition()));
}

TEST_F(ScrollBarTest, DraggingTheThumbTracksThenSetsThePosition) {
  const Rect thumb = bar->GetThumbRect();
  const int grabY = thumb.top + 2;
  const int room = 86 - thumb.Height();
  Drag({307, grabY}, {307, grabY + room}, 2);
  EXPECT_EQ(bar->GetPosition(), 900);
  ASSERT_GE(recorder.lines.size(), 3u);
  EXPECT_EQ(recorder.lines[recorder.lines.size() - 3], V(ScrollCode::kThumbTrack, 900));
  EXPECT_EQ(recorder.lines[recorder.lines.size() - 2], V(ScrollCode::kThumbPosition, 900));
  EXPECT_EQ(recorder.lines.back(), V(ScrollCode::kEndScroll, 900));
  recorder.Clear();
  Drag({307, bar->GetThumbRect().top + 2}, {307, -500}, 2);
  EXPECT_EQ(bar->GetPosition(), 0) << "dragging past the end stops at the minimum";
}

TEST_F(ScrollBarTest, TheWheelScrollsThreeStepsANotch) {
  host.MouseWheel(WheelEvent{{307, 50}, 0, -1, kKeyModifierNone});
  EXPECT_EQ(bar->GetPosition(), 60);
  host.MouseWheel(WheelEvent{{307, 50}, 0, 5, kKeyModifierNone});
  EXPECT_EQ(bar->GetPosition(), 0);
}

TEST_F(ScrollBarTest, ABarWhoseContentFitsIsInert) {
  bar->SetScrollInfo(0, 80, 100, 0);
  Click({307, 105});
  Drag({307, 30}, {307, 90});
  EXPECT_EQ(bar->GetPosition(), 0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(ScrollBarTest, ADisabledBarIgnoresTheMouse) {
  bar->Disable();
  Click({307, 105});
  EXPECT_EQ(bar->GetPosition(), 0);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(ScrollBarTest, AHorizontalBarReportsHorizontally) {
  auto horizontal =
      Add(std::make_shared<ScrollBar>(Rect{0, 180, 200, 194}, ScrollBar::Orientation::kHorizontal));
  horizontal->SetScrollInfo(0, 400, 200, 0);
  horizontal->SetStep(10);
  recorder.ListenTo(horizontal->GetStation());
  Click({195, 187});
  EXPECT_EQ(recorder.lines.front(), "HScroll 1 10");
}

TEST_F(ScrollBarTest, ThePositionMovesTheThumbAndPaintingStaysInside) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  const int top = bar->GetThumbRect().top;
  bar->SetPosition(900);
  EXPECT_EQ(bar->GetThumbRect().bottom, 100);
  EXPECT_GT(bar->GetThumbRect().top, top);
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

}  // namespace
