#include "Host/Toolkit/ButtonControl.h"

#include <chrono>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"

ButtonControl::ButtonControl(CommandID command, Commander* commander)
    : SubView(commander), mCommand(command) {
  SetTakesFocusOnClick(true);
}

ButtonControl::~ButtonControl() = default;

bool ButtonControl::Click(KeyModifiers modifiers) {
  if (!IsEnabledInTree() || !IsVisible()) {
    return false;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  return ClickSelf(modifiers);
}

bool ButtonControl::ClickSelf(KeyModifiers /*modifiers*/) {
  return SendCommand();
}

bool ButtonControl::SendCommand() {
  if (mCommand == kNoCommand) {
    return false;
  }
  return ProcessCommand(mCommand);
}

void ButtonControl::LeftButtonDownSelf(Point point, KeyModifiers /*modifiers*/) {
  mTracking = true;
  mInside = GetLocalBounds().Contains(point);
  CaptureMouse();
  Invalidate();
}

void ButtonControl::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  const bool inside = GetLocalBounds().Contains(point);
  if (mTracking) {
    if (inside != mInside) {
      mInside = inside;
      Invalidate();
    }
    return;
  }
  if (inside && !mHovered) {
    mHovered = true;
    Invalidate();
  }
}

void ButtonControl::LeftButtonUpSelf(Point point, KeyModifiers modifiers) {
  if (!mTracking) {
    return;
  }
  mTracking = false;
  ReleaseMouse();
  const bool inside = GetLocalBounds().Contains(point);
  mInside = false;
  Invalidate();
  if (inside) {
    Click(modifiers);
  }
}

void ButtonControl::MouseLeaveSelf() {
  if (mHovered) {
    mHovered = false;
    Invalidate();
  }
}

void ButtonControl::HideSelf() {
  mTracking = false;
  mHovered = false;
}

void ButtonControl::DestroySelf() {
  mTracking = false;
}

bool ButtonControl::KeyDownSelf(const KeyEvent& event) {
  if ((event.key == KeyCode::kSpace || event.key == KeyCode::kReturn) && !event.isRepeat) {
    Click(event.modifiers);
    return true;
  }
  return SubView::KeyDownSelf(event);
}

void ButtonControl::PaintFace(DC& dc, const Rect& rect, bool framed) const {
  const bool enabled = IsEnabledInTree();
  std::string_view face = kColor_ButtonFace;
  if (enabled && IsPressed()) {
    face = kColor_ButtonFacePressed;
  } else if (enabled && (mHovered || (mTracking && !mInside))) {
    face = kColor_ButtonFaceHover;
  }
  dc.FillRect(rect, ColorManager::GetColor(face));
  if (framed) {
    dc.FrameRect(rect, ColorManager::GetColor(kColor_ControlBorder));
  }
}
