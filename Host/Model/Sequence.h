#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "Host/Model/Markers.h"
#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/TrackItemGroup.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// Property keys carried by PropertiesChangedMessage for a sequence or master clip.
inline constexpr const char* kPropertyKey_InPoint = "MZ.InPoint";
inline constexpr const char* kPropertyKey_OutPoint = "MZ.OutPoint";
inline constexpr const char* kPropertyKey_FrameAlignment = "MZ.FrameAlignment";

// A sequence: video and audio tracks, frame rate and time display, in, out and zero points,
// markers, the edit line (current time) with its player, and the current selection of track
// items. Owned by the project; owns its tracks.
//
// Messages on GetStation(): SequenceChangedMessage (structure, timing and settings),
// SequenceClipSelectionChangedMessage, PropertiesChangedMessage, MarkersChangedMessage,
// SequenceZeroPointChangedMessage, SequenceNameChangedMessage, SequenceSettingsChangedMessage,
// TrackItemLinkStatusChangedMessage, ReadOnlyStateChangedMessage. On GetPlayerStation():
// PlayerPositionChangedMessage, PlayerIsPlayingMessage, PlayerIsStoppedMessage.
//
// Setters are not undoable: they are for building, loading and the actions
// (SequencePropertyActions and the sequence editing actions). Selection and the edit line are
// not edits and have no undo.
class Sequence : public ModelObject {
 public:
  // The size of the sequence's video frames, in pixels.
  struct FrameSize {
    int width = 1920;
    int height = 1080;
    friend bool operator==(const FrameSize&, const FrameSize&) = default;
  };
  static constexpr int kMaxFrameSide = 16384;

  static SequenceRef Create(std::string name, FrameRate videoRate = kFrameRate_25,
                            FrameRate audioRate = kFrameRate_Audio48000);
  ~Sequence() override;

  const std::string& GetName() const { return mName; }
  void SetName(std::string name);

  const FrameRate& GetVideoFrameRate() const { return mVideoRate; }
  const FrameRate& GetAudioFrameRate() const { return mAudioRate; }
  // How times are shown: the video display may differ from the rate (drop-frame labels).
  const FrameRate& GetVideoTimeDisplay() const { return mVideoDisplay; }
  const FrameRate& GetAudioTimeDisplay() const { return mAudioDisplay; }
  // Invalid rates are refused. SequenceSettingsChangedMessage.
  bool SetFrameRates(FrameRate videoRate, FrameRate audioRate);
  bool SetTimeDisplays(FrameRate videoDisplay, FrameRate audioDisplay);

  const FrameSize& GetFrameSize() const { return mFrameSize; }
  // Sides from 1 to kMaxFrameSide; others are refused. SequenceSettingsChangedMessage.
  bool SetFrameSize(FrameSize size);

  // True: times align to audio samples; false: to video frames.
  bool IsAudioFrameAligned() const { return mAudioFrameAligned; }
  void SetAudioFrameAligned(bool aligned);  // PropertiesChangedMessage "MZ.FrameAlignment"

  TickTime GetZeroPoint() const { return mZeroPoint; }
  void SetZeroPoint(TickTime time);  // SequenceZeroPointChangedMessage

  std::optional<TickTime> GetInPoint() const { return mInPoint; }
  std::optional<TickTime> GetOutPoint() const { return mOutPoint; }
  void SetInPoint(std::optional<TickTime> time);   // PropertiesChangedMessage "MZ.InPoint"
  void SetOutPoint(std::optional<TickTime> time);  // PropertiesChangedMessage "MZ.OutPoint"

  const Markers& GetMarkers() const { return mMarkers; }
  void SetMarkers(Markers markers);  // MarkersChangedMessage
  // Edits the markers in place; MarkersChangedMessage when `change` returns true (it changed
  // something). Used by MarkerActions, whose steps keep only the marker they change.
  void ChangeMarkers(const std::function<bool(Markers&)>& change);

  // The edit line. Moving it sends PlayerPositionChangedMessage on the player station.
  TickTime GetCurrentTime() const { return mCurrentTime; }
  void SetCurrentTime(TickTime time, int playMode = kPlayModeSet);
  const StationName& GetPlayerStation() const { return mPlayerStation; }
  PlayerState GetPlayerState() const { return mPlayerState; }
  // PlayerIsPlayingMessage / PlayerIsStoppedMessage when the state changes.
  void SetPlayerState(PlayerState state);

  bool IsReadOnly() const { return mReadOnly; }
  void SetReadOnly(bool readOnly);  // ReadOnlyStateChangedMessage

  // Tracks, top video track first / first audio track first.
  const std::vector<TrackRef>& GetVideoTracks() const { return mVideoTracks; }
  const std::vector<TrackRef>& GetAudioTracks() const { return mAudioTracks; }
  void AddTrack(const TrackRef& track);
  // The end of the last item (0 when empty).
  TickTime GetEnd() const;
  bool Contains(const TrackItem* item) const;
  TrackItemRef FindTrackItem(ObjectID id) const;
  // Every item, video tracks first, each track's items in time order.
  void ForEachTrackItem(const std::function<void(const TrackItemRef&)>& visit) const;
  // The entries a track-menu parameter offers, in value order: "None", a separator ("(-"), then
  // the video tracks by name from the top. A track without a name is listed as "~" (no entry, but
  // it keeps its value). Rebuilt by the rows on every structure change.
  std::vector<std::string> GetTrackComboParamStrings() const;

  // The selection as groups of linked items. SetSelection takes items and groups each with the
  // items linked to it (one group per link group; an unlinked item is a group of its own);
  // items not in this sequence are ignored. SequenceClipSelectionChangedMessage when it changed.
  const std::vector<TrackItemGroup>& GetSelection() const { return mSelection; }
  void SetSelection(const std::vector<TrackItemRef>& items, bool byUser = true);
  void SetSelectedGroups(std::vector<TrackItemGroup> groups, bool byUser = true);
  void ClearSelection(bool byUser = true);
  bool IsSelected(const TrackItem* item) const;

  Project* GetProject() const override { return mProject; }
  // Project only.
  void SetProject(Project* project) { mProject = project; }

  // Structure and timing notifications. Edits that touch many items wrap them in a batch, so
  // listeners get one SequenceChangedMessage at the end instead of one per item.
  void NotifyStructureChanged();
  void NotifySettingsChanged();
  void NotifyLinkStatusChanged();
  class ScopedChangeBatch {
   public:
    explicit ScopedChangeBatch(Sequence& sequence);
    ScopedChangeBatch(const ScopedChangeBatch&) = delete;
    ScopedChangeBatch& operator=(const ScopedChangeBatch&) = delete;
    ~ScopedChangeBatch();

   private:
    SequenceRef mSequence;
  };

 private:
  Sequence(std::string name, FrameRate videoRate, FrameRate audioRate);
  void FlushChanges();
  // Drops selected items that left the sequence.
  void PruneSelection();

  std::string mName;
  FrameRate mVideoRate;
  FrameRate mAudioRate;
  FrameRate mVideoDisplay;
  FrameRate mAudioDisplay;
  FrameSize mFrameSize;
  bool mAudioFrameAligned = false;
  TickTime mZeroPoint = 0;
  std::optional<TickTime> mInPoint;
  std::optional<TickTime> mOutPoint;
  Markers mMarkers;
  TickTime mCurrentTime = 0;
  StationName mPlayerStation;
  PlayerState mPlayerState = PlayerState::Stopped;
  bool mReadOnly = false;
  std::vector<TrackRef> mVideoTracks;
  std::vector<TrackRef> mAudioTracks;
  std::vector<TrackItemGroup> mSelection;
  Project* mProject = nullptr;  // owner; cleared when the project lets go

  int mBatchDepth = 0;
  bool mPendingStructure = false;
  bool mPendingSettings = false;
};
