#include "Handlers/EffectControls/Src/GroupLumaRangeDefinitionBeginParameter.h"

#include "Handlers/EffectControls/Src/LumaRangeLimiter.h"

GroupLumaRangeDefinitionBeginParameter::GroupLumaRangeDefinitionBeginParameter(
    const ParameterControlInfo& info)
    : GroupHSLRangeDefinitionBeginParameter(info, {0.0, 100.0, LumaRangeLimiter::kFirstHandle}) {}

std::shared_ptr<const Limiter> GroupLumaRangeDefinitionBeginParameter::MakeLimiter() const {
  return std::make_shared<LumaRangeLimiter>(this);
}
