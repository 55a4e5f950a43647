#ifndef QV_PTP_TTLVFACTORY_H
#define QV_PTP_TTLVFACTORY_H

#include <memory>

#include "ptp/iSerializableTarget.h"
#include "ptp/tTLV.h"

namespace nQVPTP000 {

// Turns the next TLV of a received message into an object of its class.
class tTLVFactory {
  public:
    // Reads the TLV at the source's position. Returns the TLV, owned by the caller, or null:
    // -52005 for a kind the codec does not build (its octets are skipped, so the next TLV
    // can be read), -52012 when the datagram ends.
    static std::unique_ptr<tTLV> createTLV(iSerializableTarget& source, tStatus& status);

  private:
    static std::unique_ptr<tTLV> createErrorStatusTLV(iSerializableTarget& source, tStatus& status);
    static void skipUnsupportedTLV(iSerializableTarget& source, tStatus& status);
};

}  // namespace nQVPTP000

#endif
