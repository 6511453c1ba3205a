#include "Host/Shell/FrameRenderer.h"

#include <cairo.h>

#include <algorithm>
#include <cmath>
#include <numbers>
#include <string>
#include <vector>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/Image.h"

namespace {

// The clip of `track` under `time`; transitions are not pictures of their own.
TrackItemRef ClipAt(const Track& track, TickTime time) {
  for (const TrackItemRef& item : track.GetItems()) {
    if (!item->IsTransition() && item->GetStart() <= time && time < item->GetEnd())
      return item;
  }
  return nullptr;
}

// Reads one effect's parameters at a clip time, with the catalogue's defaults as fallback.
class EffectReader {
 public:
  EffectReader(const Component& component, TickTime clipTime)
      : mComponent(component), mClipTime(clipTime) {}

  double Scalar(std::string_view name, double fallback) const {
    const ComponentParamRef param = mComponent.FindParam(name);
    const std::optional<double> value = param ? param->GetScalarAt(mClipTime) : std::nullopt;
    return value && std::isfinite(*value) ? *value : fallback;
  }

  ParamPoint Point(std::string_view name, ParamPoint fallback) const {
    const ComponentParamRef param = mComponent.FindParam(name);
    if (param == nullptr)
      return fallback;
    const ParamValue value = param->GetValueAt(mClipTime);
    const auto* point = std::get_if<ParamPoint>(&value);
    return point != nullptr && std::isfinite(point->x) && std::isfinite(point->y) ? *point
                                                                                  : fallback;
  }

 private:
  const Component& mComponent;
  TickTime mClipTime;
};

struct Placement {
  ParamPoint position;
  ParamPoint anchor;
  double scaleX = 1.0;
  double scaleY = 1.0;
  double rotationDegrees = 0.0;
  double opacity = 1.0;
  cairo_operator_t blend = CAIRO_OPERATOR_OVER;
};

cairo_operator_t BlendOperator(int index) {
  // In the Opacity effect's menu order; Dissolve draws as Normal here.
  static constexpr cairo_operator_t kOperators[] = {
      CAIRO_OPERATOR_OVER,     CAIRO_OPERATOR_OVER,      CAIRO_OPERATOR_DARKEN,
      CAIRO_OPERATOR_MULTIPLY, CAIRO_OPERATOR_LIGHTEN,   CAIRO_OPERATOR_SCREEN,
      CAIRO_OPERATOR_OVERLAY,  CAIRO_OPERATOR_DIFFERENCE};
  return index >= 0 && index < static_cast<int>(std::size(kOperators)) ? kOperators[index]
                                                                       : CAIRO_OPERATOR_OVER;
}

// The generated picture of a clip at a clip frame, at `scale` of the sequence's frame.
Image Picture(const TrackItem& clip, const Sequence::FrameSize& frame, double scale,
              std::int64_t frameNumber) {
  const Size size{std::max(1, static_cast<int>(std::lround(frame.width * scale))),
                  std::max(1, static_cast<int>(std::lround(frame.height * scale)))};
  Image image(size);
  const std::uint32_t rgb = clip.GetLabelColor();
  const Color label(static_cast<std::uint8_t>((rgb >> 16) & 0xFF),
                    static_cast<std::uint8_t>((rgb >> 8) & 0xFF),
                    static_cast<std::uint8_t>(rgb & 0xFF));
  image.Clear(label);
  DC dc(image);
  // A slate: a white border and the clip's name and frame at the top left, so that position,
  // scale, rotation and blur show, and the middle stays the label colour (tests read it there).
  const int border = std::max(1, size.height / 60);
  const Color white(255, 255, 255);
  dc.FrameRect({0, 0, size.width, size.height}, white, border);
  const Font font(std::max(6.0, size.height / 12.0), true);
  dc.DrawTextAt(clip.GetName() + "  #" + std::to_string(frameNumber), {border * 3, border * 3},
                font, white);
  return image;
}

std::uint8_t ClampByte(double value) {
  return static_cast<std::uint8_t>(std::clamp(std::lround(value), 0L, 255L));
}

// Brightness adds (100 is +100 levels); contrast stretches about the middle grey.
void ApplyBrightnessContrast(Image& image, double brightness, double contrast) {
  const double gain = std::max(0.0, 1.0 + contrast / 100.0);
  std::uint8_t* data = image.GetData();
  const Size size = image.GetPixelSize();
  for (int y = 0; y < size.height; ++y) {
    auto* row = data + static_cast<std::ptrdiff_t>(y) * image.GetStride();
    for (int x = 0; x < size.width; ++x) {
      std::uint8_t* pixel = row + 4 * x;
      const double alpha = pixel[3] / 255.0;
      for (int c = 0; c < 3; ++c) {  // premultiplied: work on the straight value
        const double straight = alpha > 0.0 ? pixel[c] / alpha : 0.0;
        pixel[c] = ClampByte(((straight - 128.0) * gain + 128.0 + brightness) * alpha);
      }
    }
  }
  image.MarkDirty();
}

// One horizontal or vertical box pass of radius r over every channel.
void BoxPass(Image& image, int radius, bool horizontal) {
  const Size size = image.GetPixelSize();
  const int stride = image.GetStride();
  std::uint8_t* data = image.GetData();
  const int lines = horizontal ? size.height : size.width;
  const int length = horizontal ? size.width : size.height;
  const std::ptrdiff_t step = horizontal ? 4 : stride;
  std::vector<std::uint8_t> copy(static_cast<std::size_t>(length) * 4);
  for (int l = 0; l < lines; ++l) {
    std::uint8_t* start = data + (horizontal ? static_cast<std::ptrdiff_t>(l) * stride : 4 * l);
    for (int i = 0; i < length; ++i)
      std::copy_n(start + i * step, 4, copy.begin() + 4 * i);
    for (int c = 0; c < 4; ++c) {
      long sum = 0;
      const auto at = [&](int i) { return copy[4 * std::clamp(i, 0, length - 1) + c]; };
      for (int i = -radius; i <= radius; ++i)
        sum += at(i);
      for (int i = 0; i < length; ++i) {
        start[i * step + c] = static_cast<std::uint8_t>(sum / (2 * radius + 1));
        sum += at(i + radius + 1) - at(i - radius);
      }
    }
  }
}

// Three box passes each way: close to a Gaussian of the given radius.
void ApplyBlur(Image& image, double radius) {
  const int box = static_cast<int>(std::lround(radius / 3.0));
  if (box < 1)
    return;
  for (int pass = 0; pass < 3; ++pass) {
    BoxPass(image, box, true);
    BoxPass(image, box, false);
  }
  image.MarkDirty();
}

// Runs the clip's chain over its picture and returns where and how it is composited.
Placement ApplyChain(const TrackItem& clip, TickTime clipTime, double scale, Image& picture,
                     const Sequence::FrameSize& frame) {
  Placement placement;
  placement.position = {frame.width / 2.0, frame.height / 2.0};
  placement.anchor = placement.position;
  const ComponentChainRef& chain = clip.GetComponentChain();
  if (chain == nullptr)
    return placement;
  for (const ComponentRef& component : chain->GetComponents()) {
    if (component == nullptr || component->IsBypassed())
      continue;
    const EffectReader read(*component, clipTime);
    const std::string& name = component->GetMatchName();
    if (name == kMatchName_Motion) {
      placement.position = read.Point("Position", placement.position);
      placement.anchor = read.Point("Anchor Point", placement.anchor);
      const double uniform = read.Scalar("Scale", 100.0) / 100.0;
      const bool uniformScale = read.Scalar("Uniform Scale", 1.0) != 0.0;
      placement.scaleY = uniform;
      placement.scaleX = uniformScale ? uniform : read.Scalar("Scale Width", 100.0) / 100.0;
      placement.rotationDegrees = read.Scalar("Rotation", 0.0);
    } else if (name == kMatchName_Opacity) {
      placement.opacity = std::clamp(read.Scalar("Opacity", 100.0) / 100.0, 0.0, 1.0);
      placement.blend = BlendOperator(static_cast<int>(read.Scalar("Blend Mode", 0.0)));
    } else if (name == kMatchName_BrightnessContrast) {
      ApplyBrightnessContrast(picture, read.Scalar("Brightness", 0.0),
                              read.Scalar("Contrast", 0.0));
    } else if (name == kMatchName_GaussianBlur) {
      ApplyBlur(picture, std::clamp(read.Scalar("Blurriness", 0.0), 0.0, 3000.0) * scale);
    }
  }
  return placement;
}

void Composite(Image& target, const Rect& frameRect, double scale, const Image& picture,
               const Placement& placement) {
  cairo_t* cr = cairo_create(target.GetNativeSurface());
  cairo_rectangle(cr, frameRect.left, frameRect.top, frameRect.Width(), frameRect.Height());
  cairo_clip(cr);
  cairo_translate(cr, frameRect.left + placement.position.x * scale,
                  frameRect.top + placement.position.y * scale);
  cairo_rotate(cr, placement.rotationDegrees * std::numbers::pi / 180.0);
  // A zero scale would make the matrix singular: nothing shows, as it should.
  if (std::abs(placement.scaleX) > 1e-6 && std::abs(placement.scaleY) > 1e-6) {
    cairo_scale(cr, placement.scaleX, placement.scaleY);
    cairo_translate(cr, -placement.anchor.x * scale, -placement.anchor.y * scale);
    cairo_set_source_surface(cr, picture.GetNativeSurface(), 0, 0);
    cairo_set_operator(cr, placement.blend);
    cairo_paint_with_alpha(cr, placement.opacity);
  }
  cairo_destroy(cr);
  target.MarkDirty();
}

}  // namespace

Rect FrameRenderer::FrameRect(const Sequence& sequence, Size size) {
  const Sequence::FrameSize& frame = sequence.GetFrameSize();
  const double scale = std::min(static_cast<double>(size.width) / frame.width,
                                static_cast<double>(size.height) / frame.height);
  const int width = static_cast<int>(std::lround(frame.width * scale));
  const int height = static_cast<int>(std::lround(frame.height * scale));
  const int left = (size.width - width) / 2;
  const int top = (size.height - height) / 2;
  return {left, top, left + width, top + height};
}

TrackItemRef FrameRenderer::TopClipAt(const Sequence& sequence, TickTime time) {
  const auto& tracks = sequence.GetVideoTracks();
  for (auto track = tracks.rbegin(); track != tracks.rend(); ++track) {
    if (TrackItemRef clip = ClipAt(**track, time))
      return clip;
  }
  return nullptr;
}

Image FrameRenderer::Render(const Sequence& sequence, TickTime time, Size size) {
  Image target(Size{std::max(1, size.width), std::max(1, size.height)});
  target.Clear(Color(0, 0, 0));
  const Rect frameRect = FrameRect(sequence, size);
  if (frameRect.IsEmpty())
    return target;
  const Sequence::FrameSize& frame = sequence.GetFrameSize();
  const double scale = static_cast<double>(frameRect.Width()) / frame.width;
  const TickTime ticksPerFrame =
      std::max<TickTime>(1, sequence.GetVideoFrameRate().GetTicksPerFrame());
  // V1 first: each track above covers it.
  for (const TrackRef& track : sequence.GetVideoTracks()) {
    const TrackItemRef clip = ClipAt(*track, time);
    if (clip == nullptr)
      continue;
    const TickTime clipTime = clip->SequenceTimeToClipTime(SequenceTime(time)).Ticks();
    Image picture = Picture(*clip, frame, scale, clipTime / ticksPerFrame);
    const Placement placement = ApplyChain(*clip, clipTime, scale, picture, frame);
    Composite(target, frameRect, scale, picture, placement);
  }
  return target;
}
