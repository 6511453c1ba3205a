#include <SDL.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Shell/ScriptInputRoute.h"
#include "Host/Shell/Sdl/SdlInputBox.h"
#include "Host/Shell/Sdl/SdlMenuTracker.h"
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

  // Queues input for a modal loop that has not started yet.
  void QueueMouse(Uint32 type, int x, int y) {
    SDL_Event event{};
    event.type = type;
    if (type == SDL_MOUSEMOTION) {
      event.motion.windowID = mWindow->GetWindowID();
      event.motion.x = x;
      event.motion.y = y;
    } else {
      event.button.windowID = mWindow->GetWindowID();
      event.button.button = SDL_BUTTON_LEFT;
      event.button.state = type == SDL_MOUSEBUTTONDOWN ? SDL_PRESSED : SDL_RELEASED;
      event.button.clicks = 1;
      event.button.x = x;
      event.button.y = y;
    }
    SDL_PushEvent(&event);
  }
  void QueueClick(int x, int y) {
    QueueMouse(SDL_MOUSEMOTION, x, y);
    QueueMouse(SDL_MOUSEBUTTONDOWN, x, y);
    QueueMouse(SDL_MOUSEBUTTONUP, x, y);
  }
  void QueueKey(SDL_Keycode key) {
    SDL_Event event{};
    event.type = SDL_KEYDOWN;
    event.key.windowID = mWindow->GetWindowID();
    event.key.state = SDL_PRESSED;
    event.key.keysym.sym = key;
    SDL_PushEvent(&event);
  }
  void QueueText(const char* text) {
    SDL_Event event{};
    event.type = SDL_TEXTINPUT;
    event.text.windowID = mWindow->GetWindowID();
    SDL_strlcpy(event.text.text, text, sizeof(event.text.text));
    SDL_PushEvent(&event);
  }

  bool Has(const std::string& event) const {
    for (const auto& e : mView->events) {
      if (e == event)
        return true;
    }
    return false;
  }

  MessagingTestScope mMessaging;
  ViewHost mHost{Size{240, 200}};
  std::shared_ptr<RecordingView> mView;
  std::unique_ptr<SdlWindow> mWindow;
};

TEST_F(SdlWindowTest, ShowsTheRenderedImage) {
  const Image shown = mWindow->ReadBack();
  ASSERT_EQ(shown.GetPixelSize(), (Size{240, 200}));
  EXPECT_EQ(shown.GetPixel(10, 50), kLeftColor);
  EXPECT_EQ(shown.GetPixel(230, 50), kRightColor);
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
  mWindow->GetInputRoute().Resize({320, 150});
  EXPECT_EQ(mHost.GetSize(), (Size{320, 150}));
  EXPECT_EQ(mView->GetBounds(), Rect::FromSize(0, 0, 320, 150));
  const Image shown = mWindow->ReadBack();
  ASSERT_EQ(shown.GetPixelSize(), (Size{320, 150}));
  EXPECT_EQ(shown.GetPixel(310, 140), kRightColor);
}

TEST_F(SdlWindowTest, ClosingTheWindowEndsTheLoop) {
  EXPECT_TRUE(mWindow->Pump(0));
  mWindow->RequestClose();
  EXPECT_FALSE(mWindow->Pump(0));
  EXPECT_TRUE(mWindow->IsClosed());
}

TEST_F(SdlWindowTest, AGuardThatRefusesKeepsTheWindowOpenUntilItAgrees) {
  int asked = 0;
  bool agree = false;
  mWindow->SetCloseGuard([&] {
    ++asked;
    return agree;
  });
  mWindow->RequestClose();
  EXPECT_TRUE(mWindow->Pump(0));
  EXPECT_FALSE(mWindow->IsClosed());
  EXPECT_EQ(asked, 1);
  agree = true;
  mWindow->RequestClose();
  EXPECT_FALSE(mWindow->Pump(0));
  EXPECT_EQ(asked, 2);
}

// One, separator, Two (disabled), Three, More > Four; opened at (10, 10).
PopupMenuRequest SampleMenu() {
  auto command = [](CommandID id, const char* text, bool enabled) {
    PopupMenuEntry entry;
    entry.command = id;
    entry.text = text;
    entry.enabled = enabled;
    return entry;
  };
  PopupMenuRequest request;
  request.menuName = "Sample";
  request.windowPoint = {10, 10};
  request.entries.push_back(command(1, "One", true));
  PopupMenuEntry separator;
  separator.kind = MenuItem::Kind::kSeparator;
  request.entries.push_back(separator);
  request.entries.push_back(command(2, "Two", false));
  request.entries.push_back(command(3, "Three", true));
  PopupMenuEntry more;
  more.kind = MenuItem::Kind::kSubmenu;
  more.text = "More";
  more.submenu.push_back(command(4, "Four", true));
  request.entries.push_back(more);
  return request;
}

// Vertical centre of entry rows in SampleMenu (separator rows are shorter).
int RowCenter(int row) {
  const int rows[] = {0, SdlMenuTracker::kItemHeight,
                      SdlMenuTracker::kItemHeight + SdlMenuTracker::kSeparatorHeight,
                      2 * SdlMenuTracker::kItemHeight + SdlMenuTracker::kSeparatorHeight,
                      3 * SdlMenuTracker::kItemHeight + SdlMenuTracker::kSeparatorHeight};
  return 10 + SdlMenuTracker::kPadding + rows[row] + SdlMenuTracker::kItemHeight / 2;
}

TEST_F(SdlWindowTest, PopupMenusChooseEnabledCommandsWithThePointer) {
  SdlMenuTracker tracker(*mWindow);
  const PopupMenuRequest menu = SampleMenu();
  mWindow->Pump(0);
  mView->events.clear();  // the system pointer may enter the window first
  QueueClick(40, RowCenter(3));
  EXPECT_EQ(tracker.TrackPopupMenu(menu), 3);

  QueueClick(40, RowCenter(2));  // disabled: the menu stays open
  QueueKey(SDLK_ESCAPE);
  EXPECT_EQ(tracker.TrackPopupMenu(menu), std::nullopt);

  QueueClick(230, 190);  // outside
  EXPECT_EQ(tracker.TrackPopupMenu(menu), std::nullopt);
  for (const auto& event : mView->events) {
    EXPECT_NE(event.rfind("down", 0), 0u) << "the view got a press meant for the menu";
    EXPECT_NE(event.rfind("up", 0), 0u) << "the view got a release meant for the menu";
  }
}

TEST_F(SdlWindowTest, PopupMenusOpenSubmenusAndFollowTheKeys) {
  SdlMenuTracker tracker(*mWindow);
  const PopupMenuRequest menu = SampleMenu();
  QueueMouse(SDL_MOUSEMOTION, 40, RowCenter(4));  // hover "More": the submenu opens beside it
  QueueKey(SDLK_RIGHT);
  QueueKey(SDLK_RETURN);
  EXPECT_EQ(tracker.TrackPopupMenu(menu), 4);

  QueueKey(SDLK_DOWN);  // One
  QueueKey(SDLK_DOWN);  // skips the separator and the disabled Two
  QueueKey(SDLK_RETURN);
  EXPECT_EQ(tracker.TrackPopupMenu(menu), 3);
}

TEST_F(SdlWindowTest, InputBoxesEditAndAnswer) {
  SdlInputBox box(*mWindow);
  const InputBoxRequest request{"Rename Item", "New Name", "Blur"};
  QueueText(" 2x");
  QueueKey(SDLK_BACKSPACE);
  QueueText("\xC3\xA9");
  QueueKey(SDLK_BACKSPACE);  // a whole two-byte character
  QueueKey(SDLK_RETURN);
  EXPECT_EQ(box.Answer(request), "Blur 2");

  QueueText("gone");
  QueueKey(SDLK_ESCAPE);
  EXPECT_EQ(box.Answer(request), std::nullopt);
}

TEST_F(SdlWindowTest, ClosingTheWindowCancelsAModal) {
  SdlInputBox box(*mWindow);
  mWindow->RequestClose();
  EXPECT_EQ(box.Answer({"Title", "Prompt", "x"}), std::nullopt);
  EXPECT_TRUE(mWindow->IsClosed());
}

}  // namespace
