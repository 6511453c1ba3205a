#pragma once

#include <string_view>

// The panel's resources, compiled into the library from Resources/ at build time. Each view
// stays valid for the life of the process.

// The colour definitions ("EFFECTCONTROLSCOLORS"): Resources/EffectControlsColors.txt.
std::string_view EffectControlsColorsResource();
// The menu resources ("HandlerEffectControls_*"): Resources/EffectControlsMenus.txt.
std::string_view EffectControlsMenusResource();
