// Placing the rows and section buttons, scrolling, the section expanders and disclosure.
#include <algorithm>
#include <initializer_list>

#include "Handlers/EffectControls/Public/EffectControlsListScroller.h"
#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/MultiPictureButton.h"

// What the layout walk reports. Headers come before the rows of their section.
class EffectControlsListView::LayoutSink {
 public:
  enum class Section { kGraphics, kVideo, kAudioPart };

  virtual ~LayoutSink() = default;
  // `part`: the audio part the header belongs to, null for the other sections.
  virtual void Header(Section section, MultiPictureButton* expander, AudioPartInfo* part,
                      int top) = 0;
  virtual void Row(const std::shared_ptr<EffectItem>& row, int top) = 0;
};

int EffectControlsListView::WalkLayout(LayoutSink* sink) const {
  int y = kInitialBaseline - mScrollOffset;
  // Headers belong to clip targets; a transition shows its row alone.
  const bool headers = mTarget.kind == kTargetClip || mTarget.kind == kTargetTransitionComponent;

  // A section: its header when it has one, then its rows. Rows of a closed section sit at the
  // header's bottom and take no height (they are hidden).
  auto section = [&](LayoutSink::Section kind, const EffectItemList& rows, bool hasHeader,
                     bool expanded, MultiPictureButton* expander, AudioPartInfo* part) {
    if (hasHeader) {
      if (sink != nullptr) {
        sink->Header(kind, expander, part, y);
      }
      y += kSectionHeaderHeight;
    }
    const bool open = !hasHeader || expanded;
    for (const auto& row : rows) {
      if (sink != nullptr) {
        sink->Row(row, y);
      }
      if (open && !row->IsSetAside()) {
        y += row->Height();
      }
    }
  };

  section(LayoutSink::Section::kGraphics, mGraphicsItems, headers && !mGraphicsItems.IsEmpty(),
          mGraphicsExpanded, mGraphicsExpander.get(), nullptr);
  section(LayoutSink::Section::kVideo, mVideoItems,
          headers && !mVideoItems.IsEmpty() && !mTarget.transitionChain, mVideoExpanded,
          mVideoExpander.get(), nullptr);
  for (const auto& part : mAudioParts) {
    section(LayoutSink::Section::kAudioPart, part->GetItems(), headers && part->IsClipPart(),
            part->IsExpanded(), part->GetExpanderButton().get(), part.get());
  }
  return y;
}

void EffectControlsListView::PositionItems() {
  // Places the section buttons and rows, and remembers where the headers went for painting.
  class PlacingSink final : public LayoutSink {
   public:
    explicit PlacingSink(EffectControlsListView& list)
        : mList(list), mWidth(list.GetBounds().Width()), mViewHeight(list.GetBounds().Height()) {}

    void Header(Section section, MultiPictureButton* expander, AudioPartInfo* part,
                int top) override {
      if (expander != nullptr) {
        expander->SetBounds(
            Rect::FromSize(mWidth - kExpanderRightInset, top + 3, kExpanderSize, kExpanderSize));
      }
      switch (section) {
        case Section::kGraphics:
          mList.mGraphicsHeaderTop = top;
          break;
        case Section::kVideo:
          mList.mVideoHeaderTop = top;
          break;
        case Section::kAudioPart:
          part->SetHeaderTop(top);
          if (part->GetPlayButton()) {
            part->GetPlayButton()->SetBounds(Rect::FromSize(mWidth - kPlayButtonRightInset, top + 3,
                                                            kPlayButtonWidth, kPlayButtonHeight));
          }
          break;
      }
    }

    void Row(const std::shared_ptr<EffectItem>& row, int top) override {
      row->SetViewTopAndBottom(0, mViewHeight);
      row->PositionSelf(top, 0, mWidth);
      if (row->HasCustomView()) {
        row->SetCustomViewRect(Rect::FromSize(0, top, mWidth, row->Height()));
      }
    }

   private:
    EffectControlsListView& mList;
    int mWidth;
    int mViewHeight;
  };

  mGraphicsHeaderTop = -1;
  mVideoHeaderTop = -1;
  for (const auto& part : mAudioParts) {
    part->SetHeaderTop(-1);
  }
  PlacingSink sink(*this);
  WalkLayout(&sink);
}

int EffectControlsListView::GetMaxHeight() const {
  const int top = kInitialBaseline - mScrollOffset;
  return WalkLayout(nullptr) - top + kMaxHeightExtra;
}

void EffectControlsListView::SetBoundsSelf(const Rect& /*bounds*/) {
  PositionItems();
  UpdateVScrollBar();
}

// --- Scrolling ---

void EffectControlsListView::UpdateVScrollBar() {
  if (mScroller == nullptr) {
    return;
  }
  const int visible = GetBounds().Height();
  const int content = GetMaxHeight();
  mScroller->SizeListScrollBar(content, visible);
  const int barPosition = mScroller->GetListScrollPosition();
  const int limit = content - visible;
  const int offset = limit < 0 ? 0 : std::clamp(barPosition, 0, limit);
  if (offset != barPosition) {
    mScroller->SetListScrollPosition(offset);
  }
  if (offset != mScrollOffset) {
    mScrollOffset = offset;
    PositionItems();
    Invalidate();
    BroadcastRefreshKeyframes();
  }
}

void EffectControlsListView::OnVScroll(ScrollCode /*code*/, int position, KeyModifiers /*flags*/) {
  // The offset never leaves the content, whatever the bar reports.
  const int limit = std::max(0, GetMaxHeight() - GetBounds().Height());
  const int offset = std::clamp(position, 0, limit);
  if (offset == mScrollOffset) {
    return;
  }
  mScrollOffset = offset;
  PositionItems();
  Redraw();
  BroadcastRefreshKeyframes();
}

void EffectControlsListView::SetDoShowVerticalSeparator(bool show) {
  if (mShowVerticalSeparator != show) {
    mShowVerticalSeparator = show;
    Invalidate();
  }
}

// --- Section buttons ---

namespace {

std::shared_ptr<MultiPictureButton> MakeSectionButton(EffectControlsListView& list, Size size,
                                                      CommandID command,
                                                      std::initializer_list<Decal> pictures,
                                                      const char* toolTip) {
  auto button = std::make_shared<MultiPictureButton>(Rect::FromSize(0, 0, size.width, size.height),
                                                     command, pictures, &list);
  button->SetTakesFocusOnClick(false);
  if (toolTip != nullptr) {
    button->SetToolTip(toolTip);
  }
  list.AddChild(button);
  button->Hide();
  return button;
}

constexpr Size kExpanderButtonSize{EffectControlsListView::kExpanderSize,
                                   EffectControlsListView::kExpanderSize};

}  // namespace

void EffectControlsListView::CreateVideoExpanderButton() {
  if (!mVideoExpander) {
    mVideoExpander = MakeSectionButton(
        *this, kExpanderButtonSize, kVideoExpanderCommand,
        {kChevronUpNormalDecal, kChevronDownNormalDecal},
        "$$$/Vantile/Handlers/EffectControls/ExpandVideoEffects=Expand Video Effects");
    mVideoExpander->SetValue(1);
  }
}

void EffectControlsListView::CreateXOEditableTextExpanderButton() {
  if (!mTextExpander) {
    mTextExpander = MakeSectionButton(*this, kExpanderButtonSize, kTextExpanderCommand,
                                      {kChevronUpNormalDecal, kChevronDownNormalDecal}, nullptr);
    mTextExpander->SetValue(1);
  }
}

void EffectControlsListView::CreateGraphicsExpanderButton() {
  if (!mGraphicsExpander) {
    mGraphicsExpander =
        MakeSectionButton(*this, kExpanderButtonSize, kGraphicsExpanderCommand,
                          {kChevronUpNormalDecal, kChevronDownNormalDecal}, nullptr);
    mGraphicsExpander->SetValue(1);
  }
}

std::shared_ptr<MultiPictureButton> EffectControlsListView::CreateAudioExpanderButton(int index) {
  if (index < 0 || index >= kMaxAudioParts) {
    return nullptr;
  }
  return MakeSectionButton(
      *this, kExpanderButtonSize, kAudioExpanderCommand + index,
      {kChevronUpNormalDecal, kChevronDownNormalDecal},
      "$$$/Vantile/Handlers/EffectControls/ExpandAudioEffects=Expand Audio Effects");
}

std::shared_ptr<MultiPictureButton> EffectControlsListView::CreatePlayButton(int index) {
  if (index < 0 || index >= kMaxAudioParts) {
    return nullptr;
  }
  return MakeSectionButton(
      *this, Size{kPlayButtonWidth, kPlayButtonHeight}, kPlayAudioPartCommand + index,
      {kPlayNormalDecal, kStopNormalDecal},
      "$$$/Vantile/Handlers/EffectControls/PlayAudioPart=Play only the audio of this part");
}

void EffectControlsListView::ShowSectionRows(const EffectItemList& list, bool show) {
  for (const auto& row : list) {
    if (show) {
      row->Show();
    } else {
      row->Hide();
    }
  }
}

void EffectControlsListView::AfterLayoutChange() {
  PositionItems();
  UpdateVScrollBar();
  Redraw();
  BroadcastRefreshKeyframes();
  BroadcastListChanged();
}

void EffectControlsListView::OnVideoExpander() {
  mVideoExpanded = !mVideoExpanded;
  if (mVideoExpander) {
    mVideoExpander->SetValue(mVideoExpanded ? 0 : 1);
    const bool audioTransition = !mAudioParts.empty() && !mAudioParts.front()->IsClipPart();
    if (!mVideoItems.IsEmpty() && !audioTransition) {
      mVideoExpander->Show();
    }
  }
  // Rows of a closed section keep no controls on screen: they would lie over the next one.
  ShowSectionRows(mVideoItems, mVideoExpanded);
  AfterLayoutChange();
}

void EffectControlsListView::OnGraphicsExpander() {
  mGraphicsExpanded = !mGraphicsExpanded;
  if (mGraphicsExpander) {
    mGraphicsExpander->SetValue(mGraphicsExpanded ? 0 : 1);
    if (!mGraphicsItems.IsEmpty()) {
      mGraphicsExpander->Show();
    }
  }
  ShowSectionRows(mGraphicsItems, mGraphicsExpanded);
  AfterLayoutChange();
}

void EffectControlsListView::OnXOEditableTextExpander() {
  mTextExpanded = !mTextExpanded;
  if (mTextExpander) {
    mTextExpander->SetValue(mTextExpanded ? 0 : 1);
  }
  AfterLayoutChange();
}

void EffectControlsListView::OnAudioExpander(CommandID command) {
  AudioPartInfo* part = FindAudioPartInfoByIndex(command - kAudioExpanderCommand);
  if (part == nullptr) {
    return;
  }
  part->SetExpanded(!part->IsExpanded());
  if (part->GetExpanderButton()) {
    part->GetExpanderButton()->SetValue(part->IsExpanded() ? 0 : 1);
  }
  ShowSectionRows(part->GetItems(), part->IsExpanded());
  AfterLayoutChange();
}

// --- Disclosure ---

void EffectControlsListView::OnDisclosureStateChanged() {
  UpdateVScrollBar();
  PositionItems();
  BroadcastListChanged();
  Redraw();
  BroadcastRefreshKeyframes();
}

void EffectControlsListView::OnDisclosureStateAllChanged(bool expanded) {
  ForEachTopRow(
      [expanded](const std::shared_ptr<EffectItem>& row) { row->SetAllExpanded(expanded); });
  OnDisclosureStateChanged();
}
