#include "platform/OSException.h"

#include <utility>

namespace qv::dsc::osdep {

OSException::OSException(const char* file, std::uint32_t line)
    : OSException("Unknown error", 0, file, line) {}

OSException::OSException(std::string message, std::uint32_t osError, const char* file,
                         std::uint32_t line)
    : Exception(file, line),
      message_(std::make_shared<const std::string>(std::move(message))),
      osError_(osError) {}

const char* OSException::what() const noexcept {
    return message_->c_str();
}

std::uint32_t OSException::errorCode() const noexcept {
    return kCode;
}

std::uint32_t OSException::osErrorCode() const noexcept {
    return osError_;
}

}  // namespace qv::dsc::osdep
