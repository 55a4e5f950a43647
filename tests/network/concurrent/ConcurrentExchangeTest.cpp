#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

constexpr int kRounds = 40;

// Round after round of reads of one clock whose values are known and differ from every
// other clock's; returns the first answer that was not its own clock's, or "".
std::string readOwnClock(nQVPTPMGMT000::tPTPClockProxy& proxy, const qvtest::TestClock& clock) {
    for (int round = 0; round < kRounds; ++round) {
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
            return "priority1 " + std::to_string(priority1) + ", domain " +
                   std::to_string(defaults.getDomainNumber()) + ", description " + description;
        }
    }
    return "";
}

TEST(ConcurrentExchanges, ThreadsReadingDifferentClocksEachGetTheirOwnAnswers) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    qvtest::TestNetwork network({"ptp4l:domain=0:prio1=11:prio2=21:desc=first",
                                 "ptp4l:domain=1:prio1=12:prio2=22:desc=second",
                                 "ptp4l:domain=0:prio1=13:prio2=23:desc=third",
                                 "ptpd:domain=2:prio1=14:prio2=24"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), network.clocks().size());

    std::vector<std::string> problems(proxies.size(), "clock not found");
    std::vector<std::thread> threads;
    std::atomic<bool> go{false};
    for (std::size_t i = 0; i < proxies.size(); ++i) {
        threads.emplace_back([&, i] {
            while (!go.load()) {
                std::this_thread::yield();
            }
            const auto key = nQVPTPMGMT000::makeClockKey(proxies[i]->getPortIdentity());
            for (const auto& candidate : network.clocks()) {
                if (qvtest::clockKeyOf(candidate) == key) {
                    problems[i] = readOwnClock(*proxies[i], candidate);
                }
            }
        });
    }
    // A discovery on the main thread meanwhile: it shares the node with the readers.
    go.store(true);
    client.findClocks(300, status);
    EXPECT_TRUE(status.succeeded()) << status.code;
    for (std::size_t i = 0; i < threads.size(); ++i) {
        threads[i].join();
        EXPECT_EQ(problems[i], "") << "thread " << i;
    }
}

}  // namespace
