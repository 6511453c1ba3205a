#include "Handlers/EffectControls/Src/HueRangeLimiter.h"

HueRangeLimiter::HueRangeLimiter(const HSLRangeValues* values)
    : HSLRangeLimiter(values, kFirstHandle) {}
