#include "Handlers/EffectControls/Src/SaturationRangeLimiter.h"

SaturationRangeLimiter::SaturationRangeLimiter(const HSLRangeValues* values)
    : HSLRangeLimiter(values, kFirstHandle) {}
