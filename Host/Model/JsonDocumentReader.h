#pragma once

#include <cstddef>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// Reads a JSON document as the library's own parser does, but knows the path of the value it is
// reading ("sequences[0].tracks[2]"), so that whatever the library reports (bad syntax, a number
// beyond the double range) names its place, and refuses nesting deeper than a limit while it
// reads, before anything else can recurse over the document.
//
// Include only where documents are read: it brings the JSON library with it.
class JsonDocumentReader final : public nlohmann::json_sax<nlohmann::ordered_json> {
 public:
  // The document, or nothing with `*error` set to "<path>: <fault>" (no path for a fault at the
  // top level): "sequences[0].speed: not valid JSON: number overflow parsing '1e999'",
  // "properties.a[0][0]: nested deeper than 64 levels".
  static std::optional<nlohmann::ordered_json> Read(std::string_view text, std::size_t maxDepth,
                                                    std::string* error);

  // Text of a document fit for an error message: one line, at most `maxBytes` of it (cut at a
  // character boundary, marked "...") however long it is; control characters show as '?'.
  static std::string Excerpt(std::string_view text, std::size_t maxBytes);

  bool null() override;
  bool boolean(bool value) override;
  bool number_integer(number_integer_t value) override;
  bool number_unsigned(number_unsigned_t value) override;
  bool number_float(number_float_t value, const string_t& text) override;
  bool string(string_t& value) override;
  bool binary(binary_t& value) override;
  bool start_object(std::size_t elements) override;
  bool key(string_t& key) override;
  bool end_object() override;
  bool start_array(std::size_t elements) override;
  bool end_array() override;
  bool parse_error(std::size_t position, const std::string& lastToken,
                   const nlohmann::json::exception& error) override;

 private:
  struct Failure {
    std::string message;
  };
  struct OpenValue {
    nlohmann::ordered_json* value;  // owned by the document; stays put while its members are read
    // The member being read when `value` is an object; none between members.
    std::optional<std::string> key;
  };

  explicit JsonDocumentReader(std::size_t maxDepth) : mMaxDepth(maxDepth) {}

  nlohmann::ordered_json* Put(nlohmann::ordered_json value);
  bool Add(nlohmann::ordered_json value);
  bool Open(nlohmann::ordered_json container);
  bool Close();
  void EndMember();
  std::string PathOfNextValue() const;

  std::size_t mMaxDepth;
  nlohmann::ordered_json mRoot;
  std::vector<OpenValue> mOpen;
};
