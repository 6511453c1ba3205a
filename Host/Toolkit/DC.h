#pragma once

#include <memory>
#include <span>
#include <string_view>
#include <vector>

#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Geometry.h"

class Bitmap;
class Font;
class Image;
class ImageList;
struct _cairo;

enum class TextAlign { kLeft, kCenter, kRight };
enum class TextVAlign { kTop, kCenter, kBottom };

// A drawing context over an Image. Callers draw in logical pixels relative to the current
// origin; the DC multiplies by the image's scale factor, so a DC on a scale-2 image draws the
// same picture at twice the pixels. Coordinates may be anything an int holds (e.g. +-2^30):
// geometry is clipped in 64-bit/double arithmetic before it reaches the back end, so far-off
// shapes draw exactly their visible part or nothing.
//
// Pixel conventions follow the half-open Rect: FillRect(r) paints the pixels r.left <= x <
// r.right; a 1-pixel DrawLine from a to b paints a's pixel up to, not including, b's.
//
// The image is not owned and must outlive the DC. State (origin, clip) changes through the
// scoped helpers or Push/Pop pairs. UI thread only.
class DC {
 public:
  explicit DC(Image& target);
  ~DC();
  DC(const DC&) = delete;
  DC& operator=(const DC&) = delete;

  Image& GetImage() const { return *mTarget; }
  double GetScaleFactor() const;
  // The whole target in logical pixels, in current coordinates.
  Rect GetBounds() const;

  // Origin: where the current coordinates' (0, 0) lies, in the target's logical coordinates.
  Point GetOrigin() const { return mOrigin; }
  void SetOrigin(Point origin) { mOrigin = origin; }
  void OffsetOrigin(int dx, int dy) { mOrigin = mOrigin + Point{dx, dy}; }

  // Clip: the visible area, in current coordinates; always within the target.
  Rect GetClipBox() const;
  // Narrows the clip to its intersection with `rect` (current coordinates) until PopClip.
  void PushClip(const Rect& rect);
  // Restores the clip before the matching PushClip; an unmatched pop is ignored.
  void PopClip();
  bool IsVisible(const Rect& rect) const { return GetClipBox().Intersects(rect); }

  // Saves origin and clip and restores them when destroyed (a child view's paint).
  class ScopedState {
   public:
    explicit ScopedState(DC& dc);
    ~ScopedState();
    ScopedState(const ScopedState&) = delete;
    ScopedState& operator=(const ScopedState&) = delete;

   private:
    DC& mDC;
    Point mOrigin;
    std::size_t mClipDepth;
  };
  class ScopedClip {
   public:
    ScopedClip(DC& dc, const Rect& rect) : mDC(dc) { dc.PushClip(rect); }
    ~ScopedClip() { mDC.PopClip(); }
    ScopedClip(const ScopedClip&) = delete;
    ScopedClip& operator=(const ScopedClip&) = delete;

   private:
    DC& mDC;
  };

  // Fills with `color`, blending by its alpha (source-over).
  void FillRect(const Rect& rect, Color color);
  // A frame of `width` pixels inside `rect`.
  void FrameRect(const Rect& rect, Color color, int width = 1);
  // Replaces the pixels (alpha included) instead of blending; for clearing to transparent.
  void ClearRect(const Rect& rect, Color color = Color(0, 0, 0, 0));

  // Horizontal and vertical lines are pixel exact; others are antialiased through the pixel
  // centres. `width` is in logical pixels, at least 1.
  void DrawLine(Point from, Point to, Color color, int width = 1);
  // A connected antialiased line through the pixel centres of `points`.
  void Polyline(std::span<const Point> points, Color color, double width = 1.0);
  void FillPolygon(std::span<const Point> points, Color color);
  // A disc of `radius` around the centre of pixel `center`.
  void DrawCircleFill(Point center, int radius, Color color);
  void DrawCircle(Point center, int radius, Color color, double width = 1.0);

  // One line of text inside `rect`, clipped to it; text wider than the rect is ellipsized.
  void DrawText(std::string_view text, const Rect& rect, const Font& font, Color color,
                TextAlign align = TextAlign::kLeft, TextVAlign valign = TextVAlign::kTop);
  // One line with its top-left at `topLeft`, clipped only by the clip box.
  void DrawTextAt(std::string_view text, Point topLeft, const Font& font, Color color);

  // Images draw at their logical size; one made for another scale is resampled. `alpha` is
  // clamped to [0, 1]; NaN draws nothing.
  void DrawImage(const Image& image, Point topLeft, double alpha = 1.0);
  void DrawImage(const Image& image, const Rect& dest, double alpha = 1.0);
  void DrawBitmap(const Bitmap& bitmap, Point topLeft, double alpha = 1.0);
  // Nothing for an index outside the list (reported through the debug assertion).
  void DrawImageListImage(const ImageList& list, int index, Point topLeft, double alpha = 1.0);

  // Copies (replaces, no blending) the area of `source` at `sourceTopLeft` (source's current
  // coordinates) into `dest`. Copying a DC onto itself with overlap is handled.
  void BitBlt(const Rect& dest, const DC& source, Point sourceTopLeft);
  void BitBlt(const Rect& dest, const Image& source, Point sourceTopLeft);

  // The back end's context, for toolkit code that draws vector glyphs. Its transform is the
  // scale only; the origin is not applied.
  _cairo* GetNativeContext() const { return mCairo; }

 private:
  void ApplyClip();
  Rect ClipInTarget() const;  // target logical coordinates

  Image* mTarget;            // not owned; the caller keeps it alive
  _cairo* mCairo = nullptr;  // owned
  Point mOrigin;
  std::vector<Rect> mClipStack;  // target logical coordinates; front is the whole target
};
