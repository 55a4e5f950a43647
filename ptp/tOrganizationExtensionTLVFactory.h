#ifndef QV_PTP_TORGANIZATIONEXTENSIONTLVFACTORY_H
#define QV_PTP_TORGANIZATIONEXTENSIONTLVFACTORY_H

#include <cstdint>
#include <memory>

#include "ptp/TLVs/tOrganizationExtensionTLV.h"
#include "ptp/iSerializableTarget.h"

namespace nQVPTP000 {

// Builds the organization extension TLVs that the codec knows: the LXI NOT_DEFINED TLV.
class tOrganizationExtensionTLVFactory {
  public:
    // Called with the source just after the tlvType. Returns the TLV, owned by the caller,
    // or null: an organization the codec does not support is traced and gives -52005 (the
    // rest of its TLV is skipped undecoded), -52012 when the datagram ends.
    static std::unique_ptr<tOrganizationExtensionTLV> createOrganizationExtensionTLV(
        iSerializableTarget& source, tStatus& status);

  private:
    static void reportUnsupported(std::uint32_t organizationId, std::uint32_t organizationSubType,
                                  tStatus& status);
};

}  // namespace nQVPTP000

#endif
