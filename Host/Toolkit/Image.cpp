#include "Host/Toolkit/Image.h"

#include <cairo.h>

#include <cmath>
#include <cstring>
#include <utility>

namespace {

// Cairo's image surfaces are limited to 32767 pixels a side.
constexpr int kMaxPixelSide = 32767;

double SaneScale(double scale) {
  return std::isfinite(scale) && scale > 0.0 ? scale : 1.0;
}

cairo_surface_t* CreateSurface(Size pixelSize) {
  if (pixelSize.width <= 0 || pixelSize.height <= 0 || pixelSize.width > kMaxPixelSide ||
      pixelSize.height > kMaxPixelSide) {
    return nullptr;
  }
  cairo_surface_t* surface =
      cairo_image_surface_create(CAIRO_FORMAT_ARGB32, pixelSize.width, pixelSize.height);
  if (cairo_surface_status(surface) != CAIRO_STATUS_SUCCESS) {
    cairo_surface_destroy(surface);
    return nullptr;
  }
  return surface;
}

std::uint8_t Unpremultiply(std::uint32_t channel, std::uint32_t alpha) {
  return static_cast<std::uint8_t>(alpha == 0 ? 0 : (channel * 255 + alpha / 2) / alpha);
}

}  // namespace

Image::Image() = default;

Image::Image(Size logicalSize, double scale) : mScale(SaneScale(scale)) {
  const double w = std::ceil(logicalSize.width * mScale - 1e-9);
  const double h = std::ceil(logicalSize.height * mScale - 1e-9);
  if (w > 0 && h > 0 && w <= kMaxPixelSide && h <= kMaxPixelSide) {
    mSurface = CreateSurface({static_cast<int>(w), static_cast<int>(h)});
    if (mSurface != nullptr)
      mPixelSize = {static_cast<int>(w), static_cast<int>(h)};
  }
}

Image Image::FromPixelSize(Size pixelSize, double scale) {
  Image image;
  image.mScale = SaneScale(scale);
  image.mSurface = CreateSurface(pixelSize);
  if (image.mSurface != nullptr)
    image.mPixelSize = pixelSize;
  return image;
}

Image::~Image() {
  if (mSurface != nullptr)
    cairo_surface_destroy(mSurface);
}

Image::Image(Image&& other) noexcept
    : mSurface(std::exchange(other.mSurface, nullptr)),
      mPixelSize(std::exchange(other.mPixelSize, Size{})),
      mScale(other.mScale) {}

Image& Image::operator=(Image&& other) noexcept {
  if (this != &other) {
    if (mSurface != nullptr)
      cairo_surface_destroy(mSurface);
    mSurface = std::exchange(other.mSurface, nullptr);
    mPixelSize = std::exchange(other.mPixelSize, Size{});
    mScale = other.mScale;
  }
  return *this;
}

Image Image::Clone() const {
  Image copy = FromPixelSize(mPixelSize, mScale);
  if (copy.mSurface != nullptr) {
    cairo_surface_flush(mSurface);
    std::memcpy(copy.GetData(), GetData(),
                static_cast<std::size_t>(GetStride()) * mPixelSize.height);
    copy.MarkDirty();
  }
  return copy;
}

Size Image::GetLogicalSize() const {
  return {static_cast<int>(std::lround(mPixelSize.width / mScale)),
          static_cast<int>(std::lround(mPixelSize.height / mScale))};
}

Color Image::GetPixel(int x, int y) const {
  if (mSurface == nullptr || x < 0 || y < 0 || x >= mPixelSize.width || y >= mPixelSize.height) {
    return Color(0, 0, 0, 0);
  }
  cairo_surface_flush(mSurface);
  std::uint32_t word;
  std::memcpy(&word, GetData() + static_cast<std::ptrdiff_t>(y) * GetStride() + x * 4, 4);
  const std::uint32_t a = word >> 24;
  return Color(Unpremultiply((word >> 16) & 0xff, a), Unpremultiply((word >> 8) & 0xff, a),
               Unpremultiply(word & 0xff, a), static_cast<std::uint8_t>(a));
}

void Image::Clear(Color color) {
  if (mSurface == nullptr)
    return;
  cairo_t* cr = cairo_create(mSurface);
  cairo_set_operator(cr, CAIRO_OPERATOR_SOURCE);
  cairo_set_source_rgba(cr, color.r / 255.0, color.g / 255.0, color.b / 255.0, color.a / 255.0);
  cairo_paint(cr);
  cairo_destroy(cr);
}

std::uint8_t* Image::GetData() {
  if (mSurface == nullptr)
    return nullptr;
  cairo_surface_flush(mSurface);
  return cairo_image_surface_get_data(mSurface);
}

const std::uint8_t* Image::GetData() const {
  if (mSurface == nullptr)
    return nullptr;
  cairo_surface_flush(mSurface);
  return cairo_image_surface_get_data(mSurface);
}

int Image::GetStride() const {
  return mSurface == nullptr ? 0 : cairo_image_surface_get_stride(mSurface);
}

void Image::MarkDirty() {
  if (mSurface != nullptr)
    cairo_surface_mark_dirty(mSurface);
}

bool Image::SavePNG(const std::string& path, std::string* error) const {
  if (mSurface == nullptr) {
    if (error != nullptr)
      *error = "cannot save an empty image";
    return false;
  }
  const cairo_status_t status = cairo_surface_write_to_png(mSurface, path.c_str());
  if (status != CAIRO_STATUS_SUCCESS) {
    if (error != nullptr)
      *error = "cannot write " + path + ": " + cairo_status_to_string(status);
    return false;
  }
  return true;
}

Image Image::LoadPNG(const std::string& path, double scale, std::string* error) {
  cairo_surface_t* loaded = cairo_image_surface_create_from_png(path.c_str());
  const cairo_status_t status = cairo_surface_status(loaded);
  if (status != CAIRO_STATUS_SUCCESS) {
    cairo_surface_destroy(loaded);
    if (error != nullptr)
      *error = "cannot read " + path + ": " + cairo_status_to_string(status);
    return Image();
  }
  const Size size{cairo_image_surface_get_width(loaded), cairo_image_surface_get_height(loaded)};
  Image image = FromPixelSize(size, scale);
  if (!image.IsEmpty()) {
    // The PNG may load as RGB24 or A8; painting converts it to our ARGB32 layout.
    cairo_t* cr = cairo_create(image.mSurface);
    cairo_set_operator(cr, CAIRO_OPERATOR_SOURCE);
    cairo_set_source_surface(cr, loaded, 0, 0);
    cairo_paint(cr);
    cairo_destroy(cr);
  } else if (error != nullptr) {
    *error = "image in " + path + " is too large";
  }
  cairo_surface_destroy(loaded);
  return image;
}
