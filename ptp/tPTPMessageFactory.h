#ifndef QV_PTP_TPTPMESSAGEFACTORY_H
#define QV_PTP_TPTPMESSAGEFACTORY_H

#include <memory>

#include "ptp/iSerializableTarget.h"
#include "ptp/tPTPMessage.h"

namespace nQVPTP000 {

// Turns a received datagram into the message object of its type.
class tPTPMessageFactory {
  public:
    // Reads the datagram from the source's position. Returns the message, owned by the
    // caller, or null with the reason in the status: -52002 for a versionPTP other than 2 or
    // unacceptable content, -52005 for a type the codec does not decode (the peer-delay
    // messages among them), -52012 for a datagram cut inside header or body, -52000 when
    // memory ran out. A message is never returned half-built.
    static std::unique_ptr<tPTPMessage> createMessage(iSerializableTarget& source, tStatus& status);

  private:
    static std::unique_ptr<tPTPMessage> createBody(std::unique_ptr<tMessageHeader> header,
                                                   iSerializableTarget& source, tStatus& status);
};

}  // namespace nQVPTP000

#endif
