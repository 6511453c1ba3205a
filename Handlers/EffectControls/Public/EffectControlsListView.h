#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/PanelTarget.h"
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
#include "Host/Time/TimePoint.h"
#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/SubView.h"

class AudioPartInfo;
class ClipboardItem;
class DC;
class DirectManipulationManager;
class EffectClipboardItem;
class EffectControlsListScroller;
class EffectItem;
class FilterItem;
class KeyframeMultiSelection;
class MultiPictureButton;
struct EffectRowRules;
class PanelTimeline;
struct PanelTimelineChangedMessage;
struct CommandStatus;
struct ParameterControlInfo;
struct PlannedRow;
enum class ScrollCode : std::int32_t;

// Bits that change how the list builds and draws (see HasECPStyle). The effect controls panel
// uses none; they are for other panels that embed or extend the list.
enum EffectControlsListViewStyle : std::uint32_t {
  kStyleNone = 0,
  kStyleNoVideoExpander = 0x1,        // no video expander button
  kStyleNoAudio = 0x2,                // audio clips show no rows
  kStyleHideTimeRemapping = 0x8,      // no row for the time-remapping intrinsic
  kStyleNoVideoSetupButton = 0x40,    // video effect rows show no setup-dialog button
  kStyleCheckboxSwitch = 0x80,        // effect rows switch with a check box
  kStyleIndentFilters = 0x100,        // effect rows indented by 40 pixels
  kStyleStartCollapsed = 0x200,       // effect rows start collapsed
  kStyleNoMaskControls = 0x400,       // no mask-shape row and no mask rows
  kStyleOwnSliderRows = 0x800,        // angle, point and colour parameters use the panel's rows
  kStyleWideParameterNames = 0x2000,  // parameter names start at 10 px, end at 3/4 of the width
  kStyleNoXOTextExpander = 0x4000,    // no editable-text expander button
  kStyleNoFilterIndent = 0x8000,      // effect rows have no indent of their own
};

// How EffectControlsListView::HitTestAndSelect treats a miss.
struct ListHitTestOptions {
  bool keepKeyframesOnMiss = false;
};

// The left half of the effect controls panel: a scrolling list of sections (editable text,
// graphics, video, one per audio part), each a list of effect rows with their parameter rows
// below. The list builds its rows from the target (the selected clip's linked video and audio
// items, a transition, or a master clip's own effects), places and paints them, keeps the
// effect and parameter selections and the keyframe selection the keyframe area edits. Its rows
// and the keyframe area read the edit time and zoom from the panel's PanelTimeline.
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
  using TargetKind = PanelTarget::Kind;
  static constexpr TargetKind kTargetClip = PanelTarget::kClip;
  static constexpr TargetKind kTargetTransition = PanelTarget::kTransition;
  static constexpr TargetKind kTargetTransitionComponent = PanelTarget::kTransitionComponent;

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
  // The effect commands the panel view routes to the list (besides the standard edit ones).
  static constexpr CommandID kDeleteAllEffectsCommand = 11541;
  static constexpr CommandID kSavePresetCommand = 18002;
  static constexpr CommandID kEffectsEnabledCommand = 18003;
  static constexpr CommandID kDeleteEffectCommand = 18005;
  static constexpr CommandID kResetEffectCommand = 18300;
  static constexpr int kMaxAudioParts = 50;

  // `parent`: where the list's commands go that it does not handle (the panel view; not owned).
  // `ownStation`: where the list's messages go out (and the rows report); the list listens
  // there too. Registers the keyframe station. `timeline`: the panel's time state, shared with
  // the panel view that owns it; null gives the list one of its own (a list on its own).
  EffectControlsListView(Commander* parent, StationName ownStation,
                         std::shared_ptr<PanelTimeline> timeline = nullptr);
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
  const SequenceRef& GetSequence() const { return mTarget.sequence; }
  // Decides from the sequence's clip selection what to show (video, audio, a transition, a
  // transition with its own effects) and rebuilds unless the rows were built for that very
  // target (see PanelTarget).
  void DoSequenceClipSelectionChanged(const SequenceRef& sequence);
  // Master-clip mode: the list shows the master clip's own video effects (the selected clip's
  // master clip). Takes effect at the next build.
  void SetMasterClip(const MasterClipRef& masterClip) { mTarget.masterClip = masterClip; }
  bool IsViewingMasterClip() const { return mTarget.masterClip != nullptr; }
  const MasterClipRef& GetMasterClip() const { return mTarget.masterClip; }
  void ClearMasterClip() { mTarget.masterClip.reset(); }
  void SetTargetKind(TargetKind kind) { mTarget.kind = kind; }
  TargetKind GetTargetKind() const { return mTarget.kind; }
  void SetShowVideo(bool show) { mTarget.showVideo = show; }
  void SetShowAudio(bool show) { mTarget.showAudio = show; }
  bool GetShowVideo() const { return mTarget.showVideo; }
  bool GetShowAudio() const { return mTarget.showAudio; }
  // The chain of a targeted transition that carries effects of its own
  // (kTargetTransitionComponent).
  void SetTransitionChain(const ComponentChainRef& chain) { mTarget.transitionChain = chain; }
  const ComponentChainRef& GetTransitionChain() const { return mTarget.transitionChain; }
  // What the next build shows, and what the rows were built for (none since the last clear).
  const PanelTarget& GetTarget() const { return mTarget; }
  const std::optional<PanelTarget>& GetBuiltTarget() const { return mBuiltTarget; }
  // What `groups` (the sequence's clip selection) asks the list to show.
  PanelTarget ChooseTarget(std::vector<TrackItemGroup> groups) const;
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
  // The row (or rows) of one parameter, appended to `parentRow`. `controlIndex` is the
  // parameter's position in its component. The hook decides for any but an audio effect, whose
  // own description has already left out what it hides.
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
  // Converts through the shown video item, else the shown audio transition (the item ResetTimes
  // chose); with neither, the two lines coincide.
  SequenceTime ClipTimeToSequenceTime(ClipTime clipTime) const;
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
  // Only this parameter is selected (effects and other parameters are not).
  void SelectParameterExclusively(const std::shared_ptr<EffectItem>& row);
  // Selects every effect from the anchor to `row` in display order, both included; the anchor
  // is the selected effect nearest to `row` (the one before it when the click lies between two
  // selected effects). The keyframe selection is emptied.
  void ShiftClickSelection(const std::shared_ptr<EffectItem>& row);

  // --- Selection queries ---
  // What GetSelectedComponentsWithOptions includes besides the selected effects.
  struct SelectedComponentOptions {
    bool includeMasks = false;  // selected masks (subsidiary entries)
    // With no effect selected: the effects whose parameters are selected.
    bool includeParameterOwners = false;
  };
  // The selected effects that are no masks, in selection order, with their track items.
  void GetSelectedComponents(std::vector<ComponentRef>& components,
                             std::vector<TrackItemRef>& trackItems) const;
  std::vector<ComponentRef> GetSelectedComponentsWithOptions(
      const SelectedComponentOptions& options) const;
  // The selected effects (masks included) that belong to `chain`.
  void GetSelectedComponentsFromComponentChain(const ComponentChain& chain,
                                               std::vector<ComponentRef>& components,
                                               std::vector<TrackItemRef>& trackItems) const;
  // The selected effect when exactly one is selected, else null.
  ComponentRef GetSingleSelectComponent() const;
  // False when nothing is selected.
  bool FirstSelectedComponent(ComponentRef& component, TrackItemRef& trackItem) const;
  bool AtLeastOneFilterSelected() const { return !mSelectedFilters.IsEmpty(); }
  bool IsFilterSelected() const { return !mSelectedFilters.IsEmpty(); }
  bool IsOneFilterSelected() const { return mSelectedFilters.Size() == 1; }
  bool SelectionContainsSubsidiaryItems() const {
    return mSelectedFilters.ContainsSubsidiaryItems();
  }

  // --- Hit testing (list coordinates) ---
  static constexpr int kFolderHitBandHeight = 18;
  static constexpr int kDragThreshold = 2;
  // A parameter's name ends this far before the middle of the list.
  static constexpr int kParameterNameEndBeforeMiddle = 20;
  static constexpr const char* kEditMenuName = "HandlerEffectControls_Edit_Menu";
  // Hit-tests the shown sections in display order and changes the selections as the click
  // asks; opens the edit menu for a right click. True when a row was hit.
  bool ClickedItem(Point point, KeyModifiers modifiers, MouseButton button);
  // The rows of one section. When no row is hit, the keyframe selection is emptied unless
  // the options keep it (a later section may still be hit).
  using HitTestOptions = ListHitTestOptions;
  bool HitTestAndSelect(const EffectItemList& list, Point point, KeyModifiers modifiers,
                        MouseButton button, const HitTestOptions& options = {});
  // A click on an effect row's title band.
  bool HitFilter(const std::shared_ptr<EffectItem>& row, Point point, KeyModifiers modifiers,
                 MouseButton button);
  // A click on a parameter row: a hit only on its name.
  bool HitParam(const std::shared_ptr<EffectItem>& row, Point point, KeyModifiers modifiers,
                MouseButton button);
  // The name area of a parameter row (empty when the list is too narrow for one).
  Rect GetParameterNameRect(const EffectItem& row) const;
  // Whether the point lies in a row's custom user interface.
  bool HitTestCustomUIRectangles(Point point) const;
  // The deepest shown row whose own band holds the point, or null.
  std::shared_ptr<EffectItem> FindItemFromPoint(Point point) const;
  // Whether the point lies in the zone at the right edge that drags the separator.
  bool IsInSeparatorZone(Point point) const;
  bool IsDraggingSeparator() const { return mSeparatorDragging; }
  bool IsHoveringSeparator() const { return mSeparatorHovering; }
  void SetSeparatorEnabled(bool enabled) { mSeparatorEnabled = enabled; }

  // --- Direct manipulation (the monitor's on-screen controls) ---
  // Makes the selected effect with on-screen controls the host's direct-manipulation effect,
  // else the effect owning the selected parameters, else none.
  void UpdateDirectManipulation();
  // The host reports the user picked `component`'s on-screen controls: select its row alone.
  void SelectDMFilterItem(const ComponentRef& component);
  // The effect that owns the selected parameters (the first when several); null when none.
  ComponentRef GetDirectManipulationComponent() const;
  // The project's manager; null with no target.
  DirectManipulationManager* GetDirectManipulationManager() const;

  // --- Effect commands ---
  // Each does nothing on a read-only container. The On... operations return whether they had
  // something to act on (the panel view passes delete and paste on to the keyframe area when
  // the list had not).
  bool OnDelete();
  bool OnDeleteEffect() { return OnDelete(); }
  bool OnCut();
  bool OnCopy();
  bool OnPaste();
  void OnSelectAll();
  void OnDeselectAll() { ClearSelection(); }
  void OnResetEffect();
  void OnEffectEnabled();
  void OnDeleteAllEffects();
  // Statuses of the list's own commands (the standard edit commands).
  void OnDeleteStatus(CommandID command, CommandStatus& status) const;
  void OnCopyStatus(CommandStatus& status) const;
  void OnPasteStatus(CommandStatus& status) const;
  void OnSelectAllStatus(CommandStatus& status) const;
  void OnDeselectAllStatus(CommandStatus& status) const;
  // The statuses of the effect commands the panel view routes to the list.
  void OnCommandStatus(CommandID command, CommandStatus& status) const;
  bool CanDeleteEffects() const;
  bool GetAllowSavePreset() const;
  // Copies of the selected effects and masks; null with an empty selection.
  std::shared_ptr<const EffectClipboardItem> CreateVideoFilterComponentClipboardItemFromSelection()
      const;
  // Pastes the item's masks into the mask paste target as one step; false when there is no
  // target or nothing to paste.
  bool PasteFromVideoFilterComponentClipboardItem(const EffectClipboardItem& item);
  // The effect a mask paste goes into: the first selected video effect that takes masks, or
  // the owner of a selected mask. False when there is none.
  bool GetMaskPasteTarget(ComponentRef& videoFilterComponent) const;
  // The chains a paste of effects may go into (the shown items', or the master clip's).
  std::vector<ComponentChainRef> GetPasteTargetChains() const;

  // --- Edit time ---
  // The edit line in sequence time (the timeline's); every parameter row reads it.
  TickTime GetEditTime() const;
  const PanelTimeline& GetTimeline() const { return *mTimeline; }

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

  // --- Keyframe area zoom (the timeline's; see PanelTimeline) ---
  // Each returns false and changes nothing when the value is the stored one. A time per pixel
  // that is not a positive number is refused (false).
  bool SetTimePerPixel(double secondsPerPixel);
  bool SetVisibleKeyframeTime(TickTime time);
  double GetTimePerPixel() const;
  TickTime GetVisibleKeyframeTime() const;
  // One frame of this rate lasts one pixel of the keyframe area.
  const FrameRate& GetPixelFrameRate() const;

  // --- State dump ---
  // Every row in display order (sections top to bottom, each row before its children) with
  // its path of titles, class, geometry and state. Set-aside rows are listed too. `origin`:
  // the list's top-left in the coordinates the rectangles are wanted in (the panel's).
  std::vector<StateDumpRow> GetDumpRows(Point origin = {}) const;

  // --- Mouse (list coordinates) ---
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  void RightButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  bool SetCursorSelf(Point point, KeyModifiers modifiers) override;
  void MouseCaptureLostSelf() override;

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
  void OnTimelineChanged(const PanelTimelineChangedMessage& change);
  // Rows whose values were read at another time read them again.
  void SyncRowsToTime(bool force);
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
  // Selects the rows of the effects a paste added, once they are built; the request is for
  // the next build only.
  void AutoSelectNthEmbeddedEffect();
  // Selects the rows of these components alone; those without a row are skipped.
  void SelectComponents(const std::vector<ComponentRef>& components);
  // A press at `point` moved beyond the threshold: the effect pressed starts to move.
  // Intrinsic, archived and read-only effects show the no-drop cursor and do not move.
  void DragSelection(Point point);
  bool HitTestRow(const std::shared_ptr<EffectItem>& row, Point point, KeyModifiers modifiers,
                  MouseButton button);
  bool IsMaskMultiSelectEnabled() const;
  void OpenEditMenu(Point point);
  // The sections that hold selectable rows, in display order (graphics, video, the audio
  // parts of clips).
  void ForEachSelectableList(const std::function<void(const EffectItemList&)>& visit) const;
  std::shared_ptr<FilterItem> FindFilterRow(const Component* component,
                                            const TrackItem* trackItem) const;
  Project* GetTargetProject() const;
  // Every top row of every section, in display order.
  void ForEachTopRow(const std::function<void(const std::shared_ptr<EffectItem>&)>& visit) const;
  // What the style says about which rows exist.
  EffectRowRules MakeRowRules() const;
  // The rows of planned effects, made (not yet finished or shown) and appended to `section`;
  // `trackItem` is the item they belong to.
  void AddEffectRows(EffectItemList& section, const std::vector<PlannedRow>& effects,
                     const TrackItemRef& trackItem);
  std::shared_ptr<FilterItem> MakeEffectRow(const PlannedRow& effect,
                                            const TrackItemRef& trackItem);
  // The rows under an effect or a group; `masterClipEffect` is that of the effect above.
  void AddPlannedRows(const std::shared_ptr<EffectItem>& parent,
                      const std::vector<PlannedRow>& rows, const TrackItemRef& trackItem,
                      bool masterClipEffect);
  void AddGroupRow(const std::shared_ptr<EffectItem>& parent, const PlannedRow& group,
                   const TrackItemRef& trackItem, bool masterClipEffect);
  ParameterControlInfo MakeParameterInfo(const TrackItemRef& trackItem,
                                         const ComponentRef& component,
                                         const ComponentParamRef& param, bool masterClipMode) const;

  // What the selection chose (and the next build shows).
  PanelTarget mTarget;
  // What the rows were built for; empty after ClearList.
  std::optional<PanelTarget> mBuiltTarget;
  bool mVideoExpanded = false;
  bool mTextExpanded = false;
  bool mGraphicsExpanded = false;
  EffectItemList mVideoItems;
  EffectItemList mGraphicsItems;
  std::vector<std::shared_ptr<AudioPartInfo>> mAudioParts;
  FilterMultiSelection::Selection mSelectedFilters;
  ParameterMultiSelection::Selection mSelectedParameters;
  ComponentChainRef mVideoChain;
  ComponentChainRef mMasterGraphicChain;
  StationName mChainStation;
  StationName mMasterGraphicChainStation;
  TrackItemRef mVideoTrackItem;
  StationName mVideoTrackItemStation;
  TrackItemRef mAudioTransitionItem;
  StationName mOwnStation;
  StationName mKeyframeStation;
  std::shared_ptr<KeyframeMultiSelection> mKeyframeSelection;
  // Shared with the panel view, which owns it, and (its edit time) with the rows.
  std::shared_ptr<PanelTimeline> mTimeline;
  // The item whose placement relates the rows' clip times to the sequence (see ResetTimes).
  TrackItemRef mTimeReferenceItem;
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

  // Effects a paste added, to select once the next build has made their rows.
  std::vector<ComponentRef> mPendingSelection;

  // Separator drag at the right edge and the click in progress.
  bool mSeparatorEnabled = true;
  bool mSeparatorHovering = false;
  bool mSeparatorDragging = false;
  int mSeparatorGrabOffset = 0;
  std::optional<Point> mPressPoint;  // while a left click may still turn into a drag
  // The audio part the dragged row belongs to (null: a video or graphics row). Not owned.
  AudioPartInfo* mDragAudioPart = nullptr;
};
