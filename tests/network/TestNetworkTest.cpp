#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <poll.h>
#include <signal.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdint>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include "tests/support/Hex.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using qvtest::TestNetwork;

// pmc's text form of a port identity: "020000.fffe.000001-1".
std::string pmcPortIdentity(const qvtest::TestClock& clock) {
    const std::string hex =
        qvtest::hexText(std::vector<std::uint8_t>(clock.identity.begin(), clock.identity.end()));
    std::string digits;
    for (char c : hex) {
        if (c != ' ') {
            digits += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
        }
    }
    return digits.substr(0, 6) + "." + digits.substr(6, 4) + "." + digits.substr(10, 6) + "-" +
           std::to_string(clock.portNumber);
}

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

// A management GET of PRIORITY1 to all clocks and ports, as the standard lays it out.
const char* const kGetPriority1 =
    "0D | 02 | 00 36 | 00 | 00 | 00 00 "      // management, version 2, length 54, domain 0, flags
    "00 00 00 00 00 00 00 00 | 00 00 00 00 "  // correctionField, reserved
    "02 51 56 FF FE 00 00 09 | 00 01 "        // sourcePortIdentity
    "00 2A | 04 | 7F "                        // sequenceId 42, controlField, logMessageInterval
    "FF FF FF FF FF FF FF FF | FF FF "        // targetPortIdentity: all clocks, all ports
    "00 | 00 | 00 | 00 "      // startingBoundaryHops, boundaryHops, actionField GET, reserved
    "00 01 | 00 02 | 20 05";  // MANAGEMENT TLV, lengthField 2, PRIORITY1

// Opens a UDP socket on the general port that receives the PTP group on `address`.
int openGeneralSocket(const std::string& address) {
    const int fd = socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    sockaddr_in local{};
    local.sin_family = AF_INET;
    local.sin_port = htons(320);
    local.sin_addr.s_addr = htonl(INADDR_ANY);
    ip_mreq group{};
    inet_pton(AF_INET, "224.0.1.129", &group.imr_multiaddr);
    inet_pton(AF_INET, address.c_str(), &group.imr_interface);
    const unsigned char noLoop = 0;
    if (fd < 0 || bind(fd, reinterpret_cast<sockaddr*>(&local), sizeof local) != 0 ||
        setsockopt(fd, IPPROTO_IP, IP_ADD_MEMBERSHIP, &group, sizeof group) != 0 ||
        setsockopt(fd, IPPROTO_IP, IP_MULTICAST_IF, &group.imr_interface,
                   sizeof group.imr_interface) != 0 ||
        setsockopt(fd, IPPROTO_IP, IP_MULTICAST_LOOP, &noLoop, sizeof noLoop) != 0) {
        if (fd >= 0) {
            close(fd);
        }
        return -1;
    }
    return fd;
}

// How network tests enter the client namespace: the test's thread enters, creates its
// sockets (and threads), and leaves; what it created stays in the client namespace.
TEST(NetworkNamespaceEntry, SocketMadeInsideTalksToClockAfterThreadLeaves) {
    QV_REQUIRE_TEST_NETWORK("ptp4l");
    TestNetwork network({"ptp4l:domain=0:prio1=77:mac=02:00:00:00:00:21"});
    ASSERT_TRUE(network.isUp()) << network.failure();

    const unsigned long outside = qvtest::NetworkNamespaceEntry::currentNamespaceId();
    int fd = -1;
    {
        qvtest::NetworkNamespaceEntry entry(network.clientNamespace());
        ASSERT_TRUE(entry.entered()) << entry.failure();
        EXPECT_NE(qvtest::NetworkNamespaceEntry::currentNamespaceId(), outside);
        fd = openGeneralSocket(network.clientAddress());
    }
    EXPECT_EQ(qvtest::NetworkNamespaceEntry::currentNamespaceId(), outside);
    ASSERT_GE(fd, 0);

    const auto request = qvtest::hexOctets(kGetPriority1);
    sockaddr_in group{};
    group.sin_family = AF_INET;
    group.sin_port = htons(320);
    inet_pton(AF_INET, "224.0.1.129", &group.sin_addr);
    ASSERT_EQ(sendto(fd, request.data(), request.size(), 0, reinterpret_cast<sockaddr*>(&group),
                     sizeof group),
              static_cast<ssize_t>(request.size()));

    std::vector<std::uint8_t> answer(1500);
    pollfd waiting{fd, POLLIN, 0};
    ASSERT_EQ(poll(&waiting, 1, 3000), 1) << "no answer from ptp4l";
    const ssize_t size = recv(fd, answer.data(), answer.size(), 0);
    close(fd);
    ASSERT_GE(size, 55);
    answer.resize(static_cast<std::size_t>(size));
    EXPECT_EQ(answer[0] & 0x0F, 0x0D);  // management
    EXPECT_EQ(std::vector<std::uint8_t>(answer.begin() + 20, answer.begin() + 28),
              std::vector<std::uint8_t>(network.clocks()[0].identity.begin(),
                                        network.clocks()[0].identity.end()));
    EXPECT_EQ(answer[30], 0x00);  // sequenceId 42 echoed
    EXPECT_EQ(answer[31], 0x2A);
    EXPECT_EQ(answer[46] & 0x0F, 0x02);  // actionField RESPONSE
    EXPECT_EQ(answer[52], 0x20);         // managementId PRIORITY1
    EXPECT_EQ(answer[53], 0x05);
    EXPECT_EQ(answer[54], 77);  // priority1
}

}  // namespace
