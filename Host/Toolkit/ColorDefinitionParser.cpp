#include "Host/Toolkit/ColorDefinitionParser.h"

#include <charconv>
#include <cmath>
#include <cstdlib>
#include <optional>
#include <set>
#include <string>

namespace {

std::string_view Trim(std::string_view text) {
  const auto first = text.find_first_not_of(" \t\r\v\f");
  if (first == std::string_view::npos)
    return {};
  const auto last = text.find_last_not_of(" \t\r\v\f");
  return text.substr(first, last - first + 1);
}

// "'text' rest". Built by appending: GCC 12 at -O3 warns falsely (-Wrestrict) about
// "'" + std::string(...) chains.
std::string Quoted(std::string_view text, std::string_view rest) {
  std::string result;
  result.reserve(text.size() + rest.size() + 2);
  result += '\'';
  result.append(text);
  result += '\'';
  result.append(rest);
  return result;
}

bool IsKey(std::string_view key) {
  if (key.empty())
    return false;
  for (char c : key) {
    const bool ok = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
                    c == '.' || c == '_' || c == '-';
    if (!ok)
      return false;
  }
  return true;
}

std::vector<std::string_view> SplitArguments(std::string_view inside) {
  std::vector<std::string_view> arguments;
  if (Trim(inside).empty())
    return arguments;
  std::size_t start = 0;
  while (true) {
    const auto comma = inside.find(',', start);
    arguments.push_back(Trim(inside.substr(start, comma - start)));
    if (comma == std::string_view::npos)
      break;
    start = comma + 1;
  }
  return arguments;
}

std::optional<int> ParseChannel(std::string_view text) {
  int base = 10;
  if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
    base = 16;
    text.remove_prefix(2);
  }
  int value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, base);
  if (error != std::errc() || end != text.data() + text.size() || value < 0 || value > 255) {
    return std::nullopt;
  }
  return value;
}

// "20%", "20" or "12.5%" -> 0.2, 0.2, 0.125; nullopt outside 0..100.
std::optional<double> ParsePercent(std::string_view text) {
  if (!text.empty() && text.back() == '%')
    text.remove_suffix(1);
  text = Trim(text);
  if (text.empty())
    return std::nullopt;
  const std::string copy(text);
  char* end = nullptr;
  const double value = std::strtod(copy.c_str(), &end);
  if (end != copy.c_str() + copy.size() || !std::isfinite(value) || value < 0.0 || value > 100.0) {
    return std::nullopt;
  }
  return value / 100.0;
}

// Fills `definition` from the value text, or returns why it cannot.
std::optional<std::string> ParseValue(std::string_view value, ColorDefinition& definition) {
  if (value.empty())
    return "missing value after '='";
  if (value.front() != '$')
    return "value must start with $MAP, $VOK, $RGB or $REVERSIBLESCALED";
  const auto open = value.find('(');
  if (open == std::string_view::npos)
    return "missing '(' after the directive";
  if (value.back() != ')')
    return "value must end with ')'";
  const std::string_view directive = Trim(value.substr(0, open));
  const std::string_view inside = value.substr(open + 1, value.size() - open - 2);
  if (inside.find_first_of("()") != std::string_view::npos)
    return "unbalanced parentheses";
  const std::vector<std::string_view> arguments = SplitArguments(inside);
  auto expect = [&](std::size_t count) -> std::optional<std::string> {
    if (arguments.size() == count)
      return std::nullopt;
    return std::string(directive) + " takes " + std::to_string(count) + " argument" +
           (count == 1 ? "" : "s") + ", found " + std::to_string(arguments.size());
  };
  if (directive == "$MAP" || directive == "$VOK") {
    if (auto problem = expect(1))
      return problem;
    if (!IsKey(arguments[0]))
      return Quoted(arguments[0], " is not a colour key");
    definition.kind =
        directive == "$MAP" ? ColorDefinition::Kind::kMap : ColorDefinition::Kind::kToolkit;
    definition.reference = arguments[0];
    if (definition.kind == ColorDefinition::Kind::kMap && definition.reference == definition.key) {
      return Quoted(definition.key, " maps to itself");
    }
    return std::nullopt;
  }
  if (directive == "$RGB") {
    if (auto problem = expect(3))
      return problem;
    int channels[3];
    for (int i = 0; i < 3; ++i) {
      const auto channel = ParseChannel(arguments[i]);
      if (!channel) {
        return Quoted(arguments[i], " is not a channel value from 0 to 255");
      }
      channels[i] = *channel;
    }
    definition.kind = ColorDefinition::Kind::kRGB;
    definition.rgb =
        Color(static_cast<std::uint8_t>(channels[0]), static_cast<std::uint8_t>(channels[1]),
              static_cast<std::uint8_t>(channels[2]));
    return std::nullopt;
  }
  if (directive == "$REVERSIBLESCALED") {
    if (auto problem = expect(4))
      return problem;
    for (int i = 0; i < 2; ++i) {
      if (!IsKey(arguments[i]))
        return Quoted(arguments[i], " is not a colour key");
    }
    const auto light = ParsePercent(arguments[2]);
    const auto dark = ParsePercent(arguments[3]);
    if (!light || !dark)
      return "scales must be percentages from 0% to 100%";
    if (arguments[0] == definition.key || arguments[1] == definition.key) {
      return Quoted(definition.key, " refers to itself");
    }
    definition.kind = ColorDefinition::Kind::kReversibleScaled;
    definition.reference = arguments[0];
    definition.darkReference = arguments[1];
    definition.lightScale = *light;
    definition.darkScale = *dark;
    return std::nullopt;
  }
  return "unknown directive " + Quoted(directive, "");
}

}  // namespace

ColorDefinitionParseResult ColorDefinitionParser::Parse(std::string_view resourceText) {
  ColorDefinitionParseResult result;
  std::set<std::string, std::less<>> seen;
  int lineNumber = 0;
  std::size_t start = 0;
  while (start <= resourceText.size()) {
    const auto newline = resourceText.find('\n', start);
    const std::string_view raw = resourceText.substr(
        start, newline == std::string_view::npos ? std::string_view::npos : newline - start);
    start = newline == std::string_view::npos ? resourceText.size() + 1 : newline + 1;
    ++lineNumber;
    const std::string_view line = Trim(raw);
    if (line.empty() || line.front() == '#' || line.starts_with("//"))
      continue;
    auto report = [&](std::string reason) {
      result.problems.push_back({lineNumber, std::string(line), std::move(reason)});
    };
    const auto equals = line.find('=');
    if (equals == std::string_view::npos) {
      report("missing '='");
      continue;
    }
    const std::string_view key = Trim(line.substr(0, equals));
    if (key.empty()) {
      report("missing key before '='");
      continue;
    }
    if (!IsKey(key)) {
      report(Quoted(key, " is not a valid key"));
      continue;
    }
    ColorDefinition definition;
    definition.key = key;
    definition.line = lineNumber;
    if (auto problem = ParseValue(Trim(line.substr(equals + 1)), definition)) {
      report(*problem);
      continue;
    }
    if (seen.contains(key)) {
      report(Quoted(key, " is defined twice; the first definition is kept"));
      continue;
    }
    seen.emplace(key);
    result.definitions.push_back(std::move(definition));
  }
  return result;
}
