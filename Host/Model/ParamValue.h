#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

// A position or a 2-D quantity (scale with two axes, anchor point), in the parameter's own units.
struct ParamPoint {
  double x = 0.0;
  double y = 0.0;
  friend bool operator==(const ParamPoint&, const ParamPoint&) = default;
};

// A colour as straight (not premultiplied) RGBA floats, 0 to 1 being the displayable range; values
// above 1 are kept (bright colours of a float pipeline), NaN and infinities are not valid.
struct ParamColor {
  float r = 0.0f;
  float g = 0.0f;
  float b = 0.0f;
  float a = 1.0f;
  friend bool operator==(const ParamColor&, const ParamColor&) = default;
};

// The index of an entry of a popup menu parameter.
struct ParamChoice {
  std::int32_t index = 0;
  friend bool operator==(const ParamChoice&, const ParamChoice&) = default;
};

// Opaque data that the host stores and compares but never reads (custom effect settings).
struct ParamBlob {
  std::vector<std::uint8_t> bytes;
  friend bool operator==(const ParamBlob&, const ParamBlob&) = default;
};

// The value of a parameter at one time. Scalars of every numeric parameter (float, double,
// integer, angle in degrees, slider) are doubles; the parameter rounds integers itself. The
// alternatives are distinct types, so a literal 1 does not silently become a bool or a double:
// write 1.0, true or ParamChoice{1}.
using ParamValue =
    std::variant<double, ParamPoint, ParamColor, bool, ParamChoice, std::string, ParamBlob>;

// In the order of the variant's alternatives (KindOf(v) == v.index()).
enum class ParamValueKind : std::uint8_t { Double, Point, Color, Bool, Choice, String, Blob };

ParamValueKind KindOf(const ParamValue& value);
const char* ToString(ParamValueKind kind);

// Double, point and colour values change smoothly between keyframes; the others hold until the
// next keyframe whatever its interpolation says.
bool Interpolates(ParamValueKind kind);

// False when any number in the value is NaN or infinite. Strings and blobs are always finite.
bool IsFinite(const ParamValue& value);

// The value read as one number: a double as is, a bool as 0 or 1, a choice as its index;
// nullopt for the other kinds.
std::optional<double> AsScalar(const ParamValue& value);

// Linear blend a + (b - a) * f of two values of the same interpolating kind (per component for
// points and colours); for other kinds, or kinds that differ, a when f < 1 and b when f >= 1.
ParamValue Blend(const ParamValue& a, const ParamValue& b, double f);

// Short readable form for diagnostics and test output: "1.5", "(3, 4)", "rgba(1, 0, 0, 1)", "true",
// "choice 2", "\"text\"", "blob[3]".
std::string ToString(const ParamValue& value);
