#pragma once

#include "Host/Rows/GroupBeginParameter.h"

// A row of buttons: the group's button children side by side on lines. While expanded the first
// starts at x = (group level + 1) x the indent per level + 5, each next one 5 pixels after the
// previous one's preferred width, and a button that would pass the row's width starts a new
// line. A line is as high as the first button's row; the group is as high as its lines (0
// without children), the buttons standing in for its name. Children that are not buttons are
// stacked under the lines.
class GroupButtonsBeginParameter : public GroupBeginParameter {
 public:
  static constexpr int kGap = 5;

  explicit GroupButtonsBeginParameter(const ParameterControlInfo& info);

  bool IsGenericGroup() const override { return false; }
  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

 private:
  enum class Pass { kMeasure, kPlace };
  // The height the children take across `width`; kPlace also puts them there from `top`.
  int LayOut(int top, int depth, int width, Pass pass) const;
};
