#include "Host/Shell/ProgramOptions.h"

#include <optional>

#include "Host/Messaging/PropertyList.h"
#include "Host/Shell/WholeNumber.h"

namespace {

constexpr int kMaxSide = 16384;

std::optional<int> ParseSide(std::string_view text) {
  const std::optional<int> value = ParseWholeNumber<int>(text);
  if (!value || *value < 1 || *value > kMaxSide)
    return std::nullopt;
  return value;
}

std::optional<Size> ParseSize(std::string_view text) {
  const auto x = text.find_first_of("xX");
  if (x == std::string_view::npos)
    return std::nullopt;
  const auto width = ParseSide(text.substr(0, x));
  const auto height = ParseSide(text.substr(x + 1));
  if (!width || !height)
    return std::nullopt;
  return Size{*width, *height};
}

}  // namespace

ProgramOptions::ParseResult ProgramOptions::Parse(std::span<const std::string_view> arguments) {
  ProgramOptions options;
  bool sawProject = false, sawSize = false, sawScript = false, sawOut = false, sawMonkey = false,
       sawEvents = false, sawLayout = false;
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    std::string_view name = arguments[i];
    std::optional<std::string_view> inlineValue;
    if (const auto equals = name.find('='); name.starts_with("--") && equals != name.npos) {
      inlineValue = name.substr(equals + 1);
      name = name.substr(0, equals);
    }
    if (name == "--headless" || name == "--help" || name == "-h") {
      if (inlineValue)
        return std::string(name) + " takes no value";
      (name == "--headless" ? options.headless : options.help) = true;
      continue;
    }
    if (name == "--pref") {
      std::string_view value;
      if (inlineValue) {
        value = *inlineValue;
      } else if (i + 1 < arguments.size()) {
        value = arguments[++i];
      }
      const auto equals = value.find('=');
      if (equals == std::string_view::npos || equals == 0)
        return "--pref needs KEY=VALUE, not '" + std::string(value) + "'";
      options.preferences.emplace_back(value.substr(0, equals), value.substr(equals + 1));
      continue;
    }
    bool* seen = name == "--project"  ? &sawProject
                 : name == "--size"   ? &sawSize
                 : name == "--script" ? &sawScript
                 : name == "--out"    ? &sawOut
                 : name == "--monkey" ? &sawMonkey
                 : name == "--events" ? &sawEvents
                 : name == "--layout" ? &sawLayout
                                      : nullptr;
    if (seen == nullptr)
      return "unknown option '" + std::string(arguments[i]) + "'";
    if (*seen)
      return std::string(name) + " given twice";
    *seen = true;
    std::string_view value;
    if (inlineValue) {
      value = *inlineValue;
    } else if (i + 1 < arguments.size()) {
      value = arguments[++i];
    } else {
      return std::string(name) + " needs a value";
    }
    if (value.empty())
      return std::string(name) + " needs a value";
    if (name == "--size") {
      const auto size = ParseSize(value);
      if (!size) {
        return "--size needs WxH with each side between 1 and " + std::to_string(kMaxSide) +
               ", not '" + std::string(value) + "'";
      }
      options.size = *size;
    } else if (name == "--project") {
      options.projectPath = value;
    } else if (name == "--script") {
      options.scriptPath = value;
    } else if (name == "--layout") {
      if (value != "editing" && value != "panel")
        return "--layout is editing or panel, not '" + std::string(value) + "'";
      options.layout = value == "editing" ? Layout::kEditing : Layout::kPanel;
    } else if (name == "--monkey") {
      options.monkeySeed = ParseWholeNumber<std::uint64_t>(value);
      if (!options.monkeySeed)
        return "--monkey needs a seed (a whole number), not '" + std::string(value) + "'";
    } else if (name == "--events") {
      const auto events = ParseWholeNumber<int>(value);
      if (!events || *events < 1)
        return "--events needs a count from 1 up, not '" + std::string(value) + "'";
      options.monkeyEvents = *events;
    } else {
      options.outDir = value;
    }
  }
  if (sawMonkey && sawScript)
    return "--monkey and --script cannot go together: the monkey writes its own script";
  if (sawEvents && !sawMonkey)
    return "--events counts a monkey's events: give --monkey SEED too";
  return options;
}

std::string ProgramOptions::Usage() {
  return "usage: effectcontrols [--project FILE] [--size WxH] [--script FILE] [--out DIR] "
         "[--headless] [--layout editing|panel] [--pref KEY=VALUE]... [--monkey SEED [--events "
         "N]]\n"
         "  --project FILE  project to open and save with Ctrl+S; a new one when FILE does not\n"
         "                  exist yet (default: the built-in demo project, saved where asked)\n"
         "  --size WxH      workspace (window) size in pixels (default 960x540)\n"
         "  --script FILE   automation script to run; shots and dumps go under --out\n"
         "  --out DIR       folder for shots, dumps and saves (default: the current folder)\n"
         "  --headless      never open a window, even with a display\n"
         "  --layout L      editing: a timeline and a program monitor beside the panel (the\n"
         "                  default in a window without a script); panel: the panel alone\n"
         "  --pref KEY=VALUE  set a preference before the panels open (true/false, a number or\n"
         "                  text), e.g. effect.controls.own.slider.rows=true for slider rows\n"
         "  --monkey SEED   random user input from SEED instead of a script, with a check every\n"
         "                  100 events; the script it ran is written under --out as monkey.ecs\n"
         "  --events N      how many events the monkey makes (default 3000)\n"
         "Script lines (one a line, '#' comments; coordinates are panel pixels):\n"
         "  select ID... | select-none | time TICKS|hh:mm:ss:ff\n"
         "  click|rclick|dblclick X Y [shift] [ctrl] [alt] | drag X1 Y1 X2 Y2 [steps N] [mods]\n"
         "  move X Y | wheel DY | key NAME [mods] | type TEXT\n"
         "  command ID-or-NAME | menu-answer ID-or-NAME|none|pick N | input-answer TEXT\n"
         "  resize W H | undo | redo | shot FILE.png | dump FILE.json | save FILE (a copy)\n"
         "  close (as the window's close button: asks to save changes; ends the script)\n"
         "  wait MS (real time passes: playback runs) | memory FILE.json (resident size)\n"
         "  check (saves, reloads, undoes and redoes all since the last check; fails on a\n"
         "        difference or a debug assertion)\n"
         "What a user does outside the panel:\n"
         "  tool NAME       pick a timeline tool (pointer, track-select-forward, ripple, roll,\n"
         "                  rate-stretch, razor, slip, slide, pen, hand, zoom)\n"
         "  open ID...      open track items as a double-click in the timeline does\n"
         "  reopen-panel    close the front panel's tab and open it again\n"
         "Dumps give each shown row's rectangle and its controls' in panel pixels, the keyframe\n"
         "glyphs' centres, the selected keyframes, the pointer's cursor and the panel's tool.\n";
}

void ProgramOptions::ApplyPreferences(PropertyList& properties) const {
  for (const auto& [key, text] : preferences) {
    if (properties.IsReadOnly(key)) {
      continue;
    }
    if (text == "true" || text == "false") {
      properties.SetBool(key, text == "true");
      continue;
    }
    if (const std::optional<int> number = ParseWholeNumber<int>(text)) {
      properties.SetInt(key, *number);
    } else {
      properties.SetString(key, text);
    }
  }
}
