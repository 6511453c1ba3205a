#include "Host/Toolkit/ViewBase.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/Image.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ViewHost.h"

ViewBase::ViewBase(Commander* superCommander) : Commander(superCommander) {}

ViewBase::~ViewBase() {
  // Children that outlive us (held elsewhere) become roots of their own.
  for (const std::shared_ptr<ViewBase>& child : mChildren) {
    child->mParent = nullptr;
  }
}

std::shared_ptr<const void> ViewBase::KeepAliveForDispatch() const {
  return weak_from_this().lock();
}

// --- Tree ---

void ViewBase::AddChild(std::shared_ptr<ViewBase> child) {
  if (!HOST_VERIFY(child != nullptr && !child->Contains(*this), "Invalid child view")) {
    return;
  }
  if (!HOST_VERIFY(!mDestroying, "Adding a child to a destroyed view")) {
    return;
  }
  if (child->mParent == this) {
    return;
  }
  if (child->mParent != nullptr) {
    child->RemoveFromParent();
  } else if (child->mHost != nullptr) {
    child->mHost->SetRootView(nullptr);
  }
  child->mParent = this;
  mChildren.push_back(child);
  // Leaving the old parent cleared a super commander that was that parent.
  if (child->GetSuperCommander() == nullptr) {
    child->SetSuperCommander(this);
  }
  child->FinishCreate();
  child->Invalidate();
}

std::shared_ptr<ViewBase> ViewBase::RemoveChild(ViewBase& child) {
  const auto it = std::find_if(mChildren.begin(), mChildren.end(),
                               [&](const auto& candidate) { return candidate.get() == &child; });
  if (it == mChildren.end()) {
    return nullptr;
  }
  std::shared_ptr<ViewBase> released = *it;
  child.Invalidate();
  ViewHost* const host = GetHost();
  mChildren.erase(it);
  child.mParent = nullptr;
  if (host != nullptr) {
    host->ForgetViewsIn(child);
  }
  if (child.GetSuperCommander() == this) {
    child.SetSuperCommander(nullptr);
  }
  return released;
}

void ViewBase::RemoveFromParent() {
  if (mParent != nullptr) {
    mParent->RemoveChild(*this);
  }
}

bool ViewBase::Contains(const ViewBase& view) const {
  for (const ViewBase* candidate = &view; candidate != nullptr; candidate = candidate->mParent) {
    if (candidate == this) {
      return true;
    }
  }
  return false;
}

ViewBase& ViewBase::GetRootView() {
  ViewBase* view = this;
  while (view->mParent != nullptr) {
    view = view->mParent;
  }
  return *view;
}

ViewHost* ViewBase::GetHost() const {
  const ViewBase* view = this;
  while (view->mParent != nullptr) {
    view = view->mParent;
  }
  return view->mHost;
}

// --- Geometry ---

void ViewBase::SetBounds(const Rect& bounds) {
  Rect newBounds = bounds;
  newBounds.right = std::max(newBounds.right, newBounds.left);
  newBounds.bottom = std::max(newBounds.bottom, newBounds.top);
  if (newBounds == mBounds) {
    return;
  }
  Invalidate();
  mBounds = newBounds;
  Invalidate();
  SetBoundsSelf(mBounds);
}

void ViewBase::MoveTo(Point topLeft) {
  SetBounds(Rect::FromSize(topLeft.x, topLeft.y, mBounds.Width(), mBounds.Height()));
}

void ViewBase::Resize(Size size) {
  SetBounds(Rect::FromSize(mBounds.left, mBounds.top, size.width, size.height));
}

Point ViewBase::LocalToWindow(Point point) const {
  for (const ViewBase* view = this; view != nullptr; view = view->mParent) {
    point = view->LocalToParent(point);
  }
  return point;
}

Point ViewBase::WindowToLocal(Point point) const {
  return point - LocalToWindow(Point{0, 0});
}

Rect ViewBase::LocalToWindow(const Rect& rect) const {
  const Point origin = LocalToWindow(Point{0, 0});
  return rect.Offset(origin.x, origin.y);
}

// --- Visibility and enabling ---

void ViewBase::Show() {
  SetVisible(true);
}

void ViewBase::Hide() {
  SetVisible(false);
}

void ViewBase::SetVisible(bool visible) {
  if (visible == mVisible) {
    return;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (visible) {
    mVisible = true;
    Invalidate();
    ShowSelf();
    return;
  }
  Invalidate();
  mVisible = false;
  LeaveHostState();
  if (Commander* superCommander = GetSuperCommander(); superCommander != nullptr && IsOnDuty()) {
    superCommander->BecomeTarget();
  }
  HideSelf();
}

bool ViewBase::IsShown() const {
  const ViewBase* view = this;
  for (; view != nullptr; view = view->mParent) {
    if (!view->mVisible) {
      return false;
    }
    if (view->mParent == nullptr) {
      break;
    }
  }
  return view != nullptr && view->mHost != nullptr;
}

void ViewBase::SetEnabled(bool enabled) {
  if (enabled == mEnabled) {
    return;
  }
  mEnabled = enabled;
  Invalidate();
}

bool ViewBase::IsEnabledInTree() const {
  for (const ViewBase* view = this; view != nullptr; view = view->mParent) {
    if (!view->mEnabled) {
      return false;
    }
  }
  return true;
}

// --- Painting ---

void ViewBase::Invalidate() {
  InvalidateRect(GetLocalBounds());
}

void ViewBase::InvalidateRect(const Rect& rect) {
  if (!IsShown()) {
    return;
  }
  Rect area = rect;
  const ViewBase* view = this;
  for (; view != nullptr; view = view->mParent) {
    area = area.Intersect(view->GetLocalBounds());
    if (area.IsEmpty()) {
      return;
    }
    area = area.Offset(view->mBounds.left, view->mBounds.top);
    if (view->mParent == nullptr) {
      view->mHost->InvalidateWindowRect(area);
    }
  }
}

void ViewBase::UpdateNow() {
  if (ViewHost* host = GetHost()) {
    host->Render();
  }
}

void ViewBase::SetDoubleBuffered(bool doubleBuffered) {
  if (doubleBuffered == mDoubleBuffered) {
    return;
  }
  mDoubleBuffered = doubleBuffered;
  if (!doubleBuffered) {
    mBackBuffer.reset();
  }
  Invalidate();
}

void ViewBase::PaintTree(DC& dc) {
  if (!mVisible) {
    return;
  }
  DC::ScopedState state(dc);
  dc.OffsetOrigin(mBounds.left, mBounds.top);
  dc.PushClip(GetLocalBounds());
  const Rect clip = dc.GetClipBox();
  if (clip.IsEmpty()) {
    return;
  }
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  if (!mDoubleBuffered) {
    PaintContent(dc);
    return;
  }
  const double scale = dc.GetScaleFactor();
  if (mBackBuffer == nullptr || mBackBufferSize != GetSize() || mBackBufferScale != scale) {
    mBackBuffer = std::make_unique<Image>(GetSize(), scale);
    mBackBufferSize = GetSize();
    mBackBufferScale = scale;
  }
  {
    DC offscreen(*mBackBuffer);
    DC::ScopedClip offscreenClip(offscreen, clip);
    offscreen.ClearRect(clip);
    PaintContent(offscreen);
  }
  dc.DrawImage(*mBackBuffer, Point{0, 0});
}

void ViewBase::PaintContent(DC& dc) {
  {
    DC::ScopedState state(dc);
    PaintSelf(dc);
  }
  // A copy: a paint hook that changes the tree must not break this walk.
  const std::vector<std::shared_ptr<ViewBase>> children = mChildren;
  for (const std::shared_ptr<ViewBase>& child : children) {
    if (child->mParent == this) {
      child->PaintTree(dc);
    }
  }
}

// --- Mouse ---

void ViewBase::CaptureMouse() {
  ViewHost* host = GetHost();
  if (HOST_VERIFY(host != nullptr && IsShown(), "Capturing the mouse for a hidden view")) {
    host->SetCapture(*this);
  }
}

void ViewBase::ReleaseMouse() {
  if (ViewHost* host = GetHost()) {
    host->ReleaseCapture(*this);
  }
}

bool ViewBase::HasMouseCapture() const {
  const ViewHost* host = GetHost();
  return host != nullptr && host->GetCaptureView() == this;
}

std::optional<Point> ViewBase::GetMouseLocation() const {
  const ViewHost* host = GetHost();
  if (host == nullptr) {
    return std::nullopt;
  }
  const std::optional<Point> point = host->GetMousePoint();
  if (!point) {
    return std::nullopt;
  }
  return WindowToLocal(*point);
}

ViewBase* ViewBase::FindViewAt(Point point) {
  if (!mVisible || !HitTestSelf(point)) {
    return nullptr;
  }
  for (auto it = mChildren.rbegin(); it != mChildren.rend(); ++it) {
    if (ViewBase* hit = (*it)->FindViewAt((*it)->ParentToLocal(point))) {
      return hit;
    }
  }
  return this;
}

bool ViewBase::HitTestSelf(Point point) const {
  return GetLocalBounds().Contains(point);
}

void ViewBase::LeaveHostState() {
  if (ViewHost* host = GetHost()) {
    host->ForgetViewsIn(*this);
  }
}

// --- Drag and drop ---

bool ViewBase::DoDragDrop(std::shared_ptr<const DataObject> data, DropEffect allowedEffects) {
  ViewHost* host = GetHost();
  if (!HOST_VERIFY(host != nullptr, "Dragging from a view outside a window")) {
    return false;
  }
  return host->StartDrag(std::move(data), allowedEffects, weak_from_this());
}

// --- Menus ---

std::optional<CommandID> ViewBase::TrackPopupMenu(std::string_view menuName, Point point) {
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  const ViewHost* host = GetHost();
  return RunPopupMenu(menuName, *this, LocalToWindow(point),
                      host != nullptr ? &host->GetShortcutManager() : nullptr);
}

// --- Life cycle ---

void ViewBase::FinishCreate() {
  if (mCreated) {
    return;
  }
  mCreated = true;
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  FinishCreateSelf();
}

void ViewBase::Destroy() {
  if (mDestroying) {
    return;
  }
  mDestroying = true;
  const std::shared_ptr<const void> alive = KeepAliveForDispatch();
  DestroySelf();
  while (!mChildren.empty()) {
    const std::shared_ptr<ViewBase> child = mChildren.back();
    child->Destroy();
    // A child destroyed earlier (or busy destroying itself) may still be here.
    RemoveChild(*child);
  }
  if (mParent != nullptr) {
    RemoveFromParent();
  } else if (mHost != nullptr) {
    mHost->SetRootView(nullptr);
  }
  DetachFromSuperCommander(false);
  mDestroyed = true;
}

void ViewBase::SetToolTip(std::string text) {
  mToolTip = std::move(text);
}

std::string ViewBase::GetToolTipSelf(Point /*point*/) const {
  return mToolTip;
}
