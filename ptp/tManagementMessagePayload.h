#ifndef QV_PTP_TMANAGEMENTMESSAGEPAYLOAD_H
#define QV_PTP_TMANAGEMENTMESSAGEPAYLOAD_H

#include <cstdint>
#include <memory>

#include "ptp/iManagedClock.h"
#include "ptp/tTLV.h"

namespace nQVPTP000 {

// What a management message carries: a management TLV or an error status.
//
// The responder operations answer a request against a managed clock. Each returns the
// payload of the answer: either this TLV itself, filled in (the pointer equals `this` and
// stays owned by its holder), or a new TLV that the caller owns. `respond` wraps that rule
// and always hands the caller an answer it owns.
class tManagementMessagePayload : public tTLV {
  public:
    enum tActionField : std::uint32_t {
        kGet = 0,
        kSet = 1,
        kResponse = 2,
        kCommand = 3,
        kAcknowledge = 4,
    };

    using tTLV::tTLV;

    virtual std::uint16_t getManagementId() const = 0;
    virtual void setManagementId(std::uint16_t managementId, tStatus& status) = 0;
    // The shared answer to an operation a class does not support: an error status
    // NOT_SUPPORTED, "Unsupported actionField".
    virtual tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                                    tStatus& status);
    virtual tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                                    tStatus& status);
    virtual tManagementMessagePayload* respondToCommand(iManagedClock& clock, std::uint16_t port,
                                                        tStatus& status);

    // The answer to a request with `actionField` (GET, SET or COMMAND), owned by the caller;
    // null when the status holds an error or memory runs out (-52000).
    std::unique_ptr<tManagementMessagePayload> respond(std::uint32_t actionField,
                                                       iManagedClock& clock, std::uint16_t port,
                                                       tStatus& status);

  protected:
    std::unique_ptr<tManagementMessagePayload> dispatch(std::uint32_t actionField,
                                                        iManagedClock& clock, std::uint16_t port,
                                                        tStatus& status);
    tManagementMessagePayload(const tManagementMessagePayload&) = default;
    tManagementMessagePayload& operator=(const tManagementMessagePayload&) = default;

    // A new error status about this TLV's management id; -52000 and null without memory.
    tManagementMessagePayload* errorAnswer(std::uint16_t managementErrorId, const char* text,
                                           tStatus& status) const;
};

}  // namespace nQVPTP000

#endif
