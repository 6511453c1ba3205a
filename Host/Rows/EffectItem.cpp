#include "Host/Rows/EffectItem.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/DisclosureTriangle.h"
#include "Host/Toolkit/Font.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/ViewBase.h"

EffectItem::EffectItem(ViewBase* parentView, std::string name, StationName station)
    : mName(std::move(name)), mStation(std::move(station)), mParentView(parentView) {
  if (parentView != nullptr) {
    mParentViewAlive = parentView->weak_from_this();
    mTracksParentView = !mParentViewAlive.expired();
  }
}

EffectItem::~EffectItem() {
  // Controls of a row that was never destroyed must not stay behind in the list view.
  DestroyControl(mTriangle);
}

ViewBase* EffectItem::GetParentView() const {
  if (mTracksParentView && mParentViewAlive.expired()) {
    return nullptr;
  }
  return mParentView;
}

void EffectItem::ListenToMessage(const Message& message) {
  if (const auto* triangle = message.As<DisclosureTriangleStateChangedMessage>()) {
    if (IsAltDown(triangle->modifiers)) {
      // Alt-click opens or closes every row; the list does it for all sections at once.
      if (!mStation.empty()) {
        BroadcastMessage(mStation, DisclosureStateAllChanged(triangle->open));
      }
      return;
    }
    OnDisclosureStateChanged();
  }
}

void EffectItem::FinishCreateSelf() {
  if (mCreated || mDestroyed) {
    return;
  }
  mCreated = true;
  if (CanExpand()) {
    mTriangle = AdoptControl(std::make_shared<DisclosureTriangle>(
        Rect::FromSize(0, 0, kTriangleSize, kTriangleSize), 0, mExpanded));
    if (mTriangle) {
      AddListener(mTriangle->GetStation(), *this);
    }
  }
  for (const auto& child : mItems) {
    child->FinishCreateSelf();
  }
}

void EffectItem::CommitPendingInput() {
  for (const std::shared_ptr<ViewBase>& control : GetControls()) {
    control->CommitPendingInput();
  }
}

void EffectItem::Destroy() {
  if (mDestroyed) {
    return;
  }
  CommitPendingInput();
  mDestroyed = true;
  mShown = false;
  RemoveListenerFromAllStations(*this);
  DestroyControl(mTriangle);
  // Children go last to first, as views do.
  for (auto it = mItems.rbegin(); it != mItems.rend(); ++it) {
    (*it)->Destroy();
  }
}

void EffectItem::AddItem(std::shared_ptr<EffectItem> child) {
  if (!child || child.get() == this || !child->mParentItem.expired()) {
    HOST_ASSERT(child != nullptr, "Invalid child row");
    return;
  }
  child->mParentItem = weak_from_this();
  mItems.push_back(child);
  if (mCreated && !mDestroyed) {
    child->FinishCreateSelf();
  }
  if (mShown && mExpanded && !child->IsSetAside()) {
    child->Show();
  } else if (child->IsShown()) {
    child->Hide();
  }
}

void EffectItem::SetGroupLevel(int level) {
  HOST_ASSERT(level >= 0, "Negative group level");
  mGroupLevel = std::max(level, 0);
}

int EffectItem::GetGroupLevelIndentInPixels() const {
  return mGroupLevel * GetIndentPerGroupLevel();
}

int EffectItem::GetTitleLeft() const {
  return (ShouldIndentTitleToCurrentLevel() ? GetGroupLevelIndentInPixels() : 0) + kTitleOffset;
}

int EffectItem::GetTitleRightEdge() const {
  return mWidth;
}

void EffectItem::Show() {
  if (mDestroyed || mSetAside) {
    return;
  }
  mShown = true;
  if (mTriangle) {
    mTriangle->SetOpen(mExpanded);
    mTriangle->Show();
  }
  ShowControls(true);
  if (mExpanded) {
    ShowChildren();
  } else {
    HideChildren();
  }
}

void EffectItem::Hide() {
  mShown = false;
  if (mTriangle) {
    mTriangle->Hide();
  }
  ShowControls(false);
  HideChildren();
}

void EffectItem::SetAside(bool aside) {
  if (mSetAside == aside) {
    return;
  }
  mSetAside = aside;
  if (aside) {
    if (mShown) {
      Hide();
    }
    return;
  }
  const std::shared_ptr<EffectItem> parent = GetParentItem();
  if (parent && parent->IsShown() && parent->IsExpanded()) {
    Show();
  }
}

void EffectItem::SetIsExpanded(bool expanded) {
  mExpanded = expanded;
  if (mTriangle) {
    mTriangle->SetOpen(expanded);
  }
  if (!mShown) {
    return;
  }
  // Rows show some controls only while expanded (a slider under the value).
  ShowControls(true);
  if (expanded) {
    ShowChildren();
  } else {
    HideChildren();
  }
}

void EffectItem::SetAllExpanded(bool expanded) {
  if (CanExpand()) {
    SetIsExpanded(expanded);
  }
  for (const auto& child : mItems) {
    child->SetAllExpanded(expanded);
  }
}

void EffectItem::OnDisclosureStateChanged() {
  if (mTriangle) {
    SetIsExpanded(mTriangle->IsOpen());
  }
  if (!mStation.empty()) {
    BroadcastMessage(mStation, EffectControlsDisclosureStateChanged());
  }
}

void EffectItem::PositionSelf(int top, int depth, int width) {
  mTop = top;
  mDepth = depth;
  mWidth = width;
  if (mTriangle) {
    const Point at = GetDisclosureTrianglePosition();
    PlaceView(*mTriangle, Rect::FromSize(at.x, top + at.y, kTriangleSize, kTriangleSize));
  }
  PositionChildren(top + OwnHeight() + (mExpanded ? GetExpandedAreaHeight() : 0), depth + 1, width);
}

void EffectItem::PositionSelfUsingHostSize(int top, int depth) {
  const ViewBase* parent = GetParentView();
  PositionSelf(top, depth, parent != nullptr ? parent->GetBounds().Width() : mWidth);
}

int EffectItem::Height() const {
  return OwnHeight() + (mExpanded ? GetExpandedAreaHeight() + ChildrenHeight() : 0);
}

void EffectItem::SetViewTopAndBottom(int viewTop, int viewBottom) {
  mViewTop = viewTop;
  mViewBottom = viewBottom;
  for (const auto& child : mItems) {
    child->SetViewTopAndBottom(viewTop, viewBottom);
  }
}

void EffectItem::DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const {
  dc.DrawText(mName, rect, font, color);
}

void EffectItem::PaintSelf(DC& /*dc*/, const Rect& /*rowRect*/) {}

void EffectItem::GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const {
  for (const auto& child : mItems) {
    if (!child->IsSetAside()) {
      child->GetKeyframeTimes(times, line);
    }
  }
}

bool EffectItem::RecursiveUpdateSetAside() {
  bool changed = UpdateSetAside();
  for (const auto& child : mItems) {
    changed = child->RecursiveUpdateSetAside() || changed;
  }
  return changed;
}

bool EffectItem::RecursiveUpdateParameterUI() {
  bool changed = UpdateParameterUI();
  for (const auto& child : mItems) {
    changed = child->RecursiveUpdateParameterUI() || changed;
  }
  return changed;
}

void EffectItem::RecursiveSynchToTime(bool force) {
  if (mDestroyed) {
    return;
  }
  SynchToTime(force);
  for (const auto& child : mItems) {
    child->RecursiveSynchToTime(force);
  }
}

Point EffectItem::GetDisclosureTrianglePosition() const {
  // Effect rows keep x = indent + 3 for their on/off switch; the triangle follows it.
  return {GetGroupLevelIndentInPixels() + 20, 2};
}

bool EffectItem::AdoptView(const std::shared_ptr<ViewBase>& view) {
  ViewBase* parent = GetParentView();
  if (!view || parent == nullptr || mDestroyed) {
    return false;
  }
  view->Hide();
  parent->AddChild(view);
  std::erase_if(mControls, [](const std::weak_ptr<ViewBase>& c) { return c.expired(); });
  mControls.push_back(view);
  return true;
}

std::vector<std::shared_ptr<ViewBase>> EffectItem::GetControls() const {
  std::vector<std::shared_ptr<ViewBase>> controls;
  for (const auto& weak : mControls) {
    if (auto control = weak.lock(); control && !control->IsDestroyed()) {
      controls.push_back(std::move(control));
    }
  }
  return controls;
}

void EffectItem::DestroyView(ViewBase& view) {
  view.Destroy();
}

void EffectItem::PlaceView(ViewBase& view, const Rect& bounds) {
  if (view.GetBounds() != bounds) {
    view.SetBounds(bounds);
  }
}

int EffectItem::PositionChildren(int top, int depth, int width) {
  int y = top;
  for (const auto& child : mItems) {
    if (child->IsSetAside()) {
      continue;
    }
    child->SetViewTopAndBottom(mViewTop, mViewBottom);
    child->PositionSelf(y, depth, width);
    if (mExpanded) {
      y += child->Height();
    }
  }
  return y;
}

int EffectItem::ChildrenHeight() const {
  int height = 0;
  for (const auto& child : mItems) {
    if (!child->IsSetAside()) {
      height += child->Height();
    }
  }
  return height;
}

void EffectItem::ShowChildren() {
  for (const auto& child : mItems) {
    if (!child->IsSetAside()) {
      child->Show();
    }
  }
}

void EffectItem::HideChildren() {
  for (const auto& child : mItems) {
    child->Hide();
  }
}
