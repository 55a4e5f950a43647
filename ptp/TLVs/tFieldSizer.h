#ifndef QV_PTP_TLVS_TFIELDSIZER_H
#define QV_PTP_TLVS_TFIELDSIZER_H

#include <array>
#include <cstdint>
#include <type_traits>
#include <vector>

#include "ptp/TLVs/tFlagBit.h"
#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// The field walk that measures a data field: the octets its fields take on the wire, so that
// every lengthField follows from the same field list that encodes and decodes.
class tFieldSizer {
  public:
    template <typename T>
    void field(const T& value) {
        if constexpr (std::is_base_of_v<iPTPSerializable, T>) {
            add(value.getSize());
        } else {
            static_assert(std::is_integral_v<T>, "no wire form for this field type");
            add(sizeof(T));
        }
    }
    void reserved(unsigned octets) { add(octets); }
    template <typename... Flags>
    void flags8(tFlagBit<Flags>...) {
        add(1);
    }
    template <typename... Flags>
    void flags16(tFlagBit<Flags>...) {
        add(2);
    }
    void lowNibble(const std::uint8_t&) { add(1); }
    template <std::size_t N>
    void octets(const std::array<std::uint8_t, N>&) {
        add(N);
    }
    void octetArray(const std::vector<std::uint8_t>& value, std::uint16_t) { add(value.size()); }

    // 16-bit, as lengthField: a sum beyond it wraps as the wire field would.
    std::uint16_t size() const { return static_cast<std::uint16_t>(size_); }

  private:
    void add(std::size_t octets) { size_ += octets; }
    std::size_t size_ = 0;
};

}  // namespace nQVPTP000

#endif
