#ifndef QV_PTP_TRANSPORT_TUDPNETWORKINTERFACE_H
#define QV_PTP_TRANSPORT_TUDPNETWORKINTERFACE_H

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <mutex>
#include <vector>

#include "platform/MulticastInterfaces.h"
#include "ptp/transport/iPTPPortMessaging.h"

namespace nQVPTP000 {

// PTP over UDP on IPv4 multicast: one socket sends to the group 224.0.1.129, two sockets
// bound to the event port 319 and the general port 320 receive, both members of the group.
// Other processes may bind the same ports at the same time.
//
// By default the system's default multicast interface sends and joins. Given interfaces
// (useInterfaces), there is one send socket per interface and the receive sockets join the
// group on each; a receive tells on which interface its datagram came in.
//
// Threads: `receive` runs on one thread; sends, `abortReceive` and `close` may come from
// others. `close` wakes a running receive and waits until it has left before the sockets
// are closed, so a receive never touches a descriptor that has been closed (and perhaps
// reused by someone else).
class tUDPNetworkInterface final : public iPTPPortMessaging {
  public:
    static constexpr const char* kMulticastGroup = "224.0.1.129";
    static constexpr const char* kPeerDelayMulticastGroup = "224.0.0.107";  // never joined
    static constexpr std::uint16_t kEventPort = 319;
    static constexpr std::uint16_t kGeneralPort = 320;
    static constexpr std::size_t kMaxDatagram = 1024;
    static constexpr int kWaitStepMilliseconds = 500;
    static constexpr std::uint64_t kCompatibilityLength = 124;
    // Room in the kernel for a burst of answers (a thousand clocks answering one discovery,
    // one to two megabytes as the kernel counts them) while the receive thread decodes. Kept at
    // 4 MiB because the receive loop drains it fast: it drops a bad datagram without a pause
    // (tests/bench/BadDatagramBench: some 20,000 to 70,000 a second here), so even a queue
    // filled by a flood (a few thousand datagrams) is read within a fraction of a second,
    // far inside an exchange's 5 s time-out.
    static constexpr int kReceiveBufferOctets = 4 * 1024 * 1024;

    tUDPNetworkInterface();
    ~tUDPNetworkInterface() override;
    tUDPNetworkInterface(const tUDPNetworkInterface&) = delete;
    tUDPNetworkInterface& operator=(const tUDPNetworkInterface&) = delete;

    // The interfaces of the next open; none (the default) for the system's default one.
    void useInterfaces(std::vector<qv::dsc::osdep::MulticastInterface> interfaces);

    void open(tStatus& status) override;
    void close(tStatus& status) override;
    // In compatibility mode the unit is first padded with zero octets to 124 octets.
    void sendEventMessage(tProtocolDataUnit& unit, tStatus& status) override;
    void sendGeneralMessage(tProtocolDataUnit& unit, tStatus& status) override;
    // Sends on every interface when `via` is not one of them. Fails only when no send
    // succeeded: an interface that has gone down does not silence the others.
    void sendGeneralMessageVia(tProtocolDataUnit& unit, tInterfaceIndex via,
                               tStatus& status) override;
    // A datagram longer than 1024 octets is consumed and gives -52003 with the reason
    // tStatusReason::tKind::kBadDatagram: unlike a failing socket, reading may go on at once.
    void receive(tProtocolDataUnit& unit, tStatus& status) override;
    void abortReceive(tStatus& status) override;
    tPortAddress getPortAddress() override;
    tInterfaceIndex getReceiveInterface() const override { return lastInterface_; }

    bool isCompatibilityMode() const { return padEventMessages_.load(); }

  private:
    // Counts a running receive so that close waits for it to leave.
    class tReceiveScope {
      public:
        explicit tReceiveScope(tUDPNetworkInterface& owner);
        ~tReceiveScope();
        tReceiveScope(const tReceiveScope&) = delete;
        tReceiveScope& operator=(const tReceiveScope&) = delete;

      private:
        tUDPNetworkInterface& owner_;
    };

    struct tSendSocket {
        tInterfaceIndex index;
        int fd;
    };

    // The interfaces to open on: those given, or the default one as index 0 with
    // localInterfaceAddress_.
    std::vector<qv::dsc::osdep::MulticastInterface> interfacesToOpen() const;
    void openSendSockets(tStatus& status);
    int openReceiveSocket(std::uint16_t port, tStatus& status);
    void sendTo(std::uint16_t port, const tProtocolDataUnit& unit, tInterfaceIndex via,
                tStatus& status);
    bool sendDatagram(int fd, std::uint16_t port, const tProtocolDataUnit& unit);
    bool awaitDatagram(int& readySocket, tStatus& status);
    bool reportAbort(tStatus& status);
    void noteCompatibility(std::uint8_t firstOctet, bool eventPort);
    void wake();
    void drainWake();
    void closeSockets();

    std::atomic<int> eventSocket_{-1};
    std::atomic<int> generalSocket_{-1};
    std::mutex sendLock_;                                         // guards sendSockets_
    std::vector<tSendSocket> sendSockets_;                        // guarded by sendLock_
    std::vector<qv::dsc::osdep::MulticastInterface> interfaces_;  // set before open
    // The group's address in network byte order. No socket header here: on Windows it
    // would bring the system's types, which clash with the host header's own.
    std::uint32_t groupAddress_ = 0;
    std::atomic<bool> stopRequested_{false};
    std::uint32_t localInterfaceAddress_ = 0;  // network byte order; 0 is any interface
    std::atomic<bool> padEventMessages_{false};
    // An eventfd (a loopback socket on Windows) that abortReceive and close signal.
    std::atomic<int> wakeEvent_{-1};
    int lastSocket_ = -1;  // the socket read last; the receiving thread's only
    tInterfaceIndex lastInterface_ = kEveryInterface;  // the receiving thread's only

    std::mutex receiveLock_;  // guards activeReceives_ and closing_
    std::condition_variable receiveIdle_;
    int activeReceives_ = 0;
    std::atomic<bool> closing_{false};
};

}  // namespace nQVPTP000

#endif
