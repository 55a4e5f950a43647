#include "ptp/tClockIdentity.h"

#include <cstring>

#include "platform/tTrace.h"

namespace nQVPTP000 {

tClockIdentity::tClockIdentity(const std::uint8_t* octets) {
    std::memcpy(octets_.data(), octets, kSize);
}

void tClockIdentity::trace(nQVTARN000::tTrace& trace) const {
    for (std::uint8_t octet : octets_) {
        trace.appendFormatted("%.2x", octet);
    }
}

void tClockIdentity::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeOctets(octets_.data(), kSize, status);
}

void tClockIdentity::deserialize(iSerializableTarget& source, tStatus& status) {
    source.readOctets(octets_.data(), kSize, status);
}

const tClockIdentity& allOnesClockIdentity() {
    static const std::uint8_t kAllOnes[tClockIdentity::kSize] = {0xFF, 0xFF, 0xFF, 0xFF,
                                                                 0xFF, 0xFF, 0xFF, 0xFF};
    static const tClockIdentity identity(kAllOnes);
    return identity;
}

}  // namespace nQVPTP000
