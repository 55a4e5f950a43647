#ifndef QV_PLATFORM_OUTOFRANGE_H
#define QV_PLATFORM_OUTOFRANGE_H

#include "platform/Exception.h"

namespace qv::dsc::exception {

// Thrown when a value does not fit the range of its type (sizes, counts, times).
class OutOfRange : public Exception {
  public:
    using Exception::Exception;
    ~OutOfRange() override = default;

    const char* what() const noexcept override;
    std::uint32_t errorCode() const noexcept override;
};

}  // namespace qv::dsc::exception

#endif
