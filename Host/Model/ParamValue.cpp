#include "Host/Model/ParamValue.h"

#include <cmath>
#include <sstream>
#include <type_traits>

namespace {

template <class... Ts>
struct Overloaded : Ts... {
  using Ts::operator()...;
};
template <class... Ts>
Overloaded(Ts...) -> Overloaded<Ts...>;

double Mix(double a, double b, double f) {
  return a + (b - a) * f;
}

}  // namespace

ParamValueKind KindOf(const ParamValue& value) {
  return static_cast<ParamValueKind>(value.index());
}

const char* ToString(ParamValueKind kind) {
  switch (kind) {
    case ParamValueKind::Double:
      return "double";
    case ParamValueKind::Point:
      return "point";
    case ParamValueKind::Color:
      return "colour";
    case ParamValueKind::Bool:
      return "bool";
    case ParamValueKind::Choice:
      return "choice";
    case ParamValueKind::String:
      return "string";
    case ParamValueKind::Blob:
      return "blob";
  }
  return "unknown";
}

bool Interpolates(ParamValueKind kind) {
  return kind == ParamValueKind::Double || kind == ParamValueKind::Point ||
         kind == ParamValueKind::Color;
}

bool IsFinite(const ParamValue& value) {
  return std::visit(
      Overloaded{
          [](double v) { return std::isfinite(v); },
          [](const ParamPoint& p) { return std::isfinite(p.x) && std::isfinite(p.y); },
          [](const ParamColor& c) {
            return std::isfinite(c.r) && std::isfinite(c.g) && std::isfinite(c.b) &&
                   std::isfinite(c.a);
          },
          [](const auto&) { return true; },
      },
      value);
}

std::optional<double> AsScalar(const ParamValue& value) {
  if (const double* d = std::get_if<double>(&value)) {
    return *d;
  }
  if (const bool* b = std::get_if<bool>(&value)) {
    return *b ? 1.0 : 0.0;
  }
  if (const ParamChoice* c = std::get_if<ParamChoice>(&value)) {
    return static_cast<double>(c->index);
  }
  return std::nullopt;
}

ParamValue Blend(const ParamValue& a, const ParamValue& b, double f) {
  if (a.index() == b.index()) {
    if (const double* x = std::get_if<double>(&a)) {
      return Mix(*x, std::get<double>(b), f);
    }
    if (const ParamPoint* p = std::get_if<ParamPoint>(&a)) {
      const ParamPoint& q = std::get<ParamPoint>(b);
      return ParamPoint{Mix(p->x, q.x, f), Mix(p->y, q.y, f)};
    }
    if (const ParamColor* c = std::get_if<ParamColor>(&a)) {
      const ParamColor& d = std::get<ParamColor>(b);
      return ParamColor{
          static_cast<float>(Mix(c->r, d.r, f)), static_cast<float>(Mix(c->g, d.g, f)),
          static_cast<float>(Mix(c->b, d.b, f)), static_cast<float>(Mix(c->a, d.a, f))};
    }
  }
  return f < 1.0 ? a : b;
}

std::string ToString(const ParamValue& value) {
  std::ostringstream out;
  std::visit(Overloaded{
                 [&](double v) { out << v; },
                 [&](const ParamPoint& p) { out << '(' << p.x << ", " << p.y << ')'; },
                 [&](const ParamColor& c) {
                   out << "rgba(" << c.r << ", " << c.g << ", " << c.b << ", " << c.a << ')';
                 },
                 [&](bool b) { out << (b ? "true" : "false"); },
                 [&](const ParamChoice& c) { out << "choice " << c.index; },
                 [&](const std::string& s) { out << '"' << s << '"'; },
                 [&](const ParamBlob& b) { out << "blob[" << b.bytes.size() << ']'; },
             },
             value);
  return out.str();
}
