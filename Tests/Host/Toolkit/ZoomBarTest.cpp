#include <gtest/gtest.h>

#include <algorithm>

#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ZoomBar.h"
#include "Host/Toolkit/ZoomLimiter.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

class FrameLimiter : public ZoomLimiter {
 public:
  TickTime GetDuration() const override { return 100 * kSecond; }
  TickTime GetFrameDuration() const override { return kSecond / 25; }
  TickTime ClampTime(TickTime time) const override {
    return std::clamp<TickTime>(time, 0, 100 * kSecond);
  }
};

class ZoomBarTest : public ControlTest {
 protected:
  ZoomBarTest() {
    // Both 200 px wide; the zoom bar shows 100 s, two pixels a second.
    bar = Add(std::make_shared<TimeBarControl>(Rect{0, 60, 200, 84}));
    bar->SetTimeRange(0, 100 * kSecond);
    bar->SetZoomInOutTime(20 * kSecond, 40 * kSecond);
    zoom = Add(std::make_shared<ZoomBar>(kBounds));
    zoom->AttachTo(bar.get());
    recorder.ListenTo(bar->GetStation());
  }

  static std::string N(TickTime t) { return std::to_string(t); }

  static constexpr Rect kBounds{0, 50, 200, 60};
  std::shared_ptr<TimeBarControl> bar;
  std::shared_ptr<ZoomBar> zoom;
};

TEST_F(ZoomBarTest, TheThumbShowsTheVisiblePartOfTheRange) {
  EXPECT_EQ(zoom->GetThumbRect(), (Rect{40, 0, 80, 10}));
  bar->SetZoomInOutTime(0, 100 * kSecond);
  EXPECT_EQ(zoom->GetThumbRect(), (Rect{0, 0, 200, 10}));
  bar->SetZoomInOutTime(50 * kSecond, 50 * kSecond + 1);
  EXPECT_EQ(zoom->GetThumbRect().Width(), ZoomBar::kMinThumbWidth);
}

TEST_F(ZoomBarTest, DraggingTheLeftEndZoomsKeepingTheRightEnd) {
  Drag({41, 55}, {21, 55}, 2);
  EXPECT_EQ(bar->GetZoomInTime(), 10 * kSecond);
  EXPECT_EQ(bar->GetZoomOutTime(), 40 * kSecond);
  EXPECT_EQ(recorder.lines, (Lines{"ZoomChanging " + N(15 * kSecond) + " " + N(40 * kSecond),
                                   "ZoomChanging " + N(10 * kSecond) + " " + N(40 * kSecond),
                                   "ZoomChanged " + N(10 * kSecond) + " " + N(40 * kSecond)}));
}

TEST_F(ZoomBarTest, DraggingTheRightEndStopsAtTheEndOfTheRange) {
  Drag({78, 55}, {400, 55}, 2);
  EXPECT_EQ(bar->GetZoomInTime(), 20 * kSecond);
  EXPECT_EQ(bar->GetZoomOutTime(), 100 * kSecond);
  EXPECT_EQ(recorder.lines.back(), "ZoomChanged " + N(20 * kSecond) + " " + N(100 * kSecond));
}

TEST_F(ZoomBarTest, ZoomingInStopsAtTheMinimumSpan) {
  Drag({78, 55}, {0, 55}, 2);
  EXPECT_EQ(bar->GetZoomOutTime() - bar->GetZoomInTime(), bar->GetMinimumZoomSpan());
  FrameLimiter limiter;
  limiter.SetScrollWidth(200);
  bar->SetZoomLimiter(&limiter);
  // A frame may take at most kMaxPixelsPerFrame pixels: 200 px show at least that many frames.
  const TickTime frames = SecondsToTicks(200.0 / (ZoomLimiter::kMaxPixelsPerFrame * 25.0));
  EXPECT_EQ(bar->GetMinimumZoomSpan(), frames);
  bar->SetZoomInOutTime(20 * kSecond, 40 * kSecond);
  Drag({41, 55}, {300, 55}, 2);
  EXPECT_EQ(bar->GetZoomOutTime() - bar->GetZoomInTime(), frames);
  bar->SetZoomLimiter(nullptr);
}

TEST_F(ZoomBarTest, DraggingTheMiddleSlidesWithoutZooming) {
  Drag({60, 55}, {80, 55}, 2);
  EXPECT_EQ(bar->GetZoomInTime(), 30 * kSecond);
  EXPECT_EQ(bar->GetZoomOutTime(), 50 * kSecond);
  EXPECT_EQ(recorder.lines, (Lines{"SlideZoom " + N(25 * kSecond) + " " + N(45 * kSecond),
                                   "SlideZoom " + N(30 * kSecond) + " " + N(50 * kSecond)}));
  recorder.Clear();
  // The thumb is now [60, 100); its middle is at 80 (x = 100 would grab the right end).
  Drag({80, 55}, {-500, 55}, 1);
  EXPECT_EQ(bar->GetZoomInTime(), 0) << "the slide stops at the start";
  EXPECT_EQ(bar->GetZoomOutTime(), 20 * kSecond);
}

TEST_F(ZoomBarTest, APressBesideTheThumbCentresTheViewThere) {
  Click({150, 55});
  EXPECT_EQ(bar->GetZoomInTime(), 65 * kSecond);
  EXPECT_EQ(bar->GetZoomOutTime(), 85 * kSecond);
  EXPECT_EQ(recorder.lines, Lines{"SlideZoom " + N(65 * kSecond) + " " + N(85 * kSecond)});
}

TEST_F(ZoomBarTest, ADoubleClickShowsTheWholeRange) {
  DoubleClick({60, 55});
  EXPECT_EQ(bar->GetZoomInTime(), 0);
  EXPECT_EQ(bar->GetZoomOutTime(), 100 * kSecond);
  EXPECT_EQ(recorder.lines.back(), "ZoomChanged 0 " + N(100 * kSecond));
}

TEST_F(ZoomBarTest, ADisabledBarDoesNotZoom) {
  zoom->Disable();
  Drag({41, 55}, {21, 55});
  EXPECT_EQ(bar->GetZoomInTime(), 20 * kSecond);
  EXPECT_TRUE(recorder.lines.empty());
}

TEST_F(ZoomBarTest, RulerAndBarMayGoInEitherOrder) {
  bar->Destroy();
  bar.reset();
  EXPECT_EQ(zoom->GetTimeBar(), nullptr);
  Drag({41, 55}, {21, 55});  // inert, and no dangling ruler
  EXPECT_TRUE(PaintsOnlyInside(kBounds));

  auto ruler = std::make_shared<TimeBarControl>(Rect{0, 0, 10, 10});
  auto other = std::make_shared<ZoomBar>(Rect{0, 0, 10, 10});
  other->AttachTo(ruler.get());
  zoom->AttachTo(ruler.get());  // takes the ruler from the other bar
  EXPECT_EQ(other->GetTimeBar(), nullptr);
  EXPECT_EQ(ruler->GetZoomBar(), zoom.get());
  zoom->Destroy();
  zoom.reset();
  EXPECT_EQ(ruler->GetZoomBar(), nullptr);
}

TEST_F(ZoomBarTest, PaintsInsideItsBounds) {
  bar->Hide();
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
}

}  // namespace
