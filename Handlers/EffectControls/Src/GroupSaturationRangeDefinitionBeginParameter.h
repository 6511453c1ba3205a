#pragma once

#include "Handlers/EffectControls/Src/GroupHSLRangeDefinitionBeginParameter.h"

// The saturation range: 0 to 100 percent, limited by a SaturationRangeLimiter (handles 9 to 12).
class GroupSaturationRangeDefinitionBeginParameter : public GroupHSLRangeDefinitionBeginParameter {
 public:
  explicit GroupSaturationRangeDefinitionBeginParameter(const ParameterControlInfo& info);

 protected:
  std::shared_ptr<const Limiter> MakeLimiter() const override;
};
