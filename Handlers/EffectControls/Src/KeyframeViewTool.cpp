#include "Handlers/EffectControls/Src/KeyframeViewTool.h"

void KeyframeViewTool::SetTool(ToolMode mode) {
  mTool = (mode == ToolMode::kZoom || mode == ToolMode::kHand) ? ToolMode::kPointer : mode;
}

int KeyframeViewTool::GetEffectiveTool(KeyModifiers modifiers) const {
  if (mTool == ToolMode::kZoom && IsAltDown(modifiers)) {
    return kSituationZoomOut;
  }
  return static_cast<int>(mTool);
}

Cursor KeyframeViewTool::CursorFor(int situation) {
  switch (situation) {
    case 101:
    case 202:
    case 403:
      return Cursor::kTinyMarquee;
    case kSituationControlPoint:
      return Cursor::kDirectControlPointSelect;
    case kSituationDirectionHandle:
      return Cursor::kDirectionHandleSelection;
    case 104:
      return Cursor::kEditAnchor;
    case 105:
      return Cursor::kDirectSelectAdd;
    case 106:
      return Cursor::kSelectVerticalAdjust;
    case kSituationZoomIn:
      return Cursor::kTLZoomIn;
    case kSituationZoomOut:
      return Cursor::kTLZoomOut;
    case kSituationHand:
      return Cursor::kHand;
    case kSituationPen:
      return Cursor::kPen;
    case 401:
      return Cursor::kPenAdd;
    case 402:
      return Cursor::kPenSelection;
    case 404:
      return Cursor::kPenVerticalAdjust;
    case kSituationGraphDivider:
      return Cursor::kSplitterVerticalBig;
    case kSituationIntroOutro:
      return Cursor::kSplitterHorizontalBig;
    default:
      return Cursor::kOSArrow;
  }
}

void KeyframeViewTool::SetCursor(int situation) {
  mLastCursor = CursorFor(situation);
  SetCurrentCursor(mLastCursor);
}
