#include "platform/FindClocksTimeout.h"

#include "platform/SettingsStore.h"

namespace qv::dsc::osdep {

std::uint16_t FindClocksTimeout::read() {
    const SettingsStore store(kKeyPath);
    return static_cast<std::uint16_t>(store.readNumber(kValueName).value_or(kDefault) & 0xFFFF);
}

}  // namespace qv::dsc::osdep
