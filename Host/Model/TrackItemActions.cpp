#include "Host/Model/TrackItemActions.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/FunctionAction.h"
#include "Host/Model/Project.h"
#include "Host/Model/TrackItem.h"

namespace {

template <class T, class Apply>
EditStatus SetProperty(const TrackItemRef& item, const char* name, T before, T after, Apply apply) {
  if (before == after) {
    return EditStatus::NoChange;
  }
  return ExecuteModelAction(
      item->GetProject(),
      FunctionAction::MakeSetter(name, std::move(before), std::move(after),
                                 [item, apply](const T& value) { apply(*item, value); }));
}

}  // namespace

EditStatus TrackItemActions::SetIntroOutroLocked(const TrackItemRef& item, bool locked) {
  if (!HOST_VERIFY(item != nullptr, "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SetProperty(item, kSetIntroOutroLocked, item->AreIntroOutroLocked(), locked,
                     [](TrackItem& i, bool l) { i.SetIntroOutroLocked(l); });
}

EditStatus TrackItemActions::SetLabelColor(const TrackItemRef& item, std::uint32_t rgb) {
  if (!HOST_VERIFY(item != nullptr, "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SetProperty(item, kSetLabelColor, item->GetLabelColor(), rgb & 0xFFFFFFu,
                     [](TrackItem& i, std::uint32_t c) { i.SetLabelColor(c); });
}

EditStatus TrackItemActions::SetName(const TrackItemRef& item, std::string name) {
  if (!HOST_VERIFY(item != nullptr, "Invalid TrackItem")) {
    return EditStatus::InvalidArgument;
  }
  return SetProperty(item, kSetName, item->GetOwnName(), std::move(name),
                     [](TrackItem& i, const std::string& n) { i.SetName(n); });
}
