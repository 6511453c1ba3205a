// Painting the effect list: background, section headers, effect rows and parameter rows. The
// rows' controls are child views and paint themselves afterwards.
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/Component.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

namespace {

constexpr const char* kColorBackground = "colors.effectscontrols.listview.background";
constexpr const char* kColorRemoveable = "colors.effectscontrols.listview.removeable";
constexpr const char* kColorNonRemoveable = "colors.effectscontrols.listview.nonremoveable";
constexpr const char* kColorHSeparator = "colors.effectscontrols.listview.Hseparator";
constexpr const char* kColorVSeparator = "colors.effectscontrols.listview.Vseparator";
constexpr const char* kColorExpander = "colors.effectscontrols.listview.expander";
constexpr const char* kColorSelected = "colors.effectscontrols.listview.selected";

constexpr const char* kLabelVideo = "$$$/Vantile/Handlers/EffectControls/Video=Video";
constexpr const char* kLabelAudio = "$$$/Vantile/Handlers/EffectControls/Audio=Audio";
constexpr const char* kLabelGraphics = "$$$/Vantile/Handlers/EffectControls/Graphic=Graphics";
constexpr const char* kLabelMasterGraphics =
    "$$$/Vantile/Handlers/EffectControls/MasterGraphics=Master Graphics";

// Where a header's label and a row's name sit.
constexpr int kHeaderLabelLeft = 7;
constexpr int kHeaderLabelTop = 4;
constexpr int kHeaderLabelHeight = 17;
constexpr int kNameInset = 2;
constexpr int kNameTop = 4;

void DrawHLine(DC& dc, int left, int right, int y, Color color) {
  dc.FillRect(Rect{left, y, right, y + 1}, color);
}

// Fills `area` except where `holes` lie.
void FillExcept(DC& dc, const Rect& area, const std::vector<Rect>& holes, std::size_t first,
                Color color) {
  if (area.IsEmpty()) {
    return;
  }
  for (std::size_t i = first; i < holes.size(); ++i) {
    const Rect hole = holes[i].Intersect(area);
    if (hole.IsEmpty()) {
      continue;
    }
    FillExcept(dc, Rect{area.left, area.top, area.right, hole.top}, holes, i + 1, color);
    FillExcept(dc, Rect{area.left, hole.bottom, area.right, area.bottom}, holes, i + 1, color);
    FillExcept(dc, Rect{area.left, hole.top, hole.left, hole.bottom}, holes, i + 1, color);
    FillExcept(dc, Rect{hole.right, hole.top, area.right, hole.bottom}, holes, i + 1, color);
    return;
  }
  dc.FillRect(area, color);
}

}  // namespace

void EffectControlsListView::PaintSelf(DC& dc) {
  PaintBackground(dc);
  const bool empty = mVideoItems.IsEmpty() && mGraphicsItems.IsEmpty() && mAudioParts.empty();
  if (!empty && (mTarget.kind == kTargetClip || mTarget.kind == kTargetTransitionComponent)) {
    if (!mGraphicsItems.IsEmpty()) {
      DrawItemList(dc, mGraphicsItems, mGraphicsHeaderTop,
                   LocalizeString(mMasterGraphicChain ? kLabelMasterGraphics : kLabelGraphics),
                   mGraphicsExpanded, 0);
    }
    const std::string videoLabel =
        mTarget.transitionChain ? std::string() : LocalizeString(kLabelVideo);
    if (!mVideoItems.IsEmpty()) {
      DrawItemList(dc, mVideoItems, mVideoHeaderTop, videoLabel,
                   mVideoExpanded || mTarget.transitionChain != nullptr, 0);
    }
    const std::string audioLabel = LocalizeString(kLabelAudio);
    const int width = GetBounds().Width();
    int number = 1;
    for (const auto& part : mAudioParts) {
      if (part->IsClipPart() && part->GetHeaderTop() >= 0) {
        DrawHLine(dc, 0, width, part->GetHeaderTop() - 1, ColorManager::GetColor(kColorHSeparator));
        const std::string label =
            mAudioParts.size() > 1 ? audioLabel + " " + std::to_string(number) : audioLabel;
        DrawItemList(dc, part->GetItems(), part->GetHeaderTop(), label, part->IsExpanded(), 0);
      } else {
        DrawItemList(dc, part->GetItems(), -1, std::string(), true, 0);
      }
      ++number;
    }
  } else if (!empty) {
    // A transition: its rows paint themselves, without section headers.
    DrawItemList(dc, mVideoItems, -1, std::string(), true, 0);
    for (const auto& part : mAudioParts) {
      DrawItemList(dc, part->GetItems(), -1, std::string(), true, 0);
    }
  }
  if (mShowVerticalSeparator) {
    const Rect bounds = GetLocalBounds();
    dc.FillRect(Rect{bounds.right - 1, bounds.top, bounds.right, bounds.bottom},
                ColorManager::GetColor(kColorVSeparator));
  }
}

void EffectControlsListView::PaintBackground(DC& dc) {
  std::vector<Rect> holes;
  ForEachTopRow([&holes](const std::shared_ptr<EffectItem>& top) {
    if (!top->IsShown()) {
      return;
    }
    auto visit = [&holes](const std::shared_ptr<EffectItem>& row, const auto& self) -> void {
      if (row->HasCustomView() && row->IsShown()) {
        holes.push_back(row->GetCustomViewRect());
      }
      for (const auto& child : row->GetItems()) {
        self(child, self);
      }
    };
    visit(top, visit);
  });
  FillExcept(dc, GetLocalBounds(), holes, 0, ColorManager::GetColor(kColorBackground));
}

bool EffectControlsListView::DrawItemList(DC& dc, const EffectItemList& list, int headerTop,
                                          const std::string& label, bool expanded, int flag) {
  const Rect bounds = GetLocalBounds();
  const bool hasHeader = !label.empty() && headerTop >= 0;
  if (hasHeader) {
    const Rect header{bounds.left, headerTop, bounds.right, headerTop + kSectionHeaderHeight};
    if (header.Intersects(bounds)) {
      DrawHLine(dc, bounds.left, bounds.right, headerTop, ColorManager::GetColor(kColorHSeparator));
      // The expander's colour marks the header's left edge.
      dc.FillRect(Rect{bounds.left, headerTop + 1, bounds.left + 2, header.bottom},
                  ColorManager::GetColor(kColorExpander));
      const Rect text = Rect::FromSize(bounds.left + kHeaderLabelLeft, headerTop + kHeaderLabelTop,
                                       bounds.Width() - kHeaderLabelLeft - kExpanderRightInset - 4,
                                       kHeaderLabelHeight);
      dc.DrawText(label, text, mNormalFont, ColorManager::GetColor(kColor_ReversibleBlack));
    }
    if (!expanded) {
      return false;
    }
  }
  for (const auto& row : list) {
    if (row->IsSetAside()) {
      continue;
    }
    const int top = row->GetTop();
    if (top >= bounds.bottom) {
      break;
    }
    if (top + row->Height() <= bounds.top) {
      continue;
    }
    const Rect band{bounds.left, top, bounds.right, top + row->OwnHeight()};
    if (band.bottom > bounds.top) {
      if (auto* filter = dynamic_cast<FilterItem*>(row.get())) {
        DrawFilterItem(dc, *filter, band, flag);
      } else {
        DrawItem(dc, *row, band, flag);
      }
    }
    if (row->IsExpanded()) {
      DrawFolderItem(dc, *row, band, bounds, flag);
    }
  }
  return false;
}

void EffectControlsListView::DrawFolderItem(DC& dc, EffectItem& row, const Rect& rect,
                                            const Rect& clip, int flag) {
  for (const auto& child : row.GetItems()) {
    // A group may keep children hidden that it does not place (levels that diverge).
    if (child->IsSetAside() || !child->IsShown()) {
      continue;
    }
    const int top = child->GetTop();
    if (top >= clip.bottom) {
      return;
    }
    if (top + child->Height() <= clip.top) {
      continue;
    }
    const Rect band{rect.left, top, rect.right, top + child->OwnHeight()};
    if (band.bottom > clip.top) {
      if (auto* filter = dynamic_cast<FilterItem*>(child.get())) {
        DrawFilterItem(dc, *filter, band, flag);
      } else {
        DrawItem(dc, *child, band, flag);
      }
    }
    if (child->IsExpanded()) {
      DrawFolderItem(dc, *child, band, clip, flag);
    }
  }
}

void EffectControlsListView::DrawFilterItem(DC& dc, FilterItem& row, const Rect& rect,
                                            int /*flag*/) {
  const bool intrinsic = row.Component() && row.Component()->IsIntrinsic();
  dc.FillRect(rect, ColorManager::GetColor(intrinsic ? kColorNonRemoveable : kColorRemoveable));
  DrawHLine(dc, rect.left, rect.right, rect.top, ColorManager::GetColor(kColorHSeparator));

  const Rect title{row.GetTitleLeft(), rect.top + 1, rect.right - kFilterTitleRightMargin,
                   rect.bottom};
  Color textColor = ColorManager::GetColor(kColor_ReversibleBlack);
  if (row.IsSelected()) {
    dc.FillRect(title, ColorManager::GetColor(kColorSelected));
    textColor = ColorManager::GetColor(kColor_ListBoxContentSelectedText);
  } else if (row.IsOffline()) {
    textColor = ColorManager::GetColor(kColor_ReversibleGray);
  }
  row.DrawTitle(dc, Rect{title.left + kNameInset, rect.top + kNameTop, title.right, rect.bottom},
                mLabelFont, textColor);
  row.PaintSelf(dc, Rect{rect.left, rect.top, rect.right, rect.top + row.Height()});
}

void EffectControlsListView::DrawItem(DC& dc, EffectItem& row, const Rect& rect, int /*flag*/) {
  const int width = rect.Width();
  if (row.IsShown() && row.ShouldDrawDivider()) {
    DrawHLine(dc, rect.left, rect.right, rect.top, ColorManager::GetColor(kColorHSeparator));
    if (row.CanTimeVary() && row.IsExpanded()) {
      // Between the name band and what the open parameter shows under it.
      DrawHLine(dc, rect.left, rect.right, rect.top + row.OwnHeight(),
                ColorManager::GetColor(kColorHSeparator));
    }
  }

  int left = row.GetTitleLeft();
  int right = row.IsParameter() && !row.IsGroupBegin()
                  ? width / 2 - 20 + row.GetParameterIndentInPixels()
                  : width / 2 + 100;
  if (HasECPStyle(kStyleWideParameterNames)) {
    left = 10;
    right = width * 3 / 4 + row.GetParameterIndentInPixels() - 30;
  }
  const int nameHeight = (row.IsExpanded() ? row.OwnHeight() : row.Height()) - 2;
  const Rect name{left, rect.top, right, rect.top + nameHeight};

  Color textColor = ColorManager::GetColor(kColor_ReversibleBlack);
  if (row.IsSelected()) {
    dc.FillRect(Rect{name.left, name.top + 1, name.right, name.bottom},
                ColorManager::GetColor(kColorSelected));
    textColor = ColorManager::GetColor(kColor_ListBoxContentSelectedText);
  } else if (!row.IsParamEnabled()) {
    textColor = ColorManager::GetColor(kColor_ReversibleGray);
  }
  row.DrawTitle(dc, Rect{name.left + kNameInset, rect.top + kNameTop, name.right, name.bottom},
                mLabelFont, textColor);
  row.PaintSelf(dc, Rect{rect.left, rect.top, rect.right, rect.top + row.Height()});
}
