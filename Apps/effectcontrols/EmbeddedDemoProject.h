#pragma once

#include <string_view>

// examples/demo.json as it was at build time. Generated
// into the build folder by EmbedFile.cmake.
std::string_view EmbeddedDemoProjectJSON();
