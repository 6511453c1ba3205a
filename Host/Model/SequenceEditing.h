#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// The timeline edits as plain functions over the model: each checks what it may do, changes the
// items' times directly (no undo step, no partial change: an edit either applies whole or returns
// a status other than Done and changes nothing) and sends the items' change messages. The undoable
// forms are in SequenceActions, which wrap these in one action each.
//
// Deltas are sequence ticks, applied as given (SequenceActions' queries round a dragged delta to
// frames); the Limits functions say how far an edit may go from where things are now; an edit
// beyond them is refused (TimeOutOfRange), never done in part.
//
// Transitions sit over the cut between two adjacent clips of one track: clip A ends at the cut,
// clip B starts there; the cut lies at start + duration * cutRatio. Either clip may be missing (a
// transition at the start of a clip has no A, one at the end no B). The part of a transition
// before the cut shows B's head material, the part after it A's tail material, so a transition
// never reaches beyond the media of the clip that has to fill it.
class SequenceEditing {
 public:
  enum class Edge { Start, End };

  struct Limits {
    TickTime minimum = 0;  // most negative delta allowed (<= 0)
    TickTime maximum = 0;  // most positive delta allowed (>= 0)
    TickTime Clamp(TickTime delta) const;
  };

  struct TransitionClips {
    TrackItemRef clipA;  // outgoing; null at the start of a clip
    TrackItemRef clipB;  // incoming; null at the end of a clip
    TickTime cut = 0;    // sequence time of the edit point
  };
  // Clip A and B of a transition on its track; both null for a clip or an item on no track.
  static TransitionClips FindTransitionClips(const TrackItem& transition);
  // The transition on `clip`'s track over its start (Edge::Start) or end, or null.
  static TrackItemRef FindTransitionAt(const TrackItem& clip, Edge edge);

  // Trim one edge of a transition; the cut stays where it is.
  //      A ======|                         A ======|
  //          [  tr  ]        start +d  ->       [tr ]
  //              |====== B                     |====== B
  static Limits GetTrimTransitionLimits(const TrackItem& transition, Edge edge);
  static EditStatus TrimTransition(TrackItem& transition, Edge edge, TickTime delta);

  // Move a transition along its cut (both clips needed); the clips stay.
  //   A ======|          A ======|
  //       [ tr ]   ->       [ tr ]        (+d)
  //           |=== B             |=== B
  static Limits GetSlideTransitionLimits(const TrackItem& transition);
  static EditStatus SlideTransition(TrackItem& transition, TickTime delta);

  // A new duration that keeps the transition's alignment on the cut, limited to what the clips
  // allow (at least one frame). NoChange when it is what the transition has.
  static EditStatus SetTransitionDuration(TrackItem& transition, TickTime duration);

  // Move the cut between adjacent clips A and B: A's end and B's start move together, the
  // transition over the cut with them; nothing else moves.
  //   A =====|=== B      ->    A =======|= B     (+d)
  static Limits GetRollLimits(const TrackItem& clipA, const TrackItem& clipB);
  static EditStatus Roll(TrackItem& clipA, TrackItem& clipB, TickTime delta);

  // Ripple trim: one edge of each item moves by delta and everything after the item on its
  // track (and the transition over that edge) moves along, so no gap opens or closes elsewhere.
  //   End, +d:    A =====|B ===       ->  A =======|B ===
  //   Start, +d:  B's first d of media is trimmed away; B keeps its start, what follows
  //               B moves d earlier.
  // `items` are clips, usually one clip and its linked items.
  static Limits GetRippleTrimLimits(const std::vector<TrackItemRef>& items, Edge edge);
  static EditStatus RippleTrim(const std::vector<TrackItemRef>& items, Edge edge, TickTime delta);

  // Plain trim of one clip edge; neighbours stay, so the clip cannot grow over them.
  //   A ====|   |=== B     End +d ->  A ======| |=== B
  static Limits GetTrimLimits(const TrackItem& clip, Edge edge);
  static EditStatus Trim(TrackItem& clip, Edge edge, TickTime delta);

  // Takes the items off their tracks (a clip's transitions stay; remove them too if wanted).
  static EditStatus RemoveItems(const std::vector<TrackItemRef>& items);
};
