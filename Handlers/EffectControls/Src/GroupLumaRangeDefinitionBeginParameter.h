#pragma once

#include "Handlers/EffectControls/Src/GroupHSLRangeDefinitionBeginParameter.h"

// The luma range: 0 to 100 percent, limited by a LumaRangeLimiter (handles 13 to 16).
class GroupLumaRangeDefinitionBeginParameter : public GroupHSLRangeDefinitionBeginParameter {
 public:
  explicit GroupLumaRangeDefinitionBeginParameter(const ParameterControlInfo& info);

 protected:
  std::shared_ptr<const Limiter> MakeLimiter() const override;
};
