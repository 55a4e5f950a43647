#ifndef QV_PLATFORM_SETTINGSSTORE_H
#define QV_PLATFORM_SETTINGSSTORE_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace qv::dsc::osdep {

// Persistent settings, one key per folder and one value per file. The key path
// "Software\Quarvel\Corbel\qv-1588" is the folder "<root>/Software/Quarvel/Corbel/qv-1588";
// the root is $QV_SETTINGS_ROOT when set, otherwise /etc/corbel. A number is stored as
// decimal text, or hexadecimal after "0x", surrounding white space allowed.
class SettingsStore {
  public:
    static constexpr const char* kRootVariable = "QV_SETTINGS_ROOT";
    static constexpr const char* kDefaultRoot = "/etc/corbel";

    // Key path segments are separated by '\' or '/'; "." and ".." segments are ignored so
    // that a key never leads out of the root.
    explicit SettingsStore(std::string_view keyPath);

    // The stored number, or nothing when the key, the value or a valid 32-bit number in it
    // is missing. A value name that holds '/' or is "." or ".." is never found.
    std::optional<std::uint32_t> readNumber(std::string_view valueName) const;
    // The stored text as it is (at most 4096 octets), or nothing when the value is missing,
    // longer, or named as readNumber never finds.
    std::optional<std::string> readText(std::string_view valueName) const;

    const std::string& folder() const { return folder_; }

  private:
    std::string folder_;
};

}  // namespace qv::dsc::osdep

#endif
