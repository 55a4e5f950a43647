#ifndef QV_PTP_TLVS_TMANAGEMENTERRORSTATUSTLV_H
#define QV_PTP_TLVS_TMANAGEMENTERRORSTATUSTLV_H

#include <cstdint>

#include "ptp/tManagementMessagePayload.h"
#include "ptp/tPTPText.h"

namespace nQVPTP000 {

// A MANAGEMENT_ERROR_STATUS TLV: a clock's refusal of a request. Its displayData is
// optional on the wire: a TLV that ends before or inside it decodes with an empty text.
class tManagementErrorStatusTLV final : public tManagementMessagePayload {
  public:
    // managementErrorId values.
    static constexpr std::uint16_t kResponseTooBig = 0x0001;
    static constexpr std::uint16_t kNoSuchId = 0x0002;
    static constexpr std::uint16_t kWrongLength = 0x0003;
    static constexpr std::uint16_t kWrongValue = 0x0004;
    static constexpr std::uint16_t kNotSetable = 0x0005;
    static constexpr std::uint16_t kNotSupported = 0x0006;
    static constexpr std::uint16_t kGeneralError = 0xFFFE;

    tManagementErrorStatusTLV();
    // A text longer than 255 octets keeps its length modulo 256, as the length octet does.
    tManagementErrorStatusTLV(std::uint16_t managementId, std::uint16_t managementErrorId,
                              const char* displayText);
    tManagementErrorStatusTLV(const tManagementErrorStatusTLV&) = default;
    tManagementErrorStatusTLV& operator=(const tManagementErrorStatusTLV&) = default;

    void deserializeValue(iSerializableTarget& source, tStatus& status) override;
    void serializeValue(iSerializableTarget& target, tStatus& status) const override;
    std::unique_ptr<tTLV> clone(tStatus& status) const override;
    std::uint16_t getManagementId() const override { return managementId_; }
    void setManagementId(std::uint16_t managementId, tStatus& status) override;

    std::uint16_t getManagementErrorId() const { return managementErrorId_; }
    const tPTPText& getDisplayData() const { return displayData_; }

  private:
    void updateLength();

    std::uint16_t managementErrorId_ = kNotSupported;
    std::uint16_t managementId_ = 0;
    tPTPText displayData_;
};

}  // namespace nQVPTP000

#endif
