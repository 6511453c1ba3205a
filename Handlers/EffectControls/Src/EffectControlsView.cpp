#include "Handlers/EffectControls/Src/EffectControlsView.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeSelection.h"
#include "Host/Model/Sequence.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/ScrollBar.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ZoomBar.h"

namespace {

constexpr std::string_view kSeparatorRatioKey = "HandlerEffectControls.SeparatorRatio";
constexpr std::string_view kSeparatorRatioMaximizedKey =
    "HandlerEffectControls.SeparatorRatioWhenMaximized";
constexpr std::string_view kKeyframesVisibleKey = "HandlerEffectControls.AreKeyframesVisible";
constexpr std::string_view kRulerNumbersKey = "be.prefs.effectcontrols.showtimerulernumbers";
constexpr TickTime kDefaultRulerEnd = 25401600000000;  // 100 s

}  // namespace

EffectControlsView::EffectControlsView(Commander* parent, std::string contextName)
    : TabView(parent),
      mContextName(std::move(contextName)),
      mStation(RegisterUniqueStation("EffectControlsView")),
      mTimeline(std::make_shared<PanelTimeline>()) {
  mHeader = std::make_shared<EffectControlsListHeader>(this);
  mListView = std::make_shared<EffectControlsListView>(this, mStation, mTimeline);
  mListView->SetEffectControlsView(this);
  if (Preferences::Application().Properties().GetBool(kOwnSliderRowsKey, false)) {
    mListView->SetStyle(mListView->GetStyle() | kStyleOwnSliderRows);
  }
  mKeyframeView = std::make_shared<EffectControlsKeyframeView>(this);
  mKeyframeView->SetListView(mListView);
  mKeyframeView->SetTimeline(mTimeline);
  mKeyframeView->SetPinToClip(mPinned);
  mRulerHolder = std::make_shared<SubView>(this);
  mRuler = std::make_shared<TimeBarControl>(
      Rect::FromSize(0, kZoomBarHeight, 1, TimeBarControl::GetDefaultSmallHeight() + 4), this);
  mZoomBar = std::make_shared<ZoomBar>(Rect::FromSize(0, 0, 1, kZoomBarHeight), this);
  mZoomBar->AttachTo(mRuler.get());
  mRuler->SetZoomLimiter(&mZoomLimiter);
  mScrollBar =
      std::make_shared<ScrollBar>(Rect::FromSize(0, 0, ScrollBar::GetDefaultScrollBarSize(), 1),
                                  ScrollBar::Orientation::kVertical, this);
  mScrollBar->SetStep(kScrollStep);

  mHeader->SetMasterClipHandler([this](const MasterClipRef& clip) { TargetMasterClip(clip); });
  mHeader->SetSequenceHandler([this]() {
    SetMasterClip(nullptr);
    mTargetMode = kTargetNone;
    if (mSequence) {
      SequenceClipSelectionChanged(mSequence);
    }
  });

  AddListener(mStation, *this);
  AddListener(mListView->GetKeyframeViewStation(), *this);
  AddListener(mRuler->GetStation(), *this);
  AddListener(mScrollBar->GetStation(), *this);
  AddListener(kSequenceActivationStation, *this);
  AddListener(kTrackItemActivationStation, *this);
  AddListener(kMasterClipActivationStation, *this);
  AddListener(kDirectManipulationStation, *this);
}

EffectControlsView::~EffectControlsView() {
  RemoveListenerFromAllStations(*this);
  if (mListView) {
    mListView->SetEffectControlsView(nullptr);
  }
  if (mRuler) {
    mRuler->SetZoomLimiter(nullptr);
  }
  DisposeStation(mStation);
}

std::string EffectControlsView::GetName() const {
  return LocalizeString("$$$/Vantile/Handlers/EffectControls/EffectControls=Effect Controls");
}

std::string EffectControlsView::GetFlyoutMenuName() const {
  return "HandlerEffectControls_Flyout_Menu";
}

void EffectControlsView::SetToolMode(ToolMode mode) {
  mToolMode = mode;
  mKeyframeView->SetToolMode(mode);
}

// --- Children and layout ---

void EffectControlsView::CreateChildrenSelf() {
  const Rect bounds = GetLocalBounds();
  AddChild(mRulerHolder);
  mRulerHolder->AddChild(mZoomBar);
  mRulerHolder->AddChild(mRuler);
  mRuler->SetTimeRange(0, kDefaultRulerEnd);
  mRuler->SetZoomInOutTime(0, kDefaultRulerEnd);
  mRuler->SetCurrentTime(0);
  mRuler->SetInOutMarks(std::nullopt, std::nullopt);
  mRuler->SetMarkerSelectionFunctions([this](std::int64_t id) { return mMarkers.IsSelected(id); },
                                      [this](std::int64_t id) {
                                        mMarkers.Select(id);
                                        mRuler->Invalidate();
                                      });
  mRuler->SetShowNumbers(Preferences::Application().Properties().GetBool(kRulerNumbersKey, true));

  mTimecode = std::make_shared<HotTimecodeControl>(
      Rect::FromSize(5, bounds.Height() - 20, 105, 20),
      mSequence ? mSequence->GetVideoTimeDisplay() : kFrameRate_25, 0, this);
  mTimecode->SetTakesFocusOnClick(false);
  // The edit line never goes before the sequence's start, however far it is scrubbed or typed.
  mTimecode->SetMinTime(0);
  AddChild(mTimecode);
  AddListener(mTimecode->GetStation(), *this);

  mPlayButton = std::make_shared<MultiPictureButton>(
      Rect::FromSize(0, 0, 25, 17), kPlayAudioCommand,
      std::initializer_list<Decal>{kPlayNormalDecal, kStopNormalDecal}, this);
  mPlayButton->SetToolTip(LocalizeString(
      "$$$/Vantile/Handlers/EffectControls/PlayAudio=Play only the audio for this clip"));
  mPlayButton->SetTakesFocusOnClick(false);
  mLoopButton = std::make_shared<PictureButton>(Rect::FromSize(0, 0, 25, 18), kLoopAudioCommand,
                                                kLoopNormalDecal, kLoopOnDecal, this);
  mLoopButton->SetToolTip(LocalizeString(
      "$$$/Vantile/Handlers/EffectControls/LoopAudio=Toggle looping audio playback"));
  mLoopButton->SetTakesFocusOnClick(false);
  AddChild(mPlayButton);
  AddChild(mLoopButton);

  AddChild(mScrollBar);
  AddChild(mHeader);
  AddChild(mListView);
  AddChild(mKeyframeView);
  SetDoubleBuffered(true);
  if (mSequence) {
    ReloadTimeDisplays();
    ReloadInOutMarks();
    ReloadMarkers();
    SetEditTime(mSequence->GetCurrentTime());
  }
  ApplyKeyframesVisible();
  UpdateAudioButtons();
  LayoutPanel();
}

int EffectControlsView::GetScrollBarWidth() const {
  return IsStacked() ? 0 : ScrollBar::GetDefaultScrollBarSize();
}

float EffectControlsView::CurrentRatio() const {
  return IsFrameMaximized() ? mSeparatorRatioMaximized : mSeparatorRatio;
}

void EffectControlsView::StoreRatio(float ratio) {
  if (IsFrameMaximized()) {
    mSeparatorRatioMaximized = ratio;
  } else {
    mSeparatorRatio = ratio;
  }
}

void EffectControlsView::SetBoundsSelf(const Rect& /*bounds*/) {
  LayoutPanel();
}

int EffectControlsView::ListWidthFor(int panelWidth) const {
  return std::max(kMinListWidth,
                  static_cast<int>(std::lround(static_cast<float>(panelWidth) * CurrentRatio())));
}

void EffectControlsView::LayoutPanel() {
  if (mLayingOut) {
    return;
  }
  mLayingOut = true;
  const int width = GetBounds().Width();
  const int height = GetBounds().Height();
  const int scrollBarWidth = GetScrollBarWidth();
  // The keyframe area keeps room for its horizontal scroll bar even when stacked.
  const int hScrollBarHeight = ScrollBar::GetDefaultScrollBarSize();
  const int listWidth = ListWidthFor(width);
  const int keyframeWidth = width - scrollBarWidth - listWidth - kSeparatorGap;
  const int rulerWidth = std::max(0, keyframeWidth);
  if (mKeyframesVisible) {
    mZoomLimiter.SetScrollWidth(std::max(1, keyframeWidth));
    mRulerHolder->SetBounds(Rect::FromSize(listWidth, 0, rulerWidth, kRulerHeight));
    mZoomBar->SetBounds(Rect::FromSize(0, 0, rulerWidth, kZoomBarHeight));
    mRuler->SetBounds(Rect::FromSize(0, kZoomBarHeight, rulerWidth, kRulerBarHeight));
  }
  const int headerWidth =
      mKeyframesVisible ? (listWidth <= width - scrollBarWidth ? listWidth : width) : width - 4;
  mHeader->SetBounds(Rect::FromSize(0, 0, std::max(0, headerWidth), kRulerHeight));
  const int listRight =
      mKeyframesVisible ? std::min(listWidth, width - scrollBarWidth) : width - 4 - scrollBarWidth;
  const int belowRuler = height - kRulerHeight - kBottomBarHeight;
  mListView->SetBounds(
      Rect::FromSize(5, kRulerHeight, std::max(0, listRight - 5), std::max(0, belowRuler)));
  mKeyframeView->SetBounds(Rect::FromSize(listWidth, kRulerHeight, rulerWidth,
                                          std::max(0, belowRuler - hScrollBarHeight)));
  mKeyframeAreaWidth = rulerWidth;
  if (mTimecode) {
    mTimecode->SetBounds(Rect::FromSize(5, height - 19, 105, 20));
  }
  if (mPlayButton) {
    mPlayButton->SetBounds(Rect::FromSize(width - 67, height - 18, 25, 18));
    mLoopButton->SetBounds(Rect::FromSize(width - 40, height - 18, 25, 18));
  }
  mScrollBar->SetBounds(Rect::FromSize(width - scrollBarWidth, kRulerHeight, scrollBarWidth,
                                       std::max(0, belowRuler)));
  mScrollBar->SetVisible(!IsStacked());
  mLayingOut = false;

  if (mKeyframesVisible) {
    const TickTime span = mRuler->GetZoomOutTime() - mRuler->GetZoomInTime();
    if (span > 0) {
      ZoomToTimePerPixel(static_cast<double>(span) / kTicksPerSecond / std::max(1, keyframeWidth),
                         false);
    }
  }
  mListView->UpdateVScrollBar();
  Invalidate();
}

void EffectControlsView::SetStackedSelf(bool /*stacked*/) {
  LayoutPanel();
}

int EffectControlsView::GetMaxStackedHeight() const {
  return mListView->GetMaxHeight() + 60;
}

void EffectControlsView::OnSeparatorMoved(int listWidth) {
  const int width = GetBounds().Width();
  const int scrollBarWidth = GetScrollBarWidth();
  if (width < scrollBarWidth + kMinListWidth + kMinKeyframeWidth) {
    return;
  }
  const int widest = width - scrollBarWidth - kMinKeyframeWidth;
  const int kept = std::max(std::min(listWidth, widest), kMinListWidth);
  StoreRatio(static_cast<float>(kept) / static_cast<float>(width));
  LayoutPanel();
}

void EffectControlsView::ApplyKeyframesVisible() {
  mRulerHolder->SetVisible(mKeyframesVisible);
  mZoomBar->SetVisible(mKeyframesVisible && mTargetMode != kTargetNone);
  mKeyframeView->SetVisible(mKeyframesVisible);
  mKeyframeView->SetKeyframesVisible(mKeyframesVisible);
  mHeader->SetKeyframesVisible(mKeyframesVisible);
  // The list draws its vertical separator only beside a visible keyframe area.
  mListView->SetDoShowVerticalSeparator(mKeyframesVisible);
}

void EffectControlsView::SetKeyframesVisible(bool visible) {
  if (visible == mKeyframesVisible) {
    return;
  }
  ToggleKeyframesVisible();
}

void EffectControlsView::ToggleKeyframesVisible() {
  mKeyframesVisible = !mKeyframesVisible;
  ApplyKeyframesVisible();
  const int width = GetBounds().Width();
  if (mKeyframesVisible && width > 0) {
    const int scrollBarWidth = GetScrollBarWidth();
    if (width - scrollBarWidth - ListWidthFor(width) - kSeparatorGap < kMinKeyframeWidth) {
      const int widest = std::max(kMinListWidth, width - scrollBarWidth - kMinKeyframeWidth);
      StoreRatio(static_cast<float>(widest) / static_cast<float>(width));
    }
  }
  LayoutPanel();
}

// --- Tab state ---

void EffectControlsView::SaveStateSelf(PropertyList& state) const {
  if (mSeparatorRatio != 0.0F) {
    state.SetFloat(kSeparatorRatioKey, mSeparatorRatio);
  }
  if (mSeparatorRatioMaximized != 0.0F) {
    state.SetFloat(kSeparatorRatioMaximizedKey, mSeparatorRatioMaximized);
  }
  state.SetBool(kKeyframesVisibleKey, mKeyframesVisible);
}

void EffectControlsView::RestoreStateSelf(const PropertyList& state) {
  // A stored ratio outside (0, 1) cannot be a split of the panel: it is ignored.
  const auto readRatio = [&state](std::string_view key) {
    const float ratio = state.GetFloat(key, 0.0F);
    return (ratio > 0.0F && ratio < 1.0F) ? ratio : 0.0F;
  };
  mSeparatorRatioMaximized = readRatio(kSeparatorRatioMaximizedKey);
  if (state.Has(kSeparatorRatioKey)) {
    mSeparatorRatio = readRatio(kSeparatorRatioKey);
    LayoutPanel();
    SetListScrollPosition(0);
  }
  if (state.Has(kKeyframesVisibleKey)) {
    mKeyframesVisible = state.GetBool(kKeyframesVisibleKey, true);
    ApplyKeyframesVisible();
  }
  LayoutPanel();
}

// --- Vertical scrolling ---

void EffectControlsView::SizeListScrollBar(int contentHeight, int visibleHeight) {
  const int position = contentHeight <= visibleHeight ? 0 : mScrollBar->GetPosition();
  mScrollBar->SetScrollInfo(0, std::max(0, contentHeight), std::max(0, visibleHeight), position);
}

int EffectControlsView::GetListScrollPosition() const {
  return mScrollBar->GetPosition();
}

void EffectControlsView::SetListScrollPosition(int position) {
  mScrollBar->SetPosition(position);
}

bool EffectControlsView::MouseWheelSelf(const WheelEvent& event) {
  if (event.deltaY != 0) {
    mScrollBar->ScrollBy(-event.deltaY * mScrollBar->GetStep());
  }
  return true;
}

bool EffectControlsView::MouseMagnifySelf(const MagnifyEvent& event) {
  const double secondsPerPixel =
      std::clamp(mTimeline->GetSecondsPerPixel() - event.amount * 0.5, 0.001, 1.0);
  ZoomToTimePerPixel(secondsPerPixel, true);
  return true;
}

bool EffectControlsView::MousePanSelf(const PanEvent& event) {
  mScrollBar->ScrollBy(event.deltaY);
  return true;
}

// --- Paint ---

void EffectControlsView::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_WindowBackground));
  const Color divider = ColorManager::GetColor(kColor_Divider);
  const int T = kRulerHeight;
  dc.FillRect(Rect{0, T - 1, bounds.Width(), T}, divider);
  if (mKeyframesVisible) {
    const int x = mKeyframeView->GetBounds().left - 1;
    dc.FillRect(Rect{x, T, x + 1, bounds.Height() - kBottomBarHeight}, divider);
  }
  dc.FillRect(Rect{0, bounds.Height() - kBottomBarHeight - 1, bounds.Width(),
                   bounds.Height() - kBottomBarHeight},
              divider);
}

void EffectControlsView::DestroySelf() {
  RemoveListenerFromAllStations(*this);
  auto& properties = Preferences::Application().Properties();
  if (properties.IsReadOnly(kRulerNumbersKey)) {
    PostMessageToUIThread(
        properties.GetStation(),
        std::make_shared<OverrideReadOnlyPropertyWarningMessage>(std::string(kRulerNumbersKey)));
  } else {
    properties.SetBool(kRulerNumbersKey, mRuler->AreNumbersShown());
  }
  mZoomBar->AttachTo(nullptr);
  mRuler->SetZoomLimiter(nullptr);
}

// --- Dump ---

namespace {

std::vector<std::string> RowPath(const EffectItem& row) {
  std::vector<std::string> path{row.GetName()};
  for (auto parent = row.GetParentItem(); parent; parent = parent->GetParentItem()) {
    path.insert(path.begin(), parent->GetName());
  }
  return path;
}

// The row showing `param`, or null.
const ParameterControl* FindParameterRow(const EffectControlsListView& list,
                                         const ComponentParam* param) {
  const ParameterControl* found = nullptr;
  auto look = [&](const EffectItemList& rows) {
    rows.ForEachRow([&](const EffectItemList::Row& row) {
      const auto* control = dynamic_cast<const ParameterControl*>(row.get());
      if (control != nullptr && control->GetParam().get() == param) {
        found = control;
        return false;
      }
      return true;
    });
  };
  look(list.GetVideoItems());
  look(list.GetGraphicsItems());
  for (const auto& part : list.GetAudioParts()) {
    look(part->GetItems());
  }
  return found;
}

const char* ToolModeName(ToolMode mode) {
  switch (mode) {
    case ToolMode::kZoom:
      return "zoom";
    case ToolMode::kHand:
      return "hand";
    case ToolMode::kPen:
      return "pen";
    case ToolMode::kPointer:
      break;
  }
  return "pointer";
}

}  // namespace

void EffectControlsView::FillStateDump(PanelStateDump& dump) const {
  dump.headerText = mHeader->GetDisplayText();
  dump.targetMode = mTargetMode;
  dump.rows = mListView->GetDumpRows(mListView->GetBounds().TopLeft());
  if (mKeyframesVisible) {
    StateDumpKeyframeArea area;
    area.visibleStartTime = mTimeline->GetVisibleStart();
    area.secondsPerPixel = mTimeline->GetSecondsPerPixel();
    if (const auto& selection = mListView->GetKeyframeSelection()) {
      for (const KeyframeSelection& keys : selection->GetAllSelections()) {
        const ParameterControl* row = FindParameterRow(*mListView, keys.GetParam().get());
        for (const TickTime time : keys.GetKeyframeTimes()) {
          area.selectedKeyframes.push_back(
              {.path = row ? RowPath(*row) : std::vector<std::string>{keys.GetParam()->GetName()},
               .time = time});
        }
      }
    }
    const Point origin = mKeyframeView->GetBounds().TopLeft();
    for (const auto& glyph : mKeyframeView->GetKeyframeGlyphs()) {
      area.glyphs.push_back({.path = RowPath(*glyph.row),
                             .time = glyph.clipTime,
                             .x = glyph.centre.x + origin.x,
                             .y = glyph.centre.y + origin.y,
                             .selected = glyph.selected});
    }
    dump.keyframeArea = area;
  }
  dump.extra.emplace_back("selectedKeyframeCount",
                          static_cast<std::int64_t>(mKeyframeView->GetSelectedKeyframeCount()));
  dump.extra.emplace_back("keyframesVisible", mKeyframesVisible);
  dump.extra.emplace_back("pinned", mPinned);
  dump.extra.emplace_back("separatorRatio", static_cast<double>(mSeparatorRatio));
  dump.extra.emplace_back("keyframeAreaWidth", static_cast<std::int64_t>(mKeyframeAreaWidth));
  dump.extra.emplace_back("rulerEnabled", mRuler->IsEnabled());
  dump.extra.emplace_back("rulerZoomIn", static_cast<std::int64_t>(mRuler->GetZoomInTime()));
  dump.extra.emplace_back("rulerZoomOut", static_cast<std::int64_t>(mRuler->GetZoomOutTime()));
  dump.extra.emplace_back("audioTimeUnits", mAudioTimeUnits);
  dump.extra.emplace_back("masterClipTargeted", GetMasterClip() != nullptr);
  // The header's group texts, so a script can click or hover them (panel coordinates).
  const Rect header = mHeader->GetBounds();
  for (const auto& [key, zone] :
       {std::pair{"headerMasterZone", mHeader->GetMasterZoneRect()},
        std::pair{"headerSequenceZone", mHeader->GetSequenceZoneRect()}}) {
    const Point centre = zone.Center();
    dump.extra.emplace_back(std::string(key) + "X",
                            static_cast<std::int64_t>(header.left + centre.x));
    dump.extra.emplace_back(std::string(key) + "Y",
                            static_cast<std::int64_t>(header.top + centre.y));
  }
  // "name@ticks" of each marker the ruler shows, in order.
  std::string markers;
  for (const TimeBarMarker& marker : mRuler->GetMarkers()) {
    markers += (markers.empty() ? "" : ", ") + marker.name + "@" + std::to_string(marker.time);
  }
  dump.extra.emplace_back("rulerMarkers", markers);
  // Where the list lies in the panel, so a script can turn a row's top into a click.
  const Rect list = mListView->GetBounds();
  dump.extra.emplace_back("listLeft", static_cast<std::int64_t>(list.left));
  dump.extra.emplace_back("listTop", static_cast<std::int64_t>(list.top));
  dump.extra.emplace_back("listWidth", static_cast<std::int64_t>(list.Width()));
  dump.extra.emplace_back("toolMode", std::string(ToolModeName(mToolMode)));
  // Where the keyframe area lies and where the edit line crosses it, so a script can turn a
  // time into a drop point.
  const Rect keyframes = mKeyframeView->GetBounds();
  dump.extra.emplace_back("keyframeAreaLeft", static_cast<std::int64_t>(keyframes.left));
  dump.extra.emplace_back("keyframeAreaTop", static_cast<std::int64_t>(keyframes.top));
  dump.extra.emplace_back(
      "currentTimeX",
      static_cast<std::int64_t>(keyframes.left + mKeyframeView->TimeToX(mTimeline->GetEditTime())));
  const DirectManipulationManager* manager = mListView->GetDirectManipulationManager();
  const ComponentRef onScreen =
      manager != nullptr && manager->AreControlsShown() ? manager->GetFilter() : nullptr;
  dump.extra.emplace_back("directManipulation",
                          onScreen ? onScreen->GetDisplayName() : std::string());
}
