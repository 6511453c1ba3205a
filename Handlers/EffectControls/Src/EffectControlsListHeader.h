#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/SubView.h"

class MultiPictureButton;

// The row across the top of the panel: names what the panel targets (nothing, several clips,
// one clip with its master clip, or a transition) and carries the button that shows or hides
// the keyframe area (command kToggleKeyframesCommand, sent up the commander chain).
//
// Owned by the panel view (std::shared_ptr, a child view). UI thread only.
class EffectControlsListHeader : public SubView {
 public:
  enum DisplayMode : int { kModeNone = 0, kModeClip = 1, kModeTransition = 2 };
  // Hit zones of the name row in clip mode.
  enum Zone : int { kZoneNone = 0, kZoneMaster = 1, kZoneSequence = 2, kZoneUses = 3 };

  static constexpr int kToggleKeyframesCommand = 18015;
  static constexpr int kExpanderSize = 16;
  static constexpr int kExpanderRightInset = 20;  // expander x = width - this
  static constexpr int kExpanderTop = 16;
  static constexpr int kUsesZoneWidth = 21;
  // The uses popup's entries carry these commands (first + index).
  static constexpr CommandID kFirstUseCommand = 18700;
  static constexpr int kMaxUses = 100;

  // One use of the targeted clip's master clip in the project's sequences.
  struct Use {
    SequenceRef sequence;
    TrackItemRef item;
    std::string label;  // "sequence : start timecode"
  };

  // `superCommander`: where the expander's command goes (the panel view; null: the parent).
  explicit EffectControlsListHeader(Commander* superCommander = nullptr);
  ~EffectControlsListHeader() override;

  // Nothing targeted; `clipCount` > 1 shows the several-clips text.
  void SetNoTarget(int clipCount);
  // One clip of `sequence`; the master clip is the clip's (or its merged clip's).
  void SetClip(const SequenceRef& sequence, const TrackItemRef& trackItem);
  // A transition of `sequence` joining `outgoing` and `incoming` (either may be null). A null
  // or non-transition item is refused with a debug assertion; the header stays as it was.
  void SetTransition(const SequenceRef& sequence, const TrackItemRef& transition,
                     const TrackItemRef& outgoing, const TrackItemRef& incoming);

  void SetKeyframesVisible(bool visible);
  bool AreKeyframesVisible() const { return mKeyframesVisible; }
  void EnableExpander(bool enable);

  DisplayMode GetDisplayMode() const { return mDisplayMode; }
  bool HasSeveralClips() const { return mSeveralClips; }
  bool IsShowingMasterClip() const { return mShowingMasterClip; }
  // The text the header shows, as one line (the two groups joined by two spaces in clip mode).
  std::string GetDisplayText() const;
  // The master group ("Master * name") and the sequence group ("sequence * clip") of the last
  // clip set.
  const std::string& GetMasterGroupText() const { return mMasterGroupText; }
  const std::string& GetSequenceGroupText() const { return mSequenceGroupText; }
  MultiPictureButton* GetExpander() const { return mExpander.get(); }

  // Called by a click on the master group (match frame): the panel shows the master clip.
  void SetMasterClipHandler(std::function<void(const MasterClipRef&)> handler) {
    mMasterClipHandler = std::move(handler);
  }
  // Called after a click on the sequence group took the panel back into the sequence.
  void SetSequenceHandler(std::function<void()> handler) { mSequenceHandler = std::move(handler); }
  // The video uses of the targeted clip's master clip, in sequence and track order.
  std::vector<Use> GetMasterClipUses() const;

  // The zone under `point` (local coordinates); kZoneNone outside clip mode.
  Zone HitTestZone(Point point) const;
  std::string GetToolTipText(Point point) const;
  // The master and sequence group texts' zones (local coordinates) in clip mode.
  const Rect& GetMasterZoneRect() const { return mMasterZone; }
  const Rect& GetSequenceZoneRect() const { return mSequenceZone; }
  // The zone's text shown as the header's tool tip.
  std::string GetToolTipSelf(Point point) const override;

  void FinishCreateSelf() override;
  void SetBoundsSelf(const Rect& bounds) override;
  void PaintSelf(DC& dc) override;
  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  // The uses popup's entries (enabled while the popup's uses exist); other commands go up the
  // chain.
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

 private:
  Rect GetTextRect() const;
  // Places the name row's groups; when the clip or the bounds change, not per paint.
  void LayOutNameRow();
  Rect GetUsesZoneRect() const;
  void PlaceExpander();
  void MatchFrame();
  void GoBackToSequence();
  void PopUpUses();

  bool mKeyframesVisible = true;
  bool mSeveralClips = false;
  SequenceRef mSequence;
  TrackItemRef mTrackItem;
  TrackItemRef mOutgoing;
  TrackItemRef mIncoming;
  std::shared_ptr<MultiPictureButton> mExpander;
  DisplayMode mDisplayMode = kModeNone;
  bool mShowingMasterClip = false;
  bool mBusy = false;
  std::string mNoTargetText;
  std::string mSeveralClipsText;
  std::string mMasterPrefix;
  std::string mDelimiter;
  std::string mTransitionText;
  std::string mSequenceName;
  // The texts the header draws, made when the target is set: names may be megabytes long.
  std::string mMasterGroupText;
  std::string mSequenceGroupText;
  std::string mTransitionLine;
  // The name row's groups, each a triangle and its text (local coordinates).
  Rect mMasterZone;
  Rect mSequenceZone;
  Font mFont;
  std::vector<Use> mUses;  // of the last uses popup
  std::function<void(const MasterClipRef&)> mMasterClipHandler;
  std::function<void()> mSequenceHandler;
};
