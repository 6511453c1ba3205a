#pragma once

#include <cstdint>
#include <optional>

#include "Host/Toolkit/Events.h"
#include "Host/Toolkit/KeyModifiers.h"

// Between SDL's key codes and modifier bits and the toolkit's. SDL types are passed as plain
// integers (SDL_Keycode, SDL_Keymod) so that this header stays free of SDL.

// nullopt for keys the toolkit has no code for (modifier keys alone, media keys, ...).
std::optional<KeyCode> KeyCodeFromSdlKey(std::int32_t sdlKey);
// 0 (SDLK_UNKNOWN) for kNone.
std::int32_t SdlKeyFromKeyCode(KeyCode key);
// Left and right variants both count; GUI (Windows/Command) is not a toolkit modifier.
KeyModifiers KeyModifiersFromSdl(std::uint16_t sdlModifiers);
std::uint16_t SdlModifiersFromKeyModifiers(KeyModifiers modifiers);
// True for Shift, Ctrl, Alt and GUI keys (they change the modifier state, nothing else).
bool IsSdlModifierKey(std::int32_t sdlKey);
