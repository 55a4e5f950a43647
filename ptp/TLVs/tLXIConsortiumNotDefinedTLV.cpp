#include "ptp/TLVs/tLXIConsortiumNotDefinedTLV.h"

#include <algorithm>
#include <new>

#include "platform/tTrace.h"

namespace nQVPTP000 {

namespace {

// Data is read in pieces that double in size, so that memory grows only with octets that
// the datagram really holds, whatever the lengthField claims.
constexpr std::size_t kFirstPiece = 256;

}  // namespace

tLXIConsortiumNotDefinedTLV::tLXIConsortiumNotDefinedTLV() {
    tStatus status;
    setOrganizationId(kLXIConsortium, status);
    setOrganizationSubType(kNotDefined, status);
    setDataLength(0, status, 1);
}

tLXIConsortiumNotDefinedTLV::tLXIConsortiumNotDefinedTLV(const tLXIConsortiumNotDefinedTLV& other)
    : tOrganizationExtensionTLV(other) {
    try {
        data_ = other.data_;
    } catch (const std::bad_alloc&) {
        data_.clear();
    }
    tStatus status;
    setDataLength(getDataLength(), status, 1);
}

void tLXIConsortiumNotDefinedTLV::trace(nQVTARN000::tTrace& trace) const {
    trace.append("LXI Consortium NOT_DEFINED TLV data field: ");
    trace.append(reinterpret_cast<const char*>(data_.data()), data_.size());
    trace.append("\n");
}

std::unique_ptr<tTLV> tLXIConsortiumNotDefinedTLV::clone(tStatus& status) const {
    return cloneWith(status,
                     [this] { return std::make_unique<tLXIConsortiumNotDefinedTLV>(*this); });
}

void tLXIConsortiumNotDefinedTLV::deserializeDataField(iSerializableTarget& source,
                                                       tStatus& status) {
    if (status.failed()) {
        return;
    }
    if (getLengthField() < kIdentifiersSize) {
        QV_STATUS_SET(status, kStatusBadContent, kComponentCodec);
        return;
    }
    const std::size_t length = getLengthField() - kIdentifiersSize;
    std::vector<std::uint8_t> data;
    try {
        std::size_t piece = kFirstPiece;
        while (data.size() < length && status.succeeded()) {
            const std::size_t start = data.size();
            data.resize(start + std::min(piece, length - start));
            source.readOctets(data.data() + start, data.size() - start, status);
            piece *= 2;
        }
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    if (status.succeeded()) {
        data_.swap(data);
    }
}

void tLXIConsortiumNotDefinedTLV::serializeDataField(iSerializableTarget& target,
                                                     tStatus& status) const {
    if (!data_.empty()) {
        target.writeOctets(data_.data(), data_.size(), status);
    }
}

}  // namespace nQVPTP000
