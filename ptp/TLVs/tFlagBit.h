#ifndef QV_PTP_TLVS_TFLAGBIT_H
#define QV_PTP_TLVS_TFLAGBIT_H

#include <cstdint>

namespace nQVPTP000 {

// One flag of a flags octet (or 16-bit word) and the mask of its bit on the wire. `Flag` is
// `bool` when the field walk reads and `const bool` when it writes or measures.
template <typename Flag>
struct tFlagBit {
    Flag& flag;
    std::uint16_t mask;
};

template <typename Flag>
tFlagBit<Flag> flagBit(Flag& flag, std::uint16_t mask) {
    return {flag, mask};
}

}  // namespace nQVPTP000

#endif
