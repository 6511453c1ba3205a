#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <typeindex>
#include <typeinfo>
#include <utility>
#include <vector>

// Flavour names of the host's drag data.
inline constexpr std::string_view kDataTypeName_Text = "text/plain;charset=utf-8";
// A vector of components dragged out of an effect list.
inline constexpr std::string_view kDataTypeName_EffectControlsComponent =
    "host/effectcontrols-components";
// A vector of effect selection items dragged from the effects browser.
inline constexpr std::string_view kDataTypeName_EffectSelection = "host/effect-selection";
inline constexpr std::string_view kDataTypeName_FilterVector = "host/filter-vector";
inline constexpr std::string_view kDataTypeName_FilterPresetVector = "host/filter-preset-vector";

// Data offered by a drag (or a clipboard), in several flavours at once: each flavour name maps
// either to bytes or to a shared, immutable payload of a C++ type. A payload is read back only
// as the type it was stored as. A value type; copies share the payloads. UI thread only.
class DataObject {
 public:
  // Replaces a flavour in place (it keeps its position); an empty flavour name is refused with
  // a debug assertion and changes nothing.
  bool SetBytes(std::string_view flavour, std::vector<std::uint8_t> bytes);
  bool SetString(std::string_view flavour, std::string_view text);
  template <class T>
  bool SetPayload(std::string_view flavour, std::shared_ptr<const T> payload);

  // Null when the flavour is absent or holds a payload.
  const std::vector<std::uint8_t>* GetBytes(std::string_view flavour) const;
  std::optional<std::string> GetString(std::string_view flavour) const;
  // Null when the flavour is absent, holds bytes, or holds a payload of another type.
  template <class T>
  std::shared_ptr<const T> GetPayload(std::string_view flavour) const;

  bool HasFlavour(std::string_view flavour) const;
  // In the order they were first set.
  std::vector<std::string> GetFlavours() const;
  bool Remove(std::string_view flavour);
  void Clear() { mEntries.clear(); }
  bool IsEmpty() const { return mEntries.empty(); }

 private:
  struct Entry {
    std::string flavour;
    std::vector<std::uint8_t> bytes;
    std::shared_ptr<const void> payload;  // null for bytes
    std::type_index type = typeid(void);  // the payload's type
  };

  bool Store(std::string_view flavour, Entry entry);
  const Entry* Find(std::string_view flavour) const;

  std::vector<Entry> mEntries;
};

template <class T>
bool DataObject::SetPayload(std::string_view flavour, std::shared_ptr<const T> payload) {
  if (payload == nullptr) {
    return false;
  }
  Entry entry;
  entry.payload = std::move(payload);
  entry.type = typeid(T);
  return Store(flavour, std::move(entry));
}

template <class T>
std::shared_ptr<const T> DataObject::GetPayload(std::string_view flavour) const {
  const Entry* entry = Find(flavour);
  if (entry == nullptr || entry->payload == nullptr || entry->type != typeid(T)) {
    return nullptr;
  }
  return std::static_pointer_cast<const T>(entry->payload);
}
