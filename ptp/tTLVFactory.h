#ifndef QV_PTP_TTLVFACTORY_H
#define QV_PTP_TTLVFACTORY_H

#include <memory>

#include "ptp/iSerializableTarget.h"
#include "ptp/tTLV.h"

namespace nQVPTP000 {

// Turns the next TLV of a received message into an object of its class.
class tTLVFactory {
  public:
    // Reads the TLV at the source's position. Returns the TLV, owned by the caller, with its
    // lengthField matched to what it writes, or null: -52005 for a kind the codec does not
    // build or a TLV that is malformed (its octets are skipped, so the next TLV can be read),
    // -52012 when the datagram ends. An error status TLV that the datagram's end cut inside
    // its display text is returned with -52012: it is the last TLV.
    static std::unique_ptr<tTLV> createTLV(iSerializableTarget& source, tStatus& status);

  private:
    static std::unique_ptr<tTLV> createOfType(std::uint16_t tlvType, iSerializableTarget& source,
                                              tStatus& status);
    static std::unique_ptr<tTLV> createErrorStatusTLV(iSerializableTarget& source, tStatus& status);
    static void skipUnsupportedTLV(iSerializableTarget& source, tStatus& status);
};

}  // namespace nQVPTP000

#endif
