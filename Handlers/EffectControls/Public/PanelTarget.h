#pragma once

#include <vector>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/TrackItemGroup.h"

// What the panel's list shows, as one value: two targets that compare equal show the same rows
// from the same chains, so the list rebuilds exactly when the target it built for and the one
// the selection now asks for differ, in any member.
struct PanelTarget {
  enum Kind : int {
    kClip = 1,
    kTransition = 2,
    kTransitionComponent = 3,  // a transition with its own effects
  };

  SequenceRef sequence;
  // The sequence's clip selection it was chosen from: the clip or transition, the items linked
  // to it and the clip's audio parts.
  std::vector<TrackItemGroup> selection;
  Kind kind = kTransition;
  bool showVideo = false;
  bool showAudio = false;
  // The chain of a transition that carries effects of its own (kTransitionComponent).
  ComponentChainRef transitionChain;
  // Master-clip mode: the master clip whose own video effects are shown instead of the clip's.
  MasterClipRef masterClip;

  friend bool operator==(const PanelTarget&, const PanelTarget&) = default;
};
