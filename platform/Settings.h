// The per-user settings store the host also uses: an INI file per
// application, $XDG_CONFIG_HOME/<application>/settings.ini (default
// ~/.config/...), one [section] per settings section.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quendal {

// The settings file of an application ("Merivane").
std::string SettingsPath(std::string_view application);

// The stored value, or `fallback` when there is none.
std::string GetSetting(std::string_view application, std::string_view section,
                       std::string_view key, std::string_view fallback);
// Stores a value (the file is replaced atomically); false when it can't be written.
bool SaveSetting(std::string_view application, std::string_view section, std::string_view key,
                 std::string_view value);

}  // namespace quendal
