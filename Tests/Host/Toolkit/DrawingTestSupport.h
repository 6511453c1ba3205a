#pragma once

#include <cstdlib>
#include <functional>

#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/Image.h"

// Pixel helpers for the drawing tests.

inline bool NearColor(Color a, Color b, int tolerance = 2) {
  return std::abs(a.r - b.r) <= tolerance && std::abs(a.g - b.g) <= tolerance &&
         std::abs(a.b - b.b) <= tolerance && std::abs(a.a - b.a) <= tolerance;
}

// Device pixels of `image` for which `predicate` holds.
inline int CountPixels(const Image& image,
                       const std::function<bool(int x, int y, Color c)>& predicate) {
  int count = 0;
  const Size size = image.GetPixelSize();
  for (int y = 0; y < size.height; ++y) {
    for (int x = 0; x < size.width; ++x) {
      if (predicate(x, y, image.GetPixel(x, y)))
        ++count;
    }
  }
  return count;
}

// Pixels that differ from `background`, inside or outside `area` (device pixels).
inline int CountChangedInside(const Image& image, const Rect& area, Color background) {
  return CountPixels(image, [&](int x, int y, Color c) {
    return area.Contains({x, y}) && !NearColor(c, background, 0);
  });
}
inline int CountChangedOutside(const Image& image, const Rect& area, Color background) {
  return CountPixels(image, [&](int x, int y, Color c) {
    return !area.Contains({x, y}) && !NearColor(c, background, 0);
  });
}

inline Image MakeCanvas(Size size, Color background, double scale = 1.0) {
  Image image(size, scale);
  image.Clear(background);
  return image;
}

// Colours that appear in no theme, so that test pixels are unambiguous.
inline constexpr Color kTestBackground{10, 20, 30};
inline constexpr Color kTestRed{220, 40, 40};
inline constexpr Color kTestGreen{40, 200, 60};
