#pragma once

#include <cstdint>
#include <string_view>

#include "Host/Model/ParamValue.h"

// Text as the host stores it in binary parameter values: UTF-16, low byte first. For tests
// that write ASCII labels.
inline ParamBlob WideText(std::string_view text) {
  ParamBlob blob;
  for (const char c : text) {
    blob.bytes.push_back(static_cast<std::uint8_t>(c));
    blob.bytes.push_back(0);
  }
  return blob;
}
