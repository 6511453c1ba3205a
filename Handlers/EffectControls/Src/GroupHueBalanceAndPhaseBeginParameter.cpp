#include "Handlers/EffectControls/Src/GroupHueBalanceAndPhaseBeginParameter.h"

#include <algorithm>

GroupHueBalanceAndPhaseBeginParameter::GroupHueBalanceAndPhaseBeginParameter(
    const ParameterControlInfo& info)
    : GroupWheelSetBeginParameter(info, 1) {}

int GroupHueBalanceAndPhaseBeginParameter::GetWheelDiameter() const {
  return std::max(0, GetWidth() - GetParameterIndentInPixels() - 90);
}

int GroupHueBalanceAndPhaseBeginParameter::GetExpandedAreaHeight() const {
  // Children start at top + 18 + D, never inside the group's own band.
  return std::max(0, 18 + GetWheelDiameter() - OwnHeight());
}

int GroupHueBalanceAndPhaseBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  const int area = std::max(OwnHeight(), GetWidth() - GetParameterIndentInPixels() - 72);
  return area + ChildrenHeight();
}

void GroupHueBalanceAndPhaseBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupWheelSetBeginParameter::PositionSelf(top, depth, width);
  if (GetWheelCount() == 0) {
    return;
  }
  const int diameter = GetWheelDiameter();
  PlaceView(*GetWheel(0),
            Rect::FromSize(GetParameterIndentInPixels() + 35, top + 20, diameter, diameter));
}
