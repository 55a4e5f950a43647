#include "ptp/tMessageSuffix.h"

#include <new>

#include "platform/tTrace.h"
#include "ptp/tTLVFactory.h"

namespace nQVPTP000 {

tMessageSuffix::~tMessageSuffix() {
    destroyAll();
}

void tMessageSuffix::destroyAll() {
    while (!tlvs_.empty()) {
        tlvs_.pop_back();
    }
}

void tMessageSuffix::trace(nQVTARN000::tTrace& trace) const {
    for (std::size_t i = 0; i < tlvs_.size(); ++i) {
        const auto index = static_cast<unsigned>(i);
        if (!tlvs_[i]) {
            trace.appendFormatted("TLV at index %u is NULL!\n", index);
            continue;
        }
        trace.appendFormatted("--- Begin TLV %u ---", index);
        trace.append(*tlvs_[i]);
        trace.appendFormatted("--- End TLV %u ---", index);
    }
}

void tMessageSuffix::serialize(iSerializableTarget& target, tStatus& status) const {
    for (const auto& tlv : tlvs_) {
        if (status.failed()) {
            return;
        }
        tlv->serialize(target, status);
    }
}

void tMessageSuffix::deserialize(iSerializableTarget& source, tStatus& status) {
    if (status.failed()) {
        return;
    }
    clear(status);
    while (status.succeeded()) {
        std::unique_ptr<tTLV> tlv = tTLVFactory::createTLV(source, status);
        if (status.code == kStatusUnsupported) {
            status.reset();  // a kind the codec does not build, or a malformed TLV: skipped whole
        } else if (tlv) {
            // Added also when the datagram ended inside it (the end stays recorded).
            const tStatus outcome = status;
            status.reset();
            addTLV(std::move(tlv), status);
            if (status.succeeded()) {
                status = outcome;
            }
        }
    }
    if (status.code == kStatusNoData) {
        status.reset();
    }
}

std::uint16_t tMessageSuffix::getSize() const {
    std::uint16_t size = 0;
    for (const auto& tlv : tlvs_) {
        size = static_cast<std::uint16_t>(size + tlv->getSize());
    }
    return size;
}

tTLV* tMessageSuffix::getTLV(std::size_t index, tStatus& status) const {
    if (index < tlvs_.size()) {
        return tlvs_[index].get();
    }
    QV_STATUS_SET(status, kStatusNoData, kComponentCodec);
    return nullptr;
}

void tMessageSuffix::addTLV(std::unique_ptr<tTLV> tlv, tStatus& status) {
    if (status.failed()) {
        return;
    }
    try {
        // The room doubles, starting from one element.
        if (tlvs_.size() == tlvs_.capacity()) {
            tlvs_.reserve(tlvs_.empty() ? 1 : tlvs_.size() * 2);
        }
        tlvs_.push_back(std::move(tlv));
    } catch (const std::bad_alloc&) {
        growthFailed_ = true;
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
}

void tMessageSuffix::clear(tStatus& status) {
    if (status.failed()) {
        return;
    }
    if (growthFailed_ && !tlvs_.empty()) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    destroyAll();
}

}  // namespace nQVPTP000
