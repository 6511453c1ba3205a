#include "Host/Model/ParameterMultiSelection.h"

#include <algorithm>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/TrackItem.h"

bool ParameterMultiSelection::Selection::Contains(const ComponentParam* param) const {
  return std::any_of(mEntries.begin(), mEntries.end(),
                     [param](const Entry& e) { return e.param.get() == param; });
}

bool ParameterMultiSelection::Selection::Add(const ComponentRef& component,
                                             const ComponentParamRef& param,
                                             const TrackItemRef& trackItem) {
  if (!param || Contains(param.get())) {
    return false;
  }
  mEntries.push_back({component, param, trackItem});
  return true;
}

bool ParameterMultiSelection::Selection::Remove(const ComponentParam* param) {
  return std::erase_if(mEntries, [param](const Entry& e) { return e.param.get() == param; }) > 0;
}

std::vector<ComponentRef> ParameterMultiSelection::Selection::GetComponents() const {
  std::vector<ComponentRef> components;
  for (const Entry& entry : mEntries) {
    if (entry.component &&
        std::find(components.begin(), components.end(), entry.component) == components.end()) {
      components.push_back(entry.component);
    }
  }
  return components;
}

bool operator==(const ParameterMultiSelection::Selection& a,
                const ParameterMultiSelection::Selection& b) {
  return std::equal(a.mEntries.begin(), a.mEntries.end(), b.mEntries.begin(), b.mEntries.end(),
                    [](const auto& x, const auto& y) {
                      return x.component == y.component && x.param == y.param &&
                             x.trackItem == y.trackItem;
                    });
}
