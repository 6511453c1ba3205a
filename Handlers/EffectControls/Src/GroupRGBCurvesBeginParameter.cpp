#include "Handlers/EffectControls/Src/GroupRGBCurvesBeginParameter.h"

#include <algorithm>

GroupRGBCurvesBeginParameter::GroupRGBCurvesBeginParameter(const ParameterControlInfo& info)
    : GroupCurveSetBeginParameter(
          info, {{"$$$/Vantile/Handlers/EffectControls/Master=Master", Color(255, 255, 255)},
                 {"$$$/Vantile/Handlers/EffectControls/Red=Red", Color(230, 60, 60)},
                 {"$$$/Vantile/Handlers/EffectControls/Green=Green", Color(60, 200, 80)},
                 {"$$$/Vantile/Handlers/EffectControls/Blue=Blue", Color(80, 120, 255)}}) {}

int GroupRGBCurvesBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return std::max(0, GetWidth() + 10 - GetParameterIndentInPixels()) + ChildrenHeight();
}

void GroupRGBCurvesBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupCurveSetBeginParameter::PositionSelf(top, depth, width);
  if (GetCurveCount() != 4) {
    return;
  }
  const int side = GetCurveSide();
  const int left = GetParameterIndentInPixels() + 20;
  const int right = GetParameterIndentInPixels() + side + 25;
  const int lower = top + side + 25;
  PlaceView(*GetCurve(0), Rect::FromSize(left, top, side, side + 20));
  PlaceView(*GetCurve(1), Rect::FromSize(right, top, side, side + 20));
  PlaceView(*GetCurve(2), Rect::FromSize(left, lower, side, side + 20));
  PlaceView(*GetCurve(3), Rect::FromSize(right, lower, side, side + 20));
}
