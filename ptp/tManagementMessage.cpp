#include "ptp/tManagementMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

namespace {
// actionField values from here on are reserved by IEEE 1588-2008.
constexpr std::uint32_t kFirstReservedAction = 5;
}  // namespace

tManagementMessage::tManagementMessage(tStatus& status) : tPTPMessage(status) {
    if (complete()) {
        getHeader()->setMessageType(tMessageHeader::kManagement, status);
        getHeader()->setMessageLength(getSize(), status);
    }
}

tManagementMessage::tManagementMessage(std::unique_ptr<tMessageHeader> header,
                                       iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tManagementMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Management Message ---\n");
    traceHeader(trace);
    trace.append("targetPortIdentity: ").append(targetPortIdentity_);
    trace.appendFormatted("startingBoundaryHops: %u ", startingBoundaryHops_);
    trace.appendFormatted("boundaryHops: %u ", boundaryHops_);
    trace.appendFormatted("actionField: %#.1x ", actionField_);
    traceSuffix(trace);
    trace.append("--- End Management Message ---\n");
}

void tManagementMessage::setActionField(std::uint32_t actionField, tStatus& status) {
    if (status.succeeded()) {
        actionField_ = actionField;
    }
}

void tManagementMessage::setTargetPortIdentity(const tPortIdentity& identity, tStatus& status) {
    if (status.succeeded()) {
        targetPortIdentity_ = identity;
    }
}

void tManagementMessage::setPayload(std::unique_ptr<tManagementMessagePayload> payload,
                                    tStatus& status) {
    if (status.failed() || !complete()) {
        return;
    }
    getSuffix()->clear(status);
    getSuffix()->addTLV(std::move(payload), status);
    getHeader()->setMessageLength(getSize(), status);
}

tManagementMessagePayload* tManagementMessage::getPayload(tStatus& status) const {
    if (getSuffix() == nullptr) {
        QV_STATUS_SET(status, kStatusNoTlvList, kComponentCodec);
        return nullptr;
    }
    tTLV* first = getSuffix()->getTLV(0, status);
    if (first == nullptr) {
        return nullptr;
    }
    // A received message may begin with an organization extension, which is no payload.
    auto* payload = dynamic_cast<tManagementMessagePayload*>(first);
    if (payload == nullptr) {
        QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
    }
    return payload;
}

void tManagementMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    std::uint8_t reserved = 0;
    std::uint8_t actionField = 0;
    targetPortIdentity_.deserialize(source, status);
    source.readUInteger8(startingBoundaryHops_, status);
    source.readUInteger8(boundaryHops_, status);
    source.readEnumeration4(reserved, status);
    source.readEnumeration4(actionField, status);
    if (status.succeeded() && actionField >= kFirstReservedAction) {
        QV_STATUS_SET(status, kStatusBadContent, kComponentCodec);
    }
    if (status.succeeded()) {
        actionField_ = actionField;
    }
    source.readUInteger8(reserved, status);
}

void tManagementMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    targetPortIdentity_.serialize(target, status);
    target.writeUInteger8(startingBoundaryHops_, status);
    target.writeUInteger8(boundaryHops_, status);
    target.writeEnumeration4(0, status);
    target.writeEnumeration4(static_cast<std::uint8_t>(actionField_), status);
    target.writeUInteger8(0, status);
}

}  // namespace nQVPTP000
