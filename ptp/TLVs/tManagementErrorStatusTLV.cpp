#include "ptp/TLVs/tManagementErrorStatusTLV.h"

#include <cstring>

namespace nQVPTP000 {

namespace {
constexpr std::uint16_t kFixedLength = 8;  // managementErrorId, managementId, reserved
}

tManagementErrorStatusTLV::tManagementErrorStatusTLV()
    : tManagementMessagePayload(kManagementErrorStatus) {
    updateLength();
}

tManagementErrorStatusTLV::tManagementErrorStatusTLV(std::uint16_t managementId,
                                                     std::uint16_t managementErrorId,
                                                     const char* displayText)
    : tManagementMessagePayload(kManagementErrorStatus),
      managementErrorId_(managementErrorId),
      managementId_(managementId) {
    if (displayText != nullptr && *displayText != '\0') {
        tStatus scratch;
        displayData_.setText(reinterpret_cast<const std::uint8_t*>(displayText),
                             static_cast<std::uint8_t>(std::strlen(displayText) % 256), scratch);
    }
    updateLength();
}

void tManagementErrorStatusTLV::updateLength() {
    tStatus scratch;
    setDataLength(static_cast<std::uint16_t>(kFixedLength + displayData_.getSize()), scratch, 2);
}

void tManagementErrorStatusTLV::deserializeValue(iSerializableTarget& source, tStatus& status) {
    std::uint8_t reserved = 0;
    source.readEnumeration16(managementErrorId_, status);
    source.readEnumeration16(managementId_, status);
    for (int i = 0; i < 4; ++i) {
        source.readOctet(reserved, status);
    }
    // The display text and its pad are optional: a TLV that ends before or inside them is
    // still a complete refusal. A TLV cut inside its fixed fields is not.
    if (status.failed()) {
        return;
    }
    if (getLengthField() <= kFixedLength) {
        displayData_ = tPTPText();
        return;
    }
    displayData_.deserialize(source, status);
    if (displayData_.getSize() % 2 != 0) {
        source.readOctet(reserved, status);
    }
    if (status.code == kStatusNoData) {
        status.reset();
    }
}

void tManagementErrorStatusTLV::serializeValue(iSerializableTarget& target, tStatus& status) const {
    target.writeEnumeration16(managementErrorId_, status);
    target.writeEnumeration16(managementId_, status);
    for (int i = 0; i < 4; ++i) {
        target.writeOctet(0, status);
    }
    // A refusal received without a display text is written as it came, so that the octets
    // written always agree with lengthField.
    if (getLengthField() <= kFixedLength) {
        return;
    }
    displayData_.serialize(target, status);
    if (displayData_.getSize() % 2 != 0) {
        target.writeOctet(0, status);
    }
}

std::unique_ptr<tTLV> tManagementErrorStatusTLV::clone(tStatus& status) const {
    return cloneWith(status, [this] { return std::make_unique<tManagementErrorStatusTLV>(*this); });
}

void tManagementErrorStatusTLV::setManagementId(std::uint16_t managementId, tStatus& status) {
    if (status.succeeded()) {
        managementId_ = managementId;
    }
}

}  // namespace nQVPTP000
