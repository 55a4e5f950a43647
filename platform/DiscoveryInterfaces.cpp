#include "platform/DiscoveryInterfaces.h"

#include "platform/SettingsStore.h"

namespace qv::dsc::osdep {

std::string DiscoveryInterfaces::readStored() {
    return SettingsStore(kKeyPath).readText(kValueName).value_or(std::string());
}

}  // namespace qv::dsc::osdep
