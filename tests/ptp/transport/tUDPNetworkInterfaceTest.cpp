#include "ptp/transport/tUDPNetworkInterface.h"

#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <future>
#include <string>
#include <thread>
#include <vector>

#include "platform/EthernetAdapters.h"
#include "tests/ptp/transport/PrivateNetwork.h"
#include "tests/support/Hex.h"

using nQVPTP000::tProtocolDataUnit;
using nQVPTP000::tUDPNetworkInterface;

namespace {

constexpr const char* kGroup = "224.0.1.129";

// A plain socket of the test: sends to the group, or listens on one PTP port of it.
class tPlainSocket {
  public:
    tPlainSocket() = default;
    ~tPlainSocket() { close(fd_); }
    tPlainSocket(const tPlainSocket&) = delete;
    tPlainSocket& operator=(const tPlainSocket&) = delete;

    void sendTo(std::uint16_t port, const std::vector<std::uint8_t>& octets) {
        const sockaddr_in group{AF_INET, htons(port), {inet_addr(kGroup)}, {}};
        ASSERT_EQ(sendto(fd_, octets.data(), octets.size(), 0,
                         reinterpret_cast<const sockaddr*>(&group), sizeof(group)),
                  static_cast<ssize_t>(octets.size()));
    }

    void listen(std::uint16_t port) {
        const int one = 1;
        setsockopt(fd_, SOL_SOCKET, SO_REUSEADDR, &one, sizeof(one));
        const sockaddr_in local{AF_INET, htons(port), {}, {}};
        const ip_mreq membership{{inet_addr(kGroup)}, {}};
        ASSERT_EQ(bind(fd_, reinterpret_cast<const sockaddr*>(&local), sizeof(local)), 0);
        setsockopt(fd_, IPPROTO_IP, IP_ADD_MEMBERSHIP, &membership, sizeof(membership));
    }

    // The next datagram, or nothing after two seconds.
    std::vector<std::uint8_t> next() {
        pollfd waiting{fd_, POLLIN, 0};
        if (poll(&waiting, 1, 2000) != 1) {
            return {};
        }
        std::vector<std::uint8_t> octets(2048);
        const ssize_t length = recv(fd_, octets.data(), octets.size(), 0);
        octets.resize(length > 0 ? static_cast<std::size_t>(length) : 0);
        return octets;
    }

  private:
    int fd_ = socket(AF_INET, SOCK_DGRAM, IPPROTO_UDP);
};

std::vector<std::uint8_t> contents(const tProtocolDataUnit& unit) {
    return {unit.getBuffer(), unit.getBuffer() + unit.getLength()};
}

class tUDPNetworkInterfaceTest : public ::testing::Test {
  protected:
    void SetUp() override {
        QV_REQUIRE_PRIVATE_NETWORK();
        sender.open(status);
        receiver.open(status);
        ASSERT_EQ(status.code, 0);
    }

    // Receives with a status of its own, so that one failed receive does not stop the next.
    tStatus receiveInto(tProtocolDataUnit& into) {
        tStatus own;
        receiver.receive(into, own);
        return own;
    }

    tStatus status;
    tUDPNetworkInterface sender;
    tUDPNetworkInterface receiver;
    tProtocolDataUnit unit{status};
};

}  // namespace

// Each kind goes to its own port of the group and reaches another interface. A Sync with
// transportSpecific 1 on the event port turns on compatibility mode.
TEST_F(tUDPNetworkInterfaceTest, MessagesReachTheirPortOfAnotherInterface) {
    struct {
        void (tUDPNetworkInterface::*send)(tProtocolDataUnit&, tStatus&);
        std::uint16_t port;
        const char* octets;
        bool compatible;
    } const cases[] = {
        // A management message header start: messageType 0xD, versionPTP 2, length 0x0036.
        {&tUDPNetworkInterface::sendGeneralMessage, 320, "0D | 02 | 00 36", false},
        {&tUDPNetworkInterface::sendEventMessage, 319, "10 | 02 | 00 2C", true},
    };
    for (const auto& c : cases) {
        tPlainSocket listener;
        listener.listen(c.port);
        const std::vector<std::uint8_t> octets = qvtest::hexOctets(c.octets);
        tProtocolDataUnit outgoing(status);
        outgoing.writeOctets(octets.data(), octets.size(), status);
        (sender.*c.send)(outgoing, status);
        ASSERT_EQ(status.code, 0);
        EXPECT_EQ(listener.next(), octets);
        ASSERT_EQ(receiveInto(unit).code, 0);
        EXPECT_EQ(contents(unit), octets);
        EXPECT_EQ(receiver.isCompatibilityMode(), c.compatible);
    }
}

TEST_F(tUDPNetworkInterfaceTest, EventPortIsTakenFirstWhenBothAreReady) {
    tPlainSocket peer;
    peer.sendTo(320, {0x0D, 0x02});
    peer.sendTo(319, {0x00, 0x02});
    std::this_thread::sleep_for(std::chrono::milliseconds(200));  // both queued by now
    ASSERT_EQ(receiveInto(unit).code, 0);
    EXPECT_EQ(contents(unit), (std::vector<std::uint8_t>{0x00, 0x02}));
    ASSERT_EQ(receiveInto(unit).code, 0);
    EXPECT_EQ(contents(unit), (std::vector<std::uint8_t>{0x0D, 0x02}));
}

// On the general port only an Announce with transportSpecific 1 turns compatibility mode on;
// then event messages go out padded, until close.
TEST_F(tUDPNetworkInterfaceTest, CompatibilityModeFromAnnouncePadsEventMessagesUntilClose) {
    tPlainSocket peer;
    tPlainSocket eventListener;
    eventListener.listen(319);
    peer.sendTo(320, {0x1D, 0x02});  // management with the bit: no
    ASSERT_EQ(receiveInto(unit).code, 0);
    EXPECT_FALSE(receiver.isCompatibilityMode());
    peer.sendTo(320, {0x1B, 0x02});  // announce with the bit: yes
    ASSERT_EQ(receiveInto(unit).code, 0);
    ASSERT_TRUE(receiver.isCompatibilityMode());

    tProtocolDataUnit shortEvent(status);
    const std::vector<std::uint8_t> header(44, 0x5A);
    shortEvent.writeOctets(header.data(), header.size(), status);
    receiver.sendEventMessage(shortEvent, status);
    std::vector<std::uint8_t> expected = header;
    expected.resize(124, 0x00);  // 80 zero octets
    EXPECT_EQ(eventListener.next(), expected);

    tProtocolDataUnit longEvent(status);
    const std::vector<std::uint8_t> longer(130, 0xA5);
    longEvent.writeOctets(longer.data(), longer.size(), status);
    receiver.sendEventMessage(longEvent, status);
    EXPECT_EQ(eventListener.next(), longer);

    receiver.close(status);
    EXPECT_FALSE(receiver.isCompatibilityMode());
}

// An abort ends a waiting receive, or the next one if none waits, and only that one.
TEST_F(tUDPNetworkInterfaceTest, AbortEndsOneReceive) {
    auto pending = std::async(std::launch::async, [this] { return receiveInto(unit); });
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    ASSERT_EQ(pending.wait_for(std::chrono::seconds(0)), std::future_status::timeout)
        << "receive returned without traffic";
    receiver.abortReceive(status);
    EXPECT_EQ(pending.get().code, kStatusAborted);

    receiver.abortReceive(status);
    EXPECT_EQ(receiveInto(unit).code, kStatusAborted);
    tPlainSocket peer;
    peer.sendTo(320, {0x0D, 0x02});
    EXPECT_EQ(receiveInto(unit).code, 0);
}

TEST_F(tUDPNetworkInterfaceTest, OversizedDatagramFailsAndTheNextOneArrives) {
    tPlainSocket peer;
    peer.sendTo(320, std::vector<std::uint8_t>(1100, 0x0D));
    peer.sendTo(320, std::vector<std::uint8_t>(1024, 0x0D));  // the largest accepted
    const tStatus oversized = receiveInto(unit);
    EXPECT_EQ(oversized.code, kStatusSocketError);
    EXPECT_EQ(unit.getLength(), 0U);
    ASSERT_EQ(receiveInto(unit).code, 0);
    EXPECT_EQ(unit.getLength(), 1024U);
}

TEST_F(tUDPNetworkInterfaceTest, CloseWakesAReceive) {
    auto pending = std::async(std::launch::async, [this] { return receiveInto(unit); });
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    receiver.close(status);  // returns only once the receive has left
    EXPECT_EQ(pending.get().code, kStatusOsObjectError);
}

TEST_F(tUDPNetworkInterfaceTest, FirstEthernetAdapterIsOneOfThePair) {
    const auto mac = qv::dsc::osdep::EthernetAdapters::firstAddress();
    ASSERT_TRUE(mac.has_value());  // loopback is passed over
    EXPECT_TRUE(qvtest::hexText(mac->data(), 6) == "02 00 00 00 00 01" ||
                qvtest::hexText(mac->data(), 6) == "02 00 00 00 00 02");
}

TEST(tUDPNetworkInterfaceUnitTest, PortAddressIsTheGroupAndAClosedInterfaceFailsAtOnce) {
    tUDPNetworkInterface transport;
    const nQVPTP000::tPortAddress address = transport.getPortAddress();
    EXPECT_EQ(address.getNetworkProtocol(), 1);  // UDP/IPv4
    ASSERT_EQ(address.getAddressLength(), 4);
    EXPECT_EQ(qvtest::hexText(address.getAddressField(), 4), "E0 00 01 81");
    tStatus status;
    tProtocolDataUnit unit(status);
    transport.receive(unit, status);
    EXPECT_EQ(status.code, kStatusOsObjectError);
    tStatus sendStatus;
    transport.sendGeneralMessage(unit, sendStatus);
    EXPECT_EQ(sendStatus.code, kStatusSocketError);
}
