#include "Host/Toolkit/CheckBoxControl.h"

#include <array>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"

CheckBoxControl::CheckBoxControl(const Rect& bounds, std::int32_t id, std::string label,
                                 bool checked, Commander* commander)
    : ButtonControl(kNoCommand, commander),
      mID(id),
      mLabel(LocalizeString(label)),
      mChecked(checked) {
  SetBounds(bounds);
}

void CheckBoxControl::SetChecked(bool checked) {
  if (checked != mChecked) {
    mChecked = checked;
    Invalidate();
  }
}

void CheckBoxControl::SetLabel(std::string label) {
  mLabel = LocalizeString(label);
  Invalidate();
}

bool CheckBoxControl::ClickSelf(KeyModifiers /*modifiers*/) {
  mChecked = !mChecked;
  Invalidate();
  mStation.Broadcast(CheckBoxControlChangedMessage(mID, mChecked));
  if (GetCommand() != kNoCommand) {
    SendCommand();
  }
  return true;
}

void CheckBoxControl::PaintSelf(DC& dc) {
  const Rect bounds = GetLocalBounds();
  const bool enabled = IsEnabledInTree();
  const Rect box = Rect::FromSize(0, (bounds.Height() - kBoxSize) / 2, kBoxSize, kBoxSize);
  dc.FillRect(
      box, ColorManager::GetColor(IsPressed() ? kColor_ButtonFacePressed : kColor_EditBackground));
  dc.FrameRect(
      box, ColorManager::GetColor(IsHovered() && enabled ? kColor_Focus : kColor_ControlBorder));
  const Color ink =
      ColorManager::GetColor(enabled ? kColor_ControlText : kColor_ControlTextDisabled);
  if (mChecked) {
    const std::array<Point, 3> tick{Point{box.left + 3, box.top + 6},
                                    Point{box.left + 5, box.top + 9},
                                    Point{box.left + 10, box.top + 3}};
    dc.Polyline(tick, ink, 2.0);
  }
  if (!mLabel.empty()) {
    const Rect text{box.right + 5, bounds.top, bounds.right, bounds.bottom};
    dc.DrawText(mLabel, text, Font(kFont_Normal), ink, TextAlign::kLeft, TextVAlign::kCenter);
  }
}
