#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ParamValue.h"
#include "Host/Rows/ControlPointViewerHSLBase.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"
#include "Host/Time/TimePoint.h"
#include "Host/Toolkit/Commander.h"

class ComponentParamActor;
class EffectControlsKeyframeViewHSLBase;
class ImageList;
class MultiPictureButton;
class ParameterCache;

// A row ended a change of its parameter (a gesture, a click, a typed value); on the row's
// station. The list refreshes the keyframe area and its layout.
struct ParameterControlChangedMessage : MessageOf<ParameterControlChangedMessage> {
  static constexpr std::string_view kTypeName = "ParameterControlChangedMessage";
  explicit ParameterControlChangedMessage(ComponentParamRef p) : param(std::move(p)) {}
  ComponentParamRef param;
};

// A row's value is being dragged; sent for every step, on the row's station.
struct ParameterControlValueChangingMessage : MessageOf<ParameterControlValueChangingMessage> {
  static constexpr std::string_view kTypeName = "ParameterControlValueChangingMessage";
};

// A row's range or display settings changed; on the row's station.
struct ParameterControlMinMaxChangedMessage : MessageOf<ParameterControlMinMaxChangedMessage> {
  static constexpr std::string_view kTypeName = "ParameterControlMinMaxChangedMessage";
};

// What every parameter row is made with. The list fills one per parameter.
struct ParameterControlInfo {
  ViewBase* parentView = nullptr;  // the list view; not owned (see EffectItem)
  std::string name;                // empty: the parameter's display name
  StationName station;             // the list's own station
  SequenceRef sequence;
  ComponentRef component;
  ComponentParamRef param;
  TrackItemRef trackItem;  // null in master-clip mode: clip time is sequence time
  // The edit line in sequence time, written by the list and read by its rows. Null: the
  // sequence's current time.
  std::shared_ptr<const TickTime> editTime;
  // Where the player reports (stopped, position); empty: the sequence's player station.
  StationName playerStation;
  bool readOnly = false;  // the effect container accepts no edits
};

// Base of the rows that present one parameter (or a group of them): the binding to the model,
// the edit time, time conversion through the track item, the edit contract (an actor per
// gesture), the stopwatch that makes the parameter vary over time, the keyframe strip and the
// value and velocity graphs that the keyframe area asks the row to draw and hit-test.
//
// Layout of the row's own band (x from the row's group-level indent): disclosure triangle at
// +3 (rows that expand), stopwatch at +20 (parameters that can vary), name from +37 to the
// title right edge, value controls from GetControlsLeft(). While expanded, the row grows by its
// control area (a slider) or its graphs, whichever is taller; the graphs sit at the bottom
// (velocity graph last) so the keyframe area can draw them beside the controls.
//
// Edit contract: SynchParamActor opens an edit (a ComponentParamActor at the clip edit time)
// unless one is open; SetEditValue changes the model at once without an undo step; CommitEdit
// makes the gesture one undoable "MZ.ComponentParam.SetValue"; ReleaseParamActor ends the edit
// (an edit with a value set and not committed commits as it ends). A read-only row opens no
// edit. UI thread only.
class ParameterControl : public EffectItem, public Commander {
 public:
  // The stopwatch's command, sent by the row's own button to the row.
  static constexpr CommandID kToggleTimeVaryingCommand = 17901;
  // The keyframe strip at the top of the row in the keyframe area.
  static constexpr int kKeyframeStripHeight = 20;
  // A keyframe glyph is hit within this many pixels of its time.
  static constexpr int kKeyframeHitTolerance = 8;
  static constexpr int kDefaultGraphHeight = 54;
  static constexpr int kMinimumGraphHeight = 20;
  static constexpr int kStopwatchOffset = 20;
  static constexpr int kStopwatchSize = 16;

  explicit ParameterControl(const ParameterControlInfo& info);
  ~ParameterControl() override;

  // --- EffectItem ---
  void ListenToMessage(const Message& message) override;
  // Creates the stopwatch and starts listening to the parameter and the player; then shows the
  // value (SynchToCurrentTime).
  void FinishCreateSelf() override;
  // Ends an open edit (committing a set value), stops listening, destroys the controls.
  // Also the value fields the parameter cache lends the row, which are no adopted controls.
  void CommitPendingInput() override;
  void Destroy() override;
  bool IsParameter() const override { return true; }
  bool IsParamEnabled() const override;
  bool CanTimeVary() const override;
  // The control area or the graphs, whichever is taller.
  int GetExpandedAreaHeight() const override;
  void PositionSelf(int top, int depth, int width) override;
  // The parameter's keyframe times (see the base).
  void GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const override;
  // Where a row's value controls start: the parameter indent + half the width - 20.
  virtual int GetControlsLeft() const;
  // The name ends where the controls start.
  int GetTitleRightEdge() const override { return GetControlsLeft(); }

  // --- Commander ---
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  // --- Binding ---
  const SequenceRef& GetSequence() const { return mSequence; }
  const ComponentRef& GetComponent() const { return mComponent; }
  const ComponentParamRef& GetParam() const { return mParam; }
  const TrackItemRef& GetTrackItem() const { return mTrackItem; }
  const StationName& GetPlayerStation() const { return mPlayerStation; }
  // Rebinds the row to another parameter (the same row type): ends an open edit, moves the
  // listeners, rebinds the graphs and shows the new value.
  virtual void UpdateParamBinding(const SequenceRef& sequence, const ComponentRef& component,
                                  const ComponentParamRef& param, const TrackItemRef& trackItem,
                                  const StationName& playerStation = {});
  // The model's visibility of the parameter (a row of a hidden parameter is set aside).
  virtual bool IsParamVisible() const;
  // The row accepts no edits: the container or the parameter is read only.
  bool IsReadOnly() const;
  void SetReadOnly(bool readOnly) { mReadOnly = readOnly; }
  // The number a group control reports this row's parameter under; rows pass it on to their
  // controls as the owner cookie.
  virtual void SetControlID(int id) { mControlID = id; }
  int GetControlID() const { return mControlID; }

  // --- Time ---
  // The edit line in sequence time, and the same instant in clip time.
  TickTime GetEditTime() const;
  TickTime GetClipEditTime() const {
    return SequenceTimeToClipTime(SequenceTime(GetEditTime())).Ticks();
  }
  // The parameter's value at the edit time (its default when the row has no parameter).
  ParamValue GetValueAtEditTime() const;
  // Through the track item; the identity without one.
  ClipTime SequenceTimeToClipTime(SequenceTime sequenceTime) const;
  SequenceTime ClipTimeToSequenceTime(ClipTime clipTime) const;

  // --- Showing the value ---
  // Reads the parameter at the edit time into the row's controls. Called when the edit time
  // moves and when the model changed.
  virtual void SynchToCurrentTime() = 0;
  // Re-reads ranges and display settings (then the value). The base does nothing.
  virtual void RefreshSliderParameters() {}
  // Re-reads the name from the model.
  virtual void RefreshDisplayName();
  // The model changed `param` (this row's parameter or another): refresh what it shows.
  virtual void OnParamChanged(const ComponentParamRef& param);
  virtual void OnPlayerPositionChanged(TickTime sequenceTime);
  // The player stopped: an open edit ends (committing a set value).
  virtual void OnPlayerIsStopped();
  // Tells the list that a change ended, so the keyframe area is redrawn.
  void RedrawKeyframeView();
  // Re-reads the rate of change at the edit time (value units per second; 0 when constant).
  void UpdateCurrentVelocity();
  double GetCurrentVelocity() const { return mCurrentVelocity; }

  // --- Edit contract ---
  virtual bool SynchParamActor();
  virtual void ReleaseParamActor();
  bool IsEditOpen() const { return mActor != nullptr; }
  // Sets the value through the open edit (opening one if needed). False when refused.
  bool SetEditValue(const ParamValue& value);
  // Commits the open edit as one undoable step. False when none is open or nothing was set.
  bool CommitEdit();
  // Begin, set, commit and release in one: a click or a typed value. False when refused.
  bool ApplyValue(const ParamValue& value);

  // --- Time variation (the stopwatch) ---
  bool IsTimeVarying() const;
  // Undoable ("MZ.ComponentParam.SetTimeVarying"): on adds a keyframe at the edit time, off
  // removes every keyframe keeping the value at the edit time.
  virtual void SetTimeVarying(bool timeVarying);

  // --- Keyframe strip (keyframe area coordinates: x 0 is the visible start time) ---
  // The keyframe area registers itself before drawing the row; not owned (see
  // EffectControlsKeyframeViewHSLBase). `flag` is kept for the area's own use.
  void SetKeyframeViewer(EffectControlsKeyframeViewHSLBase* viewer, bool flag = true);
  EffectControlsKeyframeViewHSLBase* GetKeyframeViewer() const { return mKeyframeViewer; }
  bool GetKeyframeViewerFlag() const { return mKeyframeViewerFlag; }
  // Draws the parameter's keyframes in the strip at the top of `rowRect` (rowRect.left is the
  // x of `visibleStart`; one pixel lasts one frame of `pixelRate`) from the shared keyframe
  // images; keyframes whose clip time is in `selectedClipTimes` are drawn selected.
  virtual void DrawKeyframes(DC& dc, const Rect& rowRect, TickTime visibleStart,
                             const FrameRate& pixelRate,
                             const std::set<TickTime>& selectedClipTimes);
  // The first keyframe (in time order) whose x lies within the hit tolerance of point.x and
  // whose sequence time is not negative; its sequence time goes to `hitTime`.
  virtual bool HitKeyframe(Point point, TickTime originTime, const FrameRate& timeScale,
                           TickTime& hitTime) const;
  // The glyph index of a keyframe: 6 x kind + variant.
  static int GetKeyframeImageIndex(const ComponentParam& param, std::size_t keyframeIndex,
                                   bool selected);
  // The images every row draws keyframes from (48: see Decals.h). The handler hands over its
  // list; without one the rows make the standard list themselves.
  static void SetKeyframeImageList(std::shared_ptr<const ImageList> images);
  static std::shared_ptr<const ImageList> GetKeyframeImageList();

  // --- Graphs ---
  // Whether the row shows value and velocity graphs while expanded.
  virtual bool HasGraphs() const;
  int GetValueGraphHeight() const { return mValueGraphHeight; }
  int GetVelocityGraphHeight() const { return mVelocityGraphHeight; }
  // Limited to the minimum heights.
  void SetValueGraphHeight(int height);
  void SetVelocityGraphHeight(int height);
  virtual int GetValueGraphMinimumHeight() const { return kMinimumGraphHeight; }
  virtual int GetVelocityGraphMinimumHeight() const { return kMinimumGraphHeight; }
  // The graphs' rectangles for a row drawn at `rowRect` (keyframe area coordinates); empty
  // when the row shows no graphs.
  Rect GetValueGraphRect(const Rect& rowRect) const;
  Rect GetVelocityGraphRect(const Rect& rowRect) const;
  // Sets the graph viewers up for `rowRect` and lets them draw.
  virtual void DisplayGraph(DC& dc, const Rect& rowRect, TickTime visibleStart,
                            double secondsPerPixel, bool pinToClip);
  // What lies under `point` in the graphs as of the last DisplayGraph.
  virtual ControlPointHit HitControlPointGraph(Point point);
  ControlPointViewerHSLBase* GetValueGraphViewer() const { return mValueViewer.get(); }
  ControlPointViewerHSLBase* GetVelocityGraphViewer() const { return mVelocityViewer.get(); }
  // Makes the graph viewers of every row from now on (the panel registers its own).
  using GraphViewerFactory = std::function<std::unique_ptr<ControlPointViewerHSLBase>(
      ParameterControl& row, bool velocityGraph)>;
  static void SetGraphViewerFactory(GraphViewerFactory factory);

  // --- Shared controls ---
  static ParameterCache& GetParameterCache();

 protected:
  // --- EffectItem hooks ---
  void ShowControls(bool show) override;
  Point GetDisclosureTrianglePosition() const override;
  bool UpdateSetAside() override;
  bool UpdateParameterUI() override;
  void SynchToTime(bool force) override;
  std::shared_ptr<const void> KeepAliveForDispatch() const override;

  // Creates the row's value controls (FinishCreateSelf, after the stopwatch and before the
  // first SynchToCurrentTime) and destroys them (Destroy). Controls made with AdoptControl.
  virtual void CreateControlsSelf() {}
  virtual void DestroyControlsSelf() {}
  // Height of the controls shown under the band while expanded (a slider); 0 by default.
  virtual int GetControlAreaHeight() const { return 0; }
  // Lets the rows enable or disable their controls when the parameter's state changes.
  virtual void UpdateControlsEnabled(bool /*enabled*/) {}
  // Re-reads the stopwatch's state from the model.
  void UpdateStopwatch();
  MultiPictureButton* GetStopwatch() const { return mStopwatch.get(); }

  // Starts and stops listening on the binding's stations.
  void ListenToBinding();
  void StopListeningToBinding();

 private:
  void EnsureGraphViewers();
  void BindGraphViewers();

  SequenceRef mSequence;
  ComponentRef mComponent;
  ComponentParamRef mParam;
  TrackItemRef mTrackItem;
  StationName mPlayerStation;
  std::shared_ptr<const TickTime> mEditTime;
  std::optional<TickTime> mLastSynchTime;
  double mCurrentVelocity = 0.0;
  bool mReadOnly = false;
  int mControlID = 0;
  bool mListening = false;

  std::unique_ptr<ComponentParamActor> mActor;
  std::shared_ptr<MultiPictureButton> mStopwatch;

  EffectControlsKeyframeViewHSLBase* mKeyframeViewer = nullptr;  // not owned; see setter
  bool mKeyframeViewerFlag = true;
  std::unique_ptr<ControlPointViewerHSLBase> mValueViewer;
  std::unique_ptr<ControlPointViewerHSLBase> mVelocityViewer;
  int mValueGraphHeight = kDefaultGraphHeight;
  int mVelocityGraphHeight = kDefaultGraphHeight;
};
