#include "Host/Messaging/Localization.h"

#include <map>
#include <nlohmann/json.hpp>
#include <optional>
#include <span>
#include <utility>

namespace {

constexpr std::string_view kKeyPrefix = "$$$/";
constexpr std::string_view kCommentStart = "#{";

using Table = std::map<std::string, std::string, std::less<>>;

Table& GetTable() {
  static Table table;
  return table;
}

struct ParsedKey {
  std::string_view path;
  std::string_view defaultText;
};

bool IsBlank(std::string_view text) {
  for (const char c : text) {
    if (c != ' ' && c != '\t' && c != '\n' && c != '\r') {
      return false;
    }
  }
  return true;
}

std::optional<ParsedKey> ParseKey(std::string_view key) {
  if (!key.starts_with(kKeyPrefix)) {
    return std::nullopt;
  }
  const std::string_view rest = key.substr(kKeyPrefix.size());
  const auto equals = rest.find('=');
  if (equals == std::string_view::npos) {
    return std::nullopt;
  }
  const std::string_view path = rest.substr(0, equals);
  if (IsBlank(path)) {
    return std::nullopt;
  }
  return ParsedKey{path, rest.substr(equals + 1)};
}

// "$$$/a/b=text" or "a/b" -> "a/b".
std::string_view NormalisePath(std::string_view path) {
  if (path.starts_with(kKeyPrefix)) {
    path.remove_prefix(kKeyPrefix.size());
  }
  return path.substr(0, path.find('='));
}

std::string_view DropComment(std::string_view text) {
  return text.substr(0, text.find(kCommentStart));
}

template <class Arg>
std::string FillPlaceholders(std::string_view text, std::span<const Arg> args) {
  std::string result;
  result.reserve(text.size());
  for (std::size_t i = 0; i < text.size();) {
    if (text[i] != '@' || i + 1 >= text.size() || text[i + 1] < '0' || text[i + 1] > '9') {
      result += text[i++];
      continue;
    }
    std::size_t end = i + 1;
    std::size_t index = 0;
    bool tooLarge = false;
    while (end < text.size() && text[end] >= '0' && text[end] <= '9') {
      index = index * 10 + static_cast<std::size_t>(text[end] - '0');
      tooLarge = tooLarge || index > args.size();
      ++end;
    }
    if (!tooLarge && index < args.size()) {
      result += args[index];
    } else {
      result.append(text.substr(i, end - i));
    }
    i = end;
  }
  return result;
}

template <class Arg>
std::string Localize(std::string_view key, std::span<const Arg> args) {
  const auto parsed = ParseKey(key);
  if (!parsed) {
    return std::string(key);
  }
  std::string_view text = parsed->defaultText;
  const auto& table = GetTable();
  if (const auto it = table.find(parsed->path); it != table.end()) {
    text = it->second;
  }
  return FillPlaceholders(DropComment(text), args);
}

}  // namespace

std::string LocalizeString(std::string_view key, std::initializer_list<std::string_view> args) {
  return Localize(key, std::span<const std::string_view>(args.begin(), args.size()));
}

std::string LocalizeString(std::string_view key, const std::vector<std::string>& args) {
  return Localize(key, std::span<const std::string>(args));
}

void SetLocalizedString(std::string_view path, std::string_view translation) {
  const std::string_view normalised = NormalisePath(path);
  if (IsBlank(normalised)) {
    return;
  }
  GetTable().insert_or_assign(std::string(normalised), std::string(translation));
}

bool LoadLocalizedStringsFromJSON(std::string_view jsonText, std::string* error) {
  const auto fail = [error](std::string why) {
    if (error != nullptr) {
      *error = std::move(why);
    }
    return false;
  };
  const auto document = nlohmann::json::parse(jsonText, nullptr, false);
  if (document.is_discarded() || !document.is_object()) {
    return fail("translations must be a JSON object of path to text");
  }
  for (const auto& [path, text] : document.items()) {
    if (!text.is_string()) {
      return fail("the translation of \"" + path + "\" is not a string");
    }
    if (IsBlank(NormalisePath(path))) {
      return fail("a translation has an empty path");
    }
  }
  for (const auto& [path, text] : document.items()) {
    SetLocalizedString(path, text.get_ref<const std::string&>());
  }
  return true;
}

void ClearLocalizedStrings() {
  GetTable().clear();
}
