#include "Handlers/EffectControls/Src/GroupButtonsBeginParameter.h"

#include <vector>

#include "Handlers/EffectControls/Src/ButtonParameter.h"

GroupButtonsBeginParameter::GroupButtonsBeginParameter(const ParameterControlInfo& info)
    : GroupBeginParameter(info) {}

int GroupButtonsBeginParameter::LayOut(int top, int depth, int width, Pass pass) const {
  const int firstLeft = (GetGroupLevel() + 1) * GetIndentPerGroupLevel() + kGap;
  int lineHeight = 0;
  int lineTop = top;
  int left = firstLeft;
  bool lineEmpty = true;
  std::vector<EffectItem*> others;
  for (const auto& child : GetItems()) {
    if (child->IsSetAside()) {
      continue;
    }
    auto* button = dynamic_cast<ButtonParameter*>(child.get());
    if (button == nullptr) {
      others.push_back(child.get());
      continue;
    }
    if (lineHeight == 0) {
      lineHeight = button->Height();
    }
    const int buttonWidth = button->GetPreferredButtonWidth();
    if (!lineEmpty && left + buttonWidth > width) {
      lineTop += lineHeight;
      left = firstLeft;
    }
    if (pass == Pass::kPlace) {
      button->PositionInLine(lineTop, depth, width, left);
    }
    left += buttonWidth + kGap;
    lineEmpty = false;
  }
  int y = lineEmpty ? top : lineTop + lineHeight;
  for (EffectItem* other : others) {
    if (pass == Pass::kPlace) {
      other->PositionSelf(y, depth, width);
    }
    y += other->Height();
  }
  return y - top;
}

int GroupButtonsBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return LayOut(0, GetDepth() + 1, GetWidth(), Pass::kMeasure);
}

void GroupButtonsBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupBeginParameter::PositionSelf(top, depth, width);
  if (IsExpanded()) {
    LayOut(top, depth + 1, width, Pass::kPlace);
  }
}

void GroupButtonsBeginParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font,
                                           Color color) const {
  if (!IsExpanded()) {
    GroupBeginParameter::DrawTitle(dc, rect, font, color);
  }
}
