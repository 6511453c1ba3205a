#include <gtest/gtest.h>

#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

using Lines = std::vector<std::string>;

constexpr Color kRed(255, 0, 0);
constexpr Color kGreen(0, 255, 0);
constexpr Color kBlue(0, 0, 255);

class ViewHostTest : public ::testing::Test {
 protected:
  void SetUp() override {
    host.SetShortcutManager(&shortcuts);
    root = RecordingView::Make("root", log, Rect{}, kRed);
    host.SetRootView(root);
    a = RecordingView::Make("A", log, Rect{10, 10, 60, 60}, kGreen);
    root->AddChild(a);
    host.Render();
    log->Clear();
  }

  ToolkitTestScope scope;
  std::shared_ptr<EventLog> log = std::make_shared<EventLog>();
  ShortcutManager shortcuts;
  ViewHost host{Size{100, 80}};
  std::shared_ptr<RecordingView> root;
  std::shared_ptr<RecordingView> a;
};

// --- Painting ---

TEST_F(ViewHostTest, TheRootFillsTheWindowAndFollowsItsSize) {
  EXPECT_EQ(root->GetBounds(), (Rect{0, 0, 100, 80}));
  host.Resize(Size{120, 90});
  EXPECT_EQ(root->GetBounds(), (Rect{0, 0, 120, 90}));
  EXPECT_EQ(host.GetImage().GetPixelSize(), (Size{120, 90}));
  EXPECT_EQ(host.GetDirtyRegion().Bounds(), (Rect{0, 0, 120, 90}));
}

TEST_F(ViewHostTest, ChildrenPaintOverTheirParentClippedToTheirBounds) {
  const Image& image = host.GetImage();
  EXPECT_EQ(image.GetPixel(5, 5), kRed);
  EXPECT_EQ(image.GetPixel(10, 10), kGreen);
  EXPECT_EQ(image.GetPixel(59, 59), kGreen);
  EXPECT_EQ(image.GetPixel(60, 60), kRed);
}

TEST_F(ViewHostTest, InvalidationsAccumulateInWindowCoordinatesUntilRendered) {
  EXPECT_TRUE(host.GetDirtyRegion().IsEmpty());
  a->InvalidateRect(Rect{0, 0, 5, 5});
  a->InvalidateRect(Rect{40, 40, 45, 45});
  EXPECT_EQ(host.GetDirtyRegion().Rects(), (std::vector<Rect>{{10, 10, 15, 15}, {50, 50, 55, 55}}));
  // Parts outside the view or the window are dropped.
  a->InvalidateRect(Rect{45, -20, 200, 3});
  EXPECT_EQ(host.GetDirtyRegion().Rects().size(), 3u);
  EXPECT_EQ(host.GetDirtyRegion().Rects()[2], (Rect{55, 10, 60, 13}));

  const Region painted = host.Render();
  EXPECT_EQ(painted.Rects().size(), 3u);
  EXPECT_TRUE(host.GetDirtyRegion().IsEmpty());
  EXPECT_TRUE(host.Render().IsEmpty());
}

TEST_F(ViewHostTest, RenderPaintsOnlyTheDirtyRegion) {
  a->SetFill(kBlue);
  a->InvalidateRect(Rect{0, 0, 10, 10});
  host.Render();
  const Image& image = host.GetImage();
  EXPECT_EQ(image.GetPixel(12, 12), kBlue);
  EXPECT_EQ(image.GetPixel(25, 25), kGreen);  // not invalidated: not repainted
}

TEST_F(ViewHostTest, HiddenViewsNeitherInvalidateNorPaint) {
  a->Hide();
  EXPECT_EQ(host.GetDirtyRegion().Bounds(), (Rect{10, 10, 60, 60}));  // what it uncovered
  host.Render();
  EXPECT_EQ(host.GetImage().GetPixel(20, 20), kRed);
  a->InvalidateRect(Rect{0, 0, 5, 5});
  EXPECT_TRUE(host.GetDirtyRegion().IsEmpty());
  const int paints = a->paintCount;
  host.InvalidateAll();
  host.Render();
  EXPECT_EQ(a->paintCount, paints);
}

TEST_F(ViewHostTest, MovingAViewInvalidatesWhereItWasAndWhereItIs) {
  a->SetBounds(Rect{50, 20, 60, 30});
  EXPECT_EQ(host.GetDirtyRegion().Bounds(), (Rect{10, 10, 60, 60}));
  host.Render();
  EXPECT_EQ(host.GetImage().GetPixel(15, 15), kRed);
  EXPECT_EQ(host.GetImage().GetPixel(55, 25), kGreen);
}

TEST_F(ViewHostTest, ADoubleBufferedViewPaintsTheSamePicture) {
  auto inner = RecordingView::Make("inner", log, Rect{5, 5, 15, 15}, kBlue.WithAlpha(128));
  a->AddChild(inner);
  host.InvalidateAll();
  host.Render();
  const Image direct = host.GetImage().Clone();

  a->SetDoubleBuffered(true);
  host.InvalidateAll();
  host.Render();
  const Image& buffered = host.GetImage();
  for (int y = 0; y < 80; y += 3) {
    for (int x = 0; x < 100; x += 3) {
      ASSERT_EQ(buffered.GetPixel(x, y), direct.GetPixel(x, y)) << x << "," << y;
    }
  }
  EXPECT_NE(buffered.GetPixel(20, 20), kGreen);  // the half-transparent child shows
}

TEST_F(ViewHostTest, InvalidationsDuringAPaintWaitForTheNextRender) {
  int paints = 0;
  struct SelfInvalidating : SubView {
    int* mPaints = nullptr;
    void PaintSelf(DC&) override {
      ++*mPaints;
      Invalidate();
      UpdateNow();  // ignored inside a paint
    }
  };
  auto view = std::make_shared<SelfInvalidating>();
  view->mPaints = &paints;
  view->SetBounds(Rect{0, 0, 10, 10});
  root->AddChild(view);
  host.Render();
  EXPECT_EQ(paints, 1);
  EXPECT_EQ(host.GetDirtyRegion().Bounds(), (Rect{0, 0, 10, 10}));
}

TEST_F(ViewHostTest, ThePresenterGetsTheImageAndWhatWasPainted) {
  Region presented;
  host.SetPresenter([&](const Image& image, const Region& painted) {
    EXPECT_EQ(&image, &host.GetImage());
    presented = painted;
  });
  a->Redraw();  // invalidates and paints at once
  EXPECT_EQ(presented.Bounds(), (Rect{10, 10, 60, 60}));
}

// --- Keys and shortcuts ---

class ViewHostKeyTest : public ViewHostTest {
 protected:
  void SetUp() override {
    ViewHostTest::SetUp();
    a->BecomeTarget();
    log->Clear();
  }

  bool Key(KeyCode key, KeyModifiers modifiers = kKeyModifierNone, bool repeat = false) {
    return host.KeyDown(KeyEvent{key, modifiers, repeat});
  }
};

TEST_F(ViewHostKeyTest, KeysGoToTheTargetAndUpItsChain) {
  a->keys = {KeyCode::kLeft};
  root->keys = {KeyCode::kRight};
  EXPECT_TRUE(Key(KeyCode::kLeft));
  EXPECT_TRUE(Key(KeyCode::kRight));
  EXPECT_FALSE(Key(KeyCode::kUp));
  EXPECT_EQ(log->lines, (Lines{"A key Left", "root key Right"}));
}

TEST_F(ViewHostKeyTest, StandardEditKeysSendTheirCommands) {
  for (CommandID command : {kCommandClear, kCommandCut, kCommandCopy, kCommandPaste,
                            kCommandSelectAll, kCommandUndo, kCommandRedo}) {
    root->obeys.insert(command);
  }
  Key(KeyCode::kDelete);
  Key(KeyCode::kBackspace);
  Key(KeyCode::kX, kKeyModifierCtrl);
  Key(KeyCode::kC, kKeyModifierCtrl);
  Key(KeyCode::kV, kKeyModifierCtrl);
  Key(KeyCode::kA, kKeyModifierCtrl);
  Key(KeyCode::kZ, kKeyModifierCtrl);
  Key(KeyCode::kZ, kKeyModifierCtrl | kKeyModifierShift);
  EXPECT_EQ(log->lines, (Lines{"root command 57632", "root command 57632", "root command 57635",
                               "root command 57634", "root command 57637", "root command 57642",
                               "root command 57643", "root command 57644"}));
}

TEST_F(ViewHostKeyTest, AViewThatTakesTheKeyKeepsItFromTheShortcuts) {
  a->keys = {KeyCode::kBackspace};  // e.g. a text field
  root->obeys.insert(kCommandClear);
  Key(KeyCode::kBackspace);
  EXPECT_EQ(log->lines, (Lines{"A key Backspace"}));
}

TEST_F(ViewHostKeyTest, AShortcutForADisabledCommandIsSwallowed) {
  root->obeys.insert(kCommandCopy);
  a->statuses[kCommandCopy] = CommandStatus{};  // known, disabled
  EXPECT_TRUE(Key(KeyCode::kC, kKeyModifierCtrl));
  EXPECT_TRUE(log->lines.empty());
  a->statuses[kCommandCopy].enabled = true;
  Key(KeyCode::kC, kKeyModifierCtrl);
  EXPECT_EQ(log->lines, (Lines{"root command 57634"}));
}

TEST_F(ViewHostKeyTest, HeldKeysDoNotRepeatCommandsDeclaredSo) {
  CommandContext* context = shortcuts.AddContext("panel", "Panel");
  context->DeclareCommand("cmd.panel.play", 12052, 0, "", std::nullopt, false);
  shortcuts.BindKey("panel", KeyStroke(KeyCode::kSpace), 12052);
  shortcuts.SetActiveContext("panel");
  shortcuts.DeclareKeyRepeatsDisabledCommand(12052);
  root->obeys = {12052, kCommandClear};
  Key(KeyCode::kSpace);
  Key(KeyCode::kSpace, kKeyModifierNone, true);
  Key(KeyCode::kDelete, kKeyModifierNone, true);  // others repeat
  EXPECT_EQ(log->lines, (Lines{"root command 12052", "root command 57632"}));
}

TEST_F(ViewHostKeyTest, TheModifierStateFollowsTheInput) {
  host.MouseMove({5, 5}, kKeyModifierAlt | 0x100);
  EXPECT_EQ(GetAsyncKeyModifiers(), kKeyModifierAlt);
  Key(KeyCode::kA, kKeyModifierShift);
  EXPECT_EQ(GetAsyncKeyModifiers(), kKeyModifierShift);
}

TEST_F(ViewHostKeyTest, AModifierChangeRefreshesTheCursorUnderThePointer) {
  root->onSetCursor = [](RecordingView&, Point) {
    SetCurrentCursor(IsAltDown(GetAsyncKeyModifiers()) ? Cursor::kTLZoomOut : Cursor::kTLZoomIn);
    return true;
  };
  host.MouseMove({5, 5}, kKeyModifierNone);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kTLZoomIn);
  host.ModifiersChanged(kKeyModifierAlt);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kTLZoomOut);
}

TEST_F(ViewHostKeyTest, TypedTextGoesToTheTargetChain) {
  struct TextSink : SubView {
    std::string text;
    bool TextInputSelf(std::string_view utf8) override {
      text += utf8;
      return true;
    }
  };
  auto sink = std::make_shared<TextSink>();
  root->AddChild(sink);
  sink->BecomeTarget();
  EXPECT_TRUE(host.TextInput("Blur "));
  EXPECT_TRUE(host.TextInput("\xC3\xA9"));
  EXPECT_EQ(sink->text, "Blur \xC3\xA9");
  EXPECT_FALSE(host.TextInput(""));
}

}  // namespace
