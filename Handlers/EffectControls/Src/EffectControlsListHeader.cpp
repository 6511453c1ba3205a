#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/Application.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MultiPictureButton.h"

namespace {

constexpr std::string_view kUsesMenuName = "HandlerEffectControls_MasterClip_Uses_Menu";
// The name row's frame starts this far in and below the header's top.
constexpr int kFrameInset = 4;
constexpr int kFrameTop = 13;
constexpr int kGroupGap = 14;
constexpr int kTriangleWidth = 10;

// Draws a small right-pointing disclosure triangle centred vertically in `rect`.
void DrawTriangle(DC& dc, const Rect& rect, Color color) {
  const int cy = rect.top + rect.Height() / 2;
  const int x = rect.left + 2;
  const Point points[] = {Point{x, cy - 4}, Point{x + 5, cy}, Point{x, cy + 4}};
  dc.FillPolygon(points, color);
}

}  // namespace

EffectControlsListHeader::EffectControlsListHeader(Commander* superCommander)
    : SubView(superCommander),
      mNoTargetText(
          LocalizeString("$$$/Vantile/Handlers/EffectControls/NoClips=(no clip selected)")),
      mSeveralClipsText(LocalizeString(
          "$$$/Vantile/Handlers/EffectControls/MultipleClips=Multiple clips selected")),
      mMasterPrefix(LocalizeString("$$$/Vantile/Handlers/EffectControls/Master=Master")),
      mDelimiter(LocalizeString("$$$/Vantile/Handlers/EffectControls/DotDelimiter= * ")),
      mTransitionText(
          LocalizeString("$$$/Vantile/Handlers/EffectControls/Transition=Play the transition")),
      mFont(kFont_Normal) {}

EffectControlsListHeader::~EffectControlsListHeader() = default;

void EffectControlsListHeader::FinishCreateSelf() {
  mExpander = std::make_shared<MultiPictureButton>(
      Rect::FromSize(0, kExpanderTop, kExpanderSize, kExpanderSize), kToggleKeyframesCommand,
      std::initializer_list<Decal>{kChevronRightNormalDecal, kChevronLeftNormalDecal}, this);
  mExpander->SetToolTip(LocalizeString(
      "$$$/Vantile/Handlers/EffectControls/KeyframeExpander=Show/Hide Timeline View"));
  mExpander->SetValue(mKeyframesVisible ? 1 : 0);
  AddChild(mExpander);
  PlaceExpander();
}

void EffectControlsListHeader::PlaceExpander() {
  if (mExpander) {
    mExpander->SetBounds(Rect::FromSize(GetBounds().Width() - kExpanderRightInset, kExpanderTop,
                                        kExpanderSize, kExpanderSize));
  }
}

void EffectControlsListHeader::SetBoundsSelf(const Rect& /*bounds*/) {
  PlaceExpander();
  LayOutNameRow();
}

void EffectControlsListHeader::SetNoTarget(int clipCount) {
  mDisplayMode = kModeNone;
  mSeveralClips = clipCount > 1;
  mSequence.reset();
  mTrackItem.reset();
  mOutgoing.reset();
  mIncoming.reset();
  mShowingMasterClip = false;
  Invalidate();
}

void EffectControlsListHeader::SetClip(const SequenceRef& sequence, const TrackItemRef& trackItem) {
  if (!HOST_VERIFY(trackItem, "Invalid TrackItem")) {
    return;
  }
  mDisplayMode = kModeClip;
  mSeveralClips = false;
  mShowingMasterClip = false;
  mSequence = sequence;
  mTrackItem = trackItem;
  mOutgoing.reset();
  mIncoming.reset();
  mSequenceName = sequence ? sequence->GetName() : std::string();
  const std::string clipName = trackItem->GetName();
  const MasterClipRef& master = trackItem->GetMasterClip();
  mMasterGroupText = mMasterPrefix + mDelimiter + (master ? master->GetName() : clipName);
  mSequenceGroupText = mSequenceName + mDelimiter + clipName;
  LayOutNameRow();
  Invalidate();
}

void EffectControlsListHeader::SetTransition(const SequenceRef& sequence,
                                             const TrackItemRef& transition,
                                             const TrackItemRef& outgoing,
                                             const TrackItemRef& incoming) {
  if (transition == nullptr) {
    throw NullInterfaceException("ITrackItem");
  }
  if (!HOST_VERIFY(transition->IsTransition(), "Invalid TrackItem")) {
    return;
  }
  mDisplayMode = kModeTransition;
  mSeveralClips = false;
  mShowingMasterClip = false;
  mSequence = sequence;
  mTrackItem = transition;
  mOutgoing = outgoing;
  mIncoming = incoming;
  mSequenceName = sequence ? sequence->GetName() : std::string();
  mTransitionText = transition->GetName();
  mTransitionLine = mSequenceName + mDelimiter + mTransitionText;
  Invalidate();
}

void EffectControlsListHeader::SetKeyframesVisible(bool visible) {
  mKeyframesVisible = visible;
  if (mExpander) {
    mExpander->SetValue(visible ? 1 : 0);
  }
  PlaceExpander();
  Invalidate();
}

void EffectControlsListHeader::EnableExpander(bool enable) {
  if (mExpander) {
    mExpander->SetEnabled(enable);
  }
}

std::string EffectControlsListHeader::GetDisplayText() const {
  switch (mDisplayMode) {
    case kModeClip:
      return GetMasterGroupText() + "  " + GetSequenceGroupText();
    case kModeTransition:
      return mTransitionLine;
    default:
      return mSeveralClips ? mSeveralClipsText : mNoTargetText;
  }
}

Rect EffectControlsListHeader::GetTextRect() const {
  const Rect b = GetLocalBounds();
  return Rect::FromSize(b.left + 10, b.top + 14, b.Width() - 34, b.Height() - 14);
}

// The name row: the master group from the left, the sequence group after it, the uses zone at
// the right end. Each group is a triangle plus its text, truncated to share the row.
void EffectControlsListHeader::LayOutNameRow() {
  const Rect text = GetTextRect();
  const int height = mFont.GetHeight();
  const int available = std::max(0, text.Width() - kUsesZoneWidth - kGroupGap);
  // Neither group can be wider than the row, so neither text is measured beyond it.
  const int wanted = kTriangleWidth + mFont.StringWidth(mMasterGroupText, available);
  const int sequenceWanted = kTriangleWidth + mFont.StringWidth(mSequenceGroupText, available);
  // Each group gets at least half of the row; what one does not need, the other may use.
  const int width = std::min(wanted, std::max(available / 2, available - sequenceWanted));
  mMasterZone = Rect{text.left, text.top, text.left + width, text.top + height};
  const int left = mMasterZone.right + kGroupGap;
  const int right = std::max(left, text.right - kUsesZoneWidth);
  mSequenceZone = Rect{left, text.top, std::min(right, left + sequenceWanted), text.top + height};
}

Rect EffectControlsListHeader::GetUsesZoneRect() const {
  const Rect text = GetTextRect();
  return Rect{text.right - kUsesZoneWidth, text.top, text.right, text.top + mFont.GetHeight()};
}

EffectControlsListHeader::Zone EffectControlsListHeader::HitTestZone(Point point) const {
  if (mDisplayMode != kModeClip) {
    return kZoneNone;
  }
  if (mMasterZone.Contains(point)) {
    return kZoneMaster;
  }
  if (mSequenceZone.Contains(point)) {
    return kZoneSequence;
  }
  if (GetUsesZoneRect().Contains(point)) {
    return kZoneUses;
  }
  return kZoneNone;
}

std::string EffectControlsListHeader::GetToolTipText(Point point) const {
  if (mDisplayMode != kModeClip) {
    return GetDisplayText();
  }
  return HitTestZone(point) == kZoneMaster ? GetMasterGroupText() : GetSequenceGroupText();
}

std::string EffectControlsListHeader::GetToolTipSelf(Point point) const {
  return GetToolTipText(point);
}

void EffectControlsListHeader::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_WindowBackground));
  const Rect text = GetTextRect();
  const Color textColor = ColorManager::GetColor(kColor_ReversibleBlack);
  switch (mDisplayMode) {
    case kModeClip: {
      const Color link = ColorManager::GetColor(kColor_InteractiveControl);
      const Rect& master = mMasterZone;
      const Rect& sequence = mSequenceZone;
      const Color masterColor = mShowingMasterClip ? textColor : link;
      const Color sequenceColor = mShowingMasterClip ? link : textColor;
      DrawTriangle(dc, master, masterColor);
      dc.DrawText(mMasterGroupText,
                  Rect{master.left + kTriangleWidth, master.top, master.right, master.bottom},
                  mFont, masterColor);
      DrawTriangle(dc, sequence, sequenceColor);
      dc.DrawText(
          mSequenceGroupText,
          Rect{sequence.left + kTriangleWidth, sequence.top, sequence.right, sequence.bottom},
          mFont, sequenceColor);
      // The uses popup: a small down-pointing triangle at the right end of the row.
      const Rect uses = GetUsesZoneRect();
      const Point c = uses.Center();
      const Point down[] = {Point{c.x - 4, c.y - 2}, Point{c.x + 4, c.y - 2}, Point{c.x, c.y + 3}};
      dc.FillPolygon(down, textColor);
      dc.FrameRect(Rect{bounds.left + kFrameInset, bounds.top + kFrameTop, text.right + kFrameInset,
                        text.top + mFont.GetHeight() + 3},
                   ColorManager::GetColor(kColor_Divider));
      break;
    }
    case kModeTransition:
      dc.DrawText(mTransitionLine, text, mFont, textColor);
      break;
    default:
      dc.DrawText(mSeveralClips ? mSeveralClipsText : mNoTargetText, text, mFont, textColor);
      break;
  }
}

void EffectControlsListHeader::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  switch (HitTestZone(point)) {
    case kZoneMaster:
      if (!mShowingMasterClip && !mBusy) {
        MatchFrame();
      }
      break;
    case kZoneSequence:
      if (mShowingMasterClip && !mBusy) {
        GoBackToSequence();
      }
      break;
    case kZoneUses:
      PopUpUses();
      break;
    default:
      break;
  }
}

void EffectControlsListHeader::MatchFrame() {
  if (!mTrackItem || !mTrackItem->GetMasterClip()) {
    return;
  }
  mBusy = true;
  if (mMasterClipHandler) {
    mMasterClipHandler(mTrackItem->GetMasterClip());
  }
  mShowingMasterClip = true;
  mBusy = false;
  Invalidate();
}

void EffectControlsListHeader::GoBackToSequence() {
  mBusy = true;
  const SequenceRef sequence = mSequence;
  const TrackItemRef item = mTrackItem;
  mShowingMasterClip = false;
  if (sequence && item && sequence->Contains(item.get())) {
    if (Application* app = Application::InstanceOrNull(); app != nullptr) {
      app->ActivateSequence(sequence);
    }
    std::vector<TrackItemRef> items = item->GetLinkedItems();
    items.insert(items.begin(), item);
    sequence->SetSelection(items);
  }
  if (mSequenceHandler) {
    mSequenceHandler();
  }
  mBusy = false;
  Invalidate();
}

std::vector<EffectControlsListHeader::Use> EffectControlsListHeader::GetMasterClipUses() const {
  std::vector<Use> uses;
  if (!mTrackItem || !mTrackItem->GetMasterClip()) {
    return uses;
  }
  const MasterClip* master = mTrackItem->GetMasterClip().get();
  const Project* project = mTrackItem->GetProject();
  if (project == nullptr) {
    return uses;
  }
  for (const SequenceRef& sequence : project->GetSequences()) {
    sequence->ForEachTrackItem([&](const TrackItemRef& item) {
      if (item->IsClip() && item->GetMasterClip().get() == master &&
          item->GetMediaType() != MediaType::Audio) {
        uses.push_back({sequence, item,
                        sequence->GetName() + " : " +
                            sequence->GetVideoTimeDisplay().FormatTimecode(
                                item->GetStart() - sequence->GetZeroPoint())});
      }
    });
  }
  return uses;
}

void EffectControlsListHeader::PopUpUses() {
  mUses = GetMasterClipUses();
  if (mUses.empty()) {
    return;
  }
  Menu menu{std::string(kUsesMenuName)};
  for (std::size_t i = 0; i < mUses.size() && i < kMaxUses; ++i) {
    menu.AddCommand(kFirstUseCommand + static_cast<CommandID>(i), mUses[i].label);
  }
  MenuRegistry::Instance().Register(menu);
  TrackPopupMenu(kUsesMenuName, Point{GetUsesZoneRect().left, GetUsesZoneRect().bottom});
  MenuRegistry::Instance().Remove(kUsesMenuName);
}

bool EffectControlsListHeader::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command >= kFirstUseCommand && command < kFirstUseCommand + kMaxUses) {
    status = CommandStatus{};
    status.enabled = static_cast<std::size_t>(command - kFirstUseCommand) < mUses.size();
    return true;
  }
  return SubView::FindCommandStatus(command, status);
}

bool EffectControlsListHeader::ObeyCommand(CommandID command) {
  if (command >= kFirstUseCommand && command < kFirstUseCommand + kMaxUses) {
    const std::size_t index = static_cast<std::size_t>(command - kFirstUseCommand);
    if (index < mUses.size()) {
      const Use use = mUses[index];
      if (Application* app = Application::InstanceOrNull(); app != nullptr) {
        app->ActivateSequence(use.sequence);
      }
      use.sequence->SetCurrentTime(use.item->GetStart());
      std::vector<TrackItemRef> items = use.item->GetLinkedItems();
      items.insert(items.begin(), use.item);
      use.sequence->SetSelection(items);
    }
    return true;
  }
  return SubView::ObeyCommand(command);
}
