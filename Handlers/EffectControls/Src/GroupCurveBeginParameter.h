#pragma once

#include "Handlers/EffectControls/Src/GroupCurveSetBeginParameter.h"

// A single tone curve over the group's 32 point parameters. With W the row's width, I the
// parameter indent and S = (W - 55) / 2: the curve at (I + 20, top), S wide and S + 20 high
// (its label strip first); the children from top + S + 26; the group (W - 55 - I) / 2 + 32
// high plus its visible children. Every size is clamped at zero on a narrow list.
class GroupCurveBeginParameter : public GroupCurveSetBeginParameter {
 public:
  explicit GroupCurveBeginParameter(const ParameterControlInfo& info);

  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;

 protected:
  int GetChildrenOffset() const override { return GetCurveSide() + 26; }
};
