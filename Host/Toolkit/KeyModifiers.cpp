#include "Host/Toolkit/KeyModifiers.h"

namespace {

KeyModifiers gAsyncKeyModifiers = kKeyModifierNone;

}  // namespace

KeyModifiers GetAsyncKeyModifiers() {
  return gAsyncKeyModifiers;
}

void SetAsyncKeyModifiers(KeyModifiers modifiers) {
  gAsyncKeyModifiers = modifiers & kKeyModifierMask;
}
