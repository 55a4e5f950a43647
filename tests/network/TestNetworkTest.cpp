#include <gtest/gtest.h>
#include <signal.h>

#include <cerrno>
#include <chrono>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using qvtest::pmcPortIdentity;
using qvtest::TestNetwork;

// Ended: no longer there, or a zombie waiting for whoever adopted it (the tool that started
// it has exited) to collect it.
bool processEnded(int pid) {
    if (kill(pid, 0) != 0 && errno == ESRCH) {
        return true;
    }
    std::ifstream stat("/proc/" + std::to_string(pid) + "/stat");
    std::string text;
    std::getline(stat, text);
    const auto end = text.rfind(')');
    return end == std::string::npos || text.compare(end, 3, ") Z") == 0;
}

bool processGone(int pid) {
    for (int i = 0; i < 50; ++i) {
        if (processEnded(pid)) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    return false;
}

TEST(TestNetwork, ClocksAnswerFromClientNamespaceAndNothingRemainsAfterDown) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    TestNetwork network(
        {"ptp4l:domain=0:prio1=97:desc=alpha:mac=02:11:22:33:44:55", "ptpd:domain=2:prio1=100"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    ASSERT_EQ(network.clocks().size(), 2u);

    const auto& ptp4l = network.clocks()[0];
    EXPECT_EQ(ptp4l.impl, "ptp4l");
    EXPECT_EQ(ptp4l.identity,
              (std::array<std::uint8_t, 8>{0x02, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, 0x55}));
    EXPECT_EQ(ptp4l.domain, 0);
    const auto& ptpd = network.clocks()[1];
    EXPECT_EQ(ptpd.impl, "ptpd");
    EXPECT_EQ(ptpd.domain, 2);

    const auto answer0 =
        network.runInClient("pmc -4 -i br0 -b 0 -d 0 'GET CLOCK_DESCRIPTION' 'GET PRIORITY1'");
    EXPECT_NE(answer0.output.find(pmcPortIdentity(ptp4l) + " seq 0 RESPONSE MANAGEMENT "
                                                           "CLOCK_DESCRIPTION"),
              std::string::npos)
        << answer0.output;
    EXPECT_NE(answer0.output.find("userDescription       alpha"), std::string::npos);
    EXPECT_NE(answer0.output.find("priority1 97"), std::string::npos);
    // The ptpd clock lives in domain 2 and must not answer in domain 0.
    EXPECT_EQ(answer0.output.find(pmcPortIdentity(ptpd)), std::string::npos);

    const auto answer2 = network.runInClient("pmc -4 -i br0 -b 0 -d 2 'GET PRIORITY1'");
    EXPECT_NE(answer2.output.find(pmcPortIdentity(ptpd) + " seq 0 RESPONSE MANAGEMENT PRIORITY1"),
              std::string::npos)
        << answer2.output;
    EXPECT_NE(answer2.output.find("priority1 100"), std::string::npos);

    const std::vector<int> pids = network.processIds();
    ASSERT_EQ(pids.size(), 2u);
    const std::string prefix = network.prefix();
    network.down();
    for (int pid : pids) {
        EXPECT_TRUE(processGone(pid)) << "clock process " << pid << " still runs";
    }
    const auto namespaces = qvtest::runCommand("ip netns list");
    EXPECT_EQ(namespaces.output.find(prefix + "-"), std::string::npos) << namespaces.output;
}

TEST(TestNetwork, TwoNetworksAtOnceStaySeparate) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    // Same clock identity and domain in both: each client must see only its own clock.
    TestNetwork first({"ptp4l:domain=0:desc=first:mac=02:00:00:00:00:01"});
    TestNetwork second({"ptp4l:domain=0:desc=second:mac=02:00:00:00:00:01", "none"});
    ASSERT_TRUE(first.isUp()) << first.failure();
    ASSERT_TRUE(second.isUp()) << second.failure();
    EXPECT_NE(first.prefix(), second.prefix());
    EXPECT_EQ(second.clocks()[1].impl, "none");

    const auto answer = first.runInClient("pmc -4 -i br0 -b 0 -d 0 'GET USER_DESCRIPTION'");
    EXPECT_NE(answer.output.find("userDescription  first"), std::string::npos) << answer.output;
    EXPECT_EQ(answer.output.find("second"), std::string::npos) << answer.output;
}

// How network tests enter the client namespace: the test's thread enters, creates the
// client's sockets and receive thread, and leaves; what it created stays in the client
// namespace and talks to the clock from there.
TEST(NetworkNamespaceEntry, ClientMadeInsideTalksToTheClockAfterTheThreadLeaves) {
    QV_REQUIRE_TEST_NETWORK("ptp4l");
    TestNetwork network({"ptp4l:domain=0:prio1=77:mac=02:00:00:00:00:21"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    const unsigned long outside = qvtest::NetworkNamespaceEntry::currentNamespaceId();
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    EXPECT_EQ(qvtest::NetworkNamespaceEntry::currentNamespaceId(), outside);
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), 1u);
    EXPECT_EQ(proxies[0]->getPriority1(status), 77);
    EXPECT_TRUE(status.succeeded()) << qvtest::describe(status);
}

}  // namespace
