#include "platform/FindClocksTimeout.h"

#include "platform/OverridableSetting.h"

namespace qv::dsc::osdep {

std::uint16_t FindClocksTimeout::read() {
    const OverridableSetting setting{kOverrideVariable, kKeyPath, kValueName};
    return static_cast<std::uint16_t>(setting.readNumber().value_or(kDefault) & 0xFFFF);
}

}  // namespace qv::dsc::osdep
