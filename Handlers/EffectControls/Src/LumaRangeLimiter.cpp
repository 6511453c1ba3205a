#include "Handlers/EffectControls/Src/LumaRangeLimiter.h"

LumaRangeLimiter::LumaRangeLimiter(const HSLRangeValues* values)
    : HSLRangeLimiter(values, kFirstHandle) {}
