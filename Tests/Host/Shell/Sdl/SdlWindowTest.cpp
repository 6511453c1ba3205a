#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Shell/ScriptInputRoute.h"
#include "Host/Shell/Sdl/SdlWindow.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/ViewBase.h"
#include "Host/Toolkit/ViewHost.h"

// These tests need a display. Without one (a plain ctest run) they skip; ctest also runs them
// under xvfb-run, where they must pass.

namespace {

constexpr Color kLeftColor(200, 40, 40);
constexpr Color kRightColor(30, 90, 220);

// Paints two halves and writes down the input it gets as short strings.
class RecordingView : public ViewBase {
 public:
  std::vector<std::string> events;

  void PaintSelf(DC& dc) override {
    const Rect bounds = GetLocalBounds();
    dc.FillRect({0, 0, bounds.Width() / 2, bounds.Height()}, kLeftColor);
    dc.FillRect({bounds.Width() / 2, 0, bounds.Width(), bounds.Height()}, kRightColor);
  }
  void LeftButtonDownSelf(Point p, KeyModifiers m) override { Note("down", p, m); }
  void LeftButtonMultiClickSelf(Point p, KeyModifiers m, int count) override {
    Note("multi" + std::to_string(count), p, m);
  }
  void LeftButtonUpSelf(Point p, KeyModifiers m) override { Note("up", p, m); }
  void RightButtonDownSelf(Point p, KeyModifiers m) override { Note("rdown", p, m); }
  void MouseMoveSelf(Point p, KeyModifiers m) override { Note("move", p, m); }
  bool MouseWheelSelf(const WheelEvent& e) override {
    Note("wheel" + std::to_string(e.deltaY), e.point, e.modifiers);
    return true;
  }
  bool KeyDownSelf(const KeyEvent& e) override {
    events.push_back("key " + std::string(KeyCodeName(e.key)) + " m" + std::to_string(e.modifiers));
    return true;
  }
  bool TextInputSelf(std::string_view text) override {
    events.push_back("text " + std::string(text));
    return true;
  }

 private:
  void Note(const std::string& what, Point p, KeyModifiers m) {
    events.push_back(what + " " + std::to_string(p.x) + "," + std::to_string(p.y) + " m" +
                     std::to_string(m));
  }
};

class SdlWindowTest : public ::testing::Test {
 protected:
  void SetUp() override {
    if (std::getenv("DISPLAY") == nullptr)
      GTEST_SKIP() << "no display (DISPLAY is not set); ctest runs this under xvfb-run";
    mView = std::make_shared<RecordingView>();
    mHost.SetRootView(mView);
    mView->BecomeTarget();
    std::string error;
    mWindow = SdlWindow::Open(mHost, "SdlWindowTest", &error);
    ASSERT_NE(mWindow, nullptr) << error;
    mWindow->Pump(0);
  }

  bool Has(const std::string& event) const {
    for (const auto& e : mView->events) {
      if (e == event)
        return true;
    }
    return false;
  }

  MessagingTestScope mMessaging;
  ViewHost mHost{Size{160, 100}};
  std::shared_ptr<RecordingView> mView;
  std::unique_ptr<SdlWindow> mWindow;
};

TEST_F(SdlWindowTest, ShowsTheRenderedImage) {
  const Image shown = mWindow->ReadBack();
  ASSERT_EQ(shown.GetPixelSize(), (Size{160, 100}));
  EXPECT_EQ(shown.GetPixel(10, 50), kLeftColor);
  EXPECT_EQ(shown.GetPixel(150, 50), kRightColor);
}

TEST_F(SdlWindowTest, RepaintsWhatWasInvalidated) {
  mHost.SetBackgroundColor(Color(0, 0, 0));
  mView->Hide();
  mWindow->Pump(0);
  EXPECT_EQ(mWindow->ReadBack().GetPixel(10, 50), Color(0, 0, 0));
  mView->Show();
  mWindow->Pump(0);
  EXPECT_EQ(mWindow->ReadBack().GetPixel(10, 50), kLeftColor);
}

TEST_F(SdlWindowTest, DeliversMouseWithModifiers) {
  auto& route = mWindow->GetInputRoute();
  route.MouseMove({12, 14}, kKeyModifierNone);
  route.MouseDown(MouseButton::kLeft, {12, 14}, kKeyModifierShift | kKeyModifierCtrl, 1);
  route.MouseUp(MouseButton::kLeft, {12, 14}, kKeyModifierShift | kKeyModifierCtrl);
  route.MouseDown(MouseButton::kLeft, {12, 14}, kKeyModifierNone, 2);
  route.MouseUp(MouseButton::kLeft, {12, 14}, kKeyModifierNone);
  route.MouseDown(MouseButton::kRight, {30, 40}, kKeyModifierAlt, 1);
  route.MouseUp(MouseButton::kRight, {30, 40}, kKeyModifierAlt);
  route.Wheel({50, 60}, -2, kKeyModifierNone);
  EXPECT_TRUE(Has("move 12,14 m0"));
  EXPECT_TRUE(Has("down 12,14 m6"));
  EXPECT_TRUE(Has("up 12,14 m6"));
  EXPECT_TRUE(Has("multi2 12,14 m0"));
  EXPECT_TRUE(Has("rdown 30,40 m16"));
  EXPECT_TRUE(Has("wheel-2 50,60 m0"));
}

TEST_F(SdlWindowTest, DeliversKeysAndText) {
  auto& route = mWindow->GetInputRoute();
  route.Key(KeyCode::kDelete, kKeyModifierCtrl);
  route.Key(KeyCode::kA, kKeyModifierNone);
  // Longer than one SDL text event, with a two-byte character across the cut.
  const std::string text = "abcdefghijklmnopqrstuvwxyz0123\xC3\xA9xyz";
  route.Text(text);
  EXPECT_TRUE(Has("key Delete m4"));
  EXPECT_TRUE(Has("key A m0"));
  std::string typed;
  for (const auto& e : mView->events) {
    if (e.rfind("text ", 0) == 0)
      typed += e.substr(5);
  }
  EXPECT_EQ(typed, text);
}

TEST_F(SdlWindowTest, ResizeReachesTheViewTree) {
  mWindow->GetInputRoute().Resize({240, 120});
  EXPECT_EQ(mHost.GetSize(), (Size{240, 120}));
  EXPECT_EQ(mView->GetBounds(), Rect::FromSize(0, 0, 240, 120));
  const Image shown = mWindow->ReadBack();
  ASSERT_EQ(shown.GetPixelSize(), (Size{240, 120}));
  EXPECT_EQ(shown.GetPixel(230, 110), kRightColor);
}

TEST_F(SdlWindowTest, ClosingTheWindowEndsTheLoop) {
  EXPECT_TRUE(mWindow->Pump(0));
  mWindow->RequestClose();
  EXPECT_FALSE(mWindow->Pump(0));
  EXPECT_TRUE(mWindow->IsClosed());
}

}  // namespace
