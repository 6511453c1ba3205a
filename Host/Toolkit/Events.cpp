#include "Host/Toolkit/Events.h"

#include <array>
#include <cctype>
#include <utility>

namespace {

struct NamedKey {
  std::string_view name;
  KeyCode key;
};

// Canonical names first: KeyCodeName returns the first entry of a code.
constexpr std::array kNamedKeys{
    NamedKey{"Backspace", KeyCode::kBackspace},
    NamedKey{"Tab", KeyCode::kTab},
    NamedKey{"Return", KeyCode::kReturn},
    NamedKey{"Enter", KeyCode::kReturn},
    NamedKey{"Escape", KeyCode::kEscape},
    NamedKey{"Esc", KeyCode::kEscape},
    NamedKey{"Space", KeyCode::kSpace},
    NamedKey{"Delete", KeyCode::kDelete},
    NamedKey{"Del", KeyCode::kDelete},
    NamedKey{"Left", KeyCode::kLeft},
    NamedKey{"Right", KeyCode::kRight},
    NamedKey{"Up", KeyCode::kUp},
    NamedKey{"Down", KeyCode::kDown},
    NamedKey{"Home", KeyCode::kHome},
    NamedKey{"End", KeyCode::kEnd},
    NamedKey{"PageUp", KeyCode::kPageUp},
    NamedKey{"PageDown", KeyCode::kPageDown},
    NamedKey{"Insert", KeyCode::kInsert},
    NamedKey{"F1", KeyCode::kF1},
    NamedKey{"F2", KeyCode::kF2},
    NamedKey{"F3", KeyCode::kF3},
    NamedKey{"F4", KeyCode::kF4},
    NamedKey{"F5", KeyCode::kF5},
    NamedKey{"F6", KeyCode::kF6},
    NamedKey{"F7", KeyCode::kF7},
    NamedKey{"F8", KeyCode::kF8},
    NamedKey{"F9", KeyCode::kF9},
    NamedKey{"F10", KeyCode::kF10},
    NamedKey{"F11", KeyCode::kF11},
    NamedKey{"F12", KeyCode::kF12},
    NamedKey{"'", KeyCode::kApostrophe},
    NamedKey{"Apostrophe", KeyCode::kApostrophe},
    NamedKey{",", KeyCode::kComma},
    NamedKey{"Comma", KeyCode::kComma},
    NamedKey{"-", KeyCode::kMinus},
    NamedKey{"Minus", KeyCode::kMinus},
    NamedKey{".", KeyCode::kPeriod},
    NamedKey{"Period", KeyCode::kPeriod},
    NamedKey{"/", KeyCode::kSlash},
    NamedKey{"Slash", KeyCode::kSlash},
    NamedKey{";", KeyCode::kSemicolon},
    NamedKey{"Semicolon", KeyCode::kSemicolon},
    NamedKey{"=", KeyCode::kEquals},
    NamedKey{"Equals", KeyCode::kEquals},
    NamedKey{"[", KeyCode::kBracketLeft},
    NamedKey{"BracketLeft", KeyCode::kBracketLeft},
    NamedKey{"\\", KeyCode::kBackslash},
    NamedKey{"Backslash", KeyCode::kBackslash},
    NamedKey{"]", KeyCode::kBracketRight},
    NamedKey{"BracketRight", KeyCode::kBracketRight},
    NamedKey{"`", KeyCode::kBackquote},
    NamedKey{"Backquote", KeyCode::kBackquote},
};

// Letters and digits name themselves; their one-character names live here so that
// KeyCodeName can return a view of static storage.
constexpr std::string_view kAlphanumericNames = "0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZ";

bool EqualsIgnoringCase(std::string_view a, std::string_view b) {
  if (a.size() != b.size()) {
    return false;
  }
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (std::tolower(static_cast<unsigned char>(a[i])) !=
        std::tolower(static_cast<unsigned char>(b[i]))) {
      return false;
    }
  }
  return true;
}

struct NamedModifier {
  std::string_view name;
  KeyModifiers bit;
};

constexpr std::array kNamedModifiers{
    NamedModifier{"Ctrl", kKeyModifierCtrl}, NamedModifier{"Control", kKeyModifierCtrl},
    NamedModifier{"Alt", kKeyModifierAlt}, NamedModifier{"Shift", kKeyModifierShift}};

}  // namespace

std::optional<KeyCode> KeyCodeFromName(std::string_view name) {
  if (name.size() == 1) {
    const char c = static_cast<char>(std::toupper(static_cast<unsigned char>(name[0])));
    if (kAlphanumericNames.find(c) != std::string_view::npos) {
      return static_cast<KeyCode>(static_cast<unsigned char>(c));
    }
  }
  for (const NamedKey& entry : kNamedKeys) {
    if (EqualsIgnoringCase(entry.name, name)) {
      return entry.key;
    }
  }
  return std::nullopt;
}

std::string_view KeyCodeName(KeyCode key) {
  const auto code = static_cast<std::uint32_t>(key);
  if (code < 128) {
    const std::size_t at = kAlphanumericNames.find(static_cast<char>(code));
    if (at != std::string_view::npos) {
      return kAlphanumericNames.substr(at, 1);
    }
  }
  for (const NamedKey& entry : kNamedKeys) {
    if (entry.key == key) {
      return entry.name;
    }
  }
  return {};
}

std::string KeyStroke::ToString() const {
  std::string text;
  if (IsCtrlDown(modifiers)) {
    text += "Ctrl+";
  }
  if (IsAltDown(modifiers)) {
    text += "Alt+";
  }
  if (IsShiftDown(modifiers)) {
    text += "Shift+";
  }
  text += KeyCodeName(key);
  return text;
}

std::optional<KeyStroke> KeyStroke::Parse(std::string_view text) {
  KeyModifiers modifiers = kKeyModifierNone;
  // Split at '+', but a trailing "+" after a separator names the key itself ("Ctrl++" is
  // not a key we have; "Ctrl+=" is).
  while (true) {
    const std::size_t plus = text.find('+');
    if (plus == std::string_view::npos || plus + 1 >= text.size()) {
      break;
    }
    const std::string_view part = text.substr(0, plus);
    bool known = false;
    for (const NamedModifier& modifier : kNamedModifiers) {
      if (EqualsIgnoringCase(modifier.name, part)) {
        modifiers |= modifier.bit;
        known = true;
      }
    }
    if (!known) {
      return std::nullopt;
    }
    text.remove_prefix(plus + 1);
  }
  const std::optional<KeyCode> key = KeyCodeFromName(text);
  if (!key) {
    return std::nullopt;
  }
  return KeyStroke(*key, modifiers);
}
