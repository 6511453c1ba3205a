#pragma once

#include <string_view>
#include <utility>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Model/DirectManipulationManager.h"  // kDirectManipulationStation
#include "Host/Model/ModelRefs.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

// The application's own stations: where it announces what the user opens, activates and picks,
// independently of any one project object. The model's SequenceActivatedMessage is sent on the
// sequence-activation station too (besides the project's station).
inline constexpr const char* kSequenceActivationStation = "Host.SequenceActivation";
inline constexpr const char* kTrackItemActivationStation = "Host.TrackItemActivation";
inline constexpr const char* kMasterClipActivationStation = "Host.MasterClipActivation";
inline constexpr const char* kToolStation = "Host.Tools";

// --- Sequence-activation station ---

// A sequence was opened for editing (sent once, before its first activation).
struct SequenceOpenedMessage : MessageOf<SequenceOpenedMessage> {
  static constexpr std::string_view kTypeName = "SequenceOpenedMessage";
  explicit SequenceOpenedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

// The sequence is no longer open (its project closed); listeners drop their references.
struct SequenceClosedMessage : MessageOf<SequenceClosedMessage> {
  static constexpr std::string_view kTypeName = "SequenceClosedMessage";
  explicit SequenceClosedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

// The timeline showing the sequence took the focus. Sent with each activation: this host has
// one timeline, so the active sequence is also the focused one.
struct SequenceFocusedMessage : MessageOf<SequenceFocusedMessage> {
  static constexpr std::string_view kTypeName = "SequenceFocusedMessage";
  explicit SequenceFocusedMessage(SequenceRef s) : sequence(std::move(s)) {}
  SequenceRef sequence;
};

// --- Track-item-activation station ---

// The user opened a selection of track items (double-click in the timeline, or the
// application's OpenTrackItemSelection). Items in the order they were selected.
struct TrackItemSelectionOpenedMessage : MessageOf<TrackItemSelectionOpenedMessage> {
  static constexpr std::string_view kTypeName = "TrackItemSelectionOpenedMessage";
  explicit TrackItemSelectionOpenedMessage(std::vector<TrackItemRef> opened)
      : items(std::move(opened)) {}
  std::vector<TrackItemRef> items;
};

// --- Tool station: the timeline tool the user picked (see HostTool). No payload. ---

#define EC_DECLARE_TOOL_MESSAGE(Name)                    \
  struct Name : MessageOf<Name> {                        \
    static constexpr std::string_view kTypeName = #Name; \
  }

EC_DECLARE_TOOL_MESSAGE(PointerToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(TrackSelectForwardToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(RippleToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(RollToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(RateStretchToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(RazorToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(SlipToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(SlideToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(PenToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(HandToolSelectedMessage);
EC_DECLARE_TOOL_MESSAGE(ZoomToolSelectedMessage);

#undef EC_DECLARE_TOOL_MESSAGE
