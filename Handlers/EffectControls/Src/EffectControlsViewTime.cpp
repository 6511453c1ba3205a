#include <algorithm>
#include <cmath>
#include <optional>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequencePropertyActions.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/TimeBarControl.h"

// --- Zoom ---

void EffectControlsView::ZoomToTimePerPixel(double secondsPerPixel, bool keepCurrentTime) {
  const double s = mZoomLimiter.ClampTimePerPixel(secondsPerPixel);
  const double D = mZoomLimiter.GetScrollWidth() * s * kTicksPerSecond;
  const TickTime span = static_cast<TickTime>(std::llround(D));
  const TickTime a = mRuler->GetZoomInTime();
  const TickTime b = mRuler->GetZoomOutTime();
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
  TickTime end = AddTimes(start, span);
  if (mZoomLimiter.GetDuration() < span) {
    start = minimum;
    end = maximum;
  } else if (start < minimum) {
    start = minimum;
    end = start + span;
  } else if (end > maximum) {
    start = maximum - span;
    end = maximum;
  }
  start = mZoomLimiter.ClampTime(start);
  mVisibleBaseTime = start;
  mTimePerPixel = s;
  UpdateHorizontalScroll();
  mListView->SetVisibleKeyframeTime(start);
  mListView->SetTimePerPixel(s);
  mKeyframeView->Invalidate();
  if (end > start) {
    mRuler->SetZoomInOutTime(start, end);
  }
}

void EffectControlsView::ApplyRulerZoom() {
  const TickTime zoomIn = mRuler->GetZoomInTime();
  const TickTime zoomOut = mRuler->GetZoomOutTime();
  const int K = std::max(1, mZoomLimiter.GetScrollWidth());
  if (zoomOut <= zoomIn) {
    return;
  }
  mVisibleBaseTime = zoomIn;
  mTimePerPixel = static_cast<double>(zoomOut - zoomIn) / kTicksPerSecond / K;
  UpdateHorizontalScroll();
  mListView->SetVisibleKeyframeTime(zoomIn);
  mListView->SetTimePerPixel(mTimePerPixel);
  mKeyframeView->Invalidate();
}

void EffectControlsView::ScrollVisibleTime(TickTime ticks) {
  const TickTime zoomIn = mRuler->GetZoomInTime();
  const TickTime span = mRuler->GetZoomOutTime() - zoomIn;
  if (span <= 0 || ticks == 0) {
    return;
  }
  const TickTime minimum = mZoomLimiter.GetMinTime();
  const TickTime maximum = std::max(minimum, mZoomLimiter.GetMaxTime() - span);
  const TickTime start = std::clamp(AddTimes(zoomIn, ticks), minimum, maximum);
  if (start == zoomIn) {
    return;
  }
  mRuler->SetZoomInOutTime(start, start + span);
  ApplyRulerZoom();
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
  if (end <= start) {
    return;
  }
  mRuler->SetZoomInOutTime(start, end);
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

// --- Time displays, marks and markers ---

void EffectControlsView::ReloadTimeDisplays() {
  if (!mSequence) {
    return;
  }
  mRuler->SetTimeDisplay(mSequence->GetVideoTimeDisplay(), mSequence->GetAudioTimeDisplay());
  mRuler->SetAudioTimeUnits(mAudioTimeUnits);
  mZoomLimiter.SetAudioTimeUnits(mAudioTimeUnits);
  mZoomLimiter.SetFrameDuration(mAudioTimeUnits
                                    ? mSequence->GetAudioFrameRate().GetTicksPerFrame()
                                    : mSequence->GetVideoFrameRate().GetTicksPerFrame());
  if (mTimecode) {
    mTimecode->SetFrameRate(mAudioTimeUnits ? mSequence->GetAudioTimeDisplay()
                                            : mSequence->GetVideoTimeDisplay());
  }
}

TrackItemRef EffectControlsView::GetMasterClipItem() const {
  return mMasterClip && mTargetItem && mTargetItem->GetMasterClip() == mMasterClip ? mTargetItem
                                                                                   : nullptr;
}

void EffectControlsView::ReloadInOutMarks() {
  std::optional<TickTime> in;
  std::optional<TickTime> out;
  if (const TrackItemRef item = GetMasterClipItem()) {
    // The master clip's points are media times; the ruler shows them where the clip plays them.
    if (const auto clipIn = mMasterClip->GetInPoint()) {
      in = item->ClipTimeToSequenceTime(ClipTime(*clipIn)).Ticks();
    }
    if (const auto clipOut = mMasterClip->GetOutPoint()) {
      out = item->ClipTimeToSequenceTime(ClipTime(*clipOut)).Ticks();
    }
  } else if (mSequence) {
    in = mSequence->GetInPoint();
    out = mSequence->GetOutPoint();
  }
  mRuler->SetInOutMarks(in, out);
}

void EffectControlsView::ReloadMarkers() {
  mRuler->SetMarkers(mMarkers.GetTimeBarMarkers());
}

TickTime EffectControlsView::SnapToFrame(TickTime time) const {
  if (!mSequence) {
    return time;
  }
  const FrameRate& rate =
      mAudioTimeUnits ? mSequence->GetAudioFrameRate() : mSequence->GetVideoFrameRate();
  return FrameToTime(ToFrame(time, rate), rate);
}

void EffectControlsView::OnMarkTime(const Message& message) {
  std::optional<TickTime> in;
  std::optional<TickTime> out;
  bool setIn = false;
  bool setOut = false;
  if (const auto* changedIn = message.As<MarkInTimeChangedMessage>()) {
    in = changedIn->time;
    setIn = true;
  } else if (const auto* changedOut = message.As<MarkOutTimeChangedMessage>()) {
    out = changedOut->time;
    setOut = true;
  } else if (const auto* changedBoth = message.As<MarkInOutTimeChangedMessage>()) {
    in = changedBoth->inTime;
    out = changedBoth->outTime;
    setIn = setOut = true;
  }
  if (in) {
    in = SnapToFrame(*in);
  }
  if (out) {
    out = SnapToFrame(*out);
  }
  if (const TrackItemRef item = GetMasterClipItem()) {
    // In master-clip mode the points are the clip's media times.
    const auto toClip = [&item](std::optional<TickTime> time) {
      return time ? std::optional<TickTime>(
                        item->SequenceTimeToClipTime(SequenceTime(*time)).Ticks())
                  : time;
    };
    if (setIn && setOut) {
      SequencePropertyActions::SetInOutPoints(mMasterClip, toClip(in), toClip(out));
    } else if (setIn) {
      SequencePropertyActions::SetInPoint(mMasterClip, toClip(in));
    } else if (setOut) {
      SequencePropertyActions::SetOutPoint(mMasterClip, toClip(out));
    }
  } else if (mSequence) {
    if (setIn && setOut) {
      SequencePropertyActions::SetInOutPoints(mSequence, in, out);
    } else if (setIn) {
      SequencePropertyActions::SetInPoint(mSequence, in);
    } else if (setOut) {
      SequencePropertyActions::SetOutPoint(mSequence, out);
    }
  }
  // A refused point (out before in, say) leaves the model as it was: show that.
  ReloadInOutMarks();
}

bool EffectControlsView::NavigateMasterClip(int code) {
  const TrackItemRef item = GetMasterClipItem();
  if (!item) {
    return false;
  }
  const TickTime clipTime = item->SequenceTimeToClipTime(SequenceTime(mEditLine)).Ticks();
  const auto goTo = [this, &item](TickTime time) {
    SetEditTime(item->ClipTimeToSequenceTime(ClipTime(time)).Ticks());
    return true;
  };
  switch (code) {
    case kNavMarkIn:
      return SequencePropertyActions::SetInPoint(mMasterClip, clipTime) == EditStatus::Done;
    case kNavMarkOut:
      return SequencePropertyActions::SetOutPoint(mMasterClip, clipTime) == EditStatus::Done;
    case kNavGoToIn:
      return goTo(mMasterClip->GetInPoint().value_or(0));
    case kNavGoToOut:
      if (const auto out = mMasterClip->GetOutPoint()) {
        return goTo(*out);
      }
      return false;
    case kNavClearIn:
      return SequencePropertyActions::SetInPoint(mMasterClip, std::nullopt) == EditStatus::Done;
    case kNavClearOut:
      return SequencePropertyActions::SetOutPoint(mMasterClip, std::nullopt) == EditStatus::Done;
    case kNavClearInOut:
      return SequencePropertyActions::SetInOutPoints(mMasterClip, std::nullopt, std::nullopt) ==
             EditStatus::Done;
    case kNavNextMarker:
      if (const auto next = mMasterClip->GetMarkers().NextMarkerTime(clipTime)) {
        return goTo(*next);
      }
      return false;
    case kNavPreviousMarker:
      if (const auto previous = mMasterClip->GetMarkers().PreviousMarkerTime(clipTime)) {
        return goTo(*previous);
      }
      return false;
    case kNavClearAllMarkers:
      return MarkerActions::ClearAllMarkers(mMasterClip) == EditStatus::Done;
    default:
      return false;
  }
}
