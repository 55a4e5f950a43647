#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>

#include "tests/network/Flooder.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"

namespace {

// A third host floods the client with bad datagrams while it exchanges with a real ptp4l:
// no exchange fails, nor the first after the flood. The receive loop counts the bad
// datagrams and never takes them for a failing socket, whose pause would let the flood
// pile up in the socket's queue ahead of the answers.
TEST(FloodTest, BadDatagramsNeitherLoseExchangesNorDeafenTheClient) {
    QV_REQUIRE_TEST_NETWORK("ptp4l");
    qvtest::TestNetwork network({"ptp4l:domain=0:desc=flooded", "none"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    qvtest::ManagementClient client(network.clientNamespace());
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), 1U) << client.failure() << qvtest::describe(status);
    std::string failure;
    long sent = 0;
    std::atomic<bool> flooding{true};
    std::thread flooder([&] {
        sent = qvtest::flood(network.clocks()[1].nameSpace, network.clientAddress(), 4000, 2000,
                             61000, failure);
        flooding = false;
    });
    int failed = 0;
    while (flooding) {
        proxies[0]->getPriority1(status);
        failed += status.failed() ? 1 : 0;
        status.reset();
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    flooder.join();
    ASSERT_EQ(sent, 4000) << failure;
    EXPECT_EQ(failed, 0) << "exchanges failed during the flood";
    EXPECT_EQ(proxies[0]->getPriority1(status), 128) << qvtest::describe(status);
    const auto& transceiver = client.node().getTransceiver();
    EXPECT_GT(transceiver.badDatagramCount(), 0U);
    EXPECT_EQ(transceiver.receiveErrorCount(), 0U)
        << qvtest::describe(transceiver.lastReceiveError());
}

}  // namespace
