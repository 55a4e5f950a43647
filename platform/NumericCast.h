#ifndef QV_PLATFORM_NUMERICCAST_H
#define QV_PLATFORM_NUMERICCAST_H

#include <cstdint>

namespace qv::dsc {

// Narrowing of sizes that throws qv::dsc::exception::OutOfRange instead of truncating.
class NumericCast {
  public:
    static constexpr const char* kSource = "NumericCast";
    static constexpr std::uint32_t kNarrowLine = 67;

    static std::uint32_t toU32(std::uint64_t value);
};

}  // namespace qv::dsc

#endif
