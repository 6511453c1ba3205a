#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/Geometry.h"

struct _cairo_surface;

// An owned 32-bit ARGB pixel surface (premultiplied alpha, native-endian words, Cairo's
// ARGB32 layout) with a scale factor: device pixels per logical pixel. Move-only.
// A request for an impossible size (negative, zero, or beyond the back end's 32767 limit)
// gives an empty image; drawing into an empty image does nothing. A moved-from image is empty.
class Image {
 public:
  Image();
  // pixel size = ceil(logical size x scale); a scale that is not finite and positive counts as 1.
  explicit Image(Size logicalSize, double scale = 1.0);
  static Image FromPixelSize(Size pixelSize, double scale = 1.0);
  ~Image();
  Image(Image&& other) noexcept;
  Image& operator=(Image&& other) noexcept;
  Image(const Image&) = delete;
  Image& operator=(const Image&) = delete;

  Image Clone() const;

  bool IsEmpty() const { return mSurface == nullptr; }
  Size GetPixelSize() const { return mPixelSize; }
  Size GetLogicalSize() const;
  double GetScaleFactor() const { return mScale; }

  // Straight-alpha colour of one device pixel; transparent black outside the image.
  Color GetPixel(int x, int y) const;
  void Clear(Color color);

  // Raw rows, `GetStride()` bytes apart; nullptr for an empty image. Call MarkDirty after
  // writing through it so that the drawing back end sees the change.
  std::uint8_t* GetData();
  const std::uint8_t* GetData() const;
  int GetStride() const;
  void MarkDirty();

  // Writes the device pixels as PNG. False (and `error` filled when given) on failure;
  // an empty image cannot be saved.
  bool SavePNG(const std::string& path, std::string* error = nullptr) const;
  // Reads a PNG; an empty image (and `error`) on failure.
  static Image LoadPNG(const std::string& path, double scale = 1.0, std::string* error = nullptr);

  // The drawing back end's surface; owned by this image. For the toolkit's DC.
  _cairo_surface* GetNativeSurface() const { return mSurface; }

 private:
  _cairo_surface* mSurface = nullptr;
  Size mPixelSize;
  double mScale = 1.0;
};
