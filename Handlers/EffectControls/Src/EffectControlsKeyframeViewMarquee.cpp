#include <algorithm>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/KeyframeMarquee.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/RepeatTimer.h"

// The marquee: a press on no keyframe starts it; every move and every repeat (which scrolls the
// rows when the pointer is held near the top or bottom) selects what it covers.

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
  const int step = MarqueeScrollStep(mouse->y, GetLocalBounds());
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

int EffectControlsKeyframeView::MarqueeScrollStep(int y, const Rect& bounds) {
  int beyond = 0;
  if (y < bounds.top + kMarqueeScrollMargin) {
    beyond = y - bounds.top - kMarqueeScrollMargin;
  } else if (y > bounds.bottom - kMarqueeScrollMargin) {
    beyond = y - bounds.bottom + kMarqueeScrollMargin;
  }
  // Integer division rounds toward zero: a pixel past the margin does not scroll yet.
  return std::clamp(beyond / 2, -kMarqueeMaxScrollStep, kMarqueeMaxScrollStep);
}
