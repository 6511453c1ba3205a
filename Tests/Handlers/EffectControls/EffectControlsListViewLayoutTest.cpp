#include <cstdlib>
#include <filesystem>
#include <set>

#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

using Strings = std::vector<std::string>;

constexpr const char* kBackgroundKey = "colors.effectscontrols.listview.background";
constexpr const char* kVSeparatorKey = "colors.effectscontrols.listview.Vseparator";

// Every pixel of the image, counted by colour.
std::set<std::uint32_t> Colours(const Image& image, const Rect& area) {
  std::set<std::uint32_t> colours;
  for (int y = area.top; y < area.bottom; ++y) {
    for (int x = area.left; x < area.right; ++x) {
      const Color c = image.GetPixel(x, y);
      colours.insert((std::uint32_t{c.r} << 16) | (std::uint32_t{c.g} << 8) | c.b);
    }
  }
  return colours;
}

std::uint32_t Packed(Color c) {
  return (std::uint32_t{c.r} << 16) | (std::uint32_t{c.g} << 8) | c.b;
}

class ListLayoutTest : public ListViewTest {
 protected:
  // A clip with several effects, all open: taller than a small window.
  TrackItemRef AddBusyClip() {
    return AddClip(
        v1, {Make(kMatchName_Motion), Make(kMatchName_Opacity), Make(kMatchName_GaussianBlur),
             Make(kMatchName_Crop), Make(kMatchName_Tint), Make(kMatchName_BrightnessContrast)});
  }
  TrackItemRef AddTwoPartClip() {
    const TrackItemRef picture = AddClip(v1, {Make(kMatchName_Opacity)});
    const TrackItemRef left = AddClip(a1, {Make(kMatchName_Volume), Make(kMatchName_Delay)});
    const TrackItemRef right = AddClip(a2, {Make(kMatchName_Volume)});
    right->SetPartOrderKey(1);
    for (const TrackItemRef& item : {picture, left, right}) {
      item->SetLinkGroup(9);
    }
    return picture;
  }
  int Width() const { return list->GetBounds().Width(); }
};

TEST_F(ListLayoutTest, EmptyListPaintsOnlyTheBackgroundAndTheSeparatorWhenShown) {
  Open({200, 120});
  host->Render();
  const Color background = ColorManager::GetColor(kBackgroundKey);
  EXPECT_EQ(Colours(host->GetImage(), Rect{0, 0, 200, 120}),
            (std::set<std::uint32_t>{Packed(background)}));
  EXPECT_TRUE(list->drawn.empty());
  EXPECT_TRUE(list->labels.empty());

  list->SetDoShowVerticalSeparator(true);
  host->Render();
  EXPECT_EQ(Colours(host->GetImage(), Rect{0, 0, 199, 120}),
            (std::set<std::uint32_t>{Packed(background)}));
  EXPECT_EQ(Colours(host->GetImage(), Rect{199, 0, 200, 120}),
            (std::set<std::uint32_t>{Packed(ColorManager::GetColor(kVSeparatorKey))}));
  EXPECT_TRUE(ColorManager::ReportedUnknownKeys().empty());
}

TEST_F(ListLayoutTest, RowsStackUnderTheSectionHeaderAndButtonsSitAtTheRightEdge) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  Open();
  Select({clip});
  const EffectItemList& rows = list->GetVideoItems();
  EXPECT_EQ(list->GetVideoHeaderTop(), EffectControlsListView::kInitialBaseline);
  EXPECT_EQ(rows.At(0)->GetTop(), EffectControlsListView::kSectionHeaderHeight);
  EXPECT_EQ(rows.At(1)->GetTop(), rows.At(0)->GetTop() + rows.At(0)->Height());
  EXPECT_EQ(rows.At(0)->GetWidth(), Width());
  EXPECT_EQ(list->GetVideoExpander()->GetBounds(), Rect::FromSize(Width() - 20, 3, 16, 16));
  // Headers, the rows and the margin.
  EXPECT_EQ(list->GetMaxHeight(), 21 + rows.At(0)->Height() + rows.At(1)->Height() + 2);
}

TEST_F(ListLayoutTest, ScrollingIsClampedToTheContent) {
  const TrackItemRef clip = AddBusyClip();
  FakeScroller scroller;
  list->SetEffectControlsView(&scroller);
  Open({300, 200});
  Select({clip});
  const int content = list->GetMaxHeight();
  ASSERT_GT(content, 200);
  EXPECT_EQ(scroller.contentHeight, content);
  EXPECT_EQ(scroller.visibleHeight, 200);

  // A bar position beyond the content comes back as content - visible.
  scroller.position = content + 500;
  list->UpdateVScrollBar();
  EXPECT_EQ(list->GetScrollOffset(), content - 200);
  EXPECT_EQ(scroller.position, content - 200);
  EXPECT_EQ(list->GetVideoHeaderTop(), -(content - 200));

  // A scroll message beyond either end is clamped as well.
  list->OnVScroll(ScrollCode::kThumbTrack, content * 3, 0);
  EXPECT_EQ(list->GetScrollOffset(), content - 200);
  list->OnVScroll(ScrollCode::kThumbTrack, -40, 0);
  EXPECT_EQ(list->GetScrollOffset(), 0);
  MessageRecorder keyframes;
  keyframes.Listen(list->GetKeyframeViewStation());
  BroadcastMessage("EffectControlsTest.List",
                   ScrollVerticalMessage(ScrollCode::kThumbTrack, 30, 0));
  EXPECT_EQ(list->GetScrollOffset(), 30);
  EXPECT_EQ(list->GetVideoHeaderTop(), -30);
  EXPECT_EQ(keyframes.Count("EffectControlsRefreshKeyframesMessage"), 1);
  list->OnVScroll(ScrollCode::kThumbTrack, 30, 0);  // no change, no message
  EXPECT_EQ(keyframes.Count("EffectControlsRefreshKeyframesMessage"), 1);

  // Content shorter than the view forces the offset to 0.
  host->Resize({300, content + 100});
  scroller.position = 70;
  list->UpdateVScrollBar();
  EXPECT_EQ(list->GetScrollOffset(), 0);
  EXPECT_EQ(scroller.position, 0);
  list->SetEffectControlsView(nullptr);
}

TEST_F(ListLayoutTest, CollapsedSectionTakesNoHeightAndItsRowsAreHidden) {
  const TrackItemRef clip = AddTwoPartClip();
  Open();
  Select({clip});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 2);
  AudioPartInfo& first = *list->GetAudioParts()[0];
  AudioPartInfo& second = *list->GetAudioParts()[1];
  const int before = list->GetMaxHeight();
  const int firstRows = first.GetItems().TotalHeight();
  ASSERT_GT(firstRows, 0);
  EXPECT_EQ(second.GetHeaderTop(), first.GetHeaderTop() + 21 + firstRows);

  ASSERT_TRUE(list->ObeyCommand(EffectControlsListView::kAudioExpanderCommand));
  EXPECT_FALSE(first.IsExpanded());
  EXPECT_EQ(first.GetExpanderButton()->GetValue(), 1);
  // The header stays; the rows sit at its bottom and take no height.
  EXPECT_GE(first.GetHeaderTop(), 0);
  EXPECT_EQ(first.GetItems().At(0)->GetTop(), first.GetHeaderTop() + 21);
  EXPECT_EQ(second.GetHeaderTop(), first.GetHeaderTop() + 21);
  EXPECT_FALSE(first.GetItems().At(0)->IsShown());
  EXPECT_EQ(list->GetMaxHeight(), before - firstRows);

  list->OnAudioExpander(EffectControlsListView::kAudioExpanderCommand);
  EXPECT_TRUE(first.GetItems().At(0)->IsShown());
  EXPECT_EQ(list->GetMaxHeight(), before);

  // The video section's expander works the same way.
  const int videoRows = list->GetVideoItems().TotalHeight();
  list->OnVideoExpander();
  EXPECT_FALSE(list->IsVideoExpanded());
  EXPECT_EQ(list->GetVideoExpander()->GetValue(), 1);
  EXPECT_EQ(first.GetHeaderTop(), list->GetVideoHeaderTop() + 21);
  EXPECT_EQ(list->GetMaxHeight(), before - videoRows);
}

TEST_F(ListLayoutTest, AudioPartHeadersAreNumberedOnlyWhenThereAreSeveral) {
  Open();
  Select({AddTwoPartClip()});
  list->labels.clear();
  host->Render();
  EXPECT_EQ(list->labels, (Strings{"Video", "Audio 1", "Audio 2"}));

  const TrackItemRef lone = AddClip(a3, {Make(kMatchName_Volume)}, 30 * kSecond, 35 * kSecond);
  Select({lone});
  list->labels.clear();
  host->InvalidateAll();
  host->Render();
  EXPECT_EQ(list->labels, (Strings{"Audio"}));
}

TEST_F(ListLayoutTest, TransitionTargetDrawsNoSectionHeaders) {
  TransitionData data;
  data.displayName = "Cross Dissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 6 * kSecond, 7 * kSecond, data);
  v1->AddItem(transition);
  Open();
  Select({transition});
  host->Render();
  for (const std::string& label : list->labels) {
    EXPECT_EQ(label, "");
  }
  EXPECT_EQ(list->GetVideoHeaderTop(), -1);
  EXPECT_EQ(list->GetVideoItems().At(0)->GetTop(), EffectControlsListView::kInitialBaseline);
  EXPECT_EQ(list->GetMaxHeight(), list->GetVideoItems().At(0)->Height() + 2);
}

TEST_F(ListLayoutTest, PaintingSkipsRowsAboveTheViewAndStopsBelowIt) {
  const TrackItemRef clip = AddBusyClip();
  Open({300, 160});
  Select({clip});
  int total = 0;
  list->GetVideoItems().ForEachRow([&total](const auto&) {
    ++total;
    return true;
  });
  list->drawn.clear();
  host->Render();
  ASSERT_FALSE(list->drawn.empty());
  EXPECT_LT(static_cast<int>(list->drawn.size()), total / 2);
  for (const EffectItem* row : list->drawn) {
    EXPECT_LT(row->GetTop(), 160);
    EXPECT_GT(row->GetTop() + row->Height(), 0);
  }

  // Scrolled to the middle: nothing above the view is drawn either.
  list->OnVScroll(ScrollCode::kThumbTrack, 300, 0);
  list->drawn.clear();
  host->InvalidateAll();
  host->Render();
  ASSERT_FALSE(list->drawn.empty());
  for (const EffectItem* row : list->drawn) {
    EXPECT_LT(row->GetTop(), 160);
    EXPECT_GT(row->GetTop() + row->OwnHeight(), 0) << row->GetName();
  }
}

TEST_F(ListLayoutTest, DisclosureChangeMovesTheRowsBelowAndAnnouncesIt) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  Open();
  Select({clip});
  MessageRecorder own;
  MessageRecorder keyframes;
  own.Listen(list->GetOwnStation());
  keyframes.Listen(list->GetKeyframeViewStation());
  const auto& rows = list->GetVideoItems();
  const int opacityHeight = rows.At(0)->Height();
  rows.At(0)->SetIsExpanded(false);
  rows.At(0)->OnDisclosureStateChanged();
  EXPECT_EQ(rows.At(1)->GetTop(), rows.At(0)->GetTop() + EffectItem::kFolderTitleHeight);
  EXPECT_LT(rows.At(0)->Height(), opacityHeight);
  EXPECT_GE(own.Count("EffectControlsListChangedMessage"), 1);
  EXPECT_GE(keyframes.Count("EffectControlsRefreshKeyframesMessage"), 1);

  BroadcastMessage(list->GetOwnStation(), DisclosureStateAllChanged(false));
  for (const auto& row : rows) {
    EXPECT_FALSE(row->IsExpanded());
  }
  EXPECT_EQ(list->GetMaxHeight(), 21 + 2 * EffectItem::kFolderTitleHeight + 2);
}

TEST_F(ListLayoutTest, TheZoomSettersWriteTheTimelineTheRowsAndKeyframeAreaRead) {
  // The refusals and the pixel frame rate are the timeline's (PanelTimelineTest).
  EXPECT_TRUE(list->SetTimePerPixel(0.5));
  EXPECT_FALSE(list->SetTimePerPixel(0.5));
  EXPECT_FALSE(list->SetTimePerPixel(0.0));
  EXPECT_DOUBLE_EQ(list->GetTimeline().GetSecondsPerPixel(), 0.5);
  EXPECT_EQ(list->GetPixelFrameRate().GetTicksPerFrame(), kTicksPerSecond / 2);

  EXPECT_TRUE(list->SetVisibleKeyframeTime(5 * kSecond));
  EXPECT_FALSE(list->SetVisibleKeyframeTime(5 * kSecond));
  EXPECT_EQ(list->GetTimeline().GetVisibleStart(), 5 * kSecond);
}

TEST_F(ListLayoutTest, SelectedEffectTitleIsFilledWithTheSelectionColour) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  Open({300, 200});
  Select({clip});
  const auto& row = list->GetVideoItems().At(0);
  const Color selected = ColorManager::GetColor("colors.effectscontrols.listview.selected");
  host->Render();
  const int x = row->GetTitleLeft() + 1;
  const int y = row->GetTop() + 2;
  EXPECT_NE(Packed(host->GetImage().GetPixel(x, y)), Packed(selected));
  list->SelectItem(row, true);
  list->Invalidate();
  host->Render();
  EXPECT_EQ(Packed(host->GetImage().GetPixel(x, y)), Packed(selected));
  // The fill stops short of the row's buttons.
  EXPECT_NE(Packed(host->GetImage().GetPixel(300 - 54 + 1, y)), Packed(selected));
}

// Writes a picture of a built list for a person to look at (EC_LIST_PNG=path).
TEST_F(ListLayoutTest, RendersABuiltListToPng) {
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({Make(kMatchName_Mask)});
  const TrackItemRef picture =
      AddClip(v1, {Make(kMatchName_Motion), Make(kMatchName_Opacity),
                   Make(kMatchName_TimeRemapping), blur, Make(kMatchName_Timecode)});
  const TrackItemRef left = AddClip(a1, {Make(kMatchName_Volume), Make(kMatchName_Delay)});
  const TrackItemRef right = AddClip(a2, {Make(kMatchName_Volume)});
  right->SetPartOrderKey(1);
  for (const TrackItemRef& item : {picture, left, right}) {
    item->SetLinkGroup(5);
  }
  list->SetDoShowVerticalSeparator(true);
  Open({420, 900});
  Select({picture});
  list->SelectItem(list->GetVideoItems().At(1), true);
  list->GetVideoItems().At(0)->SetIsExpanded(false);
  list->OnDisclosureStateChanged();
  host->Render();
  const char* path = std::getenv("EC_LIST_PNG");
  const std::string out =
      path != nullptr
          ? path
          : (std::filesystem::temp_directory_path() / "effect-controls-list.png").string();
  std::string error;
  EXPECT_TRUE(host->GetImage().SavePNG(out, &error)) << error;
  EXPECT_TRUE(ColorManager::ReportedUnknownKeys().empty());
}

}  // namespace

namespace {

TEST_F(ListLayoutTest, TheTextExpanderIsMadeHiddenUnlessTheStyleLeavesItOut) {
  Open();
  ASSERT_NE(list->GetTextExpander(), nullptr);
  EXPECT_FALSE(list->GetTextExpander()->IsVisible());
  EXPECT_FALSE(list->IsTextExpanded());

  list->Destroy();
  host.reset();
  list = std::make_shared<CountingListView>(nullptr, "EffectControlsTest.Styled");
  list->SetStyle(kStyleNoXOTextExpander);
  Open();
  EXPECT_EQ(list->GetTextExpander(), nullptr);
  EXPECT_NE(list->GetVideoExpander(), nullptr);
}

TEST_F(ListLayoutTest, TheWideNameStyleMovesASelectedParametersNameBand) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Crop)});
  Open({400, 200});
  Select({clip});
  const std::shared_ptr<EffectItem> param = list->GetVideoItems().At(0)->GetItems().front();
  list->SelectParameter(param, true);
  const Color selected = ColorManager::GetColor("colors.effectscontrols.listview.selected");
  const int y = param->GetTop() + param->OwnHeight() - 4;
  auto isSelected = [&](int x) {
    return Packed(host->GetImage().GetPixel(x, y)) == Packed(selected);
  };
  host->InvalidateAll();
  host->Render();
  const int titleLeft = param->GetTitleLeft();
  const int indent = param->GetParameterIndentInPixels();
  // The name band runs from the title to 20 px before the middle.
  EXPECT_FALSE(isSelected(12));
  EXPECT_TRUE(isSelected(titleLeft + 1));
  EXPECT_TRUE(isSelected(400 / 2 - 20 + indent - 1));
  EXPECT_FALSE(isSelected(400 / 2 - 20 + indent + 1));

  list->SetStyle(kStyleWideParameterNames);
  host->InvalidateAll();
  host->Render();
  // From 10 px to three quarters of the width, less 30.
  EXPECT_FALSE(isSelected(9));
  EXPECT_TRUE(isSelected(11));
  EXPECT_TRUE(isSelected(400 * 3 / 4 + indent - 30 - 1));
  EXPECT_FALSE(isSelected(400 * 3 / 4 + indent - 30 + 1));
}

}  // namespace
