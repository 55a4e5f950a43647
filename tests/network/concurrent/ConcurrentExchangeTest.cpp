#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;
using qvtest::ManagementClient;
using qvtest::TestNetwork;

constexpr int kRounds = 40;

// What one thread saw: every answer that was not its own clock's.
struct Outcome {
    int exchanges = 0;
    int wrong = 0;
    int failed = 0;
    std::string firstProblem;
};

void note(Outcome& outcome, bool good, const std::string& what) {
    ++outcome.exchanges;
    if (!good) {
        ++outcome.wrong;
        if (outcome.firstProblem.empty()) {
            outcome.firstProblem = what;
        }
    }
}

// Round after round of reads of one clock whose values are known and differ from every
// other clock's.
void readOwnClock(tPTPClockProxy& proxy, const qvtest::TestClock& clock, Outcome& outcome) {
    for (int round = 0; round < kRounds; ++round) {
        tStatus status;
        const std::uint8_t priority1 = proxy.getPriority1(status);
        note(outcome, priority1 == clock.priority1, "priority1 " + std::to_string(priority1));
        const auto defaults = proxy.getDefaultDataSet(status);
        note(outcome,
             defaults.getPriority2() == clock.priority2 &&
                 defaults.getDomainNumber() == clock.domain,
             "default data set of domain " + std::to_string(defaults.getDomainNumber()));
        char description[64] = {};
        proxy.getUserDescription(description, sizeof description, status);
        note(outcome, description == clock.description, std::string("description ") + description);
        if (status.failed()) {
            ++outcome.failed;
        }
    }
}

TEST(ConcurrentExchanges, ThreadsReadingDifferentClocksEachGetTheirOwnAnswers) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    TestNetwork network({"ptp4l:domain=0:prio1=11:prio2=21:desc=first",
                         "ptp4l:domain=1:prio1=12:prio2=22:desc=second",
                         "ptp4l:domain=0:prio1=13:prio2=23:desc=third",
                         "ptpd:domain=2:prio1=14:prio2=24"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), network.clocks().size());

    std::vector<Outcome> outcomes(proxies.size());
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
                    readOwnClock(*proxies[i], candidate, outcomes[i]);
                }
            }
        });
    }
    // A discovery on the main thread meanwhile: it shares the node with the readers.
    go.store(true);
    client.findClocks(300, status);
    EXPECT_TRUE(status.succeeded()) << status.code;
    for (auto& thread : threads) {
        thread.join();
    }
    for (std::size_t i = 0; i < outcomes.size(); ++i) {
        SCOPED_TRACE("thread " + std::to_string(i));
        EXPECT_EQ(outcomes[i].exchanges, 3 * kRounds);
        EXPECT_EQ(outcomes[i].wrong, 0) << outcomes[i].firstProblem;
        EXPECT_EQ(outcomes[i].failed, 0);
    }
}

}  // namespace
