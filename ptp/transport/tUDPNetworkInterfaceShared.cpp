#include "ptp/transport/tUDPNetworkInterface.h"

#include <algorithm>
#include <cstring>

// The parts of the UDP interface that are the same on every system: padding of event
// messages for compatible peers, the choice of send sockets, the abort flag, and closing
// once no receive runs. The sockets themselves are in tUDPNetworkInterface.cpp (POSIX) and
// tUDPNetworkInterfaceWin32.cpp (Winsock).
namespace nQVPTP000 {

namespace {

constexpr std::uint8_t kCompatibilityBit = 0x10;
constexpr std::uint8_t kAnnounceType = 0xB;

}  // namespace

tUDPNetworkInterface::tReceiveScope::tReceiveScope(tUDPNetworkInterface& owner) : owner_(owner) {
    const std::lock_guard<std::mutex> guard(owner_.receiveLock_);
    ++owner_.activeReceives_;
}

tUDPNetworkInterface::tReceiveScope::~tReceiveScope() {
    const std::lock_guard<std::mutex> guard(owner_.receiveLock_);
    --owner_.activeReceives_;
    owner_.receiveIdle_.notify_all();
}

void tUDPNetworkInterface::close(tStatus&) {
    padEventMessages_ = false;
    std::unique_lock<std::mutex> guard(receiveLock_);
    closing_ = true;
    wake();
    receiveIdle_.wait(guard, [this] { return activeReceives_ == 0; });
    closeSockets();
    closing_ = false;
}

void tUDPNetworkInterface::useInterfaces(
    std::vector<qv::dsc::osdep::MulticastInterface> interfaces) {
    interfaces_ = std::move(interfaces);
}

std::vector<qv::dsc::osdep::MulticastInterface> tUDPNetworkInterface::interfacesToOpen() const {
    if (!interfaces_.empty()) {
        return interfaces_;
    }
    return {{"", kEveryInterface, localInterfaceAddress_}};
}

void tUDPNetworkInterface::sendTo(std::uint16_t port, const tProtocolDataUnit& unit,
                                  tInterfaceIndex via, tStatus& status) {
    if (status.failed()) {
        return;
    }
    const std::lock_guard<std::mutex> guard(sendLock_);
    const bool one = std::ranges::any_of(sendSockets_, [via](const tSendSocket& socket) {
        return via != kEveryInterface && socket.index == via;
    });
    bool sent = false;
    for (const tSendSocket& socket : sendSockets_) {
        if (!one || socket.index == via) {
            sent = sendDatagram(socket.fd, port, unit) || sent;
        }
    }
    if (!sent) {
        QV_STATUS_SET(status, kStatusSocketError, kComponentCodec);
    }
}

void tUDPNetworkInterface::sendEventMessage(tProtocolDataUnit& unit, tStatus& status) {
    if (status.failed()) {
        return;
    }
    if (padEventMessages_) {
        while (status.succeeded() && unit.getLength() < kCompatibilityLength) {
            unit.writeOctet(0, status);
        }
    }
    sendTo(kEventPort, unit, kEveryInterface, status);
}

void tUDPNetworkInterface::sendGeneralMessage(tProtocolDataUnit& unit, tStatus& status) {
    if (status.failed()) {
        return;
    }
    sendTo(kGeneralPort, unit, kEveryInterface, status);
}

void tUDPNetworkInterface::sendGeneralMessageVia(tProtocolDataUnit& unit, tInterfaceIndex via,
                                                 tStatus& status) {
    sendTo(kGeneralPort, unit, via, status);
}

void tUDPNetworkInterface::abortReceive(tStatus&) {
    stopRequested_ = true;
    wake();
}

bool tUDPNetworkInterface::reportAbort(tStatus& status) {
    if (!stopRequested_.exchange(false)) {
        return false;
    }
    QV_STATUS_SET(status, kStatusAborted, kComponentCodec);
    return true;
}

void tUDPNetworkInterface::noteCompatibility(std::uint8_t firstOctet, bool eventPort) {
    const bool flagged = (firstOctet & kCompatibilityBit) != 0;
    if (flagged && (eventPort || (firstOctet & 0x0F) == kAnnounceType)) {
        padEventMessages_ = true;
    }
}

tPortAddress tUDPNetworkInterface::getPortAddress() {
    constexpr std::uint16_t kUdpIpv4 = 1;
    std::uint8_t address[4];
    std::memcpy(address, &groupAddress_, sizeof(address));  // network order
    tStatus unused;                                         // four octets always fit
    return tPortAddress(kUdpIpv4, sizeof(address), address, unused);
}

}  // namespace nQVPTP000
