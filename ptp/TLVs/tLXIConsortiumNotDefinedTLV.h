#ifndef QV_PTP_TLVS_TLXICONSORTIUMNOTDEFINEDTLV_H
#define QV_PTP_TLVS_TLXICONSORTIUMNOTDEFINEDTLV_H

#include <cstdint>
#include <vector>

#include "ptp/TLVs/tOrganizationExtensionTLV.h"

namespace nQVPTP000 {

// The LXI Consortium's NOT_DEFINED organization extension: opaque data octets.
class tLXIConsortiumNotDefinedTLV final : public tOrganizationExtensionTLV {
  public:
    static constexpr std::uint32_t kLXIConsortium = 0x0021D6;
    static constexpr std::uint32_t kNotDefined = 0xFFFFFF;

    tLXIConsortiumNotDefinedTLV();
    // A copy whose data cannot be allocated is left without data.
    tLXIConsortiumNotDefinedTLV(const tLXIConsortiumNotDefinedTLV& other);
    tLXIConsortiumNotDefinedTLV& operator=(const tLXIConsortiumNotDefinedTLV&) = delete;

    // "LXI Consortium NOT_DEFINED TLV data field: " and the data as raw characters.
    void trace(nQVTARN000::tTrace& trace) const override;
    std::unique_ptr<tTLV> clone(tStatus& status) const override;
    // Reads lengthField - 6 data octets. A lengthField below 6 cannot hold the identifiers
    // and is refused with -52002. A read that fails keeps the previous data.
    void deserializeDataField(iSerializableTarget& source, tStatus& status) override;
    void serializeDataField(iSerializableTarget& target, tStatus& status) const override;

    const std::vector<std::uint8_t>& getData() const { return data_; }
    std::uint16_t getDataLength() const { return static_cast<std::uint16_t>(data_.size()); }

  private:
    std::vector<std::uint8_t> data_;
};

}  // namespace nQVPTP000

#endif
