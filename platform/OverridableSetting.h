#ifndef QV_PLATFORM_OVERRIDABLESETTING_H
#define QV_PLATFORM_OVERRIDABLESETTING_H

#include <cstdint>
#include <optional>
#include <string>

namespace qv::dsc::osdep {

// A setting that one process may override for itself: when the environment variable
// `variable` is set, its value stands, for this process alone, in place of the value that
// the settings store (SettingsStore: files on POSIX, the registry on Windows) holds under
// `keyPath` and `valueName`. The override writes nothing shared and needs no rights, so
// processes with different overrides run side by side. The variable is read each time,
// from the system's environment (EnvironmentVariable).
struct OverridableSetting {
    const char* variable;
    const char* keyPath;
    const char* valueName;

    // The variable's number when it holds one (the store's syntax, SettingsStore::
    // parseNumber), else the stored number; nothing when neither has one. A variable that
    // holds no number is ignored.
    std::optional<std::uint32_t> readNumber() const;
    // The variable's text when it is set and not empty, else the stored text.
    std::optional<std::string> readText() const;
};

}  // namespace qv::dsc::osdep

#endif
