#include "ptp/tMessageHeader.h"

#include <cinttypes>

#include "platform/tTrace.h"

namespace nQVPTP000 {

namespace {

using tFlag = tMessageHeader::tFlag;

// The flag octets bit by bit, from bit 7 of octet 6 down to bit 0 of octet 7; a gap is a
// reserved bit, written 0 and ignored on reading.
struct tFlagBit {
    bool reserved;
    tFlag flag;
};
constexpr tFlagBit kReserved{true, tFlag::alternateMaster};
constexpr tFlagBit kWireOrder[16] = {
    {false, tFlag::secure},
    {false, tFlag::profileSpecific2},
    {false, tFlag::profileSpecific1},
    kReserved,
    kReserved,
    {false, tFlag::unicast},
    {false, tFlag::twoStep},
    {false, tFlag::alternateMaster},
    kReserved,
    kReserved,
    {false, tFlag::frequencyTraceable},
    {false, tFlag::timeTraceable},
    {false, tFlag::ptpTimescale},
    {false, tFlag::currentUtcOffsetValid},
    {false, tFlag::leap59},
    {false, tFlag::leap61},
};

constexpr const char* kFlagNames[tMessageHeader::kFlagCount] = {
    "alternateMasterFlag",   "twoStepFlag",  "unicastFlag",   "profileSpecific1",
    "profileSpecific2",      "SECURE",       "leap61",        "leap59",
    "currentUTCOffsetValid", "ptpTimescale", "timeTraceable", "frequencyTraceable",
};

std::uint8_t controlFieldFor(std::uint32_t messageType) {
    switch (messageType) {
        case tMessageHeader::kSync:
            return 0;
        case tMessageHeader::kDelayReq:
            return 1;
        case tMessageHeader::kFollowUp:
            return 2;
        case tMessageHeader::kDelayResp:
            return 3;
        case tMessageHeader::kManagement:
            return 4;
        default:
            return 5;
    }
}

}  // namespace

tMessageHeader::tMessageHeader() = default;

tMessageHeader::tMessageHeader(iSerializableTarget& source, tStatus& status) {
    deserialize(source, status);
}

void tMessageHeader::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Message Header ---\n");
    trace.appendFormatted("transportSpecific: %#.1x\n", transportSpecific_);
    trace.appendFormatted("messageType: %#.1x\n", messageType_);
    trace.appendFormatted("versionPTP: %u\n", versionPTP_);
    trace.appendFormatted("messageLength: %u\n", messageLength_);
    trace.appendFormatted("domainNumber: %u\n", domainNumber_);
    for (std::size_t i = 0; i < kFlagCount; ++i) {
        trace.appendFormatted("%s: %s\n", kFlagNames[i], flags_[i] ? "TRUE" : "FALSE");
    }
    trace.appendFormatted("correctionField: %" PRId64 "\n", correctionField_);
    trace.append("sourcePortIdentity: ").append(sourcePortIdentity_);
    trace.appendFormatted("sequenceId: %u\n", sequenceId_);
    trace.appendFormatted("controlField: %u\n", controlField_);
    trace.appendFormatted("logMessageInterval: %d\n", logMessageInterval_);
    trace.append("--- End Message Header ---\n");
}

void tMessageHeader::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeNibble(transportSpecific_, status);
    target.writeEnumeration4(static_cast<std::uint8_t>(messageType_), status);
    target.writeNibble(0, status);
    target.writeUInteger4(versionPTP_, status);
    target.writeUInteger16(messageLength_, status);
    target.writeUInteger8(domainNumber_, status);
    target.writeOctet(0, status);
    serializeFlags(target, status);
    target.writeInteger64(correctionField_, status);
    for (int i = 0; i < 4; ++i) {
        target.writeOctet(0, status);
    }
    sourcePortIdentity_.serialize(target, status);
    target.writeUInteger16(sequenceId_, status);
    target.writeUInteger8(controlField_, status);
    target.writeInteger8(logMessageInterval_, status);
}

void tMessageHeader::deserialize(iSerializableTarget& source, tStatus& status) {
    std::uint8_t reserved = 0;
    std::uint8_t messageType = 0;
    source.readNibble(transportSpecific_, status);
    source.readEnumeration4(messageType, status);
    source.readNibble(reserved, status);
    source.readUInteger4(versionPTP_, status);
    source.readUInteger16(messageLength_, status);
    source.readUInteger8(domainNumber_, status);
    source.readOctet(reserved, status);
    deserializeFlags(source, status);
    source.readInteger64(correctionField_, status);
    for (int i = 0; i < 4; ++i) {
        source.readOctet(reserved, status);
    }
    sourcePortIdentity_.deserialize(source, status);
    source.readUInteger16(sequenceId_, status);
    source.readUInteger8(controlField_, status);
    source.readInteger8(logMessageInterval_, status);
    if (status.succeeded()) {
        messageType_ = messageType;
    }
}

void tMessageHeader::serializeFlags(iSerializableTarget& target, tStatus& status) const {
    for (const tFlagBit& bit : kWireOrder) {
        target.writeBoolean(!bit.reserved && getFlag(bit.flag), status);
    }
}

void tMessageHeader::deserializeFlags(iSerializableTarget& source, tStatus& status) {
    for (const tFlagBit& bit : kWireOrder) {
        bool value = false;
        source.readBoolean(value, status);
        if (!bit.reserved) {
            flags_[static_cast<unsigned>(bit.flag)] = value;
        }
    }
}

void tMessageHeader::setMessageType(std::uint32_t messageType, tStatus& status) {
    if (status.succeeded()) {
        messageType_ = messageType;
        controlField_ = controlFieldFor(messageType);
    }
}

void tMessageHeader::setDomainNumber(std::uint8_t domainNumber, tStatus& status) {
    if (status.succeeded()) {
        domainNumber_ = domainNumber;
    }
}

void tMessageHeader::setSequenceId(std::uint16_t sequenceId, tStatus& status) {
    if (status.succeeded()) {
        sequenceId_ = sequenceId;
    }
}

void tMessageHeader::setMessageLength(std::uint16_t messageLength, tStatus& status) {
    if (status.succeeded()) {
        messageLength_ = messageLength;
    }
}

void tMessageHeader::setSourcePortIdentity(const tPortIdentity& identity, tStatus& status) {
    if (status.succeeded()) {
        sourcePortIdentity_ = identity;
    }
}

void tMessageHeader::setFlag(tFlag flag, bool value, tStatus& status) {
    if (status.succeeded()) {
        flags_[static_cast<unsigned>(flag)] = value;
    }
}

}  // namespace nQVPTP000
