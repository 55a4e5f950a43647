#ifndef QV_PTP_TLVS_TINITIALIZETLV_H
#define QV_PTP_TLVS_TINITIALIZETLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// INITIALIZE: a command that restarts a port, with its initialization key.
class tInitializeTLV final : public tDataFieldTLV<tInitializeTLV> {
  public:
    // The key that asks for the port's INITIALIZE event; other values are refused.
    static constexpr std::uint16_t kInitializeEvent = 0x0000;

    tInitializeTLV() : tInitializeTLV(kInitializeEvent) {}
    explicit tInitializeTLV(std::uint16_t initializationKey);
    tInitializeTLV(const tInitializeTLV&) = default;
    tInitializeTLV& operator=(const tInitializeTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.initializationKey_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToCommand(iManagedClock& clock, std::uint16_t port,
                                                tStatus& status) override;

    std::uint16_t getInitializationKey() const { return initializationKey_; }

  private:
    std::uint16_t initializationKey_;
};

}  // namespace nQVPTP000

#endif
