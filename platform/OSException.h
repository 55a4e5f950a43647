#ifndef QV_PLATFORM_OSEXCEPTION_H
#define QV_PLATFORM_OSEXCEPTION_H

#include <cstdint>
#include <memory>
#include <string>

#include "platform/Exception.h"

namespace qv::dsc::osdep {

// A failure of an operating-system call, with the system's error number and a message that
// the exception owns. The message is shared between copies, so copying never throws.
class OSException : public exception::Exception {
  public:
    static constexpr std::uint32_t kCode = 42;

    explicit OSException(const char* file = "", std::uint32_t line = 0);
    OSException(std::string message, std::uint32_t osError, const char* file, std::uint32_t line);
    ~OSException() override = default;

    const char* what() const noexcept override;
    std::uint32_t errorCode() const noexcept override;
    virtual std::uint32_t osErrorCode() const noexcept;

  private:
    std::shared_ptr<const std::string> message_;
    std::uint32_t osError_ = 0;
};

}  // namespace qv::dsc::osdep

#endif
