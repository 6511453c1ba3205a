#include "Host/Rows/ParameterCache.h"

#include <algorithm>
#include <limits>

#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/ViewBase.h"

namespace {

void ResetField(HotFloatControl& field) {
  field.CancelEditing();
  field.Hide();
  field.SetEnabled(true);
  field.SetOwnerCookie(0);
  field.SetExponential(false, 1.0);
  field.SetAppendedSymbol({});
  field.SetMinimumValueString({});
  field.SetDigitsPastDecimal(2);
  field.SetValueIncrement(1.0);
  field.SetMinValue(std::numeric_limits<double>::lowest());
  field.SetMaxValue(std::numeric_limits<double>::max());
  field.SetHorizontalTextAlignment(1);
  field.SetValue(0.0, false);
}

}  // namespace

std::shared_ptr<HotFloatControl> ParameterCache::CreateHotFloat(ViewBase& parent,
                                                                Commander* superCommander) {
  Purge();
  std::shared_ptr<HotFloatControl> field;
  const auto it = std::find_if(mIdle.begin(), mIdle.end(),
                               [&](const Entry& entry) { return entry.parent == &parent; });
  if (it != mIdle.end()) {
    field = it->field.lock();
    mIdle.erase(it);
  }
  if (!field) {
    field = std::make_shared<HotFloatControl>(Rect{}, 0.0, superCommander);
    field->Hide();
    parent.AddChild(field);
  }
  field->SetSuperCommander(superCommander != nullptr ? superCommander : &parent);
  return field;
}

void ParameterCache::ReturnHotFloat(const std::shared_ptr<HotFloatControl>& field) {
  if (!field) {
    return;
  }
  ViewBase* parent = field->GetParent();
  if (parent == nullptr || field->IsDestroyed()) {
    field->Destroy();
    return;
  }
  ResetField(*field);
  field->SetSuperCommander(parent);
  const bool known = std::any_of(mIdle.begin(), mIdle.end(),
                                 [&](const Entry& entry) { return entry.field.lock() == field; });
  if (!known) {
    mIdle.push_back({parent, parent->weak_from_this(), field});
  }
}

std::size_t ParameterCache::GetIdleCount() {
  Purge();
  return mIdle.size();
}

void ParameterCache::Purge() {
  std::erase_if(mIdle, [](const Entry& entry) {
    const std::shared_ptr<HotFloatControl> field = entry.field.lock();
    return !field || entry.alive.expired() || field->IsDestroyed() ||
           field->GetParent() != entry.parent;
  });
}

ParameterCache& ParameterControl::GetParameterCache() {
  static ParameterCache cache;
  return cache;
}
