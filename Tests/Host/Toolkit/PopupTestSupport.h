#pragma once

#include <cstdlib>
#include <string>

#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/Image.h"

// Device pixels inside `rect` (window coordinates) where two renderings of a window differ.
inline int DifferingPixels(const Image& a, const Image& b, const Rect& rect) {
  int count = 0;
  for (int y = rect.top; y < rect.bottom; ++y) {
    for (int x = rect.left; x < rect.right; ++x) {
      if (!(a.GetPixel(x, y) == b.GetPixel(x, y))) {
        ++count;
      }
    }
  }
  return count;
}

// Writes `image` as `name` into the folder named by EC_TEST_PNG_DIR, when it is set, so a
// developer can look at what a test drew; does nothing otherwise.
inline void SaveForInspection(const Image& image, const std::string& name) {
  if (const char* folder = std::getenv("EC_TEST_PNG_DIR")) {
    image.SavePNG(std::string(folder) + "/" + name);
  }
}
