#include <gtest/gtest.h>
#include <signal.h>

#include <algorithm>
#include <cstring>
#include <string>
#include <thread>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;

std::string cachedUserDescription(const tPTPClockProxy& proxy) {
    char text[64] = {};
    tStatus status;
    proxy.getCachedUserDescription(text, sizeof text, status);
    return status.succeeded() ? text : "(" + std::to_string(status.code) + ")";
}

// Round after round of reads of one clock whose values differ from every other clock's;
// returns the first answer that was not its own clock's, or "".
std::string readOwnClock(tPTPClockProxy& proxy, const qvtest::TestClock& clock) {
    for (int round = 0; round < 40; ++round) {
        tStatus status;
        const std::uint8_t priority1 = proxy.getPriority1(status);
        const auto defaults = proxy.getDefaultDataSet(status);
        char description[64] = {};
        proxy.getUserDescription(description, sizeof description, status);
        if (status.failed()) {
            return "failed with " + qvtest::describe(status);
        }
        if (priority1 != clock.priority1 || defaults.getPriority2() != clock.priority2 ||
            defaults.getDomainNumber() != clock.domain || description != clock.description) {
            return "priority1 " + std::to_string(priority1) + ", description " + description;
        }
    }
    return "";
}

// Four clocks of two implementations in the four discovery domains; the MACs put the clocks'
// keys in an order other than the order in which they were started. Discovery finds each once
// in key order; then threads read different clocks while another discovery runs, and each
// gets its own clock's answers; a stopped clock stays listed with the description it gave.
TEST(Discovery, FindsEveryClockOnceThenThreadsEachGetTheirOwnClocksAnswers) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    qvtest::TestNetwork network(
        {"ptp4l:domain=0:prio1=11:prio2=21:desc=zero:mac=02:00:00:00:00:30",
         "ptpd:domain=2:prio1=14:prio2=24:mac=02:00:00:00:00:10",
         "ptp4l:domain=3:prio1=13:prio2=23:desc=three:mac=02:00:00:00:00:20",
         "ptp4l:domain=1:prio1=12:prio2=22:desc=one:mac=02:00:00:00:00:40"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const std::vector<tPTPClockProxy*> proxies = client.findClocks(1000, status);
    ASSERT_TRUE(status.succeeded()) << status.code;
    std::vector<qvtest::TestClock> expected = network.clocks();
    std::sort(expected.begin(), expected.end(), [](const auto& a, const auto& b) {
        return qvtest::clockKeyOf(a) < qvtest::clockKeyOf(b);
    });
    ASSERT_EQ(proxies.size(), expected.size());
    for (std::size_t i = 0; i < expected.size(); ++i) {
        const auto key = qvtest::clockKeyOf(expected[i]);
        EXPECT_EQ(0, std::memcmp(proxies[i]->getClockKey(), key.data(), key.size())) << i;
        EXPECT_EQ(proxies[i]->getDomainNumber(), expected[i].domain) << i;
        EXPECT_EQ(cachedUserDescription(*proxies[i]), expected[i].description) << i;
        EXPECT_EQ(proxies[i]->getPhysicalAddressLength(), 6u) << i;
    }

    std::vector<std::string> problems(proxies.size());
    std::vector<std::thread> threads;
    for (std::size_t i = 0; i < proxies.size(); ++i) {
        threads.emplace_back([&, i] { problems[i] = readOwnClock(*proxies[i], expected[i]); });
    }
    client.findClocks(300, status);  // shares the node with the readers
    EXPECT_TRUE(status.succeeded()) << status.code;
    for (std::size_t i = 0; i < threads.size(); ++i) {
        threads[i].join();
        EXPECT_EQ(problems[i], "") << "thread " << i;
    }

    const auto stopped = std::find_if(network.clocks().begin(), network.clocks().end(),
                                      [](const auto& clock) { return clock.domain == 3; });
    ASSERT_EQ(
        kill(network.processIds()[static_cast<std::size_t>(stopped - network.clocks().begin())],
             SIGKILL),
        0);
    EXPECT_EQ(client.findClocks(1000, status), proxies);
    EXPECT_TRUE(status.succeeded()) << status.code;
    tStatus read;
    auto* kept = client.node().findClock(qvtest::clockKeyOf(*stopped), read);
    ASSERT_NE(kept, nullptr);
    EXPECT_EQ(cachedUserDescription(static_cast<tPTPClockProxy&>(*kept)), "three");
}

}  // namespace
