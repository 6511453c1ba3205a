#include "Host/Toolkit/ViewHost.h"

#include <chrono>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/DataObject.h"
#include "Host/Toolkit/DragDrop.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/RepeatTimer.h"
#include "Host/Toolkit/ShortcutManager.h"
#include "Host/Toolkit/ViewBase.h"

namespace {

std::uint32_t ButtonBit(MouseButton button) {
  return 1u << static_cast<unsigned>(button);
}

std::shared_ptr<ViewBase> Lock(ViewBase* view) {
  return view != nullptr ? view->shared_from_this() : nullptr;
}

}  // namespace

ViewHost::ViewHost(Size size, double scale, Commander* superCommander)
    : Commander(superCommander), mSize(size), mScale(scale), mImage(size, scale) {}

ViewHost::~ViewHost() {
  HideToolTip();
  if (mDrag != nullptr) {
    const std::unique_ptr<DragDrop> drag = std::move(mDrag);
    drag->Cancel();
  }
  if (mRoot != nullptr) {
    mRoot->mHost = nullptr;
    if (mRoot->GetSuperCommander() == this) {
      mRoot->SetSuperCommander(nullptr);
    }
  }
}

void ViewHost::SetRootView(std::shared_ptr<ViewBase> root) {
  if (root == mRoot) {
    return;
  }
  if (root != nullptr) {
    if (!HOST_VERIFY(root->GetParent() == nullptr, "The root view must not have a parent")) {
      return;
    }
    if (root->mHost != nullptr) {
      root->mHost->SetRootView(nullptr);
    }
  }
  if (const std::shared_ptr<ViewBase> old = mRoot) {
    ForgetViewsIn(*old);
    mRoot.reset();
    old->mHost = nullptr;
    if (old->GetSuperCommander() == this) {
      old->SetSuperCommander(nullptr);
    }
  }
  mRoot = std::move(root);
  if (mRoot != nullptr) {
    mRoot->mHost = this;
    if (mRoot->GetSuperCommander() == nullptr) {
      mRoot->SetSuperCommander(this);
    }
    mRoot->SetBounds(Rect::FromSize(0, 0, mSize.width, mSize.height));
    mRoot->FinishCreate();
  }
  InvalidateAll();
}

void ViewHost::Resize(Size size) {
  mSize = size;
  mImage = Image(size, mScale);
  if (mRoot != nullptr) {
    mRoot->SetBounds(Rect::FromSize(0, 0, size.width, size.height));
  }
  InvalidateAll();
}

// --- Pointer state ---

std::shared_ptr<ViewBase> ViewHost::CapturedView() const {
  std::shared_ptr<ViewBase> view = mCapture.lock();
  if (view != nullptr && (view->GetHost() != this || !view->IsShown())) {
    return nullptr;
  }
  return view;
}

ViewBase* ViewHost::GetCaptureView() const {
  return CapturedView().get();
}

ViewBase* ViewHost::GetViewAt(Point point) const {
  return mRoot != nullptr ? mRoot->FindViewAt(mRoot->ParentToLocal(point)) : nullptr;
}

std::shared_ptr<ViewBase> ViewHost::HitView(Point point) const {
  return Lock(GetViewAt(point));
}

std::shared_ptr<ViewBase> ViewHost::MouseTarget(Point point) const {
  if (std::shared_ptr<ViewBase> captured = CapturedView()) {
    return captured;
  }
  return HitView(point);
}

void ViewHost::SetCapture(ViewBase& view) {
  std::shared_ptr<ViewBase> previous = mCapture.lock();
  mCapture = view.weak_from_this();
  if (previous != nullptr && previous.get() != &view) {
    NotifyCaptureLost(previous);
  }
}

void ViewHost::TakeCaptureAway() {
  std::shared_ptr<ViewBase> previous = mCapture.lock();
  mCapture.reset();
  NotifyCaptureLost(previous);
}

void ViewHost::NotifyCaptureLost(const std::shared_ptr<ViewBase>& view) {
  // A view being torn down has nothing left to roll back.
  if (view != nullptr && !view->mDestroying) {
    view->MouseCaptureLostSelf();
  }
}

void ViewHost::ReleaseCapture(ViewBase& view) {
  if (mCapture.lock().get() == &view) {
    mCapture.reset();
  }
}

void ViewHost::ForgetViewsIn(ViewBase& branch) {
  if (const std::shared_ptr<ViewBase> captured = mCapture.lock();
      captured != nullptr && branch.Contains(*captured)) {
    TakeCaptureAway();
  }
  if (const std::shared_ptr<ViewBase> hovered = mHover.lock();
      hovered != nullptr && branch.Contains(*hovered)) {
    mHover.reset();
  }
  if (const std::shared_ptr<ViewBase> tipView = mToolTipView.lock();
      tipView != nullptr && branch.Contains(*tipView)) {
    HideToolTip();
  }
  if (mDrag != nullptr) {
    if (ViewBase* target = mDrag->GetCurrentTarget();
        target != nullptr && branch.Contains(*target)) {
      // The target goes away under the drag: it hears it leave, the drag looks again.
      if (mMousePoint) {
        mDrag->Move(*mMousePoint, GetAsyncKeyModifiers());
      }
    }
  }
}

void ViewHost::NoteInput(Point point, KeyModifiers modifiers) {
  mMousePoint = point;
  SetAsyncKeyModifiers(modifiers);
}

void ViewHost::HideToolTip() {
  if (mToolTipTimer != 0) {
    RepeatTimer::Instance().Cancel(mToolTipTimer);
    mToolTipTimer = 0;
  }
  mToolTipView.reset();
  mToolTipText.clear();
  // Taking the tip's view out of the tree may come back here.
  const std::unique_ptr<PersistentToolTip> tip = std::move(mToolTip);
}

void ViewHost::UpdateToolTip(const std::shared_ptr<ViewBase>& view, Point point) {
  ViewBase* owner = view.get();
  std::string text;
  for (; owner != nullptr; owner = owner->GetParent()) {
    text = owner->GetToolTipSelf(owner->WindowToLocal(point));
    if (!text.empty()) {
      break;
    }
  }
  if (owner != nullptr && owner == mToolTipView.lock().get() && text == mToolTipText) {
    return;  // the same tip, shown or on its way
  }
  HideToolTip();
  if (owner == nullptr) {
    return;
  }
  mToolTipView = owner->shared_from_this();
  mToolTipText = text;
  mToolTipTimer = RepeatTimer::Instance().Schedule(
      std::chrono::milliseconds(kToolTipDelayMilliseconds), [this] {
        mToolTipTimer = 0;
        const std::shared_ptr<ViewBase> tipView = mToolTipView.lock();
        if (tipView == nullptr || !tipView->IsShown() || !mMousePoint || mButtonsDown != 0) {
          return;
        }
        mToolTip = std::make_unique<PersistentToolTip>(*tipView, mToolTipText, *mMousePoint);
      });
}

void ViewHost::UpdateHover(const std::shared_ptr<ViewBase>& view) {
  const std::shared_ptr<ViewBase> old = mHover.lock();
  if (old == view) {
    return;
  }
  mHover = view;
  if (old != nullptr) {
    old->MouseLeaveSelf();
  }
}

void ViewHost::UpdateCursor(const std::shared_ptr<ViewBase>& view, Point point,
                            KeyModifiers modifiers) {
  for (std::shared_ptr<ViewBase> candidate = view; candidate != nullptr;
       candidate = Lock(candidate->GetParent())) {
    if (candidate->IsEnabledInTree() &&
        candidate->SetCursorSelf(candidate->WindowToLocal(point), modifiers)) {
      return;
    }
  }
  SetCurrentCursor(Cursor::kOSArrow);
}

void ViewHost::FocusOnClick(ViewBase& view) {
  for (ViewBase* candidate = &view; candidate != nullptr; candidate = candidate->GetParent()) {
    if (candidate->TakesFocusOnClick()) {
      if (!candidate->IsOnDuty()) {
        candidate->BecomeTarget();
      }
      return;
    }
  }
}

// --- Input ---

void ViewHost::MouseDown(MouseButton button, Point point, KeyModifiers modifiers, int clickCount) {
  NoteInput(point, modifiers);
  mButtonsDown |= ButtonBit(button);
  HideToolTip();
  if (mDrag != nullptr || button == MouseButton::kMiddle) {
    return;
  }
  std::shared_ptr<ViewBase> view = CapturedView();
  if (view == nullptr) {
    view = HitView(point);
    UpdateHover(view);
  }
  if (view == nullptr || !view->IsEnabledInTree()) {
    return;
  }
  FocusOnClick(*view);
  const Point local = view->WindowToLocal(point);
  if (button == MouseButton::kRight) {
    view->RightButtonDownSelf(local, modifiers);
  } else if (clickCount > 1) {
    view->LeftButtonMultiClickSelf(local, modifiers, clickCount);
  } else {
    view->LeftButtonDownSelf(local, modifiers);
  }
}

void ViewHost::MouseUp(MouseButton button, Point point, KeyModifiers modifiers) {
  NoteInput(point, modifiers);
  mButtonsDown &= ~ButtonBit(button);
  if (mDrag != nullptr) {
    if (button == MouseButton::kLeft) {
      FinishDrag(point, modifiers);
    }
    return;
  }
  if (button == MouseButton::kMiddle) {
    return;
  }
  const std::shared_ptr<ViewBase> view = MouseTarget(point);
  if (view != nullptr && view->IsEnabledInTree()) {
    const Point local = view->WindowToLocal(point);
    if (button == MouseButton::kRight) {
      view->RightButtonUpSelf(local, modifiers);
    } else {
      view->LeftButtonUpSelf(local, modifiers);
    }
  }
  if (CapturedView() == nullptr) {
    const std::shared_ptr<ViewBase> hit = HitView(point);
    UpdateHover(hit);
    UpdateCursor(hit, point, modifiers);
  }
}

void ViewHost::MouseMove(Point point, KeyModifiers modifiers) {
  NoteInput(point, modifiers);
  if (mDrag != nullptr) {
    mDrag->Move(point, modifiers);
    return;
  }
  std::shared_ptr<ViewBase> view = CapturedView();
  if (view == nullptr) {
    view = HitView(point);
    UpdateHover(view);
    UpdateCursor(view, point, modifiers);
    if (mButtonsDown == 0) {
      UpdateToolTip(view, point);
    }
  }
  if (view != nullptr && view->IsEnabledInTree()) {
    view->MouseMoveSelf(view->WindowToLocal(point), modifiers);
  }
}

void ViewHost::MouseExit() {
  mMousePoint.reset();
  HideToolTip();
  if (mDrag != nullptr) {
    if (ViewBase* target = mDrag->GetCurrentTarget()) {
      // Outside the window nothing is under the pointer.
      const std::shared_ptr<ViewBase> alive = Lock(target);
      mDrag->Move(Point{-1, -1}, GetAsyncKeyModifiers());
    }
    return;
  }
  if (CapturedView() == nullptr) {
    UpdateHover(nullptr);
  }
}

namespace {

// Offers a wheel or gesture event to `view` and its parents, each in its own coordinates.
template <class Event, class Hook>
bool Bubble(std::shared_ptr<ViewBase> view, const Event& windowEvent, Hook hook) {
  for (; view != nullptr; view = Lock(view->GetParent())) {
    if (!view->IsEnabledInTree()) {
      continue;
    }
    Event local = windowEvent;
    local.point = view->WindowToLocal(windowEvent.point);
    if (((*view).*hook)(local)) {
      return true;
    }
  }
  return false;
}

}  // namespace

bool ViewHost::MouseWheel(const WheelEvent& event) {
  NoteInput(event.point, event.modifiers);
  return mDrag == nullptr && Bubble(HitView(event.point), event, &ViewBase::MouseWheelSelf);
}

bool ViewHost::MouseMagnify(const MagnifyEvent& event) {
  NoteInput(event.point, event.modifiers);
  return mDrag == nullptr && Bubble(HitView(event.point), event, &ViewBase::MouseMagnifySelf);
}

bool ViewHost::MousePan(const PanEvent& event) {
  NoteInput(event.point, event.modifiers);
  return mDrag == nullptr && Bubble(HitView(event.point), event, &ViewBase::MousePanSelf);
}

bool ViewHost::KeyDown(const KeyEvent& event) {
  SetAsyncKeyModifiers(event.modifiers);
  if (mDrag != nullptr) {
    if (event.key == KeyCode::kEscape) {
      CancelDrag();
    }
    return true;  // the drag owns the keyboard while it runs
  }
  if (GetTarget().ProcessKeyDown(event)) {
    return true;
  }
  const ShortcutManager& shortcuts = GetShortcutManager();
  const std::optional<CommandID> command =
      shortcuts.FindCommandForKey(KeyStroke(event.key, event.modifiers));
  if (!command) {
    return false;
  }
  if (event.isRepeat && shortcuts.AreKeyRepeatsDisabled(*command)) {
    return true;
  }
  // A command its handler reports disabled is not sent; one nobody reports on is tried.
  CommandStatus status;
  if (GetTarget().ProcessCommandStatus(*command, status) && !status.enabled) {
    return true;
  }
  GetTarget().ProcessCommand(*command);
  return true;
}

bool ViewHost::TextInput(std::string_view utf8) {
  if (mDrag != nullptr || utf8.empty()) {
    return false;
  }
  return GetTarget().ProcessTextInput(utf8);
}

void ViewHost::ModifiersChanged(KeyModifiers modifiers) {
  SetAsyncKeyModifiers(modifiers);
  if (mDrag != nullptr) {
    if (mMousePoint) {
      mDrag->Move(*mMousePoint, modifiers);
    }
    return;
  }
  if (mMousePoint && CapturedView() == nullptr) {
    UpdateCursor(HitView(*mMousePoint), *mMousePoint, modifiers);
  }
}

bool ViewHost::DoCommand(CommandID command) {
  return GetTarget().ProcessCommand(command);
}

CommandStatus ViewHost::GetCommandStatus(CommandID command) {
  CommandStatus status;
  GetTarget().ProcessCommandStatus(command, status);
  return status;
}

ShortcutManager& ViewHost::GetShortcutManager() const {
  return mShortcuts != nullptr ? *mShortcuts : ShortcutManager::Instance();
}

// --- Painting ---

void ViewHost::InvalidateAll() {
  InvalidateWindowRect(Rect::FromSize(0, 0, mSize.width, mSize.height));
}

void ViewHost::InvalidateWindowRect(const Rect& rect) {
  mDirty.Add(rect.Intersect(Rect::FromSize(0, 0, mSize.width, mSize.height)));
}

void ViewHost::SetBackgroundColor(Color color) {
  if (color != mBackground) {
    mBackground = color;
    InvalidateAll();
  }
}

Region ViewHost::Render() {
  if (mRendering) {
    return {};
  }
  Region painted = std::move(mDirty);
  mDirty.Clear();
  if (painted.IsEmpty() || mImage.IsEmpty()) {
    return painted;
  }
  mRendering = true;
  const std::shared_ptr<ViewBase> root = mRoot;
  {
    DC dc(mImage);
    for (const Rect& rect : painted.Rects()) {
      DC::ScopedClip clip(dc, rect);
      dc.ClearRect(rect, mBackground);
      if (root != nullptr) {
        root->PaintTree(dc);
      }
    }
  }
  mRendering = false;
  if (mPresenter) {
    mPresenter(mImage, painted);
  }
  return painted;
}

// --- Drag and drop ---

bool ViewHost::StartDrag(std::shared_ptr<const DataObject> data, DropEffect allowedEffects,
                         std::weak_ptr<ViewBase> source,
                         std::function<void(DropEffect)> onFinished) {
  if (!HOST_VERIFY(data != nullptr, "Invalid drag data") ||
      !HOST_VERIFY(mDrag == nullptr, "A drag is already running")) {
    return false;
  }
  TakeCaptureAway();
  mDrag = std::make_unique<DragDrop>(*this, std::move(data), allowedEffects, std::move(source),
                                     std::move(onFinished));
  if (mMousePoint) {
    mDrag->Move(*mMousePoint, GetAsyncKeyModifiers());
  }
  return true;
}

void ViewHost::FinishDrag(Point point, KeyModifiers modifiers) {
  // Out of the member first, so that the drop's hooks may start the next drag.
  const std::unique_ptr<DragDrop> drag = std::move(mDrag);
  drag->Drop(point, modifiers);
}

void ViewHost::CancelDrag() {
  if (mDrag != nullptr) {
    const std::unique_ptr<DragDrop> drag = std::move(mDrag);
    drag->Cancel();
  }
}
