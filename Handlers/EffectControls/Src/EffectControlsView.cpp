#include "Handlers/EffectControls/Src/EffectControlsView.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/EffectControlsScrollBar.h"
#include "Handlers/EffectControls/Src/EffectControlsTimeRuler.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequencePropertyActions.h"
#include "Host/Model/SequenceSettingsActions.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/ShortcutManager.h"

namespace {

constexpr std::string_view kSeparatorRatioKey = "HandlerEffectControls.SeparatorRatio";
constexpr std::string_view kSeparatorRatioMaximizedKey =
    "HandlerEffectControls.SeparatorRatioWhenMaximized";
constexpr std::string_view kKeyframesVisibleKey = "HandlerEffectControls.AreKeyframesVisible";
constexpr std::string_view kRulerNumbersKey = "be.prefs.effectcontrols.showtimerulernumbers";
constexpr int kScrollBarSize = EffectControlsScrollBar::kWidth;
constexpr TickTime kDefaultRulerEnd = 25401600000000;  // 100 s

// The first clip (not transition) before or after `transition` on its track.
TrackItemRef NeighbourClip(const TrackItemRef& transition, bool before) {
  const Track* track = transition->GetTrack();
  if (track == nullptr) {
    return nullptr;
  }
  TrackItemRef best;
  for (const TrackItemRef& item : track->GetItems()) {
    if (!item->IsClip()) {
      continue;
    }
    if (before && item->GetStart() < transition->GetStart() &&
        item->GetEnd() >= transition->GetStart() - transition->GetDuration()) {
      if (!best || item->GetEnd() > best->GetEnd()) {
        best = item;
      }
    } else if (!before && item->GetEnd() > transition->GetEnd() &&
               item->GetStart() <= transition->GetEnd()) {
      if (!best || item->GetStart() < best->GetStart()) {
        best = item;
      }
    }
  }
  return best;
}

}  // namespace

EffectControlsView::EffectControlsView(Commander* parent, std::string contextName)
    : TabView(parent),
      mContextName(std::move(contextName)),
      mStation(RegisterUniqueStation("EffectControlsView")) {
  mHeader = std::make_shared<EffectControlsListHeader>(this);
  mListView = std::make_shared<EffectControlsListView>(this, mStation);
  mListView->SetEffectControlsView(this);
  mKeyframeView = std::make_shared<EffectControlsKeyframeView>(this);
  mKeyframeView->SetListView(mListView);
  mKeyframeView->SetPinToClip(mPinned);
  mRulerHolder = std::make_shared<SubView>(this);
  mRuler = std::make_shared<EffectControlsTimeRuler>();
  mScrollBar = std::make_shared<EffectControlsScrollBar>();
  mScrollBar->SetStep(kScrollStep);

  mHeader->SetMasterClipHandler([this](const MasterClipRef& clip) { TargetMasterClip(clip); });
  mHeader->SetSequenceHandler([this]() {
    mMasterClip.reset();
    mListView->ClearMasterClip();
    mSelectedGroups.clear();
    if (mSequence) {
      SequenceClipSelectionChanged(mSequence);
    }
  });
  mRuler->SetTimeCallback([this](TickTime time, bool /*final*/) { SetEditTime(time); });
  mScrollBar->SetPositionCallback([this](int position) {
    mListView->OnVScroll(ScrollCode::kThumbPosition, position, kKeyModifierNone);
    mKeyframeView->Invalidate();
  });

  AddListener(mStation, *this);
  AddListener(mListView->GetKeyframeViewStation(), *this);
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
  DisposeStation(mStation);
}

std::string EffectControlsView::GetName() const {
  return LocalizeString("$$$/Vantile/Handlers/EffectControls/EffectControls=Effect Controls");
}

std::string EffectControlsView::GetFlyoutMenuName() const {
  return "HandlerEffectControls_Flyout_Menu";
}

void EffectControlsView::SetToolMode(int mode) {
  mToolMode = mode;
  mKeyframeView->SetToolMode(mode);
}

// --- Children and layout ---

void EffectControlsView::CreateChildrenSelf() {
  const Rect bounds = GetLocalBounds();
  AddChild(mRulerHolder);
  mRulerHolder->AddChild(mRuler);
  mRuler->SetTimeRange(0, kDefaultRulerEnd);
  mRuler->SetZoom(0, kDefaultRulerEnd);
  mRuler->SetCurrentTime(0);
  mRuler->SetInOut(std::nullopt, std::nullopt);
  mRuler->SetShowNumbers(Preferences::Application().Properties().GetBool(kRulerNumbersKey, true));

  mTimecode = std::make_shared<HotTimecodeControl>(
      Rect::FromSize(5, bounds.Height() - 20, 105, 20),
      mSequence ? mSequence->GetVideoTimeDisplay() : kFrameRate_25, 0, this);
  AddChild(mTimecode);
  AddListener(mTimecode->GetStation(), *this);

  mPlayButton = std::make_shared<MultiPictureButton>(
      Rect::FromSize(0, 0, 25, 17), kPlayAudioCommand,
      std::initializer_list<Decal>{kPlayNormalDecal, kStopNormalDecal}, this);
  mPlayButton->SetToolTip(LocalizeString(
      "$$$/Vantile/Handlers/EffectControls/PlayAudio=Play only the audio for this clip"));
  mLoopButton = std::make_shared<PictureButton>(Rect::FromSize(0, 0, 25, 18), kLoopAudioCommand,
                                                kLoopNormalDecal, kLoopOnDecal, this);
  mLoopButton->SetToolTip(LocalizeString(
      "$$$/Vantile/Handlers/EffectControls/LoopAudio=Toggle looping audio playback"));
  AddChild(mPlayButton);
  AddChild(mLoopButton);

  AddChild(mScrollBar);
  AddChild(mHeader);
  AddChild(mListView);
  AddChild(mKeyframeView);
  SetDoubleBuffered(true);
  ApplyKeyframesVisible();
  UpdateAudioButtons();
  LayoutPanel();
}

int EffectControlsView::GetScrollBarWidth() const {
  return IsStacked() ? 0 : kScrollBarSize;
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

void EffectControlsView::LayoutPanel() {
  if (mLayingOut) {
    return;
  }
  mLayingOut = true;
  const int W = GetBounds().Width();
  const int H = GetBounds().Height();
  const int S = GetScrollBarWidth();
  const int R = kScrollBarSize;
  const int T = EffectControlsTimeRuler::kRulerHeight;

  const int L = std::max(kMinListWidth,
                         static_cast<int>(std::lround(static_cast<float>(W) * CurrentRatio())));
  const int K = std::max(1, W - S - L - kSeparatorGap);
  if (mKeyframesVisible) {
    mZoomLimiter.SetScrollWidth(K);
    mRulerHolder->SetBounds(Rect::FromSize(L, 0, W - S - L - kSeparatorGap, T));
    mRuler->SetBounds(Rect::FromSize(0, 0, W - S - L - kSeparatorGap, T));
  }
  const int headerWidth = mKeyframesVisible ? (L <= W - S ? L : W) : W - 4;
  mHeader->SetBounds(Rect::FromSize(0, 0, headerWidth, T));
  const int A = mKeyframesVisible ? std::min(L, W - S) : W - 4 - S;
  mListView->SetBounds(Rect::FromSize(5, T, A - 5, H - T - kBottomBarHeight));
  mKeyframeView->SetBounds(
      Rect::FromSize(L, T, W - S - L - kSeparatorGap, H - T - R - kBottomBarHeight));
  mKeyframeAreaWidth = std::max(0, W - S - L - kSeparatorGap);
  if (mTimecode) {
    mTimecode->SetBounds(Rect::FromSize(5, H - 19, 105, 20));
  }
  if (mPlayButton) {
    mPlayButton->SetBounds(Rect::FromSize(W - 67, H - 18, 25, 18));
    mLoopButton->SetBounds(Rect::FromSize(W - 40, H - 18, 25, 18));
  }
  mScrollBar->SetBounds(Rect::FromSize(W - S, T, S, std::max(0, H - T - kBottomBarHeight)));
  mScrollBar->SetVisible(!IsStacked());
  mLayingOut = false;

  if (mKeyframesVisible && K > 0) {
    const TickTime span = mRuler->GetZoomOut() - mRuler->GetZoomIn();
    if (span > 0) {
      ZoomToTimePerPixel(static_cast<double>(span) / kTicksPerSecond / K, false);
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
  const int W = GetBounds().Width();
  const int S = GetScrollBarWidth();
  if (W < S + kMinListWidth + kMinKeyframeWidth) {
    return;
  }
  int X = listWidth;
  if (W - X - S < kMinKeyframeWidth) {
    X = W - S - kMinKeyframeWidth;
  }
  X = std::max(X, kMinListWidth);
  StoreRatio(static_cast<float>(X) / static_cast<float>(W));
  LayoutPanel();
}

void EffectControlsView::ApplyKeyframesVisible() {
  mRulerHolder->SetVisible(mKeyframesVisible);
  mRuler->SetZoomBarVisible(mKeyframesVisible);
  mKeyframeView->SetVisible(mKeyframesVisible);
  mKeyframeView->SetKeyframesVisible(mKeyframesVisible);
  mHeader->SetKeyframesVisible(mKeyframesVisible);
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
  const int W = GetBounds().Width();
  if (mKeyframesVisible && W > 0) {
    const int S = GetScrollBarWidth();
    const int L = std::max(kMinListWidth,
                           static_cast<int>(std::lround(static_cast<float>(W) * CurrentRatio())));
    if (W - S - L - kSeparatorGap < kMinKeyframeWidth) {
      StoreRatio(static_cast<float>(std::max(kMinListWidth, W - S - kMinKeyframeWidth)) /
                 static_cast<float>(W));
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
  mSeparatorRatioMaximized = state.GetFloat(kSeparatorRatioMaximizedKey, 0.0F);
  if (state.Has(kSeparatorRatioKey)) {
    mSeparatorRatio = state.GetFloat(kSeparatorRatioKey, 0.0F);
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
  mScrollBar->SetRange(contentHeight, visibleHeight);
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
  const double s = std::clamp(mTimePerPixel - event.amount * 0.5, 0.001, 1.0);
  ZoomToTimePerPixel(s, true);
  return true;
}

bool EffectControlsView::MousePanSelf(const PanEvent& event) {
  mScrollBar->ScrollBy(event.deltaY);
  return true;
}

// --- Zoom ---

void EffectControlsView::ZoomToTimePerPixel(double secondsPerPixel, bool keepCurrentTime) {
  const double s = mZoomLimiter.ClampTimePerPixel(secondsPerPixel);
  const double D = mZoomLimiter.GetScrollWidth() * s * kTicksPerSecond;
  const TickTime span = static_cast<TickTime>(std::llround(D));
  const TickTime a = mRuler->GetZoomIn();
  const TickTime b = mRuler->GetZoomOut();
  const TickTime W = b - a;
  const TickTime t = mEditLine;
  TickTime start = a;
  if (t >= a && t <= b && W > 0 && s != mTimePerPixel && keepCurrentTime) {
    const double f = static_cast<double>(t - a) / static_cast<double>(W);
    if (f > 0.18 && f < 0.82) {
      start = t - static_cast<TickTime>(std::llround(D * (0.5 - 2.0 * (0.5 - f) / 3.0)));
    } else if (f >= 0.82) {
      start = b - span;
    }
  }
  const TickTime minimum = mZoomLimiter.GetMinTime();
  const TickTime maximum = mZoomLimiter.GetMaxTime();
  if (mZoomLimiter.GetDuration() < span) {
    start = minimum;
  } else if (start < minimum) {
    start = minimum;
  } else if (start + span > maximum) {
    start = maximum - span;
  }
  start = mZoomLimiter.ClampTime(start);
  mVisibleBaseTime = start;
  mTimePerPixel = s;
  UpdateHorizontalScroll();
  mListView->SetVisibleKeyframeTime(start);
  mListView->SetTimePerPixel(s);
  mKeyframeView->Invalidate();
  mRuler->SetZoom(start, start + span);
}

void EffectControlsView::UpdateHorizontalScroll() {
  const double ticksPerPixel = mTimePerPixel * kTicksPerSecond;
  if (!(ticksPerPixel > 0.0)) {
    mScrollRange = -1;
    mScrollPosition = -1;
    mScrollScale = 0.0;
    return;
  }
  double range = static_cast<double>(mZoomLimiter.GetDuration()) / ticksPerPixel;
  double position =
      static_cast<double>(mVisibleBaseTime - mZoomLimiter.GetMinTime()) / ticksPerPixel;
  if (range > kMaxScrollRange) {
    mScrollScale = range / kMaxScrollRange;
    range = range / mScrollScale + 0.5;
    position = position / mScrollScale + 0.5;
  } else {
    mScrollScale = 0.0;
  }
  mScrollRange = static_cast<int>(std::min<double>(range, kMaxScrollRange));
  mScrollPosition = static_cast<int>(std::clamp<double>(position, 0.0, kMaxScrollRange));
}

void EffectControlsView::SetVisibleRange(TickTime start, TickTime end) {
  mRuler->SetZoom(start, end);
  const int K = std::max(1, mZoomLimiter.GetScrollWidth());
  const double s = static_cast<double>(end - start) / kTicksPerSecond / K;
  if (s > 0.0) {
    ZoomToTimePerPixel(s, false);
  }
}

std::pair<TickTime, TickTime> EffectControlsView::GetTrackItemStartAndEnd(
    const TrackItemRef& trackItem) const {
  if (!HOST_VERIFY(trackItem, "Invalid TrackItem")) {
    return {0, 0};
  }
  return {trackItem->GetStart(), trackItem->GetEnd()};
}

void EffectControlsView::SetupTimeBarZoomMinMax(const std::vector<TrackItemGroup>& selection) {
  if (!HOST_VERIFY(mSequence, "Invalid TrackItemSelection")) {
    return;
  }
  mSequenceEnd = mSequence->GetEnd();
  TickTime minimum = 0;
  TickTime maximum = mSequenceEnd;
  if (mTargetMode == kTargetTransition && selection.size() == 1) {
    const TrackItemGroup& group = selection.front();
    const TrackItemRef item =
        !group.videoItems.empty()
            ? group.videoItems.front()
            : (!group.audioItems.empty() ? group.audioItems.front() : nullptr);
    if (item && item->IsTransition()) {
      const TickTime d = item->GetDuration();
      TickTime low = item->GetStart() - d;
      TickTime high = item->GetEnd() + d;
      if (const TrackItemRef outgoing = NeighbourClip(item, true)) {
        low = std::min(low, outgoing->GetStart() - d);
      }
      if (const TrackItemRef incoming = NeighbourClip(item, false)) {
        high = std::max(high, incoming->GetEnd() + d);
      }
      minimum = std::max<TickTime>(0, low);
      maximum = high;
    }
  } else if (mTargetMode == kTargetClip && mPinned) {
    bool found = false;
    TickTime low = 0;
    TickTime high = 0;
    const auto take = [&](const TrackItemRef& item) {
      if (!item || !item->IsClip()) {
        return;
      }
      low = found ? std::min(low, item->GetStart()) : item->GetStart();
      high = found ? std::max(high, item->GetEnd()) : item->GetEnd();
      found = true;
    };
    for (const TrackItemGroup& group : selection) {
      for (const TrackItemRef& item : group.videoItems) {
        take(item);
      }
      for (const TrackItemRef& item : group.audioItems) {
        take(item);
      }
    }
    if (found) {
      minimum = low;
      maximum = high;
    }
  }
  mZoomLimiter.SetMinMaxTime(minimum, maximum);
  mRuler->SetTimeRange(minimum, maximum);
}

// --- Target ---

void EffectControlsView::OnSequenceActivated(const SequenceRef& sequence) {
  FollowSequence(sequence);
}

void EffectControlsView::FollowSequence(const SequenceRef& sequence) {
  if (!mSequenceStation.empty()) {
    RemoveListener(mSequenceStation, *this);
    mSequenceStation.clear();
  }
  if (mSequence) {
    RemoveListener(mSequence->GetPlayerStation(), *this);
  }
  mSequence = sequence;
  mSelectedGroups.clear();
  mTargetMode = kTargetNone;
  mMasterClip.reset();
  mListView->ClearMasterClip();
  mListView->SetSequence(sequence);
  if (!sequence) {
    mHeader->SetNoTarget(0);
    FinishClipSelection(0, 0);
    return;
  }
  mSequenceStation = sequence->GetStation();
  AddListener(mSequenceStation, *this);
  AddListener(sequence->GetPlayerStation(), *this);
  mRuler->SetFrameRate(sequence->GetVideoTimeDisplay());
  mRuler->SetZeroPoint(sequence->GetZeroPoint());
  if (mTimecode) {
    mTimecode->SetFrameRate(sequence->GetVideoTimeDisplay());
    mTimecode->SetZeroPoint(sequence->GetZeroPoint());
  }
  mZoomLimiter.SetFrameDuration(sequence->GetVideoFrameRate().GetTicksPerFrame());
  SequenceClipSelectionChanged(sequence);
}

void EffectControlsView::RefreshFromClipSelection() {
  if (mSequence) {
    SequenceClipSelectionChanged(mSequence);
  }
}

void EffectControlsView::SequenceClipSelectionChanged(const SequenceRef& sequence) {
  if (!HOST_VERIFY(sequence, "Invalid Sequence")) {
    return;
  }
  const std::vector<TrackItemGroup> groups = sequence->GetSelection();
  if ((mTargetMode == kTargetClip || mTargetMode == kTargetTransition) &&
      groups == mSelectedGroups) {
    return;
  }
  mSelectedGroups = groups;
  if (!mTargetStation.empty()) {
    RemoveListener(mTargetStation, *this);
    mTargetStation.clear();
  }
  mMasterClip.reset();
  mListView->ClearMasterClip();
  mTargetMode = kTargetClip;
  mEditLine = sequence->GetCurrentTime();
  SetupTimeBarZoomMinMax(groups);

  TrackItemRef video;
  TrackItemRef audio;
  int audioParts = 0;
  int state = static_cast<int>(groups.size());
  if (groups.size() == 1) {
    audioParts = SequenceClipSelectionChangedForOneTrackItem(groups.front(), video, audio);
  } else if (groups.size() > 1) {
    audioParts = SequenceClipSelectionChangedForMultipleTrackItems(groups, video, audio);
  }
  bool targeted = true;
  if (video && video->IsTransition()) {
    TargetTransition(video);
  } else if (audio && audio->IsTransition()) {
    TargetTransition(audio);
  } else if (video && video->IsClip()) {
    TargetClip(video);
  } else if (audio && audio->IsClip()) {
    TargetClip(audio);
  } else {
    targeted = false;
    mListView->SetVisibleKeyframeTime(0);
    const int K = std::max(1, mZoomLimiter.GetScrollWidth());
    const TickTime span = mRuler->GetZoomOut() - mRuler->GetZoomIn();
    if (span > 0) {
      mListView->SetTimePerPixel(static_cast<double>(span) / kTicksPerSecond / K);
    }
  }
  if (targeted) {
    state = 1;
  }
  FinishClipSelection(state, audioParts);
}

int EffectControlsView::SequenceClipSelectionChangedForOneTrackItem(const TrackItemGroup& group,
                                                                    TrackItemRef& video,
                                                                    TrackItemRef& audio) {
  if (!HOST_VERIFY(!group.IsEmpty(), "Invalid TrackItemGroup")) {
    return 0;
  }
  int audioParts = 0;
  if (group.videoItems.size() == 1) {
    video = group.videoItems.front();
    mTargetStation = video->GetStation();
  } else if (group.audioItems.size() == 1 ||
             (group.videoItems.empty() && !group.audioItems.empty())) {
    audio = group.audioItems.front();
    mTargetStation = audio->GetStation();
    audioParts = 1;
  }
  if (video) {
    audioParts = static_cast<int>(group.audioItems.size());
  }
  if (!mTargetStation.empty()) {
    AddListener(mTargetStation, *this);
  }
  return audioParts;
}

int EffectControlsView::SequenceClipSelectionChangedForMultipleTrackItems(
    const std::vector<TrackItemGroup>& groups, TrackItemRef& video, TrackItemRef& audio) {
  // The groups form one linked set when every item of every group is linked to the others
  // (one clip's video and audio selected as separate groups).
  std::vector<TrackItemRef> videos;
  std::vector<TrackItemRef> audios;
  for (const TrackItemGroup& group : groups) {
    if (!HOST_VERIFY(!group.IsEmpty(), "Invalid TrackItemGroup")) {
      return 0;
    }
    videos.insert(videos.end(), group.videoItems.begin(), group.videoItems.end());
    audios.insert(audios.end(), group.audioItems.begin(), group.audioItems.end());
  }
  const TrackItemRef first = !videos.empty() ? videos.front() : audios.front();
  bool linked = first->IsClip() && first->GetLinkGroup() != 0 && videos.size() <= 1;
  for (const auto* items : {&videos, &audios}) {
    for (const TrackItemRef& item : *items) {
      linked = linked && item->IsClip() && item->GetLinkGroup() == first->GetLinkGroup();
    }
  }
  if (!linked) {
    return 0;
  }
  if (!videos.empty()) {
    video = videos.front();
  } else {
    audio = audios.front();
  }
  return static_cast<int>(audios.size());
}

void EffectControlsView::TargetClip(const TrackItemRef& item) {
  const auto [start, end] = GetTrackItemStartAndEnd(item);
  mClipStart = start;
  mClipEnd = end;
  mKeyframeView->SetClipSpan(start, end);
  mRuler->SetZoom(start, end);
  mHeader->SetClip(mSequence, item);
}

void EffectControlsView::TargetTransition(const TrackItemRef& item) {
  mTargetMode = kTargetTransition;
  SetupTimeBarZoomMinMax(mSelectedGroups);
  const TickTime s = item->GetStart();
  const TickTime e = item->GetEnd();
  const TickTime d = e - s;
  mClipStart = s;
  mClipEnd = e;
  mKeyframeView->SetClipSpan(s, e);
  mRuler->SetZoom(std::max<TickTime>(0, s - d), e + d);
  mHeader->SetTransition(mSequence, item, NeighbourClip(item, true), NeighbourClip(item, false));
}

void EffectControlsView::TargetMasterClip(const MasterClipRef& masterClip) {
  if (!masterClip) {
    return;
  }
  mMasterClip = masterClip;
  mListView->SetMasterClip(masterClip);
  if (mSequence) {
    mListView->DoSequenceClipSelectionChanged(mSequence);
  }
  Invalidate();
}

void EffectControlsView::FinishClipSelection(int state, int audioParts) {
  const bool enabled = state == 1;
  if (!enabled) {
    mTargetMode = kTargetNone;
    mHeader->SetNoTarget(state);
    mZoomLimiter.SetMinMaxTime(0, 0);
    mKeyframeView->SetClipSpan(0, 0);
  }
  mRuler->SetEnabled(enabled);
  mRuler->SetZoomBarVisible(enabled && mKeyframesVisible);
  if (mTimecode) {
    mTimecode->SetEnabled(enabled);
  }
  mZoomLimiter.SetScrollWidth(mKeyframeAreaWidth);
  if (enabled) {
    SetVisibleRange(mRuler->GetZoomIn(), mRuler->GetZoomOut());
  }
  SetEditTime(mSequence ? mSequence->GetCurrentTime() : 0);
  if (mSequence) {
    mRuler->SetInOut(mSequence->GetInPoint(), mSequence->GetOutPoint());
  }
  mScrollBar->SetPosition(0);
  if (mSequence) {
    mListView->DoSequenceClipSelectionChanged(mSequence);
  }
  (void)audioParts;
  UpdateAudioButtons();
  LayoutPanel();
}

void EffectControlsView::UpdateAudioButtons() {
  if (!mPlayButton) {
    return;
  }
  const int parts = mListView->GetNumberOfAudioParts();
  bool anyPlayable = false;
  for (int i = 0; i < parts; ++i) {
    anyPlayable = anyPlayable || mListView->CanPlayAudioPart(i);
  }
  if (parts == 1 && anyPlayable) {
    mPlayButton->Show();
    mPlayButton->Enable();
    mLoopButton->Enable();
  } else if (parts > 1) {
    mPlayButton->Disable();
    mPlayButton->Hide();
    mLoopButton->SetEnabled(anyPlayable);
  } else {
    mPlayButton->Disable();
    mLoopButton->Disable();
  }
}

void EffectControlsView::SetEditTime(TickTime time) {
  mEditLine = time;
  mRuler->SetCurrentTime(time);
  mKeyframeView->SetEditTime(time);
  if (mTimecode) {
    mTimecode->SetTime(time);
  }
  if (mSequence && mSequence->GetCurrentTime() != time) {
    mSequence->SetCurrentTime(time);
  }
}

void EffectControlsView::OnSequenceChanged(const SequenceRef& sequence, bool settingsChanged) {
  if (!HOST_VERIFY(sequence, "Invalid Sequence")) {
    return;
  }
  if (sequence != mSequence) {
    return;
  }
  if (settingsChanged) {
    mRuler->SetFrameRate(sequence->GetVideoTimeDisplay());
    mZoomLimiter.SetFrameDuration(sequence->GetVideoFrameRate().GetTicksPerFrame());
  }
  const bool sameSelection = sequence->GetSelection() == mSelectedGroups;
  TrackItemRef target;
  for (const TrackItemGroup& group : mSelectedGroups) {
    for (const auto* items : {&group.videoItems, &group.audioItems}) {
      if (!items->empty() && !target) {
        target = items->front();
      }
    }
  }
  const bool stillThere = target && sequence->Contains(target.get());
  if (sameSelection && stillThere && mTargetMode != kTargetNone) {
    if (mTargetMode == kTargetTransition) {
      SetVisibleRange(mRuler->GetZoomIn(), mRuler->GetZoomOut());
    } else if (mPinned) {
      const auto [start, end] = GetTrackItemStartAndEnd(target);
      if (start != mClipStart || end != mClipEnd) {
        mRuler->SetTimeRange(0, sequence->GetEnd());
        SetupTimeBarZoomMinMax(mSelectedGroups);
        mClipStart = start;
        mClipEnd = end;
        mKeyframeView->SetClipSpan(start, end);
        SetVisibleRange(start, end);
        SetEditTime(sequence->GetCurrentTime());
      }
    }
    mKeyframeView->Invalidate();
    return;
  }
  mSelectedGroups.clear();
  mTargetMode = kTargetNone;
  SequenceClipSelectionChanged(sequence);
}

// --- Commands ---

bool EffectControlsView::FindCommandStatus(CommandID command, CommandStatus& status) {
  const bool readOnly = mListView->IsReadOnlyEffectContainer();
  switch (command) {
    case kToggleKeyframesCommand:
      status.enabled = true;
      status.checked = mKeyframesVisible;
      return true;
    case kPinToClipCommand:
      status.enabled = mTargetMode == kTargetClip;
      status.checked = mPinned;
      return true;
    case kAudioTimeUnitsCommand:
      status.enabled = mSequence != nullptr;
      status.checked = mAudioTimeUnits;
      return true;
    case kRulerNumbersCommand:
      status.enabled = true;
      status.checked = mRuler->GetShowNumbers();
      return true;
    case kLoopAudioCommand:
      status.enabled = true;
      status.checked = mAudioLoop;
      return true;
    case kZoomInCommand:
    case kZoomOutCommand:
      status.enabled = mTargetMode != kTargetNone;
      return true;
    case kRenameCommand: {
      status.enabled = !readOnly && mListView->GetSelectedItems().GetEntries().size() == 1;
      return true;
    }
    default:
      break;
  }
  return TabView::FindCommandStatus(command, status);
}

bool EffectControlsView::ObeyCommand(CommandID command) {
  switch (command) {
    case kToggleKeyframesCommand:
      ToggleKeyframesVisible();
      return true;
    case kZoomInCommand:
      ZoomToTimePerPixel(mTimePerPixel * 0.5, true);
      return true;
    case kZoomOutCommand:
      ZoomToTimePerPixel(mTimePerPixel * 2.0, true);
      return true;
    case kPinToClipCommand:
      if (mTargetMode == kTargetClip) {
        mPinned = !mPinned;
        mKeyframeView->SetPinToClip(mPinned);
        SetupTimeBarZoomMinMax(mSelectedGroups);
        ZoomToTimePerPixel(mTimePerPixel, true);
      }
      return true;
    case kAudioTimeUnitsCommand:
      SetAudioTimeUnits(!mAudioTimeUnits);
      if (mSequence) {
        SequenceSettingsActions::SetAudioFrameAligned(mSequence, !mAudioTimeUnits);
      }
      return true;
    case kRulerNumbersCommand:
      mRuler->SetShowNumbers(!mRuler->GetShowNumbers());
      return true;
    case kLoopAudioCommand:
      mAudioLoop = !mAudioLoop;
      if (mLoopButton) {
        mLoopButton->SetSelected(mAudioLoop);
      }
      return true;
    case kRenameCommand:
      RenameSelectedEffect();
      return true;
    default:
      break;
  }
  // Effect and row commands go to the list first.
  if (mListView->ObeyCommand(command)) {
    return true;
  }
  return TabView::ObeyCommand(command);
}

void EffectControlsView::SetAudioTimeUnits(bool audioUnits) {
  mAudioTimeUnits = audioUnits;
  mZoomLimiter.SetAudioTimeUnits(audioUnits);
  if (mSequence) {
    const FrameRate display =
        audioUnits ? mSequence->GetAudioTimeDisplay() : mSequence->GetVideoTimeDisplay();
    mRuler->SetFrameRate(display);
    if (mTimecode) {
      mTimecode->SetFrameRate(display);
    }
    mZoomLimiter.SetFrameDuration(audioUnits ? mSequence->GetAudioFrameRate().GetTicksPerFrame()
                                             : mSequence->GetVideoFrameRate().GetTicksPerFrame());
  }
}

void EffectControlsView::RenameSelectedEffect() {
  const auto& entries = mListView->GetSelectedItems().GetEntries();
  if (entries.size() != 1 || mListView->IsReadOnlyEffectContainer()) {
    return;
  }
  const ComponentRef component = entries.front().component;
  if (!component) {
    return;
  }
  const auto name = InputBox::Ask("$$$/Vantile/Handlers/EffectControls/RenameItem=Rename Item",
                                  "$$$/Vantile/Handlers/EffectControls/NewName=New Name",
                                  component->GetInstanceName());
  if (name && !name->empty() && *name != component->GetInstanceName()) {
    ComponentActions::SetInstanceName(component, *name);
  }
}

void EffectControlsView::NowOnDuty() {
  ShortcutManager::Instance().SetActiveContext(mContextName);
  if (mSequenceChangedOffDuty && mSequence) {
    mSequenceChangedOffDuty = false;
    OnSequenceChanged(mSequence);
  }
}

// --- Messages ---

void EffectControlsView::ListenToMessage(const Message& message) {
  if (const auto* m = message.As<SequenceClipSelectionChangedMessage>()) {
    if (m->sequence == mSequence) {
      SequenceClipSelectionChanged(m->sequence);
    }
  } else if (const auto* activated = message.As<SequenceActivatedMessage>()) {
    if (activated->sequence != mSequence) {
      FollowSequence(activated->sequence);
    }
  } else if (const auto* opened = message.As<SequenceOpenedMessage>()) {
    if (opened->sequence != mSequence) {
      FollowSequence(opened->sequence);
    }
  } else if (const auto* focused = message.As<SequenceFocusedMessage>()) {
    if (focused->sequence != mSequence) {
      FollowSequence(focused->sequence);
    }
  } else if (const auto* closed = message.As<SequenceClosedMessage>()) {
    if (closed->sequence == mSequence) {
      FollowSequence(nullptr);
    }
  } else if (const auto* changed = message.As<SequenceChangedMessage>()) {
    if (!IsShown()) {
      mSequenceChangedOffDuty = true;
    } else {
      OnSequenceChanged(changed->sequence, changed->settingsChanged);
    }
  } else if (const auto* settings = message.As<SequenceSettingsChangedMessage>()) {
    if (settings->sequence == mSequence) {
      SetAudioTimeUnits(mAudioTimeUnits);
    }
  } else if (const auto* named = message.As<SequenceNameChangedMessage>()) {
    if (named->sequence == mSequence && mTargetMode != kTargetNone) {
      mSelectedGroups.clear();
      mTargetMode = kTargetNone;
      SequenceClipSelectionChanged(mSequence);
    }
  } else if (const auto* zero = message.As<SequenceZeroPointChangedMessage>()) {
    if (zero->sequence == mSequence) {
      mRuler->SetZeroPoint(zero->zeroPoint);
      if (mTimecode) {
        mTimecode->SetZeroPoint(zero->zeroPoint);
      }
    }
  } else if (message.Is<TrackItemLinkStatusChangedMessage>()) {
    if (mSequence) {
      mSelectedGroups.clear();
      mTargetMode = kTargetNone;
      SequenceClipSelectionChanged(mSequence);
    }
  } else if (const auto* properties = message.As<PropertiesChangedMessage>()) {
    if (mSequence && properties->objectID == mSequence->GetID()) {
      for (const std::string& key : properties->keys) {
        if (key == "MZ.InPoint" || key == "MZ.OutPoint") {
          mRuler->SetInOut(mSequence->GetInPoint(), mSequence->GetOutPoint());
        } else if (key == "MZ.FrameAlignment" &&
                   mSequence->IsAudioFrameAligned() == mAudioTimeUnits) {
          SetAudioTimeUnits(!mSequence->IsAudioFrameAligned());
        }
      }
    }
  } else if (const auto* position = message.As<PlayerPositionChangedMessage>()) {
    if (position->sequence == mSequence) {
      mEditLine = position->time;
      mRuler->SetCurrentTime(position->time);
      mKeyframeView->SetEditTime(position->time);
      if (mTimecode) {
        mTimecode->SetTime(position->time);
      }
    }
  } else if (message.Is<MarkersChangedMessage>()) {
    mRuler->Invalidate();
  } else if (const auto* typed = message.As<HotTimecodeValueChangedMessage>()) {
    SetEditTime(typed->time);
  } else if (const auto* typing = message.As<HotTimecodeValueChangingMessage>()) {
    SetEditTime(typing->time);
  } else if (message.Is<EffectControlsListChangedMessage>()) {
    mListView->UpdateVScrollBar();
    UpdateAudioButtons();
    mKeyframeView->Invalidate();
  } else if (const auto* moved = message.As<EffectControlsListSeparatorMoved>()) {
    OnSeparatorMoved(moved->point.x + mListView->GetBounds().left);
  } else if (message.Is<EffectControlsRefreshKeyframesMessage>()) {
    mKeyframeView->Invalidate();
  } else if (message.Is<EffectControlsFilterSelectionChangedMessage>()) {
    mKeyframeView->Invalidate();
  } else if (message.Is<MasterClipNameChangedMessage>() ||
             message.Is<MasterClipClipChangedMessage>()) {
    Invalidate();
  }
}

// --- Paint ---

void EffectControlsView::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  dc.FillRect(bounds, ColorManager::GetColor(kColor_WindowBackground));
  const Color divider = ColorManager::GetColor(kColor_Divider);
  const int T = EffectControlsTimeRuler::kRulerHeight;
  dc.FillRect(Rect{0, T - 1, bounds.Width(), T}, divider);
  if (mKeyframesVisible) {
    const int x = mKeyframeView->GetBounds().left - kSeparatorGap / 2;
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
    properties.SetBool(kRulerNumbersKey, mRuler->GetShowNumbers());
  }
}

// --- Dump ---

void EffectControlsView::FillStateDump(PanelStateDump& dump) const {
  dump.headerText = mHeader->GetDisplayText();
  dump.targetMode = mTargetMode;
  dump.rows = mListView->GetDumpRows();
  if (mKeyframesVisible) {
    StateDumpKeyframeArea area;
    area.visibleStartTime = mListView->GetVisibleKeyframeTime();
    area.secondsPerPixel = mListView->GetTimePerPixel();
    dump.keyframeArea = area;
  }
  dump.extra.emplace_back("selectedKeyframeCount",
                          static_cast<std::int64_t>(mKeyframeView->GetSelectedKeyframeCount()));
  dump.extra.emplace_back("keyframesVisible", mKeyframesVisible);
  dump.extra.emplace_back("pinned", mPinned);
  dump.extra.emplace_back("separatorRatio", static_cast<double>(mSeparatorRatio));
  dump.extra.emplace_back("keyframeAreaWidth", static_cast<std::int64_t>(mKeyframeAreaWidth));
  dump.extra.emplace_back("rulerEnabled", mRuler->IsEnabled());
}
