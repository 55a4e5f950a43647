#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>

#include "tests/network/Flooder.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using qvtest::describe;

// A third host floods the client with bad datagrams while the client exchanges with a real
// ptp4l: every exchange succeeds, and so does the first one after the flood. The receive
// loop counts the bad datagrams and never takes them for a failing socket (which would
// pause it while the flood piles up in the socket's queue).
TEST(FloodTest, BadDatagramsNeitherLoseExchangesNorDeafenTheClient) {
    QV_REQUIRE_TEST_NETWORK("ptp4l");
    qvtest::TestNetwork network({"ptp4l:domain=0:desc=flooded", "none"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), 1U) << describe(status);

    const qvtest::FloodPlan plan{network.clocks()[1].nameSpace, network.clientAddress(), 4000,
                                 2000};
    std::string failure;
    long sent = 0;
    std::atomic<bool> flooding{true};
    std::thread flooder([&] {
        sent = qvtest::flood(plan, failure);
        flooding = false;
    });
    int exchanges = 0;
    int failed = 0;
    for (; flooding && exchanges < 1000; ++exchanges) {
        tStatus exchange;
        proxies[0]->getPriority1(exchange);
        failed += exchange.failed() ? 1 : 0;
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    flooder.join();
    ASSERT_EQ(sent, plan.count) << failure;
    EXPECT_EQ(failed, 0) << "of " << exchanges << " exchanges during the flood";

    tStatus after;
    EXPECT_EQ(proxies[0]->getPriority1(after), 128);
    EXPECT_TRUE(after.succeeded()) << describe(after);
    const auto& transceiver = client.node().getTransceiver();
    EXPECT_GT(transceiver.badDatagramCount(), 0U);
    EXPECT_EQ(transceiver.receiveErrorCount(), 0U) << describe(transceiver.lastReceiveError());
}

}  // namespace
