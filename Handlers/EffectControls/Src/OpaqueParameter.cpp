#include "Handlers/EffectControls/Src/OpaqueParameter.h"

OpaqueParameter::OpaqueParameter(const ParameterControlInfo& info) : ParameterControl(info) {}
