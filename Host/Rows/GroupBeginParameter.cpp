#include "Host/Rows/GroupBeginParameter.h"

#include <algorithm>
#include <memory>
#include <variant>

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

void GroupBeginParameter::GetKeyframeTimes(std::set<TickTime>& times, bool toSequenceTime) const {
  EffectItem::GetKeyframeTimes(times, toSequenceTime);
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

std::size_t GroupBeginParameter::CountGroupEntries(const ComponentParam& param) {
  const ParamValue value = param.GetValueAt(kTime_Zero);
  if (const auto* text = std::get_if<std::string>(&value)) {
    return static_cast<std::size_t>(std::count(text->begin(), text->end(), ';'));
  }
  if (const auto* blob = std::get_if<ParamBlob>(&value)) {
    // Wide text: UTF-16 code units, low byte first; a trailing odd byte is no code unit.
    std::size_t count = 0;
    for (std::size_t i = 0; i + 1 < blob->bytes.size(); i += 2) {
      count += blob->bytes[i] == ';' && blob->bytes[i + 1] == 0 ? 1 : 0;
    }
    return count;
  }
  return 0;
}
