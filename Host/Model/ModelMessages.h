#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Time/TickTime.h"

// The model's change messages. They go out on do, undo and redo alike, and on live edits. Each
// says on which station it is sent; payload references keep their objects alive, so a message may
// be posted to the UI thread and read later.

// --- Project station ---

struct UndoHistoryChangedMessage : MessageOf<UndoHistoryChangedMessage> {
  static constexpr std::string_view kTypeName = "UndoHistoryChangedMessage";
  UndoHistoryChangedMessage(std::string undo, std::string redo)
      : undoName(std::move(undo)), redoName(std::move(redo)) {}
  std::string undoName;  // what Undo would take back; empty when nothing
  std::string redoName;
};

struct ClipboardChangedMessage : MessageOf<ClipboardChangedMessage> {
  static constexpr std::string_view kTypeName = "ClipboardChangedMessage";
};

struct SequenceActivatedMessage : MessageOf<SequenceActivatedMessage> {
  static constexpr std::string_view kTypeName = "SequenceActivatedMessage";
  explicit SequenceActivatedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;  // null when no sequence is active
};

// Project, sequence or master clip station: the object's read-only state changed.
struct ReadOnlyStateChangedMessage : MessageOf<ReadOnlyStateChangedMessage> {
  static constexpr std::string_view kTypeName = "ReadOnlyStateChangedMessage";
  ReadOnlyStateChangedMessage(ObjectID id, bool ro) : objectID(id), readOnly(ro) {}
  ObjectID objectID;
  bool readOnly;
};

// --- Sequence station ---

// Items added, removed, moved or trimmed (structure), or frame rates and displays (settings).
struct SequenceChangedMessage : MessageOf<SequenceChangedMessage> {
  static constexpr std::string_view kTypeName = "SequenceChangedMessage";
  SequenceChangedMessage(SequenceRef s, bool structure, bool settings)
      : sequence(std::move(s)), structureChanged(structure), settingsChanged(settings) {}
  SequenceRef sequence;
  bool structureChanged;
  bool settingsChanged;
};

struct SequenceSettingsChangedMessage : MessageOf<SequenceSettingsChangedMessage> {
  static constexpr std::string_view kTypeName = "SequenceSettingsChangedMessage";
  explicit SequenceSettingsChangedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

struct SequenceNameChangedMessage : MessageOf<SequenceNameChangedMessage> {
  static constexpr std::string_view kTypeName = "SequenceNameChangedMessage";
  explicit SequenceNameChangedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

struct SequenceZeroPointChangedMessage : MessageOf<SequenceZeroPointChangedMessage> {
  static constexpr std::string_view kTypeName = "SequenceZeroPointChangedMessage";
  SequenceZeroPointChangedMessage(SequenceRef s, TickTime z)
      : sequence(std::move(s)), zeroPoint(z) {}
  SequenceRef sequence;
  TickTime zeroPoint;
};

// `byUser`: the user selected; false when an edit changed the selection (an item was removed).
struct SequenceClipSelectionChangedMessage : MessageOf<SequenceClipSelectionChangedMessage> {
  static constexpr std::string_view kTypeName = "SequenceClipSelectionChangedMessage";
  SequenceClipSelectionChangedMessage(SequenceRef s, bool user)
      : sequence(std::move(s)), byUser(user) {}
  SequenceRef sequence;
  bool byUser;
};

struct TrackItemLinkStatusChangedMessage : MessageOf<TrackItemLinkStatusChangedMessage> {
  static constexpr std::string_view kTypeName = "TrackItemLinkStatusChangedMessage";
  explicit TrackItemLinkStatusChangedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

// Sequence or master clip station: named properties of the object changed ("MZ.InPoint",
// "MZ.OutPoint", "MZ.FrameAlignment", ...).
struct PropertiesChangedMessage : MessageOf<PropertiesChangedMessage> {
  static constexpr std::string_view kTypeName = "PropertiesChangedMessage";
  PropertiesChangedMessage(ObjectID id, std::vector<std::string> changedKeys)
      : objectID(id), keys(std::move(changedKeys)) {}
  ObjectID objectID;
  std::vector<std::string> keys;
};

// Sequence or master clip station.
struct MarkersChangedMessage : MessageOf<MarkersChangedMessage> {
  static constexpr std::string_view kTypeName = "MarkersChangedMessage";
  explicit MarkersChangedMessage(ObjectID owner) : ownerID(owner) {}
  ObjectID ownerID;
};

// --- Sequence player station ---

struct PlayerPositionChangedMessage : MessageOf<PlayerPositionChangedMessage> {
  static constexpr std::string_view kTypeName = "PlayerPositionChangedMessage";
  PlayerPositionChangedMessage(SequenceRef s, TickTime t, int mode)
      : sequence(std::move(s)), time(t), playMode(mode) {}
  SequenceRef sequence;
  TickTime time;  // sequence time
  int playMode;   // kPlayMode...
};

struct PlayerIsPlayingMessage : MessageOf<PlayerIsPlayingMessage> {
  static constexpr std::string_view kTypeName = "PlayerIsPlayingMessage";
  explicit PlayerIsPlayingMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

struct PlayerIsStoppedMessage : MessageOf<PlayerIsStoppedMessage> {
  static constexpr std::string_view kTypeName = "PlayerIsStoppedMessage";
  explicit PlayerIsStoppedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

// --- Track item station ---

// Times, speed, name, label, intro/outro, transition settings. Component messages of the item's
// chain arrive on this station too.
struct TrackItemChangedMessage : MessageOf<TrackItemChangedMessage> {
  static constexpr std::string_view kTypeName = "TrackItemChangedMessage";
  explicit TrackItemChangedMessage(TrackItemRef item) : trackItem(std::move(item)) {}
  TrackItemRef trackItem;
};

// --- Master clip and media stations ---

struct MasterClipNameChangedMessage : MessageOf<MasterClipNameChangedMessage> {
  static constexpr std::string_view kTypeName = "MasterClipNameChangedMessage";
  explicit MasterClipNameChangedMessage(MasterClipRef clip) : masterClip(std::move(clip)) {}
  MasterClipRef masterClip;
};

// In/out, graphics flags or its chain's structure changed.
struct MasterClipClipChangedMessage : MessageOf<MasterClipClipChangedMessage> {
  static constexpr std::string_view kTypeName = "MasterClipClipChangedMessage";
  explicit MasterClipClipChangedMessage(MasterClipRef clip) : masterClip(std::move(clip)) {}
  MasterClipRef masterClip;
};

struct MediaChangedMessage : MessageOf<MediaChangedMessage> {
  static constexpr std::string_view kTypeName = "MediaChangedMessage";
  explicit MediaChangedMessage(MediaRef m) : media(std::move(m)) {}
  MediaRef media;
};

// --- Component chain station ---

// A value of one of the chain's components changed; the rows refresh, the list is not rebuilt.
struct ComponentChainChangedMessage : MessageOf<ComponentChainChangedMessage> {
  static constexpr std::string_view kTypeName = "ComponentChainChangedMessage";
  explicit ComponentChainChangedMessage(ComponentChainRef c) : chain(std::move(c)) {}
  ComponentChainRef chain;
};

struct ComponentChainChange {
  enum class Kind { Added, Removed, Moved, MasksChanged };
  Kind kind;
  ComponentRef component;
  int index;  // position after the change; before it for Removed
};

// Components added, removed or reordered, or masks of one of them added or removed: the list
// rebuilds.
struct ComponentChainStructureChangedMessage : MessageOf<ComponentChainStructureChangedMessage> {
  static constexpr std::string_view kTypeName = "ComponentChainStructureChangedMessage";
  ComponentChainStructureChangedMessage(ComponentChainRef c,
                                        std::vector<ComponentChainChange> changeList)
      : chain(std::move(c)), changes(std::move(changeList)) {}
  ComponentChainRef chain;
  std::vector<ComponentChainChange> changes;
};

// --- Component station and its owner's (track item or master clip) station ---

// Bypass, offline, preset or masks changed.
struct ComponentChangedMessage : MessageOf<ComponentChangedMessage> {
  static constexpr std::string_view kTypeName = "ComponentChangedMessage";
  explicit ComponentChangedMessage(ComponentRef c) : component(std::move(c)) {}
  ComponentRef component;
};

struct ComponentInstanceNameChangedMessage : MessageOf<ComponentInstanceNameChangedMessage> {
  static constexpr std::string_view kTypeName = "ComponentInstanceNameChangedMessage";
  explicit ComponentInstanceNameChangedMessage(ComponentRef c) : component(std::move(c)) {}
  ComponentRef component;
};

// --- Parameter station ---

// Value, keyframes, time variation, or visible/enabled/read-only state.
struct ParamChangedMessage : MessageOf<ParamChangedMessage> {
  static constexpr std::string_view kTypeName = "ParamChangedMessage";
  ParamChangedMessage(ComponentRef c, ComponentParamRef p)
      : component(std::move(c)), param(std::move(p)) {}
  ComponentRef component;  // null for a parameter outside a component
  ComponentParamRef param;
};
