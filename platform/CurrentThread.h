#ifndef QV_PLATFORM_CURRENTTHREAD_H
#define QV_PLATFORM_CURRENTTHREAD_H

#include <cstdint>

namespace qv::dsc::osdep {

// The system's number for the calling thread, as debuggers and system tools show it.
class CurrentThread {
  public:
    static std::uint32_t id() noexcept;
};

}  // namespace qv::dsc::osdep

#endif
