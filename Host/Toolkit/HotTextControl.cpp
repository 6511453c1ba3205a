#include "Host/Toolkit/HotTextControl.h"

#include <algorithm>
#include <cstdlib>
#include <memory>

#include "Host/Messaging/MessageLoop.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"

HotTextControl::HotTextControl(std::string_view stationBase, Commander* commander)
    : SubView(commander), mStation(stationBase) {}

HotTextControl::~HotTextControl() = default;

void HotTextControl::SetHorizontalTextAlignment(int alignment) {
  mAlignment = alignment;
  Invalidate();
}

int HotTextControl::GetHorizontalTextAlignment() const {
  return mAlignment;
}

void HotTextControl::SetFont(Font font) {
  mFont = font;
  Invalidate();
}

TextAlign HotTextControl::Alignment() const {
  switch (mAlignment) {
    case 0:
      return TextAlign::kLeft;
    case 2:
      return TextAlign::kRight;
    default:
      return TextAlign::kCenter;
  }
}

Rect HotTextControl::TextRect() const {
  return GetLocalBounds();
}

double HotTextControl::FactorFor(KeyModifiers modifiers) {
  if (IsShiftDown(modifiers)) {
    return kCoarseFactor;
  }
  if (IsCtrlDown(modifiers)) {
    return kFineFactor;
  }
  return 1.0;
}

bool HotTextControl::BeginEditing() {
  if (!IsEnabledInTree() || !IsVisible()) {
    return false;
  }
  if (!mEditing) {
    mEditing = true;
    mEdit.Reset(InitialEditTextSelf());
  }
  if (!IsTarget()) {
    BecomeTarget();
  }
  Invalidate();
  return true;
}

bool HotTextControl::CommitEditing() {
  if (!mEditing) {
    return false;
  }
  mEditing = false;
  Invalidate();
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  return CommitTextSelf(mEdit.GetText());
}

void HotTextControl::CancelEditing() {
  if (mEditing) {
    mEditing = false;
    Invalidate();
  }
}

void HotTextControl::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (mEditing) {
    const Rect rect = TextRect();
    mEdit.SetCaretFromX(point.x - mEdit.TextLeft(rect, mFont, Alignment()), mFont,
                        IsShiftDown(modifiers));
    Invalidate();
    return;
  }
  mPressed = true;
  mScrubbing = false;
  mPressPoint = point;
  mLastX = point.x;
  mUnits = 0.0;
  CaptureMouse();
}

void HotTextControl::LeftButtonMultiClickSelf(Point point, KeyModifiers modifiers, int clickCount) {
  if (mEditing) {
    mEdit.SelectAll();
    Invalidate();
    return;
  }
  SubView::LeftButtonMultiClickSelf(point, modifiers, clickCount);
}

void HotTextControl::MouseMoveSelf(Point point, KeyModifiers modifiers) {
  if (!mPressed) {
    return;
  }
  if (!mScrubbing) {
    if (std::abs(point.x - mPressPoint.x) < kDragThreshold) {
      return;
    }
    mScrubbing = true;
    mLastX = mPressPoint.x;
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    BeginScrubSelf();
  }
  // Each stretch of the move counts with the modifiers held for it.
  mUnits += (point.x - mLastX) * FactorFor(modifiers);
  mLastX = point.x;
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  ScrubSelf(mUnits);
}

void HotTextControl::LeftButtonUpSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!mPressed) {
    return;
  }
  mPressed = false;
  ReleaseMouse();
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (mScrubbing) {
    mScrubbing = false;
    EndScrubSelf();
  } else if (GetLocalBounds().Contains(point)) {
    BeginEditing();
  }
}

bool HotTextControl::SetCursorSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  SetCurrentCursor(mEditing ? Cursor::kIBeam : Cursor::kSplitterHorizontal);
  return true;
}

bool HotTextControl::KeyDownSelf(const KeyEvent& event) {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (mEditing) {
    switch (event.key) {
      case KeyCode::kReturn:
        CommitEditing();
        return true;
      case KeyCode::kTab:
        CommitEditing();
        return false;  // on to whoever moves the focus
      case KeyCode::kEscape:
        CancelEditing();
        return true;
      default:
        break;
    }
    if (mEdit.HandleKey(event)) {
      Invalidate();
      return true;
    }
    // Typing swallows plain keys so they do not act as shortcuts while the text is edited.
    return (event.modifiers & (kKeyModifierCtrl | kKeyModifierAlt)) == 0;
  }
  switch (event.key) {
    case KeyCode::kUp:
      StepSelf(IsShiftDown(event.modifiers) ? kCoarseFactor : 1.0);
      return true;
    case KeyCode::kDown:
      StepSelf(IsShiftDown(event.modifiers) ? -kCoarseFactor : -1.0);
      return true;
    case KeyCode::kReturn:
      BeginEditing();
      return true;
    default:
      return SubView::KeyDownSelf(event);
  }
}

bool HotTextControl::TextInputSelf(std::string_view utf8) {
  if (!mEditing) {
    if (!BeginEditing()) {
      return false;
    }
  }
  mEdit.Insert(utf8);
  Invalidate();
  return true;
}

void HotTextControl::NowOffDuty() {
  if (!mEditing) {
    return;
  }
  // Applied on the next idle turn: a duty hook must not set off model changes that may
  // destroy views of the commander chain being switched.
  std::weak_ptr<ViewBase> weak = weak_from_this();
  MessageLoop::Instance().AddIdleTask([weak] {
    const std::shared_ptr<ViewBase> view = weak.lock();
    auto* control = static_cast<HotTextControl*>(view.get());
    if (control != nullptr && control->mEditing && !control->IsDestroyed() &&
        !control->IsOnDuty()) {
      control->CommitEditing();
    }
  });
}

void HotTextControl::HideSelf() {
  mPressed = false;
  mScrubbing = false;
}

void HotTextControl::CommitPendingInput() {
  if (mEditing) {
    CommitEditing();
  }
}

void HotTextControl::DestroySelf() {
  CommitPendingInput();
  mEditing = false;
  mPressed = false;
  mScrubbing = false;
}

void HotTextControl::PaintSelf(DC& dc) {
  const Rect rect = TextRect();
  if (mEditing && IsEnabledInTree()) {
    mEdit.Paint(dc, rect, mFont, Alignment());
    return;
  }
  const bool enabled = IsEnabledInTree();
  const Color color = ColorManager::GetColor(enabled ? kColor_HotText : kColor_ControlTextDisabled);
  const std::string text = GetDisplayText();
  const int width = mFont.StringWidth(text, rect.Width());
  int left = rect.left;
  if (Alignment() == TextAlign::kCenter) {
    left = rect.left + (rect.Width() - width) / 2;
  } else if (Alignment() == TextAlign::kRight) {
    left = rect.right - width;
  }
  const int top = rect.top + (rect.Height() - mFont.GetHeight()) / 2;
  dc.DrawText(text, Rect{left, top, left + width, top + mFont.GetHeight()}, mFont, color);
  if (enabled) {
    // A dotted underline marks the text as something to drag.
    const int y = std::min(rect.bottom - 1, top + mFont.GetHeight());
    for (int x = left; x < left + width; x += 2) {
      dc.FillRect(Rect{x, y, x + 1, y + 1}, color);
    }
  }
}
