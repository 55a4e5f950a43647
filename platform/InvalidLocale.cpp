#include "platform/InvalidLocale.h"

namespace qv::dsc::exception {

const char* InvalidLocale::what() const noexcept {
    return "Invalid locale";
}

std::uint32_t InvalidLocale::errorCode() const noexcept {
    return 0x8ABC7024u;
}

}  // namespace qv::dsc::exception
