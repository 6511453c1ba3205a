#include "Host/Messaging/PropertyList.h"

#include <cmath>
#include <cstdint>
#include <limits>
#include <nlohmann/json.hpp>

namespace {

using Json = nlohmann::json;

// Well-formed UTF-8 (no overlong forms, surrogates or code points above U+10FFFF): only such text
// survives a save, so nothing else is accepted.
bool IsValidUtf8(std::string_view text) {
  std::size_t i = 0;
  while (i < text.size()) {
    const auto byte = static_cast<unsigned char>(text[i]);
    std::size_t length = 0;
    std::uint32_t codePoint = 0;
    if (byte < 0x80) {
      ++i;
      continue;
    } else if ((byte & 0xE0) == 0xC0) {
      length = 2;
      codePoint = byte & 0x1F;
    } else if ((byte & 0xF0) == 0xE0) {
      length = 3;
      codePoint = byte & 0x0F;
    } else if ((byte & 0xF8) == 0xF0) {
      length = 4;
      codePoint = byte & 0x07;
    } else {
      return false;
    }
    if (i + length > text.size()) {
      return false;
    }
    for (std::size_t k = 1; k < length; ++k) {
      const auto next = static_cast<unsigned char>(text[i + k]);
      if ((next & 0xC0) != 0x80) {
        return false;
      }
      codePoint = (codePoint << 6) | (next & 0x3F);
    }
    constexpr std::uint32_t kSmallest[] = {0, 0, 0x80, 0x800, 0x10000};
    if (codePoint < kSmallest[length] || codePoint > 0x10FFFF ||
        (codePoint >= 0xD800 && codePoint <= 0xDFFF)) {
      return false;
    }
    i += length;
  }
  return true;
}

bool IsStorable(std::string_view key, const PropertyList::Value& value) {
  if (key.empty() || !IsValidUtf8(key)) {
    return false;
  }
  if (const auto* text = std::get_if<std::string>(&value)) {
    return IsValidUtf8(*text);
  }
  if (const auto* f = std::get_if<float>(&value)) {
    return std::isfinite(*f);
  }
  if (const auto* d = std::get_if<double>(&value)) {
    return std::isfinite(*d);
  }
  return true;
}

// The stored number as a double, if the value is a number.
std::optional<double> AsNumber(const PropertyList::Value& value) {
  if (const auto* i = std::get_if<int>(&value)) {
    return static_cast<double>(*i);
  }
  if (const auto* f = std::get_if<float>(&value)) {
    return static_cast<double>(*f);
  }
  if (const auto* d = std::get_if<double>(&value)) {
    return *d;
  }
  return std::nullopt;
}

Json ToJsonValue(const PropertyList::Value& value) {
  return std::visit([](const auto& v) { return Json(v); }, value);
}

std::optional<PropertyList::Value> FromJsonValue(const Json& json) {
  switch (json.type()) {
    case Json::value_t::boolean:
      return PropertyList::Value(json.get<bool>());
    case Json::value_t::number_integer: {
      const auto i = json.get<std::int64_t>();
      if (i >= std::numeric_limits<int>::min() && i <= std::numeric_limits<int>::max()) {
        return PropertyList::Value(static_cast<int>(i));
      }
      return PropertyList::Value(static_cast<double>(i));
    }
    case Json::value_t::number_unsigned: {
      const auto u = json.get<std::uint64_t>();
      if (u <= static_cast<std::uint64_t>(std::numeric_limits<int>::max())) {
        return PropertyList::Value(static_cast<int>(u));
      }
      return PropertyList::Value(static_cast<double>(u));
    }
    case Json::value_t::number_float:
      return PropertyList::Value(json.get<double>());
    case Json::value_t::string:
      return PropertyList::Value(json.get<std::string>());
    default:
      return std::nullopt;
  }
}

}  // namespace

bool PropertyList::Has(std::string_view key) const {
  return mValues.find(key) != mValues.end();
}

std::optional<PropertyList::Value> PropertyList::GetValue(std::string_view key) const {
  const auto it = mValues.find(key);
  if (it == mValues.end()) {
    return std::nullopt;
  }
  return it->second;
}

bool PropertyList::GetBool(std::string_view key, bool defaultValue) const {
  const auto it = mValues.find(key);
  if (it == mValues.end()) {
    return defaultValue;
  }
  const auto* b = std::get_if<bool>(&it->second);
  return b != nullptr ? *b : defaultValue;
}

int PropertyList::GetInt(std::string_view key, int defaultValue) const {
  const auto it = mValues.find(key);
  if (it == mValues.end()) {
    return defaultValue;
  }
  const auto number = AsNumber(it->second);
  if (!number || std::trunc(*number) != *number ||
      *number < static_cast<double>(std::numeric_limits<int>::min()) ||
      *number > static_cast<double>(std::numeric_limits<int>::max())) {
    return defaultValue;
  }
  return static_cast<int>(*number);
}

float PropertyList::GetFloat(std::string_view key, float defaultValue) const {
  const auto it = mValues.find(key);
  if (it == mValues.end()) {
    return defaultValue;
  }
  const auto number = AsNumber(it->second);
  if (!number || std::abs(*number) > static_cast<double>(std::numeric_limits<float>::max())) {
    return defaultValue;
  }
  return static_cast<float>(*number);
}

double PropertyList::GetDouble(std::string_view key, double defaultValue) const {
  const auto it = mValues.find(key);
  if (it == mValues.end()) {
    return defaultValue;
  }
  return AsNumber(it->second).value_or(defaultValue);
}

std::string PropertyList::GetString(std::string_view key, std::string_view defaultValue) const {
  const auto it = mValues.find(key);
  if (it != mValues.end()) {
    if (const auto* s = std::get_if<std::string>(&it->second)) {
      return *s;
    }
  }
  return std::string(defaultValue);
}

bool PropertyList::SetValue(std::string_view key, Value value) {
  if (IsReadOnly(key) || !IsStorable(key, value)) {
    return false;
  }
  const auto it = mValues.find(key);
  if (it != mValues.end()) {
    it->second = std::move(value);
  } else {
    mValues.emplace(std::string(key), std::move(value));
  }
  return true;
}

bool PropertyList::SetBool(std::string_view key, bool value) {
  return SetValue(key, value);
}
bool PropertyList::SetInt(std::string_view key, int value) {
  return SetValue(key, value);
}
bool PropertyList::SetFloat(std::string_view key, float value) {
  return SetValue(key, value);
}
bool PropertyList::SetDouble(std::string_view key, double value) {
  return SetValue(key, value);
}
bool PropertyList::SetString(std::string_view key, std::string_view value) {
  return SetValue(key, std::string(value));
}

bool PropertyList::Remove(std::string_view key) {
  if (IsReadOnly(key)) {
    return false;
  }
  if (const auto it = mValues.find(key); it != mValues.end()) {
    mValues.erase(it);
  }
  return true;
}

void PropertyList::SetReadOnly(std::string_view key, bool readOnly) {
  if (key.empty()) {
    return;
  }
  if (readOnly) {
    mReadOnly.emplace(key);
  } else if (const auto it = mReadOnly.find(key); it != mReadOnly.end()) {
    mReadOnly.erase(it);
  }
}

bool PropertyList::IsReadOnly(std::string_view key) const {
  return mReadOnly.find(key) != mReadOnly.end();
}

std::vector<std::string> PropertyList::Keys() const {
  std::vector<std::string> keys;
  keys.reserve(mValues.size());
  for (const auto& [key, value] : mValues) {
    keys.push_back(key);
  }
  return keys;
}

void PropertyList::Clear() {
  mValues.clear();
  mReadOnly.clear();
}

std::string PropertyList::ToJSON() const {
  Json values = Json::object();
  for (const auto& [key, value] : mValues) {
    values[key] = ToJsonValue(value);
  }
  Json readOnly = Json::array();
  for (const auto& key : mReadOnly) {
    readOnly.push_back(key);
  }
  Json document = Json::object();
  document["values"] = std::move(values);
  document["readOnly"] = std::move(readOnly);
  // Setters admit only valid UTF-8; replacing is a safety net that cannot fail the save.
  return document.dump(2, ' ', false, Json::error_handler_t::replace);
}

std::optional<PropertyList> PropertyList::FromJSON(std::string_view text, std::string* error) {
  const auto fail = [error](std::string why) -> std::optional<PropertyList> {
    if (error != nullptr) {
      *error = std::move(why);
    }
    return std::nullopt;
  };
  const Json document = Json::parse(text, nullptr, false);
  if (document.is_discarded()) {
    return fail("not valid JSON");
  }
  if (!document.is_object()) {
    return fail("the top level is not an object");
  }
  PropertyList list;
  if (const auto values = document.find("values"); values != document.end()) {
    if (!values->is_object()) {
      return fail("\"values\" is not an object");
    }
    for (const auto& [key, json] : values->items()) {
      auto value = FromJsonValue(json);
      if (key.empty()) {
        return fail("a value has an empty key");
      }
      if (!value || !IsStorable(key, *value)) {
        return fail("the value of \"" + key + "\" is not a bool, number or string");
      }
      list.mValues.emplace(key, std::move(*value));
    }
  }
  if (const auto readOnly = document.find("readOnly"); readOnly != document.end()) {
    if (!readOnly->is_array()) {
      return fail("\"readOnly\" is not an array");
    }
    for (const auto& key : *readOnly) {
      if (!key.is_string() || key.get_ref<const std::string&>().empty()) {
        return fail("\"readOnly\" holds something other than a key");
      }
      list.mReadOnly.insert(key.get<std::string>());
    }
  }
  return list;
}

bool operator==(const PropertyList& a, const PropertyList& b) {
  return a.mValues == b.mValues && a.mReadOnly == b.mReadOnly;
}
