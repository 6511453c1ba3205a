#pragma once

#include "Host/Shell/PanelStateDump.h"

// Implemented by tab views that take part in the automation dump. The shell asks every open
// tab whose view implements it, in tab order; the view fills `dump` (which arrives empty) from
// its current state and must not change that state. UI thread only.
class StateDumpSource {
 public:
  virtual ~StateDumpSource() = default;

  virtual void FillStateDump(PanelStateDump& dump) const = 0;
};
