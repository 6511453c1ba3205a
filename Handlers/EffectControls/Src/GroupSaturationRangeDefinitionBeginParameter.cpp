#include "Handlers/EffectControls/Src/GroupSaturationRangeDefinitionBeginParameter.h"

#include "Handlers/EffectControls/Src/SaturationRangeLimiter.h"

GroupSaturationRangeDefinitionBeginParameter::GroupSaturationRangeDefinitionBeginParameter(
    const ParameterControlInfo& info)
    : GroupHSLRangeDefinitionBeginParameter(info,
                                            {0.0, 100.0, SaturationRangeLimiter::kFirstHandle}) {}

std::shared_ptr<const Limiter> GroupSaturationRangeDefinitionBeginParameter::MakeLimiter() const {
  return std::make_shared<SaturationRangeLimiter>(this);
}
