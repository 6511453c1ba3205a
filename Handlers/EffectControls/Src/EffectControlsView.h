#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListScroller.h"
#include "Handlers/EffectControls/Src/ECWZoomLimiter.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/TickTime.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Shell/StateDumpSource.h"
#include "Host/Toolkit/TabView.h"

class EffectControlsKeyframeView;
class EffectControlsListHeader;
class EffectControlsListView;
class EffectControlsTimeRuler;
class EffectControlsScrollBar;
class HotTimecodeControl;
class MultiPictureButton;
class PictureButton;
class SubView;

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

  static constexpr int kMinListWidth = 263;
  static constexpr int kMinKeyframeWidth = 74;
  static constexpr int kSeparatorGap = 4;
  static constexpr int kBottomBarHeight = 20;
  static constexpr int kScrollStep = 20;
  static constexpr double kTicksPerSecond = 254016000000.0;
  static constexpr int kMaxScrollRange = 2147483646;

  // Commands the view carries out itself.
  static constexpr int kRenameCommand = 18001;
  static constexpr int kSavePresetCommand = 18002;
  static constexpr int kToggleKeyframesCommand = 18015;
  static constexpr int kLoopAudioCommand = 18051;
  static constexpr int kAudioTimeUnitsCommand = 18052;
  static constexpr int kPinToClipCommand = 18053;
  static constexpr int kRulerNumbersCommand = 18054;
  static constexpr int kPlayAudioCommand = 18550;
  static constexpr int kZoomInCommand = 12076;
  static constexpr int kZoomOutCommand = 12077;

  // `parent`: where unhandled commands go (the handler). `contextName`: the shortcut context
  // applied when the panel comes on duty.
  EffectControlsView(Commander* parent, std::string contextName);
  ~EffectControlsView() override;

  // --- Used by the handler ---
  void SetToolMode(int mode);
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
  // `secondsPerPixel` clamped by the limiter; `keepCurrentTime` keeps the edit line where it is
  // on screen (left edge near 0 %, right edge near 100 %, else proportionally).
  void ZoomToTimePerPixel(double secondsPerPixel, bool keepCurrentTime);
  // The item's start and end in sequence ticks; a null item raises "Invalid TrackItem" and
  // gives {0, 0}.
  std::pair<TickTime, TickTime> GetTrackItemStartAndEnd(const TrackItemRef& trackItem) const;
  // Sets the zoom limiter's and ruler's range for the selection (see the cpp).
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
  // Targets a master clip's own content (source clip selection).
  void TargetMasterClip(const MasterClipRef& masterClip);

  // --- Layout state ---
  void OnSeparatorMoved(int listWidth);
  void ToggleKeyframesVisible();
  void SetKeyframesVisible(bool visible);
  bool AreKeyframesVisible() const { return mKeyframesVisible; }
  float GetSeparatorRatio() const { return mSeparatorRatio; }
  float GetSeparatorRatioWhenMaximized() const { return mSeparatorRatioMaximized; }
  int GetKeyframeAreaWidth() const { return mKeyframeAreaWidth; }
  int GetTargetMode() const { return mTargetMode; }
  bool IsPinned() const { return mPinned; }
  bool IsAudioTimeUnits() const { return mAudioTimeUnits; }
  bool IsAudioLoop() const { return mAudioLoop; }
  const SequenceRef& GetSequence() const { return mSequence; }
  const std::vector<TrackItemGroup>& GetSelectedGroups() const { return mSelectedGroups; }
  TickTime GetClipStart() const { return mClipStart; }
  TickTime GetClipEnd() const { return mClipEnd; }
  double GetTimePerPixel() const { return mTimePerPixel; }
  TickTime GetVisibleBaseTime() const { return mVisibleBaseTime; }
  int GetScrollPosition() const { return mScrollPosition; }
  int GetScrollRange() const { return mScrollRange; }
  double GetScrollScale() const { return mScrollScale; }
  const ECWZoomLimiter& GetZoomLimiter() const { return mZoomLimiter; }
  ECWZoomLimiter& GetZoomLimiter() { return mZoomLimiter; }
  EffectControlsTimeRuler* GetTimeRuler() const { return mRuler.get(); }
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
  void StoreRatio(float ratio);
  void ApplyKeyframesVisible();
  void FollowSequence(const SequenceRef& sequence);
  void FinishClipSelection(int state, int audioParts);
  void TargetClip(const TrackItemRef& item);
  void TargetTransition(const TrackItemRef& item);
  void SetVisibleRange(TickTime start, TickTime end);
  void UpdateAudioButtons();
  void SetAudioTimeUnits(bool audioUnits);
  void RenameSelectedEffect();
  void SetEditTime(TickTime time);

  std::string mContextName;
  StationName mStation;
  std::shared_ptr<EffectControlsListHeader> mHeader;
  std::shared_ptr<EffectControlsListView> mListView;
  std::shared_ptr<EffectControlsKeyframeView> mKeyframeView;
  std::shared_ptr<SubView> mRulerHolder;
  std::shared_ptr<EffectControlsTimeRuler> mRuler;
  ECWZoomLimiter mZoomLimiter;
  std::shared_ptr<HotTimecodeControl> mTimecode;
  std::shared_ptr<MultiPictureButton> mPlayButton;
  std::shared_ptr<PictureButton> mLoopButton;
  std::shared_ptr<EffectControlsScrollBar> mScrollBar;

  int mTargetMode = kTargetNone;
  bool mPinned = true;
  bool mKeyframesVisible = true;
  bool mAudioLoop = false;
  std::vector<TrackItemGroup> mSelectedGroups;
  TickTime mClipStart = 0;
  TickTime mClipEnd = 0;
  float mSeparatorRatio = 0.0F;
  float mSeparatorRatioMaximized = 0.0F;
  int mKeyframeAreaWidth = kMinKeyframeWidth;
  SequenceRef mSequence;
  StationName mSequenceStation;
  StationName mTargetStation;
  TickTime mSequenceEnd = 0;
  TickTime mEditLine = 0;
  MasterClipRef mMasterClip;
  double mTimePerPixel = -1.0;
  TickTime mVisibleBaseTime = 0;
  int mScrollPosition = -1;
  int mScrollRange = -1;
  double mScrollScale = 0.0;
  bool mSequenceChangedOffDuty = false;
  bool mAudioTimeUnits = false;
  bool mLayingOut = false;
  int mToolMode = 100;
};
