#include "Host/Toolkit/Region.h"

#include <algorithm>

void Region::Add(const Rect& rect) {
  if (rect.IsEmpty()) {
    return;
  }
  for (const Rect& existing : mRects) {
    if (existing.Intersect(rect) == rect) {
      return;  // already covered
    }
  }
  // Absorb every rect the growing one overlaps until it overlaps none.
  Rect merged = rect;
  bool grew = true;
  while (grew) {
    grew = false;
    for (auto it = mRects.begin(); it != mRects.end(); ++it) {
      if (it->Intersects(merged)) {
        merged = merged.Union(*it);
        mRects.erase(it);
        grew = true;
        break;
      }
    }
  }
  mRects.push_back(merged);
  if (mRects.size() > kMaxRects) {
    const Rect bounds = Bounds();
    mRects.assign(1, bounds);
  }
}

void Region::Add(const Region& other) {
  for (const Rect& rect : other.mRects) {
    Add(rect);
  }
}

void Region::IntersectWith(const Rect& rect) {
  for (Rect& existing : mRects) {
    existing = existing.Intersect(rect);
  }
  std::erase_if(mRects, [](const Rect& r) { return r.IsEmpty(); });
}

void Region::Offset(int dx, int dy) {
  for (Rect& rect : mRects) {
    rect = rect.Offset(dx, dy);
  }
}

Rect Region::Bounds() const {
  Rect bounds;
  for (const Rect& rect : mRects) {
    bounds = bounds.Union(rect);
  }
  return bounds;
}

bool Region::Contains(Point point) const {
  return std::any_of(mRects.begin(), mRects.end(),
                     [&](const Rect& rect) { return rect.Contains(point); });
}

bool Region::Intersects(const Rect& rect) const {
  return std::any_of(mRects.begin(), mRects.end(),
                     [&](const Rect& r) { return r.Intersects(rect); });
}
