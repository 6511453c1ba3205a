#pragma once

#include <algorithm>
#include <cmath>

// The linear scale of a range bar `width` pixels wide showing [minimum, maximum]: the first and
// last pixels are the ends. An empty range maps everything to the first pixel; a bar too narrow
// to show a range reads every x as the minimum.
struct RangeBarScale {
  double minimum = 0.0;
  double maximum = 1.0;
  int width = 0;

  int ValueToX(double value) const {
    const int span = std::max(0, width - 1);
    if (maximum <= minimum) {
      return 0;
    }
    return static_cast<int>(std::lround((value - minimum) / (maximum - minimum) * span));
  }

  double XToValue(int x) const {
    const int span = width - 1;
    if (span <= 0) {
      return minimum;
    }
    return std::clamp(minimum + (maximum - minimum) * x / span, minimum, maximum);
  }
};
