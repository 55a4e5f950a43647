#ifndef QV_PTP_TTLVWINDOW_H
#define QV_PTP_TTLVWINDOW_H

#include <cstddef>
#include <cstdint>

#include "ptp/iSerializableTarget.h"

namespace nQVPTP000 {

// The value of one received TLV: the `length` octets that its lengthField announces, read
// through the source positioned at the value's first octet.
//
// A TLV class reads its fields as it knows them, which need not match what the sender put
// in lengthField. The window keeps the two in step: a read beyond the announced value is
// refused (the TLV is malformed, not the datagram), and `close` moves the source to the
// value's end, so that the next TLV is read from where it really starts and never from the
// middle of this one.
class tTLVWindow final : public iSerializableTarget {
  public:
    tTLVWindow(iSerializableTarget& source, std::uint16_t length)
        : source_(source), limitBits_(std::uint64_t{length} * 8) {}
    tTLVWindow(const tTLVWindow&) = delete;
    tTLVWindow& operator=(const tTLVWindow&) = delete;

    // Skips what the value left unread. A value that was skipped as unsupported (-52005),
    // that needed more than its lengthField gives, or that its class refused as malformed
    // (-52002) leaves -52005: the TLV is dropped and the next one read. When the datagram
    // ends inside the value, -52012 stays.
    void close(tStatus& status);

    void writeBoolean(bool value, tStatus& status) override;
    void writeEnumeration4(std::uint8_t value, tStatus& status) override;
    void writeEnumeration8(std::uint8_t value, tStatus& status) override;
    void writeEnumeration16(std::uint16_t value, tStatus& status) override;
    void writeUInteger4(std::uint8_t value, tStatus& status) override;
    void writeUInteger8(std::uint8_t value, tStatus& status) override;
    void writeUInteger16(std::uint16_t value, tStatus& status) override;
    void writeUInteger32(std::uint32_t value, tStatus& status) override;
    void writeUInteger48(std::uint64_t value, tStatus& status) override;
    void writeInteger8(std::int8_t value, tStatus& status) override;
    void writeInteger16(std::int16_t value, tStatus& status) override;
    void writeInteger32(std::int32_t value, tStatus& status) override;
    void writeInteger64(std::int64_t value, tStatus& status) override;
    void writeNibble(std::uint8_t value, tStatus& status) override;
    void writeOctet(std::uint8_t value, tStatus& status) override;
    void writeOctets(const std::uint8_t* octets, std::size_t count, tStatus& status) override;

    void readBoolean(bool& value, tStatus& status) override;
    void readEnumeration4(std::uint8_t& value, tStatus& status) override;
    void readEnumeration8(std::uint8_t& value, tStatus& status) override;
    void readEnumeration16(std::uint16_t& value, tStatus& status) override;
    void readUInteger4(std::uint8_t& value, tStatus& status) override;
    void readUInteger8(std::uint8_t& value, tStatus& status) override;
    void readUInteger16(std::uint16_t& value, tStatus& status) override;
    void readUInteger32(std::uint32_t& value, tStatus& status) override;
    void readUInteger48(std::uint64_t& value, tStatus& status) override;
    void readInteger8(std::int8_t& value, tStatus& status) override;
    void readInteger16(std::int16_t& value, tStatus& status) override;
    void readInteger32(std::int32_t& value, tStatus& status) override;
    void readInteger64(std::int64_t& value, tStatus& status) override;
    void readNibble(std::uint8_t& value, tStatus& status) override;
    void readOctet(std::uint8_t& value, tStatus& status) override;
    void readOctets(std::uint8_t* octets, std::size_t count, tStatus& status) override;

  private:
    // Whether `bits` more bits fit in the value; records -52012 when not.
    bool admitBits(std::uint64_t bits, tStatus& status);
    // The same for whole octets, which start on the next octet boundary.
    bool admitOctets(std::uint64_t octets, tStatus& status);
    void skipRest(tStatus& status);

    iSerializableTarget& source_;
    std::uint64_t limitBits_;
    std::uint64_t usedBits_ = 0;
    bool overrun_ = false;  // a read went past the announced value
};

}  // namespace nQVPTP000

#endif
