#ifndef QV_PLATFORM_DISCOVERYINTERFACES_H
#define QV_PLATFORM_DISCOVERYINTERFACES_H

#include <string>
#include <string_view>
#include <vector>

#include "platform/MulticastInterfaces.h"

namespace qv::dsc::osdep {

// The interfaces on which discovery sends and listens: the environment variable
// QV_INTERFACES for one process, else the setting "interfaces" beside "findClocksTimeout"
// under the key "Software\Quarvel\Corbel\qv-1588" (a file in the SettingsStore folder; on
// Windows, DiscoveryInterfacesWin32.cpp, a REG_SZ value under HKEY_LOCAL_MACHINE). Either
// holds interface names separated by commas and/or blanks, or the word "all". Empty or
// absent: no choice, and the system's default multicast interface serves as before.
class DiscoveryInterfaces {
  public:
    static constexpr const char* kKeyPath = "Software\\Quarvel\\Corbel\\qv-1588";
    static constexpr const char* kValueName = "interfaces";
    static constexpr const char* kVariable = "QV_INTERFACES";
    static constexpr std::string_view kAll = "all";

    // The text of the variable when it is set and not empty, else the stored text.
    static std::string read();

    // The interfaces of `available` that `setting` names, in the order of `available`:
    // every one for "all", none for a setting without names. A word may also be an
    // interface index in decimal (Windows' friendly names often hold blanks). A word that
    // names none of `available` is returned in `unknown`, with an empty list.
    static std::vector<MulticastInterface> choose(std::string_view setting,
                                                  const std::vector<MulticastInterface>& available,
                                                  std::string& unknown);

  private:
    // The stored text; empty when the value is absent or unreadable.
    static std::string readStored();
};

}  // namespace qv::dsc::osdep

#endif
