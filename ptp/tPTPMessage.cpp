#include "ptp/tPTPMessage.h"

#include <new>

#include "platform/tTrace.h"

namespace nQVPTP000 {

tPTPMessage::tPTPMessage(tStatus& status) {
    try {
        header_ = std::make_unique<tMessageHeader>();
        suffix_ = std::make_unique<tMessageSuffix>();
    } catch (const std::bad_alloc&) {
        header_.reset();
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
}

tPTPMessage::tPTPMessage(std::unique_ptr<tMessageHeader> header, tStatus& status)
    : header_(std::move(header)) {
    try {
        suffix_ = std::make_unique<tMessageSuffix>();
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
}

tPTPMessage::~tPTPMessage() = default;

// A message that lost its header or suffix to an allocation failure has nothing sound to
// write or read into; saying so keeps the failure from passing as success later.
bool tPTPMessage::refuseIncomplete(tStatus& status) const {
    if (!complete()) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    return status.failed();
}

void tPTPMessage::serialize(iSerializableTarget& target, tStatus& status) const {
    if (refuseIncomplete(status)) {
        return;
    }
    header_->setMessageLength(getSize(), status);
    serializeHeader(target, status);
    serializeBody(target, status);
    serializeSuffix(target, status);
}

void tPTPMessage::deserialize(iSerializableTarget& source, tStatus& status) {
    if (refuseIncomplete(status)) {
        return;
    }
    deserializeHeader(source, status);
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tPTPMessage::assign(const tPTPMessage& other, tStatus& status) {
    if (&other == this || status.failed()) {
        return;
    }
    if (refuseIncomplete(status) || other.refuseIncomplete(status)) {
        return;
    }
    *header_ = *other.header_;
    for (std::size_t i = 0; i < other.suffix_->getCount() && status.succeeded(); ++i) {
        suffix_->addTLV(other.suffix_->getTLV(i, status)->clone(status), status);
    }
}

void tPTPMessage::deserializeHeader(iSerializableTarget& source, tStatus& status) {
    header_->deserialize(source, status);
}

void tPTPMessage::deserializeSuffix(iSerializableTarget& source, tStatus& status) {
    if (suffix_) {
        suffix_->deserialize(source, status);
    }
}

void tPTPMessage::serializeHeader(iSerializableTarget& target, tStatus& status) const {
    header_->serialize(target, status);
}

void tPTPMessage::serializeSuffix(iSerializableTarget& target, tStatus& status) const {
    suffix_->serialize(target, status);
}

std::uint16_t tPTPMessage::sizeWithBody(std::uint16_t bodySize) const {
    if (!complete()) {
        return 0;
    }
    return static_cast<std::uint16_t>(header_->getSize() + bodySize + suffix_->getSize());
}

void tPTPMessage::traceHeader(nQVTARN000::tTrace& trace) const {
    if (header_) {
        trace.append(*header_);
    }
}

void tPTPMessage::traceSuffix(nQVTARN000::tTrace& trace) const {
    if (suffix_) {
        trace.append(*suffix_);
    }
}

}  // namespace nQVPTP000
