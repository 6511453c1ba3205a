#include "Host/Toolkit/Color.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

namespace {

std::uint8_t MixChannel(std::uint8_t from, std::uint8_t to, double t) {
  return static_cast<std::uint8_t>(std::lround(from + (to - from) * t));
}

}  // namespace

Color Color::Mix(const Color& other, double t) const {
  t = std::isnan(t) ? 0.0 : std::clamp(t, 0.0, 1.0);
  return {MixChannel(r, other.r, t), MixChannel(g, other.g, t), MixChannel(b, other.b, t),
          MixChannel(a, other.a, t)};
}

std::string Color::ToHex() const {
  char text[10];
  if (IsOpaque()) {
    std::snprintf(text, sizeof text, "#%02x%02x%02x", r, g, b);
  } else {
    std::snprintf(text, sizeof text, "#%02x%02x%02x%02x", r, g, b, a);
  }
  return text;
}
