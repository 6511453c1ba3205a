#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>

#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/Geometry.h"
#include "Host/Toolkit/Image.h"

// A picture of a fixed logical size that can be drawn at any scale factor: either a toolkit
// decal, drawn as a vector glyph once per scale (and again after a theme change), or a fixed
// image. Shared and immutable to its users; the per-scale pictures are a cache. UI thread only.
class Bitmap {
 public:
  // The process-wide shared bitmap of `decal`. A value outside the Decal range is reported
  // through the host debug assertion and gives a visible placeholder (magenta square).
  static std::shared_ptr<const Bitmap> GetBitmap(Decal decal);

  // A bitmap showing `image` (its logical size is the image's).
  static std::shared_ptr<const Bitmap> FromImage(Image image);

  ~Bitmap();
  Bitmap(const Bitmap&) = delete;
  Bitmap& operator=(const Bitmap&) = delete;

  Size GetSize() const { return mSize; }
  std::optional<Decal> GetDecal() const { return mDecal; }

  // The picture at `scale` (pixels per logical pixel). For a decal it is drawn for exactly
  // that scale; a fixed image is returned as it is. Valid until the next call on this bitmap.
  const Image& GetImage(double scale) const;

  // Pictures drawn so far (for tests of the cache).
  static std::size_t GlyphRenderCount();

 private:
  struct Key {
    int scalePercent;
    bool operator<(const Key& other) const { return scalePercent < other.scalePercent; }
  };

  Bitmap(std::optional<Decal> decal, Size size, Image image);

  std::optional<Decal> mDecal;
  Size mSize;
  Image mFixed;  // for a bitmap made from an image
  mutable std::map<Key, Image> mRendered;
  mutable std::uint64_t mRenderedGeneration = 0;
};
