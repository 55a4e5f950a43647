#ifndef QV_PTP_ISERIALIZABLETARGET_H
#define QV_PTP_ISERIALIZABLETARGET_H

#include <cstddef>
#include <cstdint>

#include "platform/tStatus.h"

namespace nQVPTP000 {

// Where every PTP object writes its wire form and reads it back: one write and one read per
// IEEE 1588-2008 primitive type, in this slot order. Each operation is a no-op once the
// status holds an error, so an object serializes a chain of fields and its caller tests once.
class iSerializableTarget {
  public:
    virtual ~iSerializableTarget() = default;

    virtual void writeBoolean(bool value, tStatus& status) = 0;
    virtual void writeEnumeration4(std::uint8_t value, tStatus& status) = 0;
    virtual void writeEnumeration8(std::uint8_t value, tStatus& status) = 0;
    virtual void writeEnumeration16(std::uint16_t value, tStatus& status) = 0;
    virtual void writeUInteger4(std::uint8_t value, tStatus& status) = 0;
    virtual void writeUInteger8(std::uint8_t value, tStatus& status) = 0;
    virtual void writeUInteger16(std::uint16_t value, tStatus& status) = 0;
    virtual void writeUInteger32(std::uint32_t value, tStatus& status) = 0;
    virtual void writeUInteger48(std::uint64_t value, tStatus& status) = 0;
    virtual void writeInteger8(std::int8_t value, tStatus& status) = 0;
    virtual void writeInteger16(std::int16_t value, tStatus& status) = 0;
    virtual void writeInteger32(std::int32_t value, tStatus& status) = 0;
    virtual void writeInteger64(std::int64_t value, tStatus& status) = 0;
    virtual void writeNibble(std::uint8_t value, tStatus& status) = 0;
    virtual void writeOctet(std::uint8_t value, tStatus& status) = 0;
    virtual void writeOctets(const std::uint8_t* octets, std::size_t count, tStatus& status) = 0;

    virtual void readBoolean(bool& value, tStatus& status) = 0;
    virtual void readEnumeration4(std::uint8_t& value, tStatus& status) = 0;
    virtual void readEnumeration8(std::uint8_t& value, tStatus& status) = 0;
    virtual void readEnumeration16(std::uint16_t& value, tStatus& status) = 0;
    virtual void readUInteger4(std::uint8_t& value, tStatus& status) = 0;
    virtual void readUInteger8(std::uint8_t& value, tStatus& status) = 0;
    virtual void readUInteger16(std::uint16_t& value, tStatus& status) = 0;
    virtual void readUInteger32(std::uint32_t& value, tStatus& status) = 0;
    virtual void readUInteger48(std::uint64_t& value, tStatus& status) = 0;
    virtual void readInteger8(std::int8_t& value, tStatus& status) = 0;
    virtual void readInteger16(std::int16_t& value, tStatus& status) = 0;
    virtual void readInteger32(std::int32_t& value, tStatus& status) = 0;
    virtual void readInteger64(std::int64_t& value, tStatus& status) = 0;
    virtual void readNibble(std::uint8_t& value, tStatus& status) = 0;
    virtual void readOctet(std::uint8_t& value, tStatus& status) = 0;
    virtual void readOctets(std::uint8_t* octets, std::size_t count, tStatus& status) = 0;
};

}  // namespace nQVPTP000

#endif
