#ifndef QV_EXPERT_CLOCKS_CPTPCLOCKLIST_H
#define QV_EXPERT_CLOCKS_CPTPCLOCKLIST_H

#include <cstdint>
#include <list>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Mutex.h"
#include "platform/tStatus.h"
#include "ptpmgmt/iPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"

// The clock ports of the last successful discovery, and those asked for by name since, as
// the expert hands them out. The proxies belong to the node; this list only borrows them.
//
// Discovery and the lookup by name run under the named find mutex, so that one process at
// a time sends its requests (and one thread at a time counts and copies the node's
// clocks). The array is replaced and read only under `lock_`: a thread collecting names
// never walks an array that another thread's discovery is replacing.
class CPtpClockList {
  public:
    static constexpr const char* kMutexName = "findClksMutex";

    // Creates or opens the find mutex; throws when it cannot.
    CPtpClockList();

    // Runs a discovery; on success the array holds the node's clocks. On failure (also
    // when the find mutex cannot be taken) the previous array stays.
    bool refresh(nQVPTPMGMT000::tPTPMgmtNode& node, std::uint16_t timeoutMs, tStatus& status);

    // Asks the port that `name` names (tPTPMgmtNode::askClock) and waits at most `timeoutMs`
    // for it. `found` is its proxy, now in the array beside the others, or null when the
    // name does not parse or no port answered. False when the lookup itself failed.
    bool ask(nQVPTPMGMT000::tPTPMgmtNode& node, std::u16string_view name, std::uint16_t timeoutMs,
             nQVPTPMGMT000::iPTPClockProxy*& found, tStatus& status);

    // One item name per clock port, in the node's key order.
    std::list<std::u16string> names() const;

    // The proxy that the node knows under the item name, without discovery; null when the
    // name does not parse or names no clock.
    static nQVPTPMGMT000::iPTPClockProxy* lookup(nQVPTPMGMT000::iPTPMgmtNode& node,
                                                 std::u16string_view name);

  private:
    // The array from the node's clocks (find mutex held).
    bool copyFrom(nQVPTPMGMT000::tPTPMgmtNode& node, tStatus& status);

    qv::dsc::osdep::Mutex findMutex_;
    mutable std::mutex lock_;
    std::vector<nQVPTPMGMT000::iPTPClockProxy*> proxies_;  // guarded by lock_
};

#endif
