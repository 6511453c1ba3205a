#pragma once

#include "Host/Shell/ScriptInputRoute.h"

class ViewHost;

// Hands the input straight to a view host (headless runs and tests).
class ViewHostInputRoute : public ScriptInputRoute {
 public:
  explicit ViewHostInputRoute(ViewHost& host) : mHost(host) {}

  void MouseDown(MouseButton button, Point point, KeyModifiers modifiers, int clickCount) override;
  void MouseUp(MouseButton button, Point point, KeyModifiers modifiers) override;
  void MouseMove(Point point, KeyModifiers modifiers) override;
  void Wheel(Point point, int deltaY, KeyModifiers modifiers) override;
  void Key(KeyCode key, KeyModifiers modifiers) override;
  void Text(std::string_view utf8) override;
  void Resize(Size size) override;

 private:
  ViewHost& mHost;  // not owned; outlives the route
};
