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
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/HotTextControl.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"

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

}  // namespace

EffectControlsKeyframeView::EffectControlsKeyframeView(Commander* superCommander)
    : SubView(superCommander) {
  const PropertyList& properties = Preferences::Application().Properties();
  mSnapFlags = 0;
  for (const SnapPreference& preference : kSnapPreferences) {
    // A preference absent from the store counts as on.
    if (properties.GetBool(preference.key, true)) {
      mSnapFlags |= preference.flag;
    }
  }
}

EffectControlsKeyframeView::~EffectControlsKeyframeView() = default;

void EffectControlsKeyframeView::DestroySelf() {
  // The rows may outlive this area: none may keep pointing at it, shown or not.
  if (const auto list = mList.lock()) {
    std::function<void(const std::shared_ptr<EffectItem>&)> forget =
        [&](const std::shared_ptr<EffectItem>& row) {
          auto* param = dynamic_cast<ParameterControl*>(row.get());
          if (param != nullptr && param->GetKeyframeViewer() == this) {
            param->SetKeyframeViewer(nullptr);
          }
          for (const auto& child : row->GetItems()) {
            forget(child);
          }
        };
    const auto forgetAll = [&](const EffectItemList& rows) {
      for (const auto& row : rows) {
        forget(row);
      }
    };
    forgetAll(list->GetGraphicsItems());
    forgetAll(list->GetVideoItems());
    for (const auto& part : list->GetAudioParts()) {
      forgetAll(part->GetItems());
    }
  }
  mActor.reset();
  mToolTip.reset();
  RemoveListenerFromAllStations(*this);
  SubView::DestroySelf();
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
  if (const auto* changed = message.As<PanelTimelineChangedMessage>()) {
    if (changed->Has(PanelTimeline::kEditTimeChanged) && mTimeline) {
      SetCurrentTime(mTimeline->GetEditTime());
    }
    Invalidate();
  } else if (message.Is<RepeatMessage>()) {
    if (mGesture == Gesture::kMarquee) {
      AutoScrollMarquee();
    }
  }
}

void EffectControlsKeyframeView::SetPinToClip(bool pinned) {
  mPinned = pinned;
  Invalidate();
}

TickTime EffectControlsKeyframeView::GetEditTime() const {
  return mTimeline ? mTimeline->GetEditTime() : 0;
}

void EffectControlsKeyframeView::SetCurrentTime(TickTime /*time*/) {
  const auto selection = GetSelection();
  if (!selection || selection->IsEmpty() || !IsShown() || IsTarget()) {
    return;
  }
  Commander* super = GetSuperCommander();
  if (super == nullptr || !super->IsOnDuty()) {
    return;
  }
  // Typing in a field of the panel goes on: the keys stay with it.
  if (const auto* field = dynamic_cast<const HotTextControl*>(&GetTarget());
      field != nullptr && field->IsEditing()) {
    return;
  }
  BecomeTarget();
}

// --- Time mapping ---

TickTime EffectControlsKeyframeView::GetVisibleStartTime() const {
  return mTimeline ? mTimeline->GetVisibleStart() : 0;
}

double EffectControlsKeyframeView::GetSecondsPerPixel() const {
  return mTimeline ? mTimeline->GetSecondsPerPixel() : 0.0;
}

int EffectControlsKeyframeView::TimeToX(TickTime sequenceTime) const {
  if (!mTimeline) {
    return 0;
  }
  const std::int64_t frames =
      ToFrame(SubtractTimes(sequenceTime, GetVisibleStartTime()), mTimeline->GetPixelFrameRate());
  return static_cast<int>(std::clamp<std::int64_t>(frames, -kMaxPixel, kMaxPixel));
}

TickTime EffectControlsKeyframeView::XToTime(int x) const {
  if (!mTimeline) {
    return 0;
  }
  const int clamped = std::clamp(x, 0, GetLocalBounds().right);
  const double ticks =
      static_cast<double>(clamped) * GetSecondsPerPixel() * static_cast<double>(kTicksPerSecond);
  return AddTimes(GetVisibleStartTime(), static_cast<TickTime>(std::trunc(ticks)));
}

TickTime EffectControlsKeyframeView::GetPixelSpan() const {
  return static_cast<TickTime>(
      std::trunc(GetSecondsPerPixel() * static_cast<double>(kTicksPerSecond)));
}

// --- Rows ---

std::vector<EffectControlsKeyframeView::Section> EffectControlsKeyframeView::CollectSections(
    bool stopBelow) const {
  std::vector<Section> sections;
  const auto list = mList.lock();
  if (!list) {
    return sections;
  }
  const int bottom = GetLocalBounds().bottom;
  const auto collect = [&](const EffectItemList& rows) {
    Section section;
    bool stopped = false;
    std::function<void(const std::shared_ptr<EffectItem>&)> walk =
        [&](const std::shared_ptr<EffectItem>& row) {
          if (stopped || !row->IsShown() || row->IsSetAside()) {
            return;
          }
          if (stopBelow && row->GetTop() > bottom) {
            stopped = true;
            return;
          }
          section.tracks.push_back(Track{row, dynamic_cast<ParameterControl*>(row.get())});
          if (row->IsExpanded()) {
            for (const auto& child : row->GetItems()) {
              walk(child);
            }
          }
        };
    for (const auto& row : rows) {
      walk(row);
    }
    if (!section.tracks.empty()) {
      section.top = section.tracks.front().row->GetTop();
      section.bottom = section.tracks.back().row->GetTop() + section.tracks.back().row->OwnHeight();
      for (const Track& track : section.tracks) {
        section.bottom = std::max(section.bottom, track.row->GetBottom());
      }
      sections.push_back(std::move(section));
    }
  };
  if (list->IsGraphicsExpanded()) {
    collect(list->GetGraphicsItems());
  }
  if (list->IsVideoExpanded()) {
    collect(list->GetVideoItems());
  }
  for (const auto& part : list->GetAudioParts()) {
    if (part->IsClipPart() && part->IsExpanded()) {
      collect(part->GetItems());
    }
  }
  return sections;
}

bool EffectControlsKeyframeView::IsKeyframeTrack(const Track& track) {
  return track.param != nullptr && track.param->GetParam() && track.param->IsTimeVarying();
}

TrackItemRef EffectControlsKeyframeView::GetClip() const {
  const auto list = mList.lock();
  if (!list) {
    return nullptr;
  }
  if (list->GetVideoTrackItem() && list->GetVideoTrackItem()->IsClip()) {
    return list->GetVideoTrackItem();
  }
  for (const auto& part : list->GetAudioParts()) {
    if (part->IsClipPart()) {
      return part->GetTrackItem();
    }
  }
  return nullptr;
}

std::shared_ptr<KeyframeMultiSelection> EffectControlsKeyframeView::GetSelection() const {
  const auto list = mList.lock();
  return list ? list->GetKeyframeSelection() : nullptr;
}

bool EffectControlsKeyframeView::IsReadOnly() const {
  const auto list = mList.lock();
  return !list || list->IsReadOnlyEffectContainer();
}

int EffectControlsKeyframeView::GetSelectedKeyframeCount() const {
  const auto selection = GetSelection();
  return selection ? static_cast<int>(selection->GetKeyframeCount()) : 0;
}

std::vector<EffectControlsKeyframeView::KeyframeGlyph>
EffectControlsKeyframeView::GetKeyframeGlyphs() const {
  std::vector<KeyframeGlyph> glyphs;
  if (!mTimeline || !(GetSecondsPerPixel() > 0.0)) {
    return glyphs;
  }
  const auto selection = GetSelection();
  const int width = GetLocalBounds().Width();
  for (const Section& section : CollectSections(true)) {
    for (const Track& track : section.tracks) {
      if (!IsKeyframeTrack(track) || track.row->GetBottom() < 0) {
        continue;
      }
      const int centreY = track.row->GetTop() + ParameterControl::kKeyframeStripHeight / 2;
      for (const TickTime time : track.param->GetParam()->GetKeyframeTimes()) {
        const int x = TimeToX(track.param->ClipTimeToSequenceTime(ClipTime(time)).Ticks());
        if (x < -8 || x > width + 8) {
          continue;
        }
        glyphs.push_back(KeyframeGlyph{
            .row = track.param,
            .clipTime = time,
            .centre = Point{x, centreY},
            .selected = selection && selection->Contains(track.param->GetParam().get(), time),
        });
      }
    }
  }
  return glyphs;
}

std::set<TickTime> EffectControlsKeyframeView::CollectKeyframeTimes() const {
  std::set<TickTime> times;
  for (const Section& section : CollectSections(false)) {
    for (const Track& track : section.tracks) {
      if (IsKeyframeTrack(track)) {
        track.param->GetKeyframeTimes(times, TimeLine::kSequence);
      }
    }
  }
  return times;
}

std::optional<TickTime> EffectControlsKeyframeView::NavigateKeyframe(bool forward) {
  const std::set<TickTime> times = CollectKeyframeTimes();
  const TickTime now = GetEditTime();
  std::optional<TickTime> found;
  if (forward) {
    if (const auto it = times.upper_bound(now); it != times.end()) {
      found = *it;
    }
  } else if (const auto it = times.lower_bound(now); it != times.begin()) {
    found = *std::prev(it);
  }
  const auto selection = GetSelection();
  if (!found || !selection) {
    return found;
  }
  selection->Clear();
  for (const Section& section : CollectSections(false)) {
    for (const Track& track : section.tracks) {
      if (!IsKeyframeTrack(track)) {
        continue;
      }
      const TickTime clipTime = track.param->SequenceTimeToClipTime(SequenceTime(*found)).Ticks();
      selection->AddItem(track.param->GetTrackItem(), track.param->GetComponent(),
                         track.param->GetParam(), clipTime);
    }
  }
  Invalidate();
  return found;
}

// --- Separator and announcements ---

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

void EffectControlsKeyframeView::AnnounceDragTime(std::optional<TickTime> time) const {
  if (const auto list = mList.lock()) {
    BroadcastMessage(list->GetKeyframeViewStation(), EffectControlsKeyframeDragTimeMessage(time));
  }
}
