// Several threads talking to different clocks through one node at once: each gets the
// answers of its own clock. Run under ThreadSanitizer too.
#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "ptpmgmt/tPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"
#include "tests/ptpmgmt/ClientTestSupport.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

using nQVPTPMGMT000::iPTPClockProxy;
using nQVPTPMGMT000::tPTPClockProxy;
using nQVPTPMGMT000::tPTPMgmtNode;
using namespace qvtest;

namespace {

constexpr int kClocks = 4;
constexpr int kRounds = 40;

TEST(ConcurrentExchangesTest, EachThreadGetsItsOwnClocksAnswers) {
    SimulatedNetwork network;
    std::vector<std::unique_ptr<SimulatedClock>> clocks;
    for (int i = 0; i < kClocks; ++i) {
        clocks.push_back(
            std::make_unique<SimulatedClock>(clockIdentity(static_cast<std::uint8_t>(i + 1))));
        // Some answer a little late, so that exchanges overlap.
        clocks.back()->setDelay(std::chrono::milliseconds(i % 2));
        network.attach(*clocks.back());
    }
    tStatus status;
    tPTPMgmtNode node(&network, clientIdentity(), kClientPort, status);
    node.open(status);
    ASSERT_TRUE(discoverAll(node, kClocks, status));
    std::vector<iPTPClockProxy*> proxies(kClocks);
    node.copyClockProxies(proxies.data(), kClocks, status);
    ASSERT_TRUE(status.succeeded());

    std::atomic<int> wrong{0};
    std::atomic<int> failed{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < kClocks; ++i) {
        threads.emplace_back([&, i] {
            auto& proxy = *static_cast<tPTPClockProxy*>(proxies[static_cast<std::size_t>(i)]);
            for (int round = 0; round < kRounds; ++round) {
                tStatus own;
                const auto value = static_cast<std::uint8_t>(i * 50 + round);
                proxy.setPriority1(value, own);
                const std::uint8_t read = proxy.getPriority1(own);
                const auto identity = proxy.getDefaultDataSet(own).getClockIdentity();
                failed += own.failed() ? 1 : 0;
                wrong += (read != value ||
                          !(identity == clocks[static_cast<std::size_t>(i)]->identity()))
                             ? 1
                             : 0;
            }
        });
    }
    // Discovery and list reads go on meanwhile.
    for (int round = 0; round < 3; ++round) {
        tStatus own;
        node.findClocks(5, own);
        EXPECT_EQ(node.clockCount(), kClocks);
        EXPECT_TRUE(own.succeeded());
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(failed.load(), 0);
    EXPECT_EQ(wrong.load(), 0);
    for (int i = 0; i < kClocks; ++i) {
        EXPECT_EQ(clocks[static_cast<std::size_t>(i)]->read(
                      [](const InMemoryManagedClock& c) { return c.defaultDataSet.priority1; }),
                  i * 50 + kRounds - 1);
    }
    node.close(status);
}

}  // namespace
