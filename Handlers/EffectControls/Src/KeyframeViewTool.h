#pragma once

#include "Handlers/EffectControls/Src/ToolMode.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/KeyModifiers.h"

// The keyframe area's tool: the timeline's tool as the area uses it, and the cursor for each
// hover situation. Owned by the keyframe area. UI thread only.
class KeyframeViewTool {
 public:
  // What lies under the pointer; the values are the codes the area has always used.
  enum Situation : int {
    kSituationPointer = 100,
    kSituationControlPoint = 102,
    kSituationDirectionHandle = 103,
    kSituationZoomIn = 200,
    kSituationZoomOut = 201,
    kSituationHand = 300,
    kSituationPen = 400,
    kSituationGraphDivider = 500,
    kSituationIntroOutro = 501,
  };

  // Zoom and hand select like the pointer here; other tools are kept as they are.
  void SetTool(ToolMode mode);
  ToolMode GetTool() const { return mTool; }
  // The tool with the modifiers held: zoom with Alt zooms out (kSituationZoomOut).
  int GetEffectiveTool(KeyModifiers modifiers) const;
  // The toolkit's cursor for a situation code; unknown codes give the arrow.
  static Cursor CursorFor(int situation);
  // Makes the situation's cursor current and remembers it.
  void SetCursor(int situation);
  Cursor GetLastCursor() const { return mLastCursor; }

 private:
  ToolMode mTool = ToolMode::kPointer;
  Cursor mLastCursor = Cursor::kOSArrow;
};
