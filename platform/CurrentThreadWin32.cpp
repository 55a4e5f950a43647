#include <windows.h>

#include "platform/CurrentThread.h"

namespace qv::dsc::osdep {

std::uint32_t CurrentThread::id() noexcept {
    return GetCurrentThreadId();
}

}  // namespace qv::dsc::osdep
