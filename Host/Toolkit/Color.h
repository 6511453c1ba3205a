#pragma once

#include <cstdint>
#include <string>

// An sRGB colour with straight (not premultiplied) alpha, 0 transparent .. 255 opaque.
struct Color {
  std::uint8_t r = 0;
  std::uint8_t g = 0;
  std::uint8_t b = 0;
  std::uint8_t a = 255;

  constexpr Color() = default;
  constexpr Color(std::uint8_t red, std::uint8_t green, std::uint8_t blue, std::uint8_t alpha = 255)
      : r(red), g(green), b(blue), a(alpha) {}

  // 0xRRGGBB, opaque.
  static constexpr Color FromRGB(std::uint32_t rgb) {
    return {static_cast<std::uint8_t>(rgb >> 16), static_cast<std::uint8_t>(rgb >> 8),
            static_cast<std::uint8_t>(rgb)};
  }

  friend constexpr bool operator==(const Color&, const Color&) = default;

  constexpr Color WithAlpha(std::uint8_t alpha) const { return {r, g, b, alpha}; }
  bool IsOpaque() const { return a == 255; }

  // Channel-wise mix; t = 0 gives *this, t = 1 gives `other` (t is clamped to [0, 1]).
  Color Mix(const Color& other, double t) const;

  // "#rrggbb" for opaque colours, "#rrggbbaa" otherwise.
  std::string ToHex() const;
};
