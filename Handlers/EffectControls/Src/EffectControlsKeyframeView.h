#pragma once

#include <functional>
#include <memory>
#include <string_view>
#include <vector>

#include "Handlers/EffectControls/Src/ToolMode.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/SubView.h"

class EffectControlsListView;
class EffectItem;
class ParameterControl;
class ImageList;
class PanelTimeline;

// The keyframe area asks the panel view to slide its visible time (a drag reached an edge).
// `amount` in ticks, positive towards later times. Sent on the list's keyframe station.
struct EffectControlsAutoScrollMessage : MessageOf<EffectControlsAutoScrollMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsAutoScrollMessage";
  explicit EffectControlsAutoScrollMessage(TickTime a) : amount(a) {}
  TickTime amount;
};

// The keyframe area beside the list: the targeted clip's span as a band, one track per visible
// list row at the row's position, the keyframes of time-varying parameters and the current
// time line. It owns no rows: it reads their positions from the list it was given, and the
// time (edit line, visible start, seconds per pixel, the clip's span) from the panel's
// timeline, redrawing when that changes.
//
// Owned by the panel view (a child view). UI thread only.
class EffectControlsKeyframeView : public SubView, public Listener {
 public:
  explicit EffectControlsKeyframeView(Commander* superCommander = nullptr);
  ~EffectControlsKeyframeView() override;

  // The list whose rows the area follows (shared with the panel view).
  void SetListView(std::weak_ptr<EffectControlsListView> list) { mList = std::move(list); }
  // The panel's time state (shared with the panel view, which writes it). Null: the area has
  // no time and draws no clip, keyframes or edit line.
  void SetTimeline(std::shared_ptr<const PanelTimeline> timeline);
  // The keyframe glyphs (6 x kind + variant); null draws plain diamonds.
  void SetKeyframeImages(std::shared_ptr<const ImageList> images) { mImages = std::move(images); }

  void SetToolMode(ToolMode mode) { mToolMode = mode; }
  ToolMode GetToolMode() const { return mToolMode; }
  void SetPinToClip(bool pinned);
  bool IsPinnedToClip() const { return mPinned; }
  void SetKeyframesVisible(bool visible) { mKeyframesVisible = visible; }

  // The edit line, in sequence ticks.
  TickTime GetEditTime() const;

  // Snapping flags: kSnapKeyframes switches snapping as a whole, the others pick what keyframe
  // drags snap to. Read from the application properties at construction and written back on
  // every change ("effect.controls.is.keyframe.snapping", "effect.controls.issnapping.to.video",
  // ...); a read-only property keeps its value.
  enum SnapFlag : unsigned {
    kSnapKeyframes = 1,
    kSnapVideo = 2,
    kSnapAudio = 4,
    kSnapMarkers = 8,
    kSnapCurrentTime = 16,
    kSnapClip = 32,
  };
  static constexpr unsigned kSnapTargets =
      kSnapVideo | kSnapAudio | kSnapMarkers | kSnapCurrentTime | kSnapClip;
  void SetSnapFlags(unsigned flags);
  unsigned GetSnapFlags() const { return mSnapFlags; }
  bool IsSnapFlagSet(SnapFlag flag) const { return (mSnapFlags & flag) != 0; }
  void ToggleSnapFlag(SnapFlag flag) { SetSnapFlags(mSnapFlags ^ flag); }

  // Time mapping from the timeline: x in local pixels.
  TickTime GetVisibleStartTime() const;
  double GetSecondsPerPixel() const;
  double TimeToX(TickTime time) const;
  TickTime XToTime(double x) const;

  // One keyframe as the area draws it: the parameter's row, the keyframe's clip time, the
  // glyph's centre (local coordinates), whether it is selected, and its glyph kind.
  struct KeyframeGlyph {
    const ParameterControl* row = nullptr;  // owned by the list; valid until its next rebuild
    TickTime clipTime = 0;
    Point centre;
    bool selected = false;
    int kind = 0;
  };
  // Every glyph drawn now (shown rows within the area), in row order then time order.
  std::vector<KeyframeGlyph> GetKeyframeGlyphs() const;

  // Selected keyframes across the list's keyframe selection.
  int GetSelectedKeyframeCount() const;

  // The area's left edge is the list/keyframe separator: pressing within kSeparatorGrabWidth of
  // it and dragging reports EffectControlsListSeparatorMoved on the list's own station, with the
  // pointer in the list's coordinates (the panel view moves the split).
  static constexpr int kSeparatorGrabWidth = 4;
  bool IsDraggingSeparator() const { return mDraggingSeparator; }

  // Delete (the standard clear command) removes the selected keyframes as one undo step.
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;
  void DeleteSelectedKeyframes();

  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;

  // --- Listener ---
  void ListenToMessage(const Message& message) override;

 private:
  void ReportSeparator(Point point) const;
  // The glyphs of one row, placed as PaintSelf draws them.
  void VisitGlyphs(const EffectControlsListView& list, const std::shared_ptr<EffectItem>& row,
                   const std::function<void(const KeyframeGlyph&)>& visit) const;

  std::weak_ptr<EffectControlsListView> mList;
  std::shared_ptr<const PanelTimeline> mTimeline;
  std::shared_ptr<const ImageList> mImages;
  ToolMode mToolMode = ToolMode::kPointer;
  bool mPinned = true;
  bool mKeyframesVisible = true;
  bool mDraggingSeparator = false;
  unsigned mSnapFlags = kSnapKeyframes | kSnapTargets;
};
