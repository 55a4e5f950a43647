#ifndef QV_PTP_TLVS_TFIELDWRITER_H
#define QV_PTP_TLVS_TFIELDWRITER_H

#include <array>
#include <cstdint>
#include <type_traits>
#include <vector>

#include "ptp/TLVs/tFlagBit.h"
#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// The field walk that writes a data field: each field in wire order to the target.
class tFieldWriter {
  public:
    tFieldWriter(iSerializableTarget& target, tStatus& status) : target_(target), status_(status) {}

    template <typename T>
    void field(const T& value) {
        if constexpr (std::is_base_of_v<iPTPSerializable, T>) {
            value.serialize(target_, status_);
        } else if constexpr (std::is_same_v<T, std::uint8_t>) {
            target_.writeUInteger8(value, status_);
        } else if constexpr (std::is_same_v<T, std::int8_t>) {
            target_.writeInteger8(value, status_);
        } else if constexpr (std::is_same_v<T, std::uint16_t>) {
            target_.writeUInteger16(value, status_);
        } else if constexpr (std::is_same_v<T, std::int16_t>) {
            target_.writeInteger16(value, status_);
        } else {
            static_assert(std::is_same_v<T, std::int32_t>, "no wire form for this field type");
            target_.writeInteger32(value, status_);
        }
    }

    void reserved(unsigned octets) {
        for (unsigned i = 0; i < octets; ++i) {
            target_.writeOctet(0, status_);
        }
    }

    template <typename... Flags>
    void flags8(tFlagBit<Flags>... bits) {
        target_.writeUInteger8(static_cast<std::uint8_t>(combine(bits...)), status_);
    }

    template <typename... Flags>
    void flags16(tFlagBit<Flags>... bits) {
        target_.writeUInteger16(combine(bits...), status_);
    }

    // An octet whose high nibble is reserved.
    void lowNibble(const std::uint8_t& value) {
        target_.writeNibble(0, status_);
        target_.writeNibble(static_cast<std::uint8_t>(value & 0x0F), status_);
    }

    template <std::size_t N>
    void octets(const std::array<std::uint8_t, N>& value) {
        target_.writeOctets(value.data(), N, status_);
    }

    // `count` octets of an array held with its own length field; nothing when empty.
    void octetArray(const std::vector<std::uint8_t>& value, std::uint16_t /*count*/) {
        if (!value.empty()) {
            target_.writeOctets(value.data(), value.size(), status_);
        }
    }

  private:
    template <typename... Flags>
    static std::uint16_t combine(tFlagBit<Flags>... bits) {
        std::uint16_t word = 0;
        ((word = static_cast<std::uint16_t>(word | (bits.flag ? bits.mask : 0))), ...);
        return word;
    }

    iSerializableTarget& target_;
    tStatus& status_;
};

}  // namespace nQVPTP000

#endif
