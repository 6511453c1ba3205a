#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"

#include <algorithm>
#include <cmath>
#include <functional>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/PanelTimeline.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/KeyframeCurve.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

struct SnapPreference {
  unsigned flag;
  std::string_view key;
};
constexpr SnapPreference kSnapPreferences[] = {
    {EffectControlsKeyframeView::kSnapKeyframes, "effect.controls.is.keyframe.snapping"},
    {EffectControlsKeyframeView::kSnapVideo, "effect.controls.issnapping.to.video"},
    {EffectControlsKeyframeView::kSnapAudio, "effect.controls.issnapping.to.audio"},
    {EffectControlsKeyframeView::kSnapMarkers, "effect.controls.is.snapping.to.sequence.markers"},
    {EffectControlsKeyframeView::kSnapCurrentTime, "effect.controls.is.snapping.to.cti"},
    {EffectControlsKeyframeView::kSnapClip, "effect.controls.is.snapping.to.clip"},
};

// The panel's colour when its set is registered, else the toolkit's.
Color PanelColor(std::string_view key, std::string_view fallback) {
  return ColorManager::HasColor(key) ? ColorManager::GetColor(key)
                                     : ColorManager::GetColor(fallback);
}

// Glyph kind in the keyframe image order (Linear, Bezier, AutoBezier, Hold, ...).
int GlyphKind(TemporalInterpolation interpolation) {
  switch (interpolation) {
    case TemporalInterpolation::Hold:
      return 3;
    case TemporalInterpolation::Bezier:
    case TemporalInterpolation::ContinuousBezier:
      return 1;
    case TemporalInterpolation::AutoBezier:
      return 2;
    case TemporalInterpolation::Linear:
      break;
  }
  return 0;
}

void VisitRows(const EffectItemList& list,
               const std::function<void(const std::shared_ptr<EffectItem>&)>& visit) {
  std::function<void(const std::shared_ptr<EffectItem>&)> walk =
      [&](const std::shared_ptr<EffectItem>& row) {
        visit(row);
        if (row->IsExpanded()) {
          for (const auto& child : row->GetItems()) {
            walk(child);
          }
        }
      };
  for (const auto& row : list) {
    walk(row);
  }
}

}  // namespace

EffectControlsKeyframeView::EffectControlsKeyframeView(Commander* superCommander)
    : SubView(superCommander) {
  const PropertyList& properties = Preferences::Application().Properties();
  mSnapFlags = 0;
  for (const SnapPreference& preference : kSnapPreferences) {
    if (properties.GetBool(preference.key, true)) {
      mSnapFlags |= preference.flag;
    }
  }
}

void EffectControlsKeyframeView::SetSnapFlags(unsigned flags) {
  PropertyList& properties = Preferences::Application().Properties();
  unsigned stored = mSnapFlags;
  for (const SnapPreference& preference : kSnapPreferences) {
    const bool wanted = (flags & preference.flag) != 0;
    if (wanted == ((mSnapFlags & preference.flag) != 0)) {
      continue;
    }
    // A property the user may not change keeps the area's flag as it was.
    if (properties.IsReadOnly(preference.key)) {
      continue;
    }
    properties.SetBool(preference.key, wanted);
    stored = wanted ? (stored | preference.flag) : (stored & ~preference.flag);
  }
  mSnapFlags = stored;
}

EffectControlsKeyframeView::~EffectControlsKeyframeView() = default;

void EffectControlsKeyframeView::SetTimeline(std::shared_ptr<const PanelTimeline> timeline) {
  if (mTimeline) {
    RemoveListener(mTimeline->GetStation(), *this);
  }
  mTimeline = std::move(timeline);
  if (mTimeline) {
    AddListener(mTimeline->GetStation(), *this);
  }
  Invalidate();
}

void EffectControlsKeyframeView::ListenToMessage(const Message& message) {
  if (message.Is<PanelTimelineChangedMessage>()) {
    Invalidate();
  }
}

void EffectControlsKeyframeView::SetPinToClip(bool pinned) {
  mPinned = pinned;
  Invalidate();
}

TickTime EffectControlsKeyframeView::GetEditTime() const {
  return mTimeline ? mTimeline->GetEditTime() : 0;
}

TickTime EffectControlsKeyframeView::GetVisibleStartTime() const {
  return mTimeline ? mTimeline->GetVisibleStart() : 0;
}

double EffectControlsKeyframeView::GetSecondsPerPixel() const {
  return mTimeline ? mTimeline->GetSecondsPerPixel() : 0.0;
}

double EffectControlsKeyframeView::TimeToX(TickTime time) const {
  return mTimeline ? mTimeline->TimeToX(time) : 0.0;
}

TickTime EffectControlsKeyframeView::XToTime(double x) const {
  return mTimeline ? mTimeline->XToTime(x) : 0;
}

int EffectControlsKeyframeView::GetSelectedKeyframeCount() const {
  const auto list = mList.lock();
  if (!list || !list->GetKeyframeSelection()) {
    return 0;
  }
  return static_cast<int>(list->GetKeyframeSelection()->GetKeyframeCount());
}

bool EffectControlsKeyframeView::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command == kCommandClear) {
    status.enabled = GetSelectedKeyframeCount() > 0;
    return true;
  }
  return SubView::FindCommandStatus(command, status);
}

bool EffectControlsKeyframeView::ObeyCommand(CommandID command) {
  if (command == kCommandClear) {
    DeleteSelectedKeyframes();
    return true;
  }
  return SubView::ObeyCommand(command);
}

void EffectControlsKeyframeView::DeleteSelectedKeyframes() {
  const auto list = mList.lock();
  if (!list || !list->GetKeyframeSelection() || list->GetKeyframeSelection()->IsEmpty()) {
    return;
  }
  // The selection is the list's and may be replaced by the rebuild an edit causes: keep it.
  const std::shared_ptr<KeyframeMultiSelection> selection = list->GetKeyframeSelection();
  if (selection->RemoveSelectionFromComponentParams() == EditStatus::Done) {
    selection->Clear();
    Invalidate();
  }
}

void EffectControlsKeyframeView::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const Color background =
      PanelColor("colors.effectscontrols.keyframeview.background", kColor_ContentBackground);
  const Color noClip =
      PanelColor("colors.effectscontrols.keyframeview.noclipband", kColor_WindowBackground);
  const Color separator =
      PanelColor("colors.effectscontrols.keyframeview.Hseparator", kColor_ListBoxContentDivider);
  const Color band =
      PanelColor("colors.effectscontrols.keyframeview.trimband", kColor_ControlBackground);
  const Color filterBackground =
      PanelColor("colors.effectscontrols.keyframeview.filteritembkgd", kColor_ListBoxContentNormal);
  dc.FillRect(bounds, noClip);

  const auto list = mList.lock();
  if (!list || !mTimeline || !(GetSecondsPerPixel() > 0.0)) {
    return;
  }
  // The clip's span is the area's working background; outside it the no-clip colour shows.
  const int clipLeft =
      std::max(0, static_cast<int>(std::floor(TimeToX(mTimeline->GetShownStart()))));
  const int clipRight =
      std::min(bounds.Width(), static_cast<int>(std::ceil(TimeToX(mTimeline->GetShownEnd()))));
  if (clipRight > clipLeft) {
    dc.FillRect(Rect{clipLeft, 0, clipRight, bounds.Height()}, background);
  }

  const auto draw = [&](const std::shared_ptr<EffectItem>& row) {
    if (!row->IsShown() || row->IsSetAside()) {
      return;
    }
    const int top = row->GetTop();
    const int height = row->Height();
    if (top + height < 0 || top > bounds.Height()) {
      return;
    }
    if (row->IsFilter()) {
      // The effect's band: where the clip lies, across the effect's own title row.
      if (clipRight > clipLeft) {
        dc.FillRect(Rect{clipLeft, top + 1, clipRight, top + row->OwnHeight() - 1}, band);
      }
    } else if (row->IsFolder()) {
      dc.FillRect(Rect{0, top, bounds.Width(), top + row->OwnHeight()}, filterBackground);
    }
    dc.FillRect(Rect{0, top + row->OwnHeight() - 1, bounds.Width(), top + row->OwnHeight()},
                separator);

    VisitGlyphs(*list, row, [&](const KeyframeGlyph& glyph) {
      const int index = 6 * glyph.kind + (glyph.selected ? 3 : 0);
      const Point at{glyph.centre.x - 7, glyph.centre.y - 8};
      if (mImages && index < mImages->GetCount()) {
        mImages->Draw(dc, index, at);
      } else {
        dc.DrawBitmap(*Bitmap::GetBitmap(static_cast<Decal>(index)), at);
      }
    });
  };
  VisitRows(list->GetVideoItems(), draw);
  VisitRows(list->GetGraphicsItems(), draw);
  for (const auto& part : list->GetAudioParts()) {
    VisitRows(part->GetItems(), draw);
  }

  // The current time across every track.
  const int x = static_cast<int>(std::lround(TimeToX(mTimeline->GetEditTime())));
  if (x >= 0 && x < bounds.Width()) {
    dc.FillRect(Rect{x, 0, x + 1, bounds.Height()},
                ColorManager::GetColor(kColor_CurrentTimeIndicator));
  }
}

void EffectControlsKeyframeView::VisitGlyphs(
    const EffectControlsListView& list, const std::shared_ptr<EffectItem>& row,
    const std::function<void(const KeyframeGlyph&)>& visit) const {
  const auto* control = dynamic_cast<const ParameterControl*>(row.get());
  if (control == nullptr || !control->GetParam() || !control->GetParam()->IsTimeVarying()) {
    return;
  }
  const int width = GetLocalBounds().Width();
  const auto& selection = list.GetKeyframeSelection();
  const auto& keys = control->GetParam()->GetKeyframes().Keyframes();
  const int centreY = row->GetTop() + row->OwnHeight() / 2;
  for (const auto& key : keys) {
    const ClipTime clipTime(key.time);
    const TickTime sequenceTime = control->GetTrackItem()
                                      ? control->ClipTimeToSequenceTime(clipTime).Ticks()
                                      : list.ClipTimeToSequenceTime(clipTime).Ticks();
    const int x = static_cast<int>(std::lround(TimeToX(sequenceTime)));
    if (x < -8 || x > width + 8) {
      continue;
    }
    visit(KeyframeGlyph{
        .row = control,
        .clipTime = key.time,
        .centre = Point{x, centreY},
        .selected = selection && selection->Contains(control->GetParam().get(), key.time),
        .kind = GlyphKind(key.interpolation),
    });
  }
}

std::vector<EffectControlsKeyframeView::KeyframeGlyph>
EffectControlsKeyframeView::GetKeyframeGlyphs() const {
  std::vector<KeyframeGlyph> glyphs;
  const auto list = mList.lock();
  if (!list || !mTimeline || !(GetSecondsPerPixel() > 0.0)) {
    return glyphs;
  }
  const int height = GetLocalBounds().Height();
  const auto collect = [&](const std::shared_ptr<EffectItem>& row) {
    if (!row->IsShown() || row->IsSetAside() || row->GetTop() + row->Height() < 0 ||
        row->GetTop() > height) {
      return;
    }
    VisitGlyphs(*list, row, [&glyphs](const KeyframeGlyph& glyph) { glyphs.push_back(glyph); });
  };
  VisitRows(list->GetVideoItems(), collect);
  VisitRows(list->GetGraphicsItems(), collect);
  for (const auto& part : list->GetAudioParts()) {
    VisitRows(part->GetItems(), collect);
  }
  return glyphs;
}

// --- Separator ---

void EffectControlsKeyframeView::ReportSeparator(Point point) const {
  const auto list = mList.lock();
  if (!list) {
    return;
  }
  // Both views are children of the panel view: their bounds share its coordinates.
  const int xInList = GetBounds().left + point.x - list->GetBounds().left;
  BroadcastMessage(list->GetOwnStation(),
                   EffectControlsListSeparatorMoved(Point{xInList, point.y}));
}

void EffectControlsKeyframeView::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  if (point.x < kSeparatorGrabWidth) {
    mDraggingSeparator = true;
    CaptureMouse();
  }
}

void EffectControlsKeyframeView::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDraggingSeparator) {
    ReportSeparator(point);
  }
}

void EffectControlsKeyframeView::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDraggingSeparator) {
    // The report moves this view: the last one comes from the release point.
    mDraggingSeparator = false;
    ReleaseMouse();
    ReportSeparator(point);
  }
}

bool EffectControlsKeyframeView::SetCursorSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mDraggingSeparator || point.x < kSeparatorGrabWidth) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return true;
  }
  return false;
}
