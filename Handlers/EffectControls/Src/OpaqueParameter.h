#pragma once

#include "Host/Rows/ParameterControl.h"

// The row of an opaque parameter (data only the effect reads): a 20-pixel row with the name and,
// when the parameter can vary over time, the stopwatch. It shows no value and edits none; its
// keyframes are drawn and hit like those of other rows, and the stopwatch is one undoable
// "MZ.ComponentParam.SetTimeVarying" step.
class OpaqueParameter : public ParameterControl {
 public:
  static constexpr int kRowHeight = 20;

  explicit OpaqueParameter(const ParameterControlInfo& info);

  int OwnHeight() const override { return kRowHeight; }
  bool CanExpand() const override { return false; }
  void SetIsExpanded(bool /*expanded*/) override {}
  // Nothing to show.
  void SynchToCurrentTime() override {}
  // The row never opens an edit of the value.
  bool SynchParamActor() override { return false; }
  void ReleaseParamActor() override {}
};
