#include "Handlers/EffectControls/Src/GroupCurveBeginParameter.h"

#include <algorithm>

GroupCurveBeginParameter::GroupCurveBeginParameter(const ParameterControlInfo& info)
    : GroupCurveSetBeginParameter(
          info, {{"$$$/Vantile/Handlers/EffectControls/LumaWaveform=Luma Waveform",
                  Color(255, 255, 255)}}) {}

int GroupCurveBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  const int curveArea = std::max(0, (GetWidth() - 55 - GetParameterIndentInPixels()) / 2) + 32;
  return curveArea + ChildrenHeight();
}

void GroupCurveBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupCurveSetBeginParameter::PositionSelf(top, depth, width);
  if (GetCurveCount() == 0) {
    return;
  }
  const int side = GetCurveSide();
  PlaceView(*GetCurve(0), Rect::FromSize(GetParameterIndentInPixels() + 20, top, side, side + 20));
}
