#ifndef QV_PTP_TRANSPORT_IPTPPORTMESSAGING_H
#define QV_PTP_TRANSPORT_IPTPPORTMESSAGING_H

#include "platform/tStatus.h"
#include "ptp/tPortAddress.h"
#include "ptp/tProtocolDataUnit.h"

namespace nQVPTP000 {

// Carries PTP messages to and from the network: an event port for timed messages and a
// general port for everything else. Every operation reports through the status record and
// does nothing once it holds an error; none throws.
class iPTPPortMessaging {
  public:
    virtual ~iPTPPortMessaging() = default;
    virtual void open(tStatus& status) = 0;
    virtual void close(tStatus& status) = 0;
    virtual void sendEventMessage(tProtocolDataUnit& unit, tStatus& status) = 0;
    virtual void sendGeneralMessage(tProtocolDataUnit& unit, tStatus& status) = 0;
    // Blocks until one datagram has arrived on either port (placed in `unit`) or until
    // abortReceive, which gives -52009.
    virtual void receive(tProtocolDataUnit& unit, tStatus& status) = 0;
    // May be called from any thread at any time; a receive that is not running yet gives
    // up as soon as it starts.
    virtual void abortReceive(tStatus& status) = 0;
    virtual tPortAddress getPortAddress() = 0;
};

}  // namespace nQVPTP000

#endif
