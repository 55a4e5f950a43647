#ifndef QV_PTP_TPROTOCOLDATAUNIT_H
#define QV_PTP_TPROTOCOLDATAUNIT_H

#include <cstddef>
#include <cstdint>
#include <memory>

#include "ptp/iSerializableTarget.h"

namespace nQVPTP000 {

// One datagram as it goes on the wire: a growable octet buffer with a write position and a
// read position counted in bits, so that the sub-octet fields of IEEE 1588-2008 pack without
// the objects doing bit arithmetic. Bit fields fill an octet from its most significant bit
// down; numbers are big-endian; a whole-octet field starts on the next octet boundary.
//
// A read past the written data records -52012 before anything is consumed: the codec relies
// on exactly that code as its end-of-data signal.
class tProtocolDataUnit final : public iSerializableTarget {
  public:
    static constexpr std::uint64_t kInitialCapacity = 256;

    explicit tProtocolDataUnit(tStatus& status);
    ~tProtocolDataUnit() override = default;
    tProtocolDataUnit(const tProtocolDataUnit&) = delete;
    tProtocolDataUnit& operator=(const tProtocolDataUnit&) = delete;

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

    // Both positions back to 0; the buffer is kept but its old contents are unreadable.
    void reset();
    // Octets written: the write position rounded up to whole octets.
    std::uint64_t getLength() const { return (writeBits_ + 7) / 8; }
    const std::uint8_t* getBuffer() const { return buffer_.get(); }
    std::uint64_t getCapacity() const { return capacity_; }

  private:
    bool refuseWrite(tStatus& status);
    bool grow(std::uint64_t neededOctets, tStatus& status);
    void writeBits(std::uint8_t value, unsigned width, tStatus& status);
    void writeNumber(std::uint64_t value, unsigned octets, tStatus& status);
    bool readBits(std::uint8_t& value, unsigned width, tStatus& status);
    bool readNumber(std::uint64_t& value, unsigned octets, tStatus& status);
    template <typename T>
    void readAs(T& value, unsigned octets, tStatus& status);
    bool reserveRead(std::uint64_t count, std::uint64_t& start, tStatus& status);

    std::unique_ptr<std::uint8_t[]> buffer_;
    std::uint64_t capacity_ = 0;   // octets allocated
    std::uint64_t writeBits_ = 0;  // bits written, also the extent of readable data
    std::uint64_t readBits_ = 0;   // read cursor
    // Set when the buffer could not be obtained or grown: the unit then refuses every write,
    // whatever status it is later used with.
    bool unusable_ = false;
};

}  // namespace nQVPTP000

#endif
