#pragma once

#include <cstddef>
#include <vector>

#include "Host/Toolkit/Geometry.h"

// A set of pixels kept as a few non-overlapping rectangles: the dirty area of a window.
// Overlapping additions merge into their bounding box, and past kMaxRects everything merges
// into one box, so the region may cover somewhat more than what was added, never less.
class Region {
 public:
  static constexpr std::size_t kMaxRects = 8;

  Region() = default;
  explicit Region(const Rect& rect) { Add(rect); }

  // Empty rects are ignored.
  void Add(const Rect& rect);
  void Add(const Region& other);
  void Clear() { mRects.clear(); }
  // Keeps only what lies inside `rect`.
  void IntersectWith(const Rect& rect);
  void Offset(int dx, int dy);

  bool IsEmpty() const { return mRects.empty(); }
  const std::vector<Rect>& Rects() const { return mRects; }
  Rect Bounds() const;
  bool Contains(Point point) const;
  bool Intersects(const Rect& rect) const;

  friend bool operator==(const Region&, const Region&) = default;

 private:
  std::vector<Rect> mRects;  // pairwise disjoint, none empty
};
