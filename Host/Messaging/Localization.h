#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

// Localised strings. A key is "$$$/" + path + "=" + default text, e.g.
// "$$$/Vantile/Handlers/EffectControls/PlayAudio=Play only the audio for this clip".
// The translation for the path is used when the table holds one, else the default text. In the
// result, "#{" and everything after it (a note for translators) is dropped, then @0, @1, ... are
// replaced by the arguments in one pass (an argument's own "@1" or "#{" is left alone; a
// placeholder without an argument stays as written).
// Text that does not begin with "$$$/" is returned unchanged; a key with no "=" or an empty or
// blank path is malformed and returned unchanged too. UI thread only.
std::string LocalizeString(std::string_view key, std::initializer_list<std::string_view> args = {});
std::string LocalizeString(std::string_view key, const std::vector<std::string>& args);

// Translation table, by path ("Vantile/Handlers/EffectControls/PlayAudio"; a leading "$$$/" and
// anything from "=" on are ignored, so a full key works as well).
void SetLocalizedString(std::string_view path, std::string_view translation);
// Adds the entries of a JSON object {"path": "translation", ...}; false (and *error set, nothing
// added) when the text is not such an object.
bool LoadLocalizedStringsFromJSON(std::string_view jsonText, std::string* error = nullptr);
void ClearLocalizedStrings();
