#include "platform/SafeInteger.h"

#include "platform/OutOfRange.h"

namespace qv::dsc {

void SafeInteger::addAssign(std::uint32_t& target, std::uint32_t value) {
    if (value > 0xFFFFFFFFu - target) {
        throw exception::OutOfRange(kSource, kAddLine);
    }
    target += value;
}

std::uint32_t SafeInteger::doubled(std::uint32_t value) {
    if (value > 0x7FFFFFFFu) {
        throw exception::OutOfRange(kSource, kDoubleLine);
    }
    return value * 2;
}

}  // namespace qv::dsc
