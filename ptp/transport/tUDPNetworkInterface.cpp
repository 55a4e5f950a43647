#include "ptp/transport/tUDPNetworkInterface.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "platform/tStatusReason.h"

namespace nQVPTP000 {

namespace {

int newUdpSocket(int extraFlags) {
    return socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC | extraFlags, IPPROTO_UDP);
}

template <typename T>
bool setOption(int fd, int level, int name, const T& value) {
    return setsockopt(fd, level, name, &value, sizeof(value)) == 0;
}

// One datagram into `buffer`, and the interface it came in on. MSG_TRUNC answers the
// datagram's full length, so an oversized one is noticed instead of being cut silently; it
// is consumed either way.
ssize_t receiveFrom(int fd, std::uint8_t (&buffer)[tUDPNetworkInterface::kMaxDatagram],
                    tInterfaceIndex& arrivedOn) {
    iovec data{buffer, sizeof(buffer)};
    alignas(cmsghdr) char control[CMSG_SPACE(sizeof(in_pktinfo))];
    msghdr message{};
    message.msg_iov = &data;
    message.msg_iovlen = 1;
    message.msg_control = control;
    message.msg_controllen = sizeof(control);
    const ssize_t length = recvmsg(fd, &message, MSG_TRUNC);
    arrivedOn = kEveryInterface;
    for (cmsghdr* item = CMSG_FIRSTHDR(&message); length >= 0 && item != nullptr;
         item = CMSG_NXTHDR(&message, item)) {
        if (item->cmsg_level == IPPROTO_IP && item->cmsg_type == IP_PKTINFO) {
            in_pktinfo info{};
            std::memcpy(&info, CMSG_DATA(item), sizeof(info));
            arrivedOn = static_cast<tInterfaceIndex>(info.ipi_ifindex);
        }
    }
    return length;
}

void closeIfValid(std::atomic<int>& fd) {
    const int old = fd.exchange(-1);
    if (old >= 0) {
        ::close(old);
    }
}

}  // namespace

tUDPNetworkInterface::tUDPNetworkInterface() {
    groupAddress_ = inet_addr(kMulticastGroup);
}

tUDPNetworkInterface::~tUDPNetworkInterface() {
    closeSockets();
    closeIfValid(wakeEvent_);
}

void tUDPNetworkInterface::open(tStatus& status) {
    stopRequested_ = false;
    if (status.failed()) {
        return;
    }
    closeSockets();  // a second open without close starts afresh instead of leaking
    if (wakeEvent_.load() < 0) {
        wakeEvent_ = eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK);
        if (wakeEvent_.load() < 0) {
            QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            return;
        }
    }
    openSendSockets(status);
    eventSocket_ = openReceiveSocket(kEventPort, status);
    generalSocket_ = openReceiveSocket(kGeneralPort, status);
}

// One socket per interface, its outgoing multicast interface set to that interface.
void tUDPNetworkInterface::openSendSockets(tStatus& status) {
    const std::lock_guard<std::mutex> guard(sendLock_);
    for (const auto& interface : interfacesToOpen()) {
        const int fd = newUdpSocket(0);
        if (fd < 0) {
            QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            return;
        }
        sendSockets_.push_back({interface.index, fd});
        in_addr outgoing{};
        outgoing.s_addr = interface.address;
        if (!setOption(fd, IPPROTO_IP, IP_MULTICAST_IF, outgoing)) {
            QV_STATUS_SET(status, kStatusSocketError, kComponentCodec);
            return;
        }
    }
}

int tUDPNetworkInterface::openReceiveSocket(std::uint16_t port, tStatus& status) {
    if (status.failed()) {
        return -1;
    }
    // Non-blocking: a receive only reads what poll has announced, and never hangs in recv.
    const int fd = newUdpSocket(SOCK_NONBLOCK);
    if (fd < 0) {
        QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
        return -1;
    }
    sockaddr_in local{};
    local.sin_family = AF_INET;
    local.sin_port = htons(port);
    local.sin_addr.s_addr = localInterfaceAddress_;
    // The larger buffer is a wish, not a need: beyond the system's limit only a privileged
    // process may go (SO_RCVBUFFORCE), and a smaller buffer still works.
    if (!setOption(fd, SOL_SOCKET, SO_RCVBUFFORCE, kReceiveBufferOctets)) {
        setOption(fd, SOL_SOCKET, SO_RCVBUF, kReceiveBufferOctets);
    }
    // IP_PKTINFO: each datagram tells on which interface it came in.
    bool configured = setOption(fd, SOL_SOCKET, SO_REUSEADDR, 1) &&
                      setOption(fd, IPPROTO_IP, IP_PKTINFO, 1) &&
                      bind(fd, reinterpret_cast<const sockaddr*>(&local), sizeof(local)) == 0;
    for (const auto& interface : interfacesToOpen()) {
        ip_mreq membership{};
        membership.imr_multiaddr.s_addr = groupAddress_;
        membership.imr_interface.s_addr = interface.address;
        configured = configured && setOption(fd, IPPROTO_IP, IP_ADD_MEMBERSHIP, membership);
    }
    if (!configured) {
        QV_STATUS_SET(status, kStatusSocketError, kComponentCodec);
    }
    return fd;  // kept, like every socket of a failed open, until close
}

void tUDPNetworkInterface::closeSockets() {
    {
        const std::lock_guard<std::mutex> guard(sendLock_);
        for (const tSendSocket& socket : sendSockets_) {
            ::close(socket.fd);
        }
        sendSockets_.clear();
    }
    closeIfValid(eventSocket_);
    closeIfValid(generalSocket_);
}

bool tUDPNetworkInterface::sendDatagram(int fd, std::uint16_t port, const tProtocolDataUnit& unit) {
    sockaddr_in target{};
    target.sin_family = AF_INET;
    target.sin_addr.s_addr = groupAddress_;
    target.sin_port = htons(port);
    return sendto(fd, unit.getBuffer(), unit.getLength(), 0,
                  reinterpret_cast<const sockaddr*>(&target), sizeof(target)) >= 0;
}

void tUDPNetworkInterface::receive(tProtocolDataUnit& unit, tStatus& status) {
    unit.reset();
    if (status.failed() || reportAbort(status)) {
        return;
    }
    const tReceiveScope scope(*this);
    int readySocket = -1;
    if (!awaitDatagram(readySocket, status)) {
        return;
    }
    std::uint8_t buffer[kMaxDatagram];
    for (;;) {
        const ssize_t length = receiveFrom(readySocket, buffer, lastInterface_);
        if (reportAbort(status)) {
            return;  // a datagram read in this pass is dropped
        }
        if (length < 0 && (errno == EAGAIN || errno == EINTR)) {
            if (!awaitDatagram(readySocket, status)) {
                return;
            }
            continue;
        }
        if (length < 0) {
            QV_STATUS_SET(status, kStatusSocketError, kComponentCodec);
            return;
        }
        if (static_cast<std::size_t>(length) > kMaxDatagram) {
            // Consumed already; the socket is sound, so the caller may read on at once.
            if (QV_STATUS_SET(status, kStatusSocketError, kComponentCodec)) {
                tStatusReason::badDatagram(status, static_cast<std::uint64_t>(length));
            }
            return;
        }
        if (length > 0) {
            noteCompatibility(buffer[0], readySocket == eventSocket_.load());
        }
        unit.writeOctets(buffer, static_cast<std::size_t>(length), status);
        return;
    }
}

// Waits in steps of half a second until a receive socket is readable, an abort is requested
// or the interface is closed. When both sockets are readable they take turns: a flood on
// one port must not hold back the answers waiting on the other.
bool tUDPNetworkInterface::awaitDatagram(int& readySocket, tStatus& status) {
    const int event = eventSocket_.load();
    const int general = generalSocket_.load();
    for (;;) {
        if (reportAbort(status)) {
            return false;
        }
        if (closing_ || event < 0 || general < 0) {
            // Not open, or being closed: there is nothing to wait on.
            QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            return false;
        }
        pollfd waiting[3] = {{event, POLLIN, 0}, {general, POLLIN, 0}, {wakeEvent_, POLLIN, 0}};
        const int ready = poll(waiting, 3, kWaitStepMilliseconds);
        if (ready < 0 && errno != EINTR) {
            if (!reportAbort(status)) {
                QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            }
            return false;
        }
        if (ready <= 0) {
            continue;
        }
        if (waiting[2].revents != 0) {
            drainWake();
        }
        if (waiting[0].revents != 0 || waiting[1].revents != 0) {
            const bool both = waiting[0].revents != 0 && waiting[1].revents != 0;
            readySocket = both ? (lastSocket_ == event ? general : event)
                               : (waiting[0].revents != 0 ? event : general);
            lastSocket_ = readySocket;
            return true;
        }
    }
}

void tUDPNetworkInterface::wake() {
    const int fd = wakeEvent_.load();
    if (fd >= 0) {
        const std::uint64_t one = 1;
        // A full counter already means "wake up"; nothing to do about a failure.
        [[maybe_unused]] const ssize_t written = write(fd, &one, sizeof(one));
    }
}

void tUDPNetworkInterface::drainWake() {
    std::uint64_t count = 0;
    [[maybe_unused]] const ssize_t got = read(wakeEvent_.load(), &count, sizeof(count));
}

}  // namespace nQVPTP000
