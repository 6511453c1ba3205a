#pragma once

#include "Handlers/EffectControls/Src/GroupWheelSetBeginParameter.h"

// One colour wheel over the group's hue angle (first child) and balance magnitude (second
// child). With W the row's width and I the parameter indent: the wheel D x D at (I + 35,
// top + 20), D = W - I - 90; the children from top + 18 + D; the group W - I - 72 high plus its
// children. On a narrow list D stops at zero and the group keeps at least its own band.
class GroupHueBalanceAndPhaseBeginParameter : public GroupWheelSetBeginParameter {
 public:
  explicit GroupHueBalanceAndPhaseBeginParameter(const ParameterControlInfo& info);

  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  int GetWheelDiameter() const;

 protected:
  int GetExpandedAreaHeight() const override;
};
