#include "Handlers/EffectControls/Src/ButtonParameter.h"

#include <algorithm>

#include "Host/Model/ComponentParam.h"
#include "Host/Toolkit/TextButton.h"

ButtonParameter::ButtonParameter(const ParameterControlInfo& info) : ParameterControl(info) {}

int ButtonParameter::OwnHeight() const {
  return IsInGroup() ? kGroupRowHeight : kRowHeight;
}

void ButtonParameter::PositionSelf(int top, int depth, int width) {
  mInLine = false;
  ParameterControl::PositionSelf(top, depth, width);
  PlaceButton(GetParameterIndentInPixels() + width / 2 - 20, width);
}

void ButtonParameter::PositionInLine(int top, int depth, int width, int left) {
  ParameterControl::PositionSelf(top, depth, width);
  mInLine = true;
  PlaceButton(left, width);
}

int ButtonParameter::GetPreferredButtonWidth() const {
  const int label = mButton ? mButton->GetLabelWidth() : 0;
  return std::max(label + kLabelPadding, IsInGroup() ? kGroupMinimumWidth : kMinimumWidth);
}

void ButtonParameter::PlaceButton(int left, int width) {
  if (!mButton) {
    return;
  }
  const int buttonWidth = std::max(std::min(width - left, GetPreferredButtonWidth()), 0);
  PlaceView(*mButton, Rect::FromSize(left, GetTop() + 2, buttonWidth,
                                     IsInGroup() ? kGroupButtonHeight : kButtonHeight));
}

void ButtonParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const {
  if (!mInLine) {
    ParameterControl::DrawTitle(dc, rect, font, color);
  }
}

void ButtonParameter::GetKeyframeTimes(std::set<TickTime>& /*times*/, TimeLine /*line*/) const {}

void ButtonParameter::RefreshDisplayName() {
  ParameterControl::RefreshDisplayName();
  if (mButton && GetParam()) {
    mButton->SetLabel(GetParam()->GetCheckboxDisplayName());
  }
}

bool ButtonParameter::ObeyCommand(CommandID command) {
  if (command != kButtonCommand) {
    return ParameterControl::ObeyCommand(command);
  }
  OnClick();
  return true;
}

bool ButtonParameter::CanClick() const {
  return IsParamEnabled() && !IsReadOnly();
}

void ButtonParameter::OnClick() {
  // Refused clicks end here: no edit is opened, so nothing is committed.
  if (!CanClick()) {
    return;
  }
  ApplyValue(true);
  RefreshDisplayName();
}

void ButtonParameter::CreateControlsSelf() {
  const std::string label = GetParam() ? GetParam()->GetCheckboxDisplayName() : std::string();
  mButton = AdoptControl(std::make_shared<TextButton>(Rect::FromSize(0, -132, 100, 32), label,
                                                      kButtonCommand, this, Font(kFont_Normal)));
}

void ButtonParameter::DestroyControlsSelf() {
  DestroyControl(mButton);
}

void ButtonParameter::ShowControls(bool show) {
  ParameterControl::ShowControls(show);
  if (mButton) {
    mButton->SetVisible(show);
  }
}

void ButtonParameter::UpdateControlsEnabled(bool enabled) {
  if (mButton) {
    mButton->SetEnabled(enabled);
  }
}
