#ifndef QV_PTP_TLVS_TFIELDREADER_H
#define QV_PTP_TLVS_TFIELDREADER_H

#include <array>
#include <cstdint>
#include <type_traits>
#include <vector>

#include "ptp/TLVs/tFlagBit.h"
#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// The field walk that reads a data field: each field in wire order from the source. A field
// is stored only when it was read whole, so a status that already holds an error leaves
// every member as it was.
class tFieldReader {
  public:
    tFieldReader(iSerializableTarget& source, tStatus& status) : source_(source), status_(status) {}

    template <typename T>
    void field(T& value) {
        if constexpr (std::is_base_of_v<iPTPSerializable, T>) {
            value.deserialize(source_, status_);
        } else {
            T read = value;
            if constexpr (std::is_same_v<T, std::uint8_t>) {
                source_.readUInteger8(read, status_);
            } else if constexpr (std::is_same_v<T, std::int8_t>) {
                source_.readInteger8(read, status_);
            } else if constexpr (std::is_same_v<T, std::uint16_t>) {
                source_.readUInteger16(read, status_);
            } else if constexpr (std::is_same_v<T, std::int16_t>) {
                source_.readInteger16(read, status_);
            } else {
                static_assert(std::is_same_v<T, std::int32_t>, "no wire form for this field type");
                source_.readInteger32(read, status_);
            }
            store(value, read);
        }
    }

    // Reserved octets are read and ignored.
    void reserved(unsigned octets);

    template <typename... Flags>
    void flags8(tFlagBit<Flags>... bits) {
        std::uint8_t word = 0;
        source_.readUInteger8(word, status_);
        split(word, bits...);
    }

    template <typename... Flags>
    void flags16(tFlagBit<Flags>... bits) {
        std::uint16_t word = 0;
        source_.readUInteger16(word, status_);
        split(word, bits...);
    }

    // An octet whose high nibble is reserved: only the low nibble is kept.
    void lowNibble(std::uint8_t& value);

    template <std::size_t N>
    void octets(std::array<std::uint8_t, N>& value) {
        std::array<std::uint8_t, N> read{};
        source_.readOctets(read.data(), N, status_);
        store(value, read);
    }

    // `count` octets into an array held with its own length field. The octets are taken a
    // block at a time, so memory grows with the octets that are really there and never with
    // what a length field merely claims.
    void octetArray(std::vector<std::uint8_t>& value, std::uint16_t count);

    // Reads and discards `count` octets a block at a time (a record's surplus).
    void skip(std::size_t count);

    tStatus& status() { return status_; }

  private:
    template <typename T>
    void store(T& member, const T& read) {
        if (status_.succeeded()) {
            member = read;
        }
    }

    template <typename Word, typename... Flags>
    void split(Word word, tFlagBit<Flags>... bits) {
        if (status_.succeeded()) {
            ((bits.flag = (word & bits.mask) != 0), ...);
        }
    }

    iSerializableTarget& source_;
    tStatus& status_;
};

}  // namespace nQVPTP000

#endif
