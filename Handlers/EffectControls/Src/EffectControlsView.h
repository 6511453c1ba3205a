#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListScroller.h"
#include "Handlers/EffectControls/Src/ECWZoomLimiter.h"
#include "Handlers/EffectControls/Src/SequenceMarkers.h"
#include "Handlers/EffectControls/Src/ToolMode.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Shell/StateDumpSource.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/TabView.h"

class EffectControlsKeyframeView;
class EffectControlsListHeader;
class EffectControlsListView;
class HotTimecodeControl;
class MultiPictureButton;
class PanelTimeline;
class PictureButton;
class ScrollBar;
class SubView;
class TimeBarControl;
class ZoomBar;

// While the panel plays an audio part, the sequence player's position (sequence ticks) and its
// stop are relayed on the handler's "ECW.audio.player.relay" station.
struct AudioPlayerPositionChangedMessage : MessageOf<AudioPlayerPositionChangedMessage> {
  static constexpr std::string_view kTypeName = "AudioPlayerPositionChangedMessage";
  explicit AudioPlayerPositionChangedMessage(TickTime t) : time(t) {}
  TickTime time;
};
struct AudioPlayerIsStoppedMessage : MessageOf<AudioPlayerIsStoppedMessage> {
  static constexpr std::string_view kTypeName = "AudioPlayerIsStoppedMessage";
};

// The panel's tab view: the header row, the effect list on the left, the keyframe area with its
// time ruler on the right, a vertical scroll bar, the current-time field and the audio buttons.
// It decides the target (a clip, a transition, or nothing) from the sequence's clip selection,
// keeps the keyframe area's time range and zoom, remembers the split between list and keyframe
// area, and carries out the panel-level commands.
//
// Owned by the handler (std::shared_ptr, shared with the workspace frame); owns its children.
// Times are sequence ticks; zoom is seconds per pixel. UI thread only.
class EffectControlsView : public TabView,
                           public Listener,
                           public EffectControlsListScroller,
                           public StateDumpSource {
 public:
  enum TargetMode : int { kTargetNone = 0, kTargetClip = 1, kTargetTransition = 2 };
  // Work the view posts to itself (see Defer).
  enum class DeferredWork { kReloadMarkers, kInvalidate, kMoveMarker, kEditMarker };

  static constexpr int kMinListWidth = 263;
  static constexpr int kMinKeyframeWidth = 74;
  static constexpr int kSeparatorGap = 4;
  static constexpr int kBottomBarHeight = 20;
  static constexpr int kScrollStep = 20;
  static constexpr int kMaxScrollRange = 2147483646;
  // The ruler: the toolkit's small time bar plus 4 px, with the zoom bar above it.
  static constexpr int kZoomBarHeight = 10;
  static constexpr int kRulerBarHeight = 24;
  static constexpr int kRulerHeight = kZoomBarHeight + kRulerBarHeight;

  // Commands the view carries out itself.
  static constexpr int kRenameCommand = 18001;
  static constexpr int kSavePresetCommand = 18002;
  static constexpr int kEffectsEnabledCommand = 18003;
  static constexpr int kDeleteEffectCommand = 18005;
  static constexpr int kToggleSnappingCommand = 18006;
  static constexpr int kSnapToVideoCommand = 18007;
  static constexpr int kSnapToAudioCommand = 18008;
  static constexpr int kSnapToMarkersCommand = 18009;
  static constexpr int kSnapToCurrentTimeCommand = 18010;
  static constexpr int kSnapToClipCommand = 18011;
  static constexpr int kSnapToAllCommand = 18012;
  static constexpr int kSnapToNoneCommand = 18013;
  static constexpr int kToggleKeyframesCommand = 18015;
  static constexpr int kLoopAudioCommand = 18051;
  static constexpr int kAudioTimeUnitsCommand = 18052;
  static constexpr int kPinToClipCommand = 18053;
  static constexpr int kRulerNumbersCommand = 18054;
  // Switches the list between the host's angle and point rows and the panel's slider rows; the
  // choice is kept in the preference kOwnSliderRowsKey.
  static constexpr int kOwnSliderRowsCommand = 18055;
  static constexpr std::string_view kOwnSliderRowsKey = "effect.controls.own.slider.rows";
  static constexpr int kResetEffectCommand = 18300;
  static constexpr int kPlayAudioCommand = 18550;
  static constexpr int kDeleteAllEffectsCommand = 11541;
  static constexpr int kZoomInCommand = 12076;
  static constexpr int kZoomOutCommand = 12077;
  // Host navigation and marker commands.
  static constexpr int kMarkInCommand = 12065;
  static constexpr int kMarkOutCommand = 12066;
  static constexpr int kGoToInCommand = 12067;
  static constexpr int kGoToOutCommand = 12068;
  static constexpr int kClearInCommand = 12069;
  static constexpr int kClearOutCommand = 12070;
  static constexpr int kClearInOutCommand = 12071;
  static constexpr int kAddMarkerCommand = 12072;
  static constexpr int kClearMarkerCommand = 11730;
  static constexpr int kClearAllMarkersCommand = 11731;
  static constexpr int kNextMarkerCommand = 11732;
  static constexpr int kPreviousMarkerCommand = 11733;
  static constexpr int kEditMarkerCommand = 11793;
  static constexpr int kFirstColoredMarkerCommand = 11830;
  static constexpr int kLastColoredMarkerCommand = 11837;
  // A host edit of the sequence, taken only in sequence mode with editable effects.
  static constexpr int kSequenceEditCommand = 11008;
  static constexpr int kKeyframeAreaCommand = 12100;
  static constexpr int kBlendModePreviousCommand = 12200;
  static constexpr int kBlendModeNextCommand = 12201;
  static constexpr int kFirstCapsuleResetCommand = 24020;
  static constexpr int kLastCapsuleResetCommand = 24035;
  static constexpr int kCapsuleResetAllCommand = 21823;

  // The codes of master-clip navigation (what a navigation command does to a targeted master
  // clip instead of the sequence).
  enum MasterClipNavigation : int {
    kNavMarkIn = 101,
    kNavMarkOut = 102,
    kNavGoToIn = 103,
    kNavGoToOut = 104,
    kNavClearIn = 105,
    kNavClearOut = 106,
    kNavClearInOut = 107,
    kNavNextMarker = 109,
    kNavPreviousMarker = 110,
    kNavClearAllMarkers = 112,
  };

  // The menu the ruler shows on a right press.
  static constexpr const char* kSequenceMarkerMenu = "HandlerEffectControls_Sequence_Marker_Menu";

  // `parent`: where unhandled commands go (the handler). `contextName`: the shortcut context
  // applied when the panel comes on duty.
  EffectControlsView(Commander* parent, std::string contextName);
  ~EffectControlsView() override;

  // --- Used by the handler ---
  void SetToolMode(ToolMode mode);
  std::string GetName() const;
  // Follows `sequence` (null: none) and refreshes the target from its clip selection.
  void OnSequenceActivated(const SequenceRef& sequence);
  // Re-reads the sequence's clip selection and retargets (nothing when it did not change).
  void RefreshFromClipSelection();
  EffectControlsKeyframeView* GetKeyframeView() const { return mKeyframeView.get(); }
  EffectControlsListView* GetListView() const { return mListView.get(); }
  EffectControlsListHeader* GetHeader() const { return mHeader.get(); }
  const std::shared_ptr<EffectControlsListView>& GetSharedListView() const { return mListView; }

  // --- Zoom and time range ---
  // `secondsPerPixel` clamped by the limiter. With `keepCurrentTime` and the edit line on screen:
  // within the left 18 % the left edge stays, within the right 18 % the right edge stays, in
  // between the edit line moves a third of the way toward the middle.
  void ZoomToTimePerPixel(double secondsPerPixel, bool keepCurrentTime);
  // The item's start and end in sequence ticks; a null item raises "Invalid TrackItem" and
  // gives {0, 0}.
  std::pair<TickTime, TickTime> GetTrackItemStartAndEnd(const TrackItemRef& trackItem) const;
  // Sets the zoom limiter's and ruler's time range for the selection: a clip pinned, the span of
  // the selected clips; unpinned, [0, sequence end]; a transition of duration d, from d before
  // the outgoing clip to d after the incoming one (not below 0). Without a sequence it raises
  // "Invalid TrackItemSelection" and changes nothing.
  void SetupTimeBarZoomMinMax(const std::vector<TrackItemGroup>& selection);
  // The sequence (or its settings) changed.
  void OnSequenceChanged(const SequenceRef& sequence, bool settingsChanged = false);

  // --- Target refresh ---
  void SequenceClipSelectionChanged(const SequenceRef& sequence);
  // Candidates of a single group / several groups; returns the number of audio parts found.
  int SequenceClipSelectionChangedForOneTrackItem(const TrackItemGroup& group, TrackItemRef& video,
                                                  TrackItemRef& audio);
  int SequenceClipSelectionChangedForMultipleTrackItems(const std::vector<TrackItemGroup>& groups,
                                                        TrackItemRef& video, TrackItemRef& audio);
  // Targets a master clip's own content (match frame from the header, or a source clip);
  // navigation commands then act on the master clip. Null is ignored.
  void TargetMasterClip(const MasterClipRef& masterClip);
  // The list's: the one record of master-clip mode. Null outside it.
  const MasterClipRef& GetMasterClip() const;
  // Carries out a master-clip navigation code on the targeted master clip (its in and out
  // points and markers are media times, mapped through the targeted clip). False when no
  // master clip is targeted or nothing changed.
  bool NavigateMasterClip(MasterClipNavigation code);

  // --- Layout state ---
  void OnSeparatorMoved(int listWidth);
  void ToggleKeyframesVisible();
  void SetKeyframesVisible(bool visible);
  bool AreKeyframesVisible() const { return mKeyframesVisible; }
  float GetSeparatorRatio() const { return mSeparatorRatio; }
  float GetSeparatorRatioWhenMaximized() const { return mSeparatorRatioMaximized; }
  int GetKeyframeAreaWidth() const { return mKeyframeAreaWidth; }
  TargetMode GetTargetMode() const { return mTargetMode; }
  bool IsPinned() const { return mPinned; }
  bool IsAudioTimeUnits() const { return mAudioTimeUnits; }
  bool IsAudioLoop() const { return mAudioLoop; }
  const SequenceRef& GetSequence() const { return mSequence; }
  // The panel's time state: edit line, zoom and the shown clip's span. The view writes it.
  const PanelTimeline& GetTimeline() const { return *mTimeline; }
  TickTime GetClipStart() const;
  TickTime GetClipEnd() const;
  double GetTimePerPixel() const;
  TickTime GetVisibleBaseTime() const;
  int GetScrollPosition() const { return mScrollPosition; }
  int GetScrollRange() const { return mScrollRange; }
  double GetScrollScale() const { return mScrollScale; }
  const ECWZoomLimiter& GetZoomLimiter() const { return mZoomLimiter; }
  ECWZoomLimiter& GetZoomLimiter() { return mZoomLimiter; }
  TimeBarControl* GetTimeRuler() const { return mRuler.get(); }
  ZoomBar* GetZoomBar() const { return mZoomBar.get(); }
  ScrollBar* GetScrollBar() const { return mScrollBar.get(); }
  const SequenceMarkers& GetMarkers() const { return mMarkers; }
  // Scrolls the keyframe area's visible time by `ticks` (kept inside the limiter's range).
  void ScrollVisibleTime(TickTime ticks);
  HotTimecodeControl* GetTimecodeControl() const { return mTimecode.get(); }
  MultiPictureButton* GetPlayAudioButton() const { return mPlayButton.get(); }
  PictureButton* GetLoopButton() const { return mLoopButton.get(); }
  // Updates the horizontal scroll values from the current zoom (range, position, scale).
  void UpdateHorizontalScroll();

  // --- TabView / ViewBase ---
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;
  void NowOnDuty() override;
  int GetMaxStackedHeight() const override;
  void SetStackedSelf(bool stacked) override;
  void SaveStateSelf(PropertyList& state) const override;
  void RestoreStateSelf(const PropertyList& state) override;
  void CreateChildrenSelf() override;
  std::string GetFlyoutMenuName() const override;
  void SetBoundsSelf(const Rect& bounds) override;
  void PaintSelf(DC& dc) override;
  bool MouseWheelSelf(const WheelEvent& event) override;
  bool MouseMagnifySelf(const MagnifyEvent& event) override;
  bool MousePanSelf(const PanEvent& event) override;
  void DestroySelf() override;

  // --- Listener ---
  void ListenToMessage(const Message& message) override;

  // --- EffectControlsListScroller ---
  void SizeListScrollBar(int contentHeight, int visibleHeight) override;
  int GetListScrollPosition() const override;
  void SetListScrollPosition(int position) override;

  // --- StateDumpSource ---
  void FillStateDump(PanelStateDump& dump) const override;

  // Lays the children out for the current size.
  void LayoutPanel();

 private:
  int GetScrollBarWidth() const;
  float CurrentRatio() const;
  // The list's width in a panel `panelWidth` wide, from the stored split.
  int ListWidthFor(int panelWidth) const;
  void StoreRatio(float ratio);
  void ApplyKeyframesVisible();
  void FollowSequence(const SequenceRef& sequence);
  // `candidates`: 1 when an item is targeted, else the number of selected groups (the header
  // tells none from several); the time controls work only with one.
  void FinishClipSelection(int candidates);
  // The list shows what `selection` asks for: the same target, built from the same selection.
  bool ShowsTargetFor(const std::vector<TrackItemGroup>& selection) const;
  // Listens to the master clip's station while it is targeted; null leaves master-clip mode.
  void SetMasterClip(const MasterClipRef& masterClip);
  // The first clip (not transition) before or after `transition` on its track, or null.
  static TrackItemRef NeighbourClip(const TrackItemRef& transition, bool before);
  void TargetClip(const TrackItemRef& item);
  void TargetTransition(const TrackItemRef& item, const std::vector<TrackItemGroup>& selection);
  void SetVisibleRange(TickTime start, TickTime end);
  // Zooms to `secondsPerPixel` (already limited); `keepEditLine` places the range around the
  // edit line as ZoomToTimePerPixel describes.
  void ApplyZoom(double secondsPerPixel, bool keepEditLine);
  // The shown clip's or transition's span: the keyframe area's band.
  void SetShownRange(TickTime start, TickTime end);
  void UpdateAudioButtons();
  void SetAudioTimeUnits(bool audioUnits);
  // Rebuilds the list with or without the panel's own slider rows and keeps the choice.
  void SetOwnSliderRows(bool own);
  bool HasOwnSliderRows() const;
  void RenameSelectedEffect();
  void SavePreset();
  // Opens the host's marker editor for the ruler's marker `id`; one undo step when confirmed.
  void EditMarker(std::int64_t id);
  // The selected clips' opacity blend mode one step back or on (wrapping), one undo step.
  bool StepBlendMode(int step, bool apply);
  // Resets the capsule parameter at `index`, or every one when nullopt; one undo step.
  bool ResetCapsuleParameters(std::optional<std::size_t> index, bool apply);
  // Moves the edit line: the timeline, the ruler, the time field and the sequence.
  void SetEditTime(TickTime time);
  // Shows where the player is without moving the sequence's edit line.
  void ShowEditTime(TickTime time);
  // Shows the ruler's new zoom [zoomIn, zoomOut] in the list and the keyframe area.
  void ApplyRulerZoom();
  void ReloadInOutMarks();
  // Shows the markers of the sequence, or in master-clip mode the master clip's.
  void ReloadMarkers();
  void ReloadTimeDisplays();
  // A released in, out or in-and-out mark of the ruler: one undoable step.
  void OnMarkTime(const Message& message);
  bool OnNavigationCommand(CommandID command);
  bool IsNavigationCommand(CommandID command) const;
  bool IsEditingCommand(CommandID command) const;
  bool CanEdit() const;
  // The clip through which master-clip times map to sequence times.
  TrackItemRef GetMasterClipItem() const;
  TickTime SnapToFrame(TickTime time) const;
  // Work done later on the UI thread (marker and settings messages may arrive while the model
  // is being edited), posted to the view's own station so it is dropped with the view.
  void Defer(DeferredWork work, std::int64_t markerID = 0, TickTime time = 0);
  void OnDeferred(DeferredWork work, std::int64_t markerID, TickTime time);
  void SequenceSelectionLinkingChanged();
  void AudioPartPlayStarted();
  void AudioPartPlayStopped();

  std::string mContextName;
  StationName mStation;
  // Shared with the list and the keyframe area, which read it; the rows hold its edit time.
  std::shared_ptr<PanelTimeline> mTimeline;
  std::shared_ptr<EffectControlsListHeader> mHeader;
  std::shared_ptr<EffectControlsListView> mListView;
  std::shared_ptr<EffectControlsKeyframeView> mKeyframeView;
  std::shared_ptr<SubView> mRulerHolder;
  std::shared_ptr<TimeBarControl> mRuler;
  std::shared_ptr<ZoomBar> mZoomBar;
  ECWZoomLimiter mZoomLimiter;
  std::shared_ptr<HotTimecodeControl> mTimecode;
  std::shared_ptr<MultiPictureButton> mPlayButton;
  std::shared_ptr<PictureButton> mLoopButton;
  std::shared_ptr<ScrollBar> mScrollBar;
  SequenceMarkers mMarkers;

  TargetMode mTargetMode = kTargetNone;
  bool mPinned = true;
  bool mKeyframesVisible = true;
  bool mAudioLoop = false;
  float mSeparatorRatio = 0.0F;
  float mSeparatorRatioMaximized = 0.0F;
  int mKeyframeAreaWidth = kMinKeyframeWidth;
  SequenceRef mSequence;
  StationName mSequenceStation;
  StationName mTargetStation;
  TickTime mSequenceEnd = 0;
  TrackItemRef mTargetItem;  // the targeted clip or transition
  bool mAudioPartPlaying = false;
  TickTime mPositionBeforeAudioPart = 0;
  bool mScrubbing = false;
  int mScrollPosition = -1;
  int mScrollRange = -1;
  double mScrollScale = 0.0;
  bool mSequenceChangedOffDuty = false;
  bool mAudioTimeUnits = false;
  bool mLayingOut = false;
  ToolMode mToolMode = ToolMode::kPointer;
};
