#include "Host/Shell/ViewHostInputRoute.h"

#include "Host/Toolkit/ViewHost.h"

void ViewHostInputRoute::MouseDown(MouseButton button, Point point, KeyModifiers modifiers,
                                   int clickCount) {
  mHost.MouseDown(button, point, modifiers, clickCount);
}

void ViewHostInputRoute::MouseUp(MouseButton button, Point point, KeyModifiers modifiers) {
  mHost.MouseUp(button, point, modifiers);
}

void ViewHostInputRoute::MouseMove(Point point, KeyModifiers modifiers) {
  mHost.MouseMove(point, modifiers);
}

void ViewHostInputRoute::Wheel(Point point, int deltaY, KeyModifiers modifiers) {
  WheelEvent event;
  event.point = point;
  event.deltaY = deltaY;
  event.modifiers = modifiers;
  mHost.MouseWheel(event);
}

void ViewHostInputRoute::Key(KeyCode key, KeyModifiers modifiers) {
  KeyEvent event;
  event.key = key;
  event.modifiers = modifiers;
  mHost.KeyDown(event);
}

void ViewHostInputRoute::Text(std::string_view utf8) {
  mHost.TextInput(utf8);
}

void ViewHostInputRoute::Resize(Size size) {
  mHost.Resize(size);
}
