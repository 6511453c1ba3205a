#pragma once

#include <cstddef>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Messaging/Station.h"

// Typed values by key (dotted strings such as "ECP.Group.Expanded"; any non-empty string is a
// valid key, the dots carry no structure). A plain value type: tab states, row properties and,
// inside Preferences, the application's preferences.
//
// Reading: a missing key, or a value of another kind, gives the default. Numbers convert among
// int, float and double when the value fits the asked type (an int read as float, 2.0 read as
// int), never to or from bool or string.
//
// Writing fails visibly: every setter returns false and changes nothing when the key is
// read-only, the key is empty, or the value could not be saved (a number that is not finite,
// text or a key that is not valid UTF-8).
class PropertyList {
 public:
  using Value = std::variant<bool, int, float, double, std::string>;

  PropertyList() = default;

  bool Has(std::string_view key) const;
  std::optional<Value> GetValue(std::string_view key) const;

  bool GetBool(std::string_view key, bool defaultValue) const;
  int GetInt(std::string_view key, int defaultValue) const;
  float GetFloat(std::string_view key, float defaultValue) const;
  double GetDouble(std::string_view key, double defaultValue) const;
  std::string GetString(std::string_view key, std::string_view defaultValue) const;

  bool SetValue(std::string_view key, Value value);
  bool SetBool(std::string_view key, bool value);
  bool SetInt(std::string_view key, int value);
  bool SetFloat(std::string_view key, float value);
  bool SetDouble(std::string_view key, double value);
  bool SetString(std::string_view key, std::string_view value);

  // False when the key is read-only; true when it was removed or was not there.
  bool Remove(std::string_view key);

  // A read-only key keeps its value (or its absence) against every setter and Remove. Callers
  // that meant to write post OverrideReadOnlyPropertyWarningMessage to GetStation().
  void SetReadOnly(std::string_view key, bool readOnly);
  bool IsReadOnly(std::string_view key) const;

  std::vector<std::string> Keys() const;  // sorted
  std::size_t Size() const { return mValues.size(); }
  bool Empty() const { return mValues.empty(); }
  // Removes every value and every read-only mark.
  void Clear();

  // The station that carries messages about this list (empty: none).
  const StationName& GetStation() const { return mStation; }
  void SetStation(StationName station) { mStation = std::move(station); }

  // {"values": {"key": value, ...}, "readOnly": ["key", ...]}; floats and doubles are both JSON
  // numbers, so a float comes back as a double that reads back as the same float.
  std::string ToJSON() const;
  // nullopt (and *error set) when the text is not JSON of that shape or holds a value of another
  // kind (null, array, object); nothing is half-read.
  static std::optional<PropertyList> FromJSON(std::string_view text, std::string* error = nullptr);

  // Values and read-only marks (not the station).
  friend bool operator==(const PropertyList& a, const PropertyList& b);

 private:
  std::map<std::string, Value, std::less<>> mValues;
  std::set<std::string, std::less<>> mReadOnly;
  StationName mStation;
};

// Posted by a writer that found a property read-only, to the property list's station.
struct OverrideReadOnlyPropertyWarningMessage : MessageOf<OverrideReadOnlyPropertyWarningMessage> {
  static constexpr std::string_view kTypeName = "OverrideReadOnlyPropertyWarningMessage";

  explicit OverrideReadOnlyPropertyWarningMessage(std::string propertyKey)
      : key(std::move(propertyKey)) {}

  std::string key;
};
