#ifndef QV_PLATFORM_SAFEINTEGER_H
#define QV_PLATFORM_SAFEINTEGER_H

#include <cstdint>

namespace qv::dsc {

// Unsigned 32-bit arithmetic for sizes and counts that throws
// qv::dsc::exception::OutOfRange instead of wrapping around.
class SafeInteger {
  public:
    static constexpr const char* kSource = "SafeInteger";
    static constexpr std::uint32_t kAddLine = 122;
    static constexpr std::uint32_t kDoubleLine = 191;

    // target += value; a sum above 0xFFFFFFFF throws and leaves target unchanged.
    static void addAssign(std::uint32_t& target, std::uint32_t value);
    // 2 * value; a value above 0x7FFFFFFF throws.
    static std::uint32_t doubled(std::uint32_t value);
};

}  // namespace qv::dsc

#endif
