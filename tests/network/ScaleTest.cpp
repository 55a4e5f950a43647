#include <gtest/gtest.h>

#include <set>
#include <string>

#include "tests/network/BurstResponder.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using qvtest::BurstResponder;

// 250 clocks of 4 ports each, spread over domains 0 to 3, answer one discovery together.
TEST(Scale, OneDiscoveryFindsAThousandPortsAndLosesNone) {
    QV_REQUIRE_TEST_NETWORK();
    qvtest::TestNetwork network({"none"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    BurstResponder responder(network.clocks()[0].nameSpace, 250, 4);
    std::string failure;
    ASSERT_TRUE(responder.start(failure)) << failure;
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();

    tStatus status;
    const auto proxies = client.findClocks(1000, status);
    ASSERT_TRUE(status.succeeded()) << status.code;
    EXPECT_EQ(responder.answersSent(), 1000u);
    ASSERT_EQ(proxies.size(), 1000u);
    std::set<nQVPTPMGMT000::tClockKey> keys;
    for (std::size_t i = 0; i < proxies.size(); ++i) {
        const auto key = nQVPTPMGMT000::makeClockKey(proxies[i]->getPortIdentity());
        keys.insert(key);
        const auto clock = static_cast<std::uint16_t>((key[6] << 8) | key[7]);
        EXPECT_EQ(proxies[i]->getDomainNumber(), clock % 4) << "clock " << clock;
        // In key order: clock by clock, ports 1 to 4.
        EXPECT_EQ(clock, i / 4);
        EXPECT_EQ(key[9], i % 4 + 1);
    }
    EXPECT_EQ(keys.size(), 1000u);
}

}  // namespace
