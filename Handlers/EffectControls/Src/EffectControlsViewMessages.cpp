#include <memory>
#include <string>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsHandler.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsListHeader.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/TimeBarControl.h"

namespace {

struct DeferredViewWorkMessage : MessageOf<DeferredViewWorkMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsView.DeferredViewWorkMessage";
  DeferredViewWorkMessage(EffectControlsView::DeferredWork work, std::int64_t id, TickTime t)
      : kind(work), markerID(id), time(t) {}
  EffectControlsView::DeferredWork kind;
  std::int64_t markerID;
  TickTime time;
};

}  // namespace

// --- Messages ---

void EffectControlsView::Defer(DeferredWork work, std::int64_t markerID, TickTime time) {
  PostMessageToUIThread(mStation, std::make_shared<DeferredViewWorkMessage>(work, markerID, time));
}

void EffectControlsView::OnDeferred(DeferredWork work, std::int64_t markerID, TickTime time) {
  switch (work) {
    case DeferredWork::kReloadMarkers:
      ReloadMarkers();
      break;
    case DeferredWork::kInvalidate:
      Invalidate();
      break;
    case DeferredWork::kMoveMarker:
      mMarkers.Move(markerID, time);
      ReloadMarkers();
      break;
    case DeferredWork::kEditMarker:
      EditMarker(markerID);
      break;
  }
}

void EffectControlsView::AudioPartPlayStarted() {
  if (!mAudioPartPlaying && mSequence) {
    mPositionBeforeAudioPart = mSequence->GetCurrentTime();
  }
  mAudioPartPlaying = true;
  if (mPlayButton) {
    mPlayButton->SetValue(1);
  }
}

void EffectControlsView::AudioPartPlayStopped() {
  if (!mAudioPartPlaying) {
    return;
  }
  mAudioPartPlaying = false;
  if (mPlayButton) {
    mPlayButton->SetValue(0);
  }
  // The list's own stop handling arrives with audio part playback.
  if (mSequence) {
    SetEditTime(mPositionBeforeAudioPart);
  }
  BroadcastMessage(std::string(EffectControlsHandler::kAudioPlayerRelayStation),
                   AudioPlayerIsStoppedMessage());
}

void EffectControlsView::ListenToMessage(const Message& message) {
  if (const auto* deferred = message.As<DeferredViewWorkMessage>()) {
    OnDeferred(deferred->kind, deferred->markerID, deferred->time);
  } else if (const auto* m = message.As<SequenceClipSelectionChangedMessage>()) {
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
      Invalidate();
    }
  } else if (const auto* changed = message.As<SequenceChangedMessage>()) {
    if (changed->sequence != mSequence) {
      return;
    }
    if (!IsShown()) {
      mSequenceChangedOffDuty = true;
    } else {
      OnSequenceChanged(changed->sequence, changed->settingsChanged);
    }
  } else if (const auto* settings = message.As<SequenceSettingsChangedMessage>()) {
    if (settings->sequence == mSequence) {
      ReloadTimeDisplays();
    }
  } else if (const auto* named = message.As<SequenceNameChangedMessage>()) {
    if (named->sequence == mSequence && mTargetItem) {
      if (mTargetMode == kTargetTransition) {
        mHeader->SetTransition(mSequence, mTargetItem, NeighbourClip(mTargetItem, true),
                               NeighbourClip(mTargetItem, false));
      } else if (mTargetMode == kTargetClip && !mHeader->IsShowingMasterClip()) {
        mHeader->SetClip(mSequence, mTargetItem);
      }
    }
  } else if (const auto* zero = message.As<SequenceZeroPointChangedMessage>()) {
    if (zero->sequence == mSequence) {
      mRuler->SetZeroPoint(zero->zeroPoint);
      if (mTimecode) {
        mTimecode->SetZeroPoint(zero->zeroPoint);
      }
    }
  } else if (const auto* link = message.As<TrackItemLinkStatusChangedMessage>()) {
    // Refreshes only when the linking changed the selected groups.
    if (mSequence && link->sequence == mSequence) {
      SequenceClipSelectionChanged(mSequence);
    }
  } else if (const auto* properties = message.As<PropertiesChangedMessage>()) {
    const bool ofSequence = mSequence && properties->objectID == mSequence->GetID();
    const bool ofMasterClip = GetMasterClip() && properties->objectID == GetMasterClip()->GetID();
    for (const std::string& key : properties->keys) {
      if ((ofSequence || ofMasterClip) &&
          (key == kPropertyKey_InPoint || key == kPropertyKey_OutPoint)) {
        ReloadInOutMarks();
      } else if (ofSequence && key == kPropertyKey_FrameAlignment &&
                 mSequence->IsAudioFrameAligned() != mAudioTimeUnits) {
        SetAudioTimeUnits(mSequence->IsAudioFrameAligned());
      }
    }
  } else if (const auto* position = message.As<PlayerPositionChangedMessage>()) {
    if (position->sequence == mSequence) {
      ShowEditTime(position->time);
      if (mAudioPartPlaying) {
        BroadcastMessage(std::string(EffectControlsHandler::kAudioPlayerRelayStation),
                         AudioPlayerPositionChangedMessage(position->time));
      }
    }
  } else if (const auto* stopped = message.As<PlayerIsStoppedMessage>()) {
    if (stopped->sequence == mSequence) {
      AudioPartPlayStopped();
    }
  } else if (message.Is<EffectControlsAudioPartPlayStartedMessage>()) {
    AudioPartPlayStarted();
  } else if (const auto* scrubbing = message.As<EditTimeChangingMessage>()) {
    if (mSequence && !mScrubbing) {
      mScrubbing = true;
      mSequence->SetPlayerState(PlayerState::Scrubbing);
    }
    SetEditTime(scrubbing->time);
  } else if (const auto* scrubbed = message.As<EditTimeChangedMessage>()) {
    SetEditTime(scrubbed->time);
    if (mSequence && mScrubbing) {
      mSequence->SetPlayerState(PlayerState::Stopped);
    }
    mScrubbing = false;
  } else if (message.Is<ZoomInOutTimeChangingMessage>() ||
             message.Is<ZoomInOutTimeChangedMessage>() || message.Is<SlideZoomMessage>()) {
    ApplyRulerZoom();
  } else if (const auto* typed = message.As<HotTimecodeValueChangedMessage>()) {
    SetEditTime(typed->time);
  } else if (const auto* typing = message.As<HotTimecodeValueChangingMessage>()) {
    SetEditTime(typing->time);
  } else if (message.Is<MarkInTimeChangedMessage>() || message.Is<MarkOutTimeChangedMessage>() ||
             message.Is<MarkInOutTimeChangedMessage>()) {
    OnMarkTime(message);
  } else if (message.Is<MarkInTimeChangingMessage>() || message.Is<MarkOutTimeChangingMessage>() ||
             message.Is<MarkInOutTimeChangingMessage>()) {
    // The ruler shows the mark while it is dragged; the release sets it as one undo step.
  } else if (message.Is<MarkersChangedMessage>()) {
    Defer(DeferredWork::kReloadMarkers);
  } else if (const auto* moved = message.As<MarkerTimeChangedMessage>()) {
    Defer(DeferredWork::kMoveMarker, moved->markerID, SnapToFrame(moved->newTime));
  } else if (const auto* edit = message.As<EditSequenceMarkerMessage>()) {
    Defer(DeferredWork::kEditMarker, edit->markerID);
  } else if (const auto* right = message.As<TimebarRightButtonDownMessage>()) {
    const Rect holder = mRulerHolder->GetBounds();
    TrackPopupMenu(kSequenceMarkerMenu, Point{holder.left + right->point.x,
                                              holder.top + kZoomBarHeight + right->point.y});
  } else if (message.Is<EffectControlsListChangedMessage>()) {
    mListView->UpdateVScrollBar();
    UpdateAudioButtons();
    mKeyframeView->Invalidate();
  } else if (const auto* separator = message.As<EffectControlsListSeparatorMoved>()) {
    OnSeparatorMoved(separator->point.x + mListView->GetBounds().left);
  } else if (const auto* autoScroll = message.As<EffectControlsAutoScrollMessage>()) {
    ScrollVisibleTime(autoScroll->amount);
  } else if (const auto* dragTime = message.As<EffectControlsKeyframeDragTimeMessage>()) {
    // The ruler follows the dragged keyframes, then goes back to the edit line.
    mRuler->SetCurrentTime(dragTime->time.value_or(mTimeline->GetEditTime()));
  } else if (const auto* become = message.As<EffectControlsBecomeTargetMessage>()) {
    if (become->recomputeZoomRange && mSequence && mTargetMode != kTargetNone) {
      SetupTimeBarZoomMinMax(mListView->GetTarget().selection);
      ApplyRulerZoom();
    }
    mKeyframeView->Invalidate();
  } else if (message.Is<EffectControlsRefreshKeyframesMessage>() ||
             message.Is<EffectControlsFilterSelectionChangedMessage>()) {
    // Command states are asked for when menus open; only the keyframe area shows a change.
    mKeyframeView->Invalidate();
  } else if (const auto* scroll = message.As<ScrollVerticalMessage>()) {
    mListView->OnVScroll(scroll->code, scroll->position, scroll->flags);
    mKeyframeView->Invalidate();
  } else if (message.Is<MasterClipNameChangedMessage>() ||
             message.Is<MasterClipClipChangedMessage>()) {
    Defer(DeferredWork::kInvalidate);
  }
}
