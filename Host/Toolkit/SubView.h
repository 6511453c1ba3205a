#pragma once

#include "Host/Toolkit/ViewBase.h"

// The plain view the panels derive their views from (and use as a holder of other views).
// Everything is in ViewBase; see there for ownership, coordinates and hooks.
class SubView : public ViewBase {
 public:
  // `superCommander`: where commands go that this view passes on; null means its parent.
  explicit SubView(Commander* superCommander = nullptr) : ViewBase(superCommander) {}
};
