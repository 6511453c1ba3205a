#include "Host/Toolkit/DC.h"

#include <cairo.h>
#include <pango/pangocairo.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <numbers>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/Bitmap.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/TextLayout.h"

namespace {

// Geometry beyond the clip box by more than this (logical pixels) is cut away before it reaches
// Cairo, whose fixed-point coordinates overflow near 2^23 device pixels.
constexpr double kCullMargin = 64.0;
// Circles larger than this are drawn as clipped polygons instead of Cairo arcs.
constexpr double kMaxArcRadius = 1 << 20;

struct PointD {
  double x;
  double y;
};

// A rectangle in 64-bit target coordinates, half open like Rect.
struct RectL {
  std::int64_t left, top, right, bottom;
  bool IsEmpty() const { return right <= left || bottom <= top; }
  RectL Intersect(const Rect& r) const {
    return {std::max<std::int64_t>(left, r.left), std::max<std::int64_t>(top, r.top),
            std::min<std::int64_t>(right, r.right), std::min<std::int64_t>(bottom, r.bottom)};
  }
};

// Only call when the rect lies within the clip box (so within int range).
Rect ToRect(const RectL& r) {
  return {static_cast<int>(r.left), static_cast<int>(r.top), static_cast<int>(r.right),
          static_cast<int>(r.bottom)};
}

void SetSource(cairo_t* cr, Color color, double alpha = 1.0) {
  cairo_set_source_rgba(cr, color.r / 255.0, color.g / 255.0, color.b / 255.0,
                        color.a / 255.0 * alpha);
}

// Adds a rectangle in target pixels (64-bit, already clipped to the target) to the path.
void AddRectangle(cairo_t* cr, const RectL& rect) {
  cairo_rectangle(cr, static_cast<double>(rect.left), static_cast<double>(rect.top),
                  static_cast<double>(rect.right - rect.left),
                  static_cast<double>(rect.bottom - rect.top));
}

// Fills a rectangle in target pixels with the current operator.
void FillTargetRect(cairo_t* cr, const RectL& rect, Color color) {
  SetSource(cr, color);
  AddRectangle(cr, rect);
  cairo_fill(cr);
}

// `rect` in view coordinates, in the target's pixels: 64-bit, so far-off rects do not wrap.
RectL InTarget(const Rect& rect, Point origin) {
  return {std::int64_t{rect.left} + origin.x, std::int64_t{rect.top} + origin.y,
          std::int64_t{rect.right} + origin.x, std::int64_t{rect.bottom} + origin.y};
}

// Liang-Barsky: clips the segment a-b to `box`; false when nothing is left.
bool ClipSegment(PointD& a, PointD& b, double left, double top, double right, double bottom) {
  const double dx = b.x - a.x;
  const double dy = b.y - a.y;
  double t0 = 0.0;
  double t1 = 1.0;
  const double p[4] = {-dx, dx, -dy, dy};
  const double q[4] = {a.x - left, right - a.x, a.y - top, bottom - a.y};
  for (int i = 0; i < 4; ++i) {
    if (p[i] == 0.0) {
      if (q[i] < 0.0)
        return false;
      continue;
    }
    const double t = q[i] / p[i];
    if (p[i] < 0.0) {
      if (t > t1)
        return false;
      t0 = std::max(t0, t);
    } else {
      if (t < t0)
        return false;
      t1 = std::min(t1, t);
    }
  }
  const PointD start{a.x + t0 * dx, a.y + t0 * dy};
  const PointD end{a.x + t1 * dx, a.y + t1 * dy};
  a = start;
  b = end;
  return true;
}

// Sutherland-Hodgman against one edge of an axis-aligned box.
template <class Inside, class Cross>
std::vector<PointD> ClipPolygonEdge(const std::vector<PointD>& in, Inside inside, Cross cross) {
  std::vector<PointD> out;
  if (in.empty())
    return out;
  PointD previous = in.back();
  bool previousInside = inside(previous);
  for (const PointD& current : in) {
    const bool currentInside = inside(current);
    if (currentInside != previousInside)
      out.push_back(cross(previous, current));
    if (currentInside)
      out.push_back(current);
    previous = current;
    previousInside = currentInside;
  }
  return out;
}

std::vector<PointD> ClipPolygon(std::vector<PointD> points, double left, double top, double right,
                                double bottom) {
  auto crossX = [](double x) {
    return [x](PointD a, PointD b) {
      return PointD{x, a.y + (b.y - a.y) * (x - a.x) / (b.x - a.x)};
    };
  };
  auto crossY = [](double y) {
    return [y](PointD a, PointD b) {
      return PointD{a.x + (b.x - a.x) * (y - a.y) / (b.y - a.y), y};
    };
  };
  points = ClipPolygonEdge(
      points, [&](PointD p) { return p.x >= left; }, crossX(left));
  points = ClipPolygonEdge(
      points, [&](PointD p) { return p.x <= right; }, crossX(right));
  points = ClipPolygonEdge(
      points, [&](PointD p) { return p.y >= top; }, crossY(top));
  points = ClipPolygonEdge(
      points, [&](PointD p) { return p.y <= bottom; }, crossY(bottom));
  return points;
}

enum class BoxAndCircle { kOutside, kInside, kCrossing };

// Where the box lies relative to the disc of radius r around c.
BoxAndCircle CircleMeetsBox(PointD c, double r, double left, double top, double right,
                            double bottom) {
  const double nearX = std::clamp(c.x, left, right) - c.x;
  const double nearY = std::clamp(c.y, top, bottom) - c.y;
  if (nearX * nearX + nearY * nearY > r * r)
    return BoxAndCircle::kOutside;
  const double farX = std::max(std::abs(left - c.x), std::abs(right - c.x));
  const double farY = std::max(std::abs(top - c.y), std::abs(bottom - c.y));
  if (farX * farX + farY * farY <= r * r)
    return BoxAndCircle::kInside;
  return BoxAndCircle::kCrossing;
}

// Points on the circle's arc that can lie inside `box`, for a huge circle that crosses the
// box (so its centre lies outside the box): the angular span of the box seen from the centre,
// finely sampled.
std::vector<PointD> ArcThroughBox(PointD c, double r, double left, double top, double right,
                                  double bottom) {
  const PointD corners[4] = {{left, top}, {right, top}, {right, bottom}, {left, bottom}};
  const double reference = std::atan2((top + bottom) / 2 - c.y, (left + right) / 2 - c.x);
  double low = 0.0;
  double high = 0.0;
  for (const PointD& corner : corners) {
    double angle = std::atan2(corner.y - c.y, corner.x - c.x) - reference;
    angle = std::remainder(angle, 2 * std::numbers::pi);
    low = std::min(low, angle);
    high = std::max(high, angle);
  }
  constexpr int kSamples = 256;
  std::vector<PointD> arc;
  arc.reserve(kSamples + 1);
  for (int i = 0; i <= kSamples; ++i) {
    const double angle = reference + low + (high - low) * i / kSamples;
    arc.push_back({c.x + r * std::cos(angle), c.y + r * std::sin(angle)});
  }
  return arc;
}

}  // namespace

DC::DC(Image& target) : mTarget(&target) {
  if (!target.IsEmpty()) {
    mCairo = cairo_create(target.GetNativeSurface());
    const double scale = target.GetScaleFactor();
    cairo_scale(mCairo, scale, scale);
  }
  const Size pixels = target.GetPixelSize();
  const double scale = target.GetScaleFactor();
  mClipStack.push_back({0, 0, static_cast<int>(std::ceil(pixels.width / scale - 1e-9)),
                        static_cast<int>(std::ceil(pixels.height / scale - 1e-9))});
}

DC::~DC() {
  if (mCairo != nullptr) {
    cairo_destroy(mCairo);
    mTarget->MarkDirty();
  }
}

double DC::GetScaleFactor() const {
  return mTarget->GetScaleFactor();
}

Rect DC::GetBounds() const {
  return mClipStack.front().Offset(-mOrigin.x, -mOrigin.y);
}

Rect DC::ClipInTarget() const {
  return mClipStack.back();
}

Rect DC::GetClipBox() const {
  return ClipInTarget().Offset(-mOrigin.x, -mOrigin.y);
}

void DC::PushClip(const Rect& rect) {
  const RectL abs = InTarget(rect, mOrigin);
  const RectL clipped = abs.Intersect(ClipInTarget());
  mClipStack.push_back(clipped.IsEmpty() ? Rect{} : ToRect(clipped));
  ApplyClip();
}

void DC::PopClip() {
  if (!HOST_VERIFY(mClipStack.size() > 1, "PopClip without PushClip"))
    return;
  mClipStack.pop_back();
  ApplyClip();
}

void DC::ApplyClip() {
  if (mCairo == nullptr)
    return;
  const Rect& clip = ClipInTarget();
  cairo_reset_clip(mCairo);
  cairo_rectangle(mCairo, clip.left, clip.top, clip.Width(), clip.Height());
  cairo_clip(mCairo);
}

DC::ScopedState::ScopedState(DC& dc)
    : mDC(dc), mOrigin(dc.mOrigin), mClipDepth(dc.mClipStack.size()) {}

DC::ScopedState::~ScopedState() {
  mDC.mOrigin = mOrigin;
  if (mDC.mClipStack.size() != mClipDepth) {
    mDC.mClipStack.resize(std::max<std::size_t>(1, std::min(mClipDepth, mDC.mClipStack.size())));
    mDC.ApplyClip();
  }
}

void DC::FillRect(const Rect& rect, Color color) {
  if (mCairo == nullptr || color.a == 0)
    return;
  const RectL visible = InTarget(rect, mOrigin).Intersect(ClipInTarget());
  if (!visible.IsEmpty())
    FillTargetRect(mCairo, visible, color);
}

void DC::ClearRect(const Rect& rect, Color color) {
  if (mCairo == nullptr)
    return;
  cairo_save(mCairo);
  cairo_set_operator(mCairo, CAIRO_OPERATOR_SOURCE);
  const RectL visible = InTarget(rect, mOrigin).Intersect(ClipInTarget());
  if (!visible.IsEmpty())
    FillTargetRect(mCairo, visible, color);
  cairo_restore(mCairo);
}

void DC::FrameRect(const Rect& rect, Color color, int width) {
  if (rect.IsEmpty() || width <= 0)
    return;
  const std::int64_t l = rect.left, t = rect.top, r = rect.right, b = rect.bottom;
  const std::int64_t w = std::min<std::int64_t>(width, std::min(r - l, b - t));
  auto fill = [&](std::int64_t x0, std::int64_t y0, std::int64_t x1, std::int64_t y1) {
    // Clamp to int so that FillRect's own 64-bit clipping applies; the parts are within rect.
    auto c = [](std::int64_t v) {
      return static_cast<int>(std::clamp<std::int64_t>(v, std::numeric_limits<int>::min(),
                                                       std::numeric_limits<int>::max()));
    };
    FillRect({c(x0), c(y0), c(x1), c(y1)}, color);
  };
  // The sides never overlap, so translucent frames blend each pixel once.
  const std::int64_t bottomTop = std::max(b - w, t + w);
  const std::int64_t rightLeft = std::max(r - w, l + w);
  fill(l, t, r, t + w);
  fill(l, bottomTop, r, b);
  fill(l, t + w, l + w, bottomTop);
  fill(rightLeft, t + w, r, bottomTop);
}

void DC::DrawLine(Point from, Point to, Color color, int width) {
  if (mCairo == nullptr || color.a == 0 || from == to)
    return;
  width = std::max(width, 1);
  const std::int64_t ox = mOrigin.x;
  const std::int64_t oy = mOrigin.y;
  const std::int64_t before = (width - 1) / 2;
  if (from.y == to.y || from.x == to.x) {
    RectL line;
    if (from.y == to.y) {
      const std::int64_t x0 = from.x < to.x ? from.x : std::int64_t{to.x} + 1;
      const std::int64_t x1 = from.x < to.x ? to.x : std::int64_t{from.x} + 1;
      line = {x0 + ox, from.y + oy - before, x1 + ox, from.y + oy - before + width};
    } else {
      const std::int64_t y0 = from.y < to.y ? from.y : std::int64_t{to.y} + 1;
      const std::int64_t y1 = from.y < to.y ? to.y : std::int64_t{from.y} + 1;
      line = {from.x + ox - before, y0 + oy, from.x + ox - before + width, y1 + oy};
    }
    const RectL visible = line.Intersect(ClipInTarget());
    if (visible.IsEmpty())
      return;
    FillTargetRect(mCairo, visible, color);
    return;
  }
  const Point points[2] = {from, to};
  cairo_save(mCairo);
  cairo_set_line_cap(mCairo, CAIRO_LINE_CAP_BUTT);
  Polyline(points, color, width);
  cairo_restore(mCairo);
}

void DC::Polyline(std::span<const Point> points, Color color, double width) {
  if (mCairo == nullptr || color.a == 0 || points.size() < 2)
    return;
  if (!std::isfinite(width) || width < 0.0)
    width = 1.0;
  width = std::clamp(width, 0.1, 1024.0);
  const Rect clip = ClipInTarget();
  if (clip.IsEmpty())
    return;
  const double margin = width + kCullMargin;
  const double left = clip.left - margin, top = clip.top - margin;
  const double right = clip.right + margin, bottom = clip.bottom + margin;
  auto centre = [this](Point p) {
    return PointD{static_cast<double>(p.x) + mOrigin.x + 0.5,
                  static_cast<double>(p.y) + mOrigin.y + 0.5};
  };
  bool drawn = false;
  bool connected = false;
  PointD lastEnd{0, 0};
  for (std::size_t i = 1; i < points.size(); ++i) {
    PointD a = centre(points[i - 1]);
    PointD b = centre(points[i]);
    const PointD originalB = b;
    if (!ClipSegment(a, b, left, top, right, bottom)) {
      connected = false;
      continue;
    }
    if (!connected || a.x != lastEnd.x || a.y != lastEnd.y)
      cairo_move_to(mCairo, a.x, a.y);
    cairo_line_to(mCairo, b.x, b.y);
    drawn = true;
    lastEnd = b;
    connected = b.x == originalB.x && b.y == originalB.y;
  }
  if (!drawn)
    return;
  SetSource(mCairo, color);
  cairo_set_line_width(mCairo, width);
  // Round joins only show on wide lines; bevels stroke thin ones faster.
  cairo_set_line_join(mCairo, width > 2.0 ? CAIRO_LINE_JOIN_ROUND : CAIRO_LINE_JOIN_BEVEL);
  cairo_stroke(mCairo);
}

void DC::FillPolygon(std::span<const Point> points, Color color) {
  if (mCairo == nullptr || color.a == 0 || points.size() < 3)
    return;
  const Rect clip = ClipInTarget();
  if (clip.IsEmpty())
    return;
  std::vector<PointD> polygon;
  polygon.reserve(points.size());
  for (const Point& p : points) {
    polygon.push_back({static_cast<double>(p.x) + mOrigin.x, static_cast<double>(p.y) + mOrigin.y});
  }
  polygon = ClipPolygon(std::move(polygon), clip.left - kCullMargin, clip.top - kCullMargin,
                        clip.right + kCullMargin, clip.bottom + kCullMargin);
  if (polygon.size() < 3)
    return;
  cairo_move_to(mCairo, polygon[0].x, polygon[0].y);
  for (std::size_t i = 1; i < polygon.size(); ++i)
    cairo_line_to(mCairo, polygon[i].x, polygon[i].y);
  cairo_close_path(mCairo);
  SetSource(mCairo, color);
  cairo_fill(mCairo);
}

void DC::DrawCircleFill(Point center, int radius, Color color) {
  if (mCairo == nullptr || color.a == 0 || radius <= 0)
    return;
  const Rect clip = ClipInTarget();
  const PointD c{static_cast<double>(center.x) + mOrigin.x + 0.5,
                 static_cast<double>(center.y) + mOrigin.y + 0.5};
  const double r = radius;
  if (c.x + r < clip.left || c.x - r > clip.right || c.y + r < clip.top || c.y - r > clip.bottom) {
    return;
  }
  SetSource(mCairo, color);
  if (r <= kMaxArcRadius) {
    cairo_new_sub_path(mCairo);
    cairo_arc(mCairo, c.x, c.y, r, 0, 2 * std::numbers::pi);
    cairo_fill(mCairo);
    return;
  }
  const double left = clip.left - kCullMargin, top = clip.top - kCullMargin;
  const double right = clip.right + kCullMargin, bottom = clip.bottom + kCullMargin;
  switch (CircleMeetsBox(c, r, left, top, right, bottom)) {
    case BoxAndCircle::kOutside:
      return;
    case BoxAndCircle::kInside:
      cairo_rectangle(mCairo, clip.left, clip.top, clip.Width(), clip.Height());
      cairo_fill(mCairo);
      return;
    case BoxAndCircle::kCrossing:
      break;
  }
  std::vector<PointD> wedge = ArcThroughBox(c, r, left, top, right, bottom);
  wedge.push_back(c);
  wedge = ClipPolygon(std::move(wedge), left, top, right, bottom);
  if (wedge.size() < 3)
    return;
  cairo_move_to(mCairo, wedge[0].x, wedge[0].y);
  for (std::size_t i = 1; i < wedge.size(); ++i)
    cairo_line_to(mCairo, wedge[i].x, wedge[i].y);
  cairo_close_path(mCairo);
  cairo_fill(mCairo);
}

void DC::DrawCircle(Point center, int radius, Color color, double width) {
  if (mCairo == nullptr || color.a == 0 || radius <= 0)
    return;
  if (!std::isfinite(width) || width <= 0.0)
    width = 1.0;
  const Rect clip = ClipInTarget();
  const PointD c{static_cast<double>(center.x) + mOrigin.x + 0.5,
                 static_cast<double>(center.y) + mOrigin.y + 0.5};
  const double r = radius;
  const double reach = r + width;
  if (c.x + reach < clip.left || c.x - reach > clip.right || c.y + reach < clip.top ||
      c.y - reach > clip.bottom) {
    return;
  }
  SetSource(mCairo, color);
  cairo_set_line_width(mCairo, width);
  if (r <= kMaxArcRadius) {
    cairo_new_sub_path(mCairo);
    cairo_arc(mCairo, c.x, c.y, r, 0, 2 * std::numbers::pi);
    cairo_stroke(mCairo);
    return;
  }
  const double margin = width + kCullMargin;
  const double left = clip.left - margin, top = clip.top - margin;
  const double right = clip.right + margin, bottom = clip.bottom + margin;
  if (CircleMeetsBox(c, r, left, top, right, bottom) != BoxAndCircle::kCrossing)
    return;
  const std::vector<PointD> arc = ArcThroughBox(c, r, left, top, right, bottom);
  bool drawn = false;
  for (std::size_t i = 1; i < arc.size(); ++i) {
    PointD a = arc[i - 1];
    PointD b = arc[i];
    if (!ClipSegment(a, b, left, top, right, bottom))
      continue;
    cairo_move_to(mCairo, a.x, a.y);
    cairo_line_to(mCairo, b.x, b.y);
    drawn = true;
  }
  if (drawn)
    cairo_stroke(mCairo);
  cairo_new_path(mCairo);
}

void DC::DrawText(std::string_view text, const Rect& rect, const Font& font, Color color,
                  TextAlign align, TextVAlign valign) {
  if (mCairo == nullptr || color.a == 0 || text.empty() || rect.IsEmpty())
    return;
  const RectL abs = InTarget(rect, mOrigin);
  const RectL visible = abs.Intersect(ClipInTarget());
  if (visible.IsEmpty())
    return;
  // Widths in 64 bits: a rect from -2^30 to 2^30 is wider than an int.
  const std::int64_t rectWidth = abs.right - abs.left;
  const std::int64_t rectHeight = abs.bottom - abs.top;
  const auto layout = font.GetLayout(
      text, static_cast<int>(std::min<std::int64_t>(rectWidth, std::numeric_limits<int>::max())));
  const double w = layout->GetWidth();
  const double h = layout->GetHeight();
  const double scale = GetScaleFactor();
  double x = static_cast<double>(abs.left);
  if (w < static_cast<double>(rectWidth)) {
    if (align == TextAlign::kCenter)
      x += (static_cast<double>(rectWidth) - w) / 2;
    if (align == TextAlign::kRight)
      x = static_cast<double>(abs.right) - w;
  }
  double y = static_cast<double>(abs.top);
  if (valign == TextVAlign::kCenter)
    y += (static_cast<double>(rectHeight) - h) / 2;
  if (valign == TextVAlign::kBottom)
    y = static_cast<double>(abs.bottom) - h;
  x = std::round(x * scale) / scale;
  y = std::round(y * scale) / scale;
  if (x + layout->GetInkRight() < static_cast<double>(visible.left) ||
      x + layout->GetInkLeft() > static_cast<double>(visible.right) ||
      y + h < static_cast<double>(visible.top) || y > static_cast<double>(visible.bottom)) {
    return;
  }
  cairo_save(mCairo);
  AddRectangle(mCairo, visible);
  cairo_clip(mCairo);
  SetSource(mCairo, color);
  cairo_move_to(mCairo, x, y);
  pango_cairo_show_layout(mCairo, layout->GetPangoLayout());
  cairo_restore(mCairo);
}

void DC::DrawTextAt(std::string_view text, Point topLeft, const Font& font, Color color) {
  if (mCairo == nullptr || color.a == 0 || text.empty())
    return;
  const Rect clip = ClipInTarget();
  const auto layout = font.GetLayout(text);
  const double x = static_cast<double>(topLeft.x) + mOrigin.x;
  const double y = static_cast<double>(topLeft.y) + mOrigin.y;
  if (x + layout->GetInkRight() < clip.left || x + layout->GetInkLeft() > clip.right ||
      y + layout->GetHeight() < clip.top || y > clip.bottom) {
    return;
  }
  SetSource(mCairo, color);
  cairo_move_to(mCairo, x, y);
  pango_cairo_show_layout(mCairo, layout->GetPangoLayout());
}

void DC::DrawImage(const Image& image, Point topLeft, double alpha) {
  if (image.IsEmpty())
    return;
  const double imageScale = image.GetScaleFactor();
  const Size pixels = image.GetPixelSize();
  const double x = static_cast<double>(topLeft.x);
  const double y = static_cast<double>(topLeft.y);
  const double w = pixels.width / imageScale;
  const double h = pixels.height / imageScale;
  if (mCairo == nullptr || !(alpha > 0.0))
    return;
  const Rect clip = ClipInTarget();
  const double ax = x + mOrigin.x;
  const double ay = y + mOrigin.y;
  if (ax + w <= clip.left || ax >= clip.right || ay + h <= clip.top || ay >= clip.bottom)
    return;
  cairo_save(mCairo);
  cairo_translate(mCairo, ax, ay);
  cairo_scale(mCairo, 1.0 / imageScale, 1.0 / imageScale);
  cairo_set_source_surface(mCairo, image.GetNativeSurface(), 0, 0);
  const bool exact = imageScale == GetScaleFactor() &&
                     std::floor(ax * imageScale) == ax * imageScale &&
                     std::floor(ay * imageScale) == ay * imageScale;
  cairo_pattern_set_filter(cairo_get_source(mCairo),
                           exact ? CAIRO_FILTER_NEAREST : CAIRO_FILTER_GOOD);
  cairo_rectangle(mCairo, 0, 0, pixels.width, pixels.height);
  cairo_clip(mCairo);
  cairo_paint_with_alpha(mCairo, std::min(alpha, 1.0));
  cairo_restore(mCairo);
}

void DC::DrawImage(const Image& image, const Rect& dest, double alpha) {
  if (mCairo == nullptr || image.IsEmpty() || dest.IsEmpty() || !(alpha > 0.0))
    return;
  const RectL abs = InTarget(dest, mOrigin);
  const RectL visible = abs.Intersect(ClipInTarget());
  if (visible.IsEmpty())
    return;
  const Size pixels = image.GetPixelSize();
  const double sx = static_cast<double>(abs.right - abs.left) / pixels.width;
  const double sy = static_cast<double>(abs.bottom - abs.top) / pixels.height;
  // The back end's pattern matrices are fixed point: beyond this stretch they degenerate.
  constexpr double kMaxStretch = 4096.0;
  if (!HOST_VERIFY(sx <= kMaxStretch && sy <= kMaxStretch, "Image stretched too far"))
    return;
  // Anchor the pattern at the visible corner so that far-off destinations stay in range.
  const double offsetX = static_cast<double>(visible.left - abs.left) / sx;
  const double offsetY = static_cast<double>(visible.top - abs.top) / sy;
  cairo_save(mCairo);
  AddRectangle(mCairo, visible);
  cairo_clip(mCairo);
  cairo_translate(mCairo, static_cast<double>(visible.left), static_cast<double>(visible.top));
  cairo_scale(mCairo, sx, sy);
  cairo_set_source_surface(mCairo, image.GetNativeSurface(), -offsetX, -offsetY);
  cairo_pattern_set_filter(cairo_get_source(mCairo), CAIRO_FILTER_GOOD);
  cairo_pattern_set_extend(cairo_get_source(mCairo), CAIRO_EXTEND_PAD);
  cairo_paint_with_alpha(mCairo, std::min(alpha, 1.0));
  cairo_restore(mCairo);
}

void DC::DrawBitmap(const Bitmap& bitmap, Point topLeft, double alpha) {
  const Image& image = bitmap.GetImage(GetScaleFactor());
  const Size size = bitmap.GetSize();
  if (image.GetLogicalSize() == size) {
    DrawImage(image, topLeft, alpha);
  } else {
    DrawImage(image, Rect::FromSize(topLeft.x, topLeft.y, size.width, size.height), alpha);
  }
}

void DC::DrawImageListImage(const ImageList& list, int index, Point topLeft, double alpha) {
  list.Draw(*this, index, topLeft, alpha);
}

void DC::BitBlt(const Rect& dest, const DC& source, Point sourceTopLeft) {
  const Point origin = source.GetOrigin();
  const std::int64_t sx = std::int64_t{sourceTopLeft.x} + origin.x;
  const std::int64_t sy = std::int64_t{sourceTopLeft.y} + origin.y;
  auto clampInt = [](std::int64_t v) {
    return static_cast<int>(std::clamp<std::int64_t>(v, std::numeric_limits<int>::min(),
                                                     std::numeric_limits<int>::max()));
  };
  // Beyond int range nothing of the source can be copied anyway.
  if (clampInt(sx) != sx || clampInt(sy) != sy)
    return;
  BitBlt(dest, source.GetImage(), {static_cast<int>(sx), static_cast<int>(sy)});
}

void DC::BitBlt(const Rect& dest, const Image& source, Point sourceTopLeft) {
  if (mCairo == nullptr || source.IsEmpty() || dest.IsEmpty())
    return;
  const RectL abs = InTarget(dest, mOrigin);
  // Only the part that has source pixels behind it is copied.
  const Size sourceSize = source.GetLogicalSize();
  const std::int64_t shiftX = abs.left - sourceTopLeft.x;
  const std::int64_t shiftY = abs.top - sourceTopLeft.y;
  RectL visible = abs.Intersect(ClipInTarget());
  visible.left = std::max(visible.left, shiftX);
  visible.top = std::max(visible.top, shiftY);
  visible.right = std::min(visible.right, shiftX + sourceSize.width);
  visible.bottom = std::min(visible.bottom, shiftY + sourceSize.height);
  if (visible.IsEmpty())
    return;
  const double sourceScale = source.GetScaleFactor();
  // Copying a surface onto itself reads what it writes: copy the source area first.
  Image copy;
  const Image* from = &source;
  double fromX = static_cast<double>(visible.left - shiftX);
  double fromY = static_cast<double>(visible.top - shiftY);
  const double width = static_cast<double>(visible.right - visible.left);
  const double height = static_cast<double>(visible.bottom - visible.top);
  if (source.GetNativeSurface() == mTarget->GetNativeSurface()) {
    copy = Image(Size{static_cast<int>(width), static_cast<int>(height)}, sourceScale);
    if (copy.IsEmpty())
      return;
    cairo_t* cr = cairo_create(copy.GetNativeSurface());
    cairo_set_operator(cr, CAIRO_OPERATOR_SOURCE);
    cairo_set_source_surface(cr, source.GetNativeSurface(), -fromX * sourceScale,
                             -fromY * sourceScale);
    cairo_paint(cr);
    cairo_destroy(cr);
    from = &copy;
    fromX = 0;
    fromY = 0;
  }
  cairo_save(mCairo);
  cairo_set_operator(mCairo, CAIRO_OPERATOR_SOURCE);
  cairo_rectangle(mCairo, static_cast<double>(visible.left), static_cast<double>(visible.top),
                  width, height);
  cairo_clip(mCairo);
  cairo_translate(mCairo, static_cast<double>(visible.left) - fromX,
                  static_cast<double>(visible.top) - fromY);
  cairo_scale(mCairo, 1.0 / sourceScale, 1.0 / sourceScale);
  cairo_set_source_surface(mCairo, from->GetNativeSurface(), 0, 0);
  cairo_pattern_set_filter(cairo_get_source(mCairo), sourceScale == GetScaleFactor()
                                                         ? CAIRO_FILTER_NEAREST
                                                         : CAIRO_FILTER_GOOD);
  cairo_paint(mCairo);
  cairo_restore(mCairo);
}
