#ifndef QV_PLATFORM_FINDCLOCKSTIMEOUT_H
#define QV_PLATFORM_FINDCLOCKSTIMEOUT_H

#include <cstdint>

namespace qv::dsc::osdep {

// The discovery wait in milliseconds, from the setting "findClocksTimeout" of the key
// "Software\Quarvel\Corbel\qv-1588" (see SettingsStore); 1000 when it is absent. Only the
// low 16 bits of the stored number count. On Windows (FindClocksTimeoutWin32.cpp) the
// setting is the REG_DWORD registry value of that name under HKEY_LOCAL_MACHINE.
class FindClocksTimeout {
  public:
    static constexpr const char* kKeyPath = "Software\\Quarvel\\Corbel\\qv-1588";
    static constexpr const char* kValueName = "findClocksTimeout";
    static constexpr std::uint16_t kDefault = 1000;

    static std::uint16_t read();
};

}  // namespace qv::dsc::osdep

#endif
