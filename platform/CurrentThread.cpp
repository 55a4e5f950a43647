#include "platform/CurrentThread.h"

#include <unistd.h>

namespace qv::dsc::osdep {

std::uint32_t CurrentThread::id() noexcept {
    return static_cast<std::uint32_t>(gettid());
}

}  // namespace qv::dsc::osdep
