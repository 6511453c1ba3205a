#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectFile.h"
#include "Host/Model/Sequence.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/ScrollBar.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ViewHost.h"
#include "Host/Toolkit/ZoomBar.h"

namespace {

std::string ReadFile(const std::string& path) {
  std::ifstream in(path);
  std::stringstream text;
  text << in.rdbuf();
  return text.str();
}

int Distance(Color a, Color b) {
  return std::abs(a.r - b.r) + std::abs(a.g - b.g) + std::abs(a.b - b.b);
}

// Pixels in `rect` (window coordinates) whose colour is within `tolerance` of `color`.
int CountNear(const Image& image, const Rect& rect, Color color, int tolerance) {
  int count = 0;
  for (int y = rect.top; y < rect.bottom; ++y) {
    for (int x = rect.left; x < rect.right; ++x) {
      count += Distance(image.GetPixel(x, y), color) <= tolerance ? 1 : 0;
    }
  }
  return count;
}

// Pixels in `rect` that differ from `color` by more than `tolerance`.
int CountAway(const Image& image, const Rect& rect, Color color, int tolerance) {
  return rect.Width() * rect.Height() - CountNear(image, rect, color, tolerance);
}

// The panel alone in a window, on the demo project (its active sequence has Beach.mov selected).
class PanelPicture : public ::testing::Test {
 protected:
  static constexpr Size kSize{1000, 560};

  void SetUp() override {
    ColorManager::ResetForTesting();
    ColorManager::RegisterColorSet(
        "EFFECTCONTROLSCOLORS",
        ReadFile("Handlers/EffectControls/Resources/EffectControlsColors.txt"));
    const std::string json = ReadFile("examples/demo.json");
    ASSERT_FALSE(json.empty()) << "examples/demo.json not found from "
                               << std::filesystem::current_path();
    ProjectLoadResult loaded = ProjectFile::LoadFromString(json);
    ASSERT_TRUE(loaded) << loaded.error;
    project = loaded.project;
    view = std::make_shared<EffectControlsView>(nullptr, "effectcontrols");
    view->Create("effectcontrols", "Effect Controls", nullptr, true);
    host = std::make_unique<ViewHost>(kSize);
    host->SetRootView(view);
    view->SetBounds(Rect::FromSize(0, 0, kSize.width, kSize.height));
    view->OnSequenceActivated(project->GetActiveSequence());
    host->InvalidateAll();
    host->Render();
    if (const char* dir = std::getenv("EC_PICTURE_OUT")) {
      host->GetImage().SavePNG(std::string(dir) + "/panel.png");
    }
  }

  void TearDown() override {
    if (view) {
      view->Destroy();
    }
    host.reset();
    view.reset();
    ColorManager::ResetForTesting();
  }

  Rect InWindow(const ViewBase& child) const { return child.LocalToWindow(child.GetLocalBounds()); }

  MessagingTestScope scope;
  ProjectRef project;
  std::shared_ptr<EffectControlsView> view;
  std::unique_ptr<ViewHost> host;
};

TEST_F(PanelPicture, TheDemoOpensOnTheSelectedClip) {
  EXPECT_EQ(view->GetTargetMode(), EffectControlsView::kTargetClip);
  EXPECT_NE(view->GetHeader()->GetDisplayText().find("Beach.mov"), std::string::npos);
  EXPECT_TRUE(view->GetTimeRuler()->IsEnabled());
}

TEST_F(PanelPicture, TheHeaderShowsText) {
  const Image& image = host->GetImage();
  const Rect header = InWindow(*view->GetHeader());
  const Rect text{header.left + 10, header.top + 14, header.right - 24, header.bottom - 2};
  const Color background = ColorManager::GetColor(kColor_WindowBackground);
  // Glyphs: a fair number of pixels well away from the background, in the text colour's
  // direction (lighter on the dark theme).
  EXPECT_GT(CountAway(image, text, background, 120), 40);
}

TEST_F(PanelPicture, TheListShowsRowsWithSeparatorsAndText) {
  const Image& image = host->GetImage();
  const Rect list = InWindow(*view->GetListView());
  const Rect rows{list.left, list.top, list.right, std::min(list.bottom, list.top + 200)};
  // More than one colour and many edge pixels: separators and titles, not a flat fill.
  const Color first = image.GetPixel(rows.left + 2, rows.bottom - 2);
  EXPECT_GT(CountAway(image, rows, first, 60), rows.Width() * 4);
  int rowsWithLongLines = 0;
  for (int y = rows.top; y < rows.bottom; ++y) {
    const Color left = image.GetPixel(rows.left + 40, y);
    const Color above = image.GetPixel(rows.left + 40, std::max(rows.top, y - 1));
    if (Distance(left, above) > 12 &&
        CountNear(image, Rect{rows.left + 40, y, rows.right - 40, y + 1}, left, 12) >
            (rows.Width() - 80) * 8 / 10) {
      ++rowsWithLongLines;
    }
  }
  EXPECT_GE(rowsWithLongLines, 2) << "row separators across the list";
}

TEST_F(PanelPicture, TheRulerDiffersFromTheBackground) {
  const Image& image = host->GetImage();
  const Rect ruler = InWindow(*view->GetTimeRuler());
  const Color background = ColorManager::GetColor(kColor_WindowBackground);
  EXPECT_GT(CountAway(image, ruler, background, 10), ruler.Width() * ruler.Height() / 2);
  // Tick marks and numbers in the tick colour.
  EXPECT_GT(CountNear(image, ruler, ColorManager::GetColor(kColor_TimeRulerTicks), 60), 50);
}

TEST_F(PanelPicture, TheKeyframeAreaShowsItsBackgroundOverTheClip) {
  const Image& image = host->GetImage();
  const Rect area = InWindow(*view->GetKeyframeView());
  const Color background = ColorManager::GetColor("colors.effectscontrols.keyframeview.background");
  EXPECT_GT(CountNear(image, area, background, 8), area.Width() * area.Height() / 4);
}

TEST_F(PanelPicture, TheZoomBarScrollBarAndBottomBarSitWhereThePanelPutsThem) {
  const Image& image = host->GetImage();
  const Rect zoomBar = InWindow(*view->GetZoomBar());
  const Rect ruler = InWindow(*view->GetTimeRuler());
  const Rect scrollBar = InWindow(*view->GetScrollBar());
  const Rect keyframes = InWindow(*view->GetKeyframeView());
  // The zoom bar sits on top of the ruler, both over the keyframe area.
  EXPECT_EQ(zoomBar.bottom, ruler.top);
  EXPECT_EQ(zoomBar.left, keyframes.left);
  EXPECT_EQ(ruler.bottom, keyframes.top);
  EXPECT_EQ(ruler.Width(), keyframes.Width());
  // The scroll bar runs down the right edge, beside the keyframe area's 4 px gap.
  EXPECT_EQ(scrollBar.right, kSize.width);
  EXPECT_EQ(scrollBar.left, keyframes.right + EffectControlsView::kSeparatorGap);
  // The scroll bar and the zoom bar's thumb are drawn, not left as background.
  const Color background = ColorManager::GetColor(kColor_WindowBackground);
  EXPECT_GT(CountAway(image, scrollBar, background, 10), scrollBar.Height());
  const Rect thumb = view->GetZoomBar()->LocalToWindow(view->GetZoomBar()->GetThumbRect());
  EXPECT_FALSE(thumb.IsEmpty());
  EXPECT_GT(CountAway(image, thumb, background, 10), thumb.Width());
  // The current-time field shows its timecode at the bottom left.
  const Rect timecode = InWindow(*view->GetTimecodeControl());
  EXPECT_EQ(timecode.left, 5);
  EXPECT_GT(CountAway(image, timecode, background, 100), 30);
  // A crisp 1 px line separates the list from the keyframe area: one colour down the column
  // left of the area, unlike the area's own first column.
  const int x = keyframes.left - 1;
  const Rect column{x, keyframes.top, x + 1, keyframes.bottom};
  const Color line = image.GetPixel(x, keyframes.top + keyframes.Height() / 2);
  EXPECT_GT(CountNear(image, column, line, 6), keyframes.Height() * 9 / 10);
  EXPECT_LT(CountNear(image, Rect{x + 1, keyframes.top, x + 2, keyframes.bottom}, line, 6),
            keyframes.Height() / 2);
}

}  // namespace
