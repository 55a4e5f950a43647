#ifndef QV_PTPMGMT_TCLOCKKEY_H
#define QV_PTPMGMT_TCLOCKKEY_H

#include <array>
#include <cstdint>

#include "ptp/tPortIdentity.h"

namespace nQVPTPMGMT000 {

// A port identity as 10 octets: the clock identity, then the port number with its high
// octet first. Compared octet by octet as unsigned values, so keys order clocks by identity
// and, within one clock, by port number. The expert's item lookup, the node's clock table
// and the proxy all use this one form.
using tClockKey = std::array<std::uint8_t, 10>;

inline tClockKey makeClockKey(const nQVPTP000::tPortIdentity& port) {
    tClockKey key{};
    const nQVPTP000::tClockIdentity identity = port.getClockIdentity();
    for (std::size_t i = 0; i < nQVPTP000::tClockIdentity::kSize; ++i) {
        key[i] = identity[i];
    }
    key[8] = static_cast<std::uint8_t>(port.getPortNumber() >> 8);
    key[9] = static_cast<std::uint8_t>(port.getPortNumber() & 0xFF);
    return key;
}

inline nQVPTP000::tPortIdentity portIdentityOf(const tClockKey& key) {
    return nQVPTP000::tPortIdentity(nQVPTP000::tClockIdentity(key.data()),
                                    static_cast<std::uint16_t>((key[8] << 8) | key[9]));
}

}  // namespace nQVPTPMGMT000

#endif
