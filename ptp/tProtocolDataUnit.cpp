#include "ptp/tProtocolDataUnit.h"

#include <cstring>
#include <new>
#include <type_traits>

namespace nQVPTP000 {

namespace {

constexpr std::uint64_t octetsFor(std::uint64_t bits) {
    return (bits + 7) / 8;
}

}  // namespace

tProtocolDataUnit::tProtocolDataUnit(tStatus& status) {
    try {
        buffer_ = std::make_unique<std::uint8_t[]>(kInitialCapacity);
        capacity_ = kInitialCapacity;
    } catch (const std::bad_alloc&) {
        unusable_ = true;
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
}

void tProtocolDataUnit::reset() {
    writeBits_ = 0;
    readBits_ = 0;
}

bool tProtocolDataUnit::refuseWrite(tStatus& status) {
    if (unusable_) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    return status.failed();
}

// Doubles the capacity until `neededOctets` fit, keeping the contents. A failure records
// -52000 and leaves the unit refusing writes from then on.
bool tProtocolDataUnit::grow(std::uint64_t neededOctets, tStatus& status) {
    if (neededOctets <= capacity_) {
        return true;
    }
    std::uint64_t capacity = capacity_;
    while (capacity != 0 && capacity < neededOctets) {
        capacity = capacity > (UINT64_MAX >> 1) ? 0 : capacity * 2;
    }
    try {
        if (capacity == 0 || capacity > SIZE_MAX) {
            throw std::bad_alloc();
        }
        auto larger = std::make_unique<std::uint8_t[]>(static_cast<std::size_t>(capacity));
        std::memcpy(larger.get(), buffer_.get(), static_cast<std::size_t>(capacity_));
        buffer_ = std::move(larger);
        capacity_ = capacity;
        return true;
    } catch (const std::bad_alloc&) {
        unusable_ = true;
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return false;
    }
}

void tProtocolDataUnit::writeBits(std::uint8_t value, unsigned width, tStatus& status) {
    if (refuseWrite(status) || !grow(octetsFor(writeBits_ + width), status)) {
        return;
    }
    const unsigned offset = static_cast<unsigned>(writeBits_ % 8);
    std::uint8_t* octet = &buffer_[writeBits_ / 8];
    if (offset == 0) {
        *octet = 0;
    }
    const unsigned field = value & ((1U << width) - 1U);
    const unsigned room = 8 - offset;
    if (width <= room) {
        *octet = static_cast<std::uint8_t>(*octet | (field << (room - width)));
    } else {
        const unsigned rest = width - room;
        *octet = static_cast<std::uint8_t>(*octet | (field >> rest));
        octet[1] = static_cast<std::uint8_t>((field << (8 - rest)) & 0xFFU);
    }
    writeBits_ += width;
}

void tProtocolDataUnit::writeNumber(std::uint64_t value, unsigned octets, tStatus& status) {
    std::uint8_t bigEndian[8];
    for (unsigned i = 0; i < octets; ++i) {
        bigEndian[i] = static_cast<std::uint8_t>(value >> (8 * (octets - 1 - i)));
    }
    writeOctets(bigEndian, octets, status);
}

void tProtocolDataUnit::writeOctets(const std::uint8_t* octets, std::size_t count,
                                    tStatus& status) {
    if (refuseWrite(status)) {
        return;
    }
    const std::uint64_t start = octetsFor(writeBits_);
    if (!grow(count > UINT64_MAX - start ? UINT64_MAX : start + count, status)) {
        return;
    }
    if (count != 0) {
        std::memcpy(&buffer_[start], octets, count);
    }
    writeBits_ = (start + count) * 8;
}

bool tProtocolDataUnit::readBits(std::uint8_t& value, unsigned width, tStatus& status) {
    if (writeBits_ < readBits_ + width) {
        QV_STATUS_SET(status, kStatusNoData, kComponentCodec);
    }
    if (status.failed()) {
        return false;
    }
    const unsigned offset = static_cast<unsigned>(readBits_ % 8);
    const std::uint8_t* octet = &buffer_[readBits_ / 8];
    unsigned window = *octet;
    unsigned windowBits = 8;
    if (offset + width > 8) {
        window = (window << 8) | octet[1];
        windowBits = 16;
    }
    value =
        static_cast<std::uint8_t>((window >> (windowBits - offset - width)) & ((1U << width) - 1U));
    readBits_ += width;
    return true;
}

// Finds where a whole-octet read of `count` octets starts, or records -52012 when the
// octets written do not reach that far. Only complete octets count as written here.
bool tProtocolDataUnit::reserveRead(std::uint64_t count, std::uint64_t& start, tStatus& status) {
    start = octetsFor(readBits_);
    const std::uint64_t available = writeBits_ / 8;
    if (start > available || count > available - start) {
        QV_STATUS_SET(status, kStatusNoData, kComponentCodec);
    }
    return status.succeeded();
}

// Stores an n-octet number in the destination's type, two's complement for the signed ones;
// the destination is untouched when the read fails.
template <typename T>
void tProtocolDataUnit::readAs(T& value, unsigned octets, tStatus& status) {
    std::uint64_t number = 0;
    if (readNumber(number, octets, status)) {
        value = static_cast<T>(static_cast<std::make_unsigned_t<T>>(number));
    }
}

bool tProtocolDataUnit::readNumber(std::uint64_t& value, unsigned octets, tStatus& status) {
    std::uint64_t start = 0;
    if (!reserveRead(octets, start, status)) {
        return false;
    }
    std::uint64_t number = 0;
    for (unsigned i = 0; i < octets; ++i) {
        number = (number << 8) | buffer_[start + i];
    }
    value = number;
    readBits_ = (start + octets) * 8;
    return true;
}

void tProtocolDataUnit::readOctets(std::uint8_t* octets, std::size_t count, tStatus& status) {
    std::uint64_t start = 0;
    if (!reserveRead(count, start, status)) {
        return;
    }
    if (count != 0) {
        std::memcpy(octets, &buffer_[start], count);
    }
    readBits_ = (start + count) * 8;
}

// The typed operations: equal widths behave identically.

void tProtocolDataUnit::writeBoolean(bool value, tStatus& status) {
    writeBits(value ? 1 : 0, 1, status);
}
void tProtocolDataUnit::writeEnumeration4(std::uint8_t value, tStatus& status) {
    writeBits(value, 4, status);
}
void tProtocolDataUnit::writeUInteger4(std::uint8_t value, tStatus& status) {
    writeBits(value, 4, status);
}
void tProtocolDataUnit::writeNibble(std::uint8_t value, tStatus& status) {
    writeBits(value, 4, status);
}
void tProtocolDataUnit::writeEnumeration8(std::uint8_t value, tStatus& status) {
    writeNumber(value, 1, status);
}
void tProtocolDataUnit::writeUInteger8(std::uint8_t value, tStatus& status) {
    writeNumber(value, 1, status);
}
void tProtocolDataUnit::writeOctet(std::uint8_t value, tStatus& status) {
    writeNumber(value, 1, status);
}
void tProtocolDataUnit::writeInteger8(std::int8_t value, tStatus& status) {
    writeNumber(static_cast<std::uint8_t>(value), 1, status);
}
void tProtocolDataUnit::writeEnumeration16(std::uint16_t value, tStatus& status) {
    writeNumber(value, 2, status);
}
void tProtocolDataUnit::writeUInteger16(std::uint16_t value, tStatus& status) {
    writeNumber(value, 2, status);
}
void tProtocolDataUnit::writeInteger16(std::int16_t value, tStatus& status) {
    writeNumber(static_cast<std::uint16_t>(value), 2, status);
}
void tProtocolDataUnit::writeUInteger32(std::uint32_t value, tStatus& status) {
    writeNumber(value, 4, status);
}
void tProtocolDataUnit::writeInteger32(std::int32_t value, tStatus& status) {
    writeNumber(static_cast<std::uint32_t>(value), 4, status);
}
void tProtocolDataUnit::writeUInteger48(std::uint64_t value, tStatus& status) {
    writeNumber(value, 6, status);
}
void tProtocolDataUnit::writeInteger64(std::int64_t value, tStatus& status) {
    writeNumber(static_cast<std::uint64_t>(value), 8, status);
}

void tProtocolDataUnit::readBoolean(bool& value, tStatus& status) {
    std::uint8_t bit = 0;
    if (readBits(bit, 1, status)) {
        value = bit != 0;
    }
}
void tProtocolDataUnit::readEnumeration4(std::uint8_t& value, tStatus& status) {
    readBits(value, 4, status);
}
void tProtocolDataUnit::readUInteger4(std::uint8_t& value, tStatus& status) {
    readBits(value, 4, status);
}
void tProtocolDataUnit::readNibble(std::uint8_t& value, tStatus& status) {
    readBits(value, 4, status);
}

void tProtocolDataUnit::readEnumeration8(std::uint8_t& value, tStatus& status) {
    readAs(value, 1, status);
}
void tProtocolDataUnit::readUInteger8(std::uint8_t& value, tStatus& status) {
    readAs(value, 1, status);
}
void tProtocolDataUnit::readOctet(std::uint8_t& value, tStatus& status) {
    readAs(value, 1, status);
}
void tProtocolDataUnit::readInteger8(std::int8_t& value, tStatus& status) {
    readAs(value, 1, status);
}
void tProtocolDataUnit::readEnumeration16(std::uint16_t& value, tStatus& status) {
    readAs(value, 2, status);
}
void tProtocolDataUnit::readUInteger16(std::uint16_t& value, tStatus& status) {
    readAs(value, 2, status);
}
void tProtocolDataUnit::readInteger16(std::int16_t& value, tStatus& status) {
    readAs(value, 2, status);
}
void tProtocolDataUnit::readUInteger32(std::uint32_t& value, tStatus& status) {
    readAs(value, 4, status);
}
void tProtocolDataUnit::readInteger32(std::int32_t& value, tStatus& status) {
    readAs(value, 4, status);
}
void tProtocolDataUnit::readInteger64(std::int64_t& value, tStatus& status) {
    readAs(value, 8, status);
}
void tProtocolDataUnit::readUInteger48(std::uint64_t& value, tStatus& status) {
    // Zeroed before anything else, even when the read then fails.
    value = 0;
    readAs(value, 6, status);
}

}  // namespace nQVPTP000
