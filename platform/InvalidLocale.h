#ifndef QV_PLATFORM_INVALIDLOCALE_H
#define QV_PLATFORM_INVALIDLOCALE_H

#include "platform/Exception.h"

namespace qv::dsc::exception {

// Thrown for a locale name that names no supported character set; names are matched
// exactly, case included.
class InvalidLocale : public Exception {
  public:
    using Exception::Exception;
    ~InvalidLocale() override = default;

    const char* what() const noexcept override;
    std::uint32_t errorCode() const noexcept override;
};

}  // namespace qv::dsc::exception

#endif
