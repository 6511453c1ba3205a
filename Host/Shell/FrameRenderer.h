#pragma once

#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Geometry.h"

class Image;
class Sequence;

// The host's one renderer: the sequence's picture at a time. Each video track's clip at that
// time is drawn, V1 first and each higher track over it: its generated picture (its label colour,
// its name and the clip frame shown, so a person sees which frame it is), then its effects in chain
// order as far as the host renders them (Brightness & Contrast, Gaussian Blur), then placed by
// Motion (position, scale, rotation, anchor point) and composited with Opacity and its blend mode.
// Bypassed effects are skipped. Transitions are not rendered: the clips under them show.
class FrameRenderer {
 public:
  // The sequence's frame scaled to fit `size` (centred, black around it).
  static Image Render(const Sequence& sequence, TickTime time, Size size);
  // Where the sequence's frame lies in an image of `size`.
  static Rect FrameRect(const Sequence& sequence, Size size);
  // The clip of the highest video track that has one at `time`; null when none.
  static TrackItemRef TopClipAt(const Sequence& sequence, TickTime time);
};
