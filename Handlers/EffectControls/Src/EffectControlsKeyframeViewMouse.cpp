#include <algorithm>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/IntroOutroActions.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"

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
