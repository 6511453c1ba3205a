#include <algorithm>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/KeyframeMarquee.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/IntroOutroActions.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"

namespace {

constexpr const char* kIntroLengthText =
    "$$$/Vantile/HandlerEffectControls/EffectControlsKeyframeView/IntroLength=Intro Duration: ";
constexpr const char* kOutroLengthText =
    "$$$/Vantile/HandlerEffectControls/EffectControlsKeyframeView/OutroLength=Outro Duration: ";

// Integer division toward zero, as the marquee's scroll steps are specified.
int MarqueeStep(int beyond, int limit) {
  return std::clamp(beyond / 2, -limit, limit);
}

}  // namespace

// --- Press ---

void EffectControlsKeyframeView::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (mGesture != Gesture::kIdle) {
    return;
  }
  if (point.x < kSeparatorGrabWidth) {
    mGesture = Gesture::kSeparator;
    CaptureMouse();
    return;
  }
  PressAt(point, modifiers, MouseButton::kLeft);
}

void EffectControlsKeyframeView::RightButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (mGesture != Gesture::kIdle) {
    return;
  }
  PressAt(point, modifiers, MouseButton::kRight);
}

void EffectControlsKeyframeView::PressAt(Point point, KeyModifiers modifiers, MouseButton button) {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !mTimeline || !selection) {
    return;
  }
  const std::vector<Section> sections = CollectSections(false);
  // The transition's own area takes presses in a transition's view; none is drawn here.
  if (sections.empty() || list->GetTargetKind() == EffectControlsListView::kTargetTransition) {
    return;
  }
  if (!IsTarget()) {
    BecomeTarget();
  }
  ResetGestureState();
  mPressPoint = point;
  mPressModifiers = modifiers;
  mSelectionAtPress = selection->Clone();
  if (button == MouseButton::kLeft) {
    CaptureMouse();
    if (const IntroOutroHit hit = HitIntroOutro(point); hit != IntroOutroHit::kNone) {
      StartIntroOutro(hit, point);
      return;
    }
  }
  for (const Section& section : sections) {
    for (const Track& track : section.tracks) {
      if (!IsKeyframeTrack(track)) {
        continue;
      }
      const int inStrip = point.y - track.row->GetTop();
      if (inStrip >= 0 && inStrip < ParameterControl::kKeyframeStripHeight &&
          PressKeyframe(track, point, modifiers, button)) {
        return;
      }
    }
  }
  if (button == MouseButton::kRight) {
    ShowMenu(kAreaMenu, point);
    return;
  }
  StartMarquee(point, modifiers);
}

bool EffectControlsKeyframeView::PressKeyframe(const Track& track, Point point,
                                               KeyModifiers modifiers, MouseButton button) {
  ParameterControl& row = *track.param;
  TickTime hitTime = 0;
  if (!row.HitKeyframe(point, GetVisibleStartTime(), mTimeline->GetPixelFrameRate(), hitTime)) {
    return false;
  }
  const auto selection = GetSelection();
  const TickTime clipTime = row.SequenceTimeToClipTime(SequenceTime(hitTime)).Ticks();
  const bool selected = selection->Contains(row.GetParam().get(), clipTime);
  const bool modifier = IsShiftDown(modifiers) || IsCtrlDown(modifiers);
  if (selected && modifier) {
    selection->RemoveItem(row.GetParam().get(), clipTime);
  } else {
    if (!selected && (button == MouseButton::kRight || !modifier)) {
      selection->Clear();
    }
    selection->AddItem(row.GetTrackItem(), row.GetComponent(), row.GetParam(), clipTime);
  }
  if (button == MouseButton::kRight) {
    Redraw();
    ShowMenu(selection->HasSpatialKeyframe() ? kSpatialKeyframeMenu : kKeyframeMenu, point);
    return true;
  }
  if (!IsReadOnly()) {
    mGesture = Gesture::kKeyframeDrag;
    mPressedRow = track.row;
    mAnchorTime = hitTime;
    mLastDragX = point.x;
    if (IsSnapFlagSet(kSnapKeyframes)) {
      RebuildSnapSet();
    }
  }
  Invalidate();
  return true;
}

void EffectControlsKeyframeView::StartMarquee(Point point, KeyModifiers modifiers) {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!IsShiftDown(modifiers) && !IsCtrlDown(modifiers)) {
    selection->Clear();
  }
  // A press beside the effect whose on-screen controls show keeps that effect selected.
  const auto row = list->FindItemFromPoint(Point{0, point.y});
  const ComponentRef manipulated = list->GetDirectManipulationComponent();
  const auto* filter = dynamic_cast<const FilterItem*>(row.get());
  const bool onManipulated = filter != nullptr && manipulated && filter->Component() == manipulated;
  if (!onManipulated) {
    list->ClearSelection();
  }
  mGesture = Gesture::kMarquee;
  mMarqueeAnchor = point;
  mMarqueePoint = point;
  mMarqueeAnchorTime = XToTime(point.x);
  SetCurrentCursor(Cursor::kPrecisePath);
  if (!mListeningToRepeat) {
    AddListener(RepeatTimer::Instance().GetStation(), *this);
    mListeningToRepeat = true;
  }
  Invalidate();
}

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

void EffectControlsKeyframeView::ShowMenu(const char* menu, Point point) {
  TrackPopupMenu(menu, point);
}

// --- Moves ---

void EffectControlsKeyframeView::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  switch (mGesture) {
    case Gesture::kSeparator:
      ReportSeparator(point);
      return;
    case Gesture::kKeyframeDrag:
      DragKeyframes(point, modifiers);
      return;
    case Gesture::kMarquee:
      UpdateMarquee(point);
      return;
    case Gesture::kIntro:
    case Gesture::kOutro:
      DragIntroOutro(point);
      return;
    case Gesture::kIdle:
      break;
  }
}

void EffectControlsKeyframeView::DragKeyframes(Point point, KeyModifiers /*modifiers*/) {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  const auto* row = dynamic_cast<const ParameterControl*>(mPressedRow.get());
  if (!list || !selection || selection->IsEmpty() || IsReadOnly() || row == nullptr ||
      point.x == mLastDragX) {
    return;
  }
  mLastDragX = point.x;
  AutoScrollHorizontally(point);
  const Rect bounds = GetLocalBounds();
  const TickTime pointerTime = XToTime(point.x);
  std::optional<TickTime> snapped;
  if (IsSnapFlagSet(kSnapKeyframes)) {
    snapped = mSnapSet.Snap(pointerTime, kSnapTolerancePixels * GetPixelSpan());
  }
  const int x = std::clamp(snapped ? TimeToX(*snapped) : point.x, 0, bounds.right);
  mGuideSnapped = snapped.has_value();
  mGuideX = x;
  const TickTime newTime =
      snapped ? *snapped
              : AddTimes(GetVisibleStartTime(), static_cast<TickTime>(x) * GetPixelSpan());
  AnnounceDragTime(newTime);
  // The total from the press: a move held back at a clip edge does not drift afterwards.
  const TickTime delta =
      SubtractTimes(row->SequenceTimeToClipTime(SequenceTime(newTime)).Ticks(),
                    row->SequenceTimeToClipTime(SequenceTime(mAnchorTime)).Ticks());
  if (!mActor) {
    mActor = std::make_unique<KeyframeMultiSelectionActor>(list->GetSequence(), selection);
  }
  mActor->MoveSelectionTo(delta);
  mMoved = true;
  Redraw();
}

void EffectControlsKeyframeView::AutoScrollHorizontally(Point point) {
  const auto list = mList.lock();
  const int right = GetLocalBounds().right;
  int beyond = 0;
  if (point.x < kAutoScrollMargin) {
    beyond = point.x - kAutoScrollMargin;
  } else if (point.x > right - kAutoScrollMargin) {
    beyond = point.x - (right - kAutoScrollMargin);
  }
  if (beyond != 0 && list) {
    BroadcastMessage(list->GetKeyframeViewStation(),
                     EffectControlsAutoScrollMessage(beyond * GetPixelSpan()));
  }
}

void EffectControlsKeyframeView::UpdateMarquee(Point point) {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !selection) {
    return;
  }
  mMarqueePoint = point;
  std::vector<KeyframeMarquee::Track> tracks;
  for (const Section& section : CollectSections(false)) {
    for (const Track& track : section.tracks) {
      if (IsKeyframeTrack(track)) {
        tracks.push_back(KeyframeMarquee::Track{
            .top = track.row->GetTop(),
            .bottom = track.row->GetBottom(),
            .trackItem = track.param->GetTrackItem(),
            .component = track.param->GetComponent(),
            .param = track.param->GetParam(),
        });
      }
    }
  }
  const Rect rect = GetMarqueeRect();
  const TickTime pointTime = XToTime(point.x);
  KeyframeMultiSelection found(list->GetSequence());
  if (rect.Width() >= 1) {
    KeyframeMarquee::Collect(tracks, rect.top, rect.bottom, std::min(mMarqueeAnchorTime, pointTime),
                             std::max(mMarqueeAnchorTime, pointTime), found);
  }
  if (IsShiftDown(mPressModifiers)) {
    selection->AddItems(found);
  } else if (IsCtrlDown(mPressModifiers) && mSelectionAtPress) {
    *selection = *mSelectionAtPress;
    selection->InvertItems(found);
  } else {
    *selection = found;
  }
  Redraw();
}

void EffectControlsKeyframeView::AutoScrollMarquee() {
  const auto list = mList.lock();
  const std::optional<Point> mouse = GetMouseLocation();
  if (!list || !mouse) {
    return;
  }
  const Rect bounds = GetLocalBounds();
  int step = 0;
  if (mouse->y < bounds.top + kMarqueeScrollMargin) {
    step = MarqueeStep(mouse->y - bounds.top - kMarqueeScrollMargin, kMarqueeMaxScrollStep);
  } else if (mouse->y > bounds.bottom - kMarqueeScrollMargin) {
    step = MarqueeStep(mouse->y - bounds.bottom + kMarqueeScrollMargin, kMarqueeMaxScrollStep);
  }
  if (step == 0) {
    return;
  }
  const int before = list->GetScrollOffset();
  list->OnVScroll(ScrollCode::kThumbPosition, before + step, kKeyModifierNone);
  list->UpdateVScrollBar();
  // The anchor stays on the content it was pressed on.
  mMarqueeAnchor.y -= list->GetScrollOffset() - before;
  UpdateMarquee(*mouse);
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

// --- Release and cancel ---

void EffectControlsKeyframeView::LeftButtonUpSelf(Point point, KeyModifiers modifiers) {
  FinishGesture(point, modifiers);
}

void EffectControlsKeyframeView::FinishGesture(Point point, KeyModifiers /*modifiers*/) {
  const Gesture gesture = mGesture;
  mGesture = Gesture::kIdle;
  if (HasMouseCapture()) {
    ReleaseMouse();
  }
  switch (gesture) {
    case Gesture::kSeparator:
      // The report moves this view: the last one comes from the release point.
      ReportSeparator(point);
      break;
    case Gesture::kKeyframeDrag:
      if (mActor && mMoved && !IsReadOnly()) {
        mActor->CommitMoveSelection();
      }
      mActor.reset();
      if (mMoved) {
        AnnounceDragTime(std::nullopt);
      }
      break;
    case Gesture::kMarquee:
      break;
    case Gesture::kIntro:
    case Gesture::kOutro:
      if (const TrackItemRef clip = GetClip()) {
        if (gesture == Gesture::kIntro) {
          IntroOutroActions::SetIntroDuration(clip, mDraggedDuration);
        } else {
          IntroOutroActions::SetOutroDuration(clip, mDraggedDuration);
        }
      }
      break;
    case Gesture::kIdle:
      break;
  }
  ResetGestureState();
  Invalidate();
}

void EffectControlsKeyframeView::CancelGesture() {
  const Gesture gesture = mGesture;
  if (gesture == Gesture::kIdle) {
    return;
  }
  mGesture = Gesture::kIdle;
  if (HasMouseCapture()) {
    ReleaseMouse();
  }
  if (gesture == Gesture::kKeyframeDrag) {
    if (mActor) {
      mActor->RollbackMoveSelection();
    }
    mActor.reset();
    if (mMoved) {
      AnnounceDragTime(std::nullopt);
    }
  }
  // The selection goes back to what it was before the press.
  if (gesture != Gesture::kSeparator && mSelectionAtPress) {
    if (const auto selection = GetSelection()) {
      *selection = *mSelectionAtPress;
    }
  }
  ResetGestureState();
  Invalidate();
}

void EffectControlsKeyframeView::MouseCaptureLostSelf() {
  CancelGesture();
}

void EffectControlsKeyframeView::ResetGestureState() {
  mPressedRow.reset();
  mActor.reset();
  mMoved = false;
  mGuideSnapped = false;
  mToolTip.reset();
  if (mListeningToRepeat) {
    RemoveListener(RepeatTimer::Instance().GetStation(), *this);
    mListeningToRepeat = false;
  }
  if (mGesture == Gesture::kIdle) {
    mSelectionAtPress.reset();
  }
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

// --- Hover, pan and keys ---

bool EffectControlsKeyframeView::SetCursorSelf(Point point, KeyModifiers modifiers) {
  if (mGesture == Gesture::kSeparator || point.x < kSeparatorGrabWidth) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return true;
  }
  if (mGesture == Gesture::kMarquee) {
    SetCurrentCursor(Cursor::kPrecisePath);
    return true;
  }
  if (mGesture == Gesture::kIntro || mGesture == Gesture::kOutro ||
      HitIntroOutro(point) != IntroOutroHit::kNone) {
    mTool.SetCursor(KeyframeViewTool::kSituationIntroOutro);
    return true;
  }
  mTool.SetCursor(mTool.GetEffectiveTool(modifiers) == KeyframeViewTool::kSituationZoomOut
                      ? KeyframeViewTool::kSituationZoomOut
                      : KeyframeViewTool::kSituationPointer);
  return true;
}

bool EffectControlsKeyframeView::MousePanSelf(const PanEvent& /*event*/) {
  // The panel view scrolls its ruler for a pan over any of its children.
  return false;
}

bool EffectControlsKeyframeView::KeyDownSelf(const KeyEvent& event) {
  if (event.key == KeyCode::kEscape && mGesture != Gesture::kIdle) {
    CancelGesture();
    return true;
  }
  if ((event.key == KeyCode::kLeft || event.key == KeyCode::kRight) && mGesture == Gesture::kIdle &&
      GetSelectedKeyframeCount() > 0 && !IsReadOnly()) {
    const int frames = IsShiftDown(event.modifiers) ? kLargeNudgeFrames : 1;
    NudgeSelection(event.key == KeyCode::kLeft ? -frames : frames);
    return true;
  }
  return SubView::KeyDownSelf(event);
}

void EffectControlsKeyframeView::NudgeSelection(int frames) {
  const auto list = mList.lock();
  const auto selection = GetSelection();
  if (!list || !list->GetSequence() || !selection || selection->IsEmpty() || IsReadOnly()) {
    return;
  }
  const TickTime frame = list->GetSequence()->GetVideoFrameRate().GetTicksPerFrame();
  KeyframeMultiSelectionActor actor(list->GetSequence(), selection);
  if (actor.MoveSelectionTo(static_cast<TickTime>(frames) * frame) && actor.HasMoved()) {
    actor.CommitMoveSelection();
  }
  Invalidate();
}
