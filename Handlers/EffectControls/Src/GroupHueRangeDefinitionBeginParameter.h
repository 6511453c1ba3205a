#pragma once

#include "Handlers/EffectControls/Src/GroupHSLRangeDefinitionBeginParameter.h"

// The hue range: 0 to 360 degrees, limited by a HueRangeLimiter (handles 5 to 8).
class GroupHueRangeDefinitionBeginParameter : public GroupHSLRangeDefinitionBeginParameter {
 public:
  explicit GroupHueRangeDefinitionBeginParameter(const ParameterControlInfo& info);

 protected:
  std::shared_ptr<const Limiter> MakeLimiter() const override;
};
