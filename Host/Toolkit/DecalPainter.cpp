#include "Host/Toolkit/DecalPainter.h"

#include <cairo.h>
#include <pango/pangocairo.h>

#include <cmath>
#include <numbers>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/TextLayout.h"

namespace {

constexpr double kPi = std::numbers::pi;

void SetColor(cairo_t* cr, Color color, double alpha = 1.0) {
  cairo_set_source_rgba(cr, color.r / 255.0, color.g / 255.0, color.b / 255.0,
                        color.a / 255.0 * alpha);
}

struct Palette {
  Color foreground;  // icon strokes and normal keyframes
  Color dim;         // switched-off states
  Color accent;      // selected and active states
  Color outline;     // thin edge around keyframe glyphs
  Color warning;

  static Palette Current() {
    const bool dark = ColorManager::GetTheme() == ColorTheme::kDark;
    return {ColorManager::GetColor(kColor_ReversibleBlack),
            ColorManager::GetColor(kColor_ReversibleGray),
            ColorManager::GetColor(kColor_InteractiveControl),
            dark ? Color(0x10, 0x10, 0x10) : Color(0x50, 0x50, 0x50),
            ColorManager::GetColor(kColor_Error)};
  }
};

// ---- keyframe glyphs -------------------------------------------------------------------------

// Keyframe glyph centre: pixel (7, 8) of a 16 x 16 box.
constexpr double kCx = 7.5;
constexpr double kCy = 8.5;
constexpr double kR = 4.5;

enum class Half { kDiamond, kHourglass, kCircle, kSquare, kTriangle, kTallRect };

void DiamondPath(cairo_t* cr, double rx, double ry) {
  cairo_move_to(cr, kCx, kCy - ry);
  cairo_line_to(cr, kCx + rx, kCy);
  cairo_line_to(cr, kCx, kCy + ry);
  cairo_line_to(cr, kCx - rx, kCy);
  cairo_close_path(cr);
}

void HourglassPath(cairo_t* cr) {
  const double r = kR;
  const double waist = 1.3;
  cairo_move_to(cr, kCx - r, kCy - r);
  cairo_line_to(cr, kCx + r, kCy - r);
  cairo_curve_to(cr, kCx + r, kCy - 1.5, kCx + waist, kCy - 1.2, kCx + waist, kCy);
  cairo_curve_to(cr, kCx + waist, kCy + 1.2, kCx + r, kCy + 1.5, kCx + r, kCy + r);
  cairo_line_to(cr, kCx - r, kCy + r);
  cairo_curve_to(cr, kCx - r, kCy + 1.5, kCx - waist, kCy + 1.2, kCx - waist, kCy);
  cairo_curve_to(cr, kCx - waist, kCy - 1.2, kCx - r, kCy - 1.5, kCx - r, kCy - r);
  cairo_close_path(cr);
}

void HalfPath(cairo_t* cr, Half shape) {
  switch (shape) {
    case Half::kDiamond:
      DiamondPath(cr, kR + 0.5, kR + 0.5);
      break;
    case Half::kHourglass:
      HourglassPath(cr);
      break;
    case Half::kCircle:
      cairo_new_sub_path(cr);
      cairo_arc(cr, kCx, kCy, kR, 0, 2 * kPi);
      break;
    case Half::kSquare:
      cairo_rectangle(cr, kCx - kR + 0.5, kCy - kR + 0.5, 2 * kR - 1, 2 * kR - 1);
      break;
    case Half::kTriangle:
      DiamondPath(cr, kR - 0.5, kR + 2);
      break;
    case Half::kTallRect:
      cairo_rectangle(cr, kCx - kR + 1, kCy - kR - 1.5, 2 * kR - 2, 2 * kR + 3);
      break;
  }
}

// Draws the left half of `left` and the right half of `right`; `drawLeft`/`drawRight` pick the
// halves (a first keyframe shows only its right half, a last one only its left).
void PaintKeyframe(cairo_t* cr, Half left, Half right, bool drawLeft, bool drawRight, Color fill,
                   Color outline, bool centreLine) {
  auto paintShape = [&](Half shape, double clipLeft, double clipRight) {
    cairo_save(cr);
    cairo_rectangle(cr, clipLeft, 0, clipRight - clipLeft, 16);
    cairo_clip(cr);
    HalfPath(cr, shape);
    SetColor(cr, fill);
    cairo_fill_preserve(cr);
    SetColor(cr, outline, 0.85);
    cairo_set_line_width(cr, 1.0);
    cairo_stroke(cr);
    cairo_restore(cr);
  };
  // Halves are cut on whole pixels: a cut through the centre column would leave an
  // antialiased seam. The centre column (7) belongs to the half that is drawn alone.
  if (drawLeft && drawRight) {
    if (left == right) {
      paintShape(left, 0, 16);
    } else {
      paintShape(left, 0, 8);
      paintShape(right, 8, 16);
    }
  } else if (drawLeft) {
    paintShape(left, 0, 8);
  } else if (drawRight) {
    paintShape(right, 7, 16);
  }
  if (centreLine) {
    SetColor(cr, outline, 0.85);
    cairo_set_line_width(cr, 1.0);
    cairo_move_to(cr, kCx, kCy - kR - 1);
    cairo_line_to(cr, kCx, kCy + kR + 1);
    cairo_stroke(cr);
  }
}

void PaintKeyframeDecal(cairo_t* cr, int index, const Palette& palette) {
  static constexpr Half kShapes[6][2] = {
      {Half::kDiamond, Half::kDiamond},      // linear
      {Half::kHourglass, Half::kHourglass},  // bezier
      {Half::kCircle, Half::kCircle},        // auto bezier
      {Half::kSquare, Half::kSquare},        // hold
      {Half::kHourglass, Half::kDiamond},    // ease in: eased arrival
      {Half::kDiamond, Half::kHourglass},    // ease out: eased departure
  };
  const int kind = index / kKeyframeDecalVariants;
  const int variant = index % kKeyframeDecalVariants;  // Normal, First, Last, Selected, ...
  const bool selected = variant >= 3;
  const int part = variant % 3;  // 0 whole, 1 first (right half), 2 last (left half)
  PaintKeyframe(cr, kShapes[kind][0], kShapes[kind][1], part != 1, part != 2,
                selected ? palette.accent : palette.foreground, palette.outline, false);
}

void PaintTimeRemapDecal(cairo_t* cr, int index, const Palette& palette) {
  struct Shape {
    Half left, right;
    bool drawLeft, drawRight;
  };
  static constexpr Shape kShapes[6] = {
      {Half::kTriangle, Half::kTriangle, true, true},   // dual control point
      {Half::kTriangle, Half::kTriangle, true, false},  // left
      {Half::kTriangle, Half::kTriangle, false, true},  // right
      {Half::kTallRect, Half::kTallRect, true, true},   // hold
      {Half::kTriangle, Half::kTallRect, true, true},   // dual, holding to the right
      {Half::kTallRect, Half::kTriangle, true, true},   // dual, holding to the left
  };
  const Shape& shape = kShapes[index / 2];
  const bool selected = index % 2 == 1;
  PaintKeyframe(cr, shape.left, shape.right, shape.drawLeft, shape.drawRight,
                selected ? palette.accent : palette.foreground, palette.outline,
                shape.drawLeft && shape.drawRight);
}

// ---- icons -----------------------------------------------------------------------------------

void Stroke(cairo_t* cr, Color color, double width = 1.25) {
  SetColor(cr, color);
  cairo_set_line_width(cr, width);
  cairo_set_line_cap(cr, CAIRO_LINE_CAP_ROUND);
  cairo_set_line_join(cr, CAIRO_LINE_JOIN_ROUND);
  cairo_stroke(cr);
}

void Fill(cairo_t* cr, Color color) {
  SetColor(cr, color);
  cairo_fill(cr);
}

void Polygon(cairo_t* cr, std::initializer_list<std::pair<double, double>> points) {
  bool first = true;
  for (const auto& [x, y] : points) {
    if (first) {
      cairo_move_to(cr, x, y);
      first = false;
    } else {
      cairo_line_to(cr, x, y);
    }
  }
  cairo_close_path(cr);
}

void RoundedRect(cairo_t* cr, double x, double y, double w, double h, double r) {
  cairo_new_sub_path(cr);
  cairo_arc(cr, x + w - r, y + r, r, -kPi / 2, 0);
  cairo_arc(cr, x + w - r, y + h - r, r, 0, kPi / 2);
  cairo_arc(cr, x + r, y + h - r, r, kPi / 2, kPi);
  cairo_arc(cr, x + r, y + r, r, kPi, 3 * kPi / 2);
  cairo_close_path(cr);
}

// A chevron pointing at `angle` (radians; 0 = right, pi/2 = down).
void Chevron(cairo_t* cr, double angle, Color color) {
  const double c = std::cos(angle);
  const double s = std::sin(angle);
  auto at = [&](double u, double v) { return std::pair{8 + u * c - v * s, 8 + u * s + v * c}; };
  const auto [x0, y0] = at(-1.75, -3.5);
  const auto [x1, y1] = at(1.75, 0);
  const auto [x2, y2] = at(-1.75, 3.5);
  cairo_move_to(cr, x0, y0);
  cairo_line_to(cr, x1, y1);
  cairo_line_to(cr, x2, y2);
  Stroke(cr, color, 1.6);
}

// A filled triangle pointing at `angle`, centred on (cx, cy).
void Arrowhead(cairo_t* cr, double cx, double cy, double size, double angle, Color color) {
  const double c = std::cos(angle);
  const double s = std::sin(angle);
  auto at = [&](double u, double v) { return std::pair{cx + u * c - v * s, cy + u * s + v * c}; };
  const auto [x0, y0] = at(size * 0.6, 0);
  const auto [x1, y1] = at(-size * 0.5, -size * 0.6);
  const auto [x2, y2] = at(-size * 0.5, size * 0.6);
  Polygon(cr, {{x0, y0}, {x1, y1}, {x2, y2}});
  Fill(cr, color);
}

void Gear(cairo_t* cr, double cx, double cy, double outer, Color color) {
  const double inner = outer * 0.72;
  constexpr int kTeeth = 8;
  for (int i = 0; i < kTeeth * 2; ++i) {
    const double a0 = (i - 0.5) * kPi / kTeeth;
    const double a1 = (i + 0.5) * kPi / kTeeth;
    const double r = i % 2 == 0 ? outer : inner;
    if (i == 0)
      cairo_move_to(cr, cx + r * std::cos(a0), cy + r * std::sin(a0));
    cairo_line_to(cr, cx + r * std::cos(a0), cy + r * std::sin(a0));
    cairo_line_to(cr, cx + r * std::cos(a1), cy + r * std::sin(a1));
  }
  cairo_close_path(cr);
  cairo_new_sub_path(cr);
  cairo_arc_negative(cr, cx, cy, outer * 0.32, 0, -2 * kPi);
  cairo_set_fill_rule(cr, CAIRO_FILL_RULE_EVEN_ODD);
  Fill(cr, color);
  cairo_set_fill_rule(cr, CAIRO_FILL_RULE_WINDING);
}

// Centres the ink of `text` on (cx, cy). Through the toolkit's fonts, so glyphs come from the
// same DejaVu faces as the rest of the interface.
void Text(cairo_t* cr, const char* text, double size, bool bold, bool italic, double cx, double cy,
          Color color) {
  const auto layout = Font(size, bold, italic).GetLayout(text);
  PangoRectangle ink;
  pango_layout_get_extents(layout->GetPangoLayout(), &ink, nullptr);
  const double inkX = static_cast<double>(ink.x) / PANGO_SCALE;
  const double inkY = static_cast<double>(ink.y) / PANGO_SCALE;
  const double inkW = static_cast<double>(ink.width) / PANGO_SCALE;
  const double inkH = static_cast<double>(ink.height) / PANGO_SCALE;
  cairo_move_to(cr, cx - inkX - inkW / 2, cy - inkY - inkH / 2);
  pango_cairo_layout_path(cr, layout->GetPangoLayout());
  Fill(cr, color);
}

void FxBadge(cairo_t* cr, bool on, const Palette& p) {
  const Color color = on ? p.foreground : p.dim;
  RoundedRect(cr, 1.5, 3.5, 13, 10, 2);
  Stroke(cr, color, 1.0);
  Text(cr, "fx", 8.5, true, true, 8, 8.5, color);
  if (!on) {
    cairo_move_to(cr, 2.5, 13);
    cairo_line_to(cr, 13.5, 4);
    Stroke(cr, p.dim, 1.2);
  }
}

void Eye(cairo_t* cr, bool visible, const Palette& p) {
  const Color color = visible ? p.foreground : p.dim;
  cairo_move_to(cr, 1.5, 8);
  cairo_curve_to(cr, 4.5, 3, 11.5, 3, 14.5, 8);
  cairo_curve_to(cr, 11.5, 13, 4.5, 13, 1.5, 8);
  cairo_close_path(cr);
  Stroke(cr, color, 1.2);
  if (visible) {
    cairo_arc(cr, 8, 8, 2.2, 0, 2 * kPi);
    Fill(cr, color);
  } else {
    cairo_move_to(cr, 3, 13);
    cairo_line_to(cr, 13, 3);
    Stroke(cr, color, 1.2);
  }
}

void Stopwatch(cairo_t* cr, bool on, const Palette& p) {
  const Color color = on ? p.accent : p.foreground;
  cairo_arc(cr, 8, 9, 5, 0, 2 * kPi);
  if (on) {
    SetColor(cr, color, 0.35);
    cairo_fill_preserve(cr);
  }
  Stroke(cr, color, 1.2);
  cairo_rectangle(cr, 6.5, 1.5, 3, 1.5);
  Fill(cr, color);
  cairo_move_to(cr, 8, 3);
  cairo_line_to(cr, 8, 4);
  Stroke(cr, color, 1.2);
  cairo_move_to(cr, 8, 9);
  cairo_line_to(cr, 8, 5.8);
  cairo_move_to(cr, 8, 9);
  cairo_line_to(cr, 10.2, 10.3);
  Stroke(cr, color, 1.2);
}

void ResetArrow(cairo_t* cr, const Palette& p) {
  cairo_new_sub_path(cr);
  cairo_arc(cr, 8, 8.5, 4.8, -0.6 * kPi, 1.1 * kPi);
  Stroke(cr, p.foreground, 1.4);
  const double a = -0.6 * kPi;
  Arrowhead(cr, 8 + 4.8 * std::cos(a) + 0.6, 8.5 + 4.8 * std::sin(a), 4.2, 0.0, p.foreground);
}

void LoopArrows(cairo_t* cr, Color color) {
  RoundedRect(cr, 2.5, 4.5, 11, 7, 3);
  Stroke(cr, color, 1.3);
  Arrowhead(cr, 9.5, 4.5, 4, 0.0, color);
  Arrowhead(cr, 6.5, 11.5, 4, kPi, color);
}

void Eyedropper(cairo_t* cr, Color color) {
  cairo_move_to(cr, 3, 13);
  cairo_line_to(cr, 9.5, 6.5);
  Stroke(cr, color, 1.6);
  cairo_move_to(cr, 8, 5);
  cairo_line_to(cr, 11, 8);
  Stroke(cr, color, 2.2);
  cairo_arc(cr, 11.5, 4.5, 2.3, 0, 2 * kPi);
  Fill(cr, color);
}

void FadeCurves(cairo_t* cr, bool power, const Palette& p) {
  RoundedRect(cr, 1.5, 1.5, 29, 29, 3);
  Stroke(cr, p.dim, 1.0);
  if (power) {
    cairo_move_to(cr, 4, 6);
    cairo_curve_to(cr, 14, 6, 22, 14, 28, 27);
    Stroke(cr, p.foreground, 1.6);
    cairo_move_to(cr, 4, 27);
    cairo_curve_to(cr, 10, 14, 18, 6, 28, 6);
    Stroke(cr, p.accent, 1.6);
  } else {
    cairo_move_to(cr, 4, 6);
    cairo_line_to(cr, 28, 27);
    Stroke(cr, p.foreground, 1.6);
    cairo_move_to(cr, 4, 27);
    cairo_line_to(cr, 28, 6);
    Stroke(cr, p.accent, 1.6);
  }
}

void SamplePicture(cairo_t* cr, const char* letter, Color top, Color bottom) {
  cairo_pattern_t* gradient = cairo_pattern_create_linear(0, 0, 0, 120);
  cairo_pattern_add_color_stop_rgb(gradient, 0, top.r / 255.0, top.g / 255.0, top.b / 255.0);
  cairo_pattern_add_color_stop_rgb(gradient, 1, bottom.r / 255.0, bottom.g / 255.0,
                                   bottom.b / 255.0);
  cairo_rectangle(cr, 0, 0, 160, 120);
  cairo_set_source(cr, gradient);
  cairo_fill(cr);
  cairo_pattern_destroy(gradient);
  Text(cr, letter, 76, true, false, 80, 60, Color(255, 255, 255, 235));
}

double DirectionAngle(int direction) {
  // East, North, NorthEast, NorthWest, South, SouthEast, SouthWest, West (screen y points down).
  static constexpr double kAngles[8] = {0.0,     -kPi / 2, -kPi / 4,    -3 * kPi / 4,
                                        kPi / 2, kPi / 4,  3 * kPi / 4, kPi};
  return kAngles[direction];
}

}  // namespace

void PaintDecal(_cairo* cr, Decal decal) {
  const Palette p = Palette::Current();
  cairo_set_antialias(cr, CAIRO_ANTIALIAS_GRAY);
  if (decal >= kEffectControlsKeyLinearNormalDecal &&
      decal <= kEffectControlsKeyEaseOutLastSelectedDecal) {
    PaintKeyframeDecal(cr, decal - kEffectControlsKeyLinearNormalDecal, p);
    return;
  }
  if (decal >= kEffectControlsKeyTRDualControlPointNormalDecal &&
      decal <= kEffectControlsKeyTRDualHoldLeftSelectedDecal) {
    PaintTimeRemapDecal(cr, decal - kEffectControlsKeyTRDualControlPointNormalDecal, p);
    return;
  }
  if (decal >= kEffectControlsTransitionArrowEastDecal &&
      decal <= kEffectControlsTransitionArrowWestSelectedDecal) {
    const int offset = decal - kEffectControlsTransitionArrowEastDecal;
    const bool selected = offset % 2 == 1;
    Arrowhead(cr, 8, 8, 10, DirectionAngle(offset / 2), selected ? p.accent : p.dim);
    return;
  }
  switch (decal) {
    case kEffectControlsKeySumNormalDecal:
      PaintKeyframe(cr, Half::kDiamond, Half::kDiamond, true, true, p.dim, p.outline, false);
      break;
    case kChevronUpNormalDecal:
      Chevron(cr, -kPi / 2, p.foreground);
      break;
    case kChevronDownNormalDecal:
      Chevron(cr, kPi / 2, p.foreground);
      break;
    case kChevronLeftNormalDecal:
      Chevron(cr, kPi, p.foreground);
      break;
    case kChevronRightNormalDecal:
      Chevron(cr, 0.0, p.foreground);
      break;
    case kDisclosureTriangleClosedDecal:
      Arrowhead(cr, 8, 8, 8, 0.0, p.foreground);
      break;
    case kDisclosureTriangleOpenDecal:
      Arrowhead(cr, 8, 8, 8, kPi / 2, p.foreground);
      break;
    case kEffectControlsOnToggleNormalDecal:
      FxBadge(cr, true, p);
      break;
    case kEffectControlsOffToggleNormalDecal:
      FxBadge(cr, false, p);
      break;
    case kTLVideoMuteButtonNormalDecal:
      Eye(cr, true, p);
      break;
    case kTLVideoMuteOffButtonNormalDecal:
      Eye(cr, false, p);
      break;
    case kEffectControlsSetupNormalDecal:
    case kPlaybackSettingsSmallDecal:
      Gear(cr, 8, 8, 6, p.foreground);
      break;
    case kEffectControlsResetNormalDecal:
      ResetArrow(cr, p);
      break;
    case kEffectControlsPresetNormalDecal:
      for (double y : {4.5, 8.0, 11.5}) {
        cairo_move_to(cr, 2.5, y);
        cairo_line_to(cr, 9.5, y);
      }
      Stroke(cr, p.foreground, 1.3);
      Arrowhead(cr, 12.5, 8.5, 5, kPi / 2, p.foreground);
      break;
    case kDirectManipulationDecal:
      cairo_rectangle(cr, 3.5, 3.5, 9, 9);
      Stroke(cr, p.foreground, 1.0);
      for (double x : {2.0, 11.0}) {
        for (double y : {2.0, 11.0})
          cairo_rectangle(cr, x, y, 3, 3);
      }
      Fill(cr, p.foreground);
      break;
    case kStopwatchOffDecal:
      Stopwatch(cr, false, p);
      break;
    case kStopwatchOnDecal:
      Stopwatch(cr, true, p);
      break;
    case kKeyframeNavigatorPreviousDecal:
      Arrowhead(cr, 8, 8.5, 7, kPi, p.foreground);
      break;
    case kKeyframeNavigatorNextDecal:
      Arrowhead(cr, 8, 8.5, 7, 0.0, p.foreground);
      break;
    case kKeyframeNavigatorAddDecal:
      DiamondPath(cr, 4.5, 4.5);
      Stroke(cr, p.foreground, 1.2);
      break;
    case kKeyframeNavigatorRemoveDecal:
      DiamondPath(cr, 4.5, 4.5);
      SetColor(cr, p.accent);
      cairo_fill_preserve(cr);
      Stroke(cr, p.accent, 1.2);
      break;
    case kPlayNormalDecal:
    case kTrackerPlayDecal:
      Polygon(cr, {{4.5, 3}, {13, 8}, {4.5, 13}});
      Fill(cr, p.foreground);
      break;
    case kStopNormalDecal:
    case kTrackerStopDecal:
      cairo_rectangle(cr, 4, 4, 8, 8);
      Fill(cr, p.foreground);
      break;
    case kLoopNormalDecal:
      LoopArrows(cr, p.foreground);
      break;
    case kLoopOnDecal:
      LoopArrows(cr, p.accent);
      break;
    case kPanelMenuDecal:
      for (double y : {4.5, 8.0, 11.5}) {
        cairo_move_to(cr, 3, y);
        cairo_line_to(cr, 13, y);
      }
      Stroke(cr, p.foreground, 1.3);
      break;
    case kNoHeadMaterialDecal:
      Polygon(cr, {{0, 0}, {8, 0}, {0, 8}});
      Fill(cr, p.warning);
      break;
    case kNoTailMaterialDecal:
      Polygon(cr, {{0, 0}, {8, 0}, {8, 8}});
      Fill(cr, p.warning);
      break;
    case kTitlerEllipseNormalDecal:
      cairo_save(cr);
      cairo_translate(cr, 8, 8);
      cairo_scale(cr, 6, 4.5);
      cairo_arc(cr, 0, 0, 1, 0, 2 * kPi);
      cairo_restore(cr);
      Stroke(cr, p.foreground, 1.3);
      break;
    case kTitlerRectNormalDecal:
      cairo_rectangle(cr, 2.5, 3.5, 11, 9);
      Stroke(cr, p.foreground, 1.3);
      break;
    case kToolsPenDecal:
      Polygon(cr, {{8, 1.5}, {12, 8}, {10, 14}, {6, 14}, {4, 8}});
      Stroke(cr, p.foreground, 1.2);
      cairo_move_to(cr, 8, 1.5);
      cairo_line_to(cr, 8, 8);
      Stroke(cr, p.foreground, 1.0);
      cairo_arc(cr, 8, 8.5, 1.2, 0, 2 * kPi);
      Fill(cr, p.foreground);
      break;
    case kTrackerStepBackDecal:
      cairo_rectangle(cr, 3, 4, 1.8, 8);
      Fill(cr, p.foreground);
      Polygon(cr, {{13, 3.5}, {5.5, 8}, {13, 12.5}});
      Fill(cr, p.foreground);
      break;
    case kTrackerReverseDecal:
      Polygon(cr, {{11.5, 3}, {3, 8}, {11.5, 13}});
      Fill(cr, p.foreground);
      break;
    case kTrackerStepForwardDecal:
      cairo_rectangle(cr, 11.2, 4, 1.8, 8);
      Fill(cr, p.foreground);
      Polygon(cr, {{3, 3.5}, {10.5, 8}, {3, 12.5}});
      Fill(cr, p.foreground);
      break;
    case kUIFColorPickerOffDecal:
      Eyedropper(cr, p.foreground);
      break;
    case kUIFColorPickerOnDecal:
      Eyedropper(cr, p.accent);
      break;
    case kEffectControlsAudioTransitionConstantPowerDecal:
      FadeCurves(cr, true, p);
      break;
    case kEffectControlsAudioTransitionConstantGainDecal:
      FadeCurves(cr, false, p);
      break;
    case kEffectControlsSampleADecal:
      SamplePicture(cr, "A", Color(0x2f, 0x6d, 0xb5), Color(0x12, 0x2a, 0x4a));
      break;
    case kEffectControlsSampleBDecal:
      SamplePicture(cr, "B", Color(0xc0, 0x5a, 0x2a), Color(0x4a, 0x1c, 0x10));
      break;
    default:
      // Every decal has a case above; this keeps a missing one visible rather than blank.
      cairo_rectangle(cr, 0, 0, 16, 16);
      SetColor(cr, ColorManager::kFallbackColor);
      cairo_fill(cr);
      break;
  }
}
