#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/ColorDefinitionParser.h"

enum class ColorTheme { kDark, kLight };

// Broadcast on kColorManagerStation after the theme changed or a colour set was registered or
// removed: views repaint, caches of drawn pictures drop what they hold.
inline constexpr std::string_view kColorManagerStation = "Toolkit.ColorManager";
struct ColorsChangedMessage : MessageOf<ColorsChangedMessage> {
  static constexpr std::string_view kTypeName = "ColorsChangedMessage";
  ColorTheme theme = ColorTheme::kDark;
};

// Toolkit colours (the names `$VOK(...)` accepts; also keys of ColorManager::GetColor).
// "Reversible" colours are named for the light theme and reversed in the dark one:
// reversible black is the text colour, dark on light, light grey on dark.
inline constexpr std::string_view kColor_WindowBackground = "kColor_WindowBackground";
inline constexpr std::string_view kColor_ContentBackground = "kColor_ContentBackground";
inline constexpr std::string_view kColor_PanelBackground = "kColor_PanelBackground";
inline constexpr std::string_view kColor_ListBoxContentNormal = "kColor_ListBoxContentNormal";
inline constexpr std::string_view kColor_ListBoxContentAlternate = "kColor_ListBoxContentAlternate";
inline constexpr std::string_view kColor_ListBoxContentSelected = "kColor_ListBoxContentSelected";
inline constexpr std::string_view kColor_ListBoxContentSelectedText =
    "kColor_ListBoxContentSelectedText";
inline constexpr std::string_view kColor_ListBoxContentDivider = "kColor_ListBoxContentDivider";
inline constexpr std::string_view kColor_ListBoxContentHover = "kColor_ListBoxContentHover";
inline constexpr std::string_view kColor_ReversibleBlack = "kColor_ReversibleBlack";
inline constexpr std::string_view kColor_ReversibleWhite = "kColor_ReversibleWhite";
inline constexpr std::string_view kColor_ReversibleGray = "kColor_ReversibleGray";
inline constexpr std::string_view kColor_Focus = "kColor_Focus";
inline constexpr std::string_view kColor_Divider = "kColor_Divider";
inline constexpr std::string_view kColor_InteractiveControl = "kColor_InteractiveControl";
inline constexpr std::string_view kColor_InteractiveControlHover = "kColor_InteractiveControlHover";
inline constexpr std::string_view kColor_DropIndicator = "kColor_DropIndicator";
inline constexpr std::string_view kColor_ControlBackground = "kColor_ControlBackground";
inline constexpr std::string_view kColor_ControlBorder = "kColor_ControlBorder";
inline constexpr std::string_view kColor_ControlText = "kColor_ControlText";
inline constexpr std::string_view kColor_ControlTextDisabled = "kColor_ControlTextDisabled";
inline constexpr std::string_view kColor_ButtonFace = "kColor_ButtonFace";
inline constexpr std::string_view kColor_ButtonFaceHover = "kColor_ButtonFaceHover";
inline constexpr std::string_view kColor_ButtonFacePressed = "kColor_ButtonFacePressed";
inline constexpr std::string_view kColor_HotText = "kColor_HotText";
inline constexpr std::string_view kColor_EditBackground = "kColor_EditBackground";
inline constexpr std::string_view kColor_EditText = "kColor_EditText";
inline constexpr std::string_view kColor_ScrollBarTrack = "kColor_ScrollBarTrack";
inline constexpr std::string_view kColor_ScrollBarThumb = "kColor_ScrollBarThumb";
inline constexpr std::string_view kColor_SliderTrack = "kColor_SliderTrack";
inline constexpr std::string_view kColor_SliderFill = "kColor_SliderFill";
inline constexpr std::string_view kColor_MenuBackground = "kColor_MenuBackground";
inline constexpr std::string_view kColor_MenuText = "kColor_MenuText";
inline constexpr std::string_view kColor_MenuHighlight = "kColor_MenuHighlight";
inline constexpr std::string_view kColor_MenuHighlightText = "kColor_MenuHighlightText";
inline constexpr std::string_view kColor_ToolTipBackground = "kColor_ToolTipBackground";
inline constexpr std::string_view kColor_ToolTipText = "kColor_ToolTipText";
inline constexpr std::string_view kColor_TimeRulerBackground = "kColor_TimeRulerBackground";
inline constexpr std::string_view kColor_TimeRulerTicks = "kColor_TimeRulerTicks";
inline constexpr std::string_view kColor_CurrentTimeIndicator = "kColor_CurrentTimeIndicator";
inline constexpr std::string_view kColor_Warning = "kColor_Warning";
inline constexpr std::string_view kColor_Error = "kColor_Error";

// Colours by key, process-wide. Keys are looked up first in the registered colour sets (the
// most recently registered set wins), then in the theme's base colours: the toolkit kColor_
// names and the "colors.qel.*" and "colors.app.*" keys that colour sets map to. References
// ($MAP, $VOK, $REVERSIBLESCALED) resolve when asked for, so they follow the theme.
// An unknown key, or a reference chain that is circular or longer than 16 steps, gives
// kFallbackColor (a visible magenta) and is reported once through the host debug assertion.
// UI thread only.
class ColorManager {
 public:
  static constexpr Color kFallbackColor = Color(255, 0, 255);

  static Color GetColor(std::string_view key);
  static bool HasColor(std::string_view key);

  // Registers (or replaces) the set `name` from colour-definition text. Malformed lines are
  // skipped; they are returned and reported through the host debug assertion. Broadcasts
  // ColorsChangedMessage.
  static std::vector<ColorDefinitionProblem> RegisterColorSet(const std::string& name,
                                                              std::string_view resourceText);
  // False when no set of that name is registered.
  static bool UnregisterColorSet(const std::string& name);
  static bool IsColorSetRegistered(const std::string& name);

  // Dark is the default. A change broadcasts ColorsChangedMessage.
  static void SetTheme(ColorTheme theme);
  static ColorTheme GetTheme();
  // Changes whenever any colour may have changed (theme, sets); caches of drawn pictures
  // compare it to know when to redraw.
  static std::uint64_t GetGeneration();

  // Keys reported as unknown or unresolvable since start (or the last clear), in order.
  static std::vector<std::string> ReportedUnknownKeys();
  // Tests: forget reports, drop every set and return to the dark theme.
  static void ResetForTesting();
};
