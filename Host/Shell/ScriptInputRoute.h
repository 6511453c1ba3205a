#pragma once

#include <string_view>

#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/KeyModifiers.h"

// How the script runner delivers pointer, key and window input. Points are window (workspace)
// coordinates. Each call returns after the input has been delivered, so the runner can check
// its effects right away. UI thread only.
class ScriptInputRoute {
 public:
  virtual ~ScriptInputRoute() = default;

  virtual void MouseDown(MouseButton button, Point point, KeyModifiers modifiers,
                         int clickCount) = 0;
  virtual void MouseUp(MouseButton button, Point point, KeyModifiers modifiers) = 0;
  virtual void MouseMove(Point point, KeyModifiers modifiers) = 0;
  virtual void Wheel(Point point, int deltaY, KeyModifiers modifiers) = 0;
  virtual void Key(KeyCode key, KeyModifiers modifiers) = 0;
  virtual void Text(std::string_view utf8) = 0;
  virtual void Resize(Size size) = 0;
};
