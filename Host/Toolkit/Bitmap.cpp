#include "Host/Toolkit/Bitmap.h"

#include <cairo.h>

#include <algorithm>
#include <array>
#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DecalPainter.h"

namespace {

std::size_t gGlyphRenders = 0;

int ScalePercent(double scale) {
  if (!std::isfinite(scale) || scale <= 0.0)
    return 100;
  return static_cast<int>(std::lround(std::clamp(scale, 0.25, 16.0) * 100));
}

}  // namespace

Bitmap::Bitmap(std::optional<Decal> decal, Size size, Image image)
    : mDecal(decal), mSize(size), mFixed(std::move(image)) {}

Bitmap::~Bitmap() = default;

std::shared_ptr<const Bitmap> Bitmap::GetBitmap(Decal decal) {
  static std::array<std::shared_ptr<const Bitmap>, kDecalCount> bitmaps;
  if (!HOST_VERIFY(decal >= 0 && decal < kDecalCount, "Unknown decal")) {
    static const std::shared_ptr<const Bitmap> placeholder = [] {
      Image image(Size{16, 16});
      image.Clear(ColorManager::kFallbackColor);
      return std::shared_ptr<const Bitmap>(new Bitmap(std::nullopt, {16, 16}, std::move(image)));
    }();
    return placeholder;
  }
  auto& bitmap = bitmaps[decal];
  if (!bitmap)
    bitmap.reset(new Bitmap(decal, GetDecalSize(decal), Image()));
  return bitmap;
}

std::shared_ptr<const Bitmap> Bitmap::FromImage(Image image) {
  const Size size = image.GetLogicalSize();
  return std::shared_ptr<const Bitmap>(new Bitmap(std::nullopt, size, std::move(image)));
}

const Image& Bitmap::GetImage(double scale) const {
  if (!mDecal)
    return mFixed;
  const std::uint64_t generation = ColorManager::GetGeneration();
  if (generation != mRenderedGeneration) {
    mRendered.clear();
    mRenderedGeneration = generation;
  }
  const Key key{ScalePercent(scale)};
  auto found = mRendered.find(key);
  if (found != mRendered.end())
    return found->second;
  const double exactScale = key.scalePercent / 100.0;
  Image image(mSize, exactScale);
  if (!image.IsEmpty()) {
    ++gGlyphRenders;
    cairo_t* cr = cairo_create(image.GetNativeSurface());
    cairo_scale(cr, exactScale, exactScale);
    PaintDecal(cr, *mDecal);
    cairo_destroy(cr);
    image.MarkDirty();
  }
  return mRendered.emplace(key, std::move(image)).first->second;
}

std::size_t Bitmap::GlyphRenderCount() {
  return gGlyphRenders;
}
