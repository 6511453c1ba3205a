#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/FilterMultiSelection.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParameterMultiSelection.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Rows/EffectItemList.h"
#include "Host/Shell/PanelStateDump.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/SubView.h"

class AudioPartInfo;
class DC;
class EffectControlsListScroller;
class EffectItem;
class FilterItem;
class KeyframeMultiSelection;
class MultiPictureButton;
struct ParameterControlInfo;
enum class ScrollCode : std::int32_t;

// Bits that change how the list builds and draws (see HasECPStyle). The effect controls panel
// uses none; they are for other panels that embed or extend the list.
enum EffectControlsListViewStyle : std::uint32_t {
  kStyleNone = 0,
  kStyleNoVideoExpander = 0x1,      // no video expander button
  kStyleNoAudio = 0x2,              // audio clips show no rows
  kStyleHideTimeRemapping = 0x8,    // no row for the time-remapping intrinsic
  kStyleFilterOption6 = 0x40,       // passed to the effect rows
  kStyleCheckboxSwitch = 0x80,      // effect rows switch with a check box
  kStyleIndentFilters = 0x100,      // effect rows indented by 40 pixels
  kStyleStartCollapsed = 0x200,     // effect rows start collapsed
  kStyleNoMaskControls = 0x400,     // no mask-shape row and no mask rows
  kStyleOwnSliderRows = 0x800,      // angle, point and colour parameters use the panel's rows
  kStyleFlag2000 = 0x2000,          // parameter names start at 10 px, end at 3/4 of the width
  kStyleNoXOTextExpander = 0x4000,  // no editable-text expander button
  kStyleNoFilterIndent = 0x8000,    // effect rows have no indent of their own
};

// The left half of the effect controls panel: a scrolling list of sections (editable text,
// graphics, video, one per audio part), each a list of effect rows with their parameter rows
// below. The list builds its rows from the target (the selected clip's linked video and audio
// items, a transition, or a master clip's own effects), places and paints them, keeps the
// effect and parameter selections and the keyframe selection the keyframe area edits, and the
// time state the keyframe area draws with.
//
// Ownership: always held by a std::shared_ptr (the panel view owns it); the list owns its rows
// (section lists and audio parts) and its buttons (child views). Rows are rebuilt, never
// patched: every change of target or of a chain's structure is ClearList + a fresh build, and
// rows live until the next ClearList or until the list is destroyed.
//
// Coordinates: row tops are the list's own (view) coordinates, that is content position minus
// the scroll offset; row 0 of the content sits at kInitialBaseline.
//
// Messages: list-changed, filter-selection and audio messages go out on the own station given at
// construction; keyframe-refresh messages on the keyframe station the list registers
// (GetKeyframeViewStation). UI thread only.
class EffectControlsListView : public SubView, public Listener {
 public:
  enum TargetKind : int {
    kTargetClip = 1,
    kTargetTransition = 2,
    kTargetTransitionComponent = 3,  // a transition with its own effects
  };

  static constexpr int kInitialBaseline = 0;
  static constexpr int kSectionHeaderHeight = 21;
  static constexpr int kExpanderSize = 16;
  static constexpr int kExpanderRightInset = 20;  // expander x = bounds left + width - this
  static constexpr int kPlayButtonWidth = 26;
  static constexpr int kPlayButtonHeight = 14;
  static constexpr int kPlayButtonRightInset = 58;
  static constexpr int kFilterTitleRightMargin = 54;
  static constexpr int kMaxHeightExtra = 2;
  static constexpr int kSeparatorZoneWidth = 6;

  // Commands of the section buttons. An audio part's buttons send the base + the part's index.
  static constexpr CommandID kGraphicsExpanderCommand = 18498;
  static constexpr CommandID kVideoExpanderCommand = 18499;
  static constexpr CommandID kAudioExpanderCommand = 18500;
  static constexpr CommandID kPlayAudioPartCommand = 18550;
  static constexpr CommandID kTextExpanderCommand = 19050;
  static constexpr int kMaxAudioParts = 50;

  // `parent`: where the list's commands go that it does not handle (the panel view; not owned).
  // `ownStation`: where the list's messages go out (and the rows report); the list listens
  // there too. Registers the keyframe station.
  EffectControlsListView(Commander* parent, StationName ownStation);
  ~EffectControlsListView() override;

  // --- Style ---
  // Set before FinishCreate (the style decides which buttons are made) and before a build.
  void SetStyle(std::uint32_t style) { mStyle = style; }
  std::uint32_t GetStyle() const { return mStyle; }
  // Whether any of the bits of `flag` is set.
  bool HasECPStyle(std::uint32_t flag) const { return (mStyle & flag) != 0; }

  // --- Target ---
  // The sequence whose selection the list shows (null: none; the list is then empty).
  void SetSequence(const SequenceRef& sequence);
  const SequenceRef& GetSequence() const { return mSequence; }
  // Decides from the sequence's clip selection what to show (video, audio, a transition, a
  // transition with its own effects) and rebuilds when that changed.
  void DoSequenceClipSelectionChanged(const SequenceRef& sequence);
  // Master-clip mode: the list shows the master clip's own video effects (the selected clip's
  // master clip). Takes effect at the next build.
  void SetMasterClip(const MasterClipRef& masterClip) { mMasterClip = masterClip; }
  bool IsViewingMasterClip() const { return mMasterClip != nullptr; }
  const MasterClipRef& GetMasterClip() const { return mMasterClip; }
  void ClearMasterClip() { mMasterClip.reset(); }
  void SetTargetKind(TargetKind kind) { mTargetKind = kind; }
  TargetKind GetTargetKind() const { return mTargetKind; }
  void SetShowVideo(bool show) { mShowVideo = show; }
  void SetShowAudio(bool show) { mShowAudio = show; }
  bool GetShowVideo() const { return mShowVideo; }
  bool GetShowAudio() const { return mShowAudio; }
  // The chain of a targeted transition that carries effects of its own
  // (kTargetTransitionComponent).
  void SetTransitionChain(const ComponentChainRef& chain) { mTransitionChain = chain; }
  const ComponentChainRef& GetTransitionChain() const { return mTransitionChain; }
  // The effects of the master clip's chain are read only, or the sequence is.
  bool IsReadOnlyEffectContainer() const;

  // --- Building ---
  // ClearList, a fresh build for the target, then the list-changed and keyframe-refresh
  // messages. When the build throws (a model object it needs is missing), the list is left
  // empty, announced as such, and the exception goes on to the caller's dispatch.
  void ClearAndRebuildList();
  // Destroys every row and button the build made and forgets the objects it showed; the
  // selections are emptied. What the next build shows stays: the sequence, the master clip, the
  // style and the target the selection chose (kind, shown halves, transition chain).
  virtual void ClearList();
  virtual void RebuildClipOrTransitionView();
  void RebuildVideoClipView(const TrackItemGroup* group);
  void RebuildAudioClipView(const TrackItemGroup* group);
  void RebuildTransitionView(const TrackItemGroup* group);
  void RebuildTransitionComponentView(const TrackItemGroup* group);
  virtual void LoadVideoFilters(const TrackItemRef& trackItem, const ComponentChainRef& chain,
                                bool masterClipMode);
  // Makes one audio part per clip item, ordered by part key; returns the first part's item.
  TrackItemRef LoadAudioFilters(const std::vector<TrackItemRef>& audioItems);
  void LoadVideoTransition(const TrackItemRef& trackItem);
  void LoadAudioTransition(const TrackItemRef& trackItem);
  // The row of one effect with its mask rows and parameter rows (not yet finished or shown).
  std::shared_ptr<FilterItem> LoadFilter(MediaType mediaType, const TrackItemRef& trackItem,
                                         const ComponentRef& component, bool masterClipMode,
                                         bool allowMasks, int subgroupLevel, bool isMask);
  // The row (or rows) of one parameter, appended to `parentRow`. `controlIndex` is the
  // parameter's position in its component.
  void LoadFilterParameterControls(const TrackItemRef& trackItem,
                                   const std::shared_ptr<EffectItem>& parentRow, int controlIndex,
                                   const ComponentRef& component, const ComponentParamRef& param,
                                   bool suppressReset, int subgroupLevel);
  // Hooks for panels that extend the list.
  virtual bool ShouldAllowParameter(const ComponentRef& component, const ComponentParamRef& param);
  virtual bool AllowsViewMode(int viewMode) const;
  virtual void LoadFilterPlaceholder() {}
  virtual void LoadFilterPlaceholders(const TrackItemRef& /*trackItem*/,
                                      const std::string& /*name*/) {}
  void OnMasterClipChanged(const MasterClipRef& /*masterClip*/) {}
  // Moves the rows to `editTime` (sequence time); `force` re-reads values even when the time is
  // the same.
  virtual void UpdateParamsUI(TickTime editTime, bool force);

  // --- What was built ---
  const EffectItemList& GetVideoItems() const { return mVideoItems; }
  const EffectItemList& GetGraphicsItems() const { return mGraphicsItems; }
  const std::vector<std::shared_ptr<AudioPartInfo>>& GetAudioParts() const { return mAudioParts; }
  int GetNumberOfAudioParts() const { return static_cast<int>(mAudioParts.size()); }
  // Null when `index` is no part.
  AudioPartInfo* FindAudioPartInfoByIndex(int index) const;
  // The part whose rows hold `row` (at any depth); null for none.
  AudioPartInfo* FindAudioPartInfo(const EffectItem& row) const;
  bool IsVideoExpanded() const { return mVideoExpanded; }
  bool IsGraphicsExpanded() const { return mGraphicsExpanded; }
  bool IsTextExpanded() const { return mTextExpanded; }
  bool IsVideoLimiterPresent() const { return mVideoLimiterPresent; }
  // The shown video track item (clip or transition) and audio transition; null when none.
  const TrackItemRef& GetVideoTrackItem() const { return mVideoTrackItem; }
  const TrackItemRef& GetAudioTransitionItem() const { return mAudioTransitionItem; }
  const ComponentChainRef& GetVideoChain() const { return mVideoChain; }
  const ComponentChainRef& GetMasterGraphicChain() const { return mMasterGraphicChain; }
  // The shown item's start and media-in: what the keyframe area converts sequence time to clip
  // time with. Zero when nothing is shown.
  TickTime GetTrackItemStartTime() const { return mTrackItemStart; }
  TickTime GetTrackItemMediaInTime() const { return mTrackItemMediaIn; }
  void ResetTimes();

  // --- Stations ---
  const StationName& GetOwnStation() const { return mOwnStation; }
  const StationName& GetKeyframeViewStation() const { return mKeyframeStation; }

  // --- Selections ---
  const FilterMultiSelection::Selection& GetSelectedItems() const { return mSelectedFilters; }
  const ParameterMultiSelection::Selection& GetSelectedParameters() const {
    return mSelectedParameters;
  }
  // The keyframes selected in the keyframe area; recreated for the sequence at every build,
  // null before the first one. Shared with the keyframe area, which edits it in place.
  const std::shared_ptr<KeyframeMultiSelection>& GetKeyframeSelection() const {
    return mKeyframeSelection;
  }
  // Adds or removes an effect row's component in the effect selection and sets the row's flag.
  void SelectItem(const std::shared_ptr<EffectItem>& row, bool select);
  // The same for a parameter row and the parameter selection.
  void SelectParameter(const std::shared_ptr<EffectItem>& row, bool select);
  // Empties both selections and every row's flag; announces it when something was selected.
  void ClearSelection();

  // --- Edit time ---
  // The edit line in sequence time; every parameter row reads it.
  TickTime GetEditTime() const { return *mEditTime; }

  // --- Layout and scrolling ---
  // Places every row and section button for the current scroll offset.
  void PositionItems();
  // The content's height in pixels (headers, rows of open sections, and a small margin).
  int GetMaxHeight() const;
  // Fits the panel view's scroll bar and clamps the scroll offset to the content.
  void UpdateVScrollBar();
  void OnVScroll(ScrollCode code, int position, KeyModifiers flags);
  int GetScrollOffset() const { return mScrollOffset; }
  // The view that owns the scroll bar; not owned (it owns the list and clears this before it
  // goes). Null: no scroll bar, the offset stays as it is.
  void SetEffectControlsView(EffectControlsListScroller* view) { mScroller = view; }
  void SetDoShowVerticalSeparator(bool show);
  bool GetDoShowVerticalSeparator() const { return mShowVerticalSeparator; }
  // The top of a section header in view coordinates as last placed; -1 when the section has
  // no header.
  int GetVideoHeaderTop() const { return mVideoHeaderTop; }
  int GetGraphicsHeaderTop() const { return mGraphicsHeaderTop; }

  // --- Section buttons ---
  void OnVideoExpander();
  void OnGraphicsExpander();
  void OnXOEditableTextExpander();
  // `command`: kAudioExpanderCommand + the part's index.
  void OnAudioExpander(CommandID command);
  MultiPictureButton* GetVideoExpander() const { return mVideoExpander.get(); }
  MultiPictureButton* GetGraphicsExpander() const { return mGraphicsExpander.get(); }
  MultiPictureButton* GetTextExpander() const { return mTextExpander.get(); }
  // Whether part `index` can be played on its own: its item carries audio at normal speed.
  bool CanPlayAudioPart(int index) const;
  // Destroys the parts' buttons and rows and stops listening to their items.
  void ClearAudioPartsList();

  // --- Disclosure ---
  // A row opened or closed (one, or all of them with `expanded`): lay out again and announce.
  void OnDisclosureStateChanged();
  void OnDisclosureStateAllChanged(bool expanded);

  // --- Shared time state (written by the panel view, read by the keyframe area) ---
  // Each returns false and changes nothing when the value is the stored one. A time per pixel
  // that is not a positive number is refused (false).
  bool SetTimePerPixel(double secondsPerPixel);
  bool SetVisibleKeyframeTime(TickTime time);
  double GetTimePerPixel() const { return mTimePerPixel; }
  TickTime GetVisibleKeyframeTime() const { return mVisibleKeyframeTime; }
  // One frame of this rate lasts one pixel of the keyframe area.
  const FrameRate& GetPixelFrameRate() const { return mPixelFrameRate; }

  // --- State dump ---
  // Every row in display order (sections top to bottom, each row before its children) with
  // its path of titles, class, geometry and state. Set-aside rows are listed too.
  std::vector<StateDumpRow> GetDumpRows() const;

  // --- Messages and commands ---
  void ListenToMessage(const Message& message) override;
  // Switches every effect of the target (video, master-graphic and audio-part chains) on or
  // off as one undoable step; nothing when the effects are read only.
  void OnFilterOnOffAllChanged(bool enabled);
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  // --- Painting ---
  void PaintSelf(DC& dc) override;
  virtual void PaintBackground(DC& dc);
  // Draws one section: its header (unless `label` is empty) and, when `expanded`, its rows.
  // Returns whether a drop indicator belongs under the section.
  virtual bool DrawItemList(DC& dc, const EffectItemList& list, int headerTop,
                            const std::string& label, bool expanded, int flag);
  virtual void DrawItem(DC& dc, EffectItem& row, const Rect& rect, int flag);
  virtual void DrawFilterItem(DC& dc, FilterItem& row, const Rect& rect, int flag);
  void DrawFolderItem(DC& dc, EffectItem& row, const Rect& rect, const Rect& clip, int flag);

 protected:
  void FinishCreateSelf() override;
  void DestroySelf() override;
  void SetBoundsSelf(const Rect& bounds) override;

  // The section buttons; each is a child view made hidden.
  void CreateVideoExpanderButton();
  void CreateXOEditableTextExpanderButton();
  void CreateGraphicsExpanderButton();
  std::shared_ptr<MultiPictureButton> CreateAudioExpanderButton(int index);
  std::shared_ptr<MultiPictureButton> CreatePlayButton(int index);

  // Announcements.
  void BroadcastListChanged();
  void BroadcastRefreshKeyframes();

 private:
  void ListenTo(const StationName& station);
  void StopListeningTo(const StationName& station);
  void NewKeyframeSelection();
  void FinishAndShowRows(const EffectItemList& list);
  // The one layout walk behind PositionItems and GetMaxHeight: section headers and top rows
  // from the top of the content down; `sink` (null: only measure) receives the placements.
  // Returns the bottom of the content in view coordinates.
  class LayoutSink;
  int WalkLayout(LayoutSink* sink) const;
  void AfterLayoutChange();
  void ShowSectionRows(const EffectItemList& list, bool show);
  void AutoSelectNthEmbeddedEffect();
  // Every top row of every section, in display order.
  void ForEachTopRow(const std::function<void(const std::shared_ptr<EffectItem>&)>& visit) const;
  ParameterControlInfo MakeParameterInfo(const TrackItemRef& trackItem,
                                         const ComponentRef& component,
                                         const ComponentParamRef& param, bool masterClipMode) const;

  TargetKind mTargetKind = kTargetTransition;
  bool mVideoExpanded = false;
  bool mTextExpanded = false;
  bool mGraphicsExpanded = false;
  bool mShowVideo = false;
  bool mShowAudio = false;
  EffectItemList mVideoItems;
  EffectItemList mGraphicsItems;
  std::vector<std::shared_ptr<AudioPartInfo>> mAudioParts;
  FilterMultiSelection::Selection mSelectedFilters;
  ParameterMultiSelection::Selection mSelectedParameters;
  SequenceRef mSequence;
  MasterClipRef mMasterClip;
  ComponentChainRef mVideoChain;
  ComponentChainRef mMasterGraphicChain;
  StationName mChainStation;
  StationName mMasterGraphicChainStation;
  ComponentChainRef mTransitionChain;
  TrackItemRef mVideoTrackItem;
  StationName mVideoTrackItemStation;
  TrackItemRef mAudioTransitionItem;
  StationName mOwnStation;
  StationName mKeyframeStation;
  std::shared_ptr<KeyframeMultiSelection> mKeyframeSelection;
  std::shared_ptr<TickTime> mEditTime;
  TickTime mTrackItemStart = 0;
  TickTime mTrackItemMediaIn = 0;
  int mScrollOffset = 0;
  ImageList mImageList;
  Font mNormalFont;
  Font mLabelFont;
  std::shared_ptr<MultiPictureButton> mVideoExpander;
  std::shared_ptr<MultiPictureButton> mTextExpander;
  std::shared_ptr<MultiPictureButton> mGraphicsExpander;
  bool mVideoLimiterPresent = false;
  std::uint32_t mStyle = kStyleNone;

  bool mShowVerticalSeparator = false;
  EffectControlsListScroller* mScroller = nullptr;  // not owned; see SetEffectControlsView
  int mVideoHeaderTop = -1;
  int mGraphicsHeaderTop = -1;

  TickTime mVisibleKeyframeTime = 0;
  double mTimePerPixel = 0.0;
  FrameRate mPixelFrameRate;

  // The selection the list was last built for, and whether a build ran since the last clear.
  std::vector<TrackItemGroup> mTargetSelection;
  bool mBuilt = false;
  // The master clip the rows were built for (null: the sequence clip's own effects).
  MasterClipRef mBuiltMasterClip;

  bool mPendingAutoSelect = false;
  int mPendingAutoSelectIndex = -1;
};
