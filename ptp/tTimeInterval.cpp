#include "ptp/tTimeInterval.h"

#include <cinttypes>
#include <limits>

#include "platform/tTrace.h"

namespace nQVPTP000 {

tTimeInterval::tTimeInterval(std::int64_t nanoseconds) {
    constexpr std::int64_t kLargest = 0x7FFFFFFFFFFF;  // 2^47 - 1: still fits when scaled
    if (nanoseconds > kLargest) {
        scaledNanoseconds_ = std::numeric_limits<std::int64_t>::max();
    } else if (nanoseconds < -kLargest - 1) {
        scaledNanoseconds_ = std::numeric_limits<std::int64_t>::min();
    } else {
        scaledNanoseconds_ = nanoseconds * 65536;
    }
}

void tTimeInterval::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("scaledNanoseconds: %" PRId64, scaledNanoseconds_);
}

void tTimeInterval::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeInteger64(scaledNanoseconds_, status);
}

void tTimeInterval::deserialize(iSerializableTarget& source, tStatus& status) {
    source.readInteger64(scaledNanoseconds_, status);
}

}  // namespace nQVPTP000
