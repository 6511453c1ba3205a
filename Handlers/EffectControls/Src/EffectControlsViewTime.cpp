#include <algorithm>
#include <cmath>
#include <optional>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequencePropertyActions.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotTimecodeControl.h"
#include "Host/Toolkit/TimeBarControl.h"

namespace {

// Where the edit line sits in the visible range, as a share of its width: at or below the left
// zone a zoom holds the left edge, at or above the right zone the right edge.
constexpr double kLeftEdgeZone = 0.18;
constexpr double kRightEdgeZone = 0.82;

// The start of the range after a zoom that keeps `editLine` in view. `shownIn`..`shownOut`: the
// range before (not empty, holding the edit line); `exactSpan` and `span`: its length after, in
// ticks exactly and rounded. In between the zones the edit line moves a third of the way
// toward the middle.
TickTime StartAroundEditLine(TickTime editLine, TickTime shownIn, TickTime shownOut,
                             double exactSpan, TickTime span) {
  const double share =
      static_cast<double>(editLine - shownIn) / static_cast<double>(shownOut - shownIn);
  if (share >= kRightEdgeZone) {
    return shownOut - span;
  }
  if (share <= kLeftEdgeZone) {
    return shownIn;
  }
  const double shareAfter = 0.5 - 2.0 * (0.5 - share) / 3.0;
  return editLine - static_cast<TickTime>(std::llround(exactSpan * shareAfter));
}

// The seconds per pixel that show `span` ticks across `width` pixels (at least one).
double SecondsPerPixelFor(TickTime span, int width) {
  return static_cast<double>(span) / kTicksPerSecond / std::max(1, width);
}

}  // namespace

// --- Zoom ---

TickTime EffectControlsView::GetClipStart() const {
  return mTimeline->GetShownStart();
}

TickTime EffectControlsView::GetClipEnd() const {
  return mTimeline->GetShownEnd();
}

double EffectControlsView::GetTimePerPixel() const {
  return mTimeline->GetSecondsPerPixel();
}

TickTime EffectControlsView::GetVisibleBaseTime() const {
  return mTimeline->GetVisibleStart();
}

void EffectControlsView::ZoomToTimePerPixel(double secondsPerPixel, bool keepCurrentTime) {
  const double limited = mZoomLimiter.ClampTimePerPixel(secondsPerPixel);
  // The same zoom again leaves the range where it is.
  ApplyZoom(limited, keepCurrentTime && limited != mTimeline->GetSecondsPerPixel());
}

void EffectControlsView::ApplyZoom(double secondsPerPixel, bool keepEditLine) {
  const double exactSpan = mZoomLimiter.GetScrollWidth() * secondsPerPixel * kTicksPerSecond;
  const TickTime span = static_cast<TickTime>(std::llround(exactSpan));
  const TickTime shownIn = mRuler->GetZoomInTime();
  const TickTime shownOut = mRuler->GetZoomOutTime();
  const TickTime editLine = mTimeline->GetEditTime();
  const bool editLineShown = editLine >= shownIn && editLine <= shownOut && shownOut > shownIn;
  TickTime start = shownIn;
  if (keepEditLine && editLineShown) {
    start = StartAroundEditLine(editLine, shownIn, shownOut, exactSpan, span);
  }
  // The range stays inside the limiter's; a range longer than it shows all of it.
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
  mTimeline->SetVisibleStart(start);
  mTimeline->SetSecondsPerPixel(secondsPerPixel);
  UpdateHorizontalScroll();
  mKeyframeView->Invalidate();
  if (end > start) {
    mRuler->SetZoomInOutTime(start, end);
  }
}

void EffectControlsView::ApplyRulerZoom() {
  const TickTime zoomIn = mRuler->GetZoomInTime();
  const TickTime zoomOut = mRuler->GetZoomOutTime();
  if (zoomOut <= zoomIn) {
    return;
  }
  mTimeline->SetVisibleStart(zoomIn);
  mTimeline->SetSecondsPerPixel(
      SecondsPerPixelFor(zoomOut - zoomIn, mZoomLimiter.GetScrollWidth()));
  UpdateHorizontalScroll();
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
  const double ticksPerPixel = mTimeline->GetSecondsPerPixel() * kTicksPerSecond;
  if (!(ticksPerPixel > 0.0)) {
    mScrollRange = -1;
    mScrollPosition = -1;
    mScrollScale = 0.0;
    return;
  }
  double range = static_cast<double>(mZoomLimiter.GetDuration()) / ticksPerPixel;
  double position =
      static_cast<double>(mTimeline->GetVisibleStart() - mZoomLimiter.GetMinTime()) / ticksPerPixel;
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
  ZoomToTimePerPixel(SecondsPerPixelFor(end - start, mZoomLimiter.GetScrollWidth()), false);
}

void EffectControlsView::SetShownRange(TickTime start, TickTime end) {
  mTimeline->SetShownRange(start, end);
  mKeyframeView->Invalidate();
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
      const TickTime duration = item->GetDuration();
      TickTime low = item->GetStart() - duration;
      TickTime high = item->GetEnd() + duration;
      if (const TrackItemRef outgoing = NeighbourClip(item, true)) {
        low = std::min(low, outgoing->GetStart() - duration);
      }
      if (const TrackItemRef incoming = NeighbourClip(item, false)) {
        high = std::max(high, incoming->GetEnd() + duration);
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
  return GetMasterClip() && mTargetItem && mTargetItem->GetMasterClip() == GetMasterClip()
             ? mTargetItem
             : nullptr;
}

void EffectControlsView::ReloadInOutMarks() {
  std::optional<TickTime> in;
  std::optional<TickTime> out;
  if (const TrackItemRef item = GetMasterClipItem()) {
    // The master clip's points are media times; the ruler shows them where the clip plays them.
    if (const auto clipIn = GetMasterClip()->GetInPoint()) {
      in = item->ClipTimeToSequenceTime(ClipTime(*clipIn)).Ticks();
    }
    if (const auto clipOut = GetMasterClip()->GetOutPoint()) {
      out = item->ClipTimeToSequenceTime(ClipTime(*clipOut)).Ticks();
    }
  } else if (mSequence) {
    in = mSequence->GetInPoint();
    out = mSequence->GetOutPoint();
  }
  mRuler->SetInOutMarks(in, out);
}

void EffectControlsView::ReloadMarkers() {
  mMarkers.SetMasterClip(GetMasterClip(), GetMasterClipItem());
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
      SequencePropertyActions::SetInOutPoints(GetMasterClip(), toClip(in), toClip(out));
    } else if (setIn) {
      SequencePropertyActions::SetInPoint(GetMasterClip(), toClip(in));
    } else if (setOut) {
      SequencePropertyActions::SetOutPoint(GetMasterClip(), toClip(out));
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

bool EffectControlsView::NavigateMasterClip(MasterClipNavigation code) {
  const TrackItemRef item = GetMasterClipItem();
  if (!item) {
    return false;
  }
  const TickTime clipTime =
      item->SequenceTimeToClipTime(SequenceTime(mTimeline->GetEditTime())).Ticks();
  const auto goTo = [this, &item](TickTime time) {
    SetEditTime(item->ClipTimeToSequenceTime(ClipTime(time)).Ticks());
    return true;
  };
  switch (code) {
    case kNavMarkIn:
      return SequencePropertyActions::SetInPoint(GetMasterClip(), clipTime) == EditStatus::Done;
    case kNavMarkOut:
      return SequencePropertyActions::SetOutPoint(GetMasterClip(), clipTime) == EditStatus::Done;
    case kNavGoToIn:
      return goTo(GetMasterClip()->GetInPoint().value_or(0));
    case kNavGoToOut:
      if (const auto out = GetMasterClip()->GetOutPoint()) {
        return goTo(*out);
      }
      return false;
    case kNavClearIn:
      return SequencePropertyActions::SetInPoint(GetMasterClip(), std::nullopt) == EditStatus::Done;
    case kNavClearOut:
      return SequencePropertyActions::SetOutPoint(GetMasterClip(), std::nullopt) ==
             EditStatus::Done;
    case kNavClearInOut:
      return SequencePropertyActions::SetInOutPoints(GetMasterClip(), std::nullopt, std::nullopt) ==
             EditStatus::Done;
    case kNavNextMarker:
      if (const auto next = GetMasterClip()->GetMarkers().NextMarkerTime(clipTime)) {
        return goTo(*next);
      }
      return false;
    case kNavPreviousMarker:
      if (const auto previous = GetMasterClip()->GetMarkers().PreviousMarkerTime(clipTime)) {
        return goTo(*previous);
      }
      return false;
    case kNavClearAllMarkers:
      return MarkerActions::ClearAllMarkers(GetMasterClip()) == EditStatus::Done;
    default:
      return false;
  }
}
