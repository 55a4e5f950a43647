#ifndef QV_PLATFORM_FINDCLOCKSTIMEOUT_H
#define QV_PLATFORM_FINDCLOCKSTIMEOUT_H

#include <cstdint>

namespace qv::dsc::osdep {

// The discovery wait in milliseconds: the environment variable QV_FIND_CLOCKS_TIMEOUT when
// it holds a number (this process only), else the setting "findClocksTimeout" of the key
// "Software\Quarvel\Corbel\qv-1588" (SettingsStore: a file on POSIX, a REG_DWORD value
// under HKEY_LOCAL_MACHINE on Windows), else 1000. Only the low 16 bits count.
class FindClocksTimeout {
  public:
    static constexpr const char* kOverrideVariable = "QV_FIND_CLOCKS_TIMEOUT";
    static constexpr const char* kKeyPath = "Software\\Quarvel\\Corbel\\qv-1588";
    static constexpr const char* kValueName = "findClocksTimeout";
    static constexpr std::uint16_t kDefault = 1000;

    static std::uint16_t read();
};

}  // namespace qv::dsc::osdep

#endif
