#include "Host/Shell/TimelineView.h"

#include <algorithm>
#include <cmath>
#include <string>

#include "Host/Messaging/Station.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Shell/Application.h"
#include "Host/Shell/ShellMessages.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/KeyModifiers.h"

namespace {

constexpr Color kBackground(30, 30, 30);
constexpr Color kRulerColor(42, 42, 42);
constexpr Color kRulerText(170, 170, 170);
constexpr Color kHeaderColor(48, 48, 48);
constexpr Color kHeaderText(200, 200, 200);
constexpr Color kTrackColor(36, 36, 36);
constexpr Color kTrackLine(24, 24, 24);
constexpr Color kItemText(20, 20, 20);
constexpr Color kSelectedFrame(255, 255, 255);
constexpr Color kTransitionColor(150, 150, 200);
constexpr Color kEditLineColor(70, 130, 220);
constexpr int kTickSpacing = 90;    // pixels between ruler labels, about
constexpr double kZoomStep = 1.25;  // one wheel notch
constexpr int kWheelScrollPixels = 40;
constexpr double kMinTicksPerPixel = 1000.0;

Color LabelColor(std::uint32_t rgb) {
  return Color(static_cast<std::uint8_t>((rgb >> 16) & 0xFF),
               static_cast<std::uint8_t>((rgb >> 8) & 0xFF), static_cast<std::uint8_t>(rgb & 0xFF));
}

// The items that a click takes with `item`: its link group, else itself.
TrackItemGroup GroupOf(const Sequence& sequence, const TrackItemRef& item, bool linked) {
  TrackItemGroup group;
  sequence.ForEachTrackItem([&](const TrackItemRef& other) {
    const bool same = other == item || (linked && item->GetLinkGroup() != 0 &&
                                        other->GetLinkGroup() == item->GetLinkGroup());
    if (same)
      (other->GetMediaType() == MediaType::Video ? group.videoItems : group.audioItems)
          .push_back(other);
  });
  return group;
}

bool GroupHolds(const TrackItemGroup& group, const TrackItemRef& item) {
  return std::find(group.videoItems.begin(), group.videoItems.end(), item) !=
             group.videoItems.end() ||
         std::find(group.audioItems.begin(), group.audioItems.end(), item) !=
             group.audioItems.end();
}

}  // namespace

TimelineView::TimelineView(Application& application) : mApplication(application) {
  AddListener(kSequenceActivationStation, *this);
}

TimelineView::~TimelineView() {
  RemoveListenerFromAllStations(*this);
}

SequenceRef TimelineView::FollowActiveSequence() {
  SequenceRef active = mApplication.GetActiveSequence();
  if (active == mSequence)
    return active;
  RemoveListenerFromAllStations(*this);
  AddListener(kSequenceActivationStation, *this);
  mSequence = active;
  mTicksPerPixel = 0.0;
  mVisibleStart = 0;
  if (mSequence != nullptr) {
    AddListener(mSequence->GetStation(), *this);
    AddListener(mSequence->GetPlayerStation(), *this);
  }
  return active;
}

void TimelineView::ListenToMessage(const Message& /*message*/) {
  // Selection, structure, the edit line or another sequence: all of it is drawn here.
  Invalidate();
}

std::vector<TrackRef> TimelineView::TracksTopFirst(const Sequence& sequence) const {
  // As editors stack them: the highest video track at the top, V1 above A1.
  std::vector<TrackRef> tracks(sequence.GetVideoTracks().rbegin(),
                               sequence.GetVideoTracks().rend());
  tracks.insert(tracks.end(), sequence.GetAudioTracks().begin(), sequence.GetAudioTracks().end());
  return tracks;
}

Rect TimelineView::TrackRect(std::size_t row) const {
  const int top = kRulerHeight + static_cast<int>(row) * kTrackHeight;
  return {0, top, GetSize().width, top + kTrackHeight};
}

double TimelineView::GetTicksPerPixel() const {
  if (mTicksPerPixel > 0.0)
    return mTicksPerPixel;
  // Fit the sequence (and a little after it) into the tracks' width.
  const SequenceRef sequence = mApplication.GetActiveSequence();
  const TickTime end =
      sequence != nullptr ? std::max(sequence->GetEnd(), kTicksPerSecond) : kTicksPerSecond;
  const int width = std::max(1, GetSize().width - kHeaderWidth);
  return std::max(kMinTicksPerPixel, static_cast<double>(end) * 1.05 / width);
}

double TimelineView::TimeToX(TickTime time) const {
  return kHeaderWidth + static_cast<double>(time - mVisibleStart) / GetTicksPerPixel();
}

TickTime TimelineView::XToTime(int x) const {
  return mVisibleStart + static_cast<TickTime>(std::floor((x - kHeaderWidth) * GetTicksPerPixel()));
}

std::vector<TimelineView::ItemPlace> TimelineView::GetItemPlaces() const {
  std::vector<ItemPlace> places;
  const SequenceRef sequence = mApplication.GetActiveSequence();
  if (sequence == nullptr)
    return places;
  const std::vector<TrackRef> tracks = TracksTopFirst(*sequence);
  const Rect area{kHeaderWidth, kRulerHeight, GetSize().width, GetSize().height};
  for (std::size_t row = 0; row < tracks.size(); ++row) {
    const Rect band = TrackRect(row);
    // Transitions last: they lie over the cut, above the clips they join.
    for (const bool transitions : {false, true}) {
      for (const TrackItemRef& item : tracks[row]->GetItems()) {
        if (item->IsTransition() != transitions)
          continue;
        const int left = static_cast<int>(std::lround(TimeToX(item->GetStart())));
        const int right = static_cast<int>(std::lround(TimeToX(item->GetEnd())));
        const Rect rect = transitions ? Rect{left, band.top + 8, right, band.bottom - 8}
                                      : Rect{left, band.top + 2, right, band.bottom - 2};
        const Rect shown = rect.Intersect(area);
        if (!shown.IsEmpty())
          places.push_back({item, shown});
      }
    }
  }
  return places;
}

TrackItemRef TimelineView::ItemAt(Point point) const {
  TrackItemRef found;
  for (const ItemPlace& place : GetItemPlaces()) {
    // Each track's transitions come after its clips: the last hit is the one on top.
    if (place.rect.Contains(point))
      found = place.item;
  }
  return found;
}

void TimelineView::SetBoundsSelf(const Rect& /*bounds*/) {
  Invalidate();
}

void TimelineView::PaintSelf(DC& dc) {
  const SequenceRef sequence = FollowActiveSequence();
  const Size size = GetSize();
  dc.FillRect({0, 0, size.width, size.height}, kBackground);
  if (sequence == nullptr)
    return;
  const std::vector<TrackRef> tracks = TracksTopFirst(*sequence);
  const std::vector<ItemPlace> places = GetItemPlaces();
  for (std::size_t row = 0; row < tracks.size(); ++row)
    PaintTrack(dc, *sequence, places, tracks[row], TrackRect(row));
  PaintRuler(dc, *sequence);
  const int x = static_cast<int>(std::lround(TimeToX(sequence->GetCurrentTime())));
  if (x >= kHeaderWidth)
    dc.DrawLine({x, 0}, {x, size.height}, kEditLineColor);
}

void TimelineView::PaintRuler(DC& dc, const Sequence& sequence) const {
  const int width = GetSize().width;
  dc.FillRect({0, 0, width, kRulerHeight}, kRulerColor);
  const Font font(kFont_Small);
  // Labels on whole frames, about kTickSpacing pixels apart.
  const TickTime frame = std::max<TickTime>(1, sequence.GetVideoFrameRate().GetTicksPerFrame());
  const auto framesApart = std::max<TickTime>(
      1, static_cast<TickTime>(std::ceil(kTickSpacing * GetTicksPerPixel() / frame)));
  const TickTime step = framesApart * frame;
  TickTime time = std::max<TickTime>(0, mVisibleStart / step * step);
  for (; TimeToX(time) < width; time += step) {
    const int x = static_cast<int>(std::lround(TimeToX(time)));
    if (x < kHeaderWidth)
      continue;
    dc.DrawLine({x, kRulerHeight - 6}, {x, kRulerHeight}, kRulerText);
    dc.DrawTextAt(sequence.GetVideoFrameRate().FormatTimecode(time), {x + 3, 4}, font, kRulerText);
  }
}

void TimelineView::PaintTrack(DC& dc, const Sequence& sequence,
                              const std::vector<ItemPlace>& places, const TrackRef& track,
                              const Rect& row) const {
  dc.FillRect(row, kTrackColor);
  dc.DrawLine({0, row.bottom - 1}, {row.right, row.bottom - 1}, kTrackLine);
  dc.FillRect({0, row.top, kHeaderWidth, row.bottom}, kHeaderColor);
  const Font font(kFont_Small);
  dc.DrawText(track->GetName(), {4, row.top, kHeaderWidth - 2, row.bottom}, font, kHeaderText,
              TextAlign::kLeft, TextVAlign::kCenter);
  dc.PushClip({kHeaderWidth, row.top, row.right, row.bottom});
  for (const ItemPlace& place : places) {
    if (place.item->GetTrack() != track.get())
      continue;
    const bool transition = place.item->IsTransition();
    dc.FillRect(place.rect,
                transition ? kTransitionColor : LabelColor(place.item->GetLabelColor()));
    dc.DrawText(place.item->GetName(), place.rect.Inset(4, 0), font, kItemText, TextAlign::kLeft,
                TextVAlign::kCenter);
    if (sequence.IsSelected(place.item.get()))
      dc.FrameRect(place.rect, kSelectedFrame, 2);
  }
  dc.PopClip();
}

void TimelineView::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  const SequenceRef sequence = FollowActiveSequence();
  if (sequence == nullptr)
    return;
  if (point.y < kRulerHeight) {
    mScrubbing = true;
    CaptureMouse();
    Scrub(point.x);
    return;
  }
  SelectOnClick(sequence, ItemAt(point), modifiers);
}

void TimelineView::SelectOnClick(const SequenceRef& sequence, const TrackItemRef& item,
                                 KeyModifiers modifiers) {
  if (item == nullptr) {
    if (!IsShiftDown(modifiers) && !IsCtrlDown(modifiers))
      sequence->ClearSelection();
    return;
  }
  const bool linked = !IsAltDown(modifiers);
  if (!IsShiftDown(modifiers) && !IsCtrlDown(modifiers)) {
    // A click on what is selected already keeps the selection, as editors do before a drag.
    if (!sequence->IsSelected(item.get()))
      sequence->SetSelectedGroups({GroupOf(*sequence, item, linked)});
    return;
  }
  std::vector<TrackItemGroup> groups = sequence->GetSelection();
  const auto holding = std::find_if(groups.begin(), groups.end(),
                                    [&](const TrackItemGroup& g) { return GroupHolds(g, item); });
  if (holding != groups.end())
    groups.erase(holding);
  else
    groups.push_back(GroupOf(*sequence, item, linked));
  sequence->SetSelectedGroups(std::move(groups));
}

void TimelineView::LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) {
  if (clickCount != 2 || point.y < kRulerHeight) {
    LeftButtonDownSelf(point, modifiers);
    return;
  }
  const SequenceRef sequence = FollowActiveSequence();
  const TrackItemRef item = ItemAt(point);
  if (sequence == nullptr || item == nullptr)
    return;
  sequence->SetSelectedGroups({GroupOf(*sequence, item, !IsAltDown(modifiers))});
  mApplication.OpenTrackItemSelection({item});
}

void TimelineView::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mScrubbing)
    Scrub(point.x);
}

void TimelineView::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mScrubbing)
    return;
  Scrub(point.x);
  mScrubbing = false;
  ReleaseMouse();
}

void TimelineView::Scrub(int x) {
  if (mSequence == nullptr)
    return;
  const TickTime frame = std::max<TickTime>(1, mSequence->GetVideoFrameRate().GetTicksPerFrame());
  const TickTime time =
      std::clamp<TickTime>(XToTime(std::max(x, kHeaderWidth)), 0, mSequence->GetEnd());
  mApplication.SetEditTime(time / frame * frame);
}

bool TimelineView::MouseWheelSelf(const WheelEvent& event) {
  if (FollowActiveSequence() == nullptr || event.deltaY == 0)
    return false;
  if (IsCtrlDown(event.modifiers)) {
    // Zoom about the pointer: the time under it stays under it.
    const TickTime anchor = XToTime(event.point.x);
    const double scale = std::pow(kZoomStep, event.deltaY);  // up zooms in
    mTicksPerPixel = std::max(kMinTicksPerPixel, GetTicksPerPixel() / scale);
    mVisibleStart = std::max<TickTime>(
        0, anchor - static_cast<TickTime>((event.point.x - kHeaderWidth) * mTicksPerPixel));
  } else {
    mVisibleStart = std::max<TickTime>(
        0, mVisibleStart -
               static_cast<TickTime>(event.deltaY * kWheelScrollPixels * GetTicksPerPixel()));
  }
  Invalidate();
  return true;
}
