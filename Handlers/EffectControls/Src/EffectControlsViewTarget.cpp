#include <algorithm>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/ScrollBar.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ZoomBar.h"

// The first clip (not transition) before or after `transition` on its track.
TrackItemRef EffectControlsView::NeighbourClip(const TrackItemRef& transition, bool before) {
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
  if (!mTargetStation.empty()) {
    RemoveListener(mTargetStation, *this);
    mTargetStation.clear();
  }
  mSequence = sequence;
  mTargetMode = kTargetNone;
  mTargetItem.reset();
  SetMasterClip(nullptr);
  mAudioPartPlaying = false;
  mListView->SetSequence(sequence);
  mMarkers.SetSequence(sequence);
  if (!sequence) {
    mHeader->SetNoTarget(0);
    FinishClipSelection(0);
    ReloadMarkers();
    return;
  }
  mSequenceStation = sequence->GetStation();
  AddListener(mSequenceStation, *this);
  AddListener(sequence->GetPlayerStation(), *this);
  mAudioTimeUnits = sequence->IsAudioFrameAligned();
  mZoomLimiter.SetAudioTimeUnits(mAudioTimeUnits);
  mRuler->SetAudioTimeUnits(mAudioTimeUnits);
  ReloadTimeDisplays();
  mRuler->SetZeroPoint(sequence->GetZeroPoint());
  if (mTimecode) {
    mTimecode->SetZeroPoint(sequence->GetZeroPoint());
  }
  ReloadMarkers();
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
  if ((mTargetMode == kTargetClip || mTargetMode == kTargetTransition) && ShowsTargetFor(groups)) {
    return;
  }
  if (!mTargetStation.empty()) {
    RemoveListener(mTargetStation, *this);
    mTargetStation.clear();
  }
  mTargetItem.reset();
  SetMasterClip(nullptr);
  mTargetMode = kTargetClip;
  mTimeline->SetEditTime(sequence->GetCurrentTime());
  SetupTimeBarZoomMinMax(groups);

  TrackItemRef video;
  TrackItemRef audio;
  // The candidates' audio part count is what the list will build; the audio buttons read the
  // built parts from the list once it has rebuilt.
  int candidates = static_cast<int>(groups.size());
  if (groups.size() == 1) {
    SequenceClipSelectionChangedForOneTrackItem(groups.front(), video, audio);
  } else if (groups.size() > 1) {
    SequenceClipSelectionChangedForMultipleTrackItems(groups, video, audio);
  }
  bool targeted = true;
  if (video && video->IsTransition()) {
    TargetTransition(video, groups);
  } else if (audio && audio->IsTransition()) {
    TargetTransition(audio, groups);
  } else if (video && video->IsClip()) {
    TargetClip(video);
  } else if (audio && audio->IsClip()) {
    TargetClip(audio);
  } else {
    targeted = false;
    mTimeline->SetVisibleStart(0);
    const int width = std::max(1, mZoomLimiter.GetScrollWidth());
    const TickTime span = mRuler->GetZoomOutTime() - mRuler->GetZoomInTime();
    if (span > 0) {
      mTimeline->SetSecondsPerPixel(static_cast<double>(span) / kTicksPerSecond / width);
    }
  }
  if (targeted) {
    candidates = 1;
  }
  FinishClipSelection(candidates);
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
  // One clip's video and audio selected as two groups of one item each, linked to each other:
  // the rule the list builds by, so the header and the list always agree.
  std::vector<TrackItemRef> videos;
  std::vector<TrackItemRef> audios;
  for (const TrackItemGroup& group : groups) {
    if (!HOST_VERIFY(!group.IsEmpty(), "Invalid TrackItemGroup")) {
      return 0;
    }
    videos.insert(videos.end(), group.videoItems.begin(), group.videoItems.end());
    audios.insert(audios.end(), group.audioItems.begin(), group.audioItems.end());
  }
  const bool linked = groups.size() == 2 && videos.size() == 1 && audios.size() == 1 &&
                      videos.front()->IsClip() && audios.front()->IsClip() &&
                      videos.front()->GetLinkGroup() != 0 &&
                      videos.front()->GetLinkGroup() == audios.front()->GetLinkGroup();
  if (!linked) {
    return 0;
  }
  video = videos.front();
  audio = audios.front();
  return static_cast<int>(audios.size());
}

void EffectControlsView::TargetClip(const TrackItemRef& item) {
  const auto [start, end] = GetTrackItemStartAndEnd(item);
  mTargetItem = item;
  SetShownRange(start, end);
  if (end > start) {
    mRuler->SetZoomInOutTime(start, end);
  }
  mHeader->SetClip(mSequence, item);
}

void EffectControlsView::TargetTransition(const TrackItemRef& item,
                                          const std::vector<TrackItemGroup>& selection) {
  mTargetMode = kTargetTransition;
  SetupTimeBarZoomMinMax(selection);
  const TickTime start = item->GetStart();
  const TickTime end = item->GetEnd();
  const TickTime duration = end - start;
  mTargetItem = item;
  SetShownRange(start, end);
  if (duration > 0) {
    mRuler->SetZoomInOutTime(std::max<TickTime>(0, start - duration), end + duration);
  }
  mHeader->SetTransition(mSequence, item, NeighbourClip(item, true), NeighbourClip(item, false));
}

const MasterClipRef& EffectControlsView::GetMasterClip() const {
  return mListView->GetMasterClip();
}

void EffectControlsView::SetMasterClip(const MasterClipRef& masterClip) {
  if (masterClip == GetMasterClip()) {
    return;
  }
  if (GetMasterClip()) {
    RemoveListener(GetMasterClip()->GetStation(), *this);
  }
  mListView->SetMasterClip(masterClip);
  if (masterClip) {
    // Its in and out points and name arrive on its own station.
    AddListener(masterClip->GetStation(), *this);
  }
}

void EffectControlsView::TargetMasterClip(const MasterClipRef& masterClip) {
  if (!masterClip) {
    return;
  }
  SetMasterClip(masterClip);
  if (mSequence) {
    mListView->DoSequenceClipSelectionChanged(mSequence);
  }
  ReloadInOutMarks();
  ReloadMarkers();
  Invalidate();
}

bool EffectControlsView::ShowsTargetFor(const std::vector<TrackItemGroup>& selection) const {
  return mListView->GetTarget() == mListView->ChooseTarget(selection);
}

void EffectControlsView::FinishClipSelection(int candidates) {
  const bool enabled = candidates == 1;
  if (!enabled) {
    mTargetMode = kTargetNone;
    mHeader->SetNoTarget(candidates);
    mZoomLimiter.SetMinMaxTime(0, 0);
    SetShownRange(0, 0);
  }
  mRuler->SetEnabled(enabled);
  mZoomBar->SetEnabled(enabled);
  mZoomBar->SetVisible(enabled && mKeyframesVisible);
  if (mTimecode) {
    mTimecode->SetEnabled(enabled);
  }
  mZoomLimiter.SetScrollWidth(mKeyframeAreaWidth);
  if (enabled) {
    SetVisibleRange(mRuler->GetZoomInTime(), mRuler->GetZoomOutTime());
  }
  SetEditTime(mSequence ? mSequence->GetCurrentTime() : 0);
  ReloadInOutMarks();
  mScrollBar->SetPosition(0);
  if (mSequence) {
    mListView->DoSequenceClipSelectionChanged(mSequence);
  }
  UpdateAudioButtons();
  ReloadMarkers();  // a master clip's markers go with its clip
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
  ShowEditTime(time);
  if (mSequence && mSequence->GetCurrentTime() != time) {
    mSequence->SetCurrentTime(time);
  }
}

void EffectControlsView::ShowEditTime(TickTime time) {
  mTimeline->SetEditTime(time);
  mRuler->SetCurrentTime(time);
  if (mTimecode) {
    mTimecode->SetTime(time);
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
    ReloadTimeDisplays();
  }
  const bool sameSelection = ShowsTargetFor(sequence->GetSelection());
  const TrackItemRef target = mTargetItem;
  const bool stillThere = target && sequence->Contains(target.get());
  if (sameSelection && stillThere && mTargetMode != kTargetNone && IsShown()) {
    if (mTargetMode == kTargetTransition) {
      SetShownRange(target->GetStart(), target->GetEnd());
      SetVisibleRange(mRuler->GetZoomInTime(), mRuler->GetZoomOutTime());
    } else {
      const auto [start, end] = GetTrackItemStartAndEnd(target);
      const bool moved = start != mTimeline->GetShownStart() || end != mTimeline->GetShownEnd();
      // The clip's band follows a trim or a move whether or not the area is pinned to it.
      SetShownRange(start, end);
      if (mPinned && moved) {
        mRuler->SetTimeRange(0, sequence->GetEnd());
        SetupTimeBarZoomMinMax(mListView->GetTarget().selection);
        SetVisibleRange(start, end);
        SetEditTime(sequence->GetCurrentTime());
      } else if (!mPinned && sequence->GetEnd() != mSequenceEnd) {
        SetupTimeBarZoomMinMax(mListView->GetTarget().selection);
        ZoomToTimePerPixel(mTimeline->GetSecondsPerPixel(), false);
      }
    }
    mKeyframeView->Invalidate();
    return;
  }
  mTargetMode = kTargetNone;
  SequenceClipSelectionChanged(sequence);
}
