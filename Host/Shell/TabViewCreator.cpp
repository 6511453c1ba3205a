#include "Host/Shell/TabViewCreator.h"

#include "Host/Toolkit/TabView.h"

TabViewCreator::~TabViewCreator() = default;

TabView* TabViewCreator::CreateTabViewSelf(TabFrame* frame, const PropertyList& state) {
  TabView* view = CreateTabView(frame, state);
  if (view != nullptr)
    view->RestoreState(state);
  return view;
}
