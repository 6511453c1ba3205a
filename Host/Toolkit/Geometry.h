#pragma once

#include <algorithm>
#include <cstdint>

// View coordinates in pixels: x grows to the right, y downwards. A Rect is half open:
// it holds the points with left <= x < right and top <= y < bottom.

struct Point {
  int x = 0;
  int y = 0;

  friend bool operator==(const Point&, const Point&) = default;
  Point operator+(const Point& other) const { return {x + other.x, y + other.y}; }
  Point operator-(const Point& other) const { return {x - other.x, y - other.y}; }
};

struct Size {
  int width = 0;
  int height = 0;

  friend bool operator==(const Size&, const Size&) = default;
};

struct Rect {
  int left = 0;
  int top = 0;
  int right = 0;
  int bottom = 0;

  static Rect FromSize(int x, int y, int width, int height) {
    return {x, y, x + width, y + height};
  }

  friend bool operator==(const Rect&, const Rect&) = default;

  static int Saturate(std::int64_t value) {
    return static_cast<int>(std::clamp<std::int64_t>(value, INT32_MIN, INT32_MAX));
  }

  // Extents wider than an int holds (a rect spanning far off-screen coordinates) saturate.
  int Width() const { return Saturate(std::int64_t{right} - left); }
  int Height() const { return Saturate(std::int64_t{bottom} - top); }
  Size GetSize() const { return {Width(), Height()}; }
  Point TopLeft() const { return {left, top}; }
  Point Center() const {
    return {static_cast<int>((std::int64_t{left} + right) / 2),
            static_cast<int>((std::int64_t{top} + bottom) / 2)};
  }
  bool IsEmpty() const { return right <= left || bottom <= top; }

  bool Contains(const Point& p) const {
    return p.x >= left && p.x < right && p.y >= top && p.y < bottom;
  }

  Rect Offset(int dx, int dy) const { return {left + dx, top + dy, right + dx, bottom + dy}; }
  Rect Inset(int dx, int dy) const { return {left + dx, top + dy, right - dx, bottom - dy}; }

  // Empty (all zero) when the two do not overlap.
  Rect Intersect(const Rect& other) const {
    Rect r{std::max(left, other.left), std::max(top, other.top), std::min(right, other.right),
           std::min(bottom, other.bottom)};
    return r.IsEmpty() ? Rect{} : r;
  }

  // The smallest rect holding both; an empty operand is ignored.
  Rect Union(const Rect& other) const {
    if (IsEmpty())
      return other;
    if (other.IsEmpty())
      return *this;
    return {std::min(left, other.left), std::min(top, other.top), std::max(right, other.right),
            std::max(bottom, other.bottom)};
  }

  bool Intersects(const Rect& other) const { return !Intersect(other).IsEmpty(); }
};
