#pragma once

#include <string_view>

#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/Geometry.h"

class DC;

// Something drawn over the window that takes every input event until it is done: a popup menu,
// an input box. SdlWindow::RunModal runs it. Points are window coordinates.
class SdlModal {
 public:
  SdlModal() = default;
  SdlModal(const SdlModal&) = delete;
  SdlModal& operator=(const SdlModal&) = delete;
  virtual ~SdlModal() = default;

  // Where it is drawn in a window of `windowSize`.
  virtual Rect GetBounds(Size windowSize) const = 0;
  // Local coordinates: (0, 0) is the bounds' top-left corner.
  virtual void Paint(DC& dc) = 0;
  virtual void MouseMove(Point /*point*/) {}
  virtual void MouseDown(MouseButton /*button*/, Point /*point*/) {}
  virtual void MouseUp(MouseButton /*button*/, Point /*point*/) {}
  virtual void KeyDown(const KeyEvent& /*event*/) {}
  virtual void TextInput(std::string_view /*utf8*/) {}
  virtual bool IsDone() const = 0;
};
