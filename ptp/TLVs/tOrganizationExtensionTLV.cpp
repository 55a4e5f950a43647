#include "ptp/TLVs/tOrganizationExtensionTLV.h"

namespace nQVPTP000 {

std::uint16_t tOrganizationExtensionTLV::setDataLength(std::uint16_t length, tStatus& status,
                                                       std::uint16_t alignment) {
    return tTLV::setDataLength(static_cast<std::uint16_t>(length + kIdentifiersSize), status,
                               alignment);
}

void tOrganizationExtensionTLV::deserializeValue(iSerializableTarget& source, tStatus& status) {
    source.readOctets(organizationId_.data(), organizationId_.size(), status);
    source.readOctets(organizationSubType_.data(), organizationSubType_.size(), status);
    deserializeDataField(source, status);
}

void tOrganizationExtensionTLV::serializeValue(iSerializableTarget& target, tStatus& status) const {
    target.writeOctets(organizationId_.data(), organizationId_.size(), status);
    target.writeOctets(organizationSubType_.data(), organizationSubType_.size(), status);
    serializeDataField(target, status);
}

void tOrganizationExtensionTLV::setOrganizationId(std::uint32_t value, tStatus& status) {
    store(organizationId_, value, status);
}

void tOrganizationExtensionTLV::setOrganizationSubType(std::uint32_t value, tStatus& status) {
    store(organizationSubType_, value, status);
}

std::uint32_t tOrganizationExtensionTLV::toNumber(const tIdentifier& octets) {
    return std::uint32_t{octets[0]} << 16 | std::uint32_t{octets[1]} << 8 | octets[2];
}

void tOrganizationExtensionTLV::store(tIdentifier& octets, std::uint32_t value, tStatus& status) {
    if (status.failed()) {
        return;
    }
    octets = {static_cast<std::uint8_t>(value >> 16), static_cast<std::uint8_t>(value >> 8),
              static_cast<std::uint8_t>(value)};
}

}  // namespace nQVPTP000
