#include "Host/Rows/GroupBeginParameter.h"

#include <memory>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"

GroupBeginParameter::GroupBeginParameter(const ParameterControlInfo& info)
    : ParameterControl(info) {
  const std::string key = GetExpandedPropertyKey();
  const bool expanded =
      GetComponent() && GetComponent()->GetExpansionProperties().GetBool(key, false);
  EffectItem::SetIsExpanded(expanded);
}

void GroupBeginParameter::GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const {
  EffectItem::GetKeyframeTimes(times, line);
}

void GroupBeginParameter::SetIsExpanded(bool expanded) {
  ParameterControl::SetIsExpanded(expanded);
  if (!GetComponent()) {
    return;
  }
  PropertyList& properties = GetComponent()->GetExpansionProperties();
  const std::string key = GetExpandedPropertyKey();
  if (properties.GetBool(key, false) == expanded) {
    return;
  }
  if (properties.IsReadOnly(key)) {
    if (!properties.GetStation().empty()) {
      PostMessageToUIThread(properties.GetStation(),
                            std::make_shared<OverrideReadOnlyPropertyWarningMessage>(key));
    }
    return;
  }
  properties.SetBool(key, expanded);
}

std::string GroupBeginParameter::GetExpandedPropertyKey() const {
  std::size_t index = 0;
  if (GetComponent() && GetParam()) {
    index = GetComponent()->GetParamIndex(GetParam().get());
  }
  return std::string(kExpandedPropertyPrefix) + "." + std::to_string(index);
}
