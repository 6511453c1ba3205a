#include "Host/Toolkit/DataObject.h"

#include <algorithm>

#include "Host/Messaging/Diagnostics.h"

bool DataObject::Store(std::string_view flavour, Entry entry) {
  if (!HOST_VERIFY(!flavour.empty(), "Invalid drag data flavour")) {
    return false;
  }
  entry.flavour = std::string(flavour);
  for (Entry& existing : mEntries) {
    if (existing.flavour == flavour) {
      existing = std::move(entry);
      return true;
    }
  }
  mEntries.push_back(std::move(entry));
  return true;
}

const DataObject::Entry* DataObject::Find(std::string_view flavour) const {
  for (const Entry& entry : mEntries) {
    if (entry.flavour == flavour) {
      return &entry;
    }
  }
  return nullptr;
}

bool DataObject::SetBytes(std::string_view flavour, std::vector<std::uint8_t> bytes) {
  Entry entry;
  entry.bytes = std::move(bytes);
  return Store(flavour, std::move(entry));
}

bool DataObject::SetString(std::string_view flavour, std::string_view text) {
  return SetBytes(flavour, std::vector<std::uint8_t>(text.begin(), text.end()));
}

const std::vector<std::uint8_t>* DataObject::GetBytes(std::string_view flavour) const {
  const Entry* entry = Find(flavour);
  return entry != nullptr && entry->payload == nullptr ? &entry->bytes : nullptr;
}

std::optional<std::string> DataObject::GetString(std::string_view flavour) const {
  const std::vector<std::uint8_t>* bytes = GetBytes(flavour);
  if (bytes == nullptr) {
    return std::nullopt;
  }
  return std::string(bytes->begin(), bytes->end());
}

bool DataObject::HasFlavour(std::string_view flavour) const {
  return Find(flavour) != nullptr;
}

std::vector<std::string> DataObject::GetFlavours() const {
  std::vector<std::string> flavours;
  flavours.reserve(mEntries.size());
  for (const Entry& entry : mEntries) {
    flavours.push_back(entry.flavour);
  }
  return flavours;
}

bool DataObject::Remove(std::string_view flavour) {
  return std::erase_if(mEntries, [&](const Entry& entry) { return entry.flavour == flavour; }) > 0;
}
