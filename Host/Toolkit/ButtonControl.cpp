#include "Host/Toolkit/ButtonControl.h"

#include <chrono>

#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"

ButtonControl::ButtonControl(CommandID command, Commander* commander)
    : SubView(commander), mCommand(command) {
  SetTakesFocusOnClick(true);
}

ButtonControl::~ButtonControl() {
  if (mToolTipTimer != 0) {
    RepeatTimer::Instance().Cancel(mToolTipTimer);
  }
}

void ButtonControl::SetToolTip(std::string text) {
  mToolTip = std::move(text);
  if (mToolTip.empty()) {
    HideToolTip();
  } else if (mShownToolTip != nullptr) {
    mShownToolTip->SetText(mToolTip);
  }
}

bool ButtonControl::Click(KeyModifiers modifiers) {
  if (!IsEnabledInTree() || !IsVisible()) {
    return false;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  HideToolTip();
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
  HideToolTip();
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
  if (inside) {
    ScheduleToolTip();
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
  HideToolTip();
  if (mHovered) {
    mHovered = false;
    Invalidate();
  }
}

void ButtonControl::HideSelf() {
  mTracking = false;
  mHovered = false;
  HideToolTip();
}

void ButtonControl::DestroySelf() {
  mTracking = false;
  HideToolTip();
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

void ButtonControl::ScheduleToolTip() {
  if (mToolTip.empty() || mShownToolTip != nullptr || mToolTipTimer != 0 || GetHost() == nullptr) {
    return;
  }
  std::weak_ptr<ViewBase> weak = weak_from_this();
  mToolTipTimer = RepeatTimer::Instance().Schedule(
      std::chrono::milliseconds(kToolTipDelayMilliseconds), [weak] {
        const std::shared_ptr<ViewBase> view = weak.lock();
        auto* button = static_cast<ButtonControl*>(view.get());
        if (button == nullptr) {
          return;
        }
        button->mToolTipTimer = 0;
        const std::optional<Point> mouse = button->GetMouseLocation();
        if (!button->mHovered || button->mTracking || !mouse || !button->IsShown() ||
            !button->GetLocalBounds().Contains(*mouse)) {
          return;
        }
        button->mShownToolTip = std::make_unique<PersistentToolTip>(*button, button->mToolTip,
                                                                    button->LocalToWindow(*mouse));
      });
}

void ButtonControl::HideToolTip() {
  if (mToolTipTimer != 0) {
    RepeatTimer::Instance().Cancel(mToolTipTimer);
    mToolTipTimer = 0;
  }
  mShownToolTip.reset();
}
