#pragma once

#include "Handlers/EffectControls/Src/GroupCurveSetBeginParameter.h"

// Four tone curves in a two-by-two grid, 5 pixels apart: Master (white) and Red on top, Green
// and Blue below, each over 32 of the group's point parameters in that order. With W the row's
// width, I the parameter indent and S = (W - 55) / 2: each curve S wide and S + 20 high from
// x = I + 20; the children from top + 5 + 2 (S + 20); the group W + 10 - I high plus its visible
// children. Every size is clamped at zero on a narrow list.
class GroupRGBCurvesBeginParameter : public GroupCurveSetBeginParameter {
 public:
  explicit GroupRGBCurvesBeginParameter(const ParameterControlInfo& info);

  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;

 protected:
  int GetChildrenOffset() const override { return 5 + 2 * (GetCurveSide() + 20); }
};
