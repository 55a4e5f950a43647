// The simulated clocks answering over real UDP, with the management node as the client,
// inside a private network namespace of this process.
#include "tests/support/ptpmgmt/UdpResponder.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "ptp/transport/tUDPNetworkInterface.h"
#include "ptpmgmt/tPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"
#include "tests/ptp/transport/PrivateNetwork.h"

using nQVPTP000::tClockIdentity;
using nQVPTPMGMT000::iPTPClockProxy;
using nQVPTPMGMT000::tPTPClockProxy;
using nQVPTPMGMT000::tPTPMgmtNode;
using qvtest::SimulatedClock;
using qvtest::UdpResponder;

namespace {

tClockIdentity identity(std::uint8_t last) {
    const std::uint8_t octets[] = {0x00, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, last};
    return tClockIdentity(octets);
}

TEST(UdpResponderTest, ClocksAnswerDiscoveryAndExchangesOverUdp) {
    QV_REQUIRE_PRIVATE_NETWORK();
    SimulatedClock first(identity(1), 2);
    SimulatedClock late(identity(2));
    late.setDelay(std::chrono::milliseconds(100));
    first.managed().defaultDataSet.priority1 = 42;
    UdpResponder responder({&first, &late});
    tStatus status;
    responder.start(status);
    ASSERT_TRUE(status.succeeded()) << status.code;

    nQVPTP000::tUDPNetworkInterface transport;
    tPTPMgmtNode node(&transport, identity(0xC1), 0x0101, status);
    node.open(status);
    node.findClocks(400, status);
    ASSERT_TRUE(status.succeeded()) << status.code;
    ASSERT_EQ(node.clockCount(), 3);
    iPTPClockProxy* proxies[3] = {};
    node.copyClockProxies(proxies, 3, status);
    auto& port1 = *static_cast<tPTPClockProxy*>(proxies[0]);
    EXPECT_EQ(port1.getPortIdentity(), nQVPTP000::tPortIdentity(identity(1), 1));
    EXPECT_TRUE(port1.isOrdinaryClock());

    EXPECT_EQ(port1.getPriority1(status), 42);
    port1.setPriority1(7, status);
    EXPECT_EQ(first.read([](const auto& clock) { return clock.defaultDataSet.priority1; }), 7);
    EXPECT_EQ(proxies[2]->getPriority1(status), 128);  // the late clock, after 100 ms
    EXPECT_TRUE(status.succeeded()) << status.code;

    late.setFault(SimulatedClock::Fault::errorStatus);
    tStatus refused;
    proxies[2]->getPriority2(refused);
    EXPECT_EQ(refused.code, kStatusNoData);

    node.close(status);
    responder.stop();
    EXPECT_EQ(responder.answersSent(), 7U);  // discovery: 3, then 4 exchanges
}

}  // namespace
