#include "ptp/tManagementMessagePayload.h"

#include <new>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"

namespace nQVPTP000 {

tManagementMessagePayload* tManagementMessagePayload::errorAnswer(std::uint16_t managementErrorId,
                                                                  const char* text,
                                                                  tStatus& status) const {
    if (status.failed()) {
        return nullptr;
    }
    try {
        return new tManagementErrorStatusTLV(getManagementId(), managementErrorId, text);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return nullptr;
    }
}

tManagementMessagePayload* tManagementMessagePayload::respondToGet(iManagedClock&, std::uint16_t,
                                                                   tStatus& status) {
    return errorAnswer(tManagementErrorStatusTLV::kNotSupported, "Unsupported actionField", status);
}

tManagementMessagePayload* tManagementMessagePayload::respondToSet(iManagedClock&, std::uint16_t,
                                                                   tStatus& status) {
    return errorAnswer(tManagementErrorStatusTLV::kNotSupported, "Unsupported actionField", status);
}

tManagementMessagePayload* tManagementMessagePayload::respondToCommand(iManagedClock&,
                                                                       std::uint16_t,
                                                                       tStatus& status) {
    return errorAnswer(tManagementErrorStatusTLV::kNotSupported, "Unsupported actionField", status);
}

std::unique_ptr<tManagementMessagePayload> tManagementMessagePayload::respond(
    std::uint32_t actionField, iManagedClock& clock, std::uint16_t port, tStatus& status) {
    try {
        return dispatch(actionField, clock, port, status);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return nullptr;
    }
}

std::unique_ptr<tManagementMessagePayload> tManagementMessagePayload::dispatch(
    std::uint32_t actionField, iManagedClock& clock, std::uint16_t port, tStatus& status) {
    tManagementMessagePayload* answer = nullptr;
    switch (actionField) {
        case kGet:
            answer = respondToGet(clock, port, status);
            break;
        case kSet:
            answer = respondToSet(clock, port, status);
            break;
        case kCommand:
            answer = respondToCommand(clock, port, status);
            break;
        default:
            return std::unique_ptr<tManagementMessagePayload>(errorAnswer(
                tManagementErrorStatusTLV::kNotSupported, "Unsupported actionField", status));
    }
    if (answer != this) {
        return std::unique_ptr<tManagementMessagePayload>(answer);
    }
    std::unique_ptr<tTLV> copy = clone(status);
    return std::unique_ptr<tManagementMessagePayload>(
        static_cast<tManagementMessagePayload*>(copy.release()));
}

}  // namespace nQVPTP000
