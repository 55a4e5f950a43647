#ifndef QV_TESTS_PTPMGMT_CLIENTTESTSUPPORT_H
#define QV_TESTS_PTPMGMT_CLIENTTESTSUPPORT_H

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <vector>

#include "platform/tStatus.h"
#include "ptp/tClockIdentity.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tPortIdentity.h"
#include "ptpmgmt/tPTPMgmtNode.h"

namespace qvtest {

using tSteadyClock = std::chrono::steady_clock;

// The management client's own identity in these tests, and its port number.
nQVPTP000::tClockIdentity clientIdentity();
constexpr std::uint16_t kClientPort = 0x0101;
nQVPTP000::tPortIdentity clientPort();

// Clock identities of simulated clocks, in ascending key order.
nQVPTP000::tClockIdentity clockIdentity(std::uint8_t last);

// A management answer from `source` to `target` carrying NULL_MANAGEMENT, as octets.
std::vector<std::uint8_t> answerOctets(std::uint16_t sequenceId,
                                       const nQVPTP000::tPortIdentity& target,
                                       const nQVPTP000::tPortIdentity& source,
                                       std::uint32_t actionField);

// A request message of NULL_MANAGEMENT to all ports of all clocks from the client.
std::unique_ptr<nQVPTP000::tManagementMessage> nullRequest(std::uint32_t actionField);

// Discovers until the node knows `count` ports (at most 100 rounds of 20 ms): a single
// short discovery may end before a loaded machine has run the receive thread.
bool discoverAll(nQVPTPMGMT000::tPTPMgmtNode& node, std::uint16_t count, tStatus& status);

// Polls `condition` every millisecond for up to ten seconds; whether it came true.
bool eventually(const std::function<bool()>& condition);

}  // namespace qvtest

#endif
