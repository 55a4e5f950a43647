#include "ptp/TLVs/tClockDescriptionTLV.h"

#include <algorithm>
#include <new>

#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

namespace {
constexpr std::uint16_t kClockTypeOrdinary = 0x8000;
constexpr std::uint16_t kClockTypeBoundary = 0x4000;
constexpr std::uint16_t kClockTypeP2p = 0x2000;
constexpr std::uint16_t kClockTypeE2e = 0x1000;
constexpr std::uint16_t kClockTypeManagement = 0x0800;
}  // namespace

tClockDescriptionTLV::tClockDescriptionTLV() : tDataFieldTLV(kClockDescription) {
    tStatus scratch;
    updatePad(scratch);
}

tClockDescriptionTLV::tClockDescriptionTLV(const tClockDescriptionTLV& other)
    : tDataFieldTLV(other),
      managementNode_(other.managementNode_),
      ordinaryClock_(other.ordinaryClock_),
      p2pTransparentClock_(other.p2pTransparentClock_),
      e2eTransparentClock_(other.e2eTransparentClock_),
      boundaryClock_(other.boundaryClock_),
      physicalLayerProtocol_(other.physicalLayerProtocol_),
      physicalAddressLength_(other.physicalAddressLength_),
      physicalAddress_(other.physicalAddress_),
      protocolAddress_(other.protocolAddress_),
      manufacturerIdentity_(other.manufacturerIdentity_),
      productDescription_(other.productDescription_),
      revisionData_(other.revisionData_),
      userDescription_(other.userDescription_),
      profileIdentity_(other.profileIdentity_) {
    tStatus scratch;
    updatePad(scratch);
}

void tClockDescriptionTLV::updatePad(tStatus& status) {
    padNeeded_ = setDataLength(dataFieldSize(), status, 2) != 0;
}

void tClockDescriptionTLV::deserializeDataField(iSerializableTarget& source, tStatus& status) {
    tFieldReader reader(source, status);
    walk(*this, reader);
    if (status.failed()) {
        return;
    }
    updatePad(status);
    if (padNeeded_) {
        reader.reserved(1);
    }
}

void tClockDescriptionTLV::serializeDataField(iSerializableTarget& target, tStatus& status) const {
    tFieldWriter writer(target, status);
    walk(*this, writer);
    if (padNeeded_) {
        writer.reserved(1);
    }
}

void tClockDescriptionTLV::fillFrom(iManagedClock& clock, std::uint16_t port,
                                    tStatus& clockStatus) {
    const std::uint16_t clockType = clock.getClockType(port, clockStatus);
    ordinaryClock_ = (clockType & kClockTypeOrdinary) != 0;
    boundaryClock_ = (clockType & kClockTypeBoundary) != 0;
    p2pTransparentClock_ = (clockType & kClockTypeP2p) != 0;
    e2eTransparentClock_ = (clockType & kClockTypeE2e) != 0;
    managementNode_ = (clockType & kClockTypeManagement) != 0;
    physicalLayerProtocol_ = clock.getPhysicalLayerProtocol(port, clockStatus);
    const std::span<const std::uint8_t> address = clock.getPhysicalAddress(port, clockStatus);
    protocolAddress_ = clock.getProtocolAddress(port, clockStatus);
    manufacturerIdentity_ = clock.getManufacturerIdentity(port, clockStatus);
    productDescription_ = clock.getProductDescription(port, clockStatus);
    revisionData_ = clock.getRevisionData(port, clockStatus);
    userDescription_ = clock.getUserDescription(clockStatus);
    profileIdentity_ = clock.getProfileIdentity(port, clockStatus);
    if (clockStatus.failed()) {
        return;
    }
    // An address longer than its 16-bit length field can say is cut to what it can say.
    const std::size_t length = std::min<std::size_t>(address.size(), 0xFFFF);
    physicalAddress_.assign(address.begin(), address.begin() + static_cast<std::ptrdiff_t>(length));
    physicalAddressLength_ = static_cast<std::uint16_t>(length);
}

tManagementMessagePayload* tClockDescriptionTLV::respondToGet(iManagedClock& clock,
                                                              std::uint16_t port, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    try {
        fillFrom(clock, port, clockStatus);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return nullptr;
    }
    updatePad(status);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
