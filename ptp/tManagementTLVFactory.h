#ifndef QV_PTP_TMANAGEMENTTLVFACTORY_H
#define QV_PTP_TMANAGEMENTTLVFACTORY_H

#include <memory>

#include "ptp/iSerializableTarget.h"
#include "ptp/tManagementTLV.h"

namespace nQVPTP000 {

// Builds a MANAGEMENT TLV of the class that the management id table gives for its id.
class tManagementTLVFactory {
  public:
    // Called with the source just after the tlvType. Returns the TLV, owned by the caller,
    // or null: -52005 for a management id the codec does not build (its dataField is
    // skipped undecoded, so that it is never taken for further TLVs), -52012 when the
    // datagram ends.
    static std::unique_ptr<tManagementTLV> createManagementTLV(iSerializableTarget& source,
                                                               tStatus& status);
};

}  // namespace nQVPTP000

#endif
