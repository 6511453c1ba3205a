#include "Host/Shell/Sdl/SdlKeyMap.h"

#include <SDL.h>

#include <array>
#include <utility>

namespace {

// Keys whose SDL code differs from the toolkit's. Printable ASCII keys other than letters use
// the same code in both (SDL keys are the unshifted character).
constexpr std::array<std::pair<SDL_Keycode, KeyCode>, 24> kSpecialKeys = {{
    {SDLK_LEFT, KeyCode::kLeft},     {SDLK_RIGHT, KeyCode::kRight},
    {SDLK_UP, KeyCode::kUp},         {SDLK_DOWN, KeyCode::kDown},
    {SDLK_HOME, KeyCode::kHome},     {SDLK_END, KeyCode::kEnd},
    {SDLK_PAGEUP, KeyCode::kPageUp}, {SDLK_PAGEDOWN, KeyCode::kPageDown},
    {SDLK_INSERT, KeyCode::kInsert}, {SDLK_F1, KeyCode::kF1},
    {SDLK_F2, KeyCode::kF2},         {SDLK_F3, KeyCode::kF3},
    {SDLK_F4, KeyCode::kF4},         {SDLK_F5, KeyCode::kF5},
    {SDLK_F6, KeyCode::kF6},         {SDLK_F7, KeyCode::kF7},
    {SDLK_F8, KeyCode::kF8},         {SDLK_F9, KeyCode::kF9},
    {SDLK_F10, KeyCode::kF10},       {SDLK_F11, KeyCode::kF11},
    {SDLK_F12, KeyCode::kF12},       {SDLK_KP_ENTER, KeyCode::kReturn},
    {SDLK_DELETE, KeyCode::kDelete}, {SDLK_BACKSPACE, KeyCode::kBackspace},
}};

bool IsSharedAsciiKey(std::int32_t key) {
  switch (key) {
    case SDLK_TAB:
    case SDLK_RETURN:
    case SDLK_ESCAPE:
    case SDLK_SPACE:
    case SDLK_QUOTE:
    case SDLK_COMMA:
    case SDLK_MINUS:
    case SDLK_PERIOD:
    case SDLK_SLASH:
    case SDLK_SEMICOLON:
    case SDLK_EQUALS:
    case SDLK_LEFTBRACKET:
    case SDLK_BACKSLASH:
    case SDLK_RIGHTBRACKET:
    case SDLK_BACKQUOTE:
      return true;
    default:
      return key >= SDLK_0 && key <= SDLK_9;
  }
}

}  // namespace

std::optional<KeyCode> KeyCodeFromSdlKey(std::int32_t sdlKey) {
  if (sdlKey >= SDLK_a && sdlKey <= SDLK_z)
    return static_cast<KeyCode>('A' + (sdlKey - SDLK_a));
  if (IsSharedAsciiKey(sdlKey))
    return static_cast<KeyCode>(sdlKey);
  for (const auto& [sdl, key] : kSpecialKeys) {
    if (sdl == sdlKey)
      return key;
  }
  return std::nullopt;
}

std::int32_t SdlKeyFromKeyCode(KeyCode key) {
  const auto code = static_cast<std::int32_t>(key);
  if (code >= 'A' && code <= 'Z')
    return SDLK_a + (code - 'A');
  if (IsSharedAsciiKey(code))
    return code;
  for (const auto& [sdl, toolkitKey] : kSpecialKeys) {
    if (toolkitKey == key && sdl != SDLK_KP_ENTER)
      return sdl;
  }
  return SDLK_UNKNOWN;
}

KeyModifiers KeyModifiersFromSdl(std::uint16_t sdlModifiers) {
  KeyModifiers modifiers = kKeyModifierNone;
  if ((sdlModifiers & KMOD_SHIFT) != 0)
    modifiers |= kKeyModifierShift;
  if ((sdlModifiers & KMOD_CTRL) != 0)
    modifiers |= kKeyModifierCtrl;
  if ((sdlModifiers & KMOD_ALT) != 0)
    modifiers |= kKeyModifierAlt;
  return modifiers;
}

std::uint16_t SdlModifiersFromKeyModifiers(KeyModifiers modifiers) {
  int sdl = KMOD_NONE;
  if (IsShiftDown(modifiers))
    sdl |= KMOD_LSHIFT;
  if (IsCtrlDown(modifiers))
    sdl |= KMOD_LCTRL;
  if (IsAltDown(modifiers))
    sdl |= KMOD_LALT;
  return static_cast<std::uint16_t>(sdl);
}

bool IsSdlModifierKey(std::int32_t sdlKey) {
  switch (sdlKey) {
    case SDLK_LSHIFT:
    case SDLK_RSHIFT:
    case SDLK_LCTRL:
    case SDLK_RCTRL:
    case SDLK_LALT:
    case SDLK_RALT:
    case SDLK_LGUI:
    case SDLK_RGUI:
      return true;
    default:
      return false;
  }
}
