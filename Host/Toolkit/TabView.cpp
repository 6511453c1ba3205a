#include "Host/Toolkit/TabView.h"

#include <memory>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Toolkit/TabFrame.h"

TabView::TabView(Commander* superCommander) : ViewBase(superCommander) {
  SetTakesFocusOnClick(true);
}

bool TabView::Create(std::string_view handlerID, std::string_view name, TabFrame* frame,
                     bool show) {
  const std::shared_ptr<ViewBase> self = weak_from_this().lock();
  if (!HOST_VERIFY(self != nullptr, "A tab view must be held by a shared_ptr") ||
      !HOST_VERIFY(!mTabCreated, "The tab view was created already")) {
    return false;
  }
  mHandlerID = std::string(handlerID);
  mTabName = std::string(name);
  mFrame = frame;
  mTabCreated = true;
  if (mFrame != nullptr) {
    mFrame->AddTab(std::static_pointer_cast<TabView>(self), show);
  }
  SetVisible(show);
  CreateChildrenSelf();
  return true;
}

bool TabView::IsFrameMaximized() const {
  return mFrame != nullptr && mFrame->IsMaximized();
}

void TabView::BringToFront(bool select, bool focus) {
  if (mFrame != nullptr) {
    mFrame->BringTabToFront(*this, select, focus);
    return;
  }
  if (select) {
    Show();
  }
  if (focus) {
    BecomeTarget();
  }
}

void TabView::SetStacked(bool stacked) {
  if (stacked == mStacked) {
    return;
  }
  mStacked = stacked;
  SetStackedSelf(stacked);
  Invalidate();
}

void TabView::SaveState(PropertyList& state) const {
  SaveStateSelf(state);
}

void TabView::RestoreState(const PropertyList& state) {
  RestoreStateSelf(state);
  Invalidate();
}
