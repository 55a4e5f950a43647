#include <winsock2.h>
// After winsock2.h, which they need.
#include <mswsock.h>
#include <ws2tcpip.h>

#include <cstring>
#include <mutex>

#include "platform/tStatusReason.h"
#include "ptp/transport/tUDPNetworkInterface.h"

namespace nQVPTP000 {

// Windows backend: Windows Sockets 2. Sockets are kept in the int members of the POSIX
// backend: socket handles are 32-bit significant, and -1 turns back into INVALID_SOCKET.
// The abort wake-up is a loopback datagram socket that sends one octet to itself.

namespace {

// Room for any UDP datagram, so that an oversized one is read whole and its length known.
constexpr std::size_t kLargestDatagram = 65536;

SOCKET handleOf(int stored) {
    return static_cast<SOCKET>(static_cast<std::intptr_t>(stored));
}

int storedOf(SOCKET handle) {
    return handle == INVALID_SOCKET ? -1 : static_cast<int>(handle);
}

// Windows Sockets are started once, on first use, for the rest of the process: the
// system releases them when the process ends.
bool startSockets() {
    static const bool started = [] {
        WSADATA data{};
        return WSAStartup(MAKEWORD(2, 2), &data) == 0;
    }();
    return started;
}

int newUdpSocket(bool nonBlocking) {
    const SOCKET handle =
        WSASocketW(AF_INET, SOCK_DGRAM, IPPROTO_UDP, nullptr, 0, WSA_FLAG_NO_HANDLE_INHERIT);
    if (handle == INVALID_SOCKET) {
        return -1;
    }
    u_long on = nonBlocking ? 1 : 0;
    if (ioctlsocket(handle, static_cast<long>(FIONBIO), &on) != 0) {
        closesocket(handle);
        return -1;
    }
    return storedOf(handle);
}

template <typename T>
bool setOption(int fd, int level, int name, const T& value) {
    return setsockopt(handleOf(fd), level, name, reinterpret_cast<const char*>(&value),
                      sizeof(value)) == 0;
}

void closeIfValid(std::atomic<int>& fd) {
    const int old = fd.exchange(-1);
    if (old >= 0) {
        closesocket(handleOf(old));
    }
}

// WSARecvMsg, the one receive that hands over IP_PKTINFO, is reached through a pointer
// that the socket provider gives; null when it does not.
LPFN_WSARECVMSG recvMsgOf(SOCKET handle) {
    static const LPFN_WSARECVMSG function = [handle] {
        GUID id = WSAID_WSARECVMSG;
        LPFN_WSARECVMSG found = nullptr;
        DWORD size = 0;
        return WSAIoctl(handle, SIO_GET_EXTENSION_FUNCTION_POINTER, &id, sizeof(id), &found,
                        sizeof(found), &size, nullptr, nullptr) == 0
                   ? found
                   : nullptr;
    }();
    return function;
}

// One datagram into `buffer`, and the interface it came in on (none when the provider does
// not tell): the length, or SOCKET_ERROR.
int receiveFrom(SOCKET handle, char* buffer, std::size_t size, tInterfaceIndex& arrivedOn) {
    arrivedOn = kEveryInterface;
    const LPFN_WSARECVMSG recvMsg = recvMsgOf(handle);
    if (recvMsg == nullptr) {
        return recv(handle, buffer, static_cast<int>(size), 0);
    }
    WSABUF data{static_cast<ULONG>(size), buffer};
    alignas(WSACMSGHDR) char control[WSA_CMSG_SPACE(sizeof(IN_PKTINFO))] = {};
    WSAMSG message{};
    message.lpBuffers = &data;
    message.dwBufferCount = 1;
    message.Control = WSABUF{sizeof(control), control};
    DWORD length = 0;
    if (recvMsg(handle, &message, &length, nullptr, nullptr) != 0) {
        return SOCKET_ERROR;
    }
    for (WSACMSGHDR* item = WSA_CMSG_FIRSTHDR(&message); item != nullptr;
         item = WSA_CMSG_NXTHDR(&message, item)) {
        if (item->cmsg_level == IPPROTO_IP && item->cmsg_type == IP_PKTINFO) {
            IN_PKTINFO info{};
            std::memcpy(&info, WSA_CMSG_DATA(item), sizeof(info));
            arrivedOn = static_cast<tInterfaceIndex>(info.ipi_ifindex);
        }
    }
    return static_cast<int>(length);
}

// A non-blocking datagram socket bound to an ephemeral loopback port.
int newWakeSocket() {
    const int fd = newUdpSocket(true);
    sockaddr_in local{};
    local.sin_family = AF_INET;
    local.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (fd >= 0 &&
        bind(handleOf(fd), reinterpret_cast<const sockaddr*>(&local), sizeof(local)) != 0) {
        closesocket(handleOf(fd));
        return -1;
    }
    return fd;
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
    if (!startSockets()) {
        QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
        return;
    }
    if (wakeEvent_.load() < 0) {
        wakeEvent_ = newWakeSocket();
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
        const int fd = newUdpSocket(false);
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
    // Non-blocking: a receive only reads what select has announced, and never hangs in recv.
    const int fd = newUdpSocket(true);
    if (fd < 0) {
        QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
        return -1;
    }
    sockaddr_in local{};
    local.sin_family = AF_INET;
    local.sin_port = htons(port);
    local.sin_addr.s_addr = localInterfaceAddress_;
    // The larger buffer is a wish, not a need: a smaller one still works.
    setOption(fd, SOL_SOCKET, SO_RCVBUF, kReceiveBufferOctets);
    // IP_PKTINFO: each datagram tells on which interface it came in.
    bool configured =
        setOption(fd, SOL_SOCKET, SO_REUSEADDR, BOOL{TRUE}) &&
        setOption(fd, IPPROTO_IP, IP_PKTINFO, DWORD{1}) &&
        bind(handleOf(fd), reinterpret_cast<const sockaddr*>(&local), sizeof(local)) == 0;
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
            closesocket(handleOf(socket.fd));
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
    return sendto(handleOf(fd), reinterpret_cast<const char*>(unit.getBuffer()),
                  static_cast<int>(unit.getLength()), 0, reinterpret_cast<const sockaddr*>(&target),
                  sizeof(target)) != SOCKET_ERROR;
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
    static thread_local char buffer[kLargestDatagram];
    for (;;) {
        const int length =
            receiveFrom(handleOf(readySocket), buffer, sizeof(buffer), lastInterface_);
        const int error = length == SOCKET_ERROR ? WSAGetLastError() : 0;
        if (reportAbort(status)) {
            return;  // a datagram read in this pass is dropped
        }
        if (error == WSAEWOULDBLOCK || error == WSAEINTR || error == WSAECONNRESET) {
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
            noteCompatibility(static_cast<std::uint8_t>(buffer[0]),
                              readySocket == eventSocket_.load());
        }
        unit.writeOctets(reinterpret_cast<const std::uint8_t*>(buffer),
                         static_cast<std::size_t>(length), status);
        return;
    }
}

// Waits in steps of half a second until a receive socket is readable, an abort is requested
// or the interface is closed. When both sockets are readable they take turns: a flood on
// one port must not hold back the answers waiting on the other.
bool tUDPNetworkInterface::awaitDatagram(int& readySocket, tStatus& status) {
    const int event = eventSocket_.load();
    const int general = generalSocket_.load();
    const int wakeSocket = wakeEvent_.load();
    for (;;) {
        if (reportAbort(status)) {
            return false;
        }
        if (closing_ || event < 0 || general < 0) {
            // Not open, or being closed: there is nothing to wait on.
            QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            return false;
        }
        fd_set readable;
        FD_ZERO(&readable);
        FD_SET(handleOf(event), &readable);
        FD_SET(handleOf(general), &readable);
        FD_SET(handleOf(wakeSocket), &readable);
        timeval step{0, kWaitStepMilliseconds * 1000};
        const int ready = select(0, &readable, nullptr, nullptr, &step);
        if (ready == SOCKET_ERROR) {
            if (!reportAbort(status)) {
                QV_STATUS_SET(status, kStatusOsObjectError, kComponentCodec);
            }
            return false;
        }
        if (ready == 0) {
            continue;
        }
        if (FD_ISSET(handleOf(wakeSocket), &readable)) {
            drainWake();
        }
        const bool eventReady = FD_ISSET(handleOf(event), &readable) != 0;
        const bool generalReady = FD_ISSET(handleOf(general), &readable) != 0;
        if (eventReady || generalReady) {
            readySocket = eventReady && generalReady ? (lastSocket_ == event ? general : event)
                                                     : (eventReady ? event : general);
            lastSocket_ = readySocket;
            return true;
        }
    }
}

void tUDPNetworkInterface::wake() {
    const int fd = wakeEvent_.load();
    if (fd < 0) {
        return;
    }
    sockaddr_in self{};
    int size = sizeof(self);
    if (getsockname(handleOf(fd), reinterpret_cast<sockaddr*>(&self), &size) == 0) {
        // A full queue already means "wake up"; nothing to do about a failure.
        const char one = 1;
        sendto(handleOf(fd), &one, 1, 0, reinterpret_cast<const sockaddr*>(&self), size);
    }
}

void tUDPNetworkInterface::drainWake() {
    char octet = 0;
    while (recv(handleOf(wakeEvent_.load()), &octet, 1, 0) > 0) {
    }
}

}  // namespace nQVPTP000
