#include "Host/Toolkit/ColorManager.h"

#include <algorithm>
#include <functional>
#include <optional>
#include <set>
#include <unordered_map>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Station.h"

namespace {

constexpr int kMaxReferenceDepth = 16;

struct StringHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view text) const {
    return std::hash<std::string_view>{}(text);
  }
};

template <class T>
using StringMap = std::unordered_map<std::string, T, StringHash, std::equal_to<>>;

struct BaseColor {
  std::string_view key;
  std::uint32_t dark;
  std::uint32_t light;
};

// The theme's own colours. Dark: neutral greys around #232323, text #c8c8c8, blue accent.
constexpr BaseColor kBaseColors[] = {
    {kColor_WindowBackground, 0x232323, 0xe8e8e8},
    {kColor_ContentBackground, 0x2b2b2b, 0xf2f2f2},
    {kColor_PanelBackground, 0x262626, 0xececec},
    {kColor_ListBoxContentNormal, 0x232323, 0xf0f0f0},
    {kColor_ListBoxContentAlternate, 0x262626, 0xe9e9e9},
    {kColor_ListBoxContentSelected, 0x2d8ceb, 0x1473e6},
    {kColor_ListBoxContentSelectedText, 0xffffff, 0xffffff},
    {kColor_ListBoxContentDivider, 0x181818, 0xcfcfcf},
    {kColor_ListBoxContentHover, 0x2e2e2e, 0xe2e2e2},
    {kColor_ReversibleBlack, 0xc8c8c8, 0x1e1e1e},
    {kColor_ReversibleWhite, 0x141414, 0xffffff},
    {kColor_ReversibleGray, 0x7c7c7c, 0x8a8a8a},
    {kColor_Focus, 0x2d8ceb, 0x1473e6},
    {kColor_Divider, 0x3c3c3c, 0xc4c4c4},
    {kColor_InteractiveControl, 0x2d8ceb, 0x1473e6},
    {kColor_InteractiveControlHover, 0x5aa6f2, 0x0d66d0},
    {kColor_DropIndicator, 0x5aa6f2, 0x0d66d0},
    {kColor_ControlBackground, 0x1d1d1d, 0xffffff},
    {kColor_ControlBorder, 0x3c3c3c, 0xb3b3b3},
    {kColor_ControlText, 0xc8c8c8, 0x1e1e1e},
    {kColor_ControlTextDisabled, 0x6a6a6a, 0xa0a0a0},
    {kColor_ButtonFace, 0x353535, 0xe1e1e1},
    {kColor_ButtonFaceHover, 0x404040, 0xd6d6d6},
    {kColor_ButtonFacePressed, 0x2a2a2a, 0xc8c8c8},
    {kColor_HotText, 0x2d8ceb, 0x1473e6},
    {kColor_EditBackground, 0x161616, 0xffffff},
    {kColor_EditText, 0xe0e0e0, 0x1e1e1e},
    {kColor_ScrollBarTrack, 0x1e1e1e, 0xe4e4e4},
    {kColor_ScrollBarThumb, 0x4a4a4a, 0xb8b8b8},
    {kColor_SliderTrack, 0x3a3a3a, 0xc8c8c8},
    {kColor_SliderFill, 0x2d8ceb, 0x1473e6},
    {kColor_MenuBackground, 0x2f2f2f, 0xf5f5f5},
    {kColor_MenuText, 0xd0d0d0, 0x1e1e1e},
    {kColor_MenuHighlight, 0x2d8ceb, 0x1473e6},
    {kColor_MenuHighlightText, 0xffffff, 0xffffff},
    {kColor_ToolTipBackground, 0x3a3a3a, 0xfafafa},
    {kColor_ToolTipText, 0xe0e0e0, 0x1e1e1e},
    {kColor_TimeRulerBackground, 0x1f1f1f, 0xe0e0e0},
    {kColor_TimeRulerTicks, 0x8a8a8a, 0x6e6e6e},
    {kColor_CurrentTimeIndicator, 0x2d8ceb, 0x1473e6},
    {kColor_Warning, 0xe8a33d, 0xc77c02},
    {kColor_Error, 0xe5534b, 0xd7373f},
    // Keys that colour sets map to.
    {"colors.app.base", 0x232323, 0xe8e8e8},
    {"colors.app.Formula.A", 0x707070, 0xffffff},
    {"colors.app.Formula.B", 0x606060, 0xf7f7f7},
    {"colors.app.Formula.C", 0x535353, 0xefefef},
    {"colors.app.Formula.D", 0x474747, 0xe6e6e6},
    {"colors.app.Formula.E", 0x3d3d3d, 0xdedede},
    {"colors.app.Formula.F", 0x343434, 0xd5d5d5},
    {"colors.app.Formula.G", 0x2d2d2d, 0xcdcdcd},
    {"colors.app.Formula.H", 0x262626, 0xc4c4c4},
    {"colors.app.Formula.I", 0x202020, 0xbbbbbb},
    {"colors.app.Formula.J", 0x1a1a1a, 0xb0b0b0},
    {"colors.app.Formula.K", 0x141414, 0xa3a3a3},
    {"colors.app.Formula.L", 0x0d0d0d, 0x8f8f8f},
    {"colors.qel.black", 0x000000, 0x000000},
    {"colors.qel.white", 0xffffff, 0xffffff},
    {"colors.qel.reversible.black", 0xc8c8c8, 0x1e1e1e},
    {"colors.qel.reversible.white", 0x141414, 0xffffff},
    {"colors.qel.reversible.gray", 0x7c7c7c, 0x8a8a8a},
    {"colors.qel.DarkTimecodeText", 0x1d5fa8, 0x1d5fa8},
    {"colors.qel.LightTimecodeText", 0x4aa3f5, 0x4aa3f5},
};

bool IsToolkitName(std::string_view name) {
  return name.starts_with("kColor_");
}

struct ColorSet {
  std::string name;
  StringMap<ColorDefinition> definitions;
};

class ColorState {
 public:
  static ColorState& Get() {
    static ColorState state;
    return state;
  }

  ColorTheme theme = ColorTheme::kDark;
  std::uint64_t generation = 1;
  std::vector<ColorSet> sets;  // oldest first
  std::vector<std::string> reported;
  std::set<std::string, std::less<>> reportedSet;

  std::optional<Color> Base(std::string_view key) const {
    const auto found = mBase.find(key);
    if (found == mBase.end())
      return std::nullopt;
    return Color::FromRGB(theme == ColorTheme::kDark ? found->second.dark : found->second.light);
  }

  const ColorDefinition* Definition(std::string_view key) const {
    for (auto set = sets.rbegin(); set != sets.rend(); ++set) {
      if (const auto found = set->definitions.find(key); found != set->definitions.end()) {
        return &found->second;
      }
    }
    return nullptr;
  }

  // nullopt when the key is unknown or its references do not end in a colour.
  std::optional<Color> Resolve(std::string_view key, int depth) const {
    if (depth > kMaxReferenceDepth)
      return std::nullopt;
    const ColorDefinition* definition = Definition(key);
    if (definition == nullptr)
      return Base(key);
    switch (definition->kind) {
      case ColorDefinition::Kind::kRGB:
        return definition->rgb;
      case ColorDefinition::Kind::kMap:
        return Resolve(definition->reference, depth + 1);
      case ColorDefinition::Kind::kToolkit:
        return Base(definition->reference);
      case ColorDefinition::Kind::kReversibleScaled: {
        const bool dark = theme == ColorTheme::kDark;
        const auto color =
            Resolve(dark ? definition->darkReference : definition->reference, depth + 1);
        if (!color)
          return std::nullopt;
        const Color background = Base(kColor_ContentBackground).value_or(Color());
        return color->Mix(background, dark ? definition->darkScale : definition->lightScale);
      }
    }
    return std::nullopt;
  }

  void Report(std::string_view key) {
    if (reportedSet.contains(key))
      return;
    reportedSet.emplace(key);
    reported.emplace_back(key);
    const std::string message =
        "Unknown colour key or unresolvable colour '" + std::string(key) + "'";
    ReportDebugAssertion(message, "ColorManager::HasColor(key)", __FILE__, __LINE__,
                         "ColorManager::GetColor");
  }

 private:
  ColorState() {
    for (const BaseColor& color : kBaseColors)
      mBase.emplace(std::string(color.key), color);
  }

  StringMap<BaseColor> mBase;
};

void AnnounceChange(ColorState& state) {
  ++state.generation;
  ColorsChangedMessage message;
  message.theme = state.theme;
  BroadcastMessage(std::string(kColorManagerStation), message);
}

}  // namespace

Color ColorManager::GetColor(std::string_view key) {
  ColorState& state = ColorState::Get();
  if (auto color = state.Resolve(key, 0))
    return *color;
  state.Report(key);
  return kFallbackColor;
}

bool ColorManager::HasColor(std::string_view key) {
  return ColorState::Get().Resolve(key, 0).has_value();
}

std::vector<ColorDefinitionProblem> ColorManager::RegisterColorSet(const std::string& name,
                                                                   std::string_view resourceText) {
  ColorState& state = ColorState::Get();
  ColorDefinitionParseResult parsed = ColorDefinitionParser::Parse(resourceText);
  ColorSet set{name, {}};
  for (ColorDefinition& definition : parsed.definitions) {
    if (definition.kind == ColorDefinition::Kind::kToolkit &&
        (!IsToolkitName(definition.reference) || !state.Base(definition.reference))) {
      parsed.problems.push_back({definition.line, definition.key,
                                 "'" + definition.reference + "' is not a toolkit colour"});
      continue;
    }
    std::string key = definition.key;
    set.definitions.emplace(std::move(key), std::move(definition));
  }
  std::sort(parsed.problems.begin(), parsed.problems.end(),
            [](const auto& a, const auto& b) { return a.line < b.line; });
  for (const ColorDefinitionProblem& problem : parsed.problems) {
    ReportDebugAssertion(
        "Colour set '" + name + "' line " + std::to_string(problem.line) + ": " + problem.reason,
        "well-formed colour definition", __FILE__, __LINE__, "ColorManager::RegisterColorSet");
  }
  std::erase_if(state.sets, [&](const ColorSet& s) { return s.name == name; });
  state.sets.push_back(std::move(set));
  AnnounceChange(state);
  return parsed.problems;
}

bool ColorManager::UnregisterColorSet(const std::string& name) {
  ColorState& state = ColorState::Get();
  const auto removed = std::erase_if(state.sets, [&](const ColorSet& s) { return s.name == name; });
  if (removed > 0)
    AnnounceChange(state);
  return removed > 0;
}

bool ColorManager::IsColorSetRegistered(const std::string& name) {
  const auto& sets = ColorState::Get().sets;
  return std::any_of(sets.begin(), sets.end(), [&](const ColorSet& s) { return s.name == name; });
}

void ColorManager::SetTheme(ColorTheme theme) {
  ColorState& state = ColorState::Get();
  if (state.theme == theme)
    return;
  state.theme = theme;
  AnnounceChange(state);
}

ColorTheme ColorManager::GetTheme() {
  return ColorState::Get().theme;
}

std::uint64_t ColorManager::GetGeneration() {
  return ColorState::Get().generation;
}

std::vector<std::string> ColorManager::ReportedUnknownKeys() {
  return ColorState::Get().reported;
}

void ColorManager::ResetForTesting() {
  ColorState& state = ColorState::Get();
  state.sets.clear();
  state.reported.clear();
  state.reportedSet.clear();
  state.theme = ColorTheme::kDark;
  ++state.generation;
}
