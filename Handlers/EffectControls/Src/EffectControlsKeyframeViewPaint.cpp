#include <algorithm>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/ImageList.h"

namespace {

// The panel's colour when its set is registered, else the toolkit's.
Color PanelColor(std::string_view key, std::string_view fallback) {
  return ColorManager::HasColor(key) ? ColorManager::GetColor(key)
                                     : ColorManager::GetColor(fallback);
}

Color WithAlpha(Color color, std::uint8_t alpha) {
  color.a = alpha;
  return color;
}

constexpr int kZeroHandleWidth = 5;
constexpr int kZeroHandleHeight = 15;
constexpr int kZeroHandleInset = 3;
constexpr std::uint8_t kRegionAlpha = 50;
constexpr std::uint8_t kZeroHandleAlpha = 144;
constexpr int kNameLeftInset = 4;
constexpr int kNameRightInset = 2;

}  // namespace

void EffectControlsKeyframeView::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_WindowBackground));
  const auto list = mList.lock();
  if (!list || !mTimeline || !(GetSecondsPerPixel() > 0.0)) {
    return;
  }
  const TrackItemRef clip = GetClip();
  const bool transitionOnly = list->GetTargetKind() == EffectControlsListView::kTargetTransition;
  if (clip && !transitionOnly) {
    // The clip's own span shows the area's working background, under the guide.
    const int start = std::max(0, TimeToX(clip->GetStart()));
    const int end = std::min(bounds.right, TimeToX(clip->GetEnd()));
    if (end > start) {
      dc.FillRect(
          Rect{start, 0, end, bounds.bottom},
          PanelColor("colors.effectscontrols.keyframeview.background", kColor_ContentBackground));
    }
  }
  if (HasDragGuide()) {
    dc.FillRect(
        Rect{mGuideX, 0, mGuideX + 1, bounds.bottom},
        ColorManager::GetColor(mGuideSnapped ? kColor_ReversibleBlack : kColor_ReversibleWhite));
  }
  if (clip && !transitionOnly) {
    PaintBands(dc, *clip,
               list->GetTargetKind() == EffectControlsListView::kTargetTransitionComponent);
    const std::optional<int> barTop = GetClipBarTop();
    if (barTop) {
      PaintClipBar(dc, *clip, *barTop);
    }
    PaintIntroOutro(dc, *clip, barTop);
  }
  const std::vector<Section> sections = CollectSections(true);
  for (const Section& section : sections) {
    PaintSection(dc, section);
  }
  for (const Section& section : sections) {
    PaintCurrentTime(dc, section);
  }
  PaintMarquee(dc);
}

void EffectControlsKeyframeView::PaintBands(DC& dc, const TrackItem& clip, bool onlyNoClip) const {
  const Rect bounds = GetLocalBounds();
  const Color noClip =
      PanelColor("colors.effectscontrols.keyframeview.noclipband", kColor_WindowBackground);
  const Color trim =
      PanelColor("colors.effectscontrols.keyframeview.trimband", kColor_ControlBackground);
  const int mediaStart = TimeToX(clip.GetMediaStartInSequence());
  const int start = TimeToX(clip.GetStart());
  const int end = TimeToX(clip.GetEnd());
  const int mediaEnd = TimeToX(clip.GetMediaEndInSequence());
  const auto band = [&](int from, int to, Color color) {
    if (to > from) {
      dc.FillRect(Rect{from, 0, to, bounds.bottom}, color);
    }
  };
  if (onlyNoClip) {
    band(0, start, noClip);
    band(end, bounds.right, noClip);
    return;
  }
  band(0, mediaStart, noClip);
  band(std::max(0, mediaStart), start, trim);
  band(end, std::min(mediaEnd, bounds.right), trim);
  band(std::max(end, mediaEnd), bounds.right, noClip);
}

std::optional<int> EffectControlsKeyframeView::GetClipBarTop() const {
  const auto list = mList.lock();
  if (!list) {
    return std::nullopt;
  }
  const std::vector<Section> sections = CollectSections(false);
  if (sections.empty()) {
    return std::nullopt;
  }
  const int barBottom = sections.front().top;
  if (barBottom <= 0) {
    return std::nullopt;
  }
  return barBottom - kClipBarHeight;
}

void EffectControlsKeyframeView::PaintClipBar(DC& dc, const TrackItem& clip, int barTop) const {
  const Rect bounds = GetLocalBounds();
  const Rect bar{0, barTop, bounds.right, barTop + kClipBarHeight};
  const Color label = Color::FromRGB(clip.GetLabelColor());
  const int left = std::max(
      0, TimeToX(clip.HasHeadMaterial() ? clip.GetMediaStartInSequence() : clip.GetStart()));
  const int right = std::min(
      bounds.right, TimeToX(clip.HasTailMaterial() ? clip.GetMediaEndInSequence() : clip.GetEnd()));
  if (right > left) {
    dc.FillRect(Rect{left, bar.top, right, bar.bottom}, label);
  }
  const int start = TimeToX(clip.GetStart());
  const int end = TimeToX(clip.GetEnd());
  // The marks tell where the media runs out at the clip's own edges.
  if (!clip.HasHeadMaterial()) {
    dc.DrawBitmap(*Bitmap::GetBitmap(kNoHeadMaterialDecal), Point{start, bar.top});
  }
  if (!clip.HasTailMaterial()) {
    const auto& tail = *Bitmap::GetBitmap(kNoTailMaterialDecal);
    dc.DrawBitmap(tail, Point{end + 1 - tail.GetSize().width, bar.top});
  }
  const Font font(kFont_Normal);
  const int textTop = bar.top + std::max(0, (kClipBarHeight - font.GetHeight()) / 2);
  const Rect nameRect{std::max(0, start) + kNameLeftInset, textTop,
                      std::min(bounds.right, end) - kNameRightInset, bar.bottom};
  if (nameRect.right > nameRect.left) {
    const DC::ScopedClip clipToBar(dc, bar);
    dc.DrawText(clip.GetName(), nameRect, font, ColorManager::GetColor(kColor_ControlText));
  }
}

void EffectControlsKeyframeView::PaintIntroOutro(DC& dc, const TrackItem& clip,
                                                 std::optional<int> barTop) const {
  if (!clip.IsGraphicsClip()) {
    return;
  }
  const Rect bounds = GetLocalBounds();
  const Color focus = ColorManager::GetColor(kColor_Focus);
  const bool handles = barTop.has_value() && !clip.AreIntroOutroLocked();
  const int top = barTop.value_or(0);
  const TickTime intro = GetShownIntroDuration();
  const TickTime outro = GetShownOutroDuration();
  const int start = TimeToX(clip.GetStart());
  const int end = TimeToX(clip.GetEnd());
  if (intro > 0) {
    const int introEnd = TimeToX(AddTimes(clip.GetStart(), intro));
    dc.FillRect(Rect{start, 0, introEnd, bounds.bottom}, WithAlpha(focus, kRegionAlpha));
    if (handles) {
      dc.FillRect(Rect{introEnd - 1, top, introEnd, top + kClipBarHeight}, focus);
    }
  } else if (handles) {
    dc.FillRect(Rect::FromSize(start, top + kZeroHandleInset, kZeroHandleWidth, kZeroHandleHeight),
                WithAlpha(focus, kZeroHandleAlpha));
  }
  if (outro > 0) {
    const int outroStart = TimeToX(SubtractTimes(clip.GetEnd(), outro));
    dc.FillRect(Rect{outroStart, 0, end, bounds.bottom}, WithAlpha(focus, kRegionAlpha));
    if (handles) {
      dc.FillRect(Rect{outroStart, top, outroStart + 1, top + kClipBarHeight}, focus);
    }
  } else if (handles) {
    dc.FillRect(Rect::FromSize(end - kZeroHandleWidth, top + kZeroHandleInset, kZeroHandleWidth,
                               kZeroHandleHeight),
                WithAlpha(focus, kZeroHandleAlpha));
  }
}

void EffectControlsKeyframeView::PaintSection(DC& dc, const Section& section) {
  const Rect bounds = GetLocalBounds();
  const Color separator =
      PanelColor("colors.effectscontrols.keyframeview.Hseparator", kColor_ListBoxContentDivider);
  dc.FillRect(Rect{0, section.top - 1, bounds.right, section.top}, separator);
  for (const Track& track : section.tracks) {
    const EffectItem& row = *track.row;
    if (row.GetBottom() < 0) {
      continue;
    }
    dc.FillRect(
        Rect{0, row.GetTop() + row.OwnHeight() - 1, bounds.right, row.GetTop() + row.OwnHeight()},
        separator);
    if (IsKeyframeTrack(track)) {
      PaintTrack(dc, track);
    } else if (row.IsFilter() && !row.IsExpanded()) {
      PaintSummaryTrack(dc, track);
    }
  }
}

void EffectControlsKeyframeView::PaintTrack(DC& dc, const Track& track) {
  if (!mKeyframesVisible) {
    return;
  }
  ParameterControl& row = *track.param;
  const Rect bounds = GetLocalBounds();
  const Color separator =
      PanelColor("colors.effectscontrols.keyframeview.Hseparator", kColor_ListBoxContentDivider);
  const int top = row.GetTop();
  dc.FillRect(Rect{0, top + ParameterControl::kKeyframeStripHeight, bounds.right,
                   top + ParameterControl::kKeyframeStripHeight + 1},
              separator);
  const Rect rowRect{0, top, bounds.right, row.GetBottom()};
  const DC::ScopedClip clip(dc, rowRect);
  row.SetKeyframeViewer(this);
  std::set<TickTime> selected;
  if (const auto selection = GetSelection()) {
    if (const KeyframeSelection* keys = selection->Find(row.GetParam().get())) {
      selected = keys->GetTimes();
    }
  }
  row.DrawKeyframes(dc, rowRect, GetVisibleStartTime(), mTimeline->GetPixelFrameRate(), selected);
  if (row.IsExpanded() && row.HasGraphs()) {
    row.DisplayGraph(dc, rowRect, GetVisibleStartTime(), GetSecondsPerPixel(), mPinned);
  }
}

void EffectControlsKeyframeView::PaintSummaryTrack(DC& dc, const Track& track) const {
  if (!mKeyframesVisible) {
    return;
  }
  std::set<TickTime> times;
  track.row->GetKeyframeTimes(times, TimeLine::kSequence);
  const auto images = ParameterControl::GetKeyframeImageList();
  if (!images || images->GetCount() == 0) {
    return;
  }
  const int centreY = track.row->GetTop() + track.row->OwnHeight() / 2;
  const int width = GetLocalBounds().Width();
  for (const TickTime time : times) {
    const int x = TimeToX(time);
    if (x < -16 || x > width + 16) {
      continue;
    }
    images->Draw(dc, 0, Point{x - 7, centreY - 8});
  }
}

void EffectControlsKeyframeView::PaintCurrentTime(DC& dc, const Section& section) const {
  const int x = TimeToX(GetEditTime());
  const Rect bounds = GetLocalBounds();
  if (x < 0 || x >= bounds.right) {
    return;
  }
  dc.FillRect(Rect{x, std::max(0, section.top), x + 1, std::min(bounds.bottom, section.bottom)},
              ColorManager::GetColor(kColor_InteractiveControl));
}

void EffectControlsKeyframeView::PaintMarquee(DC& dc) const {
  if (mGesture != Gesture::kMarquee) {
    return;
  }
  const Rect bounds = GetLocalBounds();
  const Rect full = GetMarqueeRect();
  const Rect shown{std::max(full.left, bounds.left), std::max(full.top, bounds.top),
                   std::min(full.right, bounds.right - 1),
                   std::min(full.bottom, bounds.bottom - 1)};
  if (shown.right < shown.left || shown.bottom < shown.top) {
    return;
  }
  const Color color =
      PanelColor("colors.effectscontrols.control.point.connector", kColor_ReversibleBlack);
  // An edge clipped away is not drawn: the rectangle goes on beyond the area.
  if (full.top >= bounds.top) {
    dc.FillRect(Rect{shown.left, shown.top, shown.right + 1, shown.top + 1}, color);
  }
  if (full.bottom <= bounds.bottom - 1) {
    dc.FillRect(Rect{shown.left, shown.bottom, shown.right + 1, shown.bottom + 1}, color);
  }
  if (full.left >= bounds.left) {
    dc.FillRect(Rect{shown.left, shown.top, shown.left + 1, shown.bottom + 1}, color);
  }
  if (full.right <= bounds.right - 1) {
    dc.FillRect(Rect{shown.right, shown.top, shown.right + 1, shown.bottom + 1}, color);
  }
}

Rect EffectControlsKeyframeView::GetMarqueeRect() const {
  if (mGesture != Gesture::kMarquee) {
    return {};
  }
  return Rect{
      std::min(mMarqueeAnchor.x, mMarqueePoint.x), std::min(mMarqueeAnchor.y, mMarqueePoint.y),
      std::max(mMarqueeAnchor.x, mMarqueePoint.x), std::max(mMarqueeAnchor.y, mMarqueePoint.y)};
}
