#include "ptp/TLVs/tNullManagementTLV.h"

#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tNullManagementTLV::tNullManagementTLV() : tManagementTLV(kNullManagement) {
    tStatus scratch;
    setDataLength(0, scratch, 1);
}

std::unique_ptr<tTLV> tNullManagementTLV::clone(tStatus& status) const {
    return cloneWith(status, [this] { return std::make_unique<tNullManagementTLV>(*this); });
}

tManagementMessagePayload* tNullManagementTLV::respondToGet(iManagedClock&, std::uint16_t,
                                                            tStatus& status) {
    return status.failed() ? nullptr : this;
}

tManagementMessagePayload* tNullManagementTLV::respondToSet(iManagedClock&, std::uint16_t,
                                                            tStatus& status) {
    return status.failed() ? nullptr : this;
}

tManagementMessagePayload* tNullManagementTLV::respondToCommand(iManagedClock&, std::uint16_t,
                                                                tStatus& status) {
    return status.failed() ? nullptr : this;
}

}  // namespace nQVPTP000
