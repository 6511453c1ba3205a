#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "Handlers/EffectControls/Src/KeyframeSnapSet.h"
#include "Handlers/EffectControls/Src/KeyframeViewTool.h"
#include "Handlers/EffectControls/Src/ToolMode.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Rows/EffectControlsKeyframeViewHSLBase.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/SubView.h"

class EffectControlsListView;
class EffectItem;
class KeyframeMultiSelection;
class KeyframeMultiSelectionActor;
class ParameterControl;
class ImageList;
class PanelTimeline;
class PersistentToolTip;

// The keyframe area asks the panel view to slide its visible time (a drag reached an edge).
// `amount` in ticks, positive towards later times. Sent on the list's keyframe station.
struct EffectControlsAutoScrollMessage : MessageOf<EffectControlsAutoScrollMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsAutoScrollMessage";
  explicit EffectControlsAutoScrollMessage(TickTime a) : amount(a) {}
  TickTime amount;
};

// A keyframe drag shows where it is in the panel's time ruler (sequence ticks); nullopt when the
// drag ended and the ruler goes back to the edit line. Sent on the list's keyframe station.
struct EffectControlsKeyframeDragTimeMessage : MessageOf<EffectControlsKeyframeDragTimeMessage> {
  static constexpr std::string_view kTypeName = "EffectControlsKeyframeDragTimeMessage";
  explicit EffectControlsKeyframeDragTimeMessage(std::optional<TickTime> t) : time(t) {}
  std::optional<TickTime> time;
};

// The keyframe area beside the list: the targeted clip's span with its no-clip and trim bands,
// the clip bar (label colour, head and tail marks, name) with a graphics clip's intro and outro,
// one track per shown list row whose keyframes the rows draw themselves, the current time line
// and the marquee. It selects keyframes (click, Shift/Ctrl-click, right click, marquee), moves
// them (snapping to the current time, the clip's edges, other keyframes and markers), resizes
// intro and outro, and carries out the keyframe commands (delete, cut, copy, paste, select all,
// clear all, temporal and spatial interpolation). Every model change is one undo step.
//
// It owns no rows: vertical positions come from the list's rows (the list's y is the area's y),
// time from the panel's timeline. The keyframe selection is the list's; the area edits it in
// place. Times: "sequence" and "clip" say which line; x in local pixels.
//
// Owned by the panel view (a child view). UI thread only.
class EffectControlsKeyframeView : public EffectControlsKeyframeViewHSLBase,
                                   public SubView,
                                   public Listener {
 public:
  // Commands carried out here besides the standard edit ones.
  static constexpr CommandID kInterpolationLinearCommand = 18401;
  static constexpr CommandID kInterpolationBezierCommand = 18402;
  static constexpr CommandID kInterpolationAutoBezierCommand = 18403;
  static constexpr CommandID kInterpolationContinuousBezierCommand = 18404;
  static constexpr CommandID kInterpolationHoldCommand = 18405;
  static constexpr CommandID kEaseInCommand = 18406;
  static constexpr CommandID kEaseOutCommand = 18407;
  static constexpr CommandID kSpatialLinearCommand = 18408;
  static constexpr CommandID kSpatialBezierCommand = 18409;
  static constexpr CommandID kSpatialAutoBezierCommand = 18410;
  static constexpr CommandID kSpatialContinuousBezierCommand = 18411;
  static constexpr CommandID kClearAllKeyframesCommand = 18420;
  static bool IsInterpolationCommand(CommandID command) {
    return command >= kInterpolationLinearCommand && command <= kSpatialContinuousBezierCommand;
  }

  static constexpr const char* kKeyframeMenu = "HandlerEffectControls_Keyframe_Edit_Menu";
  static constexpr const char* kSpatialKeyframeMenu =
      "HandlerEffectControls_Spatial_Keyframe_Edit_Menu";
  static constexpr const char* kAreaMenu = "HandlerEffectControls_Keyframe_View_Edit_Menu";

  static constexpr int kClipBarHeight = 21;
  // A drag within this many pixels of a snap time lands on it.
  static constexpr int kSnapTolerancePixels = 6;
  static constexpr int kIntroOutroHitPixels = 5;
  static constexpr int kMaxPixel = 65536;
  // A drag this close to the left or right edge slides the visible time.
  static constexpr int kAutoScrollMargin = 10;
  static constexpr int kMarqueeScrollMargin = 10;
  static constexpr int kMarqueeMaxScrollStep = 20;
  // How far a marquee held at `y` scrolls the rows at each repeat: within kMarqueeScrollMargin
  // of an edge (or beyond it) half the distance past the margin, toward zero, at most
  // kMarqueeMaxScrollStep; 0 elsewhere.
  static int MarqueeScrollStep(int y, const Rect& bounds);
  // Arrow keys move the selection by one frame; Shift by this many.
  static constexpr int kLargeNudgeFrames = 10;

  explicit EffectControlsKeyframeView(Commander* superCommander = nullptr);
  ~EffectControlsKeyframeView() override;

  // The list whose rows the area follows (shared with the panel view).
  void SetListView(std::weak_ptr<EffectControlsListView> list) { mList = std::move(list); }
  // The panel's time state (shared with the panel view, which writes it). Null: the area has
  // no time and draws no clip, keyframes or edit line.
  void SetTimeline(std::shared_ptr<const PanelTimeline> timeline);

  // The timeline's tool as given; in this area zoom (200) and hand (300) select like the
  // pointer (GetTool).
  void SetToolMode(ToolMode mode) {
    mToolMode = mode;
    mTool.SetTool(mode);
  }
  ToolMode GetToolMode() const { return mToolMode; }
  const KeyframeViewTool& GetTool() const { return mTool; }
  void SetPinToClip(bool pinned);
  bool IsPinnedToClip() const { return mPinned; }
  void SetKeyframesVisible(bool visible) { mKeyframesVisible = visible; }

  // The edit line, in sequence ticks. SetCurrentTime is the panel's report that it moved: with
  // keyframes selected the area takes the keyboard (unless a text field is being edited there).
  TickTime GetEditTime() const;
  void SetCurrentTime(TickTime time);

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

  // --- Time mapping ---
  TickTime GetVisibleStartTime() const;
  double GetSecondsPerPixel() const;
  // Frames of the pixel rate from the visible start, limited to [-kMaxPixel, kMaxPixel].
  int TimeToX(TickTime sequenceTime) const;
  // x limited to [0, width]; the visible start plus x pixels, truncated toward zero.
  TickTime XToTime(int x) const;
  // One pixel in ticks (truncated); 0 without a timeline.
  TickTime GetPixelSpan() const;

  // One keyframe as the area draws it: the parameter's row, the keyframe's clip time, the
  // glyph's centre (local coordinates), whether it is selected.
  struct KeyframeGlyph {
    const ParameterControl* row = nullptr;  // owned by the list; valid until its next rebuild
    TickTime clipTime = 0;
    Point centre;
    bool selected = false;
  };
  // Every glyph on screen (shown rows within the area), in track order then time order.
  std::vector<KeyframeGlyph> GetKeyframeGlyphs() const;
  int GetSelectedKeyframeCount() const;

  // The ordered keyframe times (sequence) of the shown time-varying parameters.
  std::set<TickTime> CollectKeyframeTimes() const;
  // The nearest keyframe time after (forward) or before the edit line over the shown
  // parameters; the keyframes at that time become the selection. Nullopt when there is none.
  std::optional<TickTime> NavigateKeyframe(bool forward);

  // --- Snapping (rebuilt at each press on a keyframe) ---
  const KeyframeSnapSet& GetSnapSet() const { return mSnapSet; }
  void RebuildSnapSet();

  // --- Interaction state ---
  enum class Gesture { kIdle, kSeparator, kKeyframeDrag, kMarquee, kIntro, kOutro };
  Gesture GetGesture() const { return mGesture; }
  bool IsDraggingSeparator() const { return mGesture == Gesture::kSeparator; }
  bool IsMarqueeActive() const { return mGesture == Gesture::kMarquee; }
  // The normalised marquee rectangle (local), empty when none is active.
  Rect GetMarqueeRect() const;
  // During a keyframe drag that moved: the guide's x and whether it sits on a snap time.
  bool HasDragGuide() const { return mGesture == Gesture::kKeyframeDrag && mMoved; }
  int GetDragGuideX() const { return mGuideX; }
  bool IsDragGuideSnapped() const { return mGuideSnapped; }
  // The intro (outro) duration a drag shows, or the clip's.
  TickTime GetShownIntroDuration() const;
  TickTime GetShownOutroDuration() const;
  const PersistentToolTip* GetIntroOutroToolTip() const { return mToolTip.get(); }
  // Ends any gesture and puts back what it changed (Escape, lost capture).
  void CancelGesture();

  // The area's left edge is the list/keyframe separator: pressing within kSeparatorGrabWidth of
  // it and dragging reports EffectControlsListSeparatorMoved on the list's own station, with the
  // pointer in the list's coordinates (the panel view moves the split).
  static constexpr int kSeparatorGrabWidth = 4;

  // --- Commands ---
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;
  // Whether this area carries `command` out.
  static bool IsKeyframeCommand(CommandID command);
  void DeleteSelectedKeyframes();
  void CutSelectedKeyframes();
  void CopySelectedKeyframes();
  // Pastes at the edit line into the targeted chain; the pasted keyframes become the selection.
  void PasteKeyframes();
  bool CanPasteKeyframes() const;
  void SelectAllKeyframes();
  void ClearAllKeyframes();
  // Moves the selection by `frames` frames of the sequence (one undo step).
  void NudgeSelection(int frames);

  // --- EffectControlsKeyframeViewHSLBase ---
  bool ClearCutCopyStatus(CommandID command, bool& enabled, bool& checked,
                          std::string& text) override;
  bool PasteStatus(CommandID command, bool& enabled, bool& checked, std::string& text) override;
  bool SelectAllStatus(CommandID command, bool& enabled, bool& checked, std::string& text) override;
  bool InterpolationStatus(CommandID command, bool& enabled, bool& checked,
                           std::string& text) override;
  bool ClearAllKeyframesStatus(CommandID command, bool& enabled, bool& checked,
                               std::string& text) override;

  // --- SubView ---
  void DestroySelf() override;
  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void RightButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  void MouseCaptureLostSelf() override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;
  bool MousePanSelf(const PanEvent& event) override;
  bool KeyDownSelf(const KeyEvent& event) override;

  // --- Listener ---
  void ListenToMessage(const Message& message) override;

 private:
  // One shown row of the walk: the row, its parameter row (null for others) and the section.
  struct Track {
    std::shared_ptr<EffectItem> row;
    ParameterControl* param = nullptr;  // the row itself when it is a parameter row
  };
  struct Section {
    std::vector<Track> tracks;
    int top = 0;  // where the section's rows start (its first row's top)
    int bottom = 0;
  };
  // The shown sections in track order (graphics, video, audio clip parts), each with its
  // shown rows (set-aside rows and rows of closed sections left out). `stopBelow`: a section
  // stops at its first row below the area.
  std::vector<Section> CollectSections(bool stopBelow) const;
  static bool IsKeyframeTrack(const Track& track);
  // The clip the bar, bands and snap edges belong to; null when none.
  TrackItemRef GetClip() const;
  std::shared_ptr<KeyframeMultiSelection> GetSelection() const;
  bool IsReadOnly() const;
  ComponentChainRef GetPasteChain() const;

  // --- Paint ---
  void PaintBands(DC& dc, const TrackItem& clip, bool onlyNoClip) const;
  // The bar's top, or nullopt when it is not shown.
  std::optional<int> GetClipBarTop() const;
  void PaintClipBar(DC& dc, const TrackItem& clip, int barTop) const;
  void PaintIntroOutro(DC& dc, const TrackItem& clip, std::optional<int> barTop) const;
  // Registers the area with the rows it draws (they ask it for command states).
  void PaintSection(DC& dc, const Section& section);
  void PaintTrack(DC& dc, const Track& track);
  void PaintSummaryTrack(DC& dc, const Track& track) const;
  void PaintCurrentTime(DC& dc, const Section& section) const;
  void PaintMarquee(DC& dc) const;

  // --- Press ---
  void PressAt(Point point, KeyModifiers modifiers, MouseButton button);
  // The keyframe under `point` on a parameter track: true when one was hit (and handled).
  bool PressKeyframe(const Track& track, Point point, KeyModifiers modifiers, MouseButton button);
  void StartMarquee(Point point, KeyModifiers modifiers);
  enum class IntroOutroHit { kNone, kIntro, kOutro };
  IntroOutroHit HitIntroOutro(Point point) const;
  void StartIntroOutro(IntroOutroHit hit, Point point);
  void ShowMenu(const char* menu, Point point);

  // --- Drag ---
  void DragKeyframes(Point point, KeyModifiers modifiers);
  void UpdateMarquee(Point point);
  void DragIntroOutro(Point point);
  void FinishGesture(Point point, KeyModifiers modifiers);
  void AutoScrollHorizontally(Point point);
  void AutoScrollMarquee();
  std::string IntroOutroToolTipText() const;
  void ResetGestureState();

  // --- Separator ---
  void ReportSeparator(Point point) const;

  void AnnounceDragTime(std::optional<TickTime> time) const;
  void AnnounceTimeRemapping() const;

  std::weak_ptr<EffectControlsListView> mList;
  std::shared_ptr<const PanelTimeline> mTimeline;
  ToolMode mToolMode = ToolMode::kPointer;
  KeyframeViewTool mTool;
  bool mPinned = true;
  bool mKeyframesVisible = true;
  unsigned mSnapFlags = kSnapKeyframes | kSnapTargets;
  KeyframeSnapSet mSnapSet;

  Gesture mGesture = Gesture::kIdle;
  Point mPressPoint;
  KeyModifiers mPressModifiers = kKeyModifierNone;
  // Keyframe drag: the time at the press (sequence) and the row pressed on.
  TickTime mAnchorTime = 0;
  std::shared_ptr<EffectItem> mPressedRow;
  std::unique_ptr<KeyframeMultiSelectionActor> mActor;
  bool mMoved = false;
  int mLastDragX = 0;
  int mGuideX = 0;
  bool mGuideSnapped = false;
  // Marquee: anchor and current point, the anchor's time, the modifiers at the press and the
  // selection as it was (restored by a cancel; Ctrl toggles against it).
  Point mMarqueeAnchor;
  Point mMarqueePoint;
  TickTime mMarqueeAnchorTime = 0;
  std::shared_ptr<KeyframeMultiSelection> mSelectionAtPress;
  // Intro/outro drag: the duration shown while dragging.
  TickTime mDraggedDuration = 0;
  std::unique_ptr<PersistentToolTip> mToolTip;
  bool mListeningToRepeat = false;
};
