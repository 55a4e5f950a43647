#include "platform/AbsTime.h"

#include "platform/OutOfRange.h"

namespace qv::dsc {

namespace {

constexpr const char* kSource = "AbsTime";
constexpr std::uint64_t kHalfSecond = std::uint64_t{1} << 63;

}  // namespace

AbsTime AbsTime::fromUnixSeconds(std::int64_t unixSeconds) {
    AbsTime result;
    if (__builtin_add_overflow(unixSeconds, kUnixEpochSeconds, &result.seconds)) {
        throw exception::OutOfRange(kSource, __LINE__);
    }
    return result;
}

std::int64_t AbsTime::toUnixSeconds(tFraction mode) const {
    std::int64_t whole = seconds;
    if (mode == tFraction::kRound && fraction >= kHalfSecond &&
        __builtin_add_overflow(whole, 1, &whole)) {
        throw exception::OutOfRange(kSource, __LINE__);
    }
    std::int64_t result = 0;
    if (__builtin_sub_overflow(whole, kUnixEpochSeconds, &result)) {
        throw exception::OutOfRange(kSource, __LINE__);
    }
    return result;
}

}  // namespace qv::dsc
