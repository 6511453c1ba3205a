#include "Handlers/EffectControls/Src/GroupHueRangeDefinitionBeginParameter.h"

#include "Handlers/EffectControls/Src/HueRangeLimiter.h"

GroupHueRangeDefinitionBeginParameter::GroupHueRangeDefinitionBeginParameter(
    const ParameterControlInfo& info)
    : GroupHSLRangeDefinitionBeginParameter(info, {0.0, 360.0, HueRangeLimiter::kFirstHandle}) {}

std::shared_ptr<const Limiter> GroupHueRangeDefinitionBeginParameter::MakeLimiter() const {
  return std::make_shared<HueRangeLimiter>(this);
}
