#pragma once

#include <cstdint>

// The host's modifier word: a set of bits, one per modifier key held during an event.
using KeyModifiers = std::uint32_t;

inline constexpr KeyModifiers kKeyModifierNone = 0;
inline constexpr KeyModifiers kKeyModifierShift = 2;
inline constexpr KeyModifiers kKeyModifierCtrl = 4;
inline constexpr KeyModifiers kKeyModifierAlt = 16;
// Every bit the toolkit defines; other bits are dropped where modifiers are compared.
inline constexpr KeyModifiers kKeyModifierMask =
    kKeyModifierShift | kKeyModifierCtrl | kKeyModifierAlt;

constexpr bool IsShiftDown(KeyModifiers modifiers) {
  return (modifiers & kKeyModifierShift) != 0;
}
constexpr bool IsCtrlDown(KeyModifiers modifiers) {
  return (modifiers & kKeyModifierCtrl) != 0;
}
constexpr bool IsAltDown(KeyModifiers modifiers) {
  return (modifiers & kKeyModifierAlt) != 0;
}

// The modifier keys held right now, as the latest input event reported them: the toolkit's
// stand-in for the system's asynchronous key state (views read it when no event is at hand,
// e.g. on a tool change). The view host updates it with every input event. UI thread only.
KeyModifiers GetAsyncKeyModifiers();
void SetAsyncKeyModifiers(KeyModifiers modifiers);
