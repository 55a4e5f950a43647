#ifndef QV_PTP_TRANSPORT_IPTPPORTMESSAGING_H
#define QV_PTP_TRANSPORT_IPTPPORTMESSAGING_H

#include <cstdint>

#include "platform/tStatus.h"
#include "ptp/tPortAddress.h"
#include "ptp/tProtocolDataUnit.h"

namespace nQVPTP000 {

// A network interface as the system numbers it. 0 names none in particular: a send goes out
// on every interface the transport uses, and a receive did not learn where it came in.
using tInterfaceIndex = std::uint32_t;
inline constexpr tInterfaceIndex kEveryInterface = 0;

// Carries PTP messages to and from the network: an event port for timed messages and a
// general port for everything else. Every operation reports through the status record and
// does nothing once it holds an error; none throws.
//
// A transport may use several interfaces: then it sends on each of them, unless a send
// names one, and tells on which one each datagram came in. One that does not (the defaults
// below) is a transport of one interface.
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

    // sendGeneralMessage through the interface `via` alone, when it is one of the transport's.
    virtual void sendGeneralMessageVia(tProtocolDataUnit& unit, tInterfaceIndex /*via*/,
                                       tStatus& status) {
        sendGeneralMessage(unit, status);
    }
    // The interface on which the datagram of the latest successful receive came in. Only the
    // thread that calls receive asks.
    virtual tInterfaceIndex getReceiveInterface() const { return kEveryInterface; }
};

}  // namespace nQVPTP000

#endif
