#include "platform/Exception.h"

namespace qv::dsc::exception {

const char* Exception::what() const noexcept {
    return "unspecified exception";
}

std::uint32_t Exception::errorCode() const noexcept {
    return 0xFFFFFFFFu;
}

}  // namespace qv::dsc::exception
