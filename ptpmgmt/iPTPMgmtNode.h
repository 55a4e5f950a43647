#ifndef QV_PTPMGMT_IPTPMGMTNODE_H
#define QV_PTPMGMT_IPTPMGMTNODE_H

#include <cstdint>

#include "platform/tStatus.h"
#include "ptpmgmt/tClockKey.h"

namespace nQVPTPMGMT000 {

class iPTPClockProxy;

// The management node as the expert sees it: discovery, the list of clock ports found,
// and the life of the receive thread.
class iPTPMgmtNode {
  public:
    virtual ~iPTPMgmtNode() = default;
    // Discovery in domain 0 only, waiting `timeoutMs` for answers.
    virtual void findClocksInDefaultDomain(std::uint16_t timeoutMs, tStatus& status) = 0;
    // The number of clock ports known; read without a lock.
    virtual std::uint16_t clockCount() const = 0;
    // Fills `proxies` in key order when `count` equals clockCount(), else records -52012.
    virtual void copyClockProxies(iPTPClockProxy** proxies, std::uint16_t count,
                                  tStatus& status) = 0;
    // The proxy of exactly that key, or null with -52012.
    virtual iPTPClockProxy* findClock(const tClockKey& key, tStatus& status) = 0;
    virtual void removeClock(iPTPClockProxy* proxy, tStatus& status) = 0;
    virtual void open(tStatus& status) = 0;
    virtual void close(tStatus& status) = 0;
};

}  // namespace nQVPTPMGMT000

#endif
