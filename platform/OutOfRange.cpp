#include "platform/OutOfRange.h"

namespace qv::dsc::exception {

const char* OutOfRange::what() const noexcept {
    return "Out of range";
}

std::uint32_t OutOfRange::errorCode() const noexcept {
    return 0x8ABC7007u;
}

}  // namespace qv::dsc::exception
