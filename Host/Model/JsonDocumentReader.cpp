#include "Host/Model/JsonDocumentReader.h"

#include <algorithm>
#include <utility>

using json = nlohmann::ordered_json;

namespace {

// Keys quoted in a path are cut short: a path names a place, it does not repeat the file.
constexpr std::size_t kMaxKeyShown = 40;

}  // namespace

std::optional<json> JsonDocumentReader::Read(std::string_view text, std::size_t maxDepth,
                                             std::string* error) {
  JsonDocumentReader reader(maxDepth);
  try {
    json::sax_parse(text.begin(), text.end(), &reader);
  } catch (const Failure& failure) {
    if (error != nullptr)
      *error = failure.message;
    return std::nullopt;
  }
  return std::move(reader.mRoot);
}

std::string JsonDocumentReader::Excerpt(std::string_view text, std::size_t maxBytes) {
  std::size_t shownLength = std::min(text.size(), maxBytes);
  while (shownLength > 0 && shownLength < text.size() &&
         (static_cast<unsigned char>(text[shownLength]) & 0xC0) == 0x80) {
    --shownLength;
  }
  std::string shown;
  for (const char c : text.substr(0, shownLength)) {
    shown += static_cast<unsigned char>(c) < 0x20 || c == 0x7f ? '?' : c;
  }
  if (shownLength < text.size()) {
    shown += "...";
  }
  return shown;
}

bool JsonDocumentReader::null() {
  return Add(nullptr);
}
bool JsonDocumentReader::boolean(bool value) {
  return Add(value);
}
bool JsonDocumentReader::number_integer(number_integer_t value) {
  return Add(value);
}
bool JsonDocumentReader::number_unsigned(number_unsigned_t value) {
  return Add(value);
}
bool JsonDocumentReader::number_float(number_float_t value, const string_t&) {
  return Add(value);
}
bool JsonDocumentReader::string(string_t& value) {
  return Add(std::move(value));
}
bool JsonDocumentReader::binary(binary_t& value) {
  return Add(json::binary(std::move(value)));
}
bool JsonDocumentReader::start_object(std::size_t) {
  return Open(json::object());
}
bool JsonDocumentReader::key(string_t& key) {
  mOpen.back().key = std::move(key);
  return true;
}
bool JsonDocumentReader::end_object() {
  return Close();
}
bool JsonDocumentReader::start_array(std::size_t) {
  return Open(json::array());
}
bool JsonDocumentReader::end_array() {
  return Close();
}

bool JsonDocumentReader::parse_error(std::size_t, const std::string&,
                                     const nlohmann::json::exception& error) {
  // The library's text starts with its own tag, "[json.exception.parse_error.101] ".
  std::string what = error.what();
  if (const auto tagEnd = what.find("] "); what.starts_with("[json.") && tagEnd != what.npos) {
    what.erase(0, tagEnd + 2);
  }
  const std::string place = PathOfNextValue();
  throw Failure{(place.empty() ? "" : place + ": ") + "not valid JSON: " + what};
}

// Places a value in the innermost open array or object (or as the document) and gives its place.
json* JsonDocumentReader::Put(json value) {
  if (mOpen.empty()) {
    mRoot = std::move(value);
    return &mRoot;
  }
  json& parent = *mOpen.back().value;
  if (parent.is_array()) {
    parent.push_back(std::move(value));
    return &parent.back();
  }
  json& member = parent[*mOpen.back().key];
  member = std::move(value);
  return &member;
}

bool JsonDocumentReader::Add(json value) {
  Put(std::move(value));
  EndMember();
  return true;
}

bool JsonDocumentReader::Open(json container) {
  if (mOpen.size() >= mMaxDepth) {
    throw Failure{PathOfNextValue() + ": nested deeper than " + std::to_string(mMaxDepth) +
                  " levels"};
  }
  mOpen.push_back({Put(std::move(container)), std::nullopt});
  return true;
}

bool JsonDocumentReader::Close() {
  mOpen.pop_back();
  EndMember();
  return true;
}

void JsonDocumentReader::EndMember() {
  if (!mOpen.empty()) {
    mOpen.back().key.reset();
  }
}

std::string JsonDocumentReader::PathOfNextValue() const {
  std::string path;
  for (std::size_t i = 0; i < mOpen.size(); ++i) {
    const OpenValue& open = mOpen[i];
    // Every open value but the innermost is still reading its last member.
    const bool readingLast = i + 1 < mOpen.size();
    if (open.value->is_array()) {
      const std::size_t size = open.value->size();
      path += "[" + std::to_string(readingLast ? size - 1 : size) + "]";
    } else if (open.key) {
      path += (path.empty() ? "" : ".") + Excerpt(*open.key, kMaxKeyShown);
    }
  }
  return path;
}
