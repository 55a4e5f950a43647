#ifndef QV_PTP_TLVS_TCOMMANDTLV_H
#define QV_PTP_TLVS_TCOMMANDTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// A management TLV without a data field (lengthField 2), sent as a COMMAND. `Derived`
// gives `static constexpr std::uint16_t kId` and its own respondToCommand.
template <typename Derived>
class tCommandTLV : public tDataFieldTLV<Derived> {
  public:
    template <typename Self, typename Visitor>
    static void walk(Self&, Visitor&) {}

  protected:
    tCommandTLV() : tDataFieldTLV<Derived>(Derived::kId) {
        tStatus scratch;
        this->setDataLength(0, scratch, 1);
    }
    tCommandTLV(const tCommandTLV&) = default;
    tCommandTLV& operator=(const tCommandTLV&) = default;

    // The answer to a command the clock ran with `clockStatus`: the TLV itself, or
    // GENERAL_ERROR with `failureText`.
    tManagementMessagePayload* answerCommand(const tStatus& clockStatus, const char* failureText,
                                             tStatus& status) {
        return this->answer(clockStatus, failureText, status);
    }
};

}  // namespace nQVPTP000

#endif
