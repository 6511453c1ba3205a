#include <algorithm>
#include <cstdlib>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/IntroOutroActions.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/PersistentToolTip.h"

// The intro and outro handles of a graphics clip in the clip bar: a drag shows the dragged
// duration (and a tool tip with it) and sets it at the release as one undo step.

namespace {

constexpr const char* kIntroLengthText =
    "$$$/Vantile/HandlerEffectControls/EffectControlsKeyframeView/IntroLength=Intro Duration: ";
constexpr const char* kOutroLengthText =
    "$$$/Vantile/HandlerEffectControls/EffectControlsKeyframeView/OutroLength=Outro Duration: ";

}  // namespace

EffectControlsKeyframeView::IntroOutroHit EffectControlsKeyframeView::HitIntroOutro(
    Point point) const {
  const TrackItemRef clip = GetClip();
  const std::optional<int> barTop = GetClipBarTop();
  if (!clip || !barTop || !IntroOutroActions::CanResize(*clip)) {
    return IntroOutroHit::kNone;
  }
  // The handles live in the clip bar; below it the keyframes beside them stay reachable.
  if (point.y < *barTop || point.y >= *barTop + kClipBarHeight) {
    return IntroOutroHit::kNone;
  }
  const int introX = TimeToX(AddTimes(clip->GetStart(), clip->GetEffectiveIntroDuration()));
  const int outroX = TimeToX(SubtractTimes(clip->GetEnd(), clip->GetEffectiveOutroDuration()));
  if (std::abs(point.x - introX) <= kIntroOutroHitPixels && point.x < outroX) {
    return IntroOutroHit::kIntro;
  }
  if (std::abs(point.x - outroX) <= kIntroOutroHitPixels) {
    return IntroOutroHit::kOutro;
  }
  return IntroOutroHit::kNone;
}

void EffectControlsKeyframeView::StartIntroOutro(IntroOutroHit hit, Point point) {
  const TrackItemRef clip = GetClip();
  mGesture = hit == IntroOutroHit::kIntro ? Gesture::kIntro : Gesture::kOutro;
  mDraggedDuration = hit == IntroOutroHit::kIntro ? clip->GetEffectiveIntroDuration()
                                                  : clip->GetEffectiveOutroDuration();
  mToolTip =
      std::make_unique<PersistentToolTip>(*this, IntroOutroToolTipText(), LocalToWindow(point));
  Invalidate();
}

std::string EffectControlsKeyframeView::IntroOutroToolTipText() const {
  const auto list = mList.lock();
  const FrameRate rate =
      list && list->GetSequence() ? list->GetSequence()->GetVideoFrameRate() : kFrameRate_25;
  return LocalizeString(mGesture == Gesture::kIntro ? kIntroLengthText : kOutroLengthText) +
         rate.FormatTimecode(mDraggedDuration);
}

void EffectControlsKeyframeView::DragIntroOutro(Point point) {
  const TrackItemRef clip = GetClip();
  if (!clip) {
    return;
  }
  const FrameRate rate = clip->GetFrameRate();
  const TickTime gap = IntroOutroActions::GetMinimumGap(*clip);
  const TickTime atPointer =
      AddTimes(GetVisibleStartTime(), static_cast<TickTime>(point.x) * GetPixelSpan());
  // A short clip leaves no room: the upper bound never goes below the lower one.
  if (mGesture == Gesture::kIntro) {
    const TickTime upper =
        std::max<TickTime>(0, clip->GetDuration() - clip->GetEffectiveOutroDuration() - gap);
    mDraggedDuration = std::clamp(rate.AlignToFrame(SubtractTimes(atPointer, clip->GetStart())),
                                  TickTime{0}, upper);
  } else {
    const TickTime upper =
        std::max<TickTime>(0, clip->GetDuration() - clip->GetEffectiveIntroDuration() - gap);
    mDraggedDuration =
        std::clamp(rate.AlignToFrame(SubtractTimes(clip->GetEnd(), atPointer)), TickTime{0}, upper);
  }
  if (mToolTip) {
    mToolTip->SetText(IntroOutroToolTipText());
    mToolTip->MoveTo(LocalToWindow(point));
  }
  Redraw();
}

TickTime EffectControlsKeyframeView::GetShownIntroDuration() const {
  if (mGesture == Gesture::kIntro) {
    return mDraggedDuration;
  }
  const TrackItemRef clip = GetClip();
  return clip ? clip->GetEffectiveIntroDuration() : 0;
}

TickTime EffectControlsKeyframeView::GetShownOutroDuration() const {
  if (mGesture == Gesture::kOutro) {
    return mDraggedDuration;
  }
  const TrackItemRef clip = GetClip();
  return clip ? clip->GetEffectiveOutroDuration() : 0;
}
