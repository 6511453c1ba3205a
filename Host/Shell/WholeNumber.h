#pragma once

#include <charconv>
#include <optional>
#include <string_view>

// The whole number that is all of `text` (no sign for unsigned types, no spaces, no trailing
// characters); nullopt for anything else, an empty text or a value out of T's range.
template <class T>
std::optional<T> ParseWholeNumber(std::string_view text) {
  T value{};
  const char* end = text.data() + text.size();
  const auto [ptr, ec] = std::from_chars(text.data(), end, value);
  if (text.empty() || ec != std::errc() || ptr != end)
    return std::nullopt;
  return value;
}
