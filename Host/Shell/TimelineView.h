#pragma once

#include <optional>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/SubView.h"

class Application;

// The workspace's timeline: the active sequence's tracks (video with V1 lowest, then audio) with
// their clips and transitions under a time ruler that shares the sequence's edit line. A person
// picks what the effect controls show here, as in any editor: a click selects an item with the
// items linked to it (Alt: the item alone), Shift or Ctrl adds or removes it, a click on empty
// track clears the selection, a double-click opens the item (a transition's settings), the
// ruler sets and scrubs the edit line, the wheel scrolls and Ctrl+wheel zooms about the pointer.
// It changes only the host's selection and edit line, through the sequence, exactly as a real
// timeline would: nobody else is told directly.
//
// Owned by the workspace frame (a child view); follows the application's active sequence.
// UI thread only.
class TimelineView : public SubView, public Listener {
 public:
  static constexpr int kRulerHeight = 24;
  static constexpr int kTrackHeight = 30;
  static constexpr int kHeaderWidth = 40;

  explicit TimelineView(Application& application);
  ~TimelineView() override;

  // Local rectangles of the items drawn now (clipped to the view), top track first.
  struct ItemPlace {
    TrackItemRef item;
    Rect rect;
  };
  std::vector<ItemPlace> GetItemPlaces() const;
  TrackItemRef ItemAt(Point point) const;

  // Time mapping of the tracks' area, in local pixels.
  double TimeToX(TickTime time) const;
  TickTime XToTime(int x) const;
  TickTime GetVisibleStart() const { return mVisibleStart; }
  double GetTicksPerPixel() const;

  void PaintSelf(DC& dc) override;
  void SetBoundsSelf(const Rect& bounds) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool MouseWheelSelf(const WheelEvent& event) override;

  // --- Listener ---
  void ListenToMessage(const Message& message) override;

 private:
  SequenceRef FollowActiveSequence();
  std::vector<TrackRef> TracksTopFirst(const Sequence& sequence) const;
  Rect TrackRect(std::size_t row) const;
  void SelectOnClick(const SequenceRef& sequence, const TrackItemRef& item, KeyModifiers modifiers);
  void Scrub(int x);
  void PaintRuler(DC& dc, const Sequence& sequence) const;
  void PaintTrack(DC& dc, const Sequence& sequence, const std::vector<ItemPlace>& places,
                  const TrackRef& track, const Rect& row) const;

  Application& mApplication;
  SequenceRef mSequence;  // the one whose stations this view is on
  TickTime mVisibleStart = 0;
  double mTicksPerPixel = 0.0;  // 0: fit the sequence at the next paint
  bool mScrubbing = false;
};
