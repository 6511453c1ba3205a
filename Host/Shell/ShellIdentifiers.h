#pragma once

#include <cstdint>
#include <string_view>

// Identifiers of the host's panel-support machinery. Handler, module and window-type ids are
// strings (the toolkit's tabs carry their handler's id); windows and window contexts are numbers.
inline constexpr std::string_view kEffectControlsHandlerID = "EffectControls";
inline constexpr std::string_view kEffectControlsModuleID = "EffectControlsModule";
inline constexpr std::string_view kEffectControlsWindowTypeID = "EffectControlsWindow";

using WindowID = std::int32_t;
using WindowContextID = std::int32_t;

// What a handler passes to AddWindow when it has no window or context of its own in mind.
inline constexpr WindowID kDefaultWindowID = 0;
inline constexpr WindowContextID kDefaultWindowContextID = 0;
