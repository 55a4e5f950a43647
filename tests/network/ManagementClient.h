#ifndef QV_TESTS_NETWORK_MANAGEMENTCLIENT_H
#define QV_TESTS_NETWORK_MANAGEMENTCLIENT_H

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/tStatus.h"
#include "ptp/transport/tUDPNetworkInterface.h"
#include "ptpmgmt/tPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"
#include "tests/support/TestNetwork.h"

namespace qvtest {

// The management client under test, living in a network namespace: its sockets and its
// receive thread are created there, while the thread that made it returns to where it was.
// Any thread may then run exchanges through it.
class ManagementClient {
  public:
    // The client's own clock identity (a locally administered EUI-64 that no test clock
    // uses) and the port number that answers must be addressed to.
    static constexpr std::array<std::uint8_t, 8> kIdentity = {0x02, 0x51, 0x56, 0xFF,
                                                              0xFE, 0x00, 0x00, 0x99};
    static constexpr std::uint16_t kPortNumber = 0x5151;

    explicit ManagementClient(const std::string& nameSpace);
    ~ManagementClient();
    ManagementClient(const ManagementClient&) = delete;
    ManagementClient& operator=(const ManagementClient&) = delete;

    // Whether the node was built and opened in the namespace; otherwise failure() says why.
    bool isOpen() const { return open_; }
    const std::string& failure() const { return failure_; }

    nQVPTPMGMT000::tPTPMgmtNode& node() { return *node_; }

    // Runs a discovery and returns the proxies in the node's (key) order.
    std::vector<nQVPTPMGMT000::tPTPClockProxy*> findClocks(std::uint16_t timeoutMs,
                                                           tStatus& status);

  private:
    nQVPTP000::tUDPNetworkInterface transport_;
    std::unique_ptr<nQVPTPMGMT000::tPTPMgmtNode> node_;
    bool open_ = false;
    std::string failure_;
};

// The clock key of a test clock's port.
nQVPTPMGMT000::tClockKey clockKeyOf(const TestClock& clock);

// pmc's answer to one GET, as "name value" pairs ("priority1" -> "128"); empty when the
// clock did not answer. Runs "pmc -4 -i br0 -b 0 -d DOMAIN 'GET ID'" in the client
// namespace (DOMAIN the clock's own unless `domain` is given) and keeps the lines of the
// answer of `clock`.
std::map<std::string, std::string> pmcGet(const TestNetwork& network, const TestClock& clock,
                                          const std::string& managementId, int domain = -1);

// pmc's text of a clock identity, "020000.fffe.000001".
std::string pmcClockIdentity(const std::array<std::uint8_t, 8>& identity);

// A status for a failure message: "-52012 at file.cpp:120".
std::string describe(const tStatus& status);

}  // namespace qvtest

#endif
