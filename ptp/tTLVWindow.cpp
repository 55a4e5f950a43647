#include "ptp/tTLVWindow.h"

#include <algorithm>

namespace nQVPTP000 {

bool tTLVWindow::admitBits(std::uint64_t bits, tStatus& status) {
    if (status.failed()) {
        return false;
    }
    if (bits > limitBits_ - usedBits_) {
        overrun_ = true;
        QV_STATUS_SET(status, kStatusNoData, kComponentCodec);
        return false;
    }
    usedBits_ += bits;
    return true;
}

bool tTLVWindow::admitOctets(std::uint64_t octets, tStatus& status) {
    if (status.failed()) {
        return false;
    }
    const std::uint64_t aligned = (usedBits_ + 7) / 8 * 8;
    if (aligned > limitBits_ || octets > (limitBits_ - aligned) / 8) {
        overrun_ = true;
        QV_STATUS_SET(status, kStatusNoData, kComponentCodec);
        return false;
    }
    usedBits_ = aligned + octets * 8;
    return true;
}

void tTLVWindow::skipRest(tStatus& status) {
    std::uint8_t scratch[64];
    std::uint64_t rest = (limitBits_ - std::min(limitBits_, (usedBits_ + 7) / 8 * 8)) / 8;
    while (rest != 0 && status.succeeded()) {
        const auto count = static_cast<std::size_t>(std::min<std::uint64_t>(rest, sizeof scratch));
        source_.readOctets(scratch, count, status);
        rest -= count;
    }
    usedBits_ = limitBits_;
}

void tTLVWindow::close(tStatus& status) {
    // A field the TLV class refused (-52002) makes the TLV malformed, not the datagram.
    const bool malformed =
        (overrun_ && status.code == kStatusNoData) || status.code == kStatusBadContent;
    if (status.failed() && status.code != kStatusUnsupported && !malformed) {
        return;  // the datagram itself ended, or something worse
    }
    const tStatus outcome = status;
    status.reset();
    skipRest(status);
    if (status.failed()) {
        return;
    }
    if (malformed) {
        QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
    } else {
        status = outcome;
    }
}

// Writes go straight through: the window only ever bounds reading.
void tTLVWindow::writeBoolean(bool value, tStatus& status) {
    source_.writeBoolean(value, status);
}
void tTLVWindow::writeEnumeration4(std::uint8_t value, tStatus& status) {
    source_.writeEnumeration4(value, status);
}
void tTLVWindow::writeEnumeration8(std::uint8_t value, tStatus& status) {
    source_.writeEnumeration8(value, status);
}
void tTLVWindow::writeEnumeration16(std::uint16_t value, tStatus& status) {
    source_.writeEnumeration16(value, status);
}
void tTLVWindow::writeUInteger4(std::uint8_t value, tStatus& status) {
    source_.writeUInteger4(value, status);
}
void tTLVWindow::writeUInteger8(std::uint8_t value, tStatus& status) {
    source_.writeUInteger8(value, status);
}
void tTLVWindow::writeUInteger16(std::uint16_t value, tStatus& status) {
    source_.writeUInteger16(value, status);
}
void tTLVWindow::writeUInteger32(std::uint32_t value, tStatus& status) {
    source_.writeUInteger32(value, status);
}
void tTLVWindow::writeUInteger48(std::uint64_t value, tStatus& status) {
    source_.writeUInteger48(value, status);
}
void tTLVWindow::writeInteger8(std::int8_t value, tStatus& status) {
    source_.writeInteger8(value, status);
}
void tTLVWindow::writeInteger16(std::int16_t value, tStatus& status) {
    source_.writeInteger16(value, status);
}
void tTLVWindow::writeInteger32(std::int32_t value, tStatus& status) {
    source_.writeInteger32(value, status);
}
void tTLVWindow::writeInteger64(std::int64_t value, tStatus& status) {
    source_.writeInteger64(value, status);
}
void tTLVWindow::writeNibble(std::uint8_t value, tStatus& status) {
    source_.writeNibble(value, status);
}
void tTLVWindow::writeOctet(std::uint8_t value, tStatus& status) {
    source_.writeOctet(value, status);
}
void tTLVWindow::writeOctets(const std::uint8_t* octets, std::size_t count, tStatus& status) {
    source_.writeOctets(octets, count, status);
}

void tTLVWindow::readBoolean(bool& value, tStatus& status) {
    if (admitBits(1, status)) {
        source_.readBoolean(value, status);
    }
}
void tTLVWindow::readEnumeration4(std::uint8_t& value, tStatus& status) {
    if (admitBits(4, status)) {
        source_.readEnumeration4(value, status);
    }
}
void tTLVWindow::readUInteger4(std::uint8_t& value, tStatus& status) {
    if (admitBits(4, status)) {
        source_.readUInteger4(value, status);
    }
}
void tTLVWindow::readNibble(std::uint8_t& value, tStatus& status) {
    if (admitBits(4, status)) {
        source_.readNibble(value, status);
    }
}
void tTLVWindow::readEnumeration8(std::uint8_t& value, tStatus& status) {
    if (admitOctets(1, status)) {
        source_.readEnumeration8(value, status);
    }
}
void tTLVWindow::readEnumeration16(std::uint16_t& value, tStatus& status) {
    if (admitOctets(2, status)) {
        source_.readEnumeration16(value, status);
    }
}
void tTLVWindow::readUInteger8(std::uint8_t& value, tStatus& status) {
    if (admitOctets(1, status)) {
        source_.readUInteger8(value, status);
    }
}
void tTLVWindow::readUInteger16(std::uint16_t& value, tStatus& status) {
    if (admitOctets(2, status)) {
        source_.readUInteger16(value, status);
    }
}
void tTLVWindow::readUInteger32(std::uint32_t& value, tStatus& status) {
    if (admitOctets(4, status)) {
        source_.readUInteger32(value, status);
    }
}
void tTLVWindow::readUInteger48(std::uint64_t& value, tStatus& status) {
    if (admitOctets(6, status)) {
        source_.readUInteger48(value, status);
    }
}
void tTLVWindow::readInteger8(std::int8_t& value, tStatus& status) {
    if (admitOctets(1, status)) {
        source_.readInteger8(value, status);
    }
}
void tTLVWindow::readInteger16(std::int16_t& value, tStatus& status) {
    if (admitOctets(2, status)) {
        source_.readInteger16(value, status);
    }
}
void tTLVWindow::readInteger32(std::int32_t& value, tStatus& status) {
    if (admitOctets(4, status)) {
        source_.readInteger32(value, status);
    }
}
void tTLVWindow::readInteger64(std::int64_t& value, tStatus& status) {
    if (admitOctets(8, status)) {
        source_.readInteger64(value, status);
    }
}
void tTLVWindow::readOctet(std::uint8_t& value, tStatus& status) {
    if (admitOctets(1, status)) {
        source_.readOctet(value, status);
    }
}
void tTLVWindow::readOctets(std::uint8_t* octets, std::size_t count, tStatus& status) {
    if (admitOctets(count, status)) {
        source_.readOctets(octets, count, status);
    }
}

}  // namespace nQVPTP000
