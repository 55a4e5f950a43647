#include "ptp/TLVs/tUserDescriptionTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tUserDescriptionTLV::tUserDescriptionTLV() : tDataFieldTLV(kUserDescription) {
    updateLength(2);
}

void tUserDescriptionTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("user description: ").append(userDescription_).append("\n");
}

void tUserDescriptionTLV::deserializeDataField(iSerializableTarget& source, tStatus& status) {
    tFieldReader reader(source, status);
    walk(*this, reader);
    if (status.failed()) {
        return;
    }
    updateLength(2);
    if (padNeeded()) {
        reader.reserved(1);
    }
}

void tUserDescriptionTLV::serializeDataField(iSerializableTarget& target, tStatus& status) const {
    tFieldWriter writer(target, status);
    walk(*this, writer);
    if (padNeeded()) {
        writer.reserved(1);
    }
}

void tUserDescriptionTLV::setUserDescription(const tPTPText& userDescription, tStatus& status) {
    if (status.failed()) {
        return;
    }
    userDescription_.setText(userDescription.getTextField(), userDescription.getLengthField(),
                             status);
    updateLength(2);
}

tManagementMessagePayload* tUserDescriptionTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                             tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    const tPTPText text = clock.getUserDescription(clockStatus);
    if (clockStatus.succeeded()) {
        userDescription_ = text;
        updateLength(2);
    }
    return answerGet(clockStatus, status);
}

tManagementMessagePayload* tUserDescriptionTLV::respondToSet(iManagedClock& clock, std::uint16_t,
                                                             tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    clock.setUserDescription(userDescription_, clockStatus);
    return answerSet(clockStatus, status);
}

}  // namespace nQVPTP000
