#ifndef QV_PTP_TLVS_TORGANIZATIONEXTENSIONTLV_H
#define QV_PTP_TLVS_TORGANIZATIONEXTENSIONTLV_H

#include <array>
#include <cstdint>

#include "ptp/tTLV.h"

namespace nQVPTP000 {

// An ORGANIZATION_EXTENSION TLV: organizationId and organizationSubType (three octets each,
// most significant first), then a dataField that each organization's class supplies.
// lengthField counts the two identifiers and the dataField.
class tOrganizationExtensionTLV : public tTLV {
  public:
    static constexpr std::uint16_t kIdentifiersSize = 6;

    tOrganizationExtensionTLV() : tTLV(kOrganizationExtension) {}

    // `length` is the dataField's size: the identifiers' six octets are added here.
    std::uint16_t setDataLength(std::uint16_t length, tStatus& status,
                                std::uint16_t alignment) override;
    void deserializeValue(iSerializableTarget& source, tStatus& status) override;
    void serializeValue(iSerializableTarget& target, tStatus& status) const override;

    virtual void deserializeDataField(iSerializableTarget& source, tStatus& status) = 0;
    virtual void serializeDataField(iSerializableTarget& target, tStatus& status) const = 0;

    std::uint32_t getOrganizationId() const { return toNumber(organizationId_); }
    std::uint32_t getOrganizationSubType() const { return toNumber(organizationSubType_); }
    // Each stores the low 24 bits of `value`, unless the status holds an error.
    void setOrganizationId(std::uint32_t value, tStatus& status);
    void setOrganizationSubType(std::uint32_t value, tStatus& status);

  protected:
    tOrganizationExtensionTLV(const tOrganizationExtensionTLV&) = default;
    tOrganizationExtensionTLV& operator=(const tOrganizationExtensionTLV&) = default;

  private:
    using tIdentifier = std::array<std::uint8_t, 3>;
    static std::uint32_t toNumber(const tIdentifier& octets);
    static void store(tIdentifier& octets, std::uint32_t value, tStatus& status);

    tIdentifier organizationId_{};
    tIdentifier organizationSubType_{};
};

}  // namespace nQVPTP000

#endif
