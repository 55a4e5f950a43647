#ifndef QV_PTP_TLVS_TUSERDESCRIPTIONTLV_H
#define QV_PTP_TLVS_TUSERDESCRIPTIONTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tPTPText.h"

namespace nQVPTP000 {

// USER_DESCRIPTION: the clock's user-given name and location, padded to an even length.
class tUserDescriptionTLV final : public tDataFieldTLV<tUserDescriptionTLV> {
  public:
    tUserDescriptionTLV();
    tUserDescriptionTLV(const tUserDescriptionTLV&) = default;
    tUserDescriptionTLV& operator=(const tUserDescriptionTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.userDescription_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    void deserializeDataField(iSerializableTarget& source, tStatus& status) override;
    void serializeDataField(iSerializableTarget& target, tStatus& status) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    tPTPText getUserDescription() const { return userDescription_; }
    void setUserDescription(const tPTPText& userDescription, tStatus& status);

  private:
    bool padNeeded() const { return userDescription_.getSize() % 2 != 0; }

    tPTPText userDescription_;
};

}  // namespace nQVPTP000

#endif
