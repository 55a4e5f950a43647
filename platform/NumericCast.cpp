#include "platform/NumericCast.h"

#include "platform/OutOfRange.h"

namespace qv::dsc {

std::uint32_t NumericCast::toU32(std::uint64_t value) {
    if (value > 0xFFFFFFFFu) {
        throw exception::OutOfRange(kSource, kNarrowLine);
    }
    return static_cast<std::uint32_t>(value);
}

}  // namespace qv::dsc
