#pragma once

#include <string_view>

// Developer switches ("debug database" flags), kept in the application preferences under the
// key "Debug.<name>" so that a preferences file can turn them on. Off unless set. UI thread
// only.
inline constexpr std::string_view kDebugFlagEnableMaskMultiSelect = "EnableMaskMultiSelect";

bool IsDebugFlagSet(std::string_view name);
// False when the preference is read only.
bool SetDebugFlag(std::string_view name, bool value);
