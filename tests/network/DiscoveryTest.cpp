#include <gtest/gtest.h>
#include <signal.h>

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;
using qvtest::ManagementClient;
using qvtest::TestNetwork;

// Four clocks of two implementations in the four discovery domains. The MACs put the
// clocks' keys in an order other than the order in which they were started.
const std::vector<std::string> kClocks = {
    "ptp4l:domain=0:desc=zero:mac=02:00:00:00:00:30",
    "ptpd:domain=2:mac=02:00:00:00:00:10",
    "ptp4l:domain=3:desc=three:mac=02:00:00:00:00:20",
    "ptp4l:domain=1:desc=one:mac=02:00:00:00:00:40",
};

std::vector<qvtest::TestClock> inKeyOrder(std::vector<qvtest::TestClock> clocks) {
    std::sort(clocks.begin(), clocks.end(), [](const auto& a, const auto& b) {
        return qvtest::clockKeyOf(a) < qvtest::clockKeyOf(b);
    });
    return clocks;
}

std::string cachedUserDescription(const tPTPClockProxy& proxy) {
    char text[64] = {};
    tStatus status;
    proxy.getCachedUserDescription(text, sizeof text, status);
    return status.succeeded() ? text : "(" + std::to_string(status.code) + ")";
}

TEST(Discovery, FindsEveryClockOnceInKeyOrderInItsDomainAndKeepsAStoppedOne) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    TestNetwork network(kClocks);
    ASSERT_TRUE(network.isUp()) << network.failure();
    ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();

    tStatus status;
    std::vector<tPTPClockProxy*> proxies = client.findClocks(1000, status);
    ASSERT_TRUE(status.succeeded()) << status.code;

    const std::vector<qvtest::TestClock> expected = inKeyOrder(network.clocks());
    ASSERT_EQ(proxies.size(), expected.size());
    for (std::size_t i = 0; i < expected.size(); ++i) {
        SCOPED_TRACE(expected[i].mac);
        const auto key = qvtest::clockKeyOf(expected[i]);
        EXPECT_EQ(0, std::memcmp(proxies[i]->getClockKey(), key.data(), key.size()));
        EXPECT_EQ(proxies[i]->getDomainNumber(), expected[i].domain);
        EXPECT_EQ(cachedUserDescription(*proxies[i]), expected[i].description);
        EXPECT_TRUE(proxies[i]->isOrdinaryClock());
        EXPECT_EQ(proxies[i]->getPhysicalAddressLength(), 6u);
    }

    // Stop the domain-3 clock: a second discovery no longer hears it but still lists it,
    // with the description it gave before.
    const auto stopped = std::find_if(network.clocks().begin(), network.clocks().end(),
                                      [](const auto& clock) { return clock.domain == 3; });
    const int pid =
        network.processIds()[static_cast<std::size_t>(stopped - network.clocks().begin())];
    ASSERT_EQ(kill(pid, SIGKILL), 0);
    std::vector<tPTPClockProxy*> again = client.findClocks(1000, status);
    ASSERT_TRUE(status.succeeded()) << status.code;
    EXPECT_EQ(again, proxies);
    tStatus read;
    nQVPTPMGMT000::iPTPClockProxy* kept =
        client.node().findClock(qvtest::clockKeyOf(*stopped), read);
    ASSERT_NE(kept, nullptr);
    EXPECT_EQ(cachedUserDescription(static_cast<tPTPClockProxy&>(*kept)), "three");
}

}  // namespace
